#include "File.h"
#include "FileFolder.h"
#include "FileInfo.h"
#include "FileTestSupport.h"
#include "Settings.h"

#include <QBuffer>
#include <QJSEngine>
#include <QQmlEngine>
#include <QRandomGenerator>
#include <QSignalSpy>
#include <QTemporaryDir>
#include <QTextCodec>
#include <QThread>

#include <functional>
#include <unistd.h>

using FolderCall = std::function<bool(FileFolder &)>;
Q_DECLARE_METATYPE(FolderCall)

using namespace FileTestSupport;

namespace {

QByteArray randomBytes(int size)
{
    QByteArray bytes(size, Qt::Uninitialized);
    for (char &c : bytes)
        c = char(QRandomGenerator::global()->bounded(256));
    return bytes;
}

const auto kMovedFileToTrash = qOverload<const QString &, const QVariant &, const QString &>(&FileFolder::movedFileToTrash);

// Points the trash at a fresh data folder for one test.
struct DataHome
{
    DataHome(const QString &sub = QString())
    {
        path = sub.isEmpty() ? dir.path() : dir.filePath(sub);
        qputenv("XDG_DATA_HOME", QFile::encodeName(path));
    }
    QTemporaryDir dir;
    QString path;
};

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
    void pathAndCd();
    void guards_data();
    void guards();
    void makeAndRemoveFolders();
    void copyFile();
    void copyFolderTree();
    void encodedRoundTrip_data();
    void encodedRoundTrip();
    void writeFile();
    void textJsonAndRename();
    void readXmlFile_data();
    void readXmlFile();
    void readCsvFile();
    void factories();
    void folderWithoutPermission();
    void trash();
    void trashAsync();

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

    const QStringList everyFile { "a.txt", "B.md", "data.txt/f.txt", "data.txt/g.md", "sub/c.txt", "sub/d.md", "sub/deeper/e.txt" };
    QTest::newRow("files") << false << QVariant() << false << QStringList { "a.txt", "B.md" };
    // The filter also picks the folders that are entered: "sub" is not.
    QTest::newRow("files by one filter, deep") << false << QVariant("*.txt") << true << QStringList { "a.txt", "data.txt/f.txt" };
    const QStringList notInSub { "a.txt", "B.md", "data.txt/f.txt", "data.txt/g.md" };
    QTest::newRow("files by list, deep") << false << QVariant(QStringList { "*.txt", "*.md" }) << true << notInSub;
    QTest::newRow("files, all, deep") << false << QVariant() << true << everyFile;
    QTest::newRow("empty filter matches all") << false << QVariant("") << true << everyFile;
    QTest::newRow("filter of no text matches all") << false << QVariant(QVariantMap { { "a", 1 } }) << true << everyFile;
    QTest::newRow("filter by case") << false << QVariant("b.MD") << false << QStringList { "B.md" };

    QTest::newRow("folders") << true << QVariant() << false << QStringList { "data.txt", "empty", "sub" };
    QTest::newRow("folders, deep") << true << QVariant() << true << QStringList { "data.txt", "empty", "sub", "sub/deeper" };
    QTest::newRow("folders filtered at every level") << true << QVariant("s*") << true << QStringList { "sub" };
    QTest::newRow("folders by two filters") << true << QVariant(QStringList { "s*", "d*" }) << true
                                            << QStringList { "data.txt", "sub", "sub/deeper" };
}

void tst_FileFolder::listing()
{
    QFETCH(bool, folders);
    QFETCH(QVariant, filter);
    QFETCH(bool, subFolders);
    QFETCH(QStringList, expected);

    for (const char *name : { "a.txt", "B.md", ".hidden.txt", "sub/c.txt", "sub/d.md", "sub/deeper/e.txt",
                              "sub/.secret/h.txt", "data.txt/f.txt", "data.txt/g.md" })
        QVERIFY(writeBytes(path(name), "x"));
    QVERIFY(QDir(m_dir->path()).mkpath("empty"));

    FileFolder folder(m_dir->path());
    QCOMPARE(folders ? folder.folderNames(filter, subFolders) : folder.fileNames(filter, subFolders), expected);
}

