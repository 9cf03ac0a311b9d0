#include "FifFolderWalker.h"

#include "FifNameFilter.h"

#include <QFile>

#include <vector>

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>

namespace Gui {
namespace Orba {

namespace {

struct Entry
{
    QString name;
    bool isFolder;
};

// The entries of one folder that the walk wants, in listing order. The
// listing is read whole and closed before any of it is walked, so that the
// open folders do not grow with the depth of the tree.
std::vector<Entry> list(const QString& folder, const FifNameFilter& filter, bool withFolders)
{
    std::vector<Entry> entries;
    DIR* dir = ::opendir(QFile::encodeName(folder).constData());
    if (!dir)
        return entries;
    while (const dirent* entry = ::readdir(dir)) {
        const char* name = entry->d_name;
        if (name[0] == '.' && (name[1] == 0 || (name[1] == '.' && name[2] == 0)))
            continue;
        unsigned char type = entry->d_type;
        if (type == DT_UNKNOWN) {
            struct stat status;
            if (::fstatat(::dirfd(dir), name, &status, AT_SYMLINK_NOFOLLOW) != 0)
                continue;
            type = S_ISREG(status.st_mode) ? DT_REG : S_ISDIR(status.st_mode) ? DT_DIR : DT_UNKNOWN;
        }
        if (type != DT_REG && (type != DT_DIR || !withFolders))
            continue;
        const QByteArrayView bytes(name);
        if (!bytes.isValidUtf8())
            continue;
        const QString decoded = QString::fromUtf8(bytes);
        if (type == DT_REG ? filter.acceptsFile(decoded) : filter.acceptsFolder(decoded))
            entries.push_back(Entry{decoded, type == DT_DIR});
    }
    ::closedir(dir);
    return entries;
}

} // namespace

FifFolderWalker::FifFolderWalker(const FifNameFilter& nameFilter, bool subFolders)
    : filter(nameFilter)
    , includeSubFolders(subFolders)
{
}

bool FifFolderWalker::walk(const QString& folder, const FileSink& take,
                           const StopPoll& shouldStop) const
{
    struct Level
    {
        QString prefix;  // the folder's path and a "/"
        std::vector<Entry> entries;
        size_t next;
    };
    // A stack rather than recursion: trees may be nested thousands deep.
    std::vector<Level> levels;
    levels.push_back(Level{folder.endsWith(QLatin1Char('/')) ? folder : folder + QLatin1Char('/'),
                           list(folder, filter, includeSubFolders), 0});
    while (!levels.empty()) {
        Level& level = levels.back();
        if (level.next == level.entries.size()) {
            levels.pop_back();
            continue;
        }
        if (shouldStop())
            return false;
        const Entry& entry = level.entries[level.next++];
        const QString path = level.prefix + entry.name;
        if (!entry.isFolder) {
            if (!take(path))
                return false;
            continue;
        }
        std::vector<Entry> entries = list(path, filter, includeSubFolders);
        levels.push_back(Level{path + QLatin1Char('/'), std::move(entries), 0});
    }
    return true;
}

} // namespace Orba
} // namespace Gui
