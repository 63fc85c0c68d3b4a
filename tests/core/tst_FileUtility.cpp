#include "FileUtility.h"

#include <QCoreApplication>
#include <QDir>
#include <QFileInfo>
#include <QSettings>
#include <QTemporaryDir>
#include <QtTest>

class tst_FileUtility : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void resolvedPath_data();
    void resolvedPath();
    void resolvedPathWarnings_data();
    void resolvedPathWarnings();
    void existingFileWins();
    void resolvedUrl_data();
    void resolvedUrl();
    void pathUrl();
    void storePriority();
    void homeDefaultIsStoredAndRecreated();
    void pathVariableDefaults();
    void makeFolder();
    void setDateTime();

private:
    void clearVariables();
};

static const char *kPrefix = "Orvane/Runtime/pathVariables.";

void tst_FileUtility::clearVariables()
{
    for (const QByteArray &name : qApp->dynamicPropertyNames()) {
        if (name.startsWith(kPrefix))
            qApp->setProperty(name.constData(), QVariant());
    }
    QSettings settings;
    settings.remove(QStringLiteral("Orvane/Runtime/pathVariables"));
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

    QTest::newRow("tilde") << "~" << "/home/tester";
    QTest::newRow("tilde slash") << "~/a" << "/home/tester/a";
    QTest::newRow("tilde names a variable") << "~data/b" << "/srv/data/b";
    QTest::newRow("dollar") << "$TEMP/x" << "/var/tmp/t/x";
    QTest::newRow("dollar whole") << "$data" << "/srv/data";
    QTest::newRow("backslash separator kept") << "$TEMP\\x" << "/var/tmp/t\\x";
    QTest::newRow("forward slash wins over earlier backslash") << "$TE\\MP/x" << "/x";
    QTest::newRow("rule only at the start") << "a/$TEMP" << "a/$TEMP";
    QTest::newRow("plain") << "/usr/share" << "/usr/share";
    QTest::newRow("content") << "content://x/y" << "content://x/y";
    QTest::newRow("empty name after dollar") << "$/x" << "/x";
    QTest::newRow("missing variable") << "$NOPE/data" << "/data";
    QTest::newRow("missing variable alone") << "$NOPE" << "";
    QTest::newRow("lower-case home has no default") << "$home/x" << "/x";
}

void tst_FileUtility::resolvedPath()
{
    QFETCH(QString, path);
    QFETCH(QString, expected);
    QCOMPARE(FileUtility::resolvedPath(path, true), expected);
}

void tst_FileUtility::resolvedPathWarnings_data()
{
    QTest::addColumn<QString>("path");
    QTest::addColumn<QString>("warning");
    QTest::newRow("no name") << "$/x" << "Path variable name not specified";
    QTest::newRow("nonexistent") << "$NOPE" << "Nonexistent Path variable \"NOPE\"";
    QTest::newRow("nonexistent with rest") << "$NOPE/data" << "Nonexistent Path variable \"NOPE\"";
}

void tst_FileUtility::resolvedPathWarnings()
{
    QFETCH(QString, path);
    QFETCH(QString, warning);
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QRegularExpression::escape(warning) + QLatin1Char('$')));
    FileUtility::resolvedPath(path, true);
}

void tst_FileUtility::existingFileWins()
{
    QTemporaryDir dir;
    QVERIFY(dir.isValid());
    QDir::setCurrent(dir.path());
    QFile tilde(QStringLiteral("~"));
    QVERIFY(tilde.open(QIODevice::WriteOnly));
    tilde.close();
    QCOMPARE(FileUtility::resolvedPath(QStringLiteral("~"), true), QStringLiteral("~"));
    QCOMPARE(FileUtility::resolvedPath(QStringLiteral("~/x"), true), QStringLiteral("/home/tester/x"));
    QDir::setCurrent(QDir::tempPath());
}

