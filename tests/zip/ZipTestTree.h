#ifndef ZIPTESTTREE_H
#define ZIPTESTTREE_H

// A small folder tree with known contents and times, and an archive of it
// made by Info-ZIP's zip, the reference tool.

#include "TestSupport.h"

#include <QDateTime>
#include <QDir>
#include <QFile>
#include <QMap>
#include <QRandomGenerator>

namespace ZipTestTree {

// Even seconds: the zip format keeps two-second steps.
inline QDateTime fileTime()
{
    return QDateTime(QDate(2021, 3, 14), QTime(10, 20, 30));
}

inline QByteArray randomBytes(int size, quint32 seed)
{
    QByteArray bytes(size, Qt::Uninitialized);
    QRandomGenerator generator(seed);
    generator.fillRange(reinterpret_cast<quint32 *>(bytes.data()), size / 4);
    return bytes;
}

// Relative path -> contents. Folders come from the paths.
inline QMap<QString, QByteArray> contents()
{
    QMap<QString, QByteArray> files;
    files.insert(QStringLiteral("root.txt"), "root text\n");
    files.insert(QStringLiteral("data.json"), "{\"name\": \"loom\", \"count\": 3, \"tags\": [\"a\", \"b\"]}\n");
    files.insert(QStringLiteral("empty.txt"), QByteArray());
    files.insert(QStringLiteral("a/b.txt"), "a b text\n");
    files.insert(QStringLiteral("a/deep/c/d.txt"), QByteArray("deep ").repeated(200));
    files.insert(QStringLiteral("big.bin"), randomBytes(600 * 1024, 7));
    files.insert(QStringLiteral("plain.raw"), "stored, not deflated\n");
    files.insert(QStringLiteral("x\\y.txt"), "backslash in the name\n");
    return files;
}

inline bool writeTree(const QString &root)
{
    QDir dir(root);
    const auto files = contents();
    for (auto it = files.constBegin(); it != files.constEnd(); ++it) {
        const QString path = dir.filePath(it.key());
        if (!dir.mkpath(QFileInfo(path).path()))
            return false;
        QFile file(path);
        if (!file.open(QIODevice::WriteOnly) || file.write(it.value()) != it.value().size())
            return false;
        file.close();
        if (!file.open(QIODevice::ReadWrite) || !file.setFileTime(fileTime(), QFileDevice::FileModificationTime))
            return false;
    }
    return true;
}

// Zips the tree at root into archive with Info-ZIP: folder entries
// included, *.raw stored, everything else deflated.
inline bool zipTree(const QString &root, const QString &archive)
{
    int exitCode = -1;
    TestSupport::run(QStringLiteral("zip"), {QStringLiteral("-q"), QStringLiteral("-r"), QStringLiteral("-n"),
                                             QStringLiteral(".raw"), archive, QStringLiteral(".")},
                     &exitCode, root);
    return exitCode == 0;
}

inline QByteArray readAll(const QString &path)
{
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray("<unreadable>");
}

// Every file below root, as relative paths, sorted.
inline QStringList listTree(const QString &root)
{
    QStringList list;
    QDir dir(root);
    const QFileInfoList entries = dir.entryInfoList(QDir::AllEntries | QDir::NoDotAndDotDot | QDir::Hidden | QDir::System);
    for (const QFileInfo &info : entries) {
        if (info.isDir() && !info.isSymLink()) {
            for (const QString &child : listTree(info.filePath()))
                list.append(info.fileName() + QLatin1Char('/') + child);
            list.append(info.fileName() + QLatin1Char('/'));
        } else {
            list.append(info.fileName());
        }
    }
    list.sort();
    return list;
}

} // namespace ZipTestTree

#endif // ZIPTESTTREE_H
