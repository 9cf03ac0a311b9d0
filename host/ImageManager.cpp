#include "ImageManager.h"

#include <QCoreApplication>
#include <QFile>
#include <QHash>

namespace Gui {
namespace Orba {

namespace {

// One icon per id for the whole run: a new QIcon for the same file would be
// rendered again, and its pixmaps cached again beside the earlier ones.
QHash<QString, QIcon>& icons()
{
    static QHash<QString, QIcon> made;
    return made;
}

} // namespace

ImageManager* ImageManager::getInstance()
{
    static ImageManager instance;
    return &instance;
}

QIcon ImageManager::getIcon(const QString& id) const
{
    auto found = icons().constFind(id);
    if (found == icons().constEnd()) {
        if (icons().isEmpty()) {
            // Icons are let go with the application that painted them.
            qAddPostRoutine([] { icons().clear(); });
        }
        const QString path = QStringLiteral(":/icons/%1.svg").arg(id);
        found = icons().insert(id, QFile::exists(path) ? QIcon(path) : QIcon());
    }
    return *found;
}

} // namespace Orba
} // namespace Gui