void tst_FileFolder::listingFollowsNoLinkLoop()
{
    QVERIFY(writeBytes(path("sub/a.txt"), "x"));
    QVERIFY(QFile::link(m_dir->path(), path("sub/back")));

    FileFolder folder(m_dir->path());
    expectWarning("links back");
    QCOMPARE(folder.folderNames(QVariant(), true), (QStringList { "sub", "sub/back" }));
    expectWarning("links back");
    QCOMPARE(folder.fileNames(QVariant(), true), QStringList { "sub/a.txt" });
}

void tst_FileFolder::size()
{
    QVERIFY(writeBytes(path("one.bin"), QByteArray(100, 'a')));
    QVERIFY(writeBytes(path(".hidden"), QByteArray(20, 'b')));
    QVERIFY(writeBytes(path("sub/two.bin"), QByteArray(3000, 'c')));
    QVERIFY(writeBytes(path("sub/.deep/three.bin"), QByteArray(4, 'd')));
    QTemporaryDir outside;
    QVERIFY(writeBytes(outside.filePath("big.bin"), QByteArray(50000, 'e')));
    // Links count for nothing, whether to a file or to a folder.
    QVERIFY(QFile::link(outside.filePath("big.bin"), path("link.bin")));
    QVERIFY(QFile::link(path("sub"), path("sublink")));

    FileFolder folder(m_dir->path());
    QCOMPARE(folder.size(), qlonglong(100 + 20 + 3000 + 4));

    // Cached until refresh or a new path.
    QVERIFY(writeBytes(path("late.bin"), QByteArray(7, 'f')));
    QCOMPARE(folder.size(), qlonglong(3124));
    QSignalSpy spy(&folder, &FileFolder::sizeChanged);
    folder.refresh();
    QCOMPARE(folder.size(), qlonglong(3131));
    folder.setPath(path("sub"));
    QCOMPARE(folder.size(), qlonglong(3004));
    QCOMPARE(spy.count(), 2);
    QCOMPARE(FileFolder(path("nothing")).size(), qlonglong(0));
}

void tst_FileFolder::pathAndCd()
{
    FileFolder folder(m_dir->path());
    QSignalSpy pathSpy(&folder, &FileFolder::pathChanged);
    // The same folder in other forms is no change.
    folder.setPath(m_dir->path() + QLatin1Char('/'));
    folder.setUrl(QUrl::fromLocalFile(m_dir->path()));
    QCOMPARE(pathSpy.count(), 0);

    folder.setPath("~/x");
    QCOMPARE(folder.path(), QDir::homePath() + "/x");
    QVERIFY(!folder.exists());
    QVERIFY(folder.setProperty("url", QUrl::fromLocalFile(m_dir->path())));
    QVERIFY(folder.cd(".."));
    QCOMPARE(folder.path(), QFileInfo(m_dir->path()).absolutePath());
    QVERIFY(!folder.cd("no-such-folder"));
    QCOMPARE(pathSpy.count(), 3);
}

