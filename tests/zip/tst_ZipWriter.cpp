#include "TestSupport.h"
#include "ZipFileInfo.h"
#include "ZipReader.h"
#include "ZipTestTree.h"
#include "ZipWriter.h"

#include <QRegularExpression>
#include <QSignalSpy>
#include <QTemporaryDir>
#include <QtTest>

#include <memory>

class tst_ZipWriter : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void entryNames_data();
    void entryNames();
    void wholeTreeThroughInfoZip();
    void dates_data();
    void dates();
    void appendModes();
    void comments();
    void failures();
    void pathResolution();

private:
    QStringList zipinfoNames(const QString &archive);
    QString newArchive();

    QTemporaryDir m_dir;
    QString m_tree;
    int m_count = 0;
};

void tst_ZipWriter::initTestCase()
{
    QVERIFY(m_dir.isValid());
    if (!TestSupport::hasProgram(QStringLiteral("zipinfo")) || !TestSupport::hasProgram(QStringLiteral("unzip")))
        QSKIP("Info-ZIP unzip and zipinfo are not installed");
    m_tree = m_dir.filePath(QStringLiteral("tree"));
    QVERIFY(ZipTestTree::writeTree(m_tree));
}

QString tst_ZipWriter::newArchive()
{
    return m_dir.filePath(QStringLiteral("written-%1.zip").arg(++m_count));
}

QStringList tst_ZipWriter::zipinfoNames(const QString &archive)
{
    int exitCode = -1;
    const QByteArray out = TestSupport::run(QStringLiteral("zipinfo"), {QStringLiteral("-1"), archive}, &exitCode);
    if (exitCode != 0)
        return {QStringLiteral("zipinfo failed")};
    return QString::fromUtf8(out).split(QLatin1Char('\n'), Qt::SkipEmptyParts);
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
    const QString source = QDir(m_tree).filePath(QStringLiteral("a/b.txt"));
    QVERIFY(archivedFilePath.isEmpty() ? writer.addFile(source) : writer.addFile(source, archivedFilePath));

    ZipReader reader;
    reader.setPath(writer.path());
    QCOMPARE(reader.fileNames(), QStringList(entry));
    if (entry.at(0).unicode() < 128)
        QCOMPARE(zipinfoNames(writer.path()), QStringList(entry));
    reader.setCaseSensitive(true);
    QCOMPARE(reader.readTextFile(entry), QStringLiteral("a b text\n"));
}

void tst_ZipWriter::wholeTreeThroughInfoZip()
{
    ZipWriter writer;
    writer.setPath(newArchive());
    QSignalSpy pathChanged(&writer, &ZipWriter::pathChanged);
    const auto contents = ZipTestTree::contents();
    for (auto it = contents.constBegin(); it != contents.constEnd(); ++it)
        QVERIFY(writer.addFile(QDir(m_tree).filePath(it.key()), it.key()));
    QCOMPARE(pathChanged.count(), contents.size());

    int exitCode = -1;
    const QByteArray tested = TestSupport::run(QStringLiteral("unzip"), {QStringLiteral("-t"), writer.path()}, &exitCode);
    QVERIFY2(exitCode == 0, tested.constData());
    QVERIFY(tested.contains("No errors detected"));

    QStringList expected = contents.keys();
    expected.replaceInStrings(QStringLiteral("\\"), QStringLiteral("/"));
    QCOMPARE(zipinfoNames(writer.path()), expected);

    for (auto it = contents.constBegin(); it != contents.constEnd(); ++it) {
        const QString name = QString(it.key()).replace(QLatin1Char('\\'), QLatin1Char('/'));
        QCOMPARE(TestSupport::run(QStringLiteral("unzip"), {QStringLiteral("-p"), writer.path(), name}), it.value());
    }

    // Info-ZIP extracts what we wrote to the same bytes.
    QTemporaryDir out;
    TestSupport::run(QStringLiteral("unzip"), {QStringLiteral("-q"), writer.path(), QStringLiteral("-d"), out.path()},
                     &exitCode);
    QCOMPARE(exitCode, 0);
    QCOMPARE(ZipTestTree::readAll(out.filePath(QStringLiteral("big.bin"))), contents.value(QStringLiteral("big.bin")));
}

void tst_ZipWriter::dates_data()
{
    QTest::addColumn<QDateTime>("modified");
    QTest::addColumn<QString>("zipinfoStamp");
    // The day is stored one early: other tools see the day before, or day 0.
    QTest::newRow("mid-month") << QDateTime(QDate(2021, 3, 14), QTime(10, 20, 30)) << "20210313.102030";
    QTest::newRow("first of a month") << QDateTime(QDate(2022, 7, 1), QTime(23, 59, 58)) << "20220700.235958";
    QTest::newRow("new year's day") << QDateTime(QDate(2020, 1, 1), QTime(0, 0, 0)) << "20200100.000000";
}

