#include "Environment.h"

#include <QProcess>
#include <QSignalSpy>
#include <QtTest>

#include <cstdlib>

class tst_Environment : public QObject
{
    Q_OBJECT

private slots:
    void setReadRemove_data();
    void setReadRemove();
    void invalidNames_data();
    void invalidNames();
    void listing();
    void childProcessSeesChanges();
};

void tst_Environment::setReadRemove_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<QString>("value");

    QTest::newRow("plain") << "LOOMKIT_TEST_PLAIN" << "value";
    QTest::newRow("empty value") << "LOOMKIT_TEST_EMPTY" << "";
    QTest::newRow("non-latin") << "LOOMKIT_TEST_UTF8" << QString::fromUtf8("Grüße ✓ 日本");
    QTest::newRow("equals in value") << "LOOMKIT_TEST_EQ" << "a=b=c";
    QTest::newRow("lower-case name") << "loomkit_test_lower" << "x";
}

void tst_Environment::setReadRemove()
{
    QFETCH(QString, name);
    QFETCH(QString, value);

    Environment environment;
    QSignalSpy spy(&environment, &Environment::environmentChanged);
    QVERIFY(!environment.contains(name));
    QCOMPARE(environment.value(name, QStringLiteral("fallback")), QStringLiteral("fallback"));
    QVERIFY(environment.value(name).isNull());

    QVERIFY(environment.setValue(name, value));
    QCOMPARE(spy.count(), 1);
    QVERIFY(environment.contains(name));
    QCOMPARE(environment.value(name, QStringLiteral("fallback")), value);
    // What the C library sees.
    QCOMPARE(QString::fromUtf8(::getenv(name.toUtf8().constData())), value);
    QVERIFY(environment.names().contains(name));
    QCOMPARE(environment.values().value(name).toString(), value);

    // The same value again changes nothing.
    QVERIFY(environment.setValue(name, value));
    QCOMPARE(spy.count(), 1);

    QVERIFY(environment.remove(name));
    QCOMPARE(spy.count(), 2);
    QVERIFY(!environment.contains(name));
    QVERIFY(!::getenv(name.toUtf8().constData()));
    QVERIFY(!environment.names().contains(name));
    QVERIFY(environment.remove(name));
    QCOMPARE(spy.count(), 2);
}

void tst_Environment::invalidNames_data()
{
    QTest::addColumn<QString>("name");
    QTest::newRow("empty") << "";
    QTest::newRow("equals sign") << "A=B";
    QTest::newRow("nul") << QString(QStringLiteral("A")) + QChar(0) + QStringLiteral("B");
}

void tst_Environment::invalidNames()
{
    QFETCH(QString, name);

    Environment environment;
    QSignalSpy spy(&environment, &Environment::environmentChanged);
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Invalid variable name")));
    QVERIFY(!environment.setValue(name, QStringLiteral("x")));
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Invalid variable name")));
    QVERIFY(!environment.remove(name));
    QVERIFY(!environment.contains(name));
    QCOMPARE(environment.value(name, QStringLiteral("d")), QStringLiteral("d"));
    QCOMPARE(spy.count(), 0);
    // "A" must not have been set by a name cut at the "=" or the NUL.
    QVERIFY(!environment.contains(QStringLiteral("A")));
}

void tst_Environment::listing()
{
    Environment environment;
    const QStringList names = environment.names();
    QVERIFY(names.contains(QStringLiteral("HOME")));
    QStringList sorted = names;
    sorted.sort();
    QCOMPARE(names, sorted);
    QCOMPARE(environment.values().value(QStringLiteral("HOME")).toString(), qEnvironmentVariable("HOME"));
    QCOMPARE(environment.values().keys(), names);
}

void tst_Environment::childProcessSeesChanges()
{
    Environment environment;
    QVERIFY(environment.setValue(QStringLiteral("LOOMKIT_TEST_CHILD"), QStringLiteral("inherited")));
    QProcess process;
    process.start(QStringLiteral("/bin/sh"), { QStringLiteral("-c"), QStringLiteral("printf %s \"$LOOMKIT_TEST_CHILD\"") });
    QVERIFY(process.waitForFinished(10000));
    QCOMPARE(process.readAllStandardOutput(), QByteArray("inherited"));
    QVERIFY(environment.remove(QStringLiteral("LOOMKIT_TEST_CHILD")));
}

QTEST_GUILESS_MAIN(tst_Environment)
#include "tst_Environment.moc"
