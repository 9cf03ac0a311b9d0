#pragma once

// What the suites share: real files in temporary folders, search jobs run to
// their end, models checked while they change, modal dialogs answered from
// inside their own event loop as a user would, and a host application whose
// settings store lives in memory.

#include "ApplicationBase.h"
#include "FifHitsModel.h"
#include "FifInput.h"
#include "FifJob.h"
#include "Settings.h"

#include <QAbstractItemModelTester>
#include <QApplication>
#include <QComboBox>
#include <QDir>
#include <QEventLoop>
#include <QFile>
#include <QFileInfo>
#include <QStandardPaths>
#include <QTest>
#include <QTimer>

#include <functional>
#include <memory>

namespace FifTest {

using namespace Gui::Orba;

// Writes `bytes` to `root`/`path`, making the folders on the way.
inline bool write(const QString& root, const QString& path, const QByteArray& bytes)
{
    QFile file(root + QLatin1Char('/') + path);
    return QDir().mkpath(QFileInfo(file).absolutePath()) && file.open(QIODevice::WriteOnly)
           && file.write(bytes) == bytes.size();
}

inline FifInput request(const QString& what, const QString& where,
                        int matchType = QRegExp::FixedString, bool matchCase = false,
                        bool matchWord = false)
{
    FifInput input;
    input.what = what;
    input.where = where;
    input.matchType = matchType;
    input.matchCase = matchCase ? Qt::CaseSensitive : Qt::CaseInsensitive;
    input.matchWord = matchWord;
    return input;
}

// Checks every change of `model` from now on, for as long as the model lives.
inline void watch(QAbstractItemModel* model)
{
    new QAbstractItemModelTester(model, QAbstractItemModelTester::FailureReportingMode::QtTest,
                                 model);
}

inline QList<FifHit> hits(const FifHitsModel* model)
{
    QList<FifHit> list;
    for (int row = 0; row < model->rowCount(); ++row)
        list << model->index(row).data(Qt::UserRole).value<FifHit>();
    return list;
}

// Waits for the end of a search started after it was made. finished() is
// emitted on the job's thread, so it is taken through a queued connection,
// after which every hit sent before it has reached the model.
class EndWatcher
{
public:
    explicit EndWatcher(FifJob* job)
        : job(job)
    {
        QObject::connect(job, &QThread::finished, &loop, [this] { ended = true; loop.quit(); },
                         Qt::QueuedConnection);
    }

    bool wait(int timeoutMs = 20000)
    {
        if (!ended) {
            QTimer::singleShot(timeoutMs, &loop, &QEventLoop::quit);
            loop.exec();
        }
        if (!ended || !QTest::qWaitFor([this] { return !job->isRunning(); }, timeoutMs))
            return false;
        QCoreApplication::processEvents();
        return true;
    }

private:
    FifJob* job;
    QEventLoop loop;
    bool ended = false;
};

inline bool run(FifJob* job, const FifInput& input, int timeoutMs = 20000)
{
    EndWatcher watcher(job);
    return job->start(input) && watcher.wait(timeoutMs);
}

// Keeps the job's search thread at its start, running, until the job is
// asked to stop: a search that is surely still busy.
inline QMetaObject::Connection holdUntilStopped(FifJob* job)
{
    const auto hold = [job] { while (!job->shouldStop()) QThread::msleep(2); };
    return QObject::connect(job, &QThread::started, job, hold, Qt::DirectConnection);
}

inline QStringList items(const QComboBox* box)
{
    QStringList list;
    for (int i = 0; i < box->count(); ++i)
        list << box->itemText(i);
    return list;
}

// Calls `answer` once with the next modal widget of type T, from inside that
// widget's event loop. The flag reads true once it was answered.
template <class T = QWidget>
std::shared_ptr<bool> answer(typename std::common_type<std::function<void(T*)>>::type answer,
                             int timeoutMs = 10000)
{
    auto answered = std::make_shared<bool>(false);
    auto* timer = new QTimer;
    auto deadline = std::make_shared<QDeadlineTimer>(timeoutMs);
    QObject::connect(timer, &QTimer::timeout, [=] {
        T* modal = qobject_cast<T*>(QApplication::activeModalWidget());
        if (!modal && !deadline->hasExpired())
            return;
        timer->deleteLater();
        timer->stop();
        if (modal) {
            *answered = true;
            answer(modal);
        }
    });
    timer->start(10);
    return answered;
}

// A copy of an INI file under a new name: Qt caches the files it has parsed
// within a process, so only a copy shows what really is on disk.
inline QString freshCopy(const QString& fileName)
{
    static int counter = 0;
    const QString copy = fileName + QStringLiteral(".copy%1.ini").arg(++counter);
    QFile::remove(copy);
    return QFile::copy(fileName, copy) ? copy : QString();
}

} // namespace FifTest

// A test main whose host application keeps its settings store in memory, so
// that no test touches the user's settings file.
#define FIF_HOST_TEST_MAIN(TestObject)                                                   \
    int main(int argc, char** argv)                                                      \
    {                                                                                    \
        QStandardPaths::setTestModeEnabled(true);                                        \
        Gui::Orba::ApplicationBase app(argc, argv);                                      \
        Gui::Orba::Settings settings;                                                    \
        app.setSettings(&settings);                                                      \
        app.setAttribute(Qt::AA_Use96Dpi, true);                                         \
        TestObject tc;                                                                   \
        QTEST_SET_MAIN_SOURCE_PATH                                                       \
        const int result = QTest::qExec(&tc, argc, argv);                                \
        app.setSettings(nullptr);                                                        \
        return result;                                                                   \
    }
