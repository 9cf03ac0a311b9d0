#pragma once

#include "orba_host_export.h"

#include <QDialog>
#include <QPointer>
#include <QString>

class QPushButton;

namespace Gui {
namespace Orba {

class Settings;

// Base of the host's dialogs: a caption, a help button, and a geometry that
// is kept in the settings store from one opening to the next.
class ORBA_HOST_EXPORT Dialog : public QDialog
{
    Q_OBJECT

public:
    Dialog(QWidget* parent, Settings* settings, const char* name, bool modal,
           Qt::WindowFlags flags = Qt::WindowFlags());
    ~Dialog() override;

    void setHelpTopic(const QString& topic);
    QString getHelpTopic() const;
    // `button` shows the help topic when clicked.
    void setHelpButton(QPushButton* button);

    virtual void setCaption(const QString& caption);
    virtual QString getCaption() const;
    virtual bool isHelpButtonVisible() const;
    virtual void setHelpButtonVisibility(bool visible);
    virtual void help();
    virtual void saveDialogState();
    virtual void restoreDialogState();
    // "Dialogs/<object name>/Geometry", the class name standing in for an
    // empty object name.
    virtual QString getGeometryKey() const;
    virtual void saveGeometryToRegistry();
    virtual void restoreGeometryFromRegistry();
    virtual Settings* getSettings() const;

public slots:
    void done(int result) override;

protected:
    void showEvent(QShowEvent* event) override;

private:
    Settings* settings;
    QString helpTopic;
    QPointer<QPushButton> helpButton;
    bool helpButtonVisible = true;
    bool geometryRestored = false;
};

} // namespace Orba
} // namespace Gui
