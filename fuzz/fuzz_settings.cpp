// The stored last search read into a request: each key of the search holds
// a value of a type the input chooses, or nothing. Whatever is stored, the
// request stays one that the search can run: a known match type and case,
// folders and file patterns.

#include "FifInput.h"
#include "FifSettings.h"
#include "Settings.h"
#include <QDateTime>
#include <cstdlib>

using namespace Gui::Orba;

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    size_t at = 0;
    auto byte = [&] { return at < size ? data[at++] : uchar(0); };
    auto text = [&] {
        const size_t length = qMin<size_t>(byte() % 32, size - at);
        at += length;
        return QString::fromUtf8(reinterpret_cast<const char*>(data) + at - length, qsizetype(length));
    };
    Settings store;
    const FifSettings keys;
    for (const QString& key : {keys.getFindWhatKeyPath(), keys.getMatchCaseKeyPath(), keys.getMatchWordKeyPath(),
                               keys.getMatchTypeKeyPath(), keys.getWhereKeyPath(), keys.getFilterKeyPath(),
                               keys.getIncludeSubFolderKeyPath()}) {
        const QVariant values[] = {QVariant(), text(), QStringList(byte() * 400 + byte(), text()),
                                   QStringList{QString(), text()}, bool(byte() % 2), int(byte()) - 128, byte() / 7.0,
                                   text().toUtf8(), QVariantList{text(), byte()}, QDateTime::fromSecsSinceEpoch(byte())};
        if (byte() % 2)
            store.setValue(key, values[byte() % 10]);
    }
    FifInput in;
    in.setContents(&store);
    if ((in.matchCase != Qt::CaseSensitive && in.matchCase != Qt::CaseInsensitive) || in.where.isEmpty()
        || (in.matchType != QRegExp::FixedString && in.matchType != QRegExp::Wildcard && in.matchType != QRegExp::RegExp2)
        || in.filter.isEmpty())
        std::abort();
    if (in.what.size() < 64)
        in.isValid();
    in.toString();
    return 0;
}
