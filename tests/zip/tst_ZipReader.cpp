#include "ZipEntryStream.h"
#include "ZipFileInfo.h"
#include "ZipReader.h"
#include "ZipTestSupport.h"

#include <memory>

using namespace ZipTest;

// The reader's signals as text, in the order they come.
struct Recorder
{
    explicit Recorder(ZipReader &reader)
    {
        QObject::connect(&reader, &ZipReader::progress, [this](const QString &name, const QString &, double percent) {
            events << QStringLiteral("progress %1 %2").arg(name).arg(percent, 0, 'f', 3);
        });
        QObject::connect(&reader, &ZipReader::error, [this](const QString &name, const QString &output, ZipReader::Result result) {
            events << QStringLiteral("error %1 %2").arg(name).arg(int(result));
            outputs << output;
        });
        QObject::connect(&reader, &ZipReader::completed, [this] { events << QStringLiteral("completed"); });
    }
    QStringList eventsFor(const QString &name) const
    {
        return events.filter(QRegularExpression(QStringLiteral("^\\w+ %1 [^ ]+$").arg(QRegularExpression::escape(name))));
    }
    QStringList events, outputs;
};

class tst_ZipReader : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void listing();
    void lookups_data();
    void lookups();
    void extractAll_data();
    void extractAll();
    void damaged_data();
    void damaged();
    void samples_data();
    void samples();
    void hostile_data();
    void hostile();
    void oddHeaders_data();
    void oddHeaders();
    void fuzzFindings();

private:
    QTemporaryDir m_dir;
    QString m_archive;
};

void tst_ZipReader::initTestCase()
{
    if (!TestSupport::hasProgram(QStringLiteral("zip")))
        QSKIP("Info-ZIP zip is not installed");
    m_archive = m_dir.filePath(QStringLiteral("tree.zip"));
    QVERIFY(writeAndZipTree(m_dir.filePath(QStringLiteral("tree")), m_archive));
    // Info-ZIP's forced Zip64 form, which reads like any other archive.
    int exitCode = -1;
    TestSupport::run(QStringLiteral("zip"), {QStringLiteral("-qfz"), m_dir.filePath(QStringLiteral("z64.zip")),
                                             QStringLiteral("root.txt"), QStringLiteral("big.bin")},
                     &exitCode, m_dir.filePath(QStringLiteral("tree")));
    QCOMPARE(exitCode, 0);
}

void tst_ZipReader::listing()
{
    ZipReader reader;
    reader.setPath(m_archive);
    QVERIFY(!reader.isOpen()); // opens on first use
    QStringList files = reader.fileNames();
    QVERIFY(reader.isOpen());
    files.sort();
    QStringList expected = contents().keys();
    expected.replaceInStrings(QStringLiteral("\\"), QStringLiteral("/"));
    QCOMPARE(files, expected);
    QStringList folders = reader.folderNames();
    folders.sort();
    QCOMPARE(folders, QStringList({".", "a", "a/deep", "a/deep/c", "x"}));
    QCOMPARE(reader.readJsonFile(QStringLiteral("data.json")).value(QStringLiteral("count")).toInt(), 3);
    QVERIFY(reader.readJsonFile(QStringLiteral("root.txt")).isEmpty());

    // Folder entries are folders, not files; folder names fold case unless told not to.
    QVERIFY(write(m_dir.filePath(QStringLiteral("case.zip")), {file("Docs/", ""), file("Docs/one.txt", "1"), file("docs/two.txt", "2")}));
    reader.setPath(m_dir.filePath(QStringLiteral("case.zip")));
    QCOMPARE(reader.fileNames(), QStringList({"Docs/one.txt", "docs/two.txt"}));
    QCOMPARE(reader.folderNames(), QStringList("Docs"));
    reader.setCaseSensitive(true);
    QCOMPARE(reader.folderNames(), QStringList({"Docs", "docs"}));
}

