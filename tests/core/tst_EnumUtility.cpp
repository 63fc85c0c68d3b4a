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
    void value_data();
    void value();
    void namesAndInvalid();
};

void tst_EnumUtility::value_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<int>("byName");
    QTest::addColumn<int>("byVariant"); // a variant that converts to a number is taken as the value
    QTest::newRow("exact") << "TextEncodingLatin1" << 1 << 1;
    QTest::newRow("case ignored") << "TEXTENCODINGUTF8" << 0 << 0;
    QTest::newRow("alias") << "alias" << 1 << 1;
    QTest::newRow("negative value") << "textencodingunknown" << -1 << -1;
    QTest::newRow("unknown") << "nope" << 42 << 42;
    QTest::newRow("number") << "1" << 42 << 1;
    QTest::newRow("unknown number") << "99" << 42 << 42;
}

void tst_EnumUtility::value()
{
    QFETCH(QString, text);
    EnumHolder holder;
    QTEST(EnumUtility::enumValue(EnumHolder::staticMetaObject, "Encoding", text, 42), "byName");
    QTEST(EnumUtility::enumValue(&holder, "Encoding", QVariant(text), 42), "byVariant");
}

void tst_EnumUtility::namesAndInvalid()
{
    QCOMPARE(EnumUtility::enumValueName(EnumHolder::staticMetaObject, "Encoding", 0), "TextEncodingUtf8");
    QCOMPARE(EnumUtility::enumValueName(EnumHolder::staticMetaObject, "Encoding", 5), nullptr);
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

QTEST_GUILESS_MAIN(tst_EnumUtility)
#include "tst_EnumUtility.moc"
