#include "ExifInfo.h"
#include "ExifTestSupport.h"
#include "TestSupport.h"

#include <QFile>
#include <QSignalSpy>
#include <QTemporaryDir>
#include <QtTest>

#include <cmath>

using namespace ExifTestSupport;

Q_DECLARE_METATYPE(QExifURational)

namespace {

enum Group { Image = QExifImageHeader::ImageGroup, Extended = QExifImageHeader::ExtendedGroup, Gps = QExifImageHeader::GpsGroup };

QExifValue stored(ExifInfo &info, Group group, int tag)
{
    return info.header().value(QExifImageHeader::Group(group), tag);
}

void store(ExifInfo &info, Group group, int tag, const QVariant &value)
{
    switch (group) {
    case Image:
        info.setImageValue(ExifInfo::ImageTag(tag), value);
        break;
    case Extended:
        info.setExtendedValue(ExifInfo::ExtendedTag(tag), value);
        break;
    case Gps:
        info.setGpsValue(ExifInfo::GpsTag(tag), value);
        break;
    }
}

// A value's payload as a list of variants, whatever its type.
QVariantList payload(const QExifValue &value)
{
    QVariantList list;
    switch (value.type()) {
    case QExifValue::Byte:
        for (quint8 v : value.toByteVector())
            list.append(int(v));
        break;
    case QExifValue::Ascii:
        list.append(value.toString());
        break;
    case QExifValue::Short:
        for (quint16 v : value.toShortVector())
            list.append(int(v));
        break;
    case QExifValue::Long:
        for (quint32 v : value.toLongVector())
            list.append(v);
        break;
    case QExifValue::Rational:
        for (const QExifURational &v : value.toRationalVector())
            list.append(QStringLiteral("%1/%2").arg(v.first).arg(v.second));
        break;
    case QExifValue::SignedRational:
        for (const QExifSRational &v : value.toSignedRationalVector())
            list.append(QStringLiteral("%1/%2").arg(v.first).arg(v.second));
        break;
    case QExifValue::Undefined:
        list.append(value.toByteArray());
        break;
    default:
        break;
    }
    return list;
}

} // namespace

class tst_ExifInfo : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void conversions_data();
    void conversions();
    void rationals_data();
    void rationals();
    void toVariant_data();
    void toVariant();
    void xpText();
    void gpsProperties();
    void enumsAndNames();
    void valuesMap();
    void loadsExiftoolFile();
    void loadSignalsAndRepeats();
    void savesForExiftool();
    void versionChecks_data();
    void versionChecks();

private:
    QTemporaryDir m_dir;
};

void tst_ExifInfo::initTestCase()
{
    QVERIFY(m_dir.isValid());
}