void tst_FileFolder::guards_data()
{
    QTest::addColumn<QString>("at");
    QTest::addColumn<bool>("readOnly");
    QTest::addColumn<bool>("constant");
    QTest::addColumn<FolderCall>("call");
    QTest::addColumn<QString>("message");

    const auto row = [&](const char *tag, const FolderCall &call, const QString &at = "ro") {
        QTest::newRow(tag) << at << true << false << call << "This is a read only folder";
    };
    row("makeFolder", [](FileFolder &f) { return f.makeFolder(); }, "ro/new");
    row("removeFolder", [](FileFolder &f) { return f.removeFolder(); });
    row("removeFolder by name", [](FileFolder &f) { return f.removeFolder("empty", true); });
    row("makePath", [](FileFolder &f) { return f.makePath("a/b"); });
    row("removePath", [](FileFolder &f) { return f.removePath("empty"); });
    row("removeFile", [](FileFolder &f) { return f.removeFile("keep.txt"); });
    row("renameFile", [](FileFolder &f) { return f.renameFile("keep.txt", "moved.txt"); });
    row("writeFile", [](FileFolder &f) { return f.writeFile("keep.txt", "gone"); });
    row("writeJsonFile", [](FileFolder &f) { return f.writeJsonFile("keep.txt", QVariantMap { { "a", 1 } }); });
    row("writeTextFile", [](FileFolder &f) { return f.writeTextFile("keep.txt", "gone"); });

    const auto constantRow = [](const char *tag, const FolderCall &call) {
        QTest::newRow(tag) << "ro" << false << true << call << "This is a constant folder";
    };
    constantRow("constant setPath", [](FileFolder &f) { f.setPath("/"); return false; });
    constantRow("constant setUrl", [](FileFolder &f) { f.setUrl(QUrl::fromLocalFile("/")); return false; });
    constantRow("constant cd", [](FileFolder &f) { return f.cd("empty"); });
    constantRow("constant cdUp", [](FileFolder &f) { return f.cdUp(); });

    const auto otherRow = [](const char *tag, const QString &at, const FolderCall &call, const char *message) {
        QTest::newRow(tag) << at << false << false << call << QString(message);
    };
    otherRow("no folder name", "ro", [](FileFolder &f) { return f.removeFolder(QString(), true); }, "No folder name");
    otherRow("remove without path", "", [](FileFolder &f) { return f.removeFolder(); }, "No path");
    otherRow("make without path", "", [](FileFolder &f) { return f.makeFolder(); }, "No path");
    otherRow("root", "/", [](FileFolder &f) { return f.removeFolder(); }, "Not removing a root folder");
}

void tst_FileFolder::guards()
{
    QFETCH(QString, at);
    QFETCH(bool, readOnly);
    QFETCH(bool, constant);
    QFETCH(FolderCall, call);
    QFETCH(QString, message);

    QVERIFY(writeBytes(path("ro/keep.txt"), "keep"));
    QVERIFY(QDir(m_dir->path()).mkpath("ro/empty"));
    FileFolder folder(at.isEmpty() || at.startsWith('/') ? at : path(at));
    folder.setReadOnly(readOnly);
    folder.setConstant(constant);
    const QString before = folder.path();

    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(message));
    QVERIFY(!call(folder));

    QCOMPARE(folder.path(), before);
    QCOMPARE(contents(path("ro/keep.txt")), QByteArray("keep"));
    QCOMPARE(QDir(path("ro")).entryList(QDir::AllEntries | QDir::NoDotAndDotDot), (QStringList { "empty", "keep.txt" }));
    // A read-only folder still reads; a constant one still writes.
    if (readOnly && at == "ro")
        QCOMPARE(folder.readTextFile("keep.txt"), QStringLiteral("keep"));
    if (constant)
        QVERIFY(folder.writeTextFile("w.txt", "w"));
}

void tst_FileFolder::makeAndRemoveFolders()
{
    FileFolder folder(path("a/b/c"));
    QSignalSpy existsSpy(&folder, &FileFolder::existsChanged);
    QVERIFY(folder.makeFolder());
    QVERIFY(folder.makeFolder());
    QCOMPARE(existsSpy.count(), 1);

    QVERIFY(folder.makePath("x/y"));
    QVERIFY(folder.removePath("x/y"));
    QVERIFY(expectWarning("Error removing:") && !folder.removePath("x/y"));

    QVERIFY(writeBytes(path("a/b/c/full/f.txt"), "f"));
    QVERIFY(!folder.removeFolder("full"));
    QVERIFY(QFileInfo::exists(path("a/b/c/full/f.txt")));
    QVERIFY(folder.removeFolder("full", true));
    QVERIFY(!QFileInfo::exists(path("a/b/c/full")));
    QVERIFY(folder.removeFolder("never-there", true));

    // Hidden content goes too, and the cached size with it.
    QVERIFY(writeBytes(path("a/b/c/.hidden/deep/f"), "f"));
    QCOMPARE(folder.size(), qlonglong(1));
    QVERIFY(folder.removeFolder());
    QVERIFY(!folder.exists());
    QCOMPARE(folder.size(), qlonglong(0));
    // A missing folder counts as removed.
    QVERIFY(folder.removeFolder());
}

