#include "TestSupport.h"
#include "ZipEntryStream.h"
#include "ZipFileInfo.h"
#include "ZipReader.h"
#include "ZipTestArchive.h"
#include "ZipTestTree.h"

#include <QRegularExpression>
#include <QSignalSpy>
#include <QTemporaryDir>
#include <QtTest>

#include <memory>
#include <zlib.h>

using ZipTestArchive::Entry;

// Records the reader's signals in the order they come.
class Recorder
{
public:
    explicit Recorder(ZipReader &reader)
    {
        QObject::connect(&reader, &ZipReader::progress, [this](const QString &name, const QString &, double percent) {
            events.append(QStringLiteral("progress %1 %2").arg(name).arg(percent, 0, 'f', 3));
        });
        QObject::connect(&reader, &ZipReader::error,
                         [this](const QString &name, const QString &output, ZipReader::Result result) {
                             events.append(QStringLiteral("error %1 %2").arg(name).arg(int(result)));
                             errorOutputs.append(output);
                         });
        QObject::connect(&reader, &ZipReader::completed, [this] { events.append(QStringLiteral("completed")); });
    }

    QStringList eventsFor(const QString &name) const
    {
        QStringList list;
        for (const QString &event : events) {
            if (event.section(QLatin1Char(' '), 1, 1) == name)
                list.append(event);
        }
        return list;
    }

    QStringList events;
    QStringList errorOutputs;
};

class tst_ZipReader : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void notOpen_data();
    void notOpen();
    void pathAndState();
    void listing();
    void folderNamesFollowCase();
    void lookups_data();
    void lookups();
    void fileInfo();
    void dayRule_data();
    void dayRule();
    void extractAll();
    void extractAllBasePath_data();
    void extractAllBasePath();
    void extractFile();
    void damagedEntries_data();
    void damagedEntries();
    void damagedInfoZipEntry();
    void readEntries();
    void publicSamples_data();
    void publicSamples();
    void zip64Entries();
    void hostileNames_data();
    void hostileNames();
    void linksOnDisk_data();
    void linksOnDisk();
    void linkEntriesStayFiles();
    void longNames_data();
    void longNames();
    void oversizedClaims_data();
    void oversizedClaims();
    void fuzzFindings();

private:
    QString archiveOf(const QList<Entry> &entries);

    QTemporaryDir m_dir;
    QString m_tree;
    QString m_archive;
    int m_count = 0;
};

void tst_ZipReader::initTestCase()
{
    QVERIFY(m_dir.isValid());
    if (!TestSupport::hasProgram(QStringLiteral("zip")))
        QSKIP("Info-ZIP zip is not installed");
    m_tree = m_dir.filePath(QStringLiteral("tree"));
    m_archive = m_dir.filePath(QStringLiteral("tree.zip"));
    QVERIFY(ZipTestTree::writeTree(m_tree));
    QVERIFY(ZipTestTree::zipTree(m_tree, m_archive));
    QFile text(m_dir.filePath(QStringLiteral("not-a-zip.txt")));
    QVERIFY(text.open(QIODevice::WriteOnly) && text.write(QByteArray("plain text, no archive\n").repeated(50)) > 0);
}

QString tst_ZipReader::archiveOf(const QList<Entry> &entries)
{
    const QString path = m_dir.filePath(QStringLiteral("made-%1.zip").arg(++m_count));
    if (!ZipTestArchive::write(path, entries))
        return QString();
    return path;
}

void tst_ZipReader::notOpen_data()
{
    QTest::addColumn<QString>("path");
    QTest::addColumn<bool>("warnsUnableToOpen");
    QTest::newRow("empty path") << QString() << false;
    QTest::newRow("missing file") << QStringLiteral("no-such-archive.zip") << false;
    QTest::newRow("not a zip") << QStringLiteral("not-a-zip.txt") << true;
}

void tst_ZipReader::notOpen()
{
    QFETCH(QString, path);
    QFETCH(bool, warnsUnableToOpen);

    ZipReader reader;
    reader.setPath(path.isEmpty() || QFileInfo(path).isAbsolute() ? path : m_dir.filePath(path));
    Recorder recorder(reader);
    // Every call tries to open the archive again.
    const auto expect = [&](QtMsgType type) {
        if (warnsUnableToOpen)
            QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Unable to open: ")));
        QTest::ignoreMessage(type, QRegularExpression(QStringLiteral("ZIP not open")));
    };
    expect(QtWarningMsg);
    QVERIFY(reader.fileNames().isEmpty());
    QVERIFY(!reader.isOpen());

    expect(QtWarningMsg);
    const QString out = m_dir.filePath(QStringLiteral("not-open-out"));
    QVERIFY(!reader.extractAll(out));
    QVERIFY(!QFileInfo::exists(out));
    QVERIFY(recorder.events.isEmpty());

    expect(QtWarningMsg);
    QVERIFY(!reader.exists(QStringLiteral("root.txt")));
    expect(QtCriticalMsg);
    QVERIFY(reader.readTextFile(QStringLiteral("root.txt")).isNull());
    QVERIFY(!reader.isOpen());
}