void tst_ExifInfo::conversions_data()
{
    QTest::addColumn<int>("group");
    QTest::addColumn<int>("tag");
    QTest::addColumn<QVariant>("input");
    QTest::addColumn<int>("type");
    QTest::addColumn<QVariantList>("expected");

    const QDateTime date(QDate(2024, 5, 6), QTime(7, 8, 9));
    QTest::newRow("width is one LONG") << int(Image) << int(ExifInfo::ImageWidth) << QVariant(100) << 4
                                       << QVariantList{100u};
    QTest::newRow("scalar padded to the row's size")
        << int(Image) << int(ExifInfo::ImageBitsPerSample) << QVariant(8) << 3 << QVariantList{8, 0, 0};
    QTest::newRow("list cut to the row's size")
        << int(Image) << int(ExifInfo::ImageBitsPerSample) << QVariant(QVariantList{8, 8, 8, 8}) << 3
        << QVariantList{8, 8, 8};
    QTest::newRow("double truncated") << int(Image) << int(ExifInfo::ImageOrientation) << QVariant(6.9) << 3
                                      << QVariantList{6};
    QTest::newRow("numbers narrow") << int(Image) << int(ExifInfo::ImageOrientation) << QVariant(65537) << 3
                                    << QVariantList{1};
    // Digit strings are split, but the digits stay text and are skipped.
    QTest::newRow("digit string") << int(Image) << int(ExifInfo::ImageBitsPerSample) << QVariant(QStringLiteral("8,8,8"))
                                  << 3 << QVariantList();
    QTest::newRow("text in a number list is skipped")
        << int(Image) << int(ExifInfo::ImageStripOffsets) << QVariant(QVariantList{1, QStringLiteral("x"), 3u}) << 4
        << QVariantList{1u, 3u};
    QTest::newRow("ascii with terminator") << int(Image) << int(ExifInfo::ImageDescription)
                                           << QVariant(QStringLiteral("abc")) << 2 << QVariantList{QStringLiteral("abc")};
    QTest::newRow("date as text") << int(Image) << int(ExifInfo::ImageDateTime) << QVariant(date) << 2
                                  << QVariantList{QStringLiteral("2024:05:06 07:08:09")};
    QTest::newRow("ascii padded to size") << int(Gps) << int(ExifInfo::GPSDateStamp) << QVariant(QStringLiteral("2024"))
                                          << 2 << QVariantList{QStringLiteral("2024      ")};
    QTest::newRow("ascii cut to size") << int(Gps) << int(ExifInfo::GPSLatitudeRef) << QVariant(QStringLiteral("North"))
                                       << 2 << QVariantList{QStringLiteral("N")};
    QTest::newRow("version as bytes") << int(Extended) << int(ExifInfo::ExtendedExifVersion)
                                      << QVariant(QStringLiteral("0230")) << 7 << QVariantList{QByteArray("0230")};
    QTest::newRow("undefined padded") << int(Extended) << int(ExifInfo::ExtendedFlashPixVersion)
                                      << QVariant(QByteArray("01")) << 7 << QVariantList{QByteArray("01\0\0", 4)};
    QTest::newRow("undefined from a number") << int(Extended) << int(ExifInfo::ExtendedFileSource) << QVariant(3) << 7
                                             << QVariantList{QByteArray("\3")};
    QTest::newRow("undefined from a list") << int(Extended) << int(ExifInfo::ExtendedSceneType)
                                           << QVariant(QVariantList{1}) << 7 << QVariantList{QByteArray("\0", 1)};
    QTest::newRow("signed rational") << int(Extended) << int(ExifInfo::ExtendedExposureBiasValue) << QVariant(-0.5)
                                     << 10 << QVariantList{QStringLiteral("-1/2")};
    QTest::newRow("odd number stays") << int(Extended) << int(ExifInfo::ExtendedSubjectDistanceRange) << QVariant(2)
                                      << 3 << QVariantList{2};
    QTest::newRow("GPS version") << int(Gps) << int(ExifInfo::GPSVersionID) << QVariant(QVariantList{2, 3}) << 1
                                 << QVariantList{2, 3, 0, 0};
    QTest::newRow("coordinate from a number") << int(Gps) << int(ExifInfo::GPSLatitude) << QVariant(33.5) << 5
                                              << QVariantList{QStringLiteral("33/1"), QStringLiteral("30/1"),
                                                              QStringLiteral("0/1")};
    QTest::newRow("coordinate from text") << int(Gps) << int(ExifInfo::GPSLongitude) << QVariant(QStringLiteral("151.25"))
                                          << 5
                                          << QVariantList{QStringLiteral("151/1"), QStringLiteral("15/1"),
                                                          QStringLiteral("0/1")};
    QTest::newRow("time stamp from a date") << int(Gps) << int(ExifInfo::GPSTimeStamp)
                                            << QVariant(QDateTime(QDate(2024, 1, 1), QTime(10, 20, 30, 500), Qt::UTC))
                                            << 5
                                            << QVariantList{QStringLiteral("10/1"), QStringLiteral("20/1"),
                                                            QStringLiteral("305/10")};
    QTest::newRow("rational list padded") << int(Image) << int(ExifInfo::ImageWhitePoint) << QVariant(QVariantList{0.5})
                                          << 5 << QVariantList{QStringLiteral("5/10"), QStringLiteral("0/1")};

    // Tags without a row go by the value's type.
    const int fallback = ExifInfo::ImageYCbCrPosition;
    QTest::newRow("fallback int is SHORT") << int(Image) << fallback << QVariant(1) << 3 << QVariantList{1};
    QTest::newRow("fallback uint is LONG") << int(Image) << fallback << QVariant(7u) << 4 << QVariantList{7u};
    QTest::newRow("fallback double is RATIONAL") << int(Image) << fallback << QVariant(0.1) << 5
                                                 << QVariantList{QStringLiteral("1/10")};
    QTest::newRow("fallback int list is BYTE") << int(Image) << fallback << QVariant(QVariantList{1, 2}) << 1
                                               << QVariantList{1, 2};
    QTest::newRow("fallback uint list is LONG") << int(Image) << fallback << QVariant(QVariantList{1u, 2}) << 4
                                                << QVariantList{1u, 2u};
    QTest::newRow("fallback double list is RATIONAL")
        << int(Image) << fallback << QVariant(QVariantList{0.5, 2}) << 5
        << QVariantList{QStringLiteral("5/10"), QStringLiteral("2/1")};
    QTest::newRow("fallback text list is null") << int(Image) << fallback
                                                << QVariant(QStringList{QStringLiteral("a")}) << 0 << QVariantList();
    QTest::newRow("fallback empty list is null") << int(Image) << fallback << QVariant(QVariantList()) << 0
                                                 << QVariantList();
    QTest::newRow("fallback bool is null") << int(Image) << fallback << QVariant(true) << 0 << QVariantList();
    QTest::newRow("fallback text") << int(Extended) << 12345 << QVariant(QStringLiteral("x")) << 2
                                   << QVariantList{QStringLiteral("x")};
    QTest::newRow("fallback bytes") << int(Gps) << 99 << QVariant(QByteArray("raw")) << 7
                                    << QVariantList{QByteArray("raw")};
}

