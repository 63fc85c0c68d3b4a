#include "QExifValue.h"

#include <QTextCodec>
#include <QtTest>

class tst_QExifValue : public QObject
{
    Q_OBJECT

private slots:
    void typesAndCounts_data();
    void typesAndCounts();
    void scalarAccessors();
    void mismatchesGiveEmpty();
    void text_data();
    void text();
    void sharedCopies();
};

void tst_QExifValue::typesAndCounts_data()
{
    QTest::addColumn<QExifValue>("value");
    QTest::addColumn<int>("type");
    QTest::addColumn<quint32>("count");

    QTest::newRow("null") << QExifValue() << 0 << 0u;
    QTest::newRow("byte") << QExifValue(quint8(7)) << 1 << 1u;
    QTest::newRow("bytes") << QExifValue(QVector<quint8>{1, 2, 3}) << 1 << 3u;
    QTest::newRow("ascii counts its terminator") << QExifValue(QStringLiteral("hello")) << 2 << 6u;
    QTest::newRow("empty ascii") << QExifValue(QString()) << 2 << 1u;
    QTest::newRow("short") << QExifValue(quint16(3)) << 3 << 1u;
    QTest::newRow("longs") << QExifValue(QVector<quint32>{1, 2}) << 4 << 2u;
    QTest::newRow("rationals are pairs") << QExifValue(QVector<QExifURational>{{1, 2}, {3, 4}, {5, 6}}) << 5 << 3u;
    QTest::newRow("undefined") << QExifValue(QByteArray("abcdef")) << 7 << 6u;
    QTest::newRow("signed long") << QExifValue(qint32(-5)) << 9 << 1u;
    QTest::newRow("signed rational") << QExifValue(QExifSRational(-1, 3)) << 10 << 1u;
    QTest::newRow("empty vector") << QExifValue(QVector<quint16>()) << 3 << 0u;
}

void tst_QExifValue::typesAndCounts()
{
    QFETCH(QExifValue, value);
    QFETCH(int, type);
    QFETCH(quint32, count);
    QCOMPARE(value.type(), type);
    QCOMPARE(value.count(), count);
    QCOMPARE(value.isNull(), type == 0);
}

void tst_QExifValue::scalarAccessors()
{
    // toShort and toLong widen smaller types; there is no signed scalar.
    QCOMPARE(QExifValue(quint8(200)).toShort(), quint16(200));
    QCOMPARE(QExifValue(quint8(200)).toLong(), 200u);
    QCOMPARE(QExifValue(quint16(65000)).toLong(), 65000u);
    QCOMPARE(QExifValue(quint32(4000000000u)).toLong(), 4000000000u);
    QCOMPARE(QExifValue(qint32(-1)).toLong(), 0xffffffffu);
    QCOMPARE(QExifValue(QExifURational(3, 4)).toRational(), QExifURational(3, 4));
    QCOMPARE(QExifValue(QExifSRational(-3, 4)).toSignedRational(), QExifSRational(-3, 4));
    QCOMPARE(QExifValue(quint8(9)).toByte(), quint8(9));

    // Only one element makes a scalar.
    QCOMPARE(QExifValue(QVector<quint32>{1, 2}).toLong(), 0u);
    QCOMPARE(QExifValue(QVector<quint16>{1, 2}).toShort(), quint16(0));
    QCOMPARE(QExifValue(QVector<quint8>{1, 2}).toByte(), quint8(0));
    QCOMPARE(QExifValue(QVector<QExifURational>{{1, 2}, {3, 4}}).toRational(), QExifURational(0, 0));
    QCOMPARE(QExifValue(QVector<quint16>()).toLong(), 0u);
}

void tst_QExifValue::mismatchesGiveEmpty()
{
    const QExifValue shortValue(quint16(5));
    QVERIFY(shortValue.toByteVector().isEmpty());
    QVERIFY(shortValue.toByteArray().isEmpty());
    QVERIFY(shortValue.toLongVector().isEmpty());
    QVERIFY(shortValue.toRationalVector().isEmpty());
    QVERIFY(shortValue.toString().isNull());
    QCOMPARE(shortValue.toByte(), quint8(0));
    QCOMPARE(shortValue.toRational(), QExifURational(0, 0));
    QCOMPARE(shortValue.toShortVector(), QVector<quint16>{5});

    const QExifValue longValue(quint32(5));
    QCOMPARE(longValue.toShort(), quint16(0));
    QVERIFY(longValue.toSignedLongVector().isEmpty());
    QCOMPARE(QExifValue(qint32(5)).toLongVector(), QVector<quint32>());
    QCOMPARE(QExifValue(QExifURational(1, 2)).toSignedRational(), QExifSRational(0, 0));
    QVERIFY(QExifValue(QExifSRational(1, 2)).toRationalVector().isEmpty());

    const QExifValue null;
    QCOMPARE(null.toLong(), 0u);
    QVERIFY(null.toString().isNull());
    QVERIFY(null.toByteArray().isNull());
}

