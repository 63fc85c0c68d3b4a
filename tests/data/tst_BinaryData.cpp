#include "BinaryData.h"

#include <QJSEngine>
#include <QQmlEngine>
#include <QtTest>

class tst_BinaryData : public QObject
{
    Q_OBJECT

private slots:
    void typedRoundTrip_data();
    void typedRoundTrip();
    void outOfRangeAndGrowing();
    void base64AndHex_data();
    void base64AndHex();
    void badBase64AndHex();
    void conversions();
};

void tst_BinaryData::typedRoundTrip_data()
{
    QTest::addColumn<int>("type");
    QTest::addColumn<int>("byteOrder");
    QTest::addColumn<double>("value");
    QTest::addColumn<QByteArray>("hex");
    QTest::addColumn<double>("readBack");

    const auto row = [](const char *tag, BinaryData::Type type, bool bigEndian, double value, const char *hex,
                        double readBack) {
        QTest::newRow(tag) << int(type) << int(bigEndian ? BinaryData::BigEndian : BinaryData::LittleEndian) << value
                           << QByteArray(hex) << readBack;
    };
    using B = BinaryData;
    row("int8 negative", B::TypeInt8, false, -2, "fe", -2);
    row("uint8 wraps", B::TypeUInt8, false, 257, "01", 1);
    row("uint16 be", B::TypeUInt16, true, 4660, "1234", 4660);
    row("int16 be negative", B::TypeInt16, true, -2, "fffe", -2);
    row("uint32 max", B::TypeUInt32, false, 4294967295.0, "ffffffff", 4294967295.0);
    row("int32 le", B::TypeInt32, false, -1, "ffffffff", -1);
    row("int64 be", B::TypeInt64, true, -2, "fffffffffffffffe", -2);
    row("uint64 le", B::TypeUInt64, false, 258, "0201000000000000", 258);
    // Wide integers go through the script's 32-bit conversion, widened with its sign.
    row("int64 keeps 32 bits", B::TypeInt64, false, 4294967296.0, "0000000000000000", 0);
    row("uint64 sign-extends", B::TypeUInt64, false, -5, "fbffffffffffffff", 18446744073709551611.0);
    row("single be", B::TypeSingle, true, 1.5, "3fc00000", 1.5);
    row("single narrows", B::TypeSingle, false, 0.1, "cdcccc3d", double(0.1f));
    row("double le", B::TypeDouble, false, -0.5, "000000000000e0bf", -0.5);
}

void tst_BinaryData::typedRoundTrip()
{
    QFETCH(int, type);
    QFETCH(int, byteOrder);
    QFETCH(double, value);
    QFETCH(QByteArray, hex);

    BinaryData data;
    const auto t = BinaryData::Type(type);
    const auto order = BinaryData::ByteOrder(byteOrder);
    QCOMPARE(data.setDataAt(1, QJSValue(value), t, order), 1 + hex.size() / 2);
    QCOMPARE(data.hex(), QString::fromLatin1("00" + hex));
    const QJSValue read = data.dataAt(1, t, order);
    QVERIFY(read.isNumber());
    QTEST(read.toNumber(), "readBack");
}

void tst_BinaryData::outOfRangeAndGrowing()
{
    BinaryData data;
    data.setHex(QStringLiteral("0102030405"));
    QSignalSpy dataSpy(&data, &BinaryData::dataChanged);
    QSignalSpy sizeSpy(&data, &BinaryData::sizeChanged);
    QVERIFY(data.dataAt(4, BinaryData::TypeUInt16).isUndefined());
    QCOMPARE(data.dataAt(3, BinaryData::TypeUInt16, BinaryData::BigEndian).toInt(), 0x0405);
    QVERIFY(data.dataAt(-1).isUndefined());
    QVERIFY(data.dataAt(2147483647, BinaryData::TypeDouble).isUndefined());
    // 10 is QMetaType::QString: a metatype, but not one of the buffer's types.
    QVERIFY(data.dataAt(0, BinaryData::Type(10)).isUndefined());

    QCOMPARE(data.setDataAt(0, QJSValue(QJSValue::NullValue)), -1);
    QCOMPARE(data.setDataAt(9, QJSValue(QJSValue::UndefinedValue)), -1);
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Index out of range"));
    QCOMPARE(data.setDataAt(-1, QJSValue(7)), -1);
    QCOMPARE(data.hex(), QStringLiteral("0102030405"));
    QCOMPARE(dataSpy.count(), 0);

    QCOMPARE(data.setDataAt(10, QJSValue(1)), 11);
    // The gap is zero, not left over memory.
    QCOMPARE(data.hex(), QStringLiteral("0102030405000000000001"));
    QCOMPARE(data.setDataAt(0, QJSValue(7)), 1);
    QCOMPARE(sizeSpy.count(), 1);
    QCOMPARE(dataSpy.count(), 2);

    data.fill(0x41);
    QCOMPARE(data.stringData(), QString(11, QLatin1Char('A')));
    data.fill(0x42, 3);
    QCOMPARE(data.stringData(), QStringLiteral("BBB"));
    data.setSize(5);
    QCOMPARE(data.hex(), QStringLiteral("4242420000"));
    data.setSize(5);
    data.setSize(-4);
    QVERIFY(data.isEmpty());
    QCOMPARE(sizeSpy.count(), 4);
}

