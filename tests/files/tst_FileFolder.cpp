#include "File.h"
#include "FileFolder.h"
#include "FileFolderWorker.h"
#include "FileInfo.h"
#include "JsonUtility.h"

#include <QBuffer>
#include <QDir>
#include <QFile>
#include <QQmlEngine>
#include <QRandomGenerator>
#include <QSignalSpy>
#include <QTemporaryDir>
#include <QThread>
#include <QtTest>

#include <sys/stat.h>
#include <unistd.h>

namespace {

bool writeBytes(const QString &path, const QByteArray &bytes)
{
    QDir().mkpath(QFileInfo(path).absolutePath());
    QFile file(path);
    return file.open(QIODevice::WriteOnly) && file.write(bytes) == bytes.size();
}

QByteArray contents(const QString &path)
{
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray("<unreadable>");
}

QByteArray randomBytes(int size)
{
    QByteArray bytes(size, Qt::Uninitialized);
    for (char &c : bytes)
        c = char(QRandomGenerator::global()->bounded(256));
    return bytes;
}

QString native(const QString &path)
{
    return QDir::toNativeSeparators(path);
}

} // namespace

class tst_FileFolder : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void listing_data();
    void listing();
    void listingFollowsNoLinkLoop();
    void size();
    void pathProperty();
    void constantFolder();
    void readOnlyFolder_data();
    void readOnlyFolder();
    void makeAndRemoveFolders();
    void removeGuards();
    void copyFile();
    void copyFolderTree();
    void copyFolderRefusals();
    void encodedRoundTrip_data();
    void encodedRoundTrip();
    void writeFailures();
    void writeFromDevice();
    void textAndJson();
    void renameFile();
    void fileHelpers();
    void factories();
    void trash();
    void trashAsync();
    void trashAsyncFolderGone();
    void worker();

private:
    QString path(const QString &name) const { return m_dir->filePath(name); }
    QScopedPointer<QTemporaryDir> m_dir;
};

void tst_FileFolder::init()
{
    m_dir.reset(new QTemporaryDir);
    QVERIFY(m_dir->isValid());
}

void tst_FileFolder::listing_data()
{
    QTest::addColumn<bool>("folders");
    QTest::addColumn<QVariant>("filter");
    QTest::addColumn<bool>("subFolders");
    QTest::addColumn<QStringList>("expected");

    const QStringList everyFile { "a.txt", "B.md", native("data.txt/f.txt"), native("data.txt/g.md"),
                                  native("sub/c.txt"), native("sub/d.md"), native("sub/deeper/e.txt") };
    QTest::newRow("files") << false << QVariant() << false << QStringList { "a.txt", "B.md" };
    QTest::newRow("files by one filter") << false << QVariant("*.txt") << false << QStringList { "a.txt" };
    // The filter also picks the folders that are entered: "sub" is not.
    QTest::newRow("files by one filter, deep") << false << QVariant("*.txt") << true
                                               << QStringList { "a.txt", native("data.txt/f.txt") };
    QTest::newRow("files by list, deep") << false << QVariant(QStringList { "*.txt", "*.md" }) << true
                                         << QStringList { "a.txt", "B.md", native("data.txt/f.txt"), native("data.txt/g.md") };
    QTest::newRow("files by variant list") << false << QVariant(QVariantList { "*.md" }) << false
                                           << QStringList { "B.md" };
    QTest::newRow("files, all, deep") << false << QVariant() << true << everyFile;
    QTest::newRow("empty filter matches all") << false << QVariant("") << true << everyFile;
    QTest::newRow("list of empty filters matches all") << false << QVariant(QStringList { "" }) << true << everyFile;
    QTest::newRow("filter of no text matches all") << false << QVariant(QVariantMap { { "a", 1 } }) << true << everyFile;
    QTest::newRow("filter matching nothing") << false << QVariant("*.none") << true << QStringList();
    QTest::newRow("filter by case") << false << QVariant("b.MD") << false << QStringList { "B.md" };

    QTest::newRow("folders") << true << QVariant() << false << QStringList { "data.txt", "empty", "sub" };
    QTest::newRow("folders, deep") << true << QVariant() << true
                                   << QStringList { "data.txt", "empty", "sub", native("sub/deeper") };
    QTest::newRow("folders filtered at every level") << true << QVariant("s*") << true << QStringList { "sub" };
    QTest::newRow("folders, deeper name only") << true << QVariant("deeper") << true << QStringList();
    QTest::newRow("folders by two filters") << true << QVariant(QStringList { "s*", "d*" }) << true
                                            << QStringList { "data.txt", "sub", native("sub/deeper") };
}

void tst_FileFolder::listing()
{
    QFETCH(bool, folders);
    QFETCH(QVariant, filter);
    QFETCH(bool, subFolders);
    QFETCH(QStringList, expected);

    for (const char *name : { "a.txt", "B.md", ".hidden.txt", "sub/c.txt", "sub/d.md", "sub/deeper/e.txt",
                              "sub/.secret/h.txt", "data.txt/f.txt", "data.txt/g.md" })
        QVERIFY(writeBytes(path(QLatin1String(name)), "x"));
    QVERIFY(QDir(m_dir->path()).mkpath(QStringLiteral("empty")));

    FileFolder folder(m_dir->path());
    const QStringList names = folders ? folder.folderNames(filter, subFolders) : folder.fileNames(filter, subFolders);
    QCOMPARE(names, expected);
}

