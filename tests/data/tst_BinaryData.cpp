#include "BinaryData.h"

#include <QJSEngine>
#include <QQmlEngine>
#include <QSignalSpy>
#include <QtTest>

class tst_BinaryData : public QObject
{
    Q_OBJECT

private slots:
    void typedRoundTrip_data();
    void typedRoundTrip();
    void readBounds();
    void writeGrowsAndSignals();
    void wideIntegersTakeThirtyTwoBits();
    void nullValueWritesNothing();
    void fill();
    void encodings_data();
    void encodings();
    void base64AndHex_data();
    void base64AndHex();
    void badBase64AndHex();
    void dataProperty();
    void factories();
    void sizeProperty();
};

void tst_BinaryData::typedRoundTrip_data()
{
    QTest::addColumn<int>("type");
    QTest::addColumn<int>("byteOrder");
    QTest::addColumn<double>("value");
    QTest::addColumn<QByteArray>("hex");
    QTest::addColumn<double>("readBack");

    const int le = BinaryData::LittleEndian;
    const int be = BinaryData::BigEndian;
    QTest::newRow("uint8") << int(BinaryData::TypeUInt8) << le << 200.0 << QByteArray("c8") << 200.0;
    QTest::newRow("int8 negative") << int(BinaryData::TypeInt8) << le << -2.0 << QByteArray("fe") << -2.0;
    QTest::newRow("uint8 wraps") << int(BinaryData::TypeUInt8) << le << 257.0 << QByteArray("01") << 1.0;
    QTest::newRow("uint16 le") << int(BinaryData::TypeUInt16) << le << 4660.0 << QByteArray("3412") << 4660.0;
    QTest::newRow("uint16 be") << int(BinaryData::TypeUInt16) << be << 4660.0 << QByteArray("1234") << 4660.0;
    QTest::newRow("int16 be negative") << int(BinaryData::TypeInt16) << be << -2.0 << QByteArray("fffe") << -2.0;
    QTest::newRow("uint32 be") << int(BinaryData::TypeUInt32) << be << 305419896.0 << QByteArray("12345678")
                               << 305419896.0;
    QTest::newRow("uint32 max") << int(BinaryData::TypeUInt32) << le << 4294967295.0 << QByteArray("ffffffff")
                                << 4294967295.0;
    QTest::newRow("int32 le") << int(BinaryData::TypeInt32) << le << -1.0 << QByteArray("ffffffff") << -1.0;
    QTest::newRow("int64 be") << int(BinaryData::TypeInt64) << be << -2.0 << QByteArray("fffffffffffffffe") << -2.0;
    QTest::newRow("uint64 le") << int(BinaryData::TypeUInt64) << le << 258.0 << QByteArray("0201000000000000")
                               << 258.0;
    QTest::newRow("single be") << int(BinaryData::TypeSingle) << be << 1.5 << QByteArray("3fc00000") << 1.5;
    QTest::newRow("single narrows") << int(BinaryData::TypeSingle) << le << 0.1 << QByteArray("cdcccc3d")
                                    << double(0.1f);
    QTest::newRow("double le") << int(BinaryData::TypeDouble) << le << -0.5 << QByteArray("000000000000e0bf")
                               << -0.5;
    QTest::newRow("double be") << int(BinaryData::TypeDouble) << be << 2.0 << QByteArray("4000000000000000") << 2.0;
}

void tst_BinaryData::typedRoundTrip()
{
    QFETCH(int, type);
    QFETCH(int, byteOrder);
    QFETCH(double, value);
    QFETCH(QByteArray, hex);
    QFETCH(double, readBack);

    BinaryData data;
    const int next = data.setDataAt(1, QJSValue(value), BinaryData::Type(type), BinaryData::ByteOrder(byteOrder));
    QCOMPARE(next, 1 + hex.size() / 2);
    QCOMPARE(data.hex(), QString::fromLatin1("00" + hex));
    const QJSValue read = data.dataAt(1, BinaryData::Type(type), BinaryData::ByteOrder(byteOrder));
    QVERIFY(read.isNumber());
    QCOMPARE(read.toNumber(), readBack);
}

