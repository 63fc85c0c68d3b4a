#include "UnZipFile.h"
#include "ZipTestSupport.h"

using namespace ZipTest;

class tst_UnZipFile : public QObject
{
    Q_OBJECT

private slots:
    void listAndExtract();
    void hostile_data() { hostileRows(false); }
    void hostile();
    void checksum_data();
    void checksum();
    void longName();

private:
    QTemporaryDir m_dir;
};

void tst_UnZipFile::listAndExtract()
{
    if (!TestSupport::hasProgram(QStringLiteral("zip")))
        QSKIP("Info-ZIP zip is not installed");
    const QString archive = m_dir.filePath(QStringLiteral("tree.zip"));
    UnZipFile unzip;
    QVERIFY(!unzip.open(archive) && unzip.fileNames().isEmpty());
    QVERIFY(!unzip.extractCurrentFile(archive) && !QFileInfo::exists(archive));
    QVERIFY(writeAndZipTree(m_dir.filePath(QStringLiteral("tree")), archive));
    QVERIFY(unzip.open(archive));
    // Names come raw: folder entries and the backslash as they are stored.
    const QStringList names = unzip.fileNames();
    QVERIFY(names.contains(QStringLiteral("a/deep/")));
    QVERIFY(names.contains(QStringLiteral("x\\y.txt")));
    QCOMPARE(names.size(), contents().size() + 3);
    QVERIFY(unzip.gotoFirstFile());
    QCOMPARE(unzip.currentFileDateTime(), fileTime().addDays(1));

    QTemporaryDir out;
    QDir dir(out.path());
    QVERIFY(unzip.extractAll(dir));
    const auto files = contents();
    for (auto it = files.constBegin(); it != files.constEnd(); ++it) {
        QCOMPARE(readAll(dir.filePath(it.key())), it.value());
        QCOMPARE(QFileInfo(dir.filePath(it.key())).lastModified(), fileTime().addDays(1));
    }

    // Data descriptors, and folder entries with nothing in them.
    for (const QString &sample : {QStringLiteral("dd.zip"), QStringLiteral("unix.zip")}) {
        QVERIFY(unzip.open(TestSupport::dataPath(QStringLiteral("zip/") + sample)));
        QVERIFY(unzip.extractAll(dir));
    }
    QCOMPARE(readAll(dir.filePath(QStringLiteral("filename"))), QByteArray("This is a test textfile.\n"));
    QVERIFY(QFileInfo(dir.filePath(QStringLiteral("dir/empty"))).isDir());
}

void tst_UnZipFile::hostile()
{
    QFETCH(QByteArrayList, names);
    QFETCH(QStringList, written);

    Sandbox box;
    UnZipFile unzip;
    QVERIFY(unzip.open(box.archive(names)));
    QDir dir(box.out);
    QVERIFY(unzip.extractAll(dir));
    QVERIFY(box.outsideUntouched());
    QCOMPARE(box.added(), sorted(written + QStringList({"after.txt", "before.txt"})));
}

void tst_UnZipFile::checksum_data()
{
    QTest::addColumn<bool>("badCrc");
    QTest::addColumn<bool>("deflate");
    QTest::newRow("stored, good") << false << false;
    QTest::newRow("stored, bad") << true << false;
    QTest::newRow("deflated, good") << false << true;
    QTest::newRow("deflated, bad") << true << true;
}

void tst_UnZipFile::checksum()
{
    QFETCH(bool, badCrc);
    QFETCH(bool, deflate);

    Entry entry = file("entry.txt", QByteArray("checked ").repeated(5000), deflate);
    entry.badCrc = badCrc;
    const QString archive = m_dir.filePath(QStringLiteral("checksum.zip"));
    QVERIFY(write(archive, {entry}));
    UnZipFile unzip;
    QVERIFY(unzip.open(archive));
    QVERIFY(unzip.gotoFirstFile());
    QTemporaryDir out;
    QCOMPARE(unzip.extractCurrentFile(out.filePath(QStringLiteral("entry.txt"))), !badCrc);
    QCOMPARE(readAll(out.filePath(QStringLiteral("entry.txt"))), entry.data);
}

void tst_UnZipFile::longName()
{
    const QByteArray name = QByteArray(90, 'n').append('/').repeated(20) + "x";
    const QString archive = m_dir.filePath(QStringLiteral("long.zip"));
    QVERIFY(write(archive, {file(name, "long")}));
    UnZipFile unzip;
    QVERIFY(unzip.open(archive));
    QCOMPARE(unzip.fileNames(), QStringList(QString::fromUtf8(name.left(1024))));
}

QTEST_GUILESS_MAIN(tst_UnZipFile)
#include "tst_UnZipFile.moc"