void tst_FileFolder::listingFollowsNoLinkLoop()
{
    QVERIFY(writeBytes(path(QStringLiteral("sub/a.txt")), "x"));
    QVERIFY(QFile::link(m_dir->path(), path(QStringLiteral("sub/back"))));

    FileFolder folder(m_dir->path());
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("links back")));
    QCOMPARE(folder.folderNames(QVariant(), true), (QStringList { "sub", native("sub/back") }));
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("links back")));
    QCOMPARE(folder.fileNames(QVariant(), true), QStringList { native("sub/a.txt") });
}

void tst_FileFolder::size()
{
    QVERIFY(writeBytes(path(QStringLiteral("one.bin")), QByteArray(100, 'a')));
    QVERIFY(writeBytes(path(QStringLiteral(".hidden")), QByteArray(20, 'b')));
    QVERIFY(writeBytes(path(QStringLiteral("sub/two.bin")), QByteArray(3000, 'c')));
    QVERIFY(writeBytes(path(QStringLiteral("sub/.deep/three.bin")), QByteArray(4, 'd')));
    QVERIFY(writeBytes(path(QStringLiteral("../outside-big.bin")), QByteArray(50000, 'e')));
    // Links count for nothing, whether to a file or to a folder.
    QVERIFY(QFile::link(path(QStringLiteral("../outside-big.bin")), path(QStringLiteral("link.bin"))));
    QVERIFY(QFile::link(path(QStringLiteral("sub")), path(QStringLiteral("sublink"))));

    FileFolder folder(m_dir->path());
    QCOMPARE(folder.size(), qlonglong(100 + 20 + 3000 + 4));

    // Cached until refresh.
    QVERIFY(writeBytes(path(QStringLiteral("late.bin")), QByteArray(7, 'f')));
    QCOMPARE(folder.size(), qlonglong(3124));
    QSignalSpy spy(&folder, &FileFolder::sizeChanged);
    folder.refresh();
    QCOMPARE(spy.count(), 1);
    QCOMPARE(folder.size(), qlonglong(3131));

    folder.setPath(path(QStringLiteral("sub")));
    QCOMPARE(spy.count(), 2);
    QCOMPARE(folder.size(), qlonglong(3004));

    FileFolder missing(path(QStringLiteral("nothing")));
    QCOMPARE(missing.size(), qlonglong(0));
    QVERIFY(QFile::remove(path(QStringLiteral("../outside-big.bin"))));
}

void tst_FileFolder::pathProperty()
{
    FileFolder folder(m_dir->path());
    QCOMPARE(folder.path(), m_dir->path());
    QCOMPARE(folder.url(), QUrl::fromLocalFile(m_dir->path()));
    QCOMPARE(folder.folderName(), QFileInfo(m_dir->path()).fileName());
    QVERIFY(folder.exists());

    QSignalSpy pathSpy(&folder, &FileFolder::pathChanged);
    QSignalSpy existsSpy(&folder, &FileFolder::existsChanged);
    folder.setPath(m_dir->path());
    folder.setPath(m_dir->path() + QLatin1Char('/'));
    folder.setUrl(QUrl::fromLocalFile(m_dir->path()));
    QCOMPARE(pathSpy.count(), 0);

    folder.setPath(path(QStringLiteral("later")));
    QCOMPARE(pathSpy.count(), 1);
    QCOMPARE(existsSpy.count(), 1);
    QVERIFY(!folder.exists());
    QCOMPARE(folder.folderName(), QStringLiteral("later"));

    folder.setPath(QStringLiteral("~/x"));
    QCOMPARE(folder.path(), QDir::homePath() + QStringLiteral("/x"));
    QVERIFY(folder.setProperty("url", QUrl::fromLocalFile(m_dir->path())));
    QCOMPARE(folder.path(), m_dir->path());
    QCOMPARE(pathSpy.count(), 3);

    QVERIFY(folder.cd(QStringLiteral("..")));
    QCOMPARE(folder.path(), QFileInfo(m_dir->path()).absolutePath());
    QVERIFY(!folder.cd(QStringLiteral("no-such-folder")));
    QCOMPARE(pathSpy.count(), 4);

    FileFolder defaultFolder;
    QCOMPARE(defaultFolder.path(), QDir::tempPath());
    QCOMPARE(defaultFolder.separator(), QDir::separator());
    QCOMPARE(defaultFolder.listSeparator(), QDir::listSeparator());
}

