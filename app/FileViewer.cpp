#include "FileViewer.h"

#include "FifFileDecoder.h"
#include "FifHit.h"
#include "FifInput.h"
#include "FifJob.h"
#include "ImageManager.h"
#include "LineNumberGutter.h"
#include "MatchMarker.h"

#include <QAction>
#include <QClipboard>
#include <QContextMenuEvent>
#include <QDesktopServices>
#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QFontDatabase>
#include <QGuiApplication>
#include <QMenu>
#include <QTextBlock>
#include <QUrl>
#include <QtCore5Compat/QRegExp>

#include <memory>

namespace {

// The search counts one character per line break and ends lines at "\n"
// only. The document would also break lines at a lone "\r" and at a few
// other characters; those are shown as a replacement mark of the same
// length, so that a document position equals the hit's offset.
QString toDocumentText(QString text)
{
    text.replace(QStringLiteral("\r\n"), QStringLiteral("\n"));
    for (QChar& c : text) {
        const char16_t u = c.unicode();
        if (u == u'\r' || u == 0x2029 || u == 0xFDD0 || u == 0xFDD1)
            c = QChar(0xFFFD);
    }
    return text;
}

} // namespace

FileViewer::FileViewer(QWidget* parent)
    : QPlainTextEdit(parent)
{
    setObjectName(QStringLiteral("FileViewer"));
    setReadOnly(true);
    setUndoRedoEnabled(false);
    setLineWrapMode(QPlainTextEdit::NoWrap);
    setFont(QFontDatabase::systemFont(QFontDatabase::FixedFont));
    setPlaceholderText(tr("Find text in files with Edit > Find in Files (Ctrl+Shift+F); "
                          "the result chosen in the results dock is shown here."));

    gutter = new LineNumberGutter(this);
    connect(this, &QPlainTextEdit::blockCountChanged, this, &FileViewer::updateGutter);
    connect(this, &QPlainTextEdit::updateRequest, gutter, &LineNumberGutter::follow);
    updateGutter();
    marker = new MatchMarker(this);

    auto* images = Gui::Orba::ImageManager::getInstance();
    openInEditorAction = new QAction(images->getIcon(QStringLiteral("gui-orba-open-in-editor")),
                                     tr("Open in &Editor"), this);
    openInEditorAction->setObjectName(QStringLiteral("openInEditor"));
    openInEditorAction->setShortcut(QKeySequence(Qt::CTRL | Qt::Key_E));
    openInEditorAction->setToolTip(tr("Open the File in Its Editor"));
    openInEditorAction->setEnabled(false);
    connect(openInEditorAction, &QAction::triggered, this, &FileViewer::openInEditor);
    copyPathAction = new QAction(images->getIcon(QStringLiteral("gui-orba-copy-path")),
                                 tr("Copy &Path"), this);
    copyPathAction->setObjectName(QStringLiteral("copyPath"));
    copyPathAction->setToolTip(tr("Copy the File's Path"));
    copyPathAction->setEnabled(false);
    connect(copyPathAction, &QAction::triggered, this, [this] {
        QGuiApplication::clipboard()->setText(QDir::toNativeSeparators(filePath));
    });
}

bool FileViewer::showHit(const Gui::Orba::FifHit& hit, QString* error)
{
    if (!hit.isValid()) {
        if (error)
            *error = tr("The result's search no longer exists.");
        return false;
    }
    const QString path = hit.getCanonicalFilePath();
    if (path.isEmpty()) {
        const QString name = QFileInfo(hit.job->getWorkingDir(), hit.file).absoluteFilePath();
        if (error)
            *error = tr("%1 no longer exists.").arg(QDir::toNativeSeparators(name));
        return false;
    }
    if (!loadFile(path, error))
        return false;
    selectMatch(hit);
    return true;
}

QString FileViewer::getFilePath() const
{
    return filePath;
}

int FileViewer::getCurrentLine() const
{
    return textCursor().blockNumber() + 1;
}

int FileViewer::getMarkedLine() const
{
    return marker->getMarkedLine();
}

QAction* FileViewer::getOpenInEditorAction() const
{
    return openInEditorAction;
}

QAction* FileViewer::getCopyPathAction() const
{
    return copyPathAction;
}

void FileViewer::contextMenuEvent(QContextMenuEvent* event)
{
    std::unique_ptr<QMenu> menu(createStandardContextMenu(event->pos()));
    menu->addSeparator();
    menu->addAction(openInEditorAction);
    menu->addAction(copyPathAction);
    menu->exec(event->globalPos());
}

void FileViewer::resizeEvent(QResizeEvent* event)
{
    QPlainTextEdit::resizeEvent(event);
    updateGutter();
}

void FileViewer::updateGutter()
{
    const int width = gutter->sizeHint().width();
    setViewportMargins(width, 0, 0, 0);
    const QRect area = contentsRect();
    gutter->setGeometry(area.left(), area.top(), width, area.height());
}

void FileViewer::openInEditor()
{
    if (!filePath.isEmpty() && !QDesktopServices::openUrl(QUrl::fromLocalFile(filePath)))
        emit failed(tr("No application opens %1.").arg(QDir::toNativeSeparators(filePath)));
}

bool FileViewer::loadFile(const QString& path, QString* error)
{
    const QFileInfo info(path);
    if (path == filePath && info.lastModified() == fileModified && info.size() == fileSize)
        return true;

    const QString shown = QDir::toNativeSeparators(path);
    if (info.size() > maxFileBytes) {
        if (error)
            *error = tr("%1 is too large to show (%2 MB).").arg(shown).arg(info.size() >> 20);
        return false;
    }
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly)) {
        if (error)
            *error = tr("Cannot open %1: %2").arg(shown, file.errorString());
        return false;
    }
    const QByteArray bytes = file.readAll();
    if (file.error() != QFileDevice::NoError) {
        if (error)
            *error = tr("Cannot read %1: %2").arg(shown, file.errorString());
        return false;
    }

    // Decoded as the search read it, so that offsets agree.
    setPlainText(toDocumentText(Gui::Orba::FifFileDecoder::decodeFile(bytes)));
    filePath = path;
    fileModified = info.lastModified();
    fileSize = info.size();
    openInEditorAction->setEnabled(true);
    copyPathAction->setEnabled(true);
    emit fileOpened(path);
    return true;
}

void FileViewer::selectMatch(const Gui::Orba::FifHit& hit)
{
    QTextBlock block = document()->findBlockByNumber(hit.line - 1);
    if (!block.isValid()) // the file has lost lines since the search
        block = document()->lastBlock();
    const QString text = block.text();
    QRegExp rx = hit.job ? hit.job->getInput().getRegExp() : QRegExp();

    // On a line as the search read it, the hit tells where its match is. A
    // line changed since is matched again: at the hit's column first, else
    // anywhere; with nothing to go by, the whole line is selected.
    int column = hit.column;
    int length = hit.length;
    if (column < 0 || text != toDocumentText(hit.text)) {
        column = hit.offset - block.position();
        if (column >= 0 && column <= text.size() && rx.indexIn(text, column) == column) {
            length = rx.matchedLength();
        } else if (rx.indexIn(text) >= 0) {
            column = rx.pos();
            length = rx.matchedLength();
        } else {
            column = 0;
            length = text.size();
        }
    }

    QTextCursor cursor(block);
    cursor.setPosition(block.position() + column);
    cursor.setPosition(block.position() + column + length, QTextCursor::KeepAnchor);
    setTextCursor(cursor);
    centerCursor();
    marker->mark(rx, block.blockNumber() + 1);
}
