#pragma once

#include "fif_export.h"

#include <QAction>
#include <QString>

namespace Gui {
namespace Orba {

// The library's four commands, created by the host. They live in one header
// so that a host includes one file for the commands and their handler.
//
// Each command's object name is its id (Name()). The texts are built on the
// first construction of a class and shared by later instances.

// "find-in-files": opens the find dialog; served by FifHandler.
class FIF_EXPORT FifAction : public QAction
{
public:
    explicit FifAction(QObject* parent = nullptr);
    ~FifAction() override;

    static QString Name();
};

// "show-next-fifhit": the shared next-result command lent to the visible
// result dock.
class FIF_EXPORT ShowNextFifHitAction : public QAction
{
public:
    explicit ShowNextFifHitAction(QObject* parent = nullptr);
    ~ShowNextFifHitAction() override;

    static QString Name();
    // Back to the constructed state: disabled.
    void customize();
};

// "show-previous-fifhit": the shared previous-result command.
class FIF_EXPORT ShowPreviousFifHitAction : public QAction
{
public:
    explicit ShowPreviousFifHitAction(QObject* parent = nullptr);
    ~ShowPreviousFifHitAction() override;

    static QString Name();
    // Back to the constructed state: disabled.
    void customize();
};

// "stop-fifjob": the shared stop command; it has no shortcut.
class FIF_EXPORT StopFifJobAction : public QAction
{
public:
    explicit StopFifJobAction(QObject* parent = nullptr);
    ~StopFifJobAction() override;

    static QString Name();
    // Back to the constructed state: disabled.
    void customize();
};

} // namespace Orba
} // namespace Gui