void tst_FileFolder::constantFolder()
{
    QVERIFY(QDir(m_dir->path()).mkpath(QStringLiteral("inner")));
    FileFolder folder(m_dir->path());
    folder.setConstant(true);
    QSignalSpy spy(&folder, &FileFolder::pathChanged);

    const QRegularExpression message(QStringLiteral("This is a constant folder"));
    QTest::ignoreMessage(QtWarningMsg, message);
    folder.setPath(QStringLiteral("/"));
    QTest::ignoreMessage(QtWarningMsg, message);
    folder.setUrl(QUrl::fromLocalFile(QStringLiteral("/")));
    QTest::ignoreMessage(QtWarningMsg, message);
    QVERIFY(!folder.cd(QStringLiteral("inner")));
    QTest::ignoreMessage(QtWarningMsg, message);
    QVERIFY(!folder.cdUp());
    QCOMPARE(folder.path(), m_dir->path());
    QCOMPARE(spy.count(), 0);

    // Writing is still allowed on a constant folder.
    QVERIFY(folder.writeTextFile(QStringLiteral("w.txt"), QStringLiteral("w")));
}

void tst_FileFolder::readOnlyFolder_data()
{
    QTest::addColumn<QString>("operation");
    for (const char *operation : { "makeFolder", "removeFolder", "removeFolderByName", "makePath", "removePath",
                                   "removeFile", "renameFile", "writeFile", "writeJsonFile", "writeTextFile" })
        QTest::newRow(operation) << QString::fromLatin1(operation);
}

void tst_FileFolder::readOnlyFolder()
{
    QFETCH(QString, operation);

    QVERIFY(writeBytes(path(QStringLiteral("ro/keep.txt")), "keep"));
    QVERIFY(QDir(m_dir->path()).mkpath(QStringLiteral("ro/empty")));
    FileFolder folder(path(operation == QLatin1String("makeFolder") ? QStringLiteral("ro/new") : QStringLiteral("ro")));
    folder.setReadOnly(true);

    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("This is a read only folder")));
    bool result = true;
    if (operation == QLatin1String("makeFolder"))
        result = folder.makeFolder();
    else if (operation == QLatin1String("removeFolder"))
        result = folder.removeFolder();
    else if (operation == QLatin1String("removeFolderByName"))
        result = folder.removeFolder(QStringLiteral("empty"), true);
    else if (operation == QLatin1String("makePath"))
        result = folder.makePath(QStringLiteral("a/b"));
    else if (operation == QLatin1String("removePath"))
        result = folder.removePath(QStringLiteral("empty"));
    else if (operation == QLatin1String("removeFile"))
        result = folder.removeFile(QStringLiteral("keep.txt"));
    else if (operation == QLatin1String("renameFile"))
        result = folder.renameFile(QStringLiteral("keep.txt"), QStringLiteral("moved.txt"));
    else if (operation == QLatin1String("writeFile"))
        result = folder.writeFile(QStringLiteral("keep.txt"), QStringLiteral("gone"));
    else if (operation == QLatin1String("writeJsonFile"))
        result = folder.writeJsonFile(QStringLiteral("keep.txt"), QVariantMap { { "a", 1 } });
    else if (operation == QLatin1String("writeTextFile"))
        result = folder.writeTextFile(QStringLiteral("keep.txt"), QStringLiteral("gone"));
    QVERIFY(!result);

    // Nothing changed on disk.
    QCOMPARE(contents(path(QStringLiteral("ro/keep.txt"))), QByteArray("keep"));
    QVERIFY(QFileInfo(path(QStringLiteral("ro/empty"))).isDir());
    QCOMPARE(QDir(path(QStringLiteral("ro"))).entryList(QDir::AllEntries | QDir::NoDotAndDotDot),
             (QStringList { "empty", "keep.txt" }));

    // Reading goes on, and a folder handed out from it is writable.
    QCOMPARE(folder.readTextFile(QStringLiteral("keep.txt")), operation == QLatin1String("makeFolder") ? QString() : QStringLiteral("keep"));
    QScopedPointer<FileFolder> child(folder.folder(QStringLiteral("child")));
    QVERIFY(!child->isReadOnly());
    QVERIFY(!child->isConstant());
}

void tst_FileFolder::makeAndRemoveFolders()
{
    FileFolder folder(path(QStringLiteral("a/b/c")));
    QSignalSpy existsSpy(&folder, &FileFolder::existsChanged);
    QVERIFY(folder.makeFolder());
    QVERIFY(folder.exists());
    QCOMPARE(existsSpy.count(), 1);
    QVERIFY(folder.makeFolder());
    QCOMPARE(existsSpy.count(), 1);

    QVERIFY(folder.makePath(QStringLiteral("x/y")));
    QCOMPARE(existsSpy.count(), 2);
    QVERIFY(QFileInfo(path(QStringLiteral("a/b/c/x/y"))).isDir());
    QVERIFY(folder.removePath(QStringLiteral("x/y")));
    QVERIFY(!QFileInfo::exists(path(QStringLiteral("a/b/c/x"))));
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Error removing:")));
    QVERIFY(!folder.removePath(QStringLiteral("x/y")));

    QVERIFY(writeBytes(path(QStringLiteral("a/b/c/full/f.txt")), "f"));
    QVERIFY(!folder.removeFolder(QStringLiteral("full")));
    QVERIFY(QFileInfo::exists(path(QStringLiteral("a/b/c/full/f.txt"))));
    QVERIFY(folder.removeFolder(QStringLiteral("full"), true));
    QVERIFY(!QFileInfo::exists(path(QStringLiteral("a/b/c/full"))));
    QVERIFY(folder.removeFolder(QStringLiteral("never-there"), true));

    QVERIFY(writeBytes(path(QStringLiteral("a/b/c/.hidden/deep/f")), "f"));
    QCOMPARE(folder.size(), qlonglong(1));
    QSignalSpy sizeSpy(&folder, &FileFolder::sizeChanged);
    QVERIFY(folder.removeFolder());
    QVERIFY(!folder.exists());
    QCOMPARE(existsSpy.count(), 3);
    QCOMPARE(sizeSpy.count(), 1);
    QCOMPARE(folder.size(), qlonglong(0));
    QVERIFY(QFileInfo(path(QStringLiteral("a/b"))).isDir());

    // A missing folder counts as removed.
    QVERIFY(folder.removeFolder());
}