void tst_BinaryData::base64AndHex_data()
{
    QTest::addColumn<QByteArray>("bytes");
    QTest::addColumn<QString>("base64");
    QTest::addColumn<QString>("hex");

    QTest::newRow("empty") << QByteArray() << QString() << QString();
    QTest::newRow("one") << QByteArray("\xff", 1) << QStringLiteral("/w==") << QStringLiteral("ff");
    QTest::newRow("zeros") << QByteArray(4, '\0') << QStringLiteral("AAAAAA==") << QStringLiteral("00000000");
    QTest::newRow("text") << QByteArray("Man") << QStringLiteral("TWFu") << QStringLiteral("4d616e");
}

void tst_BinaryData::base64AndHex()
{
    QFETCH(QByteArray, bytes);
    QFETCH(QString, base64);
    QFETCH(QString, hex);

    BinaryData data;
    data.setData(bytes);
    QCOMPARE(data.base64(), base64);
    QCOMPARE(data.hex(), hex);

    BinaryData fromBase64;
    QSignalSpy sizeSpy(&fromBase64, &BinaryData::sizeChanged);
    fromBase64.setBase64(base64);
    QCOMPARE(fromBase64.bytes(), bytes);
    QCOMPARE(sizeSpy.count(), 1);

    BinaryData fromHex;
    fromHex.setHex(hex.toUpper());
    QCOMPARE(fromHex.bytes(), bytes);
}

void tst_BinaryData::badBase64AndHex()
{
    BinaryData data;
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Invalid Base64"));
    data.setBase64(QStringLiteral("TW*Fu"));
    QCOMPARE(data.bytes(), QByteArray("Man"));

    QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Invalid hexadecimal"));
    data.setHex(QStringLiteral("4g"));
    QCOMPARE(data.size(), 1);

    QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Invalid hexadecimal"));
    data.setHex(QStringLiteral("abc"));
    QCOMPARE(data.size(), 2);

    // Blanks between byte pairs are fine and warn about nothing.
    data.setHex(QStringLiteral("de ad\nbe ef"));
    QCOMPARE(data.hex(), QStringLiteral("deadbeef"));
}

void tst_BinaryData::conversions()
{
    BinaryData data;
    QSignalSpy dataSpy(&data, &BinaryData::dataChanged);
    data.setData(QByteArray("\x00\x01", 2));
    data.setData(QByteArray("\x00\x01", 2));
    QCOMPARE(data.data().toByteArray(), QByteArray("\x00\x01", 2));
    QCOMPARE(dataSpy.count(), 1);
    data.setData(42);
    QCOMPARE(data.bytes(), QByteArray("42"));
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Unsupported:"));
    data.setData(QVariantList { 1, 2 });
    QCOMPARE(data.bytes(), QByteArray("42"));

    QJSEngine engine;
    QQmlEngine::setObjectOwnership(&data, QQmlEngine::CppOwnership);
    QScopedPointer<BinaryData> copy(BinaryData::create(engine.newQObject(&data)));
    QCOMPARE(copy->bytes(), QByteArray("42"));
    QCOMPARE(QQmlEngine::objectOwnership(copy.data()), QQmlEngine::JavaScriptOwnership);
    QVERIFY(!copy->parent());
    BinaryData other;
    other.setData(QVariant::fromValue<QObject *>(copy.data()));
    QCOMPARE(other.bytes(), QByteArray("42"));

    data.clear();
    QVERIFY(data.isNull());

    // Text in an encoding other than the object's own.
    data.setStringData(QStringLiteral("h\u00e9"), BinaryData::TextEncodingLatin1);
    QCOMPARE(data.hex(), QStringLiteral("68e9"));
    QCOMPARE(data.stringData(BinaryData::TextEncodingLatin1), QStringLiteral("h\u00e9"));
    data.setStringData(QStringLiteral("A\u20ac"), BinaryData::TextEncodingUtf16);
    QCOMPARE(data.hex(), QStringLiteral("4100ac20"));
    QCOMPARE(data.stringData(BinaryData::TextEncodingUtf16), QStringLiteral("A\u20ac"));
}

QTEST_MAIN(tst_BinaryData)
#include "tst_BinaryData.moc"
