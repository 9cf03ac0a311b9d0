#pragma once

#include <QDateTime>
#include <QPlainTextEdit>
#include <QString>

namespace Gui {
namespace Orba {
class FifHit;
}
}

// The application's central widget: shows one text file read-only, at the
// line of a search hit with the match selected.
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

    // Files larger than this are not loaded.
    static constexpr qint64 maxFileBytes = 64 * 1024 * 1024;

signals:
    void fileOpened(const QString& path);

private:
    bool loadFile(const QString& path, QString* error);
    void selectMatch(const Gui::Orba::FifHit& hit);

    QString filePath;
    QDateTime fileModified;
    qint64 fileSize = -1;
};