void tst_ZipReader::pathAndState()
{
    ZipReader reader;
    QStringList order;
    connect(&reader, &ZipReader::pathChanged, [&] { order << QStringLiteral("path"); });
    connect(&reader, &ZipReader::fileNamesChanged, [&] { order << QStringLiteral("files"); });
    connect(&reader, &ZipReader::folderNamesChanged, [&] { order << QStringLiteral("folders"); });
    QSignalSpy caseSpy(&reader, &ZipReader::caseSensitiveChanged);

    reader.setPath(m_archive);
    QCOMPARE(order, QStringList({QStringLiteral("path"), QStringLiteral("files"), QStringLiteral("folders")}));
    reader.setPath(m_archive);
    QCOMPARE(order.size(), 3);

    // Opening is lazy: reading a list opens the archive and leaves it open.
    QVERIFY(!reader.isOpen());
    QVERIFY(!reader.fileNames().isEmpty());
    QVERIFY(reader.isOpen());
    reader.close();
    QVERIFY(!reader.isOpen());
    QCOMPARE(order.size(), 3);

    QVERIFY(reader.exists(QStringLiteral("root.txt")));
    reader.refresh();
    QVERIFY(!reader.isOpen());
    QCOMPARE(order.mid(3), QStringList({QStringLiteral("files"), QStringLiteral("folders")}));

    // A path variable resolves before it is stored.
    qputenv("LOOMKIT_ZIP_TEST_DIR", QFile::encodeName(m_dir.path()));
    reader.setPath(QStringLiteral("$LOOMKIT_ZIP_TEST_DIR/tree.zip"));
    QCOMPARE(reader.path(), m_dir.path() + QStringLiteral("/tree.zip"));

    reader.setCaseSensitive(false);
    QCOMPARE(caseSpy.count(), 0);
    reader.setCaseSensitive(true);
    reader.setCaseSensitive(true);
    QCOMPARE(caseSpy.count(), 1);
}

void tst_ZipReader::listing()
{
    ZipReader reader;
    reader.setPath(m_archive);

    QStringList files = reader.fileNames();
    files.sort();
    QStringList expected = ZipTestTree::contents().keys();
    expected.replaceInStrings(QStringLiteral("\\"), QStringLiteral("/"));
    expected.sort();
    QCOMPARE(files, expected);

    QStringList folders = reader.folderNames();
    folders.sort();
    QCOMPARE(folders, QStringList({QStringLiteral("."), QStringLiteral("a"), QStringLiteral("a/deep"),
                                   QStringLiteral("a/deep/c"), QStringLiteral("x")}));

    // A flat archive has the one folder "."
    reader.setPath(archiveOf({ZipTestArchive::file("one.txt", "1"), ZipTestArchive::file("two.txt", "2")}));
    QCOMPARE(reader.folderNames(), QStringList(QStringLiteral(".")));

    // Folder entries count as folders, not as files.
    reader.setPath(archiveOf({ZipTestArchive::file("a/", QByteArray()), ZipTestArchive::file("a/b.txt", "b")}));
    QCOMPARE(reader.folderNames(), QStringList(QStringLiteral("a")));
    QCOMPARE(reader.fileNames(), QStringList(QStringLiteral("a/b.txt")));
}

void tst_ZipReader::folderNamesFollowCase()
{
    ZipReader reader;
    reader.setPath(archiveOf({ZipTestArchive::file("Docs/one.txt", "1"), ZipTestArchive::file("docs/two.txt", "2")}));
    QCOMPARE(reader.folderNames(), QStringList(QStringLiteral("Docs")));
    reader.setCaseSensitive(true);
    QCOMPARE(reader.folderNames(), QStringList({QStringLiteral("Docs"), QStringLiteral("docs")}));
    // Files are listed as they are, duplicates and all.
    QCOMPARE(reader.fileNames().size(), 2);
}

void tst_ZipReader::lookups_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<bool>("caseSensitive");
    QTest::addColumn<bool>("found");
    QTest::newRow("exact") << "a/b.txt" << false << true;
    QTest::newRow("other case, insensitive") << "A/B.TXT" << false << true;
    QTest::newRow("other case, sensitive") << "A/B.TXT" << true << false;
    QTest::newRow("exact, sensitive") << "a/deep/c/d.txt" << true << true;
    QTest::newRow("folder entry") << "a/deep/" << false << true;
    QTest::newRow("backslash as stored") << "x\\y.txt" << false << true;
    QTest::newRow("backslash shown as slash") << "x/y.txt" << false << false;
    QTest::newRow("missing") << "nope.txt" << false << false;
}

void tst_ZipReader::lookups()
{
    QFETCH(QString, name);
    QFETCH(bool, caseSensitive);
    QFETCH(bool, found);

    ZipReader reader;
    reader.setPath(m_archive);
    reader.setCaseSensitive(caseSensitive);
    QCOMPARE(reader.exists(name), found);
    std::unique_ptr<ZipFileInfo> info(reader.fileInfo(name));
    QCOMPARE(bool(info), found);
}

