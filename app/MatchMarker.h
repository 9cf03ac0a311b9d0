#pragma once

#include <QHash>
#include <QList>
#include <QObject>
#include <QTimer>
#include <QtCore5Compat/QRegExp>

class QPlainTextEdit;
class QTextBlock;

// Marks in a text view the line of the hit shown and every match of the
// search on the lines in view. Lines are matched as they come into view, a
// few at a time from the event loop, so that neither a long file nor a slow
// expression holds up the window; of a long line, only the part around what
// is in view is matched.
class MatchMarker : public QObject
{
    Q_OBJECT

public:
    explicit MatchMarker(QPlainTextEdit* view);

    // Starts over: marks line `line` (from 1; 0 for none) and the matches of
    // `expression` (none when it is empty) as lines come into view.
    void mark(const QRegExp& expression, int line);
    int getMarkedLine() const;

    // Lines up to this length are matched whole; of longer ones, this many
    // characters around the part in view.
    static constexpr int lineWindow = 1024;

protected:
    bool eventFilter(QObject* watched, QEvent* event) override;

private slots:
    // Finds the lines in view that have not been matched yet.
    void followView();
    // Matches waiting lines for a short while, then shows what is known.
    void matchSome();

private:
    struct Line
    {
        int from = 0;               // the first character matched
        QList<QPair<int, int>> matches;  // start and length in the line
    };
    // Where the part of `block` that is matched starts.
    int windowStart(const QTextBlock& block) const;
    Line matchLine(const QTextBlock& block) const;
    void apply();

    QPlainTextEdit* view;
    QObject* viewport;
    QRegExp rx;
    int markedLine = 0;
    QHash<int, Line> found;  // by block number, of the lines in view only
    QList<int> waiting;
    QTimer timer;
};
