#include "ChaseWidget.h"
#include "FifDialog.h"
#include "FifHitDelegate.h"
#include "FifHitsView.h"
#include "FifManager.h"
#include "FifSettings.h"
#include "FifReference.h"
#include "FifTest.h"

#include <QtTest>
#include <QtWidgets>

using namespace Gui::Orba;
using FifTest::holdUntilStopped;
using FifTest::items;

// A style that activates items on a single click, as some desktops do.
struct SingleClickStyle : QProxyStyle
{
    int styleHint(StyleHint hint, const QStyleOption* option, const QWidget* widget,
                  QStyleHintReturn* data) const override
    {
        return hint == SH_ItemView_ActivateItemOnSingleClick
                   ? 1 : QProxyStyle::styleHint(hint, option, widget, data);
    }
};

// A results view in a shown dock, on job 0 of its own manager, over `files`
// files with `hits` lines holding "needle" each and `plain` files without.
struct Fixture
{
    Fixture(int files, int hits, int plain = 0)
    {
        for (int f = 0; f < files + plain; ++f) {
            QByteArray bytes = "nothing\n";
            for (int h = 0; f < files && h < hits; ++h)
                bytes += "  needle " + QByteArray::number(f * 100 + h) + "\n";
            ready &= FifTest::write(dir.path(), QString("d%1/f%2.txt").arg(f % 3).arg(f), bytes);
        }
        FifTest::watch(job->getHitsModel());
        dock.setWidget(view); dock.show();
        ready &= QTest::qWaitForWindowExposed(&dock);
    }
    QAction* action(const char* name) const { return view->findChild<QAction*>(name); }
    QTreeView* tree() const { return view->findChild<QTreeView*>(); }
    QModelIndex index(int row) const { return tree()->model()->index(row, 0); }
    QString label() const { return view->getStatusLabel()->text(); }
    bool busy() const { return view->getToolBar()->actions().constLast()->isVisible(); } // the indicator
    bool listCommands(bool on) const // next, previous, goto, save and clear
    {
        const char* names[] = {"show-next-fifhit", "show-previous-fifhit", "show-current-fifhit",
                               "save-fifhits", "clear-fifresults"};
        return std::all_of(names, names + 5, [&](auto name) { return action(name)->isEnabled() == on; });
    }

    QTemporaryDir dir;
    bool ready = dir.isValid();
    FifManager manager;
    FifJob* job = manager.getJob(0);
    FifInput request = FifTest::request("needle", dir.path());
    QDockWidget dock;
    FifHitsView* view = new FifHitsView(job, &dock);
};

