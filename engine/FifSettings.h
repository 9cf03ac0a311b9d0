#pragma once

#include "fif_export.h"

#include <QString>

namespace Gui {
namespace Orba {

class Settings;

// The names under which the last search is kept in the settings store.
class FIF_EXPORT FifSettings
{
public:
    FifSettings();

    // "group/key"; empty when the group is.
    QString getFindWhatKeyPath() const;
    QString getMatchCaseKeyPath() const;
    QString getMatchWordKeyPath() const;
    QString getMatchTypeKeyPath() const;
    QString getWhereKeyPath() const;
    QString getFilterKeyPath() const;
    QString getIncludeSubFolderKeyPath() const;

    // The most recent entry of each history, or the stored filter; empty when
    // nothing usable is stored or there is no store.
    QString getWhatString(Settings* settings) const;
    QString getWhereString(Settings* settings) const;
    QString getFilterString(Settings* settings) const;

    QString findInFilesGroup;
    QString findBarGroup;
    QString findWhatKey;
    QString matchCaseKey;
    QString matchWordKey;
    QString matchTypeKey;
    QString whereKey;
    QString filterKey;
    QString includeSubFolderKey;

private:
    QString getFirstStringOfKey(Settings* settings, const QString& keyPath) const;
};

} // namespace Orba
} // namespace Gui
