#include "TestSupport.h"
#include "UnZipFile.h"
#include "ZipTestArchive.h"
#include "ZipTestTree.h"

#include <QTemporaryDir>
#include <QtTest>

using ZipTestArchive::Entry;

class tst_UnZipFile : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void notOpen();
    void listAndExtract();
    void hostileNames_data();
    void hostileNames();
    void linksOnDisk();
    void checksum_data();
    void checksum();
    void longName();

private:
    QString archiveOf(const QList<Entry> &entries);

    QTemporaryDir m_dir;
    QString m_tree;
    QString m_archive;
    int m_count = 0;
};

void tst_UnZipFile::initTestCase()
{
    QVERIFY(m_dir.isValid());
    if (!TestSupport::hasProgram(QStringLiteral("zip")))
        QSKIP("Info-ZIP zip is not installed");
    m_tree = m_dir.filePath(QStringLiteral("tree"));
    m_archive = m_dir.filePath(QStringLiteral("tree.zip"));
    QVERIFY(ZipTestTree::writeTree(m_tree));
    QVERIFY(ZipTestTree::zipTree(m_tree, m_archive));
}

QString tst_UnZipFile::archiveOf(const QList<Entry> &entries)
{
    const QString path = m_dir.filePath(QStringLiteral("made-%1.zip").arg(++m_count));
    return ZipTestArchive::write(path, entries) ? path : QString();
}

void tst_UnZipFile::notOpen()
{
    UnZipFile unzip;
    QVERIFY(!unzip.gotoFirstFile());
    QVERIFY(unzip.currentFileName().isNull());
    QVERIFY(!unzip.currentFileDateTime().isValid());
    QVERIFY(!unzip.open(m_dir.filePath(QStringLiteral("missing.zip"))));
    QVERIFY(unzip.fileNames().isEmpty());
    QVERIFY(!unzip.extractCurrentFile(m_dir.filePath(QStringLiteral("x"))));

    // Opening again closes the archive that was open.
    QVERIFY(unzip.open(m_archive));
    QVERIFY(!unzip.open(m_dir.filePath(QStringLiteral("missing.zip"))));
    QVERIFY(!unzip.isOpen());
}

void tst_UnZipFile::listAndExtract()
{
    UnZipFile unzip;
    QVERIFY(unzip.open(m_archive));
    const QStringList names = unzip.fileNames();
    // Names come raw: folder entries and the backslash as they are stored.
    QVERIFY(names.contains(QStringLiteral("a/deep/")));
    QVERIFY(names.contains(QStringLiteral("x\\y.txt")));
    QCOMPARE(names.size(), ZipTestTree::contents().size() + 3);

    QVERIFY(unzip.gotoFirstFile());
    QCOMPARE(unzip.currentFileDateTime(), ZipTestTree::fileTime().addDays(1));

    QTemporaryDir out;
    QDir dir(out.path());
    QVERIFY(unzip.extractAll(dir));
    const auto contents = ZipTestTree::contents();
    for (auto it = contents.constBegin(); it != contents.constEnd(); ++it) {
        const QString path = dir.filePath(it.key());
        QCOMPARE(ZipTestTree::readAll(path), it.value());
        QCOMPARE(QFileInfo(path).lastModified(), ZipTestTree::fileTime().addDays(1));
    }
    QVERIFY(QFileInfo(dir.filePath(QStringLiteral("a/deep/c"))).isDir());

    // Data descriptors and Zip64 records unpack as well.
    for (const QString &sample : {QStringLiteral("dd.zip"), QStringLiteral("unix.zip")}) {
        QVERIFY(unzip.open(TestSupport::dataPath(QStringLiteral("zip/") + sample)));
        QVERIFY(unzip.extractAll(dir));
    }
    QCOMPARE(ZipTestTree::readAll(dir.filePath(QStringLiteral("filename"))), QByteArray("This is a test textfile.\n"));
    QVERIFY(QFileInfo(dir.filePath(QStringLiteral("dir/empty"))).isDir());
}

void tst_UnZipFile::hostileNames_data()
{
    QTest::addColumn<QByteArray>("name");
    QTest::addColumn<QStringList>("written");
    const QStringList good = {QStringLiteral("after.txt"), QStringLiteral("before.txt")};
    QTest::newRow("parent") << QByteArray("../evil.txt") << good;
    QTest::newRow("sibling with the same prefix") << QByteArray("../out-side/evil.txt") << good;
    QTest::newRow("climbs in the middle") << QByteArray("a/../../evil.txt") << good;
    QTest::newRow("absolute") << QByteArray("OUTSIDE/evil.txt") << good;
    QTest::newRow("absolute folder") << QByteArray("OUTSIDE/newdir/") << good;
    QTest::newRow("parent folder") << QByteArray("../newdir/") << good;
    // A backslash is an ordinary character in a raw name on Linux.
    QTest::newRow("backslashes stay one name")
        << QByteArray("..\\evil.txt") << QStringList({QStringLiteral("..\\evil.txt"), QStringLiteral("after.txt"),
                                                      QStringLiteral("before.txt")});
    QTest::newRow("climb that stays inside")
        << QByteArray("a/b/../evil.txt") << QStringList({QStringLiteral("a/"), QStringLiteral("a/evil.txt"),
                                                         QStringLiteral("after.txt"), QStringLiteral("before.txt")});
}