void tst_ExifInfo::conversions()
{
    QFETCH(int, group);
    QFETCH(int, tag);
    QFETCH(QVariant, input);
    QFETCH(int, type);
    QFETCH(QVariantList, expected);

    ExifInfo info;
    QSignalSpy changed(&info, &ExifInfo::exifChanged);
    QVERIFY(!info.isExifValid());
    store(info, Group(group), tag, input);
    QCOMPARE(changed.count(), 1);
    QVERIFY(info.isExifValid());
    const QExifValue value = stored(info, Group(group), tag);
    QCOMPARE(value.type(), type);
    QCOMPARE(payload(value), expected);
    if (type == QExifValue::Ascii)
        QCOMPARE(value.count(), quint32(value.toString().size() + 1));
}

void tst_ExifInfo::rationals_data()
{
    QTest::addColumn<double>("value");
    QTest::addColumn<QExifURational>("unsignedForm");
    QTest::addColumn<QString>("signedForm");

    QTest::newRow("half") << 0.5 << QExifURational(5, 10) << QStringLiteral("1/2");
    QTest::newRow("third") << 1.0 / 3 << QExifURational(333333, 1000000) << QStringLiteral("1/3");
    QTest::newRow("tenth") << 0.1 << QExifURational(1, 10) << QStringLiteral("1/10");
    QTest::newRow("zero") << 0.0 << QExifURational(0, 1) << QStringLiteral("0/1");
    QTest::newRow("whole") << 300.0 << QExifURational(300, 1) << QStringLiteral("300/1");
    QTest::newRow("two and a half") << 2.5 << QExifURational(25, 10) << QStringLiteral("25/10");
    QTest::newRow("negative has no unsigned form") << -2.5 << QExifURational(0, 9999) << QStringLiteral("-25/10");
    QTest::newRow("small negative") << -0.25 << QExifURational(0, 9999) << QStringLiteral("-1/4");
    QTest::newRow("pi") << M_PI << QExifURational(314159, 100000) << QStringLiteral("314159/100000");
    // Ten steps at most; the tenth power of ten wraps in 32 bits.
    QTest::newRow("tiny") << 1e-12 << QExifURational(0, 1410065408) << QString();
}

void tst_ExifInfo::rationals()
{
    QFETCH(double, value);
    QFETCH(QExifURational, unsignedForm);
    QFETCH(QString, signedForm);

    QCOMPARE(ExifInfo::toRational(value), unsignedForm);
    const QExifSRational s = ExifInfo::toSignedRational(value);
    if (!signedForm.isNull())
        QCOMPARE(QStringLiteral("%1/%2").arg(s.first).arg(s.second), signedForm);
    if (value != 0 && std::fabs(value) > 1e-9)
        QVERIFY(std::fabs(double(s.first) / s.second - value) <= std::fabs(value) * 1e-6);
}