void tst_ZipReader::fileInfo()
{
    ZipReader reader;
    reader.setPath(m_archive);

    const QByteArray data = ZipTestTree::contents().value(QStringLiteral("a/deep/c/d.txt"));
    std::unique_ptr<ZipFileInfo> info(reader.fileInfo(QStringLiteral("A/Deep/C/D.txt")));
    QVERIFY(info);
    QCOMPARE(info->filePath(), QStringLiteral("A/Deep/C/D.txt"));
    QCOMPARE(info->path(), QStringLiteral("A/Deep/C"));
    QCOMPARE(info->fileName(), QStringLiteral("D.txt"));
    QCOMPARE(info->suffix(), QStringLiteral("txt"));
    QCOMPARE(info->size(), qlonglong(data.size()));
    QVERIFY(info->compressedSize() > 0 && info->compressedSize() < info->size());
    QCOMPARE(info->crc(), ulong(crc32(0, reinterpret_cast<const Bytef *>(data.constData()), uInt(data.size()))));
    // Info-ZIP stores the true day; the reader's rule gives one day more.
    QCOMPARE(info->lastModified(), ZipTestTree::fileTime().addDays(1));
    QVERIFY(info->parent() == nullptr);

    std::unique_ptr<ZipFileInfo> stored(reader.fileInfo(QStringLiteral("plain.raw")));
    QVERIFY(stored);
    QCOMPARE(stored->compressedSize(), stored->size());

    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("File not found \"missing\"")));
    QVERIFY(!reader.fileInfo(QStringLiteral("missing")));
}

void tst_ZipReader::dayRule_data()
{
    QTest::addColumn<int>("year");
    QTest::addColumn<int>("month");
    QTest::addColumn<int>("day");
    QTest::addColumn<QDate>("expected");
    QTest::newRow("mid-month") << 2021 << 3 << 14 << QDate(2021, 3, 15);
    QTest::newRow("day 0 as ZipWriter stores the 1st") << 2021 << 4 << 0 << QDate(2021, 4, 1);
    QTest::newRow("last day of a 31-day month") << 2021 << 3 << 31 << QDate();
    QTest::newRow("end of February") << 2020 << 2 << 28 << QDate(2020, 2, 29);
}

void tst_ZipReader::dayRule()
{
    QFETCH(int, year);
    QFETCH(int, month);
    QFETCH(int, day);
    QFETCH(QDate, expected);

    Entry entry = ZipTestArchive::file("dated.txt", "d");
    entry.dosDate = quint16(((year - 1980) << 9) | (month << 5) | day);
    entry.dosTime = quint16((13 << 11) | (45 << 5) | (58 / 2));
    ZipReader reader;
    reader.setPath(archiveOf({entry}));
    std::unique_ptr<ZipFileInfo> info(reader.fileInfo(QStringLiteral("dated.txt")));
    QVERIFY(info);
    QCOMPARE(info->lastModified().date(), expected);
    if (!expected.isValid())
        return;
    QCOMPARE(info->lastModified(), QDateTime(expected, QTime(13, 45, 58)));

    // Extraction stamps the file with the same date.
    QTemporaryDir out;
    QVERIFY(reader.extractAll(out.path()));
    QCOMPARE(QFileInfo(out.filePath(QStringLiteral("dated.txt"))).lastModified(), QDateTime(expected, QTime(13, 45, 58)));
}

void tst_ZipReader::extractAll()
{
    ZipReader reader;
    reader.setPath(m_archive);
    Recorder recorder(reader);
    QTemporaryDir out;
    const QString target = out.filePath(QStringLiteral("new/folder"));
    QVERIFY(reader.extractAll(target));

    const auto contents = ZipTestTree::contents();
    for (auto it = contents.constBegin(); it != contents.constEnd(); ++it) {
        QString name = it.key();
        name.replace(QLatin1Char('\\'), QLatin1Char('/'));
        const QString path = QDir(target).filePath(name);
        QCOMPARE(ZipTestTree::readAll(path), it.value());
        QCOMPARE(QFileInfo(path).lastModified(), ZipTestTree::fileTime().addDays(1));
    }
    QVERIFY(QFileInfo(QDir(target).filePath(QStringLiteral("a/deep/c"))).isDir());

    // Progress runs one chunk behind and ends at 100; an empty entry has
    // the one report; completed comes once, last.
    const double size = 600 * 1024;
    const double chunk = ZipEntryStream::ChunkSize;
    QStringList expectedBig;
    for (double done = 0; done < size; done += chunk)
        expectedBig << QStringLiteral("progress big.bin %1").arg(done / size * 100, 0, 'f', 3);
    expectedBig << QStringLiteral("progress big.bin 100.000");
    QCOMPARE(recorder.eventsFor(QStringLiteral("big.bin")), expectedBig);
    QCOMPARE(recorder.eventsFor(QStringLiteral("empty.txt")), QStringList(QStringLiteral("progress empty.txt 100.000")));
    QCOMPARE(recorder.eventsFor(QStringLiteral("x/y.txt")),
             QStringList({QStringLiteral("progress x/y.txt 0.000"), QStringLiteral("progress x/y.txt 100.000")}));
    QCOMPARE(recorder.events.count(QStringLiteral("completed")), 1);
    QCOMPARE(recorder.events.last(), QStringLiteral("completed"));
    QVERIFY(recorder.errorOutputs.isEmpty());

    // Signals name the output as the output folder and the entry make it,
    // relative when the folder is.
    const QString previous = QDir::currentPath();
    QVERIFY(QDir::setCurrent(out.path()));
    QSignalSpy progress(&reader, &ZipReader::progress);
    QVERIFY(reader.extractAll(QStringLiteral("relative")));
    QDir::setCurrent(previous);
    QVERIFY(!progress.isEmpty());
    QCOMPARE(progress.last().at(1).toString(), QStringLiteral("relative/") + progress.last().at(0).toString());
    QVERIFY(QFileInfo::exists(out.filePath(QStringLiteral("relative/a/deep/c/d.txt"))));
}

