#pragma once

#include "fif_export.h"
#include "FifHit.h"

#include <QPointer>
#include <QWidget>

class QAction;
class QContextMenuEvent;
class QLabel;
class QModelIndex;
class QToolBar;
class QTreeView;
class QVBoxLayout;

namespace Gui {
namespace Orba {

class ChaseWidget;
class FifJob;

// Shows the hits of one search job: a tool bar with the view's commands, a
// status line and a busy indicator above a flat list of hit lines. The hit
// the user steps to, goes to, double-clicks or presses Enter on is handed out
// through showHit. Each row shows its match highlighted.
class FIF_EXPORT FifHitsView : public QWidget
{
    Q_OBJECT

public:
    FifHitsView(FifJob* job, QWidget* parent);
    ~FifHitsView() override;

    // Follows `job` from now on; the same job again changes nothing.
    void setJob(FifJob* job);
    FifJob* getJob() const;
    QToolBar* getToolBar() const;
    QLabel* getStatusLabel() const;

    // Lend the host's shared commands to this view: triggering a linked action
    // triggers the view's own one, and the view keeps its enabled state in line.
    void linkNextAction(QAction* action);
    void linkPreviousAction(QAction* action);
    void linkStopAction(QAction* action);
    void unlinkActions();

signals:
    // The hit the user has chosen; the host opens its file at its line.
    void showHit(const Gui::Orba::FifHit& hit);

public slots:
    void next();
    void previous();
    void setIconSize(const QSize& iconSize);
    // Opens the find dialog for this view's own job.
    void onFifAction();

private slots:
    void onAboutToStart();
    void onEnded();
    void onSearching(const QString& file);
    void updateActions();
    void showCurrentIndex();
    void showIndex(const QModelIndex& mi) const;
    void saveAs() const;
    void removeAllRows();

protected:
    void contextMenuEvent(QContextMenuEvent* event) override;

private:
    void nextOrPrevious(bool forward);
    // Asks whether to wrap around; false when the user declines.
    bool confirmWrap(const QString& title, const QString& text);
    void selectAndShow(const QModelIndex& index);
    void followRows(bool follow);
    // Stills the busy indicator and disables the stop commands of a search
    // that is no longer followed.
    void leaveSearching();

    FifJob* job = nullptr;
    QVBoxLayout* vboxLayout = nullptr;
    QToolBar* toolBar = nullptr;
    QLabel* statusLabel = nullptr;
    QTreeView* treeView = nullptr;
    QAction* findInFilesAction = nullptr;
    QAction* showCurrentAction = nullptr;
    QAction* clearAction = nullptr;
    QAction* saveAction = nullptr;
    ChaseWidget* chaseWidget = nullptr;
    QAction* chaseWidgetAction = nullptr;

    // A command of the view and the host's shared action lent to it:
    // triggering the shared one triggers the view's own, and the two are
    // enabled alike.
    struct SharedCommand
    {
        void link(QAction* action);
        void setEnabled(bool enabled);

        QAction* own = nullptr;
        QPointer<QAction> linked;
    };
    SharedCommand nextCommand;
    SharedCommand previousCommand;
    SharedCommand stopCommand;
};

} // namespace Orba
} // namespace Gui