void tst_FileFolder::copyFile()
{
    QVERIFY(writeBytes(path("src/one.txt"), "one"));
    QVERIFY(writeBytes(path("dst/existing.txt"), "old"));
    FileFolder folder(path("src"));

    // Into a folder the name is kept; to a file name it is not.
    QVERIFY(folder.copyFile("one.txt", path("dst")));
    QCOMPARE(contents(path("dst/one.txt")), QByteArray("one"));
    QVERIFY(folder.copyFile("one.txt", path("dst/renamed.txt")));
    QCOMPARE(contents(path("dst/renamed.txt")), QByteArray("one"));

    // Never over an existing file, named or found through the folder, nor
    // over a dangling link, which would write through it.
    QVERIFY(QFile::link(path("elsewhere.txt"), path("dst/dangling.txt")));
    for (const char *target : { "dst/existing.txt", "dst", "dst/dangling.txt" })
        QVERIFY(expectWarning("Target file already exists:", QtCriticalMsg) && !folder.copyFile("one.txt", path(target)));
    QCOMPARE(contents(path("dst/existing.txt")), QByteArray("old"));
    QVERIFY(!QFileInfo::exists(path("elsewhere.txt")));

    QVERIFY(expectWarning("File doesn't exist:.*none\\.txt", QtCriticalMsg) && !folder.copyFile("none.txt", path("dst")));
    QVERIFY(expectWarning("Copy failed:") && !folder.copyFile("one.txt", path("missing/folder/x.txt")));
    QVERIFY(!QFileInfo::exists(path("missing")));

    // The copy keeps the mode; a fifo is no file to copy.
    QVERIFY(writeBytes(path("src/tool.sh"), "#!/bin/sh\n"));
    QVERIFY(::chmod(QFile::encodeName(path("src/tool.sh")).constData(), 0750) == 0);
    QVERIFY(folder.copyFile("tool.sh", path("dst")));
    struct stat status;
    QVERIFY(::stat(QFile::encodeName(path("dst/tool.sh")).constData(), &status) == 0);
    QCOMPARE(int(status.st_mode & 07777), 0750);
    QVERIFY(makeFifo(path("src/pipe")));
    QVERIFY(expectWarning("File is not a regular file:.*pipe", QtCriticalMsg) && !folder.copyFile("pipe", path("dst")));
    QVERIFY(!QFileInfo::exists(path("dst/pipe")));
}

void tst_FileFolder::copyFolderTree()
{
    QVERIFY(writeBytes(path("tree/a.txt"), "a"));
    QVERIFY(writeBytes(path("tree/.hidden"), "h"));
    QVERIFY(writeBytes(path("tree/sub/b.bin"), randomBytes(70000)));
    QVERIFY(writeBytes(path("tree/sub/deeper/c.txt"), "c"));
    QVERIFY(QDir(m_dir->path()).mkpath("tree/empty"));
    QVERIFY(makeFifo(path("tree/pipe")));

    FileFolder folder(m_dir->path());
    // Two levels of the target are missing; a fifo in the tree must not block.
    expectWarning("Skipping what is not a regular file:.*pipe");
    QVERIFY(folder.copyFile("tree", path("out/copy")));

    FileFolder source(path("tree"));
    FileFolder target(path("out/copy"));
    QCOMPARE(target.fileNames(QVariant(), true), source.fileNames(QVariant(), true));
    QCOMPARE(target.folderNames(QVariant(), true), source.folderNames(QVariant(), true));
    QCOMPARE(contents(path("out/copy/sub/b.bin")), contents(path("tree/sub/b.bin")));
    QCOMPARE(contents(path("out/copy/.hidden")), QByteArray("h"));
    QVERIFY(!QFileInfo::exists(path("out/copy/pipe")));

    // Copying again stops at the first file that exists and changes nothing.
    QVERIFY(writeBytes(path("out/copy/a.txt"), "changed"));
    QVERIFY(expectWarning("copyFile failed:") && !folder.copyFile("tree", path("out/copy")));
    QCOMPARE(contents(path("out/copy/a.txt")), QByteArray("changed"));

    // Never into itself; a prefix of the name is not the inside of the folder.
    for (const char *inside : { "tree/inner/copy", "tree" })
        QVERIFY(expectWarning("Target is inside the source folder", QtCriticalMsg) && !folder.copyFile("tree", path(inside)));
    QVERIFY(!QFileInfo::exists(path("tree/inner")));
    QVERIFY(folder.copyFile("tree", path("tree2")));
    QCOMPARE(contents(path("tree2/a.txt")), QByteArray("a"));

    // A link inside the tree back to the tree is no endless copy.
    QVERIFY(QFile::link(path("tree"), path("tree/loop")));
    QVERIFY(expectWarning("links back to itself", QtCriticalMsg) && !folder.copyFile("tree", path("tree3")));
}

