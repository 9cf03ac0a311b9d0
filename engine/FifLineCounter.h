#pragma once

#include <QtGlobal>

namespace Gui {
namespace Orba {

class FifFileDecoder;

// Counts, in raw UTF-8 bytes holding whole lines (each ended by "\n"), what
// the scan would have counted had it decoded and matched them: the lines,
// their characters as decoded (UTF-16 code units) and their terminators. It
// lets the scan pass over lines that cannot match without decoding them,
// and still give the lines after them their true numbers and offsets.
class FifLineCounter
{
public:
    struct Counts
    {
        qint64 lines = 0;
        qint64 chars = 0;     // characters of the lines' texts, terminators left out
        qint64 crlfLines = 0; // lines ended by "\r\n" rather than "\n"
    };

    // [begin, end) holds whole lines only: `end` follows a "\n". Lines that
    // are not well-formed UTF-8 are measured with `decoder`, which must be
    // the scan's own UTF-8 one.
    static Counts count(const char* begin, const char* end, FifFileDecoder& decoder);

    // The UTF-16 length `decoder` gives `size` bytes.
    static qint64 utf16Length(const char* bytes, qint64 size, FifFileDecoder& decoder);

private:
    // The UTF-16 length of well-formed UTF-8 free of non-characters, or -1.
    static qint64 wellFormedLength(const uchar* bytes, qint64 size);
};

} // namespace Orba
} // namespace Gui
