#include "FileUtility.h"

#include <QtTest>

class tst_FileUtility : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void resolvedPath_data();
    void resolvedPath();
    void resolvedUrl_data();
    void resolvedUrl();
    void storePriority();
    void defaults();
    void realFiles();
};

static void clearVariables()
{
    for (const QByteArray &name : qApp->dynamicPropertyNames()) {
        if (name.startsWith("Orvane/Runtime/pathVariables."))
            qApp->setProperty(name.constData(), QVariant());
    }
    QSettings().remove(QStringLiteral("Orvane/Runtime/pathVariables"));
    qunsetenv("LOOMKIT_TEST_VAR");
}

void tst_FileUtility::init()
{
    QCoreApplication::setOrganizationName(QStringLiteral("OrvaneTest"));
    QCoreApplication::setApplicationName(QStringLiteral("tst_FileUtility"));
    QDir::setCurrent(QDir::tempPath());
    clearVariables();
    FileUtility::setPathVariable(QStringLiteral("HOME"), QStringLiteral("/home/tester"));
    FileUtility::setPathVariable(QStringLiteral("TEMP"), QStringLiteral("/var/tmp/t"));
    FileUtility::setPathVariable(QStringLiteral("data"), QStringLiteral("/srv/data"));
}

void tst_FileUtility::resolvedPath_data()
{
    QTest::addColumn<QString>("path");
    QTest::addColumn<QString>("expected");
    QTest::addColumn<QString>("warning");

    QTest::newRow("tilde") << "~" << "/home/tester" << "";
    QTest::newRow("tilde slash") << "~/a" << "/home/tester/a" << "";
    QTest::newRow("tilde names a variable") << "~data/b" << "/srv/data/b" << "";
    QTest::newRow("dollar") << "$TEMP/x" << "/var/tmp/t/x" << "";
    QTest::newRow("dollar whole") << "$data" << "/srv/data" << "";
    QTest::newRow("backslash separator kept") << "$TEMP\\x" << "/var/tmp/t\\x" << "";
    QTest::newRow("forward slash wins over earlier backslash") << "$TE\\MP/x" << "/x" << "Nonexistent Path variable \"TE\\\\MP\"";
    QTest::newRow("rule only at the start") << "a/$TEMP" << "a/$TEMP" << "";
    QTest::newRow("plain") << "/usr/share" << "/usr/share" << "";
    QTest::newRow("content") << "content://x/y" << "content://x/y" << "";
    QTest::newRow("empty name after dollar") << "$/x" << "/x" << "Path variable name not specified";
    QTest::newRow("missing variable") << "$NOPE/data" << "/data" << "Nonexistent Path variable \"NOPE\"";
    QTest::newRow("missing variable alone") << "$NOPE" << "" << "Nonexistent Path variable \"NOPE\"";
    QTest::newRow("lower-case home has no default") << "$home/x" << "/x" << "Nonexistent Path variable \"home\"";
}

void tst_FileUtility::resolvedPath()
{
    QFETCH(QString, path);
    QFETCH(QString, warning);
    if (!warning.isEmpty())
        QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QRegularExpression::escape(warning) + QLatin1Char('$')));
    QTEST(FileUtility::resolvedPath(path, true), "expected");
}

void tst_FileUtility::resolvedUrl_data()
{
    QTest::addColumn<QString>("url");
    QTest::addColumn<QString>("expected");
    QTest::newRow("qrc") << "qrc:/a/b.png" << ":/a/b.png";
    QTest::newRow("qrc encoded") << "qrc:/a%20b.png" << ":/a b.png";
    QTest::newRow("file") << "file:///c/d" << "/c/d";
    QTest::newRow("content") << "content://media/1" << "content://media/1";
    QTest::newRow("assets-library") << "assets-library://asset/a.JPG?id=1" << "assets-library://asset/a.JPG?id=1";
    QTest::newRow("http loses host") << "http://example.com/p/q" << "/p/q";
    QTest::newRow("no path") << "http://example.com" << QString();
    QTest::newRow("relative with variable") << "$TEMP/x" << "/var/tmp/t/x";
}

void tst_FileUtility::resolvedUrl()
{
    QFETCH(QString, url);
    QFETCH(QString, expected);
    const QString result = FileUtility::resolvedPath(QUrl(url), true);
    QCOMPARE(result, expected);
    QCOMPARE(result.isNull(), expected.isNull());
}