void tst_ExifInfo::toVariant_data()
{
    QTest::addColumn<QExifValue>("value");
    QTest::addColumn<QVariant>("expected");

    QTest::newRow("date text") << QExifValue(QStringLiteral("2024:05:06 07:08:09"))
                               << QVariant(QDateTime(QDate(2024, 5, 6), QTime(7, 8, 9)));
    QTest::newRow("not quite a date") << QExifValue(QStringLiteral("2024:05:06 07:08:09 "))
                                      << QVariant(QStringLiteral("2024:05:06 07:08:09 "));
    QTest::newRow("date and a line feed") << QExifValue(QStringLiteral("2024:05:06 07:08:09\n"))
                                          << QVariant(QStringLiteral("2024:05:06 07:08:09\n"));
    QTest::newRow("undefined") << QExifValue(QByteArray("0230")) << QVariant(QByteArray("0230"));
    QTest::newRow("byte") << QExifValue(quint8(200)) << QVariant(200);
    QTest::newRow("short") << QExifValue(quint16(65535)) << QVariant(65535);
    QTest::newRow("long") << QExifValue(quint32(4000000000u)) << QVariant(4000000000u);
    QTest::newRow("signed long") << QExifValue(qint32(-7)) << QVariant(-7);
    QTest::newRow("rational") << QExifValue(QExifURational(1, 4)) << QVariant(0.25);
    QTest::newRow("signed rational") << QExifValue(QExifSRational(-3, 4)) << QVariant(-0.75);
    QTest::newRow("zero denominator") << QExifValue(QExifURational(1, 0)) << QVariant(qInf());
    QTest::newRow("list") << QExifValue(QVector<quint16>{1, 2}) << QVariant(QVariantList{1, 2});
    QTest::newRow("rational list") << QExifValue(QVector<QExifURational>{{1, 2}, {3, 1}})
                                   << QVariant(QVariantList{0.5, 3.0});
    QTest::newRow("null") << QExifValue() << QVariant();
}

void tst_ExifInfo::toVariant()
{
    QFETCH(QExifValue, value);
    QFETCH(QVariant, expected);
    const QVariant actual = ExifInfo::toVariant(value);
    QCOMPARE(actual.userType(), expected.userType());
    if (expected.userType() == QMetaType::Double)
        QCOMPARE(actual.toDouble(), expected.toDouble());
    else
        QCOMPARE(actual, expected);
}

void tst_ExifInfo::xpText()
{
    ExifInfo info;
    info.setImageValue(ExifInfo::ImageXPTitle, QStringLiteral("Hé"));
    const QExifValue value = info.header().imageValue(ExifInfo::ImageXPTitle);
    QCOMPARE(value.type(), 1);
    QCOMPARE(value.toByteVector(), (QVector<quint8>{'H', 0, 0xe9, 0}));
    QCOMPARE(info.imageValue(ExifInfo::ImageXPTitle), QVariant(QStringLiteral("Hé")));

    // Trailing NUL pairs, as Windows writes them, are dropped on reading.
    info.header().setImageValue(ExifInfo::ImageXPAuthor, QExifValue(QVector<quint8>{'A', 0, 'b', 0, 0, 0, 0, 0}));
    QCOMPARE(info.imageValue(ExifInfo::ImageXPAuthor), QVariant(QStringLiteral("Ab")));
    // Only BYTE values are text; other groups have no such step.
    info.header().setImageValue(ExifInfo::ImageXPComment, QExifValue(QByteArray("raw")));
    QCOMPARE(info.imageValue(ExifInfo::ImageXPComment), QVariant(QByteArray("raw")));
    QVERIFY(!info.imageValue(ExifInfo::ImageXPSubject).isValid());
}

void tst_ExifInfo::gpsProperties()
{
    ExifInfo info;
    QVERIFY(std::isnan(info.gpsLatitude()));
    QVERIFY(std::isnan(info.gpsLongitude()));
    QVERIFY(std::isnan(info.gpsAltitude()));

    info.setGpsLatitude(-33.5);
    QCOMPARE(info.gpsValue(ExifInfo::GPSLatitudeRef), QVariant(QStringLiteral("S")));
    QCOMPARE(info.gpsValue(ExifInfo::GPSLatitude), QVariant(QVariantList{33.0, 30.0, 0.0}));
    QCOMPARE(info.gpsLatitude(), -33.5);

    info.setGpsLongitude(-151.2093);
    QCOMPARE(info.gpsValue(ExifInfo::GPSLongitudeRef), QVariant(QStringLiteral("W")));
    QVERIFY(std::fabs(info.gpsLongitude() + 151.2093) < 1e-7);
    info.setGpsLongitude(8.25);
    QCOMPARE(info.gpsValue(ExifInfo::GPSLongitudeRef), QVariant(QStringLiteral("E")));
    QCOMPARE(info.gpsLongitude(), 8.25);

    // Below sea level is stored, but the reading ignores it.
    info.setGpsAltitude(-12.5);
    QCOMPARE(info.gpsValue(ExifInfo::GPSAltitudeRef), QVariant(1));
    QCOMPARE(info.gpsAltitude(), 12.5);

    // A lower-case reference counts, and a single rational is plain degrees.
    info.header().setGpsValue(ExifInfo::GPSLatitudeRef, QExifValue(QStringLiteral("s")));
    info.header().setGpsValue(ExifInfo::GPSLatitude, QExifValue(QExifURational(45, 2)));
    QCOMPARE(info.gpsLatitude(), -22.5);
    info.header().setGpsValue(ExifInfo::GPSLatitude, QExifValue(QVector<QExifSRational>{{10, 1}, {30, 1}, {36, 1}}));
    QCOMPARE(info.gpsLatitude(), -10.51);
    info.header().setGpsValue(ExifInfo::GPSLatitude, QExifValue(quint32(5)));
    QVERIFY(std::isnan(info.gpsLatitude()));
    info.header().setGpsValue(ExifInfo::GPSAltitude, QExifValue(QVector<QExifURational>{{1, 1}, {2, 1}}));
    QVERIFY(std::isnan(info.gpsAltitude()));

    QCOMPARE(ExifInfo::toDegreesMinutesSeconds(12.0 + 34.0 / 60 + 56.5 / 3600).at(1).toDouble(), 34.0);
    QCOMPARE(ExifInfo::toDegreesMinutesSeconds(-0.75), (QVariantList{0.0, 45.0, 0.0}));
}

