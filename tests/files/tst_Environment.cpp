#include "Environment.h"
#include "FileTestSupport.h"

#include <QProcess>
#include <QSignalSpy>

#include <cstdlib>

using FileTestSupport::expectWarning;

class tst_Environment : public QObject
{
    Q_OBJECT

private slots:
    void setReadRemove_data();
    void setReadRemove();
    void invalidNames_data();
    void invalidNames();
    void listingAndChildProcess();
};

void tst_Environment::setReadRemove_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<QString>("value");

    QTest::newRow("plain") << "LOOMKIT_TEST_PLAIN" << "value";
    QTest::newRow("empty value") << "LOOMKIT_TEST_EMPTY" << "";
    QTest::newRow("non-latin") << "LOOMKIT_TEST_UTF8" << QString::fromUtf8("Grüße ✓ 日本");
    QTest::newRow("equals in value") << "LOOMKIT_TEST_EQ" << "a=b=c";
}

void tst_Environment::setReadRemove()
{
    QFETCH(QString, name);
    QFETCH(QString, value);

    Environment environment;
    QSignalSpy spy(&environment, &Environment::environmentChanged);
    QVERIFY(!environment.contains(name));

    QVERIFY(environment.setValue(name, value));
    QVERIFY(environment.setValue(name, value));
    QCOMPARE(spy.count(), 1);
    QCOMPARE(environment.value(name, "fallback"), value);
    // What the C library sees.
    QCOMPARE(QString::fromUtf8(::getenv(name.toUtf8().constData())), value);
    QCOMPARE(environment.values().value(name).toString(), value);

    QVERIFY(environment.remove(name));
    QVERIFY(environment.remove(name));
    QCOMPARE(spy.count(), 2);
    QVERIFY(!::getenv(name.toUtf8().constData()));
    QCOMPARE(environment.value(name, "fallback"), QStringLiteral("fallback"));
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
    QVERIFY(expectWarning("Invalid variable name") && !environment.setValue(name, "x"));
    QVERIFY(expectWarning("Invalid variable name") && !environment.remove(name));
    QCOMPARE(spy.count(), 0);
    // "A" must not have been set by a name cut at the "=" or the NUL.
    QVERIFY(!environment.contains("A"));
}

void tst_Environment::listingAndChildProcess()
{
    Environment environment;
    const QStringList names = environment.names();
    QVERIFY(names.contains("HOME"));
    QStringList sorted = names;
    sorted.sort();
    QCOMPARE(names, sorted);
    QCOMPARE(environment.values().keys(), names);

    QVERIFY(environment.setValue("LOOMKIT_TEST_CHILD", "inherited"));
    QProcess process;
    process.start("/bin/sh", { "-c", "printf %s \"$LOOMKIT_TEST_CHILD\"" });
    QVERIFY(process.waitForFinished(10000));
    QCOMPARE(process.readAllStandardOutput(), QByteArray("inherited"));
    QVERIFY(environment.remove("LOOMKIT_TEST_CHILD"));
}

QTEST_GUILESS_MAIN(tst_Environment)
#include "tst_Environment.moc"
