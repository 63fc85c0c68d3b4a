#include "StandardPaths.h"
#include "TestSupport.h"

#include <QDir>
#include <QFile>
#include <QtTest>

class tst_StandardPaths : public QObject
{
    Q_OBJECT

private slots:
    void locations_data();
    void locations();
    void unknownLocation_data();
    void unknownLocation();
    void locate();
    void findExecutable();
};

void tst_StandardPaths::locations_data()
{
    QTest::addColumn<QVariant>("type");
    QTest::addColumn<QString>("expected");

    // The test runs with HOME and XDG_* pointed at a folder of its own.
    QTest::newRow("home by value") << QVariant(int(StandardPaths::HomeLocation)) << QDir::homePath();
    QTest::newRow("home by name") << QVariant("HomeLocation") << QDir::homePath();
    QTest::newRow("home by name, any case") << QVariant("homelocation") << QDir::homePath();
    QTest::newRow("home by numeric text") << QVariant("8") << QDir::homePath();
    QTest::newRow("config") << QVariant("GenericConfigLocation") << qEnvironmentVariable("XDG_CONFIG_HOME");
    QTest::newRow("data") << QVariant("GenericDataLocation") << qEnvironmentVariable("XDG_DATA_HOME");
    QTest::newRow("cache") << QVariant("GenericCacheLocation") << qEnvironmentVariable("XDG_CACHE_HOME");
    QTest::newRow("temp") << QVariant("TempLocation") << QDir::tempPath();
}

void tst_StandardPaths::locations()
{
    QFETCH(QVariant, type);
    QFETCH(QString, expected);
    if (expected.isEmpty())
        QSKIP("The variable is not set in this environment");

    StandardPaths paths;
    QCOMPARE(paths.writableLocation(type), expected);
    QCOMPARE(paths.standardLocations(type).value(0), expected);
}

void tst_StandardPaths::unknownLocation_data()
{
    QTest::addColumn<QVariant>("type");
    QTest::newRow("unknown name") << QVariant("NoSuchLocation");
    QTest::newRow("unknown number") << QVariant(99);
    QTest::newRow("negative") << QVariant(-1);
    QTest::newRow("nothing") << QVariant();
}

void tst_StandardPaths::unknownLocation()
{
    QFETCH(QVariant, type);

    StandardPaths paths;
    for (int i = 0; i < 5; ++i)
        QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Unknown location"));
    QVERIFY(paths.writableLocation(type).isEmpty());
    QVERIFY(paths.writableLocationUrl(type).isEmpty());
    QVERIFY(paths.standardLocations(type).isEmpty());
    QVERIFY(paths.displayName(type).isEmpty());
    QVERIFY(paths.locate(type, "x").isEmpty());
}

void tst_StandardPaths::locate()
{
    const QString data = qEnvironmentVariable("XDG_DATA_HOME");
    if (data.isEmpty())
        QSKIP("XDG_DATA_HOME is not set in this environment");
    QVERIFY(QDir().mkpath(data + "/loomkit-test/folder"));
    QFile file(data + "/loomkit-test/found.txt");
    QVERIFY(file.open(QIODevice::WriteOnly));
    file.close();

    StandardPaths paths;
    const QString where("GenericDataLocation");
    QCOMPARE(paths.locate(where, "loomkit-test/found.txt"), file.fileName());
    QVERIFY(paths.locate(where, "loomkit-test/folder").isEmpty());
    QCOMPARE(paths.locate(where, "loomkit-test/folder", "LocateDirectory"), data + "/loomkit-test/folder");
    QCOMPARE(paths.locateAll(int(StandardPaths::GenericDataLocation), "loomkit-test/found.txt"), QStringList { file.fileName() });
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Unknown locate option"));
    QVERIFY(paths.locate(where, "loomkit-test/found.txt", "LocateEverything").isEmpty());
}

void tst_StandardPaths::findExecutable()
{
    StandardPaths paths;
    // The shell's own lookup is the oracle.
    int exitCode = -1;
    const QString shell = QString::fromLocal8Bit(TestSupport::run("/bin/sh", { "-c", "command -v sh" }, &exitCode)).trimmed();
    QCOMPARE(exitCode, 0);
    QCOMPARE(QFileInfo(paths.findExecutable("sh")).canonicalFilePath(), QFileInfo(shell).canonicalFilePath());

    QVERIFY(paths.findExecutable("no-such-program-here").isEmpty());
    QVERIFY(paths.findExecutable(QString()).isEmpty());
    QCOMPARE(paths.findExecutable("sh", { "/bin" }), QStringLiteral("/bin/sh"));
    QVERIFY(paths.findExecutable("sh", { "/nonexistent" }).isEmpty());
}

QTEST_GUILESS_MAIN(tst_StandardPaths)
#include "tst_StandardPaths.moc"
