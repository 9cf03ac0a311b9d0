#pragma once

#include <QDateTime>
#include <QPlainTextEdit>
#include <QString>

class QAction;
class LineNumberGutter;
class MatchMarker;

namespace Gui {
namespace Orba {
class FifHit;
}
}

// The application's central widget: shows one text file read-only, with
// line numbers, at the line of a search hit with the match selected and the
// search's other matches on the lines in view marked.
class FileViewer : public QPlainTextEdit
{
    Q_OBJECT

public:
    explicit FileViewer(QWidget* parent = nullptr);

    // Opens the hit's file (unless it is already shown and unchanged), scrolls
    // to the hit's line and selects the match. When the file cannot be shown,
    // returns false with the reason in `error` and leaves the viewer as it was.
    bool showHit(const Gui::Orba::FifHit& hit, QString* error);

    // The canonical path of the file shown, empty before the first one.
    QString getFilePath() const;
    // The line of the cursor, from 1.
    int getCurrentLine() const;
    // The line of the hit shown, from 1; 0 before the first one.
    int getMarkedLine() const;

    // Open the file shown with the desktop's application for it (Ctrl+E),
    // and copy its path to the clipboard; enabled once a file is shown.
    QAction* getOpenInEditorAction() const;
    QAction* getCopyPathAction() const;

    // Files larger than this are not loaded.
    static constexpr qint64 maxFileBytes = 64 * 1024 * 1024;

signals:
    void fileOpened(const QString& path);
    // Something the user asked for could not be done.
    void failed(const QString& message);

protected:
    void contextMenuEvent(QContextMenuEvent* event) override;
    void resizeEvent(QResizeEvent* event) override;

private:
    bool loadFile(const QString& path, QString* error);
    void selectMatch(const Gui::Orba::FifHit& hit);
    void updateGutter();
    void openInEditor();

    QString filePath;
    QDateTime fileModified;
    qint64 fileSize = -1;
    LineNumberGutter* gutter = nullptr;
    MatchMarker* marker = nullptr;
    QAction* openInEditorAction = nullptr;
    QAction* copyPathAction = nullptr;
};