void tst_ZipReader::lookups_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<bool>("caseSensitive");
    QTest::addColumn<bool>("found");
    QTest::newRow("exact") << "a/deep/c/d.txt" << true << true;
    QTest::newRow("other case, insensitive") << "A/DEEP/C/D.TXT" << false << true;
    QTest::newRow("other case, sensitive") << "A/B.TXT" << true << false;
    QTest::newRow("folder entry") << "a/deep/" << false << true;
    QTest::newRow("stored") << "plain.raw" << false << true;
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
    Recorder recorder(reader);
    QCOMPARE(reader.exists(name), found);
    std::unique_ptr<ZipFileInfo> info(reader.fileInfo(name));
    QCOMPARE(bool(info), found);
    QCOMPARE(reader.readTextFile(name).isNull(), !found);
    // extractFile makes no folder, and its failures are no error signals.
    QTemporaryDir out;
    QVERIFY(!reader.extractFile(name, out.filePath(QStringLiteral("missing/copy"))));
    QVERIFY(!QFileInfo::exists(out.filePath(QStringLiteral("missing"))) && recorder.events.isEmpty());
    if (!found || name.endsWith(QLatin1Char('/')))
        return;
    const QByteArray data = contents().value(name.toLower());
    QCOMPARE(reader.readTextFile(name).toUtf8(), data);
    QVERIFY(reader.extractFile(name, out.filePath(QStringLiteral("copy"))));
    QCOMPARE(readAll(out.filePath(QStringLiteral("copy"))), data);
    QCOMPARE(info->size(), qlonglong(data.size()));
    QCOMPARE(info->crc(), ulong(crc32(0, reinterpret_cast<const Bytef *>(data.constData()), uInt(data.size()))));
    QCOMPARE(info->compressedSize() < info->size(), data.size() > 100); // Info-ZIP stores what won't shrink
    // Info-ZIP stores the true day; the reader's rule gives one day more.
    QCOMPARE(info->lastModified(), fileTime().addDays(1));
}

void tst_ZipReader::extractAll_data()
{
    QTest::addColumn<QString>("basePath");
    QTest::addColumn<bool>("caseSensitive");
    QTest::addColumn<QStringList>("expected");
    const QStringList subtree = {"b.txt", "deep/", "deep/c/", "deep/c/d.txt"};
    QTest::newRow("everything") << QString() << false
                                << QStringList({"a/", "a/b.txt", "a/deep/", "a/deep/c/", "a/deep/c/d.txt", "big.bin",
                                                "data.json", "empty.txt", "plain.raw", "root.txt", "x/", "x/y.txt"});
    QTest::newRow("a") << "a" << false << subtree;
    QTest::newRow("./a//") << "./a//" << false << subtree;
    QTest::newRow("A, insensitive") << "A" << false << subtree;
    QTest::newRow("A, sensitive") << "A" << true << QStringList();
    QTest::newRow("a/deep") << "a/deep" << false << QStringList({"c/", "c/d.txt"});
    QTest::newRow("missing") << "zzz" << false << QStringList();
}

void tst_ZipReader::extractAll()
{
    QFETCH(QString, basePath);
    QFETCH(bool, caseSensitive);
    QFETCH(QStringList, expected);

    ZipReader reader;
    reader.setPath(m_archive);
    reader.setCaseSensitive(caseSensitive);
    Recorder recorder(reader);
    QTemporaryDir out;
    const QDir target(out.filePath(QStringLiteral("new/folder")));
    QVERIFY(reader.extractAll(target.path(), basePath));
    QCOMPARE(listTree(target.path()), expected);
    QCOMPARE(recorder.events.count(QStringLiteral("completed")), 1);
    QCOMPARE(recorder.events.last(), QStringLiteral("completed"));
    QVERIFY(recorder.outputs.isEmpty());
    if (!basePath.isEmpty())
        return;
    const auto files = contents();
    for (auto it = files.constBegin(); it != files.constEnd(); ++it) {
        const QString path = target.filePath(QString(it.key()).replace(QLatin1Char('\\'), QLatin1Char('/')));
        QCOMPARE(readAll(path), it.value());
        QCOMPARE(QFileInfo(path).lastModified(), fileTime().addDays(1));
    }
    // Progress runs one chunk behind and ends at 100; an empty entry has the one report.
    QStringList big;
    for (int done = 0; done < 600 * 1024; done += ZipEntryStream::ChunkSize)
        big << QStringLiteral("progress big.bin %1").arg(done / 6144.0, 0, 'f', 3);
    QCOMPARE(recorder.eventsFor(QStringLiteral("big.bin")), big << QStringLiteral("progress big.bin 100.000"));
    QCOMPARE(recorder.eventsFor(QStringLiteral("empty.txt")), QStringList("progress empty.txt 100.000"));
}

