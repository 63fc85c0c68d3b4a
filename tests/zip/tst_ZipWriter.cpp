#include "ZipFileInfo.h"
#include "ZipReader.h"
#include "ZipTestSupport.h"
#include "ZipWriter.h"

#include <memory>

using namespace ZipTest;

// Info-ZIP's unzip, zipinfo and zipnote judge what ZipWriter writes.
class tst_ZipWriter : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void entryNames_data();
    void entryNames();
    void wholeTree();
    void dates_data();
    void dates();
    void appendAndComments();
    void failures();

private:
    QString source(const QString &name) const { return m_dir.filePath(QStringLiteral("tree/") + name); }
    QString newArchive() { return m_dir.filePath(QStringLiteral("written-%1.zip").arg(++m_count)); }
    QTemporaryDir m_dir;
    int m_count = 0;
};

static QByteArray unzip(const QStringList &arguments, const QString &tool = QStringLiteral("unzip"))
{
    int exitCode = -1;
    const QByteArray out = TestSupport::run(tool, arguments, &exitCode);
    return exitCode == 0 ? out : "failed: " + out;
}

static QStringList zipinfoNames(const QString &archive)
{
    return QString::fromUtf8(unzip({QStringLiteral("-1"), archive}, QStringLiteral("zipinfo"))).split(QLatin1Char('\n'), Qt::SkipEmptyParts);
}

void tst_ZipWriter::initTestCase()
{
    if (!TestSupport::hasProgram(QStringLiteral("zip")) || !TestSupport::hasProgram(QStringLiteral("zipnote")))
        QSKIP("Info-ZIP zip and unzip are not installed");
    QVERIFY(writeAndZipTree(m_dir.filePath(QStringLiteral("tree")), m_dir.filePath(QStringLiteral("tree.zip"))));
}

void tst_ZipWriter::entryNames_data()
{
    QTest::addColumn<QString>("archivedFilePath");
    QTest::addColumn<QString>("entry");
    QTest::newRow("bare name of the source") << QString() << "b.txt";
    QTest::newRow("backslash") << "d\\e.txt" << "d/e.txt";
    QTest::newRow("dots cleaned") << "d/./e/../f.txt" << "d/f.txt";
    QTest::newRow("double slash") << "sub//x.txt" << "sub/x.txt";
    QTest::newRow("leading slash stays") << "/abs/x.txt" << "/abs/x.txt";
    QTest::newRow("leading climb stays") << "../up.txt" << "../up.txt";
    QTest::newRow("non-Latin") << QStringLiteral("\u4e16\u754c/\u00e9t\u00e9.txt") << QStringLiteral("\u4e16\u754c/\u00e9t\u00e9.txt");
}

void tst_ZipWriter::entryNames()
{
    QFETCH(QString, archivedFilePath);
    QFETCH(QString, entry);

    ZipWriter writer;
    writer.setPath(newArchive());
    const QString b = source(QStringLiteral("a/b.txt"));
    QVERIFY(archivedFilePath.isEmpty() ? writer.addFile(b) : writer.addFile(b, archivedFilePath));
    if (entry.at(0).unicode() < 128)
        QCOMPARE(zipinfoNames(writer.path()), QStringList(entry));
    ZipReader reader;
    reader.setPath(writer.path());
    reader.setCaseSensitive(true);
    QCOMPARE(reader.fileNames(), QStringList(entry));
    QCOMPARE(reader.readTextFile(entry), QStringLiteral("a b text\n"));
}

void tst_ZipWriter::wholeTree()
{
    ZipWriter writer;
    writer.setPath(newArchive());
    const auto files = contents();
    for (auto it = files.constBegin(); it != files.constEnd(); ++it)
        QVERIFY(writer.addFile(source(it.key()), it.key()));
    const QByteArray tested = unzip({QStringLiteral("-t"), writer.path()});
    QVERIFY2(tested.contains("No errors detected"), tested.constData());
    QStringList names = files.keys();
    names.replaceInStrings(QStringLiteral("\\"), QStringLiteral("/"));
    QCOMPARE(zipinfoNames(writer.path()), names);
    for (auto it = files.constBegin(); it != files.constEnd(); ++it)
        QCOMPARE(unzip({QStringLiteral("-p"), writer.path(), QString(it.key()).replace(QLatin1Char('\\'), QLatin1Char('/'))}), it.value());
}

