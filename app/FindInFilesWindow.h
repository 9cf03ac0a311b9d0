#pragma once

#include "MainWindow.h"

#include <QPointer>
#include <QString>

class QAction;
class QMenu;

class FileViewer;

namespace Gui {
namespace Orba {
class FifAction;
class FifHandler;
class FifHit;
class FifInput;
class FifResultsDockWidget;
class ShowNextFifHitAction;
class ShowPreviousFifHitAction;
class StopFifJobAction;
}
}

// The findinfiles main window: the library's commands in the menus and tool
// bar, its two result docks at the bottom, and a file viewer in the middle
// that shows each result chosen in either dock.
class FindInFilesWindow : public Gui::Orba::MainWindow
{
    Q_OBJECT

public:
    // A non-empty `startFolder` is offered by the first Find in Files of the
    // session, whatever folder the last session searched.
    explicit FindInFilesWindow(const QString& startFolder = QString(),
                               QWidget* parent = nullptr);
    ~FindInFilesWindow() override;

    FileViewer* getViewer() const;
    Gui::Orba::FifAction* getFindAction() const;
    Gui::Orba::ShowNextFifHitAction* getNextAction() const;
    Gui::Orba::ShowPreviousFifHitAction* getPreviousAction() const;
    Gui::Orba::StopFifJobAction* getStopAction() const;
    Gui::Orba::FifHandler* getHandler() const;
    // Dock 0 or 1; null once it has been destroyed.
    Gui::Orba::FifResultsDockWidget* getResultsDock(int index) const;

public slots:
    // Shows the hit in the viewer, or tells in the status bar why not.
    void showHit(const Gui::Orba::FifHit& hit);

private slots:
    void updateFindAction();
    void offerStartFolder(Gui::Orba::FifInput& input);
    void showHelpTopic(const QString& topic);
    void about();

private:
    void createActions();
    void createDocks();
    void createMenus();

    FileViewer* viewer = nullptr;
    Gui::Orba::FifAction* findAction = nullptr;
    Gui::Orba::ShowNextFifHitAction* nextAction = nullptr;
    Gui::Orba::ShowPreviousFifHitAction* previousAction = nullptr;
    Gui::Orba::StopFifJobAction* stopAction = nullptr;
    Gui::Orba::FifHandler* handler = nullptr;
    QPointer<Gui::Orba::FifResultsDockWidget> docks[2];
    QMenu* editMenu = nullptr;
    QString startFolder;
};