class tst_FifHitsView : public QObject
{
    Q_OBJECT

private slots:
    // The status line, the busy indicator and the commands, the view's own and
    // the linked ones, follow the search of the view's current job. Clearing
    // empties list and status, mid-search too.
    void statesFollowTheJob()
    {
        Fixture f(12, 3, 4);
        QAction next, previous, stop;
        next.setEnabled(false); previous.setEnabled(false); stop.setEnabled(false);
        f.view->linkNextAction(&next); f.view->linkPreviousAction(&previous); f.view->linkStopAction(&stop);
        QVERIFY(f.ready && !f.busy() && f.label().isEmpty() && f.listCommands(false));
        int searched = 0, cleared = 0;
        QObject probe;
        // Connected after the view: sees the label the view has just set.
        connect(f.job, &FifJob::searching, &probe, [&](const QString& file) {
            QCOMPARE(f.label(), "Searching " + file);
            if (++searched != 6)
                return;
            cleared = f.job->getLineHitCount();
            f.action("clear-fifresults")->trigger();
            QVERIFY(f.job->getLineHitCount() == 0 && f.label().isEmpty());
        });
        f.dock.hide();
        FifTest::EndWatcher end(f.job);
        QVERIFY(f.job->start(f.request)); // shows the dock at once, busy
        QVERIFY(f.dock.isVisible() && f.busy() && f.label() == "Searching...");
        QVERIFY(stop.isEnabled() && f.action("stop-fifjob")->isEnabled() && !next.isEnabled());
        bool usableWhileSearching = false;
        connect(f.job->getHitsModel(), &QAbstractItemModel::rowsInserted, &probe,
                [&] { usableWhileSearching |= next.isEnabled(); });
        QVERIFY(end.wait() && usableWhileSearching && cleared > 0 && searched == 16);
        QCOMPARE(f.label(), QString("Found %1 line(s) in 12 file(s) out of 16 file(s)").arg(36 - cleared));
        QVERIFY(!f.busy() && !stop.isEnabled() && !f.action("stop-fifjob")->isEnabled());
        QVERIFY(f.listCommands(true) && next.isEnabled() && previous.isEnabled());

        // Replaced mid-search, a job no longer reaches the view, nor its stop the job, and leaves
        // no selection model behind; deleted mid-search, it leaves the view idle, without a job.
        disconnect(f.job, nullptr, &probe, nullptr);
        FifJob* other = f.manager.getJob(1);
        FifTest::watch(other->getHitsModel());
        FifTest::EndWatcher firstEnd(f.job);
        QVERIFY(f.job->start(f.request) && f.busy() && stop.isEnabled());
        f.view->setJob(other);
        QVERIFY(!f.busy() && !stop.isEnabled() && f.tree()->model() == other->getHitsModel());
        QCOMPARE(f.tree()->findChildren<QItemSelectionModel*>(Qt::FindDirectChildrenOnly).size(), 1);
        QVERIFY(firstEnd.wait() && !f.label().startsWith("Found"));
        stop.setEnabled(true); stop.trigger();
        QVERIFY(other->shouldStop() && !f.job->shouldStop());
        other->setShouldStop(false); holdUntilStopped(other);
        QVERIFY(other->start(f.request));
        // The busy indicator turns while a search runs and stands still after.
        auto* chase = f.view->findChild<ChaseWidget*>();
        const QImage turning = chase->grab().toImage();
        QTRY_VERIFY(f.busy() && chase->grab().toImage() != turning);
        delete other; // stops the search and waits for its thread
        QVERIFY(!f.view->getJob() && !f.tree()->model() && !f.busy() && !stop.isEnabled());
        const QImage still = chase->grab().toImage();
        QTest::qWait(300); // whatever was queued finds no job
        QVERIFY(!f.view->getJob() && chase->grab().toImage() == still);
    }

