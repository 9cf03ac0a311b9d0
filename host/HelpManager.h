#pragma once

#include "orba_host_export.h"
#include "StringBase.h"

#include <QHash>
#include <QObject>
#include <QPointer>
#include <QString>

class QTextBrowser;
class QWidget;

namespace Gui {
namespace Orba {

// Context help: bundled HTML pages, one per topic, shown in a help window.
class ORBA_HOST_EXPORT HelpManager : public QObject
{
    Q_OBJECT

public:
    static HelpManager* getInstance();

    // F1 on `widget` (or a child of it) shows `topic`.
    void setHelpForWidget(QWidget* widget, const Port::StringBase<char>& helpFile,
                          const Port::StringBase<char>& topic);
    QString getHelpTopic(const QWidget* widget) const;

    // Shows the page of `topic`; false when there is no such page.
    bool showHelp(const QString& topic);

    // The help window, null until help was first shown.
    QTextBrowser* getHelpWindow() const;

    static QString pageForTopic(const QString& topic);

protected:
    bool eventFilter(QObject* watched, QEvent* event) override;

private:
    HelpManager();

    QHash<const QObject*, QString> topics;
    QPointer<QTextBrowser> window;
};

} // namespace Orba
} // namespace Gui
