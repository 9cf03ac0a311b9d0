#pragma once

#include "fif_export.h"

#include <QString>
#include <QStringList>

namespace Gui {
namespace Orba {

class FifInput;
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
    QString getThreadCountKeyPath() const;

    // The most recent entry of each history, or the stored filter; empty when
    // nothing usable is stored or there is no store.
    QString getWhatString(Settings* settings) const;
    QString getWhereString(Settings* settings) const;
    QString getFilterString(Settings* settings) const;
    // The histories of texts and folders, most recent first.
    QStringList getWhatHistory(Settings* settings) const;
    QStringList getWhereHistory(Settings* settings) const;
    // The stored number of threads that scan files (see
    // FifJob::setThreadCount); 0, one per core, when none is stored or the
    // value is no number.
    int getThreadCount(Settings* settings) const;

    // The stored search over `input`: the most recent text and folders, the
    // filter and the options. A value counts only when it is stored and Qt
    // can read it as the field's type; one of another kind (a list where a
    // flag belongs, text where a number belongs) is passed over like a
    // missing one, leaving the field as it was.
    void readInput(Settings* settings, FifInput& input) const;
    // Stores a search that was started: its options, its filter unless
    // empty, and the histories of texts and folders.
    void writeInput(Settings* settings, const FifInput& input, const QStringList& whatHistory,
                    const QStringList& whereHistory) const;

    QString findInFilesGroup;
    QString findBarGroup;
    QString findWhatKey;
    QString matchCaseKey;
    QString matchWordKey;
    QString matchTypeKey;
    QString whereKey;
    QString filterKey;
    QString includeSubFolderKey;
    QString threadCountKey;

private:
    QString getFirstStringOfKey(Settings* settings, const QString& keyPath) const;
    QStringList getList(Settings* settings, const QString& keyPath) const;
};

} // namespace Orba
} // namespace Gui