    // The find command opens the dialog on the view's own job, on the manager's filters
    // first and on the last search later. Steps, wrap prompts, goto and double-click each
    // hand out one hit, the right one, and so do Enter and a double-click in a style that
    // activates on a single click, also through shared actions linked twice; a current
    // row never selected counts as none. Save writes the list to a file.
    void findNavigateAndSave()
    {
        Fixture f(4, 1);
        f.manager.setFilters({"*.txt", "*.log"});
        QStringList seen;
        const auto find = [&](const QString& what) {
            FifTest::EndWatcher end(f.job);
            const auto answered = FifTest::answer<FifDialog>([&](FifDialog* dialog) {
                for (const char* name : {"what", "where", "filter"})
                    seen << dialog->findChild<QComboBox*>(name)->currentText();
                dialog->findChild<QComboBox*>("what")->setEditText(what);
                dialog->findChild<QComboBox*>("where")->setEditText(f.dir.path());
                dialog->findChild<QPushButton*>("start")->click();
            });
            f.action("find-in-files")->trigger();
            return *answered && end.wait() && f.job->getInput().what == what;
        };
        QVERIFY(f.ready && find("needle") && seen.at(2) == "*.txt");
        QAction next, previous;
        for (int i = 0; i < 2; ++i) { f.view->linkNextAction(&next); f.view->linkPreviousAction(&previous); }
        QSignalSpy shown(f.view, &FifHitsView::showHit);
        QStringList prompts;
        QTimer answering; // No, Yes, No, Yes
        connect(&answering, &QTimer::timeout, [&] {
            if (auto* box = qobject_cast<QMessageBox*>(QApplication::activeModalWidget())) {
                prompts << box->windowTitle();
                box->button(prompts.size() % 2 ? QMessageBox::No : QMessageBox::Yes)->click();
            }
        });
        answering.start(10);
        QItemSelectionModel* selection = f.tree()->selectionModel();
        selection->setCurrentIndex(f.index(0), QItemSelectionModel::NoUpdate); // as taking the focus does
        for (QAction* step : {&next, &next, &next, &next, &next, &next, &previous, &previous, &previous})
            step->trigger();
        selection->setCurrentIndex(f.index(0), QItemSelectionModel::Clear);
        previous.trigger();
        f.tree()->setCurrentIndex(QModelIndex()); f.action("show-current-fifhit")->trigger();
        f.tree()->setCurrentIndex(f.index(2)); f.action("show-current-fifhit")->trigger();
        const QPoint cell = f.tree()->viewport()->mapTo(&f.dock, f.tree()->visualRect(f.index(1)).center());
        QTest::mouseDClick(f.dock.windowHandle(), Qt::LeftButton, {}, cell); // as the platform delivers it
        QTest::keyClick(f.tree(), Qt::Key_Return); // the current row, once
        SingleClickStyle style; // a double-click is still one showing
        f.tree()->setStyle(&style);
        QTest::mouseDClick(f.dock.windowHandle(), Qt::LeftButton, {},
                           f.tree()->viewport()->mapTo(&f.dock, f.tree()->visualRect(f.index(3)).center()));
        f.tree()->setStyle(nullptr);
        f.view->unlinkActions(); next.trigger();
        QStringList rows, expected;
        for (const QList<QVariant>& signal : shown)
            rows << signal.at(0).value<FifHit>().toString();
        for (int row : {0, 1, 2, 3, 0, 3, 2, 3, 0, 2, 1, 1, 3})
            expected << FifTest::hits(f.job->getHitsModel()).value(row).toString();
        QCOMPARE(rows, expected);
        QCOMPARE(prompts, QStringList({"Reach bottom", "Reach bottom", "Reach top", "Reach top"}));

        const QString path = f.dir.filePath("saved.out"); // not searched: the filter is *.txt
        const auto answered = FifTest::answer<QFileDialog>([path](QFileDialog* chooser) {
            chooser->findChild<QLineEdit*>("fileNameEdit")->setText(path);
            static_cast<QDialog*>(chooser)->accept();
        });
        f.action("save-fifhits")->trigger();
        QFile file(path);
        QVERIFY(*answered && file.open(QIODevice::ReadOnly));
        for (int row = 0; row < 4; ++row)
            QCOMPARE(file.readLine(), f.index(row).data().toString().toUtf8() + '\n');
        QVERIFY(file.atEnd() && find("needle 1"));
        QCOMPARE(seen.mid(3), QStringList({"needle", f.dir.path(), "*.txt"}));
        QCOMPARE(f.label(), QString("Found 1 line(s) in 1 file(s) out of 4 file(s)")); // "needle 100"
    }

