#include "StringUtility.h"

#include <QJSEngine>
#include <QtTest>

class tst_StringUtility : public QObject
{
    Q_OBJECT

private slots:
    void convert_data();
    void convert();
    void undefinedEncodingAndValues();
};

void tst_StringUtility::convert_data()
{
    QTest::addColumn<int>("encoding");
    QTest::addColumn<QByteArray>("bytes");
    QTest::addColumn<QString>("text");
    QTest::addColumn<QString>("ways"); // "<" decodes bytes to text, ">" encodes text to bytes

    const int utf8 = TextEncodingUtf8, latin1 = TextEncodingLatin1, utf16 = TextEncodingUtf16;
    QTest::newRow("utf8") << utf8 << QByteArray("Gr\xc3\xbc\xc3\x9f" "e \xe2\x82\xac") << "Grüße €" << "<>";
    QTest::newRow("latin1") << latin1 << QByteArray("Gr\xfc\xdf" "e") << "Grüße" << "<>";
    QTest::newRow("utf16") << utf16 << QByteArray("A\x00\xac\x20", 4) << "A€" << "<>";
    QTest::newRow("utf16 empty") << utf16 << QByteArray() << QString() << "<>";
    // Latin-1 maps every byte; UTF-8 turns a lone high byte into a replacement.
    QTest::newRow("utf8 invalid byte") << utf8 << QByteArray("a\xe9") << "a\ufffd" << "<";
    QTest::newRow("utf16 odd byte ignored") << utf16 << QByteArray("B\x00\x43", 3) << "B" << "<";
    QTest::newRow("utf16 surrogate pair") << utf16 << QByteArray("\x3d\xd8\x00\xde", 4) << "\U0001F600" << "<>";
    QTest::newRow("utf16 decoding stops at zero") << utf16 << QByteArray("a\0b\0\0\0c\0", 8) << "ab" << "<";
    QTest::newRow("utf16 encoding stops at zero") << utf16 << QByteArray("a\0b\0", 4) << QStringLiteral("ab\0cd") << ">";
}

void tst_StringUtility::convert()
{
    QFETCH(int, encoding);
    QFETCH(QByteArray, bytes);
    QFETCH(QString, text);
    QFETCH(QString, ways);
    if (ways.contains(QLatin1Char('>')))
        QCOMPARE(StringUtility::toStringData(text, TextEncoding(encoding)), bytes);
    if (!ways.contains(QLatin1Char('<')))
        return;
    QCOMPARE(StringUtility::toString(bytes, TextEncoding(encoding)), text);
    // Bytes that start at an odd address decode the same.
    const QByteArray padded = ' ' + bytes;
    QCOMPARE(StringUtility::toString(QByteArray::fromRawData(padded.constData() + 1, bytes.size()),
                                     TextEncoding(encoding)), text);
}

void tst_StringUtility::undefinedEncodingAndValues()
{
    // Decoding falls back to UTF-8, encoding gives nothing: deliberately different.
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Undefined encoding: -1$")));
    QCOMPARE(StringUtility::toString(QByteArray("\xc3\xa9"), TextEncodingUnknown), QStringLiteral("é"));
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Undefined encoding: 7$")));
    QCOMPARE(StringUtility::toStringData(QStringLiteral("é"), TextEncoding(7)), QByteArray());

    QJSEngine engine;
    QCOMPARE(StringUtility::toValueData(QJSValue(QStringLiteral("é")), TextEncodingLatin1), QByteArray("\xe9"));
    QCOMPARE(StringUtility::toValueData(QJSValue(QStringLiteral("é")), TextEncodingUtf8), QByteArray("\xc3\xa9"));
    const QJSValue buffer = engine.evaluate(QStringLiteral("new Uint8Array([1, 2, 255]).buffer"));
    QCOMPARE(StringUtility::toValueData(buffer, TextEncodingUtf8), QByteArray("\x01\x02\xff"));
    // Numbers convert to their text, as QVariant does.
    QCOMPARE(StringUtility::toValueData(QJSValue(42), TextEncodingUtf8), QByteArray("42"));
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Unsupported data type:")));
    QCOMPARE(StringUtility::toValueData(engine.evaluate(QStringLiteral("({a: 1})")), TextEncodingUtf8), QByteArray());
}

QTEST_GUILESS_MAIN(tst_StringUtility)
#include "tst_StringUtility.moc"
