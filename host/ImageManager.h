#pragma once

#include "orba_host_export.h"

#include <QIcon>
#include <QString>

namespace Gui {
namespace Orba {

// Serves the application's icons by id ("gui-orba-find-in-files", ...).
class ORBA_HOST_EXPORT ImageManager
{
public:
    static ImageManager* getInstance();

    // The bundled icon of that id; an empty icon for an unknown id.
    QIcon getIcon(const QString& id) const;

private:
    ImageManager() = default;
};

} // namespace Orba
} // namespace Gui
