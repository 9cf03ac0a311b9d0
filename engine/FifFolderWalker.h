#pragma once

#include <QString>

#include <functional>

namespace Gui {
namespace Orba {

class FifNameFilter;

// Lists the files of a folder tree in the order of a depth-first walk, each
// folder's entries in the order the file system lists them. Entries are
// told apart by the types the folder listing itself gives, so that a file
// costs no status query (one only when the file system does not say).
//
// Only regular files are candidates; symbolic links are neither files nor
// folders here and are never followed; hidden entries count like others.
// Names that are not valid UTF-8 cannot be named exactly by a QString and
// are passed over.
class FifFolderWalker
{
public:
    // Takes the next file; false ends the walk.
    using FileSink = std::function<bool(const QString& path)>;
    // Polled before each entry; true ends the walk.
    using StopPoll = std::function<bool()>;

    FifFolderWalker(const FifNameFilter& filter, bool includeSubFolders);

    // Walks `folder`, a path as QDir::path() gives it, which is itself
    // walked whatever its name; paths below it are `folder` + "/" + names.
    // False when the sink or a stop ended the walk.
    bool walk(const QString& folder, const FileSink& take, const StopPoll& shouldStop) const;

private:
    const FifNameFilter& filter;
    const bool includeSubFolders;
};

} // namespace Orba
} // namespace Gui
