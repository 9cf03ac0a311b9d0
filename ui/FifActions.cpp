#include "FifActions.h"

#include "ImageManager.h"

#include <QKeySequence>

namespace Gui {
namespace Orba {

namespace {

// What distinguishes one command from another.
struct CommandTexts
{
    QString text;
    QString toolTip;
    QString shortcut;
    QString statusTip;
    QString iconId;
};

void setUp(QAction* action, const QString& name, const CommandTexts& texts, bool enabled)
{
    action->setObjectName(name);
    action->setText(texts.text);
    action->setToolTip(texts.toolTip);
    action->setShortcut(QKeySequence(texts.shortcut));
    action->setStatusTip(texts.statusTip);
    action->setIcon(ImageManager::getInstance()->getIcon(texts.iconId));
    if (!enabled)
        action->setEnabled(false);
}

} // namespace

FifAction::FifAction(QObject* parent)
    : QAction(parent)
{
    static const CommandTexts texts{
        QAction::tr("Find in Files"), QAction::tr("Find Text in Files"),
        QAction::tr("Ctrl+Shift+F"), QAction::tr("Find a text pattern in files"),
        QStringLiteral("gui-orba-find-in-files")};
    setUp(this, Name(), texts, true);
}

FifAction::~FifAction() = default;

QString FifAction::Name()
{
    return QStringLiteral("find-in-files");
}

ShowNextFifHitAction::ShowNextFifHitAction(QObject* parent)
    : QAction(parent)
{
    static const CommandTexts texts{
        QAction::tr("Show Next Result"), QAction::tr("Next Find in Files Result"),
        QAction::tr("Ctrl+F8"), QAction::tr("Show the next find in files result"),
        QStringLiteral("gui-orba-show-next-fifhit")};
    setUp(this, Name(), texts, false);
}

ShowNextFifHitAction::~ShowNextFifHitAction() = default;

QString ShowNextFifHitAction::Name()
{
    return QStringLiteral("show-next-fifhit");
}

void ShowNextFifHitAction::customize()
{
    setEnabled(false);
}

ShowPreviousFifHitAction::ShowPreviousFifHitAction(QObject* parent)
    : QAction(parent)
{
    static const CommandTexts texts{
        QAction::tr("Show Previous Result"), QAction::tr("Previous Find in Files Result"),
        QAction::tr("Ctrl+Shift+F8"), QAction::tr("Show the previous find in files result"),
        QStringLiteral("gui-orba-show-previous-fifhit")};
    setUp(this, Name(), texts, false);
}

ShowPreviousFifHitAction::~ShowPreviousFifHitAction() = default;

QString ShowPreviousFifHitAction::Name()
{
    return QStringLiteral("show-previous-fifhit");
}

void ShowPreviousFifHitAction::customize()
{
    setEnabled(false);
}

StopFifJobAction::StopFifJobAction(QObject* parent)
    : QAction(parent)
{
    // The stop command has no shortcut: an empty key sequence, not translated.
    static const CommandTexts texts{
        QAction::tr("Stop"), QAction::tr("Stop Find in Files Job"), QString(),
        QAction::tr("Stop current find in files job"),
        QStringLiteral("gui-orba-stop-fifjob")};
    setUp(this, Name(), texts, false);
}

StopFifJobAction::~StopFifJobAction() = default;

QString StopFifJobAction::Name()
{
    return QStringLiteral("stop-fifjob");
}

void StopFifJobAction::customize()
{
    setEnabled(false);
}

} // namespace Orba
} // namespace Gui