void tst_FileUtility::resolvedUrl_data()
{
    QTest::addColumn<QUrl>("url");
    QTest::addColumn<QString>("expected");
    QTest::newRow("qrc") << QUrl(QStringLiteral("qrc:/a/b.png")) << ":/a/b.png";
    QTest::newRow("qrc encoded") << QUrl(QStringLiteral("qrc:/a%20b.png")) << ":/a b.png";
    QTest::newRow("file") << QUrl(QStringLiteral("file:///c/d")) << "/c/d";
    QTest::newRow("content") << QUrl(QStringLiteral("content://media/1")) << "content://media/1";
    QTest::newRow("assets-library") << QUrl(QStringLiteral("assets-library://asset/a.JPG?id=1"))
                                    << "assets-library://asset/a.JPG?id=1";
    QTest::newRow("http loses host") << QUrl(QStringLiteral("http://example.com/p/q")) << "/p/q";
    QTest::newRow("no path") << QUrl(QStringLiteral("http://example.com")) << QString();
    QTest::newRow("relative with variable") << QUrl(QStringLiteral("$TEMP/x")) << "/var/tmp/t/x";
}

void tst_FileUtility::resolvedUrl()
{
    QFETCH(QUrl, url);
    QFETCH(QString, expected);
    const QString result = FileUtility::resolvedPath(url, true);
    QCOMPARE(result, expected);
    QCOMPARE(result.isNull(), expected.isNull());
}

void tst_FileUtility::pathUrl()
{
    QCOMPARE(FileUtility::pathUrl(QStringLiteral(":/missing/x.png")), QUrl(QStringLiteral("qrc:///missing/x.png")));
    QCOMPARE(FileUtility::pathUrl(QStringLiteral("/no/such/file")), QUrl::fromLocalFile(QStringLiteral("/no/such/file")));
    QCOMPARE(FileUtility::qrcUrl(QStringLiteral(":/a/b")).toString(), QStringLiteral("qrc:///a/b"));
    QCOMPARE(FileUtility::resolvedPathUrl(QStringLiteral("~/f.txt"), true),
             QUrl::fromLocalFile(QStringLiteral("/home/tester/f.txt")));
}

void tst_FileUtility::storePriority()
{
    const QString name = QStringLiteral("LOOMKIT_TEST_VAR");
    QCOMPARE(FileUtility::pathVariableOrigin(name, true), FileUtility::PathVariableOriginNone);

    qputenv("LOOMKIT_TEST_VAR", "/from/environment");
    QCOMPARE(FileUtility::pathVariable(name, QString(), true), QStringLiteral("/from/environment"));
    QCOMPARE(FileUtility::pathVariableOrigin(name, true), FileUtility::PathVariableOriginEnvironment);
    // Without environment lookup only the application property counts.
    QCOMPARE(FileUtility::pathVariable(name, QString(), false), QString());
    QCOMPARE(FileUtility::pathVariableOrigin(name, false), FileUtility::PathVariableOriginNone);

    {
        QSettings settings;
        settings.setValue(QStringLiteral("Orvane/Runtime/pathVariables/") + name, QStringLiteral("  /from/settings  "));
    }
    QCOMPARE(FileUtility::pathVariable(name, QString(), true), QStringLiteral("/from/settings"));
    QCOMPARE(FileUtility::pathVariableOrigin(name, true), FileUtility::PathVariableOriginSettings);

    FileUtility::setPathVariable(name, QStringLiteral("/from/property"));
    QCOMPARE(FileUtility::pathVariable(name, QString(), true), QStringLiteral("/from/property"));
    QCOMPARE(FileUtility::pathVariable(name, QString(), false), QStringLiteral("/from/property"));
    QCOMPARE(FileUtility::pathVariableOrigin(name, false), FileUtility::PathVariableOriginApplicationProperty);
    QCOMPARE(qApp->property("Orvane/Runtime/pathVariables.LOOMKIT_TEST_VAR").toString(), QStringLiteral("/from/property"));

    // An empty value removes the property, and the next store shows through.
    FileUtility::setPathVariable(name, QString());
    QVERIFY(!qApp->property("Orvane/Runtime/pathVariables.LOOMKIT_TEST_VAR").isValid());
    QCOMPARE(FileUtility::pathVariable(name, QString(), true), QStringLiteral("/from/settings"));
}