void tst_ZipReader::extractAllBasePath_data()
{
    QTest::addColumn<QString>("basePath");
    QTest::addColumn<bool>("caseSensitive");
    QTest::addColumn<QStringList>("expected");
    const QStringList subtree = {QStringLiteral("b.txt"), QStringLiteral("deep/"), QStringLiteral("deep/c/"),
                                 QStringLiteral("deep/c/d.txt")};
    QTest::newRow("a") << "a" << false << subtree;
    QTest::newRow("a/") << "a/" << false << subtree;
    QTest::newRow("./a//") << "./a//" << false << subtree;
    QTest::newRow("A, insensitive") << "A" << false << subtree;
    QTest::newRow("A, sensitive") << "A" << true << QStringList();
    QTest::newRow("a/deep") << "a/deep" << false << QStringList({QStringLiteral("c/"), QStringLiteral("c/d.txt")});
    QTest::newRow("missing") << "zzz" << false << QStringList();
}

void tst_ZipReader::extractAllBasePath()
{
    QFETCH(QString, basePath);
    QFETCH(bool, caseSensitive);
    QFETCH(QStringList, expected);

    ZipReader reader;
    reader.setPath(m_archive);
    reader.setCaseSensitive(caseSensitive);
    QSignalSpy completed(&reader, &ZipReader::completed);
    QTemporaryDir out;
    QVERIFY(reader.extractAll(out.path(), basePath));
    QCOMPARE(ZipTestTree::listTree(out.path()), expected);
    QCOMPARE(completed.count(), 1);
}

void tst_ZipReader::extractFile()
{
    ZipReader reader;
    reader.setPath(m_archive);
    Recorder recorder(reader);
    QTemporaryDir out;

    const QString path = out.filePath(QStringLiteral("copy.txt"));
    QVERIFY(reader.extractFile(QStringLiteral("A/B.txt"), path));
    QCOMPARE(ZipTestTree::readAll(path), QByteArray("a b text\n"));
    QCOMPARE(QFileInfo(path).lastModified(), ZipTestTree::fileTime().addDays(1));
    QCOMPARE(recorder.events, QStringList({QStringLiteral("progress a/b.txt 0.000"),
                                           QStringLiteral("progress a/b.txt 100.000")}));

    // No folder is made for the output, and a failed open is no error signal.
    recorder.events.clear();
    const QString missingFolder = out.filePath(QStringLiteral("missing/copy.txt"));
    QTest::ignoreMessage(QtCriticalMsg, QRegularExpression(QStringLiteral("Error opening: ")));
    QTest::ignoreMessage(QtCriticalMsg, QRegularExpression(QStringLiteral("Extracting: \"a/b.txt\" -> ")));
    QVERIFY(!reader.extractFile(QStringLiteral("a/b.txt"), missingFolder));
    QVERIFY(!QFileInfo::exists(out.filePath(QStringLiteral("missing"))));
    QVERIFY(recorder.events.isEmpty());

    QTest::ignoreMessage(QtCriticalMsg, QRegularExpression(QStringLiteral("Extracting: \"nope\" -> ")));
    QVERIFY(!reader.extractFile(QStringLiteral("nope"), path));
    QVERIFY(recorder.events.isEmpty());
}

void tst_ZipReader::damagedEntries_data()
{
    QTest::addColumn<bool>("deflate");
    QTest::addColumn<bool>("damage");
    QTest::addColumn<bool>("badCrc");
    QTest::addColumn<bool>("checksumError");
    QTest::newRow("damaged deflate data") << true << true << false << false;
    QTest::newRow("stored, wrong checksum") << false << false << true << true;
    QTest::newRow("deflated, wrong checksum") << true << false << true << true;
}