void tst_FileFolder::removeGuards()
{
    QVERIFY(writeBytes(path(QStringLiteral("keep/k.txt")), "k"));
    FileFolder folder(path(QStringLiteral("keep")));

    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("No folder name")));
    QVERIFY(!folder.removeFolder(QString(), true));
    QVERIFY(QFileInfo::exists(path(QStringLiteral("keep/k.txt"))));

    FileFolder noPath{QString()};
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("No path")));
    QVERIFY(!noPath.removeFolder());
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("No path")));
    QVERIFY(!noPath.makeFolder());

    FileFolder root(QStringLiteral("/"));
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Not removing a root folder")));
    QVERIFY(!root.removeFolder());
}

void tst_FileFolder::copyFile()
{
    QVERIFY(writeBytes(path(QStringLiteral("src/one.txt")), "one"));
    QVERIFY(writeBytes(path(QStringLiteral("dst/existing.txt")), "old"));
    FileFolder folder(path(QStringLiteral("src")));

    // Into a folder: the name is kept.
    QVERIFY(folder.copyFile(QStringLiteral("one.txt"), path(QStringLiteral("dst"))));
    QCOMPARE(contents(path(QStringLiteral("dst/one.txt"))), QByteArray("one"));

    // To a new name.
    QVERIFY(folder.copyFile(QStringLiteral("one.txt"), path(QStringLiteral("dst/renamed.txt"))));
    QCOMPARE(contents(path(QStringLiteral("dst/renamed.txt"))), QByteArray("one"));

    // Never over an existing file, named or found through the folder.
    QTest::ignoreMessage(QtCriticalMsg, QRegularExpression(QStringLiteral("Target file already exists:")));
    QVERIFY(!folder.copyFile(QStringLiteral("one.txt"), path(QStringLiteral("dst/existing.txt"))));
    QCOMPARE(contents(path(QStringLiteral("dst/existing.txt"))), QByteArray("old"));
    QTest::ignoreMessage(QtCriticalMsg, QRegularExpression(QStringLiteral("Target file already exists:")));
    QVERIFY(!folder.copyFile(QStringLiteral("one.txt"), path(QStringLiteral("dst"))));

    // Nor over a dangling link, which would write through it.
    QVERIFY(QFile::link(path(QStringLiteral("elsewhere.txt")), path(QStringLiteral("dst/dangling.txt"))));
    QTest::ignoreMessage(QtCriticalMsg, QRegularExpression(QStringLiteral("Target file already exists:")));
    QVERIFY(!folder.copyFile(QStringLiteral("one.txt"), path(QStringLiteral("dst/dangling.txt"))));
    QVERIFY(!QFileInfo::exists(path(QStringLiteral("elsewhere.txt"))));

    QTest::ignoreMessage(QtCriticalMsg, QRegularExpression(QStringLiteral("File doesn't exist:.*none\\.txt")));
    QVERIFY(!folder.copyFile(QStringLiteral("none.txt"), path(QStringLiteral("dst"))));

    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Copy failed:")));
    QVERIFY(!folder.copyFile(QStringLiteral("one.txt"), path(QStringLiteral("missing/folder/x.txt"))));
    QVERIFY(!QFileInfo::exists(path(QStringLiteral("missing"))));

    // The target goes through path resolution.
    QVERIFY(folder.copyFile(QStringLiteral("one.txt"), QStringLiteral("$TEMP/") + QFileInfo(path(QStringLiteral("via-temp.txt"))).fileName()));
    QVERIFY(QFile::remove(QDir::temp().filePath(QStringLiteral("via-temp.txt"))));

    if (::geteuid() == 0)
        QSKIP("Permission checks don't apply to the superuser");
    QVERIFY(writeBytes(path(QStringLiteral("src/locked.txt")), "l"));
    QVERIFY(QFile::setPermissions(path(QStringLiteral("src/locked.txt")), QFileDevice::WriteOwner));
    QTest::ignoreMessage(QtCriticalMsg, QRegularExpression(QStringLiteral("File is not readable:")));
    QVERIFY(!folder.copyFile(QStringLiteral("locked.txt"), path(QStringLiteral("dst"))));
}