void tst_FileUtility::storePriority()
{
    const QString name = QStringLiteral("LOOMKIT_TEST_VAR");
    const char *property = "Orvane/Runtime/pathVariables.LOOMKIT_TEST_VAR";
    const auto expect = [&](bool useEnvironment, const QString &value, FileUtility::PathVariableOrigin origin) {
        QCOMPARE(FileUtility::pathVariable(name, QString(), useEnvironment), value);
        QCOMPARE(FileUtility::pathVariableOrigin(name, useEnvironment), origin);
    };
    expect(true, QString(), FileUtility::PathVariableOriginNone);

    qputenv("LOOMKIT_TEST_VAR", "/from/environment");
    expect(true, QStringLiteral("/from/environment"), FileUtility::PathVariableOriginEnvironment);
    // Without environment lookup only the application property counts.
    expect(false, QString(), FileUtility::PathVariableOriginNone);

    QSettings().setValue(QStringLiteral("Orvane/Runtime/pathVariables/") + name, QStringLiteral("  /from/settings  "));
    expect(true, QStringLiteral("/from/settings"), FileUtility::PathVariableOriginSettings);

    FileUtility::setPathVariable(name, QStringLiteral("/from/property"));
    expect(true, QStringLiteral("/from/property"), FileUtility::PathVariableOriginApplicationProperty);
    expect(false, QStringLiteral("/from/property"), FileUtility::PathVariableOriginApplicationProperty);
    QCOMPARE(qApp->property(property).toString(), QStringLiteral("/from/property"));

    // An empty value removes the property, and the next store shows through.
    FileUtility::setPathVariable(name, QString());
    QVERIFY(!qApp->property(property).isValid());
    expect(true, QStringLiteral("/from/settings"), FileUtility::PathVariableOriginSettings);
}

void tst_FileUtility::defaults()
{
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Empty name$")));
    QCOMPARE(FileUtility::pathVariable(QString(), QStringLiteral("fallback"), true), QStringLiteral("fallback"));
    // A caller's default never stands in for a missing variable.
    QCOMPARE(FileUtility::pathVariable(QStringLiteral("NOPE"), QStringLiteral("fallback"), true), QString());
    QCOMPARE(FileUtility::homePaths(), QStringList { QStringLiteral("/home/tester") });
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Empty name, value= \"/x\"$")));
    FileUtility::setPathVariable(QString(), QStringLiteral("/x"));

    // Without a HOME anywhere the built-in one is stored, and stored again once removed.
    clearVariables();
    const QByteArray savedHome = qgetenv("HOME");
    qunsetenv("HOME");
    const char *property = "Orvane/Runtime/pathVariables.HOME";
    QCOMPARE(FileUtility::homePath(), QDir::homePath());
    QCOMPARE(qApp->property(property).toString(), QDir::homePath());
    QCOMPARE(FileUtility::pathVariableOrigin(QStringLiteral("HOME"), true), FileUtility::PathVariableOriginApplicationProperty);
    FileUtility::setPathVariable(QStringLiteral("HOME"), QString());
    QCOMPARE(FileUtility::resolvedPath(QStringLiteral("~/x"), false), QDir::homePath() + QStringLiteral("/x"));
    QCOMPARE(qApp->property(property).toString(), QDir::homePath());
    qputenv("HOME", savedHome);
}

void tst_FileUtility::realFiles()
{
    QTemporaryDir dir;
    // A file of that name is taken as it is.
    QDir::setCurrent(dir.path());
    QVERIFY(QFile(QStringLiteral("~")).open(QIODevice::WriteOnly));
    QCOMPARE(FileUtility::resolvedPath(QStringLiteral("~"), true), QStringLiteral("~"));
    QCOMPARE(FileUtility::resolvedPath(QStringLiteral("~/x"), true), QStringLiteral("/home/tester/x"));
    QCOMPARE(FileUtility::pathUrl(QStringLiteral(":/missing/x.png")), QUrl(QStringLiteral("qrc:///missing/x.png")));
    QCOMPARE(FileUtility::pathUrl(QStringLiteral("/no/such/file")), QUrl::fromLocalFile(QStringLiteral("/no/such/file")));

    const QString nested = dir.filePath(QStringLiteral("a/b/c"));
    QVERIFY(FileUtility::makeFolder(nested));
    QVERIFY(QFileInfo(nested).isDir());
    QVERIFY(FileUtility::makeFolder(nested));
    QVERIFY(FileUtility::makePath(QDir(dir.filePath(QStringLiteral("x/y")))));
    QVERIFY(QFileInfo(dir.filePath(QStringLiteral("x/y"))).isDir());

    const QString path = dir.filePath(QStringLiteral("file"));
    QVERIFY(QFile(path).open(QIODevice::WriteOnly));
    QVERIFY(!FileUtility::makeFolder(path + QStringLiteral("/sub")));

    const QDateTime accessed = QDateTime::fromSecsSinceEpoch(1000000000);
    const QDateTime modified = QDateTime::fromMSecsSinceEpoch(1200000000123LL);
    QVERIFY(FileUtility::setDateTime(path, accessed, modified));
    QCOMPARE(QFileInfo(path).lastModified().toMSecsSinceEpoch(), 1200000000000LL); // sub-seconds are lost
    QCOMPARE(QFileInfo(path).lastRead().toSecsSinceEpoch(), 1000000000LL);
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("error: 2 file: \"/no/such/file\"")));
    QVERIFY(!FileUtility::setDateTime(QStringLiteral("/no/such/file"), accessed, modified));
}

QTEST_GUILESS_MAIN(tst_FileUtility)
#include "tst_FileUtility.moc"