void tst_ZipReader::damaged_data()
{
    QTest::addColumn<bool>("deflate");
    QTest::addColumn<bool>("damage");
    QTest::addColumn<bool>("badCrc");
    QTest::newRow("garbled deflate data") << true << true << false;
    QTest::newRow("deflated, wrong checksum") << true << false << true;
    // Info-ZIP stores random bytes as they are: one flipped byte shows only
    // in the checksum, once the whole entry has been read.
    QTest::newRow("Info-ZIP, one flipped byte") << false << true << true;
}

void tst_ZipReader::damaged()
{
    QFETCH(bool, deflate);
    QFETCH(bool, damage);
    QFETCH(bool, badCrc);

    const bool infoZip = damage && badCrc;
    const QString bad = infoZip ? QStringLiteral("big.bin") : QStringLiteral("bad.txt");
    const QString good = infoZip ? QStringLiteral("root.txt") : QStringLiteral("last.txt");
    const QString archive = m_dir.filePath(QStringLiteral("damaged.zip"));
    if (infoZip) {
        QByteArray bytes = readAll(m_archive);
        const int nameAt = bytes.indexOf("big.bin");
        QVERIFY(nameAt > 30);
        const int at = nameAt + 7 + qFromLittleEndian<quint16>(bytes.constData() + nameAt - 2) + 300000;
        bytes[at] = char(bytes.at(at) ^ 0x01);
        QVERIFY(writeFile(archive, bytes));
    } else {
        Entry entry = file("bad.txt", QByteArray("payload ").repeated(1000), deflate);
        entry.damage = damage;
        entry.badCrc = badCrc;
        QVERIFY(write(archive, {file("first.txt", "first"), entry, file("last.txt", "last", true)}));
    }

    ZipReader reader;
    reader.setPath(archive);
    Recorder recorder(reader);
    QTemporaryDir out;
    QVERIFY(reader.extractAll(out.path()));
    const QStringList events = recorder.eventsFor(bad);
    QVERIFY2(!events.isEmpty() && events.last().startsWith(QStringLiteral("error ")), qPrintable(events.join(QLatin1Char('\n'))));
    QVERIFY(!events.contains(QStringLiteral("progress %1 100.000").arg(bad)));
    const int code = events.last().section(QLatin1Char(' '), 2).toInt();
    if (badCrc)
        QCOMPARE(code, int(ZipReader::CrcError));
    else
        QVERIFY(code < 0 && code != int(ZipReader::CrcError));
    QCOMPARE(recorder.outputs, QStringList(out.filePath(bad)));
    // What was written stays, and the walk goes on.
    QVERIFY(QFileInfo::exists(out.filePath(bad)));
    QCOMPARE(readAll(out.filePath(good)), contents().value(good, "last"));
    QCOMPARE(recorder.events.last(), QStringLiteral("completed"));
    QVERIFY(!reader.extractFile(bad, out.filePath(QStringLiteral("again"))));
}

