#include "Loomkit.h"
#include "VersionNumber.h"

#include <QQmlEngine>
#include <QtTest>

class tst_VersionNumber : public QObject
{
    Q_OBJECT

private slots:
    void parse_data();
    void parse();
    void compare_data();
    void compare();
    void editing();
};

void tst_VersionNumber::parse_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<QString>("versionString");
    QTest::addColumn<QString>("suffix");
    QTest::addColumn<int>("segmentCount");
    QTest::addColumn<int>("minor");

    QTest::newRow("three") << "5.15.2" << "5.15.2" << "" << 3 << 15;
    QTest::newRow("suffix") << " 1.2-beta3 " << "1.2-beta3" << "-beta3" << 2 << 2;
    QTest::newRow("trailing zero kept") << "2.0.0" << "2.0.0" << "" << 3 << 0;
    QTest::newRow("single") << "7" << "7" << "" << 1 << 0;
    QTest::newRow("empty") << "" << "" << "" << 0 << 0;
}

void tst_VersionNumber::parse()
{
    QFETCH(QString, text);
    QFETCH(int, segmentCount);
    VersionNumber version;
    version.setVersionString(text);
    QTEST(version.versionString(), "versionString");
    QTEST(version.suffix(), "suffix");
    QCOMPARE(version.segmentCount(), segmentCount);
    QTEST(version.minorVersion(), "minor");
    QCOMPARE(version.isNull(), segmentCount == 0);
}

void tst_VersionNumber::compare_data()
{
    QTest::addColumn<QVariant>("left");
    QTest::addColumn<QVariant>("right");
    QTest::addColumn<int>("sign");

    QTest::newRow("equal") << QVariant("1.2.3") << QVariant("1.2.3") << 0;
    QTest::newRow("numeric not lexical") << QVariant("1.10") << QVariant("1.9") << 1;
    QTest::newRow("shorter is lower") << QVariant("1.2") << QVariant("1.2.0") << -1;
    QTest::newRow("suffix ignored") << QVariant("2.0-rc1") << QVariant("2.0") << 0;
    QTest::newRow("number") << QVariant(2) << QVariant("1.99") << 1;
    QTest::newRow("decimal number") << QVariant(1.5) << QVariant("1.5") << 0;
    QTest::newRow("list") << QVariant(QVariantList { 3, 1 }) << QVariant("3.0.9") << 1;
    QTest::newRow("bad list is null") << QVariant(QVariantList { "x" }) << QVariant("0") << -1;
    QTest::newRow("garbage is null") << QVariant("abc") << QVariant("") << 0;
}

static int sign(int value)
{
    return value < 0 ? -1 : value > 0 ? 1 : 0;
}

void tst_VersionNumber::compare()
{
    QFETCH(QVariant, left);
    QFETCH(QVariant, right);
    QFETCH(int, sign);
    Loomkit loomkit;
    QCOMPARE(::sign(loomkit.compareVersionNumber(left, right)), sign);
    QCOMPARE(::sign(loomkit.compareVersionNumber(right, left)), -sign);
    // A VersionNumber object converts as well.
    VersionNumber version(VersionNumber::toVersion(left));
    QCOMPARE(::sign(loomkit.compareVersionNumber(QVariant::fromValue<QObject *>(&version), right)), sign);
}

void tst_VersionNumber::editing()
{
    VersionNumber version;
    QSignalSpy spy(&version, &VersionNumber::versionChanged);
    version.setMicroVersion(4);
    version.setMajorVersion(3);
    version.setMajorVersion(3);
    QCOMPARE(version.versionString(), QStringLiteral("3.0.4"));
    QCOMPARE(spy.count(), 2);
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Negative segment"));
    version.setMinorVersion(-1);
    QCOMPARE(version.versionString(), QStringLiteral("3.0.4"));

    Loomkit loomkit;
    QScopedPointer<VersionNumber> made(loomkit.versionNumber(QStringLiteral("1.2.0-alpha")));
    QCOMPARE(QQmlEngine::objectOwnership(made.data()), QQmlEngine::JavaScriptOwnership);
    QVERIFY(!made->parent());
    QVERIFY(!made->isNormalized());
    QScopedPointer<VersionNumber> normalized(made->normalized());
    QCOMPARE(normalized->versionString(), QStringLiteral("1.2"));
    QVERIFY(normalized->isPrefixOf(QStringLiteral("1.2.5")));
    QVERIFY(!normalized->isPrefixOf(QStringLiteral("1.20")));

    QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Not a version number"));
    QScopedPointer<VersionNumber> bad(loomkit.versionNumber(QStringLiteral("v1")));
    QVERIFY(bad->isNull());
}

QTEST_MAIN(tst_VersionNumber)
#include "tst_VersionNumber.moc"
