#include "Dialog.h"

#include "HelpManager.h"
#include "Settings.h"

#include <QPushButton>

namespace Gui {
namespace Orba {

Dialog::Dialog(QWidget* parent, Settings* store, const char* name, bool modal,
               Qt::WindowFlags flags)
    : QDialog(parent, flags)
    , settings(store)
{
    if (name)
        setObjectName(QString::fromUtf8(name));
    setModal(modal);
}

Dialog::~Dialog() = default;

void Dialog::setHelpTopic(const QString& topic)
{
    helpTopic = topic;
}

QString Dialog::getHelpTopic() const
{
    return helpTopic;
}

void Dialog::setHelpButton(QPushButton* button)
{
    if (helpButton)
        disconnect(helpButton, &QPushButton::clicked, this, &Dialog::help);
    helpButton = button;
    if (helpButton) {
        connect(helpButton, &QPushButton::clicked, this, &Dialog::help);
        helpButton->setVisible(helpButtonVisible);
    }
}

void Dialog::setCaption(const QString& caption)
{
    setWindowTitle(caption);
}

QString Dialog::getCaption() const
{
    return windowTitle();
}

bool Dialog::isHelpButtonVisible() const
{
    return helpButtonVisible;
}

void Dialog::setHelpButtonVisibility(bool visible)
{
    helpButtonVisible = visible;
    if (helpButton)
        helpButton->setVisible(visible);
}

void Dialog::help()
{
    if (!helpTopic.isEmpty())
        HelpManager::getInstance()->showHelp(helpTopic);
}

void Dialog::saveDialogState()
{
    saveGeometryToRegistry();
}

void Dialog::restoreDialogState()
{
    restoreGeometryFromRegistry();
}

QString Dialog::getGeometryKey() const
{
    // A dialog without a name still gets a key of its own kind.
    const QString name = objectName().isEmpty() ? QString::fromLatin1(metaObject()->className())
                                                : objectName();
    return QStringLiteral("Dialogs/%1/Geometry").arg(name);
}

void Dialog::saveGeometryToRegistry()
{
    if (settings)
        settings->setValue(getGeometryKey(), saveGeometry());
}

void Dialog::restoreGeometryFromRegistry()
{
    if (!settings)
        return;
    const QByteArray geometry = settings->getValue(getGeometryKey()).toByteArray();
    if (!geometry.isEmpty())
        restoreGeometry(geometry);
}

Settings* Dialog::getSettings() const
{
    return settings;
}

void Dialog::done(int result)
{
    saveDialogState();
    QDialog::done(result);
}

void Dialog::showEvent(QShowEvent* event)
{
    if (!geometryRestored) {
        geometryRestored = true;
        restoreDialogState();
    }
    QDialog::showEvent(event);
}

} // namespace Orba
} // namespace Gui