void tst_FileFolder::copyFolderTree()
{
    QVERIFY(writeBytes(path(QStringLiteral("tree/a.txt")), "a"));
    QVERIFY(writeBytes(path(QStringLiteral("tree/.hidden")), "h"));
    QVERIFY(writeBytes(path(QStringLiteral("tree/sub/b.bin")), randomBytes(70000)));
    QVERIFY(writeBytes(path(QStringLiteral("tree/sub/deeper/c.txt")), "c"));
    QVERIFY(QDir(m_dir->path()).mkpath(QStringLiteral("tree/empty")));
    QVERIFY(::mkfifo(QFile::encodeName(path(QStringLiteral("tree/pipe"))).constData(), 0600) == 0);

    FileFolder folder(m_dir->path());
    // Two levels of the target are missing; a fifo in the tree must not block.
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Skipping what is not a regular file:.*pipe")));
    QVERIFY(folder.copyFile(QStringLiteral("tree"), path(QStringLiteral("out/copy"))));

    FileFolder source(path(QStringLiteral("tree")));
    FileFolder target(path(QStringLiteral("out/copy")));
    QCOMPARE(target.fileNames(QVariant(), true), source.fileNames(QVariant(), true));
    QCOMPARE(target.folderNames(QVariant(), true), source.folderNames(QVariant(), true));
    QCOMPARE(target.size(), source.size());
    QCOMPARE(contents(path(QStringLiteral("out/copy/sub/b.bin"))), contents(path(QStringLiteral("tree/sub/b.bin"))));
    QCOMPARE(contents(path(QStringLiteral("out/copy/.hidden"))), QByteArray("h"));
    QVERIFY(!QFileInfo::exists(path(QStringLiteral("out/copy/pipe"))));

    // Copying again over the copy stops at the first file that exists and
    // changes nothing.
    QVERIFY(writeBytes(path(QStringLiteral("out/copy/a.txt")), "changed"));
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("copyFile failed:")));
    QVERIFY(!folder.copyFile(QStringLiteral("tree"), path(QStringLiteral("out/copy"))));
    QCOMPARE(contents(path(QStringLiteral("out/copy/a.txt"))), QByteArray("changed"));
}

void tst_FileFolder::copyFolderRefusals()
{
    QVERIFY(writeBytes(path(QStringLiteral("tree/a.txt")), "a"));
    FileFolder folder(m_dir->path());

    QTest::ignoreMessage(QtCriticalMsg, QRegularExpression(QStringLiteral("Target is inside the source folder")));
    QVERIFY(!folder.copyFile(QStringLiteral("tree"), path(QStringLiteral("tree/inner/copy"))));
    QVERIFY(!QFileInfo::exists(path(QStringLiteral("tree/inner"))));

    QTest::ignoreMessage(QtCriticalMsg, QRegularExpression(QStringLiteral("Target is inside the source folder")));
    QVERIFY(!folder.copyFile(QStringLiteral("tree"), path(QStringLiteral("tree"))));

    // A prefix of the name is not the inside of the folder.
    QVERIFY(folder.copyFile(QStringLiteral("tree"), path(QStringLiteral("tree2"))));
    QCOMPARE(contents(path(QStringLiteral("tree2/a.txt"))), QByteArray("a"));

    // A link inside the tree back to the tree is no endless copy.
    QVERIFY(QFile::link(path(QStringLiteral("tree")), path(QStringLiteral("tree/loop"))));
    QTest::ignoreMessage(QtCriticalMsg, QRegularExpression(QStringLiteral("links back to itself")));
    QVERIFY(!folder.copyFile(QStringLiteral("tree"), path(QStringLiteral("tree3"))));
}

void tst_FileFolder::encodedRoundTrip_data()
{
    QTest::addColumn<QString>("option");
    QTest::addColumn<QByteArray>("bytes");

    const QByteArray binary = randomBytes(4099);
    QTest::newRow("base64") << "base64" << binary;
    QTest::newRow("BASE64") << "BASE64" << binary;
    QTest::newRow("hex") << "hex" << binary;
    QTest::newRow("Hex") << "Hex" << QByteArray("\x00\x01\xfe\xff", 4);
    QTest::newRow("base64 empty") << "base64" << QByteArray();
}

void tst_FileFolder::encodedRoundTrip()
{
    QFETCH(QString, option);
    QFETCH(QByteArray, bytes);

    FileFolder folder(m_dir->path());
    const bool base64 = option.compare(QLatin1String("base64"), Qt::CaseInsensitive) == 0;
    const QString text = QString::fromLatin1(base64 ? bytes.toBase64() : bytes.toHex());

    QVERIFY(folder.writeFile(QStringLiteral("data.bin"), text, QVariantMap { { "decode", option } }));
    QCOMPARE(contents(path(QStringLiteral("data.bin"))), bytes);

    const QVariant read = folder.readFile(QStringLiteral("data.bin"), QVariantMap { { "encode", option } });
    QCOMPARE(read.userType(), int(QMetaType::QByteArray));
    QCOMPARE(QString::fromLatin1(read.toByteArray()), text);
    QCOMPARE(folder.readFile(QStringLiteral("data.bin")).toByteArray(), bytes);
    QCOMPARE(folder.readFile(QStringLiteral("data.bin"), QVariantMap { { "encode", "other" } }).toByteArray(), bytes);
}