void tst_ZipReader::damagedEntries()
{
    QFETCH(bool, deflate);
    QFETCH(bool, damage);
    QFETCH(bool, badCrc);
    QFETCH(bool, checksumError);

    Entry bad = ZipTestArchive::file("bad.txt", QByteArray("payload ").repeated(1000), deflate);
    bad.damage = damage;
    bad.badCrc = badCrc;
    ZipReader reader;
    reader.setPath(archiveOf({ZipTestArchive::file("first.txt", "first"), bad,
                              ZipTestArchive::file("last.txt", "last", true)}));
    Recorder recorder(reader);
    QTemporaryDir out;
    QVERIFY(reader.extractAll(out.path()));

    const QStringList events = recorder.eventsFor(QStringLiteral("bad.txt"));
    QVERIFY(!events.isEmpty());
    QVERIFY2(events.last().startsWith(QStringLiteral("error bad.txt ")), qPrintable(events.join(QLatin1Char('\n'))));
    QVERIFY(!events.contains(QStringLiteral("progress bad.txt 100.000")));
    const int code = events.last().section(QLatin1Char(' '), 2).toInt();
    if (checksumError)
        QCOMPARE(code, int(ZipReader::CrcError));
    else
        QVERIFY(code < 0 && code != int(ZipReader::CrcError));
    QCOMPARE(recorder.errorOutputs, QStringList(QDir(out.path()).filePath(QStringLiteral("bad.txt"))));

    // What was written stays, and the walk goes on.
    QVERIFY(QFileInfo::exists(out.filePath(QStringLiteral("bad.txt"))));
    QCOMPARE(ZipTestTree::readAll(out.filePath(QStringLiteral("last.txt"))), QByteArray("last"));
    QCOMPARE(recorder.events.last(), QStringLiteral("completed"));

    // Extracting the one entry gives false too.
    QVERIFY(!reader.extractFile(QStringLiteral("bad.txt"), out.filePath(QStringLiteral("again.txt"))));
}

void tst_ZipReader::damagedInfoZipEntry()
{
    // Info-ZIP stores random bytes as they are; one flipped byte is then
    // found only by the checksum, once the whole entry has been read.
    QByteArray bytes = ZipTestTree::readAll(m_archive);
    const int nameAt = bytes.indexOf("big.bin");
    QVERIFY(nameAt > 30);
    const int extraLength = qFromLittleEndian<quint16>(bytes.constData() + nameAt - 2);
    const int dataAt = nameAt + 7 + extraLength;
    bytes[dataAt + 300000] = char(bytes.at(dataAt + 300000) ^ 0x01);
    const QString damaged = m_dir.filePath(QStringLiteral("damaged.zip"));
    QFile file(damaged);
    QVERIFY(file.open(QIODevice::WriteOnly) && file.write(bytes) == bytes.size());
    file.close();

    ZipReader reader;
    reader.setPath(damaged);
    Recorder recorder(reader);
    QTemporaryDir out;
    QVERIFY(reader.extractAll(out.path()));
    const QStringList events = recorder.eventsFor(QStringLiteral("big.bin"));
    QCOMPARE(events.first(), QStringLiteral("progress big.bin 0.000"));
    QCOMPARE(events.last(), QStringLiteral("error big.bin %1").arg(int(ZipReader::CrcError)));
    QCOMPARE(QFileInfo(out.filePath(QStringLiteral("big.bin"))).size(), qint64(600 * 1024));
    QCOMPARE(ZipTestTree::readAll(out.filePath(QStringLiteral("root.txt"))), QByteArray("root text\n"));
}

void tst_ZipReader::readEntries()
{
    ZipReader reader;
    reader.setPath(m_archive);
    QCOMPARE(reader.readTextFile(QStringLiteral("root.txt")), QStringLiteral("root text\n"));
    QCOMPARE(reader.readTextFile(QStringLiteral("A/DEEP/C/D.TXT")), QStringLiteral("deep ").repeated(200));
    QCOMPARE(reader.readTextFile(QStringLiteral("empty.txt")), QString());

    const QVariantMap json = reader.readJsonFile(QStringLiteral("data.json"));
    QCOMPARE(json.value(QStringLiteral("name")).toString(), QStringLiteral("loom"));
    QCOMPARE(json.value(QStringLiteral("count")).toInt(), 3);
    QCOMPARE(json.value(QStringLiteral("tags")).toList().size(), 2);

    QTest::ignoreMessage(QtCriticalMsg, QRegularExpression(QStringLiteral("readTextFile.*Unable to locate file")));
    QVERIFY(reader.readJsonFile(QStringLiteral("missing.json")).isEmpty());
    QTest::ignoreMessage(QtCriticalMsg, QRegularExpression(QStringLiteral("Unable to locate file")));
    QVERIFY(reader.readTextFile(QStringLiteral("missing.txt")).isNull());
    // Text that is not JSON gives an empty map as well.
    QVERIFY(reader.readJsonFile(QStringLiteral("root.txt")).isEmpty());
}

