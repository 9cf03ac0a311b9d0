#pragma once

// Answers the next modal dialog from inside its own event loop, the way a
// user would, so that tests can drive exec()-based code for real.

#include <QApplication>
#include <QPointer>
#include <QTimer>
#include <QWidget>

#include <functional>
#include <memory>

namespace ModalAnswer {

// Polls until a modal widget is up, then calls `answer` with it once.
// Returns a flag that reads true once the answer was given.
inline std::shared_ptr<bool> next(std::function<void(QWidget*)> answer, int timeoutMs = 10000)
{
    auto answered = std::make_shared<bool>(false);
    auto timer = new QTimer;
    auto waited = std::make_shared<int>(0);
    timer->setInterval(10);
    QObject::connect(timer, &QTimer::timeout, [timer, answer, answered, waited, timeoutMs] {
        QWidget* modal = QApplication::activeModalWidget();
        *waited += timer->interval();
        if (!modal && *waited < timeoutMs)
            return;
        timer->stop();
        timer->deleteLater();
        if (modal) {
            *answered = true;
            answer(modal);
        }
    });
    timer->start();
    return answered;
}

} // namespace ModalAnswer
