#pragma once

#include <QByteArray>

#include <cstring>

namespace Gui {
namespace Orba {

// The colours of `fif --color`: the parts of a "file (line): text" line are
// coloured as GNU grep colours its own, a magenta file name, a green line
// number, cyan separators and a bold red match, each in the SGR sequences
// grep writes ("\33[<sgr>m\33[K" before, "\33[m\33[K" after); GREP_COLORS
// changes them as it changes grep's.
class FifGrepColors
{
public:
    enum Part { FileName, LineNumber, Separator, Match, PartCount };

    // No colour at all.
    FifGrepColors() = default;
    // grep's defaults, then the capabilities of `grepColors` (GREP_COLORS'
    // syntax) that concern these parts: fn, ln, se, mt and ms (the
    // match), and ne (no "\33[K"). As for grep, an empty value leaves the
    // part uncoloured and parsing stops at a malformed entry.
    static FifGrepColors fromGrepColors(const QByteArray& grepColors);

    bool isEnabled() const { return enabled; }
    // Appends `text` to `out`, in the part's colour if it has one.
    void append(QByteArray& out, Part part, const char* text, qsizetype size) const
    {
        if (enabled)
            appendColored(out, part, text, size);
        else
            appendPlain(out, text, size);
    }
    void append(QByteArray& out, Part part, const QByteArray& text) const
    {
        append(out, part, text.constData(), text.size());
    }

    // Appends without QByteArray's general insertion, for a line's many
    // short pieces.
    static void appendPlain(QByteArray& out, const char* text, qsizetype size)
    {
        const qsizetype at = out.size();
        out.resize(at + size);
        std::memcpy(out.data() + at, text, size_t(size));
    }

private:
    void appendColored(QByteArray& out, Part part, const char* text, qsizetype size) const;

    bool enabled = false;
    bool eraseLine = true;
    QByteArray sgr[PartCount];
};

} // namespace Orba
} // namespace Gui
