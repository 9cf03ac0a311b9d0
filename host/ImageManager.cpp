#include "ImageManager.h"

#include <QFile>

namespace Gui {
namespace Orba {

ImageManager* ImageManager::getInstance()
{
    static ImageManager instance;
    return &instance;
}

QIcon ImageManager::getIcon(const QString& id) const
{
    const QString path = QStringLiteral(":/icons/%1.svg").arg(id);
    if (!QFile::exists(path))
        return QIcon();
    return QIcon(path);
}

} // namespace Orba
} // namespace Gui