void tst_FileFolder::writeFailures()
{
    FileFolder folder(m_dir->path());

    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Error opening")));
    QVERIFY(!folder.writeFile(QStringLiteral("missing/file.txt"), QStringLiteral("x")));
    QVERIFY(!QFileInfo::exists(path(QStringLiteral("missing"))));
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Error opening")));
    QVERIFY(!folder.writeTextFile(QStringLiteral("missing/file.txt"), QStringLiteral("x")));
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Error opening")));
    QVERIFY(!JsonUtility::toFile(path(QStringLiteral("missing/file.json")), QVariantMap { { "a", 1 } }));

    // Content without bytes leaves the file as it was.
    QVERIFY(writeBytes(path(QStringLiteral("keep.txt")), "keep"));
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Unsupported content")));
    QVERIFY(!folder.writeFile(QStringLiteral("keep.txt"), QVariantMap { { "a", 1 } }));
    QCOMPARE(contents(path(QStringLiteral("keep.txt"))), QByteArray("keep"));

    // Over a folder.
    QVERIFY(QDir(m_dir->path()).mkpath(QStringLiteral("afolder")));
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Error opening")));
    QVERIFY(!folder.writeTextFile(QStringLiteral("afolder"), QStringLiteral("x")));

    // Reading what is no regular file gives nothing, and never blocks.
    QVERIFY(::mkfifo(QFile::encodeName(path(QStringLiteral("fifo"))).constData(), 0600) == 0);
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Not a regular file")));
    QVERIFY(folder.readFile(QStringLiteral("fifo")).toByteArray().isEmpty());
    QVERIFY(folder.readFile(QStringLiteral("nothing")).toByteArray().isEmpty());
    QVERIFY(folder.readTextFile(QStringLiteral("nothing")).isNull());

    if (QFileInfo::exists(QStringLiteral("/dev/full"))) {
        FileFolder dev(QStringLiteral("/dev"));
        QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Error writing")));
        QVERIFY(!dev.writeTextFile(QStringLiteral("full"), QStringLiteral("no space")));
    }
}

void tst_FileFolder::writeFromDevice()
{
    FileFolder folder(m_dir->path());
    const QByteArray payload = randomBytes(200 * 1024 + 17);

    QBuffer buffer;
    buffer.setData(payload);
    QVERIFY(folder.writeFile(QStringLiteral("from-buffer.bin"), QVariant::fromValue<QObject *>(&buffer)));
    QCOMPARE(contents(path(QStringLiteral("from-buffer.bin"))), payload);
    QVERIFY(!buffer.isOpen());

    // An open device is read from where it stands.
    QVERIFY(buffer.open(QIODevice::ReadOnly));
    QVERIFY(buffer.seek(100));
    QVERIFY(folder.writeFile(QStringLiteral("from-open.bin"), QVariant::fromValue<QObject *>(&buffer)));
    QCOMPARE(contents(path(QStringLiteral("from-open.bin"))), payload.mid(100));
    QVERIFY(buffer.isOpen());

    // A module File is a stream too.
    File file(path(QStringLiteral("from-buffer.bin")));
    QVERIFY(folder.writeFile(QStringLiteral("from-file.bin"), QVariant::fromValue<QObject *>(&file)));
    QCOMPARE(contents(path(QStringLiteral("from-file.bin"))), payload);

    // Copying a file onto itself would empty it.
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Source and target are the same file")));
    QVERIFY(!folder.writeFile(QStringLiteral("from-buffer.bin"), QVariant::fromValue<QObject *>(&file)));
    QCOMPARE(contents(path(QStringLiteral("from-buffer.bin"))), payload);

    // A write-only source gives nothing to read.
    QBuffer writeOnly;
    QVERIFY(writeOnly.open(QIODevice::WriteOnly));
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Source is not readable")));
    QVERIFY(!folder.writeFile(QStringLiteral("none.bin"), QVariant::fromValue<QObject *>(&writeOnly)));
    QVERIFY(!QFileInfo::exists(path(QStringLiteral("none.bin"))));
}

void tst_FileFolder::textAndJson()
{
    FileFolder folder(m_dir->path());
    const QString text = QString::fromUtf8("Zeile 1 – ✓\nzweite");
    QVERIFY(folder.writeTextFile(QStringLiteral("t.txt"), text));
    QCOMPARE(contents(path(QStringLiteral("t.txt"))), text.toUtf8());
    QCOMPARE(folder.readTextFile(QStringLiteral("t.txt")), text);

    QVERIFY(folder.writeTextFile(QStringLiteral("t.txt"), QStringLiteral("short")));
    QCOMPARE(contents(path(QStringLiteral("t.txt"))), QByteArray("short"));

    const QVariantMap json { { "name", QString::fromUtf8("é") }, { "n", 3 }, { "list", QVariantList { 1, "two" } },
                             { "nested", QVariantMap { { "x", true } } }, { "dropped", QVariant() } };
    QVERIFY(folder.writeJsonFile(QStringLiteral("j.json"), json));
    QVariantMap expected = json;
    expected.remove(QStringLiteral("dropped"));
    QCOMPARE(folder.readJsonFile(QStringLiteral("j.json")), expected);

    // The shared JSON writer goes the same way.
    QVERIFY(JsonUtility::toFile(path(QStringLiteral("k.json")), json));
    QCOMPARE(contents(path(QStringLiteral("k.json"))), contents(path(QStringLiteral("j.json"))));

    QVERIFY(writeBytes(path(QStringLiteral("bad.json")), "{ not json"));
    QVERIFY(folder.readJsonFile(QStringLiteral("bad.json")).isEmpty());
    QVERIFY(folder.readJsonFile(QStringLiteral("none.json")).isEmpty());
}