void tst_BinaryData::readBounds()
{
    BinaryData data;
    data.setHex(QStringLiteral("0102030405"));
    QVERIFY(data.dataAt(4, BinaryData::TypeUInt16).isUndefined());
    QCOMPARE(data.dataAt(4).toInt(), 5);
    QCOMPARE(data.dataAt(3, BinaryData::TypeUInt16, BinaryData::BigEndian).toInt(), 0x0405);
    QVERIFY(data.dataAt(-1).isUndefined());
    QVERIFY(data.dataAt(5).isUndefined());
    QVERIFY(data.dataAt(2147483647, BinaryData::TypeDouble).isUndefined());
    // 10 is QMetaType::QString: a metatype, but not one of the buffer's types.
    QVERIFY(data.dataAt(0, BinaryData::Type(10)).isUndefined());
}

void tst_BinaryData::writeGrowsAndSignals()
{
    BinaryData data;
    data.setHex(QStringLiteral("aabbccdd"));
    QSignalSpy sizeSpy(&data, &BinaryData::sizeChanged);
    QSignalSpy dataSpy(&data, &BinaryData::dataChanged);

    QCOMPARE(data.setDataAt(10, QJSValue(1)), 11);
    QCOMPARE(data.size(), 11);
    QCOMPARE(sizeSpy.count(), 1);
    QCOMPARE(dataSpy.count(), 1);
    // The gap is zero, not left over memory.
    QCOMPARE(data.hex(), QStringLiteral("aabbccdd00000000000001"));

    QCOMPARE(data.setDataAt(0, QJSValue(7)), 1);
    QCOMPARE(sizeSpy.count(), 1);
    QCOMPARE(dataSpy.count(), 2);

    QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Index out of range"));
    QCOMPARE(data.setDataAt(-1, QJSValue(7)), -1);
    QCOMPARE(data.size(), 11);
}

void tst_BinaryData::wideIntegersTakeThirtyTwoBits()
{
    BinaryData data;
    data.setDataAt(0, QJSValue(4294967296.0), BinaryData::TypeInt64);
    QVERIFY(data.dataAt(0, BinaryData::TypeInt64).toNumber() != 4294967296.0);
    QCOMPARE(data.dataAt(0, BinaryData::TypeInt64).toNumber(), 0.0);

    data.setDataAt(0, QJSValue(-5), BinaryData::TypeUInt64);
    QCOMPARE(data.hex(), QStringLiteral("fbffffffffffffff"));
}

void tst_BinaryData::nullValueWritesNothing()
{
    BinaryData data;
    data.setHex(QStringLiteral("01"));
    QSignalSpy sizeSpy(&data, &BinaryData::sizeChanged);
    QSignalSpy dataSpy(&data, &BinaryData::dataChanged);
    QCOMPARE(data.setDataAt(0, QJSValue(QJSValue::NullValue)), -1);
    QCOMPARE(data.setDataAt(5, QJSValue(QJSValue::UndefinedValue)), -1);
    QCOMPARE(data.hex(), QStringLiteral("01"));
    QCOMPARE(sizeSpy.count() + dataSpy.count(), 0);
}

void tst_BinaryData::fill()
{
    BinaryData data;
    QSignalSpy sizeSpy(&data, &BinaryData::sizeChanged);
    QSignalSpy dataSpy(&data, &BinaryData::dataChanged);
    data.fill(255);
    QVERIFY(data.isEmpty());
    QCOMPARE(sizeSpy.count(), 0);
    QCOMPARE(dataSpy.count(), 1);

    data.fill(0x41, 3);
    QCOMPARE(data.stringData(), QStringLiteral("AAA"));
    QCOMPARE(sizeSpy.count(), 1);
    data.fill(0x42);
    QCOMPARE(data.stringData(), QStringLiteral("BBB"));
    QCOMPARE(sizeSpy.count(), 1);
}

void tst_BinaryData::encodings_data()
{
    QTest::addColumn<int>("encoding");
    QTest::addColumn<QString>("text");
    QTest::addColumn<QByteArray>("hex");

    QTest::newRow("utf8") << int(BinaryData::TextEncodingUtf8) << QStringLiteral("h\u00e9\u20ac")
                          << QByteArray("68c3a9e282ac");
    QTest::newRow("latin1") << int(BinaryData::TextEncodingLatin1) << QStringLiteral("h\u00e9")
                            << QByteArray("68e9");
    QTest::newRow("utf16") << int(BinaryData::TextEncodingUtf16) << QStringLiteral("A\u20ac")
                           << QByteArray("4100ac20");
}

