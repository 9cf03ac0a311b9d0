#include "FifAsciiMatcher.h"

#include "FifRegExpTranslator.h"

#define PCRE2_CODE_UNIT_WIDTH 8
#include <pcre2.h>

#ifdef __SSE2__
#include <emmintrin.h>
#endif

namespace Gui {
namespace Orba {

namespace {

// A search that backtracks this much is handed to QRegExp, which can be
// stopped while it works on a long line; PCRE2 cannot.
constexpr uint32_t matchLimit = 1000000;

// \b and \B are written as PCRE2's own: its character tables must count
// the same ASCII characters as word characters as QRegExp does.
bool sameWordCharacters()
{
    static const bool same = [] {
        int error = 0;
        PCRE2_SIZE at = 0;
        pcre2_code* word = pcre2_compile(reinterpret_cast<PCRE2_SPTR>("\\w"), 2, 0, &error,
                                         &at, nullptr);
        if (!word)
            return false;
        pcre2_match_data* data = pcre2_match_data_create(1, nullptr);
        const QRegExp qtWord(QStringLiteral("\\w"));
        bool agree = data != nullptr;
        for (int c = 0; c < 128 && agree; ++c) {
            const char byte = char(c);
            const bool pcre = pcre2_match(word, reinterpret_cast<PCRE2_SPTR>(&byte), 1, 0, 0,
                                          data, nullptr) >= 0;
            agree = pcre == qtWord.exactMatch(QString(QChar(c)));
        }
        pcre2_match_data_free(data);
        pcre2_code_free(word);
        return agree;
    }();
    return same;
}

} // namespace

FifAsciiMatcher::FifAsciiMatcher(const QRegExp& expression)
{
    const QByteArray pattern = FifRegExpTranslator::toPcre(expression);
    if (pattern.isEmpty() || !sameWordCharacters())
        return;
    int error = 0;
    PCRE2_SIZE at = 0;
    // No option: the pattern spells out everything an option would change.
    code = pcre2_compile(reinterpret_cast<PCRE2_SPTR>(pattern.constData()), PCRE2_SIZE(pattern.size()),
                         PCRE2_NEVER_UTF | PCRE2_NEVER_UCP | PCRE2_NEVER_BACKSLASH_C, &error,
                         &at, nullptr);
    if (!code)
        return;
    // Without JIT PCRE2 still decides, only slower.
    pcre2_jit_compile(code, PCRE2_JIT_COMPLETE);
    matchData = pcre2_match_data_create(1, nullptr);
    context = pcre2_match_context_create(nullptr);
    jitStack = pcre2_jit_stack_create(32 * 1024, 1024 * 1024, nullptr);
    if (!matchData || !context) {
        pcre2_code_free(code);
        code = nullptr;
        return;
    }
    pcre2_set_match_limit(context, matchLimit);
    if (jitStack)
        pcre2_jit_stack_assign(context, nullptr, jitStack);
}

FifAsciiMatcher::~FifAsciiMatcher()
{
    pcre2_jit_stack_free(jitStack);
    pcre2_match_context_free(context);
    pcre2_match_data_free(matchData);
    pcre2_code_free(code);
}

FifAsciiMatcher::Verdict FifAsciiMatcher::match(const char* line, qsizetype size) const
{
    if (!code || !isAscii(line, size))
        return Unknown;
    const int result = pcre2_match(code, reinterpret_cast<PCRE2_SPTR>(line), PCRE2_SIZE(size), 0,
                                   0, matchData, context);
    if (result >= 0)
        return Match;
    return result == PCRE2_ERROR_NOMATCH ? NoMatch : Unknown;
}

bool FifAsciiMatcher::isAscii(const char* bytes, qsizetype size)
{
    qsizetype at = 0;
#ifdef __SSE2__
    __m128i any = _mm_setzero_si128();
    for (; at + 16 <= size; at += 16)
        any = _mm_or_si128(any, _mm_loadu_si128(reinterpret_cast<const __m128i*>(bytes + at)));
    if (_mm_movemask_epi8(any) != 0)
        return false;
#endif
    for (; at < size; ++at) {
        if (uchar(bytes[at]) >= 0x80)
            return false;
    }
    return true;
}

} // namespace Orba
} // namespace Gui