void tst_ZipWriter::dates_data()
{
    QTest::addColumn<QDateTime>("modified");
    QTest::addColumn<QString>("zipinfoStamp");
    // The day is stored one early: other tools see the day before, or day 0.
    QTest::newRow("mid-month") << QDateTime(QDate(2021, 3, 14), QTime(10, 20, 30)) << "20210313.102030";
    QTest::newRow("first of a month") << QDateTime(QDate(2022, 7, 1), QTime(23, 59, 58)) << "20220700.235958";
}

void tst_ZipWriter::dates()
{
    QFETCH(QDateTime, modified);
    QFETCH(QString, zipinfoStamp);

    QFile file(m_dir.filePath(QStringLiteral("dated.txt")));
    QVERIFY(writeFile(file.fileName(), "dated") && file.open(QIODevice::ReadWrite));
    QVERIFY(file.setFileTime(modified, QFileDevice::FileModificationTime));
    ZipWriter writer;
    writer.setPath(newArchive());
    QVERIFY(writer.addFile(file.fileName()));
    const QString info = QString::fromUtf8(unzip({QStringLiteral("-T"), writer.path()}, QStringLiteral("zipinfo")));
    QVERIFY2(info.contains(zipinfoStamp + QStringLiteral(" dated.txt")), qPrintable(info));
    // ZipReader adds the day back.
    ZipReader reader;
    reader.setPath(writer.path());
    std::unique_ptr<ZipFileInfo> entry(reader.fileInfo(QStringLiteral("dated.txt")));
    QVERIFY(entry);
    QCOMPARE(entry->lastModified(), modified);
}

void tst_ZipWriter::appendAndComments()
{
    const QString one = source(QStringLiteral("root.txt"));
    ZipWriter writer;
    writer.setPath(newArchive());
    QVERIFY(writer.addFile(one, QStringLiteral("one.txt"), QStringLiteral("a comment for one")));
    QVERIFY(writer.addFile(one, QStringLiteral("two.txt"), QString()));
    QVERIFY(writer.addFile(one, QStringLiteral("one.txt"), QString(), true));
    QCOMPARE(zipinfoNames(writer.path()), QStringList({"one.txt", "two.txt", "one.txt"}));
    QVERIFY(unzip({QStringLiteral("-tq"), writer.path()}).startsWith("No errors"));
    const QByteArray notes = unzip({writer.path()}, QStringLiteral("zipnote"));
    QVERIFY2(notes.startsWith("@ one.txt\na comment for one\n@ (comment above this line)\n@ two.txt\n@ (comment above this line)"),
             notes.constData());
    // Without append the archive starts again.
    QVERIFY(writer.addFile(one, QStringLiteral("only.txt"), QString(), false));
    QCOMPARE(zipinfoNames(writer.path()), QStringList("only.txt"));
}

void tst_ZipWriter::failures()
{
    // Opening comes first, so a failed add leaves an empty archive.
    ZipWriter writer;
    for (const QString &bad : {m_dir.filePath(QStringLiteral("missing.txt")), m_dir.filePath(QStringLiteral("tree"))}) {
        writer.setPath(newArchive());
        QVERIFY(!writer.addFile(bad, QStringLiteral("bad")));
        QCOMPARE(QFileInfo(writer.path()).size(), qint64(22));
    }
    // A folder that doesn't exist: nothing opens, nothing is made.
    writer.setPath(m_dir.filePath(QStringLiteral("no/such/folder/x.zip")));
    QVERIFY(!writer.addFile(source(QStringLiteral("root.txt"))));
    QVERIFY(!QFileInfo::exists(m_dir.filePath(QStringLiteral("no"))));
}

QTEST_GUILESS_MAIN(tst_ZipWriter)
#include "tst_ZipWriter.moc"
