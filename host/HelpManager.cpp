#include "HelpManager.h"

#include "String.h"

#include <QApplication>
#include <QEvent>
#include <QFile>
#include <QKeyEvent>
#include <QTextBrowser>
#include <QWidget>

namespace Gui {
namespace Orba {

HelpManager::HelpManager() = default;

HelpManager* HelpManager::getInstance()
{
    static HelpManager* instance = new HelpManager;
    return instance;
}

QString HelpManager::pageForTopic(const QString& topic)
{
    return QStringLiteral(":/help/%1.html").arg(topic);
}

void HelpManager::setHelpForWidget(QWidget* widget, const Port::StringBase<char>& /*helpFile*/,
                                   const Port::StringBase<char>& topic)
{
    if (!widget)
        return;
    if (!topics.contains(widget)) {
        widget->installEventFilter(this);
        connect(widget, &QObject::destroyed, this, [this](QObject* gone) { topics.remove(gone); });
    }
    topics.insert(widget, String::convert(topic));
}

QString HelpManager::getHelpTopic(const QWidget* widget) const
{
    return topics.value(widget);
}

bool HelpManager::showHelp(const QString& topic)
{
    const QString page = pageForTopic(topic);
    if (!QFile::exists(page))
        return false;
    if (!window) {
        window = new QTextBrowser;
        window->setAttribute(Qt::WA_DeleteOnClose);
        window->setObjectName(QStringLiteral("HelpWindow"));
        window->setOpenLinks(true);
        window->resize(520, 420);
    }
    window->setSource(QUrl(QStringLiteral("qrc") + page));
    window->setWindowTitle(window->documentTitle());
    window->show();
    window->raise();
    return true;
}

QTextBrowser* HelpManager::getHelpWindow() const
{
    return window;
}

bool HelpManager::eventFilter(QObject* watched, QEvent* event)
{
    if (event->type() == QEvent::KeyPress
        && static_cast<QKeyEvent*>(event)->key() == Qt::Key_F1) {
        const QString topic = topics.value(watched);
        if (!topic.isEmpty() && showHelp(topic))
            return true;
    }
    return QObject::eventFilter(watched, event);
}

} // namespace Orba
} // namespace Gui
