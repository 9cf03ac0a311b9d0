#pragma once

#include "fif_export.h"

#include <QByteArray>
#include <QByteArrayView>
#include <QString>
#include <QStringDecoder>

namespace Gui {
namespace Orba {

// How a file's bytes are read as text, the same for the search and for a
// host that shows the file: UTF-8, or UTF-16 or UTF-32 when the file starts
// with that byte-order mark, in either byte order. The mark (a UTF-8 one
// too) is not part of the text; a U+FEFF after it is. Decoding keeps no
// state between calls, so pieces cut between whole characters decode as
// the whole would.
class FIF_EXPORT FifFileDecoder
{
public:
    // `head` is the start of the file: its first four bytes, or all there are.
    explicit FifFileDecoder(QByteArrayView head = QByteArrayView());

    QStringConverter::Encoding getEncoding() const { return encoding; }
    // The bytes of the byte-order mark, which come before the text.
    int getMarkSize() const { return markSize; }
    // The bytes of one code unit: 1 for UTF-8, 2 or 4.
    int getUnitSize() const { return unitSize; }

    // The next bytes of the text. A UTF-16 or UTF-32 code unit cut between
    // two calls is completed by the second; UTF-8 must be cut where
    // decoding the pieces apart gives what decoding them together does
    // (at a line break, say).
    QString decode(QByteArrayView bytes);
    // A replacement character for a code unit the file left unfinished.
    QString finish();

    // A whole file, byte-order mark included.
    static QString decodeFile(QByteArrayView bytes);

private:
    QStringConverter::Encoding encoding = QStringConverter::Utf8;
    int markSize = 0;
    int unitSize = 1;
    QStringDecoder decoder;
    QByteArray carry;  // the start of a code unit cut off by the last call
};

} // namespace Orba
} // namespace Gui
