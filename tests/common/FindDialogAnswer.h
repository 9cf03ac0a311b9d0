#pragma once

// Runs `trigger` while a timer waits for the modal find dialog, hands it to
// `answer` and closes it if the answer left it open. Returns whether a
// dialog came.

#include "FifDialog.h"

#include <QApplication>
#include <QTimer>

#include <functional>

inline bool answerFindDialog(const std::function<void()>& trigger,
                             const std::function<void(Gui::Orba::FifDialog*)>& answer)
{
    bool answered = false;
    QTimer poll;
    poll.setInterval(10);
    QObject::connect(&poll, &QTimer::timeout, [&] {
        auto* dialog = qobject_cast<Gui::Orba::FifDialog*>(QApplication::activeModalWidget());
        if (!dialog)
            return;
        poll.stop();
        answered = true;
        answer(dialog);
        if (dialog->isVisible())
            dialog->reject();
    });
    poll.start();
    trigger();
    return answered;
}
