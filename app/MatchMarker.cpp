#include "MatchMarker.h"

#include <QElapsedTimer>
#include <QEvent>
#include <QPlainTextEdit>
#include <QScrollBar>
#include <QTextBlock>
#include <QTextLayout>

namespace {
// How long one turn of matching may hold the event loop, in milliseconds.
constexpr qint64 turnMs = 15;
}

MatchMarker::MatchMarker(QPlainTextEdit* view)
    : QObject(view)
    , view(view)
    , viewport(view->viewport())
{
    timer.setSingleShot(true);
    timer.setInterval(0);
    connect(&timer, &QTimer::timeout, this, &MatchMarker::matchSome);
    connect(view->verticalScrollBar(), &QScrollBar::valueChanged, this, &MatchMarker::followView);
    connect(view->horizontalScrollBar(), &QScrollBar::valueChanged, this,
            &MatchMarker::followView);
    // What was found belongs to the text it was found in.
    connect(view->document(), &QTextDocument::contentsChanged, this, [this] {
        found.clear();
        waiting.clear();
    });
    viewport->installEventFilter(this);
}

void MatchMarker::mark(const QRegExp& expression, int line)
{
    rx = expression;
    markedLine = line;
    found.clear();
    followView();
    apply();
}

int MatchMarker::getMarkedLine() const
{
    return markedLine;
}

bool MatchMarker::eventFilter(QObject* watched, QEvent* event)
{
    // Once the view has laid out its new size. The viewport is not asked of
    // the view, which may be on its way out.
    if (event->type() == QEvent::Resize && watched == viewport)
        QMetaObject::invokeMethod(this, &MatchMarker::followView, Qt::QueuedConnection);
    return QObject::eventFilter(watched, event);
}

void MatchMarker::followView()
{
    waiting.clear();
    if (!rx.isEmpty() && rx.isValid()) {
        const int first = view->cursorForPosition(QPoint(0, 0)).blockNumber();
        const int last =
            view->cursorForPosition(QPoint(0, view->viewport()->height())).blockNumber();
        for (auto it = found.begin(); it != found.end();) {
            if (it.key() < first || it.key() > last)
                it = found.erase(it);
            else
                ++it;
        }
        for (int number = first; number <= last; ++number) {
            const auto known = found.constFind(number);
            const QTextBlock block = view->document()->findBlockByNumber(number);
            if (known == found.constEnd() || known->from != windowStart(block))
                waiting.append(number);
        }
    }
    if (!waiting.isEmpty())
        timer.start();
}

void MatchMarker::matchSome()
{
    QElapsedTimer clock;
    clock.start();
    while (!waiting.isEmpty() && !clock.hasExpired(turnMs)) {
        const QTextBlock block = view->document()->findBlockByNumber(waiting.takeFirst());
        if (block.isValid())
            found.insert(block.blockNumber(), matchLine(block));
    }
    apply();
    if (!waiting.isEmpty())
        timer.start();
}

int MatchMarker::windowStart(const QTextBlock& block) const
{
    if (block.length() - 1 <= lineWindow || !block.layout() || block.layout()->lineCount() == 0)
        return 0;
    // From a little before the character at the left edge, in steps, so that
    // a small scroll does not match the line again.
    const int left = block.layout()->lineAt(0).xToCursor(view->horizontalScrollBar()->value());
    constexpr int step = lineWindow / 4;
    return qMax(0, left - step) / step * step;
}

MatchMarker::Line MatchMarker::matchLine(const QTextBlock& block) const
{
    Line line;
    line.from = windowStart(block);
    const QString text = block.text().mid(line.from, lineWindow);
    for (int at = 0; at <= text.size() && (at = rx.indexIn(text, at)) >= 0;) {
        const int length = rx.matchedLength();
        // Matches that touch are shown as one.
        if (length > 0 && !line.matches.isEmpty()
            && line.matches.constLast().first + line.matches.constLast().second == line.from + at)
            line.matches.last().second += length;
        else if (length > 0)
            line.matches.append({line.from + at, length});
        at += qMax(length, 1);
    }
    return line;
}

void MatchMarker::apply()
{
    QList<QTextEdit::ExtraSelection> selections;
    const QTextBlock marked = view->document()->findBlockByNumber(markedLine - 1);
    if (markedLine > 0 && marked.isValid()) {
        QTextEdit::ExtraSelection line;
        line.format.setBackground(view->palette().alternateBase());
        line.format.setProperty(QTextFormat::FullWidthSelection, true);
        line.cursor = QTextCursor(marked);
        selections.append(line);
    }
    // The palette's highlight, light enough for the text to stay readable.
    QColor colour = view->palette().color(QPalette::Highlight);
    colour.setAlpha(80);
    QTextCharFormat format;
    format.setBackground(colour);
    for (auto it = found.cbegin(); it != found.cend(); ++it) {
        const QTextBlock block = view->document()->findBlockByNumber(it.key());
        for (const auto& match : it->matches) {
            QTextCursor cursor(block);
            cursor.setPosition(block.position() + match.first);
            cursor.setPosition(block.position() + match.first + match.second,
                               QTextCursor::KeepAnchor);
            selections.append({cursor, format});
        }
    }
    view->setExtraSelections(selections);
}
