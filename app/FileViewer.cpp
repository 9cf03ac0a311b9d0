#include "FileViewer.h"

#include "FifFileDecoder.h"
#include "FifHit.h"
#include "FifInput.h"
#include "FifJob.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QFontDatabase>
#include <QTextBlock>
#include <QtCore5Compat/QRegExp>

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
    emit fileOpened(path);
    return true;
}

void FileViewer::selectMatch(const Gui::Orba::FifHit& hit)
{
    QTextBlock block = document()->findBlockByNumber(hit.line - 1);
    if (!block.isValid()) // the file has lost lines since the search
        block = document()->lastBlock();
    const QString text = block.text();

    // The hit's offset counts from the start of the file; the match's column
    // is its distance from the line's start. The match's length comes from
    // matching the job's request on the line again, where the job still
    // exists; a line that has changed since is searched for the match anew.
    int column = hit.offset - block.position();
    int length = -1;
    if (hit.job) {
        QRegExp rx = hit.job->getInput().getRegExp();
        if (column >= 0 && column <= text.size() && rx.indexIn(text, column) == column) {
            length = rx.matchedLength();
        } else if (rx.indexIn(text) >= 0) {
            column = rx.pos();
            length = rx.matchedLength();
        }
    }
    if (length < 0) { // nothing to go by: the whole line
        column = 0;
        length = text.size();
    }

    QTextCursor cursor(block);
    cursor.setPosition(block.position() + column);
    cursor.setPosition(block.position() + column + length, QTextCursor::KeepAnchor);
    setTextCursor(cursor);
    centerCursor();

    QTextEdit::ExtraSelection line;
    line.format.setBackground(palette().alternateBase());
    line.format.setProperty(QTextFormat::FullWidthSelection, true);
    line.cursor = QTextCursor(block);
    setExtraSelections({line});
}