void tst_UnZipFile::hostileNames()
{
    QFETCH(QByteArray, name);
    QFETCH(QStringList, written);

    QTemporaryDir top;
    const QString outside = top.filePath(QStringLiteral("out-side"));
    QVERIFY(QDir().mkpath(outside));
    name.replace("OUTSIDE", QFile::encodeName(outside));

    UnZipFile unzip;
    QVERIFY(unzip.open(archiveOf({ZipTestArchive::file("before.txt", "before"), ZipTestArchive::file(name, "evil"),
                                  ZipTestArchive::file("after.txt", "after")})));
    // The output folder is the caller's to make.
    QDir dir(top.filePath(QStringLiteral("out")));
    QVERIFY(dir.mkpath(dir.path()));
    QVERIFY(unzip.extractAll(dir));
    QStringList sorted = written;
    sorted.sort();
    QCOMPARE(ZipTestTree::listTree(dir.path()), sorted);
    QVERIFY(ZipTestTree::listTree(outside).isEmpty());
    QCOMPARE(ZipTestTree::listTree(top.path()).size(), written.size() + 2);
}

void tst_UnZipFile::linksOnDisk()
{
    QTemporaryDir top;
    QVERIFY(QDir().mkpath(top.filePath(QStringLiteral("outside"))));
    QVERIFY(QDir().mkpath(top.filePath(QStringLiteral("out"))));
    QFile canary(top.filePath(QStringLiteral("outside/canary.txt")));
    QVERIFY(canary.open(QIODevice::WriteOnly) && canary.write("canary") == 6);
    canary.close();
    QVERIFY(QFile::link(QStringLiteral("../outside"), top.filePath(QStringLiteral("out/link"))));
    QVERIFY(QFile::link(QStringLiteral("../outside/canary.txt"), top.filePath(QStringLiteral("out/file-link"))));

    UnZipFile unzip;
    QVERIFY(unzip.open(archiveOf({ZipTestArchive::file("link/evil.txt", "evil"),
                                  ZipTestArchive::file("link/sub/evil.txt", "evil"),
                                  ZipTestArchive::file("file-link", "evil"), ZipTestArchive::symlink("up", ".."),
                                  ZipTestArchive::file("up/evil.txt", "evil"), ZipTestArchive::file("ok.txt", "ok")})));
    QDir dir(top.filePath(QStringLiteral("out")));
    QVERIFY(unzip.extractAll(dir));
    QCOMPARE(ZipTestTree::listTree(top.filePath(QStringLiteral("outside"))), QStringList(QStringLiteral("canary.txt")));
    QCOMPARE(ZipTestTree::readAll(canary.fileName()), QByteArray("canary"));
    QCOMPARE(ZipTestTree::readAll(dir.filePath(QStringLiteral("up"))), QByteArray(".."));
    QVERIFY(!QFileInfo(dir.filePath(QStringLiteral("up"))).isSymLink());
    QCOMPARE(ZipTestTree::readAll(dir.filePath(QStringLiteral("ok.txt"))), QByteArray("ok"));
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

    Entry entry = ZipTestArchive::file("entry.txt", QByteArray("checked ").repeated(5000), deflate);
    entry.badCrc = badCrc;
    UnZipFile unzip;
    QVERIFY(unzip.open(archiveOf({entry})));
    QVERIFY(unzip.gotoFirstFile());
    QTemporaryDir out;
    QCOMPARE(unzip.extractCurrentFile(out.filePath(QStringLiteral("entry.txt"))), !badCrc);
    QCOMPARE(QFileInfo(out.filePath(QStringLiteral("entry.txt"))).size(), qint64(entry.data.size()));
}

void tst_UnZipFile::longName()
{
    const QByteArray name = QByteArray(90, 'n').append('/').repeated(20) + "x";
    UnZipFile unzip;
    QVERIFY(unzip.open(archiveOf({ZipTestArchive::file(name, "long")})));
    const QStringList names = unzip.fileNames();
    QCOMPARE(names.size(), 1);
    QCOMPARE(names.first().toUtf8(), name.left(1024));
}

QTEST_GUILESS_MAIN(tst_UnZipFile)
#include "tst_UnZipFile.moc"
