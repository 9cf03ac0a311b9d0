#include "FifFileDevice.h"

#include <QFile>

#include <cerrno>
#include <cstring>
#include <fcntl.h>
#include <unistd.h>

namespace Gui {
namespace Orba {

FifFileDevice::FifFileDevice(const QString& filePath, QByteArray* headBuffer)
    : name(filePath)
    , path(QFile::encodeName(filePath))
    , first(headBuffer ? headBuffer : &ownHead)
{
}

FifFileDevice::~FifFileDevice()
{
    close();
}

bool FifFileDevice::open(OpenMode mode)
{
    if (isOpen() || (mode & ~(ReadOnly | Unbuffered)) != 0 || !(mode & ReadOnly))
        return false;
    int flags = O_RDONLY | O_CLOEXEC;
#ifdef O_NOCTTY
    flags |= O_NOCTTY;
#endif
    do {
        fd = ::open(path.constData(), flags);
    } while (fd < 0 && errno == EINTR);
    if (fd < 0)
        return false;
    first->resize(headSize);
    const qint64 got = readAt(first->data(), headSize, 0);
    if (got < 0) {
        ::close(fd);
        fd = -1;
        first->resize(0);
        return false;
    }
    first->resize(got);
    position = 0;
    // Unbuffered: the scan reads large blocks itself; a buffer in between
    // would only copy them once more.
    return QIODevice::open(ReadOnly | Unbuffered);
}

void FifFileDevice::close()
{
    if (fd >= 0) {
        ::close(fd);
        fd = -1;
    }
    first->resize(0);  // keeps the capacity of a lent buffer
    if (isOpen())
        QIODevice::close();
}

qint64 FifFileDevice::readAt(char* data, qint64 size, qint64 at) const
{
    qint64 done = 0;
    while (done < size) {
        const ssize_t got = ::pread(fd, data + done, size_t(size - done), off_t(at + done));
        if (got < 0 && errno == EINTR)
            continue;
        if (got < 0)
            return done > 0 ? done : -1;
        done += got;
        if (got == 0 || done < size)
            break;  // a regular file read short only at its end
    }
    return done;
}

qint64 FifFileDevice::readData(char* data, qint64 maxSize)
{
    if (fd < 0)
        return -1;
    if (maxSize <= 0 || !data)
        return 0;
    qint64 done = 0;
    if (position < first->size()) {
        done = qMin<qint64>(maxSize, first->size() - position);
        std::memcpy(data, first->constData() + position, size_t(done));
        position += done;
    }
    // A head shorter than a full block was the whole file then.
    if (done < maxSize && first->size() == headSize) {
        const qint64 got = readAt(data + done, maxSize - done, position);
        if (got < 0 && done == 0)
            return -1;
        if (got > 0) {
            position += got;
            done += got;
        }
    }
    // Nothing more will come: the end, for a sequential device.
    return done > 0 ? done : -1;
}

qint64 FifFileDevice::writeData(const char*, qint64)
{
    return -1;
}

} // namespace Orba
} // namespace Gui
