#pragma once

// Helpers for tests that search real files in a temporary folder.

#include <QByteArray>
#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QSignalSpy>
#include <QString>
#include <QTemporaryDir>
#include <QTest>

namespace TestTree {

// Writes `bytes` to `root`/`relativePath`, creating folders on the way.
inline bool write(const QString& root, const QString& relativePath, const QByteArray& bytes)
{
    const QString path = root + QLatin1Char('/') + relativePath;
    if (!QDir().mkpath(QFileInfo(path).absolutePath()))
        return false;
    QFile file(path);
    if (!file.open(QIODevice::WriteOnly))
        return false;
    return file.write(bytes) == bytes.size();
}

} // namespace TestTree

// Starts `job` on `request` and waits until its thread has ended and every
// queued hit has reached the model.
#define FIF_RUN_JOB(job, request, timeoutMs)                                        \
    do {                                                                           \
        QSignalSpy fifFinishedSpy((job), &QThread::finished);                     \
        QVERIFY((job)->start(request));                                            \
        /* wait() only sees a finished() emitted after it is called */ \
        QVERIFY(fifFinishedSpy.count() > 0 || fifFinishedSpy.wait(timeoutMs)); \
        QTRY_VERIFY(!(job)->isRunning());                                          \
        QCoreApplication::processEvents();                                         \
    } while (0)
