// FifSettings and FifInput::setContents on arbitrary stored values: values of
// every type under every key, huge lists, and INI files of arbitrary bytes.
//
// Input: byte 0 bit 0 chooses an INI file made of the rest of the input;
// otherwise each key takes one type byte and the bytes after it feed the
// values of a store in memory.

#include "FifInput.h"
#include "FifSettings.h"
#include "Settings.h"

#include <QByteArray>
#include <QDateTime>
#include <QFile>
#include <QStringList>
#include <QVariant>
#include <QVariantMap>
#include <QtCore5Compat/QRegExp>

#include <cstdio>
#include <cstdlib>
#include <memory>
#include <unistd.h>

using Gui::Orba::FifInput;
using Gui::Orba::FifSettings;
using Gui::Orba::Settings;

namespace {

class Reader
{
public:
    Reader(const uint8_t* data, size_t size) : data(data), size(size) {}
    uchar byte() { return at < size ? data[at++] : 0; }
    int integer()
    {
        int value = 0;
        for (int i = 0; i < 4; ++i)
            value = value << 8 | byte();
        return value;
    }
    QString text()
    {
        const int length = byte() % 32;
        QByteArray bytes;
        for (int i = 0; i < length && at < size; ++i)
            bytes.append(char(byte()));
        return QString::fromUtf8(bytes);
    }

private:
    const uint8_t* data;
    size_t size;
    size_t at = 0;
};

QVariant value(Reader& in)
{
    switch (in.byte() % 14) {
    case 0: return QVariant();
    case 1: return QString();
    case 2: return in.text();
    case 3: { // a list of up to about 100,000 entries
        const int count = in.byte() * 400 + in.byte();
        const QString entry = in.text();
        QStringList list;
        list.reserve(count);
        for (int i = 0; i < count; ++i)
            list.append(i % 7 ? entry : QString::number(i));
        return list;
    }
    case 4: return QStringList();
    case 5: return QStringList{QString(), in.text()};
    case 6: return bool(in.byte() & 1);
    case 7: return in.integer();
    case 8: return double(in.integer()) / 7.0;
    case 9: return in.text().toUtf8();
    case 10: return QVariantList{in.integer(), in.text(), QVariantList{in.text()}};
    case 11: return QVariantMap{{in.text(), in.text()}};
    case 12: return QDateTime::fromSecsSinceEpoch(in.integer());
    default: return QVariant::fromValue(QList<int>{in.integer()});
    }
}

[[noreturn]] void fail(const char* what)
{
    std::fprintf(stderr, "mismatch: %s\n", what);
    std::abort();
}

// What setContents must make of one store, computed from the stored values
// by the documented rules.
FifInput expected(Settings& store, const FifInput& before)
{
    const FifSettings keys;
    FifInput want = before;
    auto first = [](const QVariant& v) {
        if (v.isNull())
            return QString();
        const QStringList list = v.toStringList();
        return list.isEmpty() ? QString() : list.first();
    };
    const QString what = first(store.getValue(keys.getFindWhatKeyPath()));
    if (!what.isEmpty())
        want.what = what;
    const QString where = first(store.getValue(keys.getWhereKeyPath()));
    if (!where.isEmpty())
        want.where = where;
    const QVariant filter = store.getValue(keys.getFilterKeyPath());
    if (!filter.isNull() && !filter.toString().isEmpty())
        want.filter = filter.toString();
    // A flag or number counts only when Qt can read the stored value as
    // one; anything else is passed over like a missing value.
    auto flag = [](const QVariant& v, bool* out) {
        QVariant converted = v;
        if (v.isNull() || !converted.convert(QMetaType::fromType<bool>()))
            return false;
        *out = converted.toBool();
        return true;
    };
    bool value = false;
    if (flag(store.getValue(keys.getMatchCaseKeyPath()), &value))
        want.matchCase = value ? Qt::CaseSensitive : Qt::CaseInsensitive;
    if (flag(store.getValue(keys.getMatchWordKeyPath()), &value))
        want.matchWord = value;
    const QVariant type = store.getValue(keys.getMatchTypeKeyPath());
    bool isNumber = false;
    const int stored = type.isNull() ? -1 : type.toInt(&isNumber);
    if (isNumber) {
        if (stored == 0)
            want.matchType = QRegExp::RegExp2;
        else if (stored == 1 || stored == 2)
            want.matchType = stored;
    }
    if (flag(store.getValue(keys.getIncludeSubFolderKeyPath()), &value))
        want.includeSubFolders = value;
    return want;
}

void check(Settings& store)
{
    const FifSettings keys;
    FifInput input;
    input.matchCase = Qt::CaseSensitive; // so that a stored false shows
    const FifInput want = expected(store, input);
    input.setContents(&store);

    if (input.what != want.what || input.where != want.where || input.filter != want.filter)
        fail("texts");
    if (input.matchCase != want.matchCase || input.matchType != want.matchType
        || input.matchWord != want.matchWord || input.includeSubFolders != want.includeSubFolders)
        fail("options");
    if (input.matchCase != Qt::CaseSensitive && input.matchCase != Qt::CaseInsensitive)
        fail("match case out of range");
    if (input.matchType != QRegExp::FixedString && input.matchType != QRegExp::Wildcard
        && input.matchType != QRegExp::RegExp2)
        fail("match type out of range");
    if (keys.getWhatString(&store) != want.what && !want.what.isEmpty())
        fail("getWhatString");
    if (keys.getWhatString(nullptr).size() || keys.getWhereString(nullptr).size()
        || keys.getFilterString(nullptr).size())
        fail("no store");
    // What was read must be usable as it stands.
    if (input.what.size() < 64) {
        input.isValid();
        input.getRegExp();
    }
    input.toString();
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    if (size < 1)
        return 0;
    if (data[0] & 1) {
        static const QString path =
            QStringLiteral("/tmp/fif_fuzz_settings.%1.ini").arg(QString::number(::getpid()));
        QFile file(path);
        if (!file.open(QIODevice::WriteOnly | QIODevice::Truncate))
            std::abort();
        file.write(reinterpret_cast<const char*>(data) + 1, qint64(size - 1));
        file.close();
        auto store = std::make_unique<Settings>(path);
        check(*store);
        return 0;
    }
    Reader in(data + 1, size - 1);
    Settings store;
    const FifSettings keys;
    const QString paths[] = {keys.getFindWhatKeyPath(),  keys.getMatchCaseKeyPath(),
                             keys.getMatchWordKeyPath(), keys.getMatchTypeKeyPath(),
                             keys.getWhereKeyPath(),     keys.getFilterKeyPath(),
                             keys.getIncludeSubFolderKeyPath()};
    for (const QString& path : paths) {
        const uchar present = in.byte();
        if (present & 1)
            store.setValue(path, value(in));
    }
    check(store);
    return 0;
}
