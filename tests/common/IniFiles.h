#pragma once

// Settings files for tests. Qt keeps a process-wide cache of the INI files
// it has opened, so a second store on the same path may never parse the
// file again; reading a fresh copy proves what really is on disk.

#include <QFile>
#include <QString>

namespace IniFiles {

inline QString freshCopy(const QString& fileName)
{
    static int counter = 0;
    const QString copy = fileName + QStringLiteral(".copy%1.ini").arg(++counter);
    QFile::remove(copy);
    return QFile::copy(fileName, copy) ? copy : QString();
}

inline QByteArray contents(const QString& fileName)
{
    QFile file(fileName);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}

inline bool write(const QString& fileName, const QByteArray& bytes)
{
    QFile file(fileName);
    return file.open(QIODevice::WriteOnly) && file.write(bytes) == bytes.size();
}

} // namespace IniFiles