void tst_QExifValue::text_data()
{
    QTest::addColumn<QExifValue>("value");
    QTest::addColumn<int>("type");
    QTest::addColumn<QByteArray>("payload");
    QTest::addColumn<QString>("text");
    QTest::addColumn<bool>("textIsNull");

    const bool hasJis = QTextCodec::codecForName("JIS X 0208") != nullptr;

    QTest::newRow("plain") << QExifValue(QStringLiteral("abc")) << 2 << QByteArray() << QStringLiteral("abc") << false;
    QTest::newRow("ascii prefix") << QExifValue(QStringLiteral("abc"), QExifValue::AsciiEncoding) << 7
                                  << QByteArray("ASCII\0\0\0abc", 11) << QStringLiteral("abc") << false;
    QTest::newRow("undefined prefix") << QExifValue(QStringLiteral("xyz"), QExifValue::UndefinedEncoding) << 7
                                      << QByteArray("\0\0\0\0\0\0\0\0xyz", 11) << QStringLiteral("xyz") << false;
    // The UTF-16 codec writes a byte-order mark, which stays in the value.
    QTest::newRow("unicode prefix") << QExifValue(QStringLiteral("é"), QExifValue::UnicodeEncoding) << 7
                                    << QByteArray("UNICODE\0\xff\xfe\xe9\0", 12) << QStringLiteral("é") << false;
    if (!hasJis) {
        QTest::newRow("jis without codec is plain")
            << QExifValue(QStringLiteral("abc"), QExifValue::JisEncoding) << 2 << QByteArray() << QStringLiteral("abc")
            << false;
        QTest::newRow("jis prefix without codec reads null")
            << QExifValue(QByteArray("JIS\0\0\0\0\0abc", 11)) << 7 << QByteArray("JIS\0\0\0\0\0abc", 11) << QString()
            << true;
    }
    QTest::newRow("prefix alone is null, not empty")
        << QExifValue(QByteArray("ASCII\0\0\0", 8)) << 7 << QByteArray("ASCII\0\0\0", 8) << QString() << true;
    QTest::newRow("unknown prefix") << QExifValue(QByteArray("FOOBAR\0\0abc", 11)) << 7
                                    << QByteArray("FOOBAR\0\0abc", 11) << QString() << true;
    QTest::newRow("short undefined") << QExifValue(QByteArray("0230")) << 7 << QByteArray("0230") << QString() << true;
    QTest::newRow("byte vector has no text") << QExifValue(QVector<quint8>{65, 66}) << 1 << QByteArray() << QString()
                                             << true;
}

void tst_QExifValue::text()
{
    QFETCH(QExifValue, value);
    QFETCH(int, type);
    QFETCH(QByteArray, payload);
    QFETCH(QString, text);
    QFETCH(bool, textIsNull);

    QCOMPARE(value.type(), type);
    if (type == QExifValue::Undefined) {
        QCOMPARE(value.toByteArray(), payload);
        QCOMPARE(value.count(), quint32(payload.size()));
    }
    QCOMPARE(value.toString(), text);
    QCOMPARE(value.toString().isNull(), textIsNull);
}

void tst_QExifValue::sharedCopies()
{
    QExifValue a(QVector<quint32>{1, 2, 3});
    QExifValue b = a;
    a = QExifValue(quint8(1));
    QCOMPARE(b.toLongVector(), (QVector<quint32>{1, 2, 3}));
    QCOMPARE(a.type(), 1);

    // Null values all share the one instance, also after copies go away.
    {
        QExifValue n1;
        QExifValue n2 = n1;
        QVERIFY(n2.isNull());
    }
    QVERIFY(QExifValue().isNull());
    QVERIFY(!QExifValue(QVector<quint8>()).isNull());
}

QTEST_APPLESS_MAIN(tst_QExifValue)
#include "tst_QExifValue.moc"