void tst_ZipWriter::dates()
{
    QFETCH(QDateTime, modified);
    QFETCH(QString, zipinfoStamp);

    const QString source = m_dir.filePath(QStringLiteral("dated-%1.txt").arg(m_count));
    QFile file(source);
    QVERIFY(file.open(QIODevice::WriteOnly) && file.write("dated") == 5 && file.flush());
    QVERIFY(file.setFileTime(modified, QFileDevice::FileModificationTime));
    file.close();

    ZipWriter writer;
    writer.setPath(newArchive());
    QVERIFY(writer.addFile(source, QStringLiteral("dated.txt")));

    const QString info = QString::fromUtf8(TestSupport::run(QStringLiteral("zipinfo"), {QStringLiteral("-T"), writer.path()}));
    QVERIFY2(info.contains(zipinfoStamp + QStringLiteral(" dated.txt")), qPrintable(info));

    // ZipReader adds the day back.
    ZipReader reader;
    reader.setPath(writer.path());
    std::unique_ptr<ZipFileInfo> entry(reader.fileInfo(QStringLiteral("dated.txt")));
    QVERIFY(entry);
    QCOMPARE(entry->lastModified(), modified);
}

void tst_ZipWriter::appendModes()
{
    const QString one = QDir(m_tree).filePath(QStringLiteral("root.txt"));
    const QString two = QDir(m_tree).filePath(QStringLiteral("a/b.txt"));
    ZipWriter writer;
    writer.setPath(newArchive());
    QVERIFY(writer.addFile(one, QStringLiteral("one.txt")));
    QVERIFY(writer.addFile(two, QStringLiteral("two.txt"), QString()));
    QVERIFY(writer.addFile(two, QStringLiteral("one.txt"), QString(), true));
    QCOMPARE(zipinfoNames(writer.path()),
             QStringList({QStringLiteral("one.txt"), QStringLiteral("two.txt"), QStringLiteral("one.txt")}));
    int exitCode = -1;
    TestSupport::run(QStringLiteral("unzip"), {QStringLiteral("-tq"), writer.path()}, &exitCode);
    QCOMPARE(exitCode, 0);

    // Without append the archive starts again.
    QVERIFY(writer.addFile(two, QStringLiteral("only.txt"), QString(), false));
    QCOMPARE(zipinfoNames(writer.path()), QStringList(QStringLiteral("only.txt")));
    QVERIFY(writer.addFile(one, QStringLiteral("second.txt"), QString(), false));
    QCOMPARE(zipinfoNames(writer.path()), QStringList(QStringLiteral("second.txt")));
}

void tst_ZipWriter::comments()
{
    ZipWriter writer;
    writer.setPath(newArchive());
    QVERIFY(writer.addFile(QDir(m_tree).filePath(QStringLiteral("root.txt")), QStringLiteral("c.txt"),
                           QStringLiteral("a comment for c")));
    QVERIFY(writer.addFile(QDir(m_tree).filePath(QStringLiteral("root.txt")), QStringLiteral("d.txt")));
    const QByteArray notes = TestSupport::run(QStringLiteral("zipnote"), {writer.path()});
    QVERIFY2(notes.contains("@ c.txt\na comment for c\n@ (comment above this line)\n@ d.txt\n@ (comment above this line)"),
             notes.constData());
}

void tst_ZipWriter::failures()
{
    ZipWriter writer;
    QSignalSpy pathChanged(&writer, &ZipWriter::pathChanged);
    const QString archive = newArchive();
    writer.setPath(archive);
    QCOMPARE(pathChanged.count(), 1);

    // Opening comes first, so even a failed add leaves an empty archive.
    QTest::ignoreMessage(QtCriticalMsg, QRegularExpression(QStringLiteral("File not found: \".*missing.txt\"")));
    QVERIFY(!writer.addFile(m_dir.filePath(QStringLiteral("missing.txt"))));
    QCOMPARE(pathChanged.count(), 1);
    QCOMPARE(QFileInfo(archive).size(), qint64(22));
    int exitCode = -1;
    TestSupport::run(QStringLiteral("zipinfo"), {archive}, &exitCode);
    QVERIFY(exitCode == 0 || exitCode == 1); // zipinfo calls an empty archive a warning

    // A folder that doesn't exist: nothing opens, nothing is made.
    const QString nowhere = m_dir.filePath(QStringLiteral("no/such/folder/x.zip"));
    writer.setPath(nowhere);
    QVERIFY(!writer.addFile(QDir(m_tree).filePath(QStringLiteral("root.txt"))));
    QVERIFY(!QFileInfo::exists(m_dir.filePath(QStringLiteral("no"))));

    // A source that can't be read as a file.
    writer.setPath(archive);
    QTest::ignoreMessage(QtCriticalMsg, QRegularExpression(QStringLiteral("Error opening: ")));
    QVERIFY(!writer.addFile(m_tree, QStringLiteral("folder")));
    ZipReader reader;
    reader.setPath(archive);
    QVERIFY(!reader.fileNames().contains(QStringLiteral("folder")));
}

void tst_ZipWriter::pathResolution()
{
    ZipWriter writer;
    QSignalSpy pathChanged(&writer, &ZipWriter::pathChanged);
    qputenv("LOOMKIT_ZIP_TEST_DIR", QFile::encodeName(m_dir.path()));
    writer.setPath(QStringLiteral("$LOOMKIT_ZIP_TEST_DIR/resolved.zip"));
    QCOMPARE(writer.path(), m_dir.filePath(QStringLiteral("resolved.zip")));
    writer.setPath(m_dir.filePath(QStringLiteral("resolved.zip")));
    QCOMPARE(pathChanged.count(), 1);
    QVERIFY(writer.addFile(QDir(m_tree).filePath(QStringLiteral("root.txt"))));
    QVERIFY(QFileInfo::exists(m_dir.filePath(QStringLiteral("resolved.zip"))));
}

QTEST_GUILESS_MAIN(tst_ZipWriter)
#include "tst_ZipWriter.moc"