void tst_FileUtility::homeDefaultIsStoredAndRecreated()
{
    clearVariables();
    const QByteArray savedHome = qgetenv("HOME");
    qunsetenv("HOME");
    const char *property = "Orvane/Runtime/pathVariables.HOME";
    QVERIFY(!qApp->property(property).isValid());

    QCOMPARE(FileUtility::homePath(), QDir::homePath());
    QCOMPARE(qApp->property(property).toString(), QDir::homePath());
    QCOMPARE(FileUtility::pathVariableOrigin(QStringLiteral("HOME"), true), FileUtility::PathVariableOriginApplicationProperty);

    FileUtility::setPathVariable(QStringLiteral("HOME"), QString());
    QVERIFY(!qApp->property(property).isValid());
    QCOMPARE(FileUtility::resolvedPath(QStringLiteral("~/x"), false), QDir::homePath() + QStringLiteral("/x"));
    QCOMPARE(qApp->property(property).toString(), QDir::homePath());
    qputenv("HOME", savedHome);
}

void tst_FileUtility::pathVariableDefaults()
{
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Empty name$")));
    QCOMPARE(FileUtility::pathVariable(QString(), QStringLiteral("fallback"), true), QStringLiteral("fallback"));
    // A caller's default never stands in for a missing variable.
    QCOMPARE(FileUtility::pathVariable(QStringLiteral("NOPE"), QStringLiteral("fallback"), true), QString());
    QCOMPARE(FileUtility::homePaths(), QStringList { QStringLiteral("/home/tester") });
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Empty name, value= \"/x\"$")));
    FileUtility::setPathVariable(QString(), QStringLiteral("/x"));
}

void tst_FileUtility::makeFolder()
{
    QTemporaryDir dir;
    QVERIFY(dir.isValid());
    const QString nested = dir.filePath(QStringLiteral("a/b/c"));
    QVERIFY(FileUtility::makeFolder(nested));
    QVERIFY(QFileInfo(nested).isDir());
    QVERIFY(FileUtility::makeFolder(nested));
    QVERIFY(FileUtility::makePath(QDir(dir.filePath(QStringLiteral("x/y")))));
    QVERIFY(QFileInfo(dir.filePath(QStringLiteral("x/y"))).isDir());

    QFile blocker(dir.filePath(QStringLiteral("file")));
    QVERIFY(blocker.open(QIODevice::WriteOnly));
    blocker.close();
    QVERIFY(!FileUtility::makeFolder(dir.filePath(QStringLiteral("file/sub"))));
}

void tst_FileUtility::setDateTime()
{
    QTemporaryDir dir;
    QVERIFY(dir.isValid());
    const QString path = dir.filePath(QStringLiteral("f"));
    QFile file(path);
    QVERIFY(file.open(QIODevice::WriteOnly));
    file.close();

    const QDateTime accessed = QDateTime::fromSecsSinceEpoch(1000000000);
    const QDateTime modified = QDateTime::fromMSecsSinceEpoch(1200000000123LL);
    QVERIFY(FileUtility::setDateTime(path, accessed, modified));
    const QFileInfo info(path);
    QCOMPARE(info.lastModified().toMSecsSinceEpoch(), 1200000000000LL); // sub-seconds are lost
    QCOMPARE(info.lastRead().toSecsSinceEpoch(), 1000000000LL);

    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("error: 2 file: \"/no/such/file\"")));
    QVERIFY(!FileUtility::setDateTime(QStringLiteral("/no/such/file"), accessed, modified));
}

QTEST_GUILESS_MAIN(tst_FileUtility)
#include "tst_FileUtility.moc"
