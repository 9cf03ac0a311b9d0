#include "FifFileDecoder.h"

namespace Gui {
namespace Orba {

FifFileDecoder::FifFileDecoder(QByteArrayView head)
{
    // The marks QTextStream knows, so that the text test, the scan and a
    // viewer read a file alike.
    if (const auto found = QStringConverter::encodingForData(head)) {
        encoding = *found;
        switch (encoding) {
        case QStringConverter::Utf16LE:
        case QStringConverter::Utf16BE:
            markSize = unitSize = 2;
            break;
        case QStringConverter::Utf32LE:
        case QStringConverter::Utf32BE:
            markSize = unitSize = 4;
            break;
        default:
            encoding = QStringConverter::Utf8;
            markSize = 3;
            break;
        }
    }
    // Stateless, and keeping a U+FEFF that starts a piece: only the one that
    // starts the file is a mark, and it is not decoded.
    decoder = QStringDecoder(encoding, QStringDecoder::Flag::Stateless
                                           | QStringDecoder::Flag::ConvertInitialBom);
}

QString FifFileDecoder::decode(QByteArrayView bytes)
{
    if (unitSize == 1)
        return decoder.decode(bytes);
    QByteArray units = carry;
    units.append(bytes);
    const qsizetype cut = units.size() % unitSize;
    carry = units.right(cut);
    units.chop(cut);
    return decoder.decode(units);
}

QString FifFileDecoder::finish()
{
    if (carry.isEmpty())
        return QString();
    carry.clear();
    return QString(QChar::ReplacementCharacter);
}

QString FifFileDecoder::decodeFile(QByteArrayView bytes)
{
    FifFileDecoder fileDecoder(bytes.first(qMin<qsizetype>(bytes.size(), 4)));
    return fileDecoder.decode(bytes.sliced(fileDecoder.getMarkSize())) + fileDecoder.finish();
}

} // namespace Orba
} // namespace Gui
