#pragma once

#include <QByteArray>
#include <QIODevice>
#include <QString>

namespace Gui {
namespace Orba {

// A file opened for reading with as few system calls as the search can get
// away with: one open, reads, one close, and nothing else (no status or
// permission queries, no seeks). Tens of thousands of files are opened in a
// search, so those calls add up to more than the reading itself.
//
// The first block is read at open() and kept, so that the text test can
// look at it and the scan then reads the file from its first byte without
// a second open. Reads never move anything but the device's own position.
class FifFileDevice : public QIODevice
{
public:
    // `headBuffer`, when given, holds the first block: a caller that opens
    // file after file lends the same buffer to each, sparing an allocation
    // (and the allocator's returning the memory) per file.
    explicit FifFileDevice(const QString& path, QByteArray* headBuffer = nullptr);
    ~FifFileDevice() override;

    // Opens read-only and reads the first block; false if the file cannot
    // be opened. Only QIODevice::ReadOnly is supported.
    bool open(OpenMode mode) override;
    void close() override;
    bool isSequential() const override { return true; }

    QString filePath() const { return name; }
    // The bytes read at open(), from the start of the file.
    const QByteArray& head() const { return *first; }
    // Reads up to `size` bytes at `position` without moving the device's
    // position; -1 on an error. Fewer bytes than asked for means that the
    // end of the file was reached: the device is for regular files only.
    qint64 readAt(char* data, qint64 size, qint64 position) const;

    static constexpr qint64 headSize = 64 * 1024;
    // What the search reads at a time after the head.
    static constexpr qint64 blockSize = 256 * 1024;

protected:
    qint64 readData(char* data, qint64 maxSize) override;
    qint64 writeData(const char* data, qint64 maxSize) override;

private:
    QString name;
    QByteArray path;
    QByteArray ownHead;
    QByteArray* first;
    int fd = -1;
    qint64 position = 0;  // the next byte readData() delivers
};

} // namespace Orba
} // namespace Gui