void tst_ZipReader::samples_data()
{
    QTest::addColumn<QString>("archive");
    QTest::addColumn<QString>("entry");
    QTest::addColumn<QByteArray>("data"); // null: the entry cannot be read
    QTest::newRow("not a zip") << "README.md" << QString() << QByteArray();
    QTest::newRow("missing") << "missing.zip" << QString() << QByteArray();
    QTest::newRow("data descriptor") << "dd.zip" << "filename" << QByteArray("This is a test textfile.\n");
    QTest::newRow("descriptor with signature") << "go-with-datadesc-sig.zip" << "bar.txt" << QByteArray("bar\n");
    QTest::newRow("stored") << "crc32-not-streamed.zip" << "foo.txt" << QByteArray("foo\n");
    QTest::newRow("deflated") << "test.zip" << "test.txt" << QByteArray("This is a test text file.\n");
    QTest::newRow("trailing junk") << "test-trailing-junk.zip" << "gophercolor16x16.png"
                                   << readAll(TestSupport::dataPath(QStringLiteral("zip/gophercolor16x16.png")));
    QTest::newRow("UTF-8 flag") << "utf8-7zip.zip" << QStringLiteral("\u4e16\u754c") << QByteArray("");
    QTest::newRow("UTF-8 without flag") << "utf8-infozip.zip" << QStringLiteral("\u4e16\u754c") << QByteArray("");
    // A link entry becomes a plain file holding the link's text.
    QTest::newRow("link that climbs") << "symlink.zip" << "symlink" << QByteArray("../target");
    QTest::newRow("Info-ZIP Zip64") << "z64.zip" << "big.bin" << contents().value(QStringLiteral("big.bin"));
    // These mark the compressed size as Zip64 too, which the library refuses.
    QTest::newRow("Zip64, refused") << "zip64.zip" << "README" << QByteArray();
    QTest::newRow("Zip64 again, refused") << "zip64-2.zip" << "README" << QByteArray();
}

void tst_ZipReader::samples()
{
    QFETCH(QString, archive);
    QFETCH(QString, entry);
    QFETCH(QByteArray, data);

    ZipReader reader;
    reader.setPath(QFileInfo::exists(m_dir.filePath(archive)) ? m_dir.filePath(archive)
                                                               : TestSupport::dataPath(QStringLiteral("zip/") + archive));
    Recorder recorder(reader);
    QTemporaryDir out;
    const QDir target(out.filePath(QStringLiteral("x")));
    QCOMPARE(reader.extractAll(target.path()), !entry.isNull());
    QCOMPARE(QFileInfo::exists(target.path()), !entry.isNull());
    if (entry.isNull()) {
        QVERIFY(reader.fileNames().isEmpty() && recorder.events.isEmpty() && !reader.isOpen());
        return;
    }
    QVERIFY(reader.fileNames().contains(entry));
    QCOMPARE(recorder.events.last(), QStringLiteral("completed"));
    QCOMPARE(readAll(target.filePath(entry)), data.isNull() ? QByteArray("<unreadable>") : data);
    QVERIFY(data.isNull() || recorder.outputs.isEmpty());
}

void tst_ZipReader::hostile_data()
{
    hostileRows(true);
    // A base path strips the climb, so the entry lands inside; nothing else is below it.
    QTest::newRow("climb below a base path") << QByteArrayList{"a/../../evil.txt"} << ".." << QStringList("evil.txt");
    QTest::newRow("base path that climbs") << QByteArrayList{"../out-side/evil.txt"} << "../out-side"
                                           << QStringList("evil.txt");
}

void tst_ZipReader::hostile()
{
    QFETCH(QByteArrayList, names);
    QFETCH(QString, basePath);
    QFETCH(QStringList, written);

    Sandbox box;
    ZipReader reader;
    reader.setPath(box.archive(names));
    Recorder recorder(reader);
    QVERIFY(reader.extractAll(box.out, basePath));
    QVERIFY(box.outsideUntouched());
    QCOMPARE(box.added(), sorted(written + (basePath.isEmpty() ? QStringList({"after.txt", "before.txt"}) : QStringList())));
    QCOMPARE(recorder.events.last(), QStringLiteral("completed"));
    for (QByteArray name : names) {
        const QString shown = QString::fromUtf8(name.replace("OUTSIDE", QFile::encodeName(box.outside))).replace(QLatin1Char('\\'), QLatin1Char('/'));
        if (written.isEmpty())
            QCOMPARE(recorder.eventsFor(shown), QStringList(QStringLiteral("error %1 %2").arg(shown).arg(int(ZipReader::ParameterError))));
    }
}

