#pragma once

#include <QtCore5Compat/QRegExp>

struct pcre2_real_code_8;
struct pcre2_real_match_data_8;
struct pcre2_real_match_context_8;
struct pcre2_real_jit_stack_8;

namespace Gui {
namespace Orba {

// Tells whether a line of ASCII characters matches a regular expression,
// through PCRE2's compiled (JIT) engine on the line's bytes as they are: no
// decoding, no QString. It takes the expressions FifRegExpTranslator can
// write for PCRE2 with the same meaning on such lines; for any other
// expression it is inactive, and for any other line it does not know.
// Only the verdict is its own: where the first match lies and how long it is
// are QRegExp's to tell.
class FifAsciiMatcher
{
public:
    explicit FifAsciiMatcher(const QRegExp& expression);
    ~FifAsciiMatcher();
    FifAsciiMatcher(const FifAsciiMatcher&) = delete;
    FifAsciiMatcher& operator=(const FifAsciiMatcher&) = delete;

    bool isActive() const { return code != nullptr; }

    enum Verdict { NoMatch, Match, Unknown };
    // Unknown when inactive, when the line holds a byte beyond ASCII, and
    // when PCRE2 gives up (it bounds its backtracking), so that QRegExp
    // decides those lines.
    Verdict match(const char* line, qsizetype size) const;

    static bool isAscii(const char* bytes, qsizetype size);

private:
    pcre2_real_code_8* code = nullptr;
    pcre2_real_match_data_8* matchData = nullptr;
    pcre2_real_match_context_8* context = nullptr;
    pcre2_real_jit_stack_8* jitStack = nullptr;
};

} // namespace Orba
} // namespace Gui