void tst_ExifInfo::enumsAndNames()
{
    ExifInfo info;
    QCOMPARE(info.gpsTagName(ExifInfo::GpsLatitudeRef), QStringLiteral("GPSLatitudeRef"));
    QCOMPARE(info.gpsTagName(ExifInfo::GpsTag(31)), QStringLiteral("GPSHPositioningError"));
    QCOMPARE(info.imageTagName(ExifInfo::ImageLensModel), QStringLiteral("ImageLensMake"));
    QCOMPARE(int(ExifInfo::ImageLensSerialNumber), 42036);
    QCOMPARE(info.extendedTagName(ExifInfo::ExtendedTag(1036)), QStringLiteral("ExtendedSubjectDistanceRange"));
    QVERIFY(info.imageTagName(ExifInfo::ImageTag(1)).isNull());

    const QMetaEnum gps = QMetaEnum::fromType<ExifInfo::GpsTag>();
    QCOMPARE(gps.keyCount(), 64);
    QCOMPARE(gps.keyToValue("GpsHorizontalPositionError"), 31);
    QCOMPARE(gps.keyToValue("GpsVersionId"), 0);
    QCOMPARE(QMetaEnum::fromType<ExifInfo::ImageTag>().keyCount(), 39);
    QCOMPARE(QMetaEnum::fromType<ExifInfo::ExtendedTag>().keyCount(), 56);

    // Every table row's tag has a key; the tables have the expected sizes.
    int image = 0, extended = 0, gpsRows = 0;
    for (int tag = 0; tag < 65536; ++tag) {
        image += ExifInfo::imageConversion(tag) ? 1 : 0;
        extended += ExifInfo::extendedConversion(tag) ? 1 : 0;
        gpsRows += ExifInfo::gpsConversion(tag) ? 1 : 0;
    }
    QCOMPARE(image, 37); // 38 rows, two of them for 42035
    QCOMPARE(extended, 56);
    QCOMPARE(gpsRows, 32);
    QVERIFY(!ExifInfo::imageConversion(ExifInfo::ImageYCbCrPosition));
}

void tst_ExifInfo::valuesMap()
{
    ExifInfo info;
    info.setImageValue(ExifInfo::ImageMake, QStringLiteral("Acme"));
    info.setExtendedValue(ExifInfo::ExtendedExposureTime, 0.01);
    info.setGpsLatitude(10.5);
    const QVariantMap values = info.values();
    QCOMPARE(values.value(QStringLiteral("ImageMake")), QVariant(QStringLiteral("Acme")));
    QCOMPARE(values.value(QStringLiteral("ExtendedExposureTime")), QVariant(0.01));
    QCOMPARE(values.value(QStringLiteral("GPSLatitudeRef")), QVariant(QStringLiteral("N")));

    // Feeding the map back loses the GPS tags: their keys don't start with "Gps".
    QSignalSpy changed(&info, &ExifInfo::exifChanged);
    info.setValues(values);
    QVERIFY(changed.count() >= 2);
    QCOMPARE(info.imageValue(ExifInfo::ImageMake), QVariant(QStringLiteral("Acme")));
    QCOMPARE(info.extendedValue(ExifInfo::ExtendedExposureTime), QVariant(0.01));
    QVERIFY(info.gpsTags().isEmpty());

    info.setValues({{QStringLiteral("GpsLatitude"), 1.5},
                    {QStringLiteral("GpsLatitudeRef"), QStringLiteral("S")},
                    {QStringLiteral("ImageNoSuchTag"), QStringLiteral("zero")},
                    {QStringLiteral("Other"), 1}});
    QCOMPARE(info.gpsLatitude(), -1.5);
    QCOMPARE(info.imageTags(), QList<int>{0});
    QCOMPARE(info.header().imageValue(0).toString(), QStringLiteral("zero"));
    QVERIFY(info.extendedTags().isEmpty());

    // Removing marks the object valid and announces it.
    ExifInfo empty;
    QSignalSpy emptyChanged(&empty, &ExifInfo::exifChanged);
    empty.removeGpsValue(ExifInfo::GPSAltitude);
    QVERIFY(empty.isExifValid());
    QCOMPARE(emptyChanged.count(), 1);
    empty.removeImageValue(ExifInfo::ImageMake);
    empty.removeExtendedValue(ExifInfo::ExtendedFlash);
    QCOMPARE(emptyChanged.count(), 3);
}