    // Each row shows its line's first match highlighted, found where a plain reading of the
    // file finds it, after any file name and line; painted over those characters, in the
    // highlight colours, swapped in the selected row.
    void matchesHighlighted_data()
    {
        QTest::addColumn<FifInput>("request");
        QTest::addColumn<QString>("file");
        QTest::addColumn<QByteArray>("bytes");
        const QString text = "x\nGrüße 😀 needles, NEEDLE\r\n  needle_1 ä needle-2 needle\n";
        const auto row = [&](const char* name, const FifInput& request, const char* file) {
            QTest::newRow(name) << request << file << text.toUtf8();
        };
        row("literal", FifTest::request("needle", {}), "ä/ö (2).txt");
        row("literal, case", FifTest::request("NEEDLE", {}, QRegExp::FixedString, true), "a.txt");
        row("wildcard", FifTest::request("n?ed*s", {}, QRegExp::Wildcard), "a.txt");
        row("regexp", FifTest::request("ne+dle-\\d", {}, QRegExp::RegExp2), "a.txt");
        row("word", FifTest::request("needle", {}, QRegExp::FixedString, false, true), "a.txt");
        QTest::newRow("UTF-16") << FifTest::request("needle", {}) << "b.txt"
            << QByteArray(QStringEncoder(QStringEncoder::Utf16BE, QStringEncoder::Flag::WriteBom)(text));
    }
    void matchesHighlighted()
    {
        QFETCH(FifInput, request); QFETCH(QString, file); QFETCH(QByteArray, bytes);
        Fixture f(0, 0);
        f.dock.resize(1000, 300);
        request.where = f.dir.path();
        QVERIFY(f.ready && FifTest::write(f.dir.path(), file, bytes) && FifTest::run(f.job, request));
        QRegExp rx = request.getRegExp();
        const QList<FifReference::Line> lines = FifReference::lines(bytes);
        auto* delegate = qobject_cast<FifHitDelegate*>(f.tree()->itemDelegate());
        const int rows = f.tree()->model()->rowCount();
        QVERIFY(delegate && rows > 0 && rows == FifReference::matches(bytes, rx).size());
        const QFontMetrics metrics = f.tree()->fontMetrics();
        const QPalette::ColorGroup group = f.tree()->isActiveWindow() ? QPalette::Active : QPalette::Inactive;
        const QColor highlight = f.tree()->palette().color(group, QPalette::Highlight);
        const QColor highlightedText = f.tree()->palette().color(group, QPalette::HighlightedText);
        QSet<int> origins; // where each row's text starts, as the painted match tells
        for (int row = 0; row < rows; ++row) {
            const FifHit hit = FifTest::hits(f.job->getHitsModel()).at(row);
            const QString shown = f.index(row).data().toString();
            const QString prefix = QString("%1 (%2): ").arg(QDir::toNativeSeparators(hit.file)).arg(hit.line);
            const int column = rx.indexIn(lines.value(hit.line - 1).text);
            const FifHitDelegate::Range range = delegate->matchRange(f.index(row));
            QCOMPARE(QString("%1+%2").arg(range.start).arg(range.length),
                     QString("%1+%2").arg(prefix.size() + column).arg(rx.matchedLength()));
            QVERIFY(column >= 0 && shown.startsWith(prefix) && shown.mid(range.start, range.length) == rx.cap(0));
            // Not selected: the columns holding the highlight colour span the match.
            const QRect cell = f.tree()->visualRect(f.index(row));
            f.tree()->clearSelection();
            QImage shot = f.tree()->viewport()->grab().toImage();
            int first = -1, last = -1;
            for (int x = cell.left(); x <= cell.right(); ++x)
                for (int y = cell.top(); y <= cell.bottom(); ++y)
                    if (shot.pixelColor(x, y) == highlight) {
                        (first < 0 ? first : last) = x;
                        break;
                    }
            QVERIFY2(qAbs(last - first + 1 - metrics.horizontalAdvance(rx.cap(0))) <= 1, qPrintable(shown));
            origins << first - metrics.horizontalAdvance(shown.left(range.start));
            // Selected: the match's background is the highlighted text's colour, the row's is not.
            f.tree()->selectionModel()->select(f.index(row), QItemSelectionModel::ClearAndSelect);
            shot = f.tree()->viewport()->grab().toImage();
            const auto share = [&](int from, int to) {
                int hits = 0;
                for (int x = from; x <= to; ++x)
                    for (int y = cell.top(); y <= cell.bottom(); ++y)
                        hits += shot.pixelColor(x, y) == highlightedText;
                return double(hits) / ((to - from + 1) * cell.height());
            };
            QVERIFY(share(first, last) > 0.5 && share(cell.left(), first - 1) < 0.3 && share(last + 1, cell.right()) < 0.3);
        }
        QVERIFY2(origins.size() == 1 || qAbs(*origins.begin() - *std::next(origins.begin())) <= 1,
                 qPrintable(QString::number(origins.values().constFirst())));
    }
};

FIF_HOST_TEST_MAIN(tst_FifHitsView)
#include "tst_fifhitsview.moc"