void tst_FileFolder::encodedRoundTrip_data()
{
    QTest::addColumn<QString>("option");
    QTest::addColumn<QByteArray>("bytes");

    // The option names are taken in any case.
    QTest::newRow("BASE64") << "BASE64" << randomBytes(4099);
    QTest::newRow("Hex") << "Hex" << randomBytes(4099);
    QTest::newRow("base64 empty") << "base64" << QByteArray();
}

void tst_FileFolder::encodedRoundTrip()
{
    QFETCH(QString, option);
    QFETCH(QByteArray, bytes);

    FileFolder folder(m_dir->path());
    const bool base64 = option.compare("base64", Qt::CaseInsensitive) == 0;
    const QString text = QString::fromLatin1(base64 ? bytes.toBase64() : bytes.toHex());

    QVERIFY(folder.writeFile("data.bin", text, QVariantMap { { "decode", option } }));
    QCOMPARE(contents(path("data.bin")), bytes);
    QCOMPARE(QString::fromLatin1(folder.readFile("data.bin", QVariantMap { { "encode", option } }).toByteArray()), text);
    QCOMPARE(folder.readFile("data.bin", QVariantMap { { "encode", "other" } }).toByteArray(), bytes);
}

void tst_FileFolder::writeFile()
{
    FileFolder folder(m_dir->path());
    const QByteArray payload = randomBytes(200 * 1024 + 17);

    QBuffer buffer;
    buffer.setData(payload);
    QVERIFY(folder.writeFile("from-buffer.bin", QVariant::fromValue<QObject *>(&buffer)));
    QCOMPARE(contents(path("from-buffer.bin")), payload);
    QVERIFY(!buffer.isOpen());

    // An open device is read from where it stands, and left open.
    QVERIFY(buffer.open(QIODevice::ReadOnly));
    QVERIFY(buffer.seek(100));
    QVERIFY(folder.writeFile("from-open.bin", QVariant::fromValue<QObject *>(&buffer)));
    QCOMPARE(contents(path("from-open.bin")), payload.mid(100));
    QVERIFY(buffer.isOpen());

    File file(path("from-buffer.bin"));
    QVERIFY(folder.writeFile("from-file.bin", QVariant::fromValue<QObject *>(&file)));
    QCOMPARE(contents(path("from-file.bin")), payload);

    // Copying a file onto itself would empty it.
    QVERIFY(expectWarning("Source and target are the same file")
            && !folder.writeFile("from-buffer.bin", QVariant::fromValue<QObject *>(&file)));
    QCOMPARE(contents(path("from-buffer.bin")), payload);

    QBuffer writeOnly;
    QVERIFY(writeOnly.open(QIODevice::WriteOnly));
    QVERIFY(expectWarning("Source is not readable") && !folder.writeFile("none.bin", QVariant::fromValue<QObject *>(&writeOnly)));
    QVERIFY(!QFileInfo::exists(path("none.bin")));

    // Into a missing folder, which is not made.
    QVERIFY(expectWarning("Error opening") && !folder.writeFile("missing/file.txt", "x"));
    QVERIFY(!QFileInfo::exists(path("missing")));
    QVERIFY(QDir(m_dir->path()).mkpath("afolder"));
    QVERIFY(expectWarning("Error opening") && !folder.writeTextFile("afolder", "x"));

    // Content without bytes leaves the file as it was.
    QVERIFY(writeBytes(path("keep.txt"), "keep"));
    QVERIFY(expectWarning("Unsupported content") && !folder.writeFile("keep.txt", QVariantMap { { "a", 1 } }));
    QCOMPARE(contents(path("keep.txt")), QByteArray("keep"));

    if (QFileInfo::exists("/dev/full"))
        QVERIFY(expectWarning("Error writing") && !FileFolder("/dev").writeTextFile("full", "no space"));
}

