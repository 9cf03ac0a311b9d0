#include "FifGrepColors.h"

#include <QList>

namespace Gui {
namespace Orba {

FifGrepColors FifGrepColors::fromGrepColors(const QByteArray& grepColors)
{
    FifGrepColors colors;
    colors.enabled = true;
    colors.sgr[FileName] = "35";
    colors.sgr[LineNumber] = "32";
    colors.sgr[Separator] = "36";
    colors.sgr[Match] = "01;31";
    const QList<QByteArray> entries = grepColors.split(':');
    for (const QByteArray& entry : entries) {
        const qsizetype equals = entry.indexOf('=');
        const QByteArray name = equals < 0 ? entry : entry.left(equals);
        const QByteArray value = equals < 0 ? QByteArray() : entry.mid(equals + 1);
        for (char c : value) {
            if (!(c >= '0' && c <= '9') && c != ';')
                return colors;
        }
        if (equals < 0) {
            if (name == "ne")
                colors.eraseLine = false;
            continue;
        }
        // "mt" is "ms" and "mc" together; only selected lines are shown.
        if (name == "mt" || name == "ms")
            colors.sgr[Match] = value;
        else if (name == "fn")
            colors.sgr[FileName] = value;
        else if (name == "ln")
            colors.sgr[LineNumber] = value;
        else if (name == "se")
            colors.sgr[Separator] = value;
    }
    return colors;
}

void FifGrepColors::appendColored(QByteArray& out, Part part, const char* text, qsizetype size) const
{
    const QByteArray& parameters = sgr[part];
    if (parameters.isEmpty()) {
        appendPlain(out, text, size);
        return;
    }
    out += "\33[" + parameters + 'm';
    if (eraseLine)
        out += "\33[K";
    out.append(text, size);
    out += eraseLine ? "\33[m\33[K" : "\33[m";
}

} // namespace Orba
} // namespace Gui
