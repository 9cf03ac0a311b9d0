#include "FifHit.h"

#include "FifJob.h"
#include "FifManager.h"

#include <QDir>
#include <QFileInfo>

namespace Gui {
namespace Orba {

FifHit::FifHit()
    : line(-1)
    , offset(-1)
    , rawOffset(-1)
    , column(-1)
    , length(0)
{
}

FifHit::FifHit(const QString& fileName, int lineNumber, const QString& lineText, int off,
               int rawOff, FifJob* owner)
    : job(owner)
    , file(fileName)
    , line(lineNumber)
    , offset(off)
    , rawOffset(rawOff)
    , text(lineText)
    , column(-1)
    , length(0)
{
}

QString FifHit::toString() const
{
    if (!isValid())
        return QString();
    // One pass, so that a "%2" inside a file name or line stays as it is.
    return QStringLiteral("%1 (%2): %3")
        .arg(QDir::toNativeSeparators(file), QString::number(line), text);
}

QString FifHit::getCanonicalFilePath() const
{
    if (!isValid())
        return QString();
    QFileInfo info(file);
    if (info.isRelative())
        info.setFile(job->getWorkingDir(), file);
    return info.canonicalFilePath();
}

MainWindow* FifHit::getMainWindow() const
{
    if (!isValid())
        return nullptr;
    if (auto* manager = qobject_cast<FifManager*>(job->parent()))
        return manager->getMainWindow();
    return nullptr;
}

} // namespace Orba
} // namespace Gui