void tst_ZipReader::publicSamples_data()
{
    QTest::addColumn<QString>("archive");
    QTest::addColumn<QString>("entry");
    QTest::addColumn<QByteArray>("contents");
    QTest::newRow("data descriptor") << "dd.zip" << "filename" << QByteArray("This is a test textfile.\n");
    QTest::newRow("descriptor with signature") << "go-with-datadesc-sig.zip" << "bar.txt" << QByteArray("bar\n");
    QTest::newRow("stored") << "crc32-not-streamed.zip" << "foo.txt" << QByteArray("foo\n");
    QTest::newRow("deflated") << "test.zip" << "test.txt" << QByteArray("This is a test text file.\n");
    QTest::newRow("trailing junk") << "test-trailing-junk.zip" << "gophercolor16x16.png"
                                   << ZipTestTree::readAll(TestSupport::dataPath(QStringLiteral("zip/gophercolor16x16.png")));
    QTest::newRow("UTF-8 flag") << "utf8-7zip.zip" << QStringLiteral("\u4e16\u754c") << QByteArray();
    QTest::newRow("UTF-8 without flag") << "utf8-infozip.zip" << QStringLiteral("\u4e16\u754c") << QByteArray();
    QTest::newRow("unix") << "unix.zip" << "dir/bar" << QByteArray("foo \r\n");
}

void tst_ZipReader::publicSamples()
{
    QFETCH(QString, archive);
    QFETCH(QString, entry);
    QFETCH(QByteArray, contents);

    ZipReader reader;
    reader.setPath(TestSupport::dataPath(QStringLiteral("zip/") + archive));
    QVERIFY(reader.fileNames().contains(entry));
    if (!contents.contains('\0'))
        QCOMPARE(reader.readTextFile(entry).toUtf8(), contents);

    QTemporaryDir out;
    QSignalSpy errors(&reader, &ZipReader::error);
    QVERIFY(reader.extractAll(out.path()));
    QCOMPARE(errors.count(), 0);
    QCOMPARE(ZipTestTree::readAll(QDir(out.path()).filePath(entry)), contents);
}

void tst_ZipReader::zip64Entries()
{
    // Info-ZIP's forced Zip64 form: Debian's minizip does not read the
    // Zip64 extra field (it compares against a 64-bit all-ones marker), so
    // the size stays at the 32-bit marker; the data still comes through.
    QTemporaryDir out;
    int exitCode = -1;
    TestSupport::run(QStringLiteral("zip"), {QStringLiteral("-q"), QStringLiteral("-fz"), out.filePath(QStringLiteral("z64.zip")),
                                             QStringLiteral("root.txt"), QStringLiteral("big.bin")},
                     &exitCode, m_tree);
    QCOMPARE(exitCode, 0);
    ZipReader reader;
    reader.setPath(out.filePath(QStringLiteral("z64.zip")));
    QCOMPARE(reader.readTextFile(QStringLiteral("root.txt")), QStringLiteral("root text\n"));
    QSignalSpy errors(&reader, &ZipReader::error);
    QVERIFY(reader.extractAll(out.filePath(QStringLiteral("x"))));
    QCOMPARE(errors.count(), 0);
    QCOMPARE(ZipTestTree::readAll(out.filePath(QStringLiteral("x/big.bin"))),
             ZipTestTree::contents().value(QStringLiteral("big.bin")));

    // The Go samples mark the compressed size too: the library refuses to
    // open the entry, which is logged, and nothing else breaks.
    for (const QString &sample : {QStringLiteral("zip64.zip"), QStringLiteral("zip64-2.zip")}) {
        reader.setPath(TestSupport::dataPath(QStringLiteral("zip/") + sample));
        QCOMPARE(reader.fileNames(), QStringList(QStringLiteral("README")));
        QSignalSpy completed(&reader, &ZipReader::completed);
        QVERIFY(reader.extractAll(out.filePath(sample)));
        QCOMPARE(completed.count(), 1);
        QVERIFY(!QFileInfo::exists(out.filePath(sample + QStringLiteral("/README"))));
    }
}

void tst_ZipReader::hostileNames_data()
{
    QTest::addColumn<QByteArray>("name");
    QTest::addColumn<QString>("basePath");
    QTest::addColumn<QStringList>("written");
    const QStringList good = {QStringLiteral("after.txt"), QStringLiteral("before.txt")};
    // OUTSIDE stands for the absolute path of a sibling of the output folder.
    QTest::newRow("parent") << QByteArray("../evil.txt") << QString() << good;
    QTest::newRow("sibling with the same prefix") << QByteArray("../out-side/evil.txt") << QString() << good;
    QTest::newRow("climbs after cleaning") << QByteArray("a/../../evil.txt") << QString() << good;
    QTest::newRow("deep climb") << QByteArray("a/b/../../../out-side/evil.txt") << QString() << good;
    QTest::newRow("dot then parent") << QByteArray("./../evil.txt") << QString() << good;
    QTest::newRow("backslashes") << QByteArray("..\\evil.txt") << QString() << good;
    QTest::newRow("mixed separators") << QByteArray("a\\..\\..\\out-side/evil.txt") << QString() << good;
    QTest::newRow("absolute") << QByteArray("OUTSIDE/evil.txt") << QString() << good;
    QTest::newRow("absolute folder") << QByteArray("OUTSIDE/newdir/") << QString() << good;
    QTest::newRow("parent folder") << QByteArray("../newdir/") << QString() << good;
    // A base path strips the climb, so the entry lands inside.
    const QStringList stripped = {QStringLiteral("evil.txt")};
    QTest::newRow("climb below a base path") << QByteArray("a/../../evil.txt") << QStringLiteral("..") << stripped;
    QTest::newRow("base path that climbs") << QByteArray("../out-side/evil.txt") << QStringLiteral("../out-side")
                                           << stripped;
}

