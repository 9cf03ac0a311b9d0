#include "ActionHandler.h"

#include <QAction>
#include <QtTest>

#include <memory>

using namespace Gui::Orba;

namespace {

// Records what the host's calls reach.
class RecordingHandler : public ActionHandler
{
public:
    using ActionHandler::ActionHandler;

    bool doAction() override
    {
        triggeredBy.append(qobject_cast<QAction*>(sender()));
        return true;
    }

    void updateAction(QAction* action) override
    {
        updated.append(action);
        if (action == deleteOnUpdate)
            delete victim;
    }

    QList<QAction*> triggeredBy;
    QList<QAction*> updated;
    QAction* deleteOnUpdate = nullptr;
    QAction* victim = nullptr;
};

} // namespace

class tst_ActionHandler : public QObject
{
    Q_OBJECT

private slots:
    void baseDoesNothing()
    {
        ActionHandler handler;
        QVERIFY(!handler.doAction());
        QAction action;
        handler.addAction(&action);
        handler.updateAction(&action);
        action.trigger();
        QVERIFY(action.isEnabled());
    }

    void triggerReachesDoAction()
    {
        RecordingHandler handler;
        QAction first;
        QAction second;
        handler.addAction(&first);
        handler.addAction(&second);
        handler.addAction(&first); // once is enough
        handler.addAction(nullptr);
        QCOMPARE(handler.getActions(), (QList<QAction*>{&first, &second}));

        first.trigger();
        second.trigger();
        QCOMPARE(handler.triggeredBy, (QList<QAction*>{&first, &second}));
        handler.updateActions();
        QCOMPARE(handler.updated, (QList<QAction*>{&first, &second}));
    }

    void removedActionIsLetGo()
    {
        RecordingHandler handler;
        QAction action;
        handler.addAction(&action);
        handler.removeAction(&action);
        handler.removeAction(&action);
        handler.removeAction(nullptr);
        QVERIFY(handler.getActions().isEmpty());
        action.trigger();
        QVERIFY(handler.triggeredBy.isEmpty());
        handler.updateActions();
        QVERIFY(handler.updated.isEmpty());

        handler.addAction(&action);
        action.trigger();
        QCOMPARE(handler.triggeredBy.size(), 1);
    }

    void destroyedActionIsForgotten()
    {
        RecordingHandler handler;
        auto* gone = new QAction;
        QAction kept;
        handler.addAction(gone);
        handler.addAction(&kept);
        delete gone;
        QCOMPARE(handler.getActions(), QList<QAction*>{&kept});
        handler.updateActions();
        QCOMPARE(handler.updated, QList<QAction*>{&kept});
    }

    void actionDeletedWhileUpdating()
    {
        RecordingHandler handler;
        QAction first;
        auto* second = new QAction;
        QAction third;
        handler.addAction(&first);
        handler.addAction(second);
        handler.addAction(&third);
        handler.deleteOnUpdate = &first;
        handler.victim = second;
        handler.updateActions();
        QCOMPARE(handler.updated, (QList<QAction*>{&first, &third}));
    }

    void handlerGoneBeforeAction()
    {
        QAction action;
        {
            RecordingHandler handler;
            handler.addAction(&action);
        }
        action.trigger(); // reaches nobody
        QVERIFY(action.isEnabled());
    }
};

QTEST_MAIN(tst_ActionHandler)
#include "tst_actionhandler.moc"