void tst_FileFolder::textJsonAndRename()
{
    FileFolder folder(m_dir->path());
    const QString text = QString::fromUtf8("Zeile 1 – ✓\nzweite");
    QVERIFY(folder.writeTextFile("t.txt", text));
    QCOMPARE(contents(path("t.txt")), text.toUtf8());
    QCOMPARE(folder.readTextFile("t.txt"), text);
    QVERIFY(folder.writeTextFile("t.txt", "short"));
    QCOMPARE(contents(path("t.txt")), QByteArray("short"));

    const QVariantMap json { { "name", QString::fromUtf8("é") }, { "n", 3 }, { "list", QVariantList { 1, "two" } },
                             { "nested", QVariantMap { { "x", true } } }, { "dropped", QVariant() } };
    QVERIFY(folder.writeJsonFile("j.json", json));
    QVariantMap expected = json;
    expected.remove("dropped");
    QCOMPARE(folder.readJsonFile("j.json"), expected);
    QVERIFY(writeBytes(path("bad.json"), "{ not json"));
    QVERIFY(folder.readJsonFile("bad.json").isEmpty());
    // Reading what is no regular file gives nothing, and never blocks.
    QVERIFY(makeFifo(path("fifo")));
    QVERIFY(expectWarning("Not a regular file") && folder.readFile("fifo").toByteArray().isEmpty());
    QVERIFY(folder.readTextFile("nothing").isNull());

    // Renaming never replaces a file.
    QVERIFY(folder.renameFile("t.txt", "c.txt"));
    QVERIFY(!folder.fileExists("t.txt"));
    QVERIFY(expectWarning("oldFileName:.*c\\.txt.*newFileName:.*j\\.json") && !folder.renameFile("c.txt", "j.json"));
    QCOMPARE(contents(path("c.txt")), QByteArray("short"));
    QCOMPARE(folder.readJsonFile("j.json"), expected);
    QVERIFY(folder.removeFile("c.txt"));

    QCOMPARE(FileFolder(":/").fileUrl("x/y.png"), QUrl("qrc:///x/y.png"));
}

void tst_FileFolder::readXmlFile_data()
{
    QTest::addColumn<QByteArray>("bytes");
    QTest::addColumn<QString>("expected");

    const QString text = QString::fromUtf8("Grüße ✓");
    const QByteArray utf8 = "<r><t>" + text.toUtf8() + "</t></r>";
    QTest::newRow("utf-8") << "<?xml version=\"1.0\"?>" + utf8 << text;
    QTest::newRow("utf-8 with byte order mark") << "\xef\xbb\xbf" + utf8 << text;
    // The codec writes the byte order mark itself.
    QTest::newRow("utf-16 with byte order mark") << QTextCodec::codecForName("UTF-16LE")->fromUnicode("<r><t>" + text + "</t></r>") << text;
    const QByteArray latin1 = "<?xml version='1.0' encoding='ISO-8859-1'?>\n<r><t>Gr\xfc\xdf" "e</t></r>";
    QTest::newRow("latin-1 by declaration") << latin1 << QString::fromUtf8("Grüße");
    QTest::newRow("broken") << QByteArray("<r><t>open") << QString();
}

void tst_FileFolder::readXmlFile()
{
    QFETCH(QByteArray, bytes);
    QFETCH(QString, expected);

    QVERIFY(writeBytes(path("doc.xml"), bytes));
    FileFolder folder(m_dir->path());
    const QVariantMap map = folder.readXmlFile("doc.xml");
    QCOMPARE(map.isEmpty(), expected.isNull());
    QCOMPARE(map.value("t").toString(), expected);
    QVERIFY(folder.readXmlFile("missing.xml").isEmpty());
}

