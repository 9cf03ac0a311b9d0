#pragma once

// Helpers for tests that search real files in a temporary folder.

#include <QByteArray>
#include <QDir>
#include <QEventLoop>
#include <QFile>
#include <QFileInfo>
#include <QSignalSpy>
#include <QString>
#include <QTemporaryDir>
#include <QTest>
#include <QThread>
#include <QTimer>

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
// queued hit has reached the model. The end is noticed through a queued
// connection: finished() is emitted on the job's thread, and a QSignalSpy
// would record it there while the test thread reads it.
#define FIF_RUN_JOB(job, request, timeoutMs)                                        \
    do {                                                                           \
        QEventLoop fifLoop;                                                        \
        bool fifEnded = false;                                                     \
        QObject::connect((job), &QThread::finished, &fifLoop,                      \
                         [&] { fifEnded = true; fifLoop.quit(); },                 \
                         Qt::QueuedConnection);                                    \
        QVERIFY((job)->start(request));                                            \
        QTimer::singleShot((timeoutMs), &fifLoop, &QEventLoop::quit);              \
        if (!fifEnded)                                                             \
            fifLoop.exec();                                                        \
        QVERIFY2(fifEnded, "the search did not end in time");                      \
        QTRY_VERIFY(!(job)->isRunning());                                          \
        QCoreApplication::processEvents();                                         \
    } while (0)
