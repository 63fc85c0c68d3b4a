#include "StandardPaths.h"
#include "TestSupport.h"

#include <QDir>
#include <QFile>
#include <QtTest>

class tst_StandardPaths : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void locations_data();
    void locations();
    void unknownLocation_data();
    void unknownLocation();
    void locate();
    void findExecutable();

private:
    QString m_home;
};

void tst_StandardPaths::initTestCase()
{
    m_home = QDir::homePath();
    QVERIFY(!m_home.isEmpty());
}

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
    QCOMPARE(paths.writableLocationUrl(type), QUrl::fromLocalFile(expected));
    QCOMPARE(paths.standardLocations(type).value(0), expected);
    QVERIFY(!paths.displayName(type).isEmpty());
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
    const QRegularExpression message(QStringLiteral("Unknown location"));
    QTest::ignoreMessage(QtWarningMsg, message);
    QVERIFY(paths.writableLocation(type).isEmpty());
    QTest::ignoreMessage(QtWarningMsg, message);
    QVERIFY(paths.writableLocationUrl(type).isEmpty());
    QTest::ignoreMessage(QtWarningMsg, message);
    QVERIFY(paths.standardLocations(type).isEmpty());
    QTest::ignoreMessage(QtWarningMsg, message);
    QVERIFY(paths.displayName(type).isEmpty());
    QTest::ignoreMessage(QtWarningMsg, message);
    QVERIFY(paths.locate(type, QStringLiteral("x")).isEmpty());
}

void tst_StandardPaths::locate()
{
    const QString data = qEnvironmentVariable("XDG_DATA_HOME");
    if (data.isEmpty())
        QSKIP("XDG_DATA_HOME is not set in this environment");
    QVERIFY(QDir().mkpath(data + QStringLiteral("/loomkit-test/folder")));
    QFile file(data + QStringLiteral("/loomkit-test/found.txt"));
    QVERIFY(file.open(QIODevice::WriteOnly));
    file.close();

    StandardPaths paths;
    QCOMPARE(paths.locate(QStringLiteral("GenericDataLocation"), QStringLiteral("loomkit-test/found.txt")), file.fileName());
    QVERIFY(paths.locate(QStringLiteral("GenericDataLocation"), QStringLiteral("loomkit-test/folder")).isEmpty());
    QCOMPARE(paths.locate(QStringLiteral("GenericDataLocation"), QStringLiteral("loomkit-test/folder"),
                          QStringLiteral("LocateDirectory")),
             data + QStringLiteral("/loomkit-test/folder"));
    QCOMPARE(paths.locateAll(int(StandardPaths::GenericDataLocation), QStringLiteral("loomkit-test/found.txt")).value(0),
             file.fileName());
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Unknown locate option")));
    QVERIFY(paths.locate(QStringLiteral("GenericDataLocation"), QStringLiteral("loomkit-test/found.txt"),
                         QStringLiteral("LocateEverything")).isEmpty());
}

void tst_StandardPaths::findExecutable()
{
    StandardPaths paths;
    // The shell's own lookup is the oracle.
    int exitCode = -1;
    const QString shell = QString::fromLocal8Bit(
        TestSupport::run(QStringLiteral("/bin/sh"), { QStringLiteral("-c"), QStringLiteral("command -v sh") }, &exitCode)).trimmed();
    QCOMPARE(exitCode, 0);
    QCOMPARE(QFileInfo(paths.findExecutable(QStringLiteral("sh"))).canonicalFilePath(), QFileInfo(shell).canonicalFilePath());

    QVERIFY(paths.findExecutable(QStringLiteral("no-such-program-here")).isEmpty());
    QVERIFY(paths.findExecutable(QString()).isEmpty());
    QCOMPARE(paths.findExecutable(QStringLiteral("sh"), { QStringLiteral("/bin") }), QStringLiteral("/bin/sh"));
    QVERIFY(paths.findExecutable(QStringLiteral("sh"), { QStringLiteral("/nonexistent") }).isEmpty());
}

QTEST_GUILESS_MAIN(tst_StandardPaths)
#include "tst_StandardPaths.moc"
