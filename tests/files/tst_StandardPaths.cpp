#include "FileTestSupport.h"
#include "StandardPaths.h"
#include "TestSupport.h"

using FileTestSupport::expectWarning;

// Where Qt looks when the variable is not set.
static QString dataHome()
{
    return qEnvironmentVariable("XDG_DATA_HOME", QDir::homePath() + "/.local/share");
}

class tst_StandardPaths : public QObject
{
    Q_OBJECT

private slots:
    void locations_data();
    void locations();
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
    QTest::newRow("data") << QVariant("GenericDataLocation") << dataHome();
    // Unknown types give nothing, and each call warns.
    QTest::newRow("unknown name") << QVariant("NoSuchLocation") << QString();
    QTest::newRow("unknown number") << QVariant(99) << QString();
    QTest::newRow("negative") << QVariant(-1) << QString();
    QTest::newRow("nothing") << QVariant() << QString();
}

void tst_StandardPaths::locations()
{
    QFETCH(QVariant, type);
    QFETCH(QString, expected);

    StandardPaths paths;
    const bool unknown = expected.isEmpty();
    for (int i = 0; unknown && i < 5; ++i)
        expectWarning("Unknown location");
    QCOMPARE(paths.writableLocation(type), expected);
    QCOMPARE(paths.writableLocationUrl(type), unknown ? QUrl() : QUrl::fromLocalFile(expected));
    QCOMPARE(paths.standardLocations(type).value(0), expected);
    QCOMPARE(paths.displayName(type).isEmpty(), unknown);
    if (unknown)
        QVERIFY(paths.locate(type, "x").isEmpty());
}

void tst_StandardPaths::locate()
{
    const QString data = dataHome();
    const QString found = data + "/loomkit-test/found.txt";
    QVERIFY(QDir().mkpath(data + "/loomkit-test/folder") && FileTestSupport::writeBytes(found, ""));

    StandardPaths paths;
    const QString where("GenericDataLocation");
    QCOMPARE(paths.locate(where, "loomkit-test/found.txt"), found);
    QVERIFY(paths.locate(where, "loomkit-test/folder").isEmpty());
    QCOMPARE(paths.locate(where, "loomkit-test/folder", "LocateDirectory"), data + "/loomkit-test/folder");
    QCOMPARE(paths.locateAll(int(StandardPaths::GenericDataLocation), "loomkit-test/found.txt"), QStringList { found });
    QVERIFY(expectWarning("Unknown locate option") && paths.locate(where, "loomkit-test/found.txt", "LocateEverything").isEmpty());
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