void tst_ExifInfo::loadsExiftoolFile()
{
    if (!TestSupport::hasProgram(QStringLiteral("exiftool")))
        QSKIP("exiftool is not installed");
    const QString path = m_dir.filePath(QStringLiteral("tagged.jpg"));
    QVERIFY(makeJpeg(path));
    QVERIFY(exiftoolWrite(path, {QStringLiteral("-Make=Acme"), QStringLiteral("-DateTimeOriginal=2023:12:31 23:59:58"),
                                 QStringLiteral("-ExposureTime=0.004"), QStringLiteral("-ISO=400"),
                                 QStringLiteral("-XPTitle=Über"), QStringLiteral("-GPSLatitude=48.8584"),
                                 QStringLiteral("-GPSLatitudeRef=N"), QStringLiteral("-GPSLongitude=2.2945"),
                                 QStringLiteral("-GPSLongitudeRef=W"), QStringLiteral("-GPSAltitude=35"),
                                 QStringLiteral("-GPSAltitudeRef=1")}));

    ExifInfo info;
    QVERIFY(info.load(path));
    QVERIFY(info.isExifValid());
    QVERIFY(info.exists());
    QCOMPARE(info.fileName(), QStringLiteral("tagged.jpg"));
    QCOMPARE(info.imageValue(ExifInfo::ImageMake), QVariant(QStringLiteral("Acme")));
    QCOMPARE(info.imageValue(ExifInfo::ImageXPTitle), QVariant(QStringLiteral("Über")));
    QCOMPARE(info.extendedValue(ExifInfo::ExtendedDateTimeOriginal),
             QVariant(QDateTime(QDate(2023, 12, 31), QTime(23, 59, 58))));
    QCOMPARE(info.extendedValue(ExifInfo::ExtendedExposureTime), QVariant(0.004));
    QCOMPARE(info.extendedValue(ExifInfo::ExtendedISOSpeedRatings), QVariant(400));
    QVERIFY(std::fabs(info.gpsLatitude() - 48.8584) < 1e-6);
    QVERIFY(std::fabs(info.gpsLongitude() + 2.2945) < 1e-6);
    QCOMPARE(info.gpsAltitude(), 35.0);
    QVERIFY(info.imageTags().contains(ExifInfo::ImageMake));
    QVERIFY(info.extendedTags().contains(ExifInfo::ExtendedISOSpeedRatings));
    QCOMPARE(info.values().value(QStringLiteral("GPSLongitudeRef")), QVariant(QStringLiteral("W")));

    ExifInfo byUrl;
    QVERIFY(byUrl.load(QUrl::fromLocalFile(path)));
    QCOMPARE(byUrl.imageValue(ExifInfo::ImageMake), QVariant(QStringLiteral("Acme")));
}