void tst_FileFolder::readCsvFile()
{
    QVERIFY(writeBytes(path("a.csv"), "name,n\nx,1\n\"y, z\",2.5\n"));
    QVERIFY(makeFifo(path("pipe.csv")));

    // Errors are raised in the calling script.
    QJSEngine engine;
    engine.globalObject().setProperty("folder", engine.newQObject(new FileFolder(m_dir->path())));
    const auto call = [&](const char *code) {
        return engine.evaluate(QStringLiteral("(function() { try { return %1 } catch (e) { return String(e) } })()")
                                   .arg(QLatin1String(code))).toString();
    };
    QCOMPARE(call("JSON.stringify(folder.readCsvFile('a.csv'))"), QStringLiteral(R"([{"n":1,"name":"x"},{"n":2.5,"name":"y, z"}])"));
    QCOMPARE(call("JSON.stringify(folder.readCsvFile('a.csv', { fields: ['p', 'q'] })[1])"), QStringLiteral(R"({"p":"x","q":1})"));
    QCOMPARE(call("folder.readCsvFile('pipe.csv')"), QStringLiteral("Error: Error reading CSV file:Not a regular file."));
    QCOMPARE(call("folder.readCsvFile('none.csv')"), QStringLiteral("Error: Error reading CSV file:Open QIODevice failed."));

    // No script to raise the error in: a warning and no result.
    QVERIFY(expectWarning("Error reading CSV file:") && !FileFolder(m_dir->path()).readCsvFile("none.csv").isValid());
}

void tst_FileFolder::factories()
{
    FileFolder folder(m_dir->path());
    folder.setReadOnly(true);
    folder.setConstant(true);

    QScopedPointer<File> file(folder.file("f.txt"));
    QScopedPointer<FileInfo> info(folder.fileInfo("f.txt"));
    QScopedPointer<FileFolder> child(folder.folder("child"));
    QScopedPointer<Settings> settings(folder.settingsFile(QString()));
    QCOMPARE(file->path(), path("f.txt"));
    QCOMPARE(info->filePath(), path("f.txt"));
    QCOMPARE(child->path(), path("child"));
    QCOMPARE(settings->path(), path("settings.ini"));
    for (QObject *made : std::initializer_list<QObject *> { file.data(), info.data(), child.data(), settings.data() }) {
        QVERIFY(!made->parent());
        QCOMPARE(QQmlEngine::objectOwnership(made), QQmlEngine::JavaScriptOwnership);
    }
    // A folder handed out is neither read-only nor constant.
    QVERIFY(child->makeFolder());
    QVERIFY(child->cdUp());

    // Settings are stored as INI text, in a sub-folder if named so.
    settings.reset(folder.settingsFile("sub/x.ini"));
    settings->setValue("group/key", "value");
    settings.reset();
    QVERIFY(contents(path("sub/x.ini")).contains("[group]\nkey=value"));
}

void tst_FileFolder::folderWithoutPermission()
{
    QVERIFY(writeBytes(path("closed/inner/a.txt"), "a"));
    QVERIFY(writeBytes(path("closed/b.txt"), "b"));
    if (::geteuid() == 0)
        QSKIP("Permission checks don't apply to the superuser");
    QVERIFY(QFile::setPermissions(path("closed"), QFileDevice::ExeOwner));

    FileFolder folder(path("closed"));
    QVERIFY(folder.exists());
    QVERIFY(folder.fileNames(QVariant(), true).isEmpty());
    QVERIFY(folder.folderNames(QVariant(), true).isEmpty());
    QCOMPARE(folder.size(), qlonglong(0));
    // Known names still work through the search right.
    QCOMPARE(folder.readTextFile("b.txt"), QStringLiteral("b"));
    QVERIFY(expectWarning("Error opening") && !folder.writeTextFile("new.txt", "n"));

    QVERIFY(expectWarning("File is not readable:", QtCriticalMsg) && !FileFolder(m_dir->path()).copyFile("closed", path("copy")));
    QVERIFY(!QFileInfo::exists(path("copy")));

    QVERIFY(QFile::setPermissions(path("closed"), QFileDevice::ReadOwner | QFileDevice::WriteOwner | QFileDevice::ExeOwner));
}

