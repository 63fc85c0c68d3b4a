#ifndef ZIPTESTSUPPORT_H
#define ZIPTESTSUPPORT_H

// What the zip tests share: a folder tree zipped by Info-ZIP, archives built
// byte by byte (entries no well-behaved tool writes), and a sandbox with a
// sibling folder that an extraction must never reach.

#include "TestSupport.h"

#include <QDateTime>
#include <QDir>
#include <QDirIterator>
#include <QFile>
#include <QMap>
#include <QRandomGenerator>
#include <QRegularExpression>
#include <QTemporaryDir>
#include <QtEndian>
#include <QtTest>

#include <zlib.h>

namespace ZipTest {

// Even seconds: the zip format keeps two-second steps.
inline QDateTime fileTime() { return QDateTime(QDate(2021, 3, 14), QTime(10, 20, 30)); }

// Relative path -> contents. Folders come from the paths.
inline QMap<QString, QByteArray> contents()
{
    QByteArray random(600 * 1024, Qt::Uninitialized);
    QRandomGenerator(7).fillRange(reinterpret_cast<quint32 *>(random.data()), random.size() / 4);
    return {{QStringLiteral("root.txt"), "root text\n"},
            {QStringLiteral("data.json"), "{\"name\": \"loom\", \"count\": 3}\n"},
            {QStringLiteral("empty.txt"), QByteArray()},
            {QStringLiteral("a/b.txt"), "a b text\n"},
            {QStringLiteral("a/deep/c/d.txt"), QByteArray("deep ").repeated(200)},
            {QStringLiteral("big.bin"), random},
            {QStringLiteral("plain.raw"), "stored, not deflated\n"},
            {QStringLiteral("x\\y.txt"), "backslash in the name\n"}};
}

inline bool writeFile(const QString &path, const QByteArray &data)
{
    QFile file(path);
    return QDir().mkpath(QFileInfo(path).path()) && file.open(QIODevice::WriteOnly) && file.write(data) == data.size();
}

inline QByteArray readAll(const QString &path)
{
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray("<unreadable>");
}

// Writes the tree at root and zips it into archive with Info-ZIP: folder
// entries included, *.raw stored, everything else deflated.
inline bool writeAndZipTree(const QString &root, const QString &archive)
{
    const auto files = contents();
    for (auto it = files.constBegin(); it != files.constEnd(); ++it) {
        QFile file(QDir(root).filePath(it.key()));
        if (!writeFile(file.fileName(), it.value()) || !file.open(QIODevice::ReadWrite)
            || !file.setFileTime(fileTime(), QFileDevice::FileModificationTime))
            return false;
    }
    int exitCode = -1;
    TestSupport::run(QStringLiteral("zip"), {QStringLiteral("-qr"), QStringLiteral("-n"), QStringLiteral(".raw"),
                                             archive, QStringLiteral(".")}, &exitCode, root);
    return exitCode == 0;
}

inline QStringList sorted(QStringList list)
{
    list.sort();
    return list;
}

// Everything below root as relative paths, without following links;
// folders end in "/".
inline QStringList listTree(const QString &root)
{
    QStringList list;
    QDirIterator it(root, QDir::AllEntries | QDir::NoDotAndDotDot | QDir::Hidden | QDir::System, QDirIterator::Subdirectories);
    while (it.hasNext()) {
        const QString path = QDir(root).relativeFilePath(it.next());
        list << (it.fileInfo().isDir() && !it.fileInfo().isSymLink() ? path + QLatin1Char('/') : path);
    }
    return sorted(list);
}

struct Entry
{
    QByteArray name, data;
    bool deflate = false;
    bool badCrc = false;
    bool damage = false;             // garble the stored bytes after the first few
    qint64 declaredSize = -1;        // uncompressed size to claim, if not the real one
    quint32 externalAttributes = 0; // high 16 bits: Unix mode
    quint16 dosDate = 0x526e;        // 2021-03-14, at 10:00:00
};

inline Entry file(const QByteArray &name, const QByteArray &data, bool deflate = false)
{
    return Entry{name, data, deflate};
}

// A Unix symbolic link entry: its data is the link's target.
inline Entry symlink(const QByteArray &name, const QByteArray &target)
{
    Entry entry{name, target};
    entry.externalAttributes = quint32(0120777) << 16;
    return entry;
}

inline void put(QByteArray &out, int width, std::initializer_list<quint32> values)
{
    for (quint32 value : values) {
        char bytes[4];
        qToLittleEndian(value, bytes);
        out.append(bytes, width);
    }
}

// zlib's stream without its two-byte header and four-byte trailer.
inline QByteArray rawDeflate(const QByteArray &data)
{
    QByteArray out(int(compressBound(uLong(data.size()))), '\0');
    uLongf size = uLongf(out.size());
    compress(reinterpret_cast<Bytef *>(out.data()), &size, reinterpret_cast<const Bytef *>(data.constData()), uLong(data.size()));
    return out.mid(2, int(size) - 6);
}

inline bool write(const QString &path, const QList<Entry> &entries)
{
    QByteArray out, central;
    for (const Entry &entry : entries) {
        QByteArray stored = entry.deflate ? rawDeflate(entry.data) : entry.data;
        for (int i = 4; entry.damage && i < stored.size(); ++i)
            stored[i] = char(0xff - i);
        const quint32 crc = quint32(crc32(0, reinterpret_cast<const Bytef *>(entry.data.constData()), uInt(entry.data.size())))
                            ^ (entry.badCrc ? 0x5a5a5a5a : 0);
        const quint32 size = quint32(entry.declaredSize < 0 ? entry.data.size() : entry.declaredSize);
        // From "version needed" to the name's length, both records agree.
        QByteArray shared;
        put(shared, 2, {20, 0, entry.deflate ? 8u : 0u, 0x5000, entry.dosDate});
        put(shared, 4, {crc, quint32(stored.size()), size});
        put(shared, 2, {quint32(entry.name.size()), 0});
        put(central, 4, {0x02014b50});
        put(central, 2, {(3 << 8) | 20});
        central += shared;
        put(central, 2, {0, 0, 0});
        put(central, 4, {entry.externalAttributes, quint32(out.size())});
        central += entry.name;
        put(out, 4, {0x04034b50});
        out += shared + entry.name + stored;
    }
    const quint32 centralOffset = quint32(out.size());
    out += central;
    put(out, 4, {0x06054b50});
    put(out, 2, {0, 0, quint32(entries.size()), quint32(entries.size())});
    put(out, 4, {quint32(central.size()), centralOffset});
    put(out, 2, {0});
    return writeFile(path, out);
}

// top/out to extract into, and top/out-side beside it with a canary that
// out reaches through links already on disk: out/link (a folder) and
// out/file-link (the canary). out/inner-link leads to out/real.
struct Sandbox
{
    QTemporaryDir top;
    QString out = top.filePath(QStringLiteral("out"));
    QString outside = top.filePath(QStringLiteral("out-side"));
    QStringList before;