void tst_ExifInfo::loadSignalsAndRepeats()
{
    const QString path = m_dir.filePath(QStringLiteral("plain.jpg"));
    QVERIFY(makeJpeg(path));
    ExifInfo info;
    QSignalSpy changed(&info, &ExifInfo::exifChanged);
    QSignalSpy pathChanged(&info, &FileInfo::filePathChanged);

    // A JPEG without Exif data, a missing file and a text file: not valid.
    QVERIFY(!info.load(path));
    QCOMPARE(changed.count(), 1);
    QCOMPARE(pathChanged.count(), 1);
    QVERIFY(!info.load(m_dir.filePath(QStringLiteral("missing.jpg"))));
    QVERIFY(!info.exists());
    const QString text = m_dir.filePath(QStringLiteral("text.jpg"));
    QVERIFY(writeFile(text, "not an image"));
    QVERIFY(!info.load(text));
    QCOMPARE(changed.count(), 3);

    // The same file again reads nothing and keeps the last result.
    info.clear();
    QVERIFY(info.isExifValid());
    QCOMPARE(changed.count(), 4);
    QVERIFY(info.load(text));
    QCOMPARE(changed.count(), 4);
    QCOMPARE(pathChanged.count(), 3);
    info.setUrl(QUrl::fromLocalFile(text));
    QCOMPARE(pathChanged.count(), 3);

    // The corpus: a camera file and an XMP-only one.
    QVERIFY(info.load(TestSupport::dataPath(QStringLiteral("exif/camera/Canon_40D.jpg"))));
    QCOMPARE(info.imageValue(ExifInfo::ImageMake), QVariant(QStringLiteral("Canon")));
    QVERIFY(!info.load(TestSupport::dataPath(QStringLiteral("exif/broken/image01551.jpg"))));
    QVERIFY(info.imageTags().isEmpty());
}

void tst_ExifInfo::savesForExiftool()
{
    if (!TestSupport::hasProgram(QStringLiteral("exiftool")))
        QSKIP("exiftool is not installed");
    const QString path = m_dir.filePath(QStringLiteral("saved.jpg"));
    QVERIFY(makeJpeg(path, 80, 60));

    ExifInfo info;
    info.clear();
    info.setImageValue(ExifInfo::ImageMake, QStringLiteral("Loomkit"));
    info.setImageValue(ExifInfo::ImageOrientation, 1);
    info.setImageValue(ExifInfo::ImageXResolution, 72.0);
    info.setImageValue(ExifInfo::ImageXPComment, QStringLiteral("Grüße"));
    info.setExtendedValue(ExifInfo::ExtendedDateTimeOriginal, QDateTime(QDate(2020, 2, 29), QTime(12, 0, 1)));
    info.setExtendedValue(ExifInfo::ExtendedExposureTime, 0.01);
    info.setExtendedValue(ExifInfo::ExtendedFNumber, 2.8);
    info.setExtendedValue(ExifInfo::ExtendedExposureBiasValue, -0.3);
    info.setExtendedValue(ExifInfo::ExtendedISOSpeedRatings, QVariantList{100});
    info.setExtendedValue(ExifInfo::ExtendedPixelXDimension, 80);
    info.setGpsLatitude(-33.8568);
    info.setGpsLongitude(151.2153);
    info.setGpsAltitude(58);
    QVERIFY(info.save(path));
    QVERIFY(!QFile::exists(path + QLatin1String(".tmp")));

    const QJsonObject tags = exiftoolRead(path);
    QVERIFY(!tags.isEmpty());
    QVERIFY(!tags.contains(QStringLiteral("ExifTool:Error")));
    QVERIFY(!exiftoolRead(path, {QStringLiteral("-validate"), QStringLiteral("-error")})
                 .contains(QStringLiteral("ExifTool:Error")));
    QCOMPARE(tags.value(QStringLiteral("IFD0:Make")).toString(), QStringLiteral("Loomkit"));
    QCOMPARE(tags.value(QStringLiteral("IFD0:Orientation")).toInt(), 1);
    QCOMPARE(tags.value(QStringLiteral("IFD0:XResolution")).toInt(), 72);
    QCOMPARE(tags.value(QStringLiteral("IFD0:XPComment")).toString(), QStringLiteral("Grüße"));
    QCOMPARE(tags.value(QStringLiteral("ExifIFD:DateTimeOriginal")).toString(), QStringLiteral("2020:02:29 12:00:01"));
    QCOMPARE(tags.value(QStringLiteral("ExifIFD:ExposureTime")).toDouble(), 0.01);
    QCOMPARE(tags.value(QStringLiteral("ExifIFD:FNumber")).toDouble(), 2.8);
    QVERIFY(std::fabs(tags.value(QStringLiteral("ExifIFD:ExposureCompensation")).toDouble() + 0.3) < 1e-6);
    QCOMPARE(tags.value(QStringLiteral("ExifIFD:ISO")).toInt(), 100);
    QCOMPARE(tags.value(QStringLiteral("ExifIFD:ExifImageWidth")).toInt(), 80);
    // Added on saving.
    QCOMPARE(tags.value(QStringLiteral("ExifIFD:ExifVersion")).toString(), QStringLiteral("0230"));
    QCOMPARE(tags.value(QStringLiteral("GPS:GPSVersionID")).toString(), QStringLiteral("2 3 0 0"));
    QVERIFY(std::fabs(tags.value(QStringLiteral("GPS:GPSLatitude")).toDouble() - 33.8568) < 1e-6);
    QCOMPARE(tags.value(QStringLiteral("GPS:GPSLatitudeRef")).toString(), QStringLiteral("S"));
    QVERIFY(std::fabs(tags.value(QStringLiteral("GPS:GPSLongitude")).toDouble() - 151.2153) < 1e-6);
    QCOMPARE(tags.value(QStringLiteral("GPS:GPSLongitudeRef")).toString(), QStringLiteral("E"));
    QCOMPARE(tags.value(QStringLiteral("GPS:GPSAltitude")).toDouble(), 58.0);
    QCOMPARE(tags.value(QStringLiteral("File:ImageWidth")).toInt(), 80);

    // And back.
    ExifInfo reread;
    QVERIFY(reread.load(QUrl::fromLocalFile(path)));
    QCOMPARE(reread.imageValue(ExifInfo::ImageXPComment), QVariant(QStringLiteral("Grüße")));
    QVERIFY(std::fabs(reread.gpsLatitude() + 33.8568) < 1e-6);
    QCOMPARE(reread.gpsValue(ExifInfo::GPSVersionID), QVariant(QVariantList{2, 3, 0, 0}));

    // A freshly cleared object gains both version tags.
    const QString bare = m_dir.filePath(QStringLiteral("bare.jpg"));
    QVERIFY(makeJpeg(bare));
    ExifInfo cleared;
    cleared.clear();
    QVERIFY(cleared.save(QUrl::fromLocalFile(bare)));
    QCOMPARE(cleared.extendedValue(ExifInfo::ExtendedExifVersion), QVariant(QByteArray("0230")));
    const QJsonObject bareTags = exiftoolRead(bare);
    QCOMPARE(bareTags.value(QStringLiteral("GPS:GPSVersionID")).toString(), QStringLiteral("2 3 0 0"));
    QVERIFY(!cleared.save(m_dir.filePath(QStringLiteral("missing.jpg"))));
}

