#pragma once

#include <QtGlobal>

namespace Gui {
namespace Orba {

// Tells text from binary files on their raw bytes, with the verdict that
// reading them through a QTextStream (UTF-8, byte-order mark detected) and
// looking for control characters in the first 20 lines gives. It needs no
// decoding and no second reading: the bytes read for the test are the ones
// the scan goes on with.
//
// A control character is one of category Other_Control that is not white
// space: in UTF-8 the bytes 00-08, 0E-1F and 7F, and C2 80-C2 84 and
// C2 86-C2 9F (U+0085 NEXT LINE counts as white space). No other byte
// sequence decodes to one; broken sequences decode to U+FFFD. A line ends
// at "\n" only, as QTextStream::readLine() has it.
class FifTextTest
{
public:
    enum Verdict {
        Undecided,  // feed more bytes, or finish() at the end of the file
        Text,
        Binary,
        // The file starts with a UTF-16 or UTF-32 byte-order mark: decide
        // with QTextStream itself.
        OtherEncoding
    };

    // Takes the next bytes of the file, from its first byte on.
    Verdict feed(const char* data, qint64 size);
    // The verdict once the whole file was fed.
    Verdict finish();

    static constexpr int linesExamined = 20;

private:
    Verdict examine(const char* data, qint64 size);

    Verdict verdict = Undecided;
    int lines = 0;
    bool afterC2 = false;  // the last byte examined was C2
    // The first bytes, held back until the byte-order mark can be told.
    char head[4] = {};
    int headSize = 0;
};

} // namespace Orba
} // namespace Gui