void tst_ZipReader::hostileNames()
{
    QFETCH(QByteArray, name);
    QFETCH(QString, basePath);
    QFETCH(QStringList, written);

    QTemporaryDir top;
    const QString outside = top.filePath(QStringLiteral("out-side"));
    const QString out = top.filePath(QStringLiteral("out"));
    QVERIFY(QDir().mkpath(outside));
    QFile canary(QDir(outside).filePath(QStringLiteral("canary.txt")));
    QVERIFY(canary.open(QIODevice::WriteOnly) && canary.write("canary") == 6);
    canary.close();
    name.replace("OUTSIDE", QFile::encodeName(outside));

    ZipReader reader;
    reader.setPath(archiveOf({ZipTestArchive::file("before.txt", "before"), ZipTestArchive::file(name, "evil"),
                              ZipTestArchive::file("after.txt", "after")}));
    Recorder recorder(reader);
    QVERIFY(reader.extractAll(out, basePath));

    QCOMPARE(ZipTestTree::listTree(out), written);
    QCOMPARE(ZipTestTree::listTree(outside), QStringList(QStringLiteral("canary.txt")));
    QCOMPARE(ZipTestTree::listTree(top.path()).size(), written.size() + 3);
    QCOMPARE(ZipTestTree::readAll(canary.fileName()), QByteArray("canary"));
    if (basePath.isEmpty()) {
        const QString shown = QString::fromUtf8(name).replace(QLatin1Char('\\'), QLatin1Char('/'));
        QCOMPARE(recorder.eventsFor(shown),
                 QStringList(QStringLiteral("error %1 %2").arg(shown).arg(int(ZipReader::ParameterError))));
    }
    QCOMPARE(recorder.events.last(), QStringLiteral("completed"));
}

void tst_ZipReader::linksOnDisk_data()
{
    QTest::addColumn<QByteArray>("name");
    QTest::addColumn<bool>("refused");
    QTest::addColumn<QString>("landsAt");
    QTest::newRow("through a folder link that leads out") << QByteArray("link/evil.txt") << true << QString();
    QTest::newRow("below a folder link that leads out") << QByteArray("link/sub/evil.txt") << true << QString();
    QTest::newRow("folder entry through the link") << QByteArray("link/sub/") << true << QString();
    QTest::newRow("onto a file link that leads out") << QByteArray("file-link") << true << QString();
    QTest::newRow("onto a folder link") << QByteArray("link") << true << QString();
    QTest::newRow("through a link that stays inside") << QByteArray("inner-link/ok.txt") << false
                                                      << QStringLiteral("out/real/ok.txt");
}

void tst_ZipReader::linksOnDisk()
{
    QFETCH(QByteArray, name);
    QFETCH(bool, refused);
    QFETCH(QString, landsAt);

    QTemporaryDir top;
    const QString out = top.filePath(QStringLiteral("out"));
    QVERIFY(QDir().mkpath(top.filePath(QStringLiteral("outside"))));
    QVERIFY(QDir().mkpath(top.filePath(QStringLiteral("out/real"))));
    QFile canary(top.filePath(QStringLiteral("outside/canary.txt")));
    QVERIFY(canary.open(QIODevice::WriteOnly) && canary.write("canary") == 6);
    canary.close();
    QVERIFY(QFile::link(QStringLiteral("../outside"), top.filePath(QStringLiteral("out/link"))));
    QVERIFY(QFile::link(QStringLiteral("../outside/canary.txt"), top.filePath(QStringLiteral("out/file-link"))));
    QVERIFY(QFile::link(QStringLiteral("real"), top.filePath(QStringLiteral("out/inner-link"))));
    const QStringList before = ZipTestTree::listTree(top.filePath(QStringLiteral("outside")));

    ZipReader reader;
    reader.setPath(archiveOf({ZipTestArchive::file(name, "evil"), ZipTestArchive::file("after.txt", "after")}));
    Recorder recorder(reader);
    QVERIFY(reader.extractAll(out));

    QCOMPARE(ZipTestTree::listTree(top.filePath(QStringLiteral("outside"))), before);
    QCOMPARE(ZipTestTree::readAll(canary.fileName()), QByteArray("canary"));
    QCOMPARE(ZipTestTree::readAll(QDir(out).filePath(QStringLiteral("after.txt"))), QByteArray("after"));
    const QStringList events = recorder.eventsFor(QString::fromUtf8(name));
    if (refused) {
        QCOMPARE(events, QStringList(QStringLiteral("error %1 %2").arg(QString::fromUtf8(name)).arg(int(ZipReader::ParameterError))));
    } else {
        QCOMPARE(events.last(), QStringLiteral("progress %1 100.000").arg(QString::fromUtf8(name)));
        QCOMPARE(ZipTestTree::readAll(top.filePath(landsAt)), QByteArray("evil"));
    }
}

