#include "StringUtility.h"

#include <QJSEngine>
#include <QtTest>

class tst_StringUtility : public QObject
{
    Q_OBJECT

private slots:
    void roundTrip_data();
    void roundTrip();
    void decode_data();
    void decode();
    void utf16StopsAtZeroUnit();
    void undefinedEncoding();
    void valueData();
};

void tst_StringUtility::roundTrip_data()
{
    QTest::addColumn<int>("encoding");
    QTest::addColumn<QString>("text");
    QTest::addColumn<QByteArray>("bytes");

    QTest::newRow("utf8") << int(TextEncodingUtf8) << QStringLiteral("Grüße €") << QByteArray("Gr\xc3\xbc\xc3\x9f" "e \xe2\x82\xac");
    QTest::newRow("latin1") << int(TextEncodingLatin1) << QStringLiteral("Grüße") << QByteArray("Gr\xfc\xdf" "e");
    QTest::newRow("utf16") << int(TextEncodingUtf16) << QStringLiteral("A€")
                           << QByteArray("A\x00\xac\x20", 4);
    QTest::newRow("utf16 empty") << int(TextEncodingUtf16) << QString() << QByteArray();
}

void tst_StringUtility::roundTrip()
{
    QFETCH(int, encoding);
    QFETCH(QString, text);
    QFETCH(QByteArray, bytes);
    QCOMPARE(StringUtility::toStringData(text, TextEncoding(encoding)), bytes);
    QCOMPARE(StringUtility::toString(bytes, TextEncoding(encoding)), text);
}

void tst_StringUtility::decode_data()
{
    QTest::addColumn<int>("encoding");
    QTest::addColumn<QByteArray>("bytes");
    QTest::addColumn<QString>("text");
    // Latin-1 maps every byte; UTF-8 turns a lone high byte into a replacement.
    QTest::newRow("latin1 high byte") << int(TextEncodingLatin1) << QByteArray("\xe9") << QStringLiteral("é");
    QTest::newRow("utf8 invalid byte") << int(TextEncodingUtf8) << QByteArray("a\xe9") << QStringLiteral("a\ufffd");
    QTest::newRow("utf16 odd byte ignored") << int(TextEncodingUtf16) << QByteArray("B\x00\x43", 3) << QStringLiteral("B");
    QTest::newRow("utf16 surrogate pair") << int(TextEncodingUtf16) << QByteArray("\x3d\xd8\x00\xde", 4)
                                          << QString::fromUtf8("\xf0\x9f\x98\x80");
}

void tst_StringUtility::decode()
{
    QFETCH(int, encoding);
    QFETCH(QByteArray, bytes);
    QFETCH(QString, text);
    QCOMPARE(StringUtility::toString(bytes, TextEncoding(encoding)), text);
}

void tst_StringUtility::utf16StopsAtZeroUnit()
{
    const QString withZero = QStringLiteral("ab") + QChar(0) + QStringLiteral("cd");
    QCOMPARE(StringUtility::toStringData(withZero, TextEncodingUtf16), QByteArray("a\0b\0", 4));
    QCOMPARE(StringUtility::toString(QByteArray("a\0b\0\0\0c\0", 8), TextEncodingUtf16), QStringLiteral("ab"));
    // Data that starts at an odd address still decodes.
    const QByteArray padded("xa\0b\0", 5);
    QCOMPARE(StringUtility::toString(padded.mid(1), TextEncodingUtf16), QStringLiteral("ab"));
}

void tst_StringUtility::undefinedEncoding()
{
    // Decoding falls back to UTF-8, encoding gives nothing: deliberately different.
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Undefined encoding: -1$")));
    QCOMPARE(StringUtility::toString(QByteArray("\xc3\xa9"), TextEncodingUnknown), QStringLiteral("é"));
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Undefined encoding: 7$")));
    QCOMPARE(StringUtility::toStringData(QStringLiteral("é"), TextEncoding(7)), QByteArray());
}

void tst_StringUtility::valueData()
{
    QJSEngine engine;
    QCOMPARE(StringUtility::toValueData(QJSValue(QStringLiteral("é")), TextEncodingLatin1), QByteArray("\xe9"));
    QCOMPARE(StringUtility::toValueData(QJSValue(QStringLiteral("é")), TextEncodingUtf8), QByteArray("\xc3\xa9"));

    const QJSValue buffer = engine.evaluate(QStringLiteral("new Uint8Array([1, 2, 255]).buffer"));
    QCOMPARE(StringUtility::toValueData(buffer, TextEncodingUtf8), QByteArray("\x01\x02\xff"));

    // Numbers convert to their text, as QVariant does.
    QCOMPARE(StringUtility::toValueData(QJSValue(42), TextEncodingUtf8), QByteArray("42"));

    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Unsupported data type:")));
    QCOMPARE(StringUtility::toValueData(engine.evaluate(QStringLiteral("({a: 1})")), TextEncodingUtf8), QByteArray());

    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("toStringData.*Undefined encoding: -1$")));
    QCOMPARE(StringUtility::toValueData(QJSValue(QStringLiteral("x")), TextEncodingUnknown), QByteArray());
}

QTEST_GUILESS_MAIN(tst_StringUtility)
#include "tst_StringUtility.moc"