void tst_ExifInfo::versionChecks_data()
{
    QTest::addColumn<QVariant>("exifVersion");
    QTest::addColumn<QByteArray>("savedExifVersion");
    QTest::addColumn<QVariant>("gpsVersion");
    QTest::addColumn<QVariant>("savedGpsVersion");

    const QVariant current = QVariantList{2, 3, 0, 0};
    QTest::newRow("older replaced") << QVariant(QByteArray("0220")) << QByteArray("0230") << QVariant(QVariantList{2, 2, 0, 0})
                                    << current;
    QTest::newRow("newer kept") << QVariant(QByteArray("0232")) << QByteArray("0232") << QVariant(QVariantList{2, 4, 0, 0})
                                << QVariant(QVariantList{2, 4, 0, 0});
    QTest::newRow("wrong shapes replaced") << QVariant(5) << QByteArray("0230") << QVariant(QStringLiteral("x"))
                                           << current;
    QTest::newRow("absent added") << QVariant() << QByteArray("0230") << QVariant() << current;
}

void tst_ExifInfo::versionChecks()
{
    QFETCH(QVariant, exifVersion);
    QFETCH(QByteArray, savedExifVersion);
    QFETCH(QVariant, gpsVersion);
    QFETCH(QVariant, savedGpsVersion);

    const QString path = m_dir.filePath(QStringLiteral("versions.jpg"));
    QVERIFY(makeJpeg(path));
    ExifInfo info;
    if (exifVersion.isValid())
        info.header().setExtendedValue(ExifInfo::ExtendedExifVersion, ExifInfo::toExifValue(exifVersion, 0));
    if (gpsVersion.isValid())
        info.setGpsValue(ExifInfo::GPSVersionID, gpsVersion);
    QVERIFY(info.save(path));
    QVERIFY(info.isExifValid());
    QCOMPARE(info.extendedValue(ExifInfo::ExtendedExifVersion), QVariant(savedExifVersion));
    QCOMPARE(info.gpsValue(ExifInfo::GPSVersionID), savedGpsVersion);

    ExifInfo reread;
    QVERIFY(reread.load(path));
    QCOMPARE(reread.extendedValue(ExifInfo::ExtendedExifVersion), QVariant(savedExifVersion));
    QCOMPARE(reread.gpsValue(ExifInfo::GPSVersionID), savedGpsVersion);
}

QTEST_MAIN(tst_ExifInfo)
#include "tst_ExifInfo.moc"