void tst_FileFolder::trash()
{
    {
        // A fresh account may have no data folder yet: it is made, private.
        DataHome fresh("not/yet");
        QVERIFY(writeBytes(path("t.txt"), "t"));
        const QString result = FileFolder(m_dir->path()).moveFileToTrash("t.txt").toString();
        QVERIFY(result.startsWith(fresh.path + "/Trash/files/"));
        QCOMPARE(contents(result), QByteArray("t"));
        QCOMPARE(QFileInfo(fresh.path).permissions() & 0x7777, QFileDevice::Permissions(0x7700));
    }

    DataHome data;
    FileFolder folder(m_dir->path());
    QSignalSpy spy(&folder, kMovedFileToTrash);
    QSignalSpy oneArgument(&folder, SIGNAL(movedFileToTrash(QString)));
    QSignalSpy twoArguments(&folder, SIGNAL(movedFileToTrash(QString,QVariant)));

    QVERIFY(!folder.moveFileToTrash("missing.txt").isValid());
    QCOMPARE(oneArgument.count(), 1);
    QCOMPARE(twoArguments.count(), 1);
    QCOMPARE(spy.at(0), (QVariantList { "missing.txt", QVariant(), "File does not exist." }));

    QVERIFY(writeBytes(path("doomed.txt"), "recover me"));
    const QString inTrash = folder.moveFileToTrash("doomed.txt").toString();
    QVERIFY2(inTrash.startsWith(data.path + "/Trash/files/"), qPrintable(inTrash));
    QCOMPARE(contents(inTrash), QByteArray("recover me"));
    QVERIFY(!folder.fileExists("doomed.txt"));
    QVERIFY(contents(data.path + "/Trash/info/" + QFileInfo(inTrash).fileName() + ".trashinfo").contains("Path="));
    QCOMPARE(spy.at(1).at(1).toString(), inTrash);
    QVERIFY(spy.at(1).at(2).toString().isNull());

    // A file URL names the file as well; a second file of the same name is
    // kept apart in the trash.
    QVERIFY(writeBytes(path("doomed.txt"), "second"));
    const QString url = QUrl::fromLocalFile(path("doomed.txt")).toString();
    const QString second = folder.moveFileToTrash(url).toString();
    QVERIFY(!second.isEmpty() && second != inTrash);
    QCOMPARE(contents(second), QByteArray("second"));
    QCOMPARE(spy.last().at(0).toString(), url);

    // The data folder can't be made: a file stands in its way. Nothing may
    // land in the working folder instead.
    DataHome blocked("blocker/data");
    QVERIFY(writeBytes(blocked.dir.filePath("blocker"), "b"));
    QVERIFY(writeBytes(path("stays.txt"), "stays"));
    QTemporaryDir work;
    const QString previous = QDir::currentPath();
    QVERIFY(QDir::setCurrent(work.path()));
    QVERIFY(expectWarning("Unable to move file to trash") && !folder.moveFileToTrash("stays.txt").isValid());
    QDir::setCurrent(previous);
    QCOMPARE(spy.last().at(2).toString(), QStringLiteral("Unable to move file to trash."));
    QCOMPARE(contents(path("stays.txt")), QByteArray("stays"));
    QVERIFY(QDir(work.path()).entryList(QDir::AllEntries | QDir::NoDotAndDotDot).isEmpty());
}

void tst_FileFolder::trashAsync()
{
    DataHome data;
    QVERIFY(writeBytes(path("async.txt"), "async"));

    FileFolder folder(m_dir->path());
    QThread *signalThread = nullptr;
    connect(&folder, kMovedFileToTrash, this, [&] { signalThread = QThread::currentThread(); });
    QSignalSpy spy(&folder, kMovedFileToTrash);

    folder.moveFileToTrashAsync("async.txt");
    QVERIFY(spy.wait(5000));
    QCOMPARE(signalThread, QThread::currentThread());
    QVERIFY(spy.at(0).at(1).toString().startsWith(data.path));
    QVERIFY(!folder.fileExists("async.txt"));

    folder.moveFileToTrashAsync("async.txt");
    QVERIFY(spy.wait(5000));
    QCOMPARE(spy.at(1).at(2).toString(), QStringLiteral("File does not exist."));
    QTRY_COMPARE(folder.findChildren<QThread *>().size(), 0);

    // The folder may go away while its threads still run.
    for (int i = 0; i < 20; ++i) {
        auto *gone = new FileFolder(m_dir->path());
        gone->moveFileToTrashAsync("absent.txt");
        delete gone;
    }
    QCoreApplication::processEvents();
}

QTEST_GUILESS_MAIN(tst_FileFolder)
#include "tst_FileFolder.moc"