void tst_FileFolder::renameFile()
{
    QVERIFY(writeBytes(path(QStringLiteral("a.txt")), "a"));
    QVERIFY(writeBytes(path(QStringLiteral("b.txt")), "b"));
    FileFolder folder(m_dir->path());

    QVERIFY(folder.renameFile(QStringLiteral("a.txt"), QStringLiteral("c.txt")));
    QVERIFY(!folder.fileExists(QStringLiteral("a.txt")));
    QCOMPARE(contents(path(QStringLiteral("c.txt"))), QByteArray("a"));

    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("oldFileName:.*c\\.txt.*newFileName:.*b\\.txt")));
    QVERIFY(!folder.renameFile(QStringLiteral("c.txt"), QStringLiteral("b.txt")));
    QCOMPARE(contents(path(QStringLiteral("c.txt"))), QByteArray("a"));
    QCOMPARE(contents(path(QStringLiteral("b.txt"))), QByteArray("b"));

    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("oldFileName:")));
    QVERIFY(!folder.renameFile(QStringLiteral("none.txt"), QStringLiteral("d.txt")));
}

void tst_FileFolder::fileHelpers()
{
    QVERIFY(writeBytes(path(QStringLiteral("f.txt")), "f"));
    FileFolder folder(m_dir->path());

    QCOMPARE(folder.filePath(QStringLiteral("f.txt")), path(QStringLiteral("f.txt")));
    QCOMPARE(folder.filePath(QStringLiteral("/abs/x")), QStringLiteral("/abs/x"));
    QCOMPARE(folder.relativeFilePath(path(QStringLiteral("sub/g.txt"))), QStringLiteral("sub/g.txt"));
    QCOMPARE(folder.fileUrl(QStringLiteral("f.txt")), QUrl::fromLocalFile(path(QStringLiteral("f.txt"))));
    QVERIFY(folder.fileExists(QStringLiteral("f.txt")));
    QVERIFY(!folder.fileExists(QStringLiteral("g.txt")));
    QVERIFY(folder.removeFile(QStringLiteral("f.txt")));
    QVERIFY(!folder.fileExists(QStringLiteral("f.txt")));
    QVERIFY(!folder.removeFile(QStringLiteral("f.txt")));

    QCOMPARE(folder.toNativeSeparators(QStringLiteral("a/b")), QDir::toNativeSeparators(QStringLiteral("a/b")));
    QCOMPARE(folder.fromNativeSeparators(QStringLiteral("a/b")), QStringLiteral("a/b"));

    FileFolder resources(QStringLiteral(":/"));
    QCOMPARE(resources.fileUrl(QStringLiteral("x/y.png")), QUrl(QStringLiteral("qrc:///x/y.png")));
}

void tst_FileFolder::factories()
{
    FileFolder folder(m_dir->path());

    QScopedPointer<File> file(folder.file(QStringLiteral("f.txt")));
    QCOMPARE(file->path(), path(QStringLiteral("f.txt")));
    QVERIFY(!file->parent());
    QCOMPARE(QQmlEngine::objectOwnership(file.data()), QQmlEngine::JavaScriptOwnership);

    QScopedPointer<FileInfo> info(folder.fileInfo(QStringLiteral("f.txt")));
    QCOMPARE(info->filePath(), path(QStringLiteral("f.txt")));
    QVERIFY(!info->parent());
    QCOMPARE(QQmlEngine::objectOwnership(info.data()), QQmlEngine::JavaScriptOwnership);

    folder.setReadOnly(true);
    folder.setConstant(true);
    QScopedPointer<FileFolder> child(folder.folder(QStringLiteral("child")));
    QCOMPARE(child->path(), path(QStringLiteral("child")));
    QVERIFY(!child->parent());
    QCOMPARE(QQmlEngine::objectOwnership(child.data()), QQmlEngine::JavaScriptOwnership);
    QVERIFY(child->makeFolder());
    QVERIFY(child->cdUp());
}

