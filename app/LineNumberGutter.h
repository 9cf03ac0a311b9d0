#pragma once

#include <QWidget>

class FileViewer;

// The column left of a FileViewer's text that numbers the lines in view, the
// line of the hit shown in bold. The viewer places it and keeps room for it.
class LineNumberGutter : public QWidget
{
    Q_OBJECT

public:
    explicit LineNumberGutter(FileViewer* viewer);

    // Room for the widest line number of the viewer's document.
    QSize sizeHint() const override;

public slots:
    // Follows the viewer's updates of its text area: a scroll by `dy` pixels,
    // or a repaint of `rect`.
    void follow(const QRect& rect, int dy);

protected:
    void paintEvent(QPaintEvent* event) override;

private:
    FileViewer* viewer;
};
