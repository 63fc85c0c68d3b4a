#include "QExifValue.h"

#include <QTextCodec>
#include <QtTest>

class tst_QExifValue : public QObject
{
    Q_OBJECT

private slots:
    void typesAndCounts_data();
    void typesAndCounts();
    void scalars();
    void text_data();
    void text();
};

void tst_QExifValue::typesAndCounts_data()
{
    QTest::addColumn<QExifValue>("value");
    QTest::addColumn<int>("type");
    QTest::addColumn<quint32>("count");

    QTest::newRow("null") << QExifValue() << 0 << 0u;
    QTest::newRow("bytes") << QExifValue(QVector<quint8>{1, 2, 3}) << 1 << 3u;
    QTest::newRow("ascii counts its terminator") << QExifValue(QStringLiteral("hello")) << 2 << 6u;
    QTest::newRow("empty ascii") << QExifValue(QString()) << 2 << 1u;
    QTest::newRow("rationals are pairs") << QExifValue(QVector<QExifURational>{{1, 2}, {3, 4}, {5, 6}}) << 5 << 3u;
    QTest::newRow("undefined") << QExifValue(QByteArray("abcdef")) << 7 << 6u;
    QTest::newRow("signed long") << QExifValue(qint32(-5)) << 9 << 1u;
    QTest::newRow("signed rational") << QExifValue(QExifSRational(-1, 3)) << 10 << 1u;
    QTest::newRow("empty vector is not null") << QExifValue(QVector<quint16>()) << 3 << 0u;
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

void tst_QExifValue::scalars()
{
    // toShort and toLong widen smaller types; there is no signed scalar.
    QCOMPARE(QExifValue(quint8(200)).toShort(), quint16(200));
    QCOMPARE(QExifValue(quint16(65000)).toLong(), 65000u);
    QCOMPARE(QExifValue(qint32(-1)).toLong(), 0xffffffffu);
    // Only one element makes a scalar, and a type mismatch gives an empty result.
    QCOMPARE(QExifValue(QVector<quint32>{1, 2}).toLong(), 0u);
    QCOMPARE(QExifValue(QVector<quint8>{1, 2}).toByte(), quint8(0));
    QCOMPARE(QExifValue(QVector<QExifURational>{{1, 2}, {3, 4}}).toRational(), QExifURational(0, 0));
    QCOMPARE(QExifValue(quint32(5)).toShort(), quint16(0));
    QCOMPARE(QExifValue(qint32(5)).toLongVector(), QVector<quint32>());
    QCOMPARE(QExifValue(QExifURational(1, 2)).toSignedRational(), QExifSRational(0, 0));
    const QExifValue shortValue(quint16(5));
    QVERIFY(shortValue.toByteArray().isEmpty() && shortValue.toRationalVector().isEmpty() && shortValue.toString().isNull());
    QVERIFY(QExifValue().toByteArray().isNull());
}

void tst_QExifValue::text_data()
{
    QTest::addColumn<QExifValue>("value");
    QTest::addColumn<QByteArray>("payload");
    QTest::addColumn<QString>("text"); // null: no text

    QTest::newRow("plain") << QExifValue(QStringLiteral("abc")) << QByteArray() << QStringLiteral("abc");
    QTest::newRow("ascii prefix") << QExifValue(QStringLiteral("abc"), QExifValue::AsciiEncoding)
                                  << QByteArray("ASCII\0\0\0abc", 11) << QStringLiteral("abc");
    QTest::newRow("undefined prefix") << QExifValue(QStringLiteral("xyz"), QExifValue::UndefinedEncoding)
                                      << QByteArray("\0\0\0\0\0\0\0\0xyz", 11) << QStringLiteral("xyz");
    // The UTF-16 codec writes a byte-order mark, which stays in the value.
    QTest::newRow("unicode prefix") << QExifValue(QStringLiteral("é"), QExifValue::UnicodeEncoding)
                                    << QByteArray("UNICODE\0\xff\xfe\xe9\0", 12) << QStringLiteral("é");
    if (!QTextCodec::codecForName("JIS X 0208")) {
        QTest::newRow("jis without codec is plain")
            << QExifValue(QStringLiteral("abc"), QExifValue::JisEncoding) << QByteArray() << QStringLiteral("abc");
        QTest::newRow("jis prefix without codec reads null")
            << QExifValue(QByteArray("JIS\0\0\0\0\0abc", 11)) << QByteArray("JIS\0\0\0\0\0abc", 11) << QString();
    }
    QTest::newRow("prefix alone is null, not empty")
        << QExifValue(QByteArray("ASCII\0\0\0", 8)) << QByteArray("ASCII\0\0\0", 8) << QString();
    QTest::newRow("unknown prefix") << QExifValue(QByteArray("FOOBAR\0\0abc", 11)) << QByteArray("FOOBAR\0\0abc", 11)
                                    << QString();
    QTest::newRow("short undefined") << QExifValue(QByteArray("0230")) << QByteArray("0230") << QString();
    QTest::newRow("byte vector has no text") << QExifValue(QVector<quint8>{65, 66}) << QByteArray() << QString();
}

void tst_QExifValue::text()
{
    QFETCH(QExifValue, value);
    QFETCH(QByteArray, payload);
    QFETCH(QString, text);

    // An empty payload column means the value is not UNDEFINED.
    QCOMPARE(value.type() == QExifValue::Undefined, !payload.isEmpty());
    QCOMPARE(value.toByteArray(), payload);
    if (!payload.isEmpty())
        QCOMPARE(value.count(), quint32(payload.size()));
    QCOMPARE(value.toString(), text);
    QCOMPARE(value.toString().isNull(), text.isNull());
}

QTEST_APPLESS_MAIN(tst_QExifValue)
#include "tst_QExifValue.moc"
