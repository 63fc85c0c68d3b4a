#include "EnumUtility.h"

#include <QtTest>

class EnumHolder : public QObject
{
    Q_OBJECT
public:
    enum Encoding { TextEncodingUnknown = -1, TextEncodingUtf8 = 0, TextEncodingLatin1 = 1, Alias = 1 };
    Q_ENUM(Encoding)
};

class tst_EnumUtility : public QObject
{
    Q_OBJECT

private slots:
    void byName_data();
    void byName();
    void byVariant_data();
    void byVariant();
    void invalid();
    void names();
};

void tst_EnumUtility::byName_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<int>("expected");
    QTest::newRow("exact") << "TextEncodingLatin1" << 1;
    QTest::newRow("case ignored") << "TEXTENCODINGUTF8" << 0;
    QTest::newRow("alias") << "alias" << 1;
    QTest::newRow("negative value") << "textencodingunknown" << -1;
    QTest::newRow("unknown") << "nope" << 42;
}

void tst_EnumUtility::byName()
{
    QFETCH(QString, name);
    QFETCH(int, expected);
    QCOMPARE(EnumUtility::enumValue(EnumHolder::staticMetaObject, "Encoding", name, 42), expected);
}

void tst_EnumUtility::byVariant_data()
{
    QTest::addColumn<QVariant>("value");
    QTest::addColumn<int>("expected");
    QTest::newRow("number text") << QVariant("1") << 1;
    QTest::newRow("number") << QVariant(0) << 0;
    QTest::newRow("unknown number gives default") << QVariant(99) << 42;
    QTest::newRow("name") << QVariant("textEncodingLatin1") << 1;
    QTest::newRow("unknown name") << QVariant("x") << 42;
}

void tst_EnumUtility::byVariant()
{
    QFETCH(QVariant, value);
    QFETCH(int, expected);
    EnumHolder holder;
    QCOMPARE(EnumUtility::enumValue(&holder, "Encoding", value, 42), expected);
}

void tst_EnumUtility::invalid()
{
    QVERIFY(!EnumUtility::enumerator(EnumHolder::staticMetaObject, "Missing").isValid());
    QTest::ignoreMessage(QtCriticalMsg, QRegularExpression(QStringLiteral("Null enum name$")));
    QVERIFY(!EnumUtility::enumerator(EnumHolder::staticMetaObject, nullptr).isValid());
    QTest::ignoreMessage(QtCriticalMsg, QRegularExpression(QStringLiteral("Null object$")));
    QVERIFY(!EnumUtility::enumerator(static_cast<const QObject *>(nullptr), "Encoding").isValid());
    QTest::ignoreMessage(QtCriticalMsg, QRegularExpression(QStringLiteral("Invalid metaEnum \"x\"$")));
    QCOMPARE(EnumUtility::enumValue(QMetaEnum(), QStringLiteral("x"), 7), 7);
    QTest::ignoreMessage(QtCriticalMsg, QRegularExpression(QStringLiteral("Invalid metaEnum$")));
    QCOMPARE(EnumUtility::enumValueName(QMetaEnum(), 1), nullptr);
}

void tst_EnumUtility::names()
{
    QCOMPARE(EnumUtility::enumValueName(EnumHolder::staticMetaObject, "Encoding", 0), "TextEncodingUtf8");
    QCOMPARE(EnumUtility::enumValueName(EnumHolder::staticMetaObject, "Encoding", 5), nullptr);
}

QTEST_GUILESS_MAIN(tst_EnumUtility)
#include "tst_EnumUtility.moc"
