#pragma once

#include "fif_export.h"

#include <QList>
#include <QMetaType>
#include <QPointer>
#include <QString>

namespace Gui {
namespace Orba {

class FifJob;
class MainWindow;

// One matching line of one file.
class FIF_EXPORT FifHit
{
public:
    FifHit();
    // Note the argument order, which differs from the members'.
    FifHit(const QString& file, int line, const QString& text, int offset, int rawOffset,
           FifJob* job);
    // Inline: a search with millions of hits copies each a few times.
    FifHit(const FifHit& other) = default;
    FifHit(FifHit&& other) noexcept = default;
    FifHit& operator=(const FifHit& other) = default;
    FifHit& operator=(FifHit&& other) noexcept = default;
    ~FifHit() = default;

    // A line number of 0 or more, and the job that found it still exists.
    bool isValid() const { return line >= 0 && !job.isNull(); }
    // The first match is known and lies within the line's text.
    bool hasMatchRange() const { return column >= 0 && length > 0 && column + length <= text.size(); }
    // "file (line): text" with native separators; empty for an invalid hit.
    QString toString() const;
    // The file's absolute canonical path, relative paths taken from the job's
    // working directory; empty when invalid or the file is gone.
    QString getCanonicalFilePath() const;
    MainWindow* getMainWindow() const;

    QPointer<FifJob> job;
    QString file;
    int line;
    int offset;     // characters before the match, each line break counted as one
    int rawOffset;  // the same with line breaks counted as stored
    QString text;   // the line without its terminator
    int column;     // where the first match starts in `text`; -1 when not known
    int length;     // the characters the first match spans
};

typedef QList<FifHit> FifHitList;

} // namespace Orba
} // namespace Gui

// A hit holds no pointer into itself, so lists of hits may grow by moving
// their memory rather than copying hit by hit; with a million rows that keeps
// the old and the new array from being resident together.
Q_DECLARE_TYPEINFO(Gui::Orba::FifHit, Q_RELOCATABLE_TYPE);

Q_DECLARE_METATYPE(Gui::Orba::FifHit)
Q_DECLARE_METATYPE(Gui::Orba::FifHitList)