void tst_FileFolder::trash()
{
    // The trash goes where XDG_DATA_HOME points.
    QTemporaryDir data;
    QVERIFY(data.isValid());
    qputenv("XDG_DATA_HOME", QFile::encodeName(data.path()));

    FileFolder folder(m_dir->path());
    QSignalSpy spy(&folder, &FileFolder::movedFileToTrash);

    QVariant result = folder.moveFileToTrash(QStringLiteral("missing.txt"));
    QVERIFY(!result.isValid());
    QCOMPARE(spy.count(), 1);
    QCOMPARE(spy.at(0).at(0).toString(), QStringLiteral("missing.txt"));
    QVERIFY(!spy.at(0).at(1).isValid());
    QCOMPARE(spy.at(0).at(2).toString(), QStringLiteral("File does not exist."));

    QVERIFY(writeBytes(path(QStringLiteral("doomed.txt")), "recover me"));
    result = folder.moveFileToTrash(QStringLiteral("doomed.txt"));
    QVERIFY(result.isValid());
    const QString inTrash = result.toString();
    QVERIFY2(inTrash.startsWith(data.path() + QStringLiteral("/Trash/files/")), qPrintable(inTrash));
    QCOMPARE(contents(inTrash), QByteArray("recover me"));
    QVERIFY(!folder.fileExists(QStringLiteral("doomed.txt")));
    const QString infoPath = data.path() + QStringLiteral("/Trash/info/") + QFileInfo(inTrash).fileName()
                             + QStringLiteral(".trashinfo");
    QVERIFY(contents(infoPath).contains("Path="));
    QCOMPARE(spy.count(), 2);
    QCOMPARE(spy.at(1).at(1).toString(), inTrash);
    QVERIFY(spy.at(1).at(2).toString().isNull());

    // A file URL names the file as well; a second file of the same name is
    // kept apart in the trash.
    QVERIFY(writeBytes(path(QStringLiteral("doomed.txt")), "second"));
    const QString url = QUrl::fromLocalFile(path(QStringLiteral("doomed.txt"))).toString();
    result = folder.moveFileToTrash(url);
    QVERIFY(result.isValid());
    QVERIFY(result.toString() != inTrash);
    QCOMPARE(contents(result.toString()), QByteArray("second"));
    QCOMPARE(spy.last().at(0).toString(), url);
}

void tst_FileFolder::trashAsync()
{
    QTemporaryDir data;
    QVERIFY(data.isValid());
    qputenv("XDG_DATA_HOME", QFile::encodeName(data.path()));
    QVERIFY(writeBytes(path(QStringLiteral("async.txt")), "async"));

    FileFolder folder(m_dir->path());
    QThread *signalThread = nullptr;
    connect(&folder, &FileFolder::movedFileToTrash, this, [&] { signalThread = QThread::currentThread(); });
    QSignalSpy spy(&folder, &FileFolder::movedFileToTrash);

    folder.moveFileToTrashAsync(QStringLiteral("async.txt"));
    QVERIFY(spy.wait(5000));
    QCOMPARE(signalThread, QThread::currentThread());
    QVERIFY(spy.at(0).at(1).toString().startsWith(data.path()));
    QVERIFY(spy.at(0).at(2).toString().isNull());
    QVERIFY(!folder.fileExists(QStringLiteral("async.txt")));

    folder.moveFileToTrashAsync(QStringLiteral("async.txt"));
    QVERIFY(spy.wait(5000));
    QCOMPARE(spy.at(1).at(2).toString(), QStringLiteral("File does not exist."));

    // The threads end and go away.
    QTRY_COMPARE(folder.findChildren<QThread *>().size(), 0);
}

void tst_FileFolder::trashAsyncFolderGone()
{
    QVERIFY(writeBytes(path(QStringLiteral("kept.txt")), "kept"));
    for (int i = 0; i < 20; ++i) {
        auto *folder = new FileFolder(m_dir->path());
        folder->moveFileToTrashAsync(QStringLiteral("absent.txt"));
        delete folder;
    }
    QCoreApplication::processEvents();
    QVERIFY(QFileInfo::exists(path(QStringLiteral("kept.txt"))));
}

void tst_FileFolder::worker()
{
    QVERIFY(writeBytes(path(QStringLiteral("w.txt")), "w"));
    FileFolder folder(m_dir->path());

    // On the target's own thread the result comes back.
    FileFolderWorker remove(&folder, QVariantList { "removeFile", "w.txt" });
    QSignalSpy finished(&remove, &FileFolderWorker::finished);
    remove.process();
    QCOMPARE(finished.count(), 1);
    QCOMPARE(remove.result(), QVariant(true));
    QVERIFY(!folder.fileExists(QStringLiteral("w.txt")));

    FileFolderWorker json(&folder, QVariantList { "readJsonFile", "none.json" });
    json.process();
    QCOMPARE(json.result().userType(), int(QMetaType::QVariantMap));

    FileFolderWorker nothing(&folder, QVariantList());
    QSignalSpy nothingFinished(&nothing, &FileFolderWorker::finished);
    nothing.process();
    QCOMPARE(nothingFinished.count(), 1);

    FileFolderWorker unknown(&folder, QVariantList { "noSuchMethod", "x" });
    QSignalSpy unknownFinished(&unknown, &FileFolderWorker::finished);
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Unable to invoke.*noSuchMethod")));
    unknown.process();
    QCOMPARE(unknownFinished.count(), 1);
}

QTEST_GUILESS_MAIN(tst_FileFolder)
#include "tst_FileFolder.moc"