void tst_ZipReader::oddHeaders_data()
{
    QTest::addColumn<Entry>("entry");
    QTest::addColumn<QString>("text");         // null: not read, the name is too long to find
    QTest::addColumn<QDateTime>("modified");   // null: not checked
    // Parts of 100 characters: the path is long but each part is legal.
    const QByteArray parts = QByteArray(99, 'n').append('/').repeated(40);
    QTest::newRow("name as long as the buffer") << file(parts.left(1023) + "x", "short") << QString() << QDateTime();
    QTest::newRow("name one longer") << file(parts.left(1024) + "x", "short") << QString() << QDateTime();
    QTest::newRow("name much longer") << file(parts.left(3999) + "x", "short") << QString() << QDateTime();
    // Reading stops at the data the entry holds, whatever the header claims.
    const auto claim = [](qint64 size) { Entry entry = file("claim.txt", "short", true); entry.declaredSize = size; return entry; };
    QTest::newRow("claims less") << claim(1) << "s" << QDateTime();
    QTest::newRow("claims 256 MiB") << claim(qint64(256) << 20) << "short" << QDateTime();
    QTest::newRow("claims 4 GiB less one") << claim(0xffffffff) << "short" << QDateTime();
    // The reader's day is the stored day plus one, in the same month.
    const auto dated = [](int year, int month, int day) {
        Entry entry = file("dated.txt", "short");
        entry.dosDate = quint16(((year - 1980) << 9) | (month << 5) | day);
        return entry;
    };
    QTest::newRow("mid-month") << dated(2021, 3, 14) << "short" << QDateTime(QDate(2021, 3, 15), QTime(10, 0));
    QTest::newRow("day 0, as ZipWriter stores the 1st") << dated(2021, 4, 0) << "short" << QDateTime(QDate(2021, 4, 1), QTime(10, 0));
    QTest::newRow("end of February, leap year") << dated(2020, 2, 28) << "short" << QDateTime(QDate(2020, 2, 29), QTime(10, 0));
    QTest::newRow("last day of a 31-day month") << dated(2021, 3, 31) << "short" << QDateTime(QDate(), QTime(10, 0));
}

void tst_ZipReader::oddHeaders()
{
    QFETCH(Entry, entry);
    QFETCH(QString, text);
    QFETCH(QDateTime, modified);

    const QString archive = m_dir.filePath(QStringLiteral("odd.zip"));
    QVERIFY(write(archive, {entry, file("after.txt", "after")}));
    ZipReader reader;
    reader.setPath(archive);
    const QString name = QString::fromUtf8(entry.name.left(1024));
    QCOMPARE(reader.fileNames(), QStringList({name, "after.txt"}));
    QTemporaryDir out;
    QVERIFY(reader.extractAll(out.path()));
    QCOMPARE(readAll(out.filePath(QStringLiteral("after.txt"))), QByteArray("after"));
    if (text.isNull())
        return;
    QCOMPARE(reader.readTextFile(name), text);
    QCOMPARE(QString::fromUtf8(readAll(out.filePath(name))), text);
    if (modified.isNull())
        return;
    std::unique_ptr<ZipFileInfo> info(reader.fileInfo(name));
    QCOMPARE(info->lastModified().date(), modified.date());
    QVERIFY(!modified.date().isValid() || info->lastModified() == modified);
}

void tst_ZipReader::fuzzFindings()
{
    // Inputs the fuzzer once found trouble with, run the way it runs them.
    const QDir findings(TestSupport::dataPath(QStringLiteral("zip/fuzz")));
    const QStringList files = findings.entryList(QDir::Files);
    QVERIFY(!files.isEmpty());
    for (const QString &file : files) {
        ZipReader reader;
        reader.setPath(findings.filePath(file));
        const QStringList names = reader.fileNames();
        reader.folderNames();
        if (!names.isEmpty())
            QVERIFY(reader.readTextFile(names.first()).size() < 4096 * 1100);
        QTemporaryDir out;
        QVERIFY(reader.extractAll(out.filePath(QStringLiteral("x"))));
        QVERIFY(listTree(out.path()).size() <= names.size() + 10);
    }
}

QTEST_GUILESS_MAIN(tst_ZipReader)
#include "tst_ZipReader.moc"