void tst_ZipReader::linkEntriesStayFiles()
{
    // A link entry becomes a plain file holding the link's text, so no
    // later entry can be written through it.
    QTemporaryDir top;
    const QString out = top.filePath(QStringLiteral("out"));
    ZipReader reader;
    reader.setPath(TestSupport::dataPath(QStringLiteral("zip/symlink.zip")));
    QVERIFY(reader.extractAll(out));
    const QFileInfo link(QDir(out).filePath(QStringLiteral("symlink")));
    QVERIFY(link.isFile() && !link.isSymLink());
    QCOMPARE(ZipTestTree::readAll(link.filePath()), QByteArray("../target"));

    reader.setPath(archiveOf({ZipTestArchive::symlink("up", ".."), ZipTestArchive::file("up/evil.txt", "evil"),
                              ZipTestArchive::symlink("abs", "/"), ZipTestArchive::file("abs/tmp/evil.txt", "evil")}));
    QVERIFY(reader.extractAll(out));
    QCOMPARE(ZipTestTree::listTree(top.path()),
             QStringList({QStringLiteral("out/"), QStringLiteral("out/abs"), QStringLiteral("out/symlink"),
                          QStringLiteral("out/up")}));
    QVERIFY(!QFileInfo(QDir(out).filePath(QStringLiteral("up"))).isSymLink());
}

void tst_ZipReader::longNames_data()
{
    QTest::addColumn<int>("length");
    QTest::addColumn<int>("listed");
    QTest::newRow("one short of the buffer") << 1023 << 1023;
    QTest::newRow("as long as the buffer") << 1024 << 1024;
    QTest::newRow("one longer") << 1025 << 1024;
    QTest::newRow("much longer") << 4000 << 1024;
}

void tst_ZipReader::longNames()
{
    QFETCH(int, length);
    QFETCH(int, listed);

    // Folders of 100 characters, so the path is long but each part is legal.
    QByteArray name;
    while (name.size() < length)
        name.append(QByteArray(99, 'n')).append('/');
    name.truncate(length);
    if (name.endsWith('/'))
        name[name.size() - 1] = 'x';

    ZipReader reader;
    reader.setPath(archiveOf({ZipTestArchive::file(name, "long"), ZipTestArchive::file("short.txt", "short")}));
    const QStringList files = reader.fileNames();
    QCOMPARE(files.size(), 2);
    QCOMPARE(files.first().size(), listed);
    QVERIFY(name.startsWith(files.first().toUtf8()));

    QTemporaryDir out;
    QVERIFY(reader.extractAll(out.path()));
    QCOMPARE(ZipTestTree::readAll(out.filePath(QStringLiteral("short.txt"))), QByteArray("short"));
}

void tst_ZipReader::oversizedClaims_data()
{
    QTest::addColumn<qint64>("declared");
    QTest::addColumn<QString>("expected");
    QTest::newRow("honest") << qint64(5) << QStringLiteral("short");
    QTest::newRow("claims less") << qint64(1) << QStringLiteral("s");
    QTest::newRow("claims 256 MiB") << qint64(256) * 1024 * 1024 << QStringLiteral("short");
    QTest::newRow("claims 1 GiB") << qint64(1) * 1024 * 1024 * 1024 << QStringLiteral("short");
    QTest::newRow("claims 4 GiB less one") << qint64(0xffffffff) << QStringLiteral("short");
}

void tst_ZipReader::oversizedClaims()
{
    QFETCH(qint64, declared);
    QFETCH(QString, expected);

    // Reading stops at the data the entry holds, whatever the header
    // claims, so a few bytes never ask for gigabytes.
    Entry entry = ZipTestArchive::file("claim.txt", "short", true);
    entry.declaredSize = declared;
    ZipReader reader;
    reader.setPath(archiveOf({entry}));
    QCOMPARE(reader.readTextFile(QStringLiteral("claim.txt")), expected);
    QTemporaryDir out;
    QVERIFY(reader.extractAll(out.path()));
    QCOMPARE(QString::fromUtf8(ZipTestTree::readAll(out.filePath(QStringLiteral("claim.txt")))), expected);
}

void tst_ZipReader::fuzzFindings()
{
    // Inputs the fuzzer once found trouble with, run the way it runs them.
    QDir findings(TestSupport::dataPath(QStringLiteral("zip/fuzz")));
    const QStringList files = findings.entryList(QDir::Files);
    QVERIFY(!files.isEmpty());
    for (const QString &file : files) {
        ZipReader reader;
        reader.setPath(findings.filePath(file));
        const QStringList names = reader.fileNames();
        reader.folderNames();
        if (!names.isEmpty()) {
            QVERIFY(reader.readTextFile(names.first()).size() < 4096 * 1100);
        }
        QTemporaryDir out;
        QVERIFY(reader.extractAll(out.filePath(QStringLiteral("x"))));
        QVERIFY(ZipTestTree::listTree(out.path()).size() <= names.size() + 10);
    }
}

QTEST_GUILESS_MAIN(tst_ZipReader)
#include "tst_ZipReader.moc"