void tst_BinaryData::encodings()
{
    QFETCH(int, encoding);
    QFETCH(QString, text);
    QFETCH(QByteArray, hex);

    BinaryData data;
    data.setStringData(text, BinaryData::TextEncoding(encoding));
    QCOMPARE(data.hex().toLatin1(), hex);
    QCOMPARE(data.stringData(BinaryData::TextEncoding(encoding)), text);

    // The object's own encoding drives strings given as data.
    BinaryData viaProperty;
    viaProperty.setTextEncoding(BinaryData::TextEncoding(encoding));
    viaProperty.setData(text);
    QCOMPARE(viaProperty.hex().toLatin1(), hex);
    QCOMPARE(viaProperty.stringData(), text);
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
    QSignalSpy dataSpy(&fromBase64, &BinaryData::dataChanged);
    QSignalSpy sizeSpy(&fromBase64, &BinaryData::sizeChanged);
    fromBase64.setBase64(base64);
    QCOMPARE(fromBase64.bytes(), bytes);
    QCOMPARE(dataSpy.count(), 1);
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

void tst_BinaryData::dataProperty()
{
    BinaryData data;
    QSignalSpy dataSpy(&data, &BinaryData::dataChanged);
    QSignalSpy sizeSpy(&data, &BinaryData::sizeChanged);

    data.setData(QByteArray("\x00\x01", 2));
    QCOMPARE(data.data().toByteArray(), QByteArray("\x00\x01", 2));
    QCOMPARE(dataSpy.count(), 1);
    QCOMPARE(sizeSpy.count(), 1);

    data.setData(QByteArray("\x00\x01", 2));
    QCOMPARE(dataSpy.count(), 1);

    data.setData(42);
    QCOMPARE(data.bytes(), QByteArray("42"));

    QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Unsupported:"));
    data.setData(QVariantList { 1, 2 });
    QCOMPARE(data.bytes(), QByteArray("42"));

    BinaryData other;
    other.setData(QVariant::fromValue<QObject *>(&data));
    QCOMPARE(other.bytes(), QByteArray("42"));

    data.clear();
    QVERIFY(data.isNull());
    QVERIFY(data.isEmpty());
}

void tst_BinaryData::factories()
{
    QJSEngine engine;
    QScopedPointer<BinaryData> fromBuffer(
        BinaryData::create(engine.evaluate(QStringLiteral("new Uint8Array([1, 2, 250]).buffer"))));
    QCOMPARE(fromBuffer->hex(), QStringLiteral("0102fa"));
    QCOMPARE(QQmlEngine::objectOwnership(fromBuffer.data()), QQmlEngine::JavaScriptOwnership);
    QVERIFY(!fromBuffer->parent());
    // The scoped pointer owns it here, not the script engine's collector.
    QQmlEngine::setObjectOwnership(fromBuffer.data(), QQmlEngine::CppOwnership);

    QScopedPointer<BinaryData> fromText(BinaryData::create(QJSValue(QStringLiteral("\u00e9")),
                                                           BinaryData::TextEncodingLatin1));
    QCOMPARE(fromText->hex(), QStringLiteral("e9"));

    QScopedPointer<BinaryData> fromNothing(BinaryData::create(QJSValue()));
    QVERIFY(fromNothing->isEmpty());

    QScopedPointer<BinaryData> copy(BinaryData::create(engine.newQObject(fromBuffer.data())));
    QCOMPARE(copy->bytes(), fromBuffer->bytes());
}

void tst_BinaryData::sizeProperty()
{
    BinaryData data;
    QSignalSpy sizeSpy(&data, &BinaryData::sizeChanged);
    data.setSize(0);
    QCOMPARE(sizeSpy.count(), 0);
    data.setSize(3);
    QCOMPARE(data.hex(), QStringLiteral("000000"));
    QCOMPARE(sizeSpy.count(), 1);
    data.setSize(3);
    QCOMPARE(sizeSpy.count(), 1);
    data.setSize(-4);
    QCOMPARE(data.size(), 0);
    QCOMPARE(sizeSpy.count(), 2);
}

QTEST_MAIN(tst_BinaryData)
#include "tst_BinaryData.moc"