    Sandbox()
    {
        writeFile(outside + QStringLiteral("/canary.txt"), "canary");
        QDir().mkpath(out + QStringLiteral("/real"));
        QFile::link(QStringLiteral("../out-side"), out + QStringLiteral("/link"));
        QFile::link(QStringLiteral("../out-side/canary.txt"), out + QStringLiteral("/file-link"));
        QFile::link(QStringLiteral("real"), out + QStringLiteral("/inner-link"));
        before = listTree(out);
    }

    // Builds before.txt, the named entries, after.txt. "name->target" is a
    // link entry; OUTSIDE stands for the absolute path of out-side.
    QString archive(const QByteArrayList &names) const
    {
        QList<Entry> entries = {file("before.txt", "before")};
        for (QByteArray name : names) {
            name.replace("OUTSIDE", QFile::encodeName(outside));
            const int arrow = name.indexOf("->");
            entries.append(arrow < 0 ? file(name, "evil") : symlink(name.left(arrow), name.mid(arrow + 2)));
        }
        entries.append(file("after.txt", "after"));
        const QString path = top.filePath(QStringLiteral("hostile.zip"));
        return write(path, entries) ? path : QString();
    }

    QStringList added() const
    {
        QStringList now = listTree(out);
        for (const QString &old : before)
            now.removeOne(old);
        return now;
    }

    bool outsideUntouched() const
    {
        return readAll(outside + QStringLiteral("/canary.txt")) == "canary"
               && listTree(top.path()).filter(QRegularExpression(QStringLiteral("^(?!out/.)")))
                      == QStringList({"hostile.zip", "out-side/", "out-side/canary.txt", "out/"});
    }
};

// Hostile entries for Sandbox::archive, and what lands inside out besides
// before.txt and after.txt.
inline void hostileRows(bool backslashSeparates)
{
    QTest::addColumn<QByteArrayList>("names");
    QTest::addColumn<QString>("basePath");
    QTest::addColumn<QStringList>("written");
    const QStringList none;
    QTest::newRow("parent") << QByteArrayList{"../evil.txt"} << QString() << none;
    QTest::newRow("out vs out-side prefix") << QByteArrayList{"../out-side/evil.txt"} << QString() << none;
    QTest::newRow("climbs after cleaning") << QByteArrayList{"a/../../evil.txt"} << QString() << none;
    QTest::newRow("absolute") << QByteArrayList{"OUTSIDE/evil.txt"} << QString() << none;
    QTest::newRow("absolute folder") << QByteArrayList{"OUTSIDE/newdir/"} << QString() << none;
    QTest::newRow("parent folder") << QByteArrayList{"../newdir/"} << QString() << none;
    QTest::newRow("through a folder link") << QByteArrayList{"link/sub/evil.txt"} << QString() << none;
    QTest::newRow("folder through a link") << QByteArrayList{"link/sub/"} << QString() << none;
    QTest::newRow("onto a file link") << QByteArrayList{"file-link"} << QString() << none;
    QTest::newRow("onto a folder link") << QByteArrayList{"link"} << QString() << none;
    // A link entry becomes a plain file holding its target.
    QTest::newRow("link entry that climbs") << QByteArrayList{"up->..", "up/evil.txt"} << QString() << QStringList{"up"};
    QTest::newRow("climb that stays inside") << QByteArrayList{"a/b/../evil.txt"} << QString() << QStringList{"a/", "a/evil.txt"};
    QTest::newRow("link that stays inside") << QByteArrayList{"inner-link/ok.txt"} << QString() << QStringList{"real/ok.txt"};
    QTest::newRow("backslashes") << QByteArrayList{"..\\evil.txt"} << QString()
                                 << (backslashSeparates ? none : QStringList{"..\\evil.txt"});
}

} // namespace ZipTest

Q_DECLARE_METATYPE(ZipTest::Entry)

#endif // ZIPTESTSUPPORT_H
