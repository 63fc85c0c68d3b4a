#include "ExifInfo.h"
#include "ExifTestSupport.h"

#include <QFile>
#include <QSignalSpy>
#include <QTemporaryDir>
#include <QtTest>

#include <cmath>

using namespace ExifTestSupport;

Q_DECLARE_METATYPE(QExifURational)

namespace {

using Group = QExifImageHeader::Group;
const Group Image = QExifImageHeader::ImageGroup;
const Group Extended = QExifImageHeader::ExtendedGroup;
const Group Gps = QExifImageHeader::GpsGroup;

void store(ExifInfo &info, Group group, int tag, const QVariant &value)
{
    if (group == Image)
        info.setImageValue(ExifInfo::ImageTag(tag), value);
    else if (group == Extended)
        info.setExtendedValue(ExifInfo::ExtendedTag(tag), value);
    else info.setGpsValue(ExifInfo::GpsTag(tag), value);
}

} // namespace

class tst_ExifInfo : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase() { QVERIFY(m_dir.isValid()); }
    void conversions_data();
    void conversions();
    void rationals_data();
    void rationals();
    void toVariant_data();
    void toVariant();
    void xpText();
    void gpsProperties();
    void valuesMap();
    void loadSignalsAndRepeats();
    void savesForExiftool();
    void versionChecks_data();
    void versionChecks();

private:
    QTemporaryDir m_dir;
};

void tst_ExifInfo::conversions_data()
{
    QTest::addColumn<int>("group");
    QTest::addColumn<int>("tag");
    QTest::addColumn<QVariant>("input");
    QTest::addColumn<QString>("expected"); // see describe()

    const auto row = [](const char *name, Group group, int tag, const QVariant &input, const char *expected) {
        QTest::newRow(name) << int(group) << tag << input << QString::fromUtf8(expected);
    };
    row("width is one LONG", Image, ExifInfo::ImageWidth, 100, "4:100");
    row("scalar padded to the row's size", Image, ExifInfo::ImageBitsPerSample, 8, "3:8,0,0");
    row("list cut to the row's size", Image, ExifInfo::ImageBitsPerSample, QVariantList{8, 8, 8, 8}, "3:8,8,8");
    row("double truncated", Image, ExifInfo::ImageOrientation, 6.9, "3:6");
    row("numbers narrow", Image, ExifInfo::ImageOrientation, 65537, "3:1");
    // Digit strings are split, but the digits stay text and are skipped.
    row("digit string", Image, ExifInfo::ImageBitsPerSample, "8,8,8", "3:");
    row("text in a number list is skipped", Image, ExifInfo::ImageStripOffsets, QVariantList{1, "x", 3u}, "4:1,3");
    row("ascii", Image, ExifInfo::ImageDescription, "abc", "2:abc");
    row("date as text", Image, ExifInfo::ImageDateTime, QDateTime(QDate(2024, 5, 6), QTime(7, 8, 9)),
        "2:2024:05:06 07:08:09");
    row("ascii padded to size", Gps, ExifInfo::GPSDateStamp, "2024", "2:2024      ");
    row("ascii cut to size", Gps, ExifInfo::GPSLatitudeRef, "North", "2:N");
    row("version as bytes", Extended, ExifInfo::ExtendedExifVersion, "0230", "7:0230");
    row("undefined padded", Extended, ExifInfo::ExtendedFlashPixVersion, QByteArray("01"), "7:01%00%00");
    row("undefined from a number", Extended, ExifInfo::ExtendedFileSource, 3, "7:%03");
    row("undefined from a list", Extended, ExifInfo::ExtendedSceneType, QVariantList{1}, "7:%00");
    row("signed rational", Extended, ExifInfo::ExtendedExposureBiasValue, -0.5, "10:-1/2");
    row("GPS version", Gps, ExifInfo::GPSVersionID, QVariantList{2, 3}, "1:2,3,0,0");
    row("coordinate from a number", Gps, ExifInfo::GPSLatitude, 33.5, "5:33/1,30/1,0/1");
    row("coordinate from text", Gps, ExifInfo::GPSLongitude, "151.25", "5:151/1,15/1,0/1");
    row("time stamp from a date", Gps, ExifInfo::GPSTimeStamp,
        QDateTime(QDate(2024, 1, 1), QTime(10, 20, 30, 500), Qt::UTC), "5:10/1,20/1,305/10");
    row("rational list padded", Image, ExifInfo::ImageWhitePoint, QVariantList{0.5}, "5:5/10,0/1");

    // Tags without a row go by the value's type.
    const int fallback = ExifInfo::ImageYCbCrPosition;
    row("fallback int is SHORT", Image, fallback, 1, "3:1");
    row("fallback uint is LONG", Image, fallback, 7u, "4:7");
    row("fallback double is RATIONAL", Image, fallback, 0.1, "5:1/10");
    row("fallback int list is BYTE", Image, fallback, QVariantList{1, 2}, "1:1,2");
    row("fallback uint list is LONG", Image, fallback, QVariantList{1u, 2}, "4:1,2");
    row("fallback double list is RATIONAL", Image, fallback, QVariantList{0.5, 2}, "5:5/10,2/1");
    row("fallback text list is null", Image, fallback, QStringList{"a"}, "0:");
    row("fallback empty list is null", Image, fallback, QVariantList(), "0:");
    row("fallback bool is null", Image, fallback, true, "0:");
    row("fallback text", Extended, 12345, "x", "2:x");
    row("fallback bytes", Gps, 99, QByteArray("raw"), "7:raw");
}

void tst_ExifInfo::conversions()
{
    QFETCH(int, group);
    QFETCH(int, tag);
    QFETCH(QVariant, input);
    QFETCH(QString, expected);

    ExifInfo info;
    QSignalSpy changed(&info, &ExifInfo::exifChanged);
    QVERIFY(!info.isExifValid());
    store(info, Group(group), tag, input);
    QCOMPARE(changed.count(), 1);
    QVERIFY(info.isExifValid());
    const QExifValue value = info.header().value(Group(group), tag);
    QCOMPARE(describe(value), expected);
    if (value.type() == QExifValue::Ascii) // the terminator counts
        QCOMPARE(value.count(), quint32(value.toString().size() + 1));
}

void tst_ExifInfo::rationals_data()
{
    QTest::addColumn<double>("value");
    QTest::addColumn<QExifURational>("unsignedForm");
    QTest::addColumn<QString>("signedForm");

    QTest::newRow("half") << 0.5 << QExifURational(5, 10) << QStringLiteral("1/2");
    QTest::newRow("third") << 1.0 / 3 << QExifURational(333333, 1000000) << QStringLiteral("1/3");
    QTest::newRow("zero") << 0.0 << QExifURational(0, 1) << QStringLiteral("0/1");
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
    if (std::fabs(value) > 1e-9)
        QVERIFY(std::fabs(ratio(s) - value) <= std::fabs(value) * 1e-6);
}

void tst_ExifInfo::toVariant_data()
{
    QTest::addColumn<QExifValue>("value");
    QTest::addColumn<QVariant>("expected");

    QTest::newRow("date text") << QExifValue(QStringLiteral("2024:05:06 07:08:09"))
                               << QVariant(QDateTime(QDate(2024, 5, 6), QTime(7, 8, 9)));
    QTest::newRow("not quite a date") << QExifValue(QStringLiteral("2024:05:06 07:08:09 "))
                                      << QVariant("2024:05:06 07:08:09 ");
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
    QCOMPARE(actual, expected);
}

void tst_ExifInfo::xpText()
{
    ExifInfo info;
    info.setImageValue(ExifInfo::ImageXPTitle, QStringLiteral("Hé"));
    QCOMPARE(info.header().imageValue(ExifInfo::ImageXPTitle).toByteVector(), (QVector<quint8>{'H', 0, 0xe9, 0}));
    QCOMPARE(info.imageValue(ExifInfo::ImageXPTitle), QVariant("Hé"));
    // Trailing NUL pairs, as Windows writes them, are dropped on reading.
    info.header().setImageValue(ExifInfo::ImageXPAuthor, QExifValue(QVector<quint8>{'A', 0, 'b', 0, 0, 0, 0, 0}));
    QCOMPARE(info.imageValue(ExifInfo::ImageXPAuthor), QVariant("Ab"));
    // Only BYTE values are text.
    info.header().setImageValue(ExifInfo::ImageXPComment, QExifValue(QByteArray("raw")));
    QCOMPARE(info.imageValue(ExifInfo::ImageXPComment), QVariant(QByteArray("raw")));
}

void tst_ExifInfo::gpsProperties()
{
    ExifInfo info;
    QVERIFY(std::isnan(info.gpsLatitude()));
    QVERIFY(std::isnan(info.gpsAltitude()));
    info.setGpsLatitude(-33.5);
    QCOMPARE(info.gpsValue(ExifInfo::GPSLatitudeRef), QVariant("S"));
    QCOMPARE(info.gpsValue(ExifInfo::GPSLatitude), QVariant(QVariantList{33.0, 30.0, 0.0}));
    QCOMPARE(info.gpsLatitude(), -33.5);
    info.setGpsLongitude(-151.2093);
    QCOMPARE(info.gpsValue(ExifInfo::GPSLongitudeRef), QVariant("W"));
    QVERIFY(std::fabs(info.gpsLongitude() + 151.2093) < 1e-7);
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
    QCOMPARE(ExifInfo::toDegreesMinutesSeconds(-0.75), (QVariantList{0.0, 45.0, 0.0}));
}

void tst_ExifInfo::valuesMap()
{
    ExifInfo info;
    info.setImageValue(ExifInfo::ImageMake, QStringLiteral("Acme"));
    info.setExtendedValue(ExifInfo::ExtendedExposureTime, 0.01);
    info.setGpsLatitude(10.5);
    const QVariantMap values = info.values();
    QCOMPARE(values.value("ImageMake"), QVariant("Acme"));
    QCOMPARE(values.value("ExtendedExposureTime"), QVariant(0.01));
    QCOMPARE(values.value("GPSLatitudeRef"), QVariant("N"));
    // 42035 has two rows; the first one names it.
    QCOMPARE(info.imageTagName(ExifInfo::ImageLensModel), QStringLiteral("ImageLensMake"));
    QVERIFY(info.imageTagName(ExifInfo::ImageTag(1)).isNull());

    // Feeding the map back loses the GPS tags: their keys don't start with "Gps".
    info.setValues(values);
    QCOMPARE(info.imageValue(ExifInfo::ImageMake), QVariant("Acme"));
    QCOMPARE(info.extendedValue(ExifInfo::ExtendedExposureTime), QVariant(0.01));
    QVERIFY(info.gpsTags().isEmpty());
    info.setValues({{QStringLiteral("GpsLatitude"), 1.5},
                    {QStringLiteral("GpsLatitudeRef"), QStringLiteral("S")},
                    {QStringLiteral("ImageNoSuchTag"), QStringLiteral("zero")},
                    {QStringLiteral("Other"), 1}});
    QCOMPARE(info.gpsLatitude(), -1.5);
    QCOMPARE(info.imageTags(), QList<int>{0});
    QVERIFY(info.extendedTags().isEmpty());

    // Removing marks the object valid and announces it.
    ExifInfo empty;
    QSignalSpy changed(&empty, &ExifInfo::exifChanged);
    empty.removeGpsValue(ExifInfo::GPSAltitude);
    QVERIFY(empty.isExifValid());
    QCOMPARE(changed.count(), 1);
}

void tst_ExifInfo::loadSignalsAndRepeats()
{
    const QString path = m_dir.filePath("plain.jpg");
    QVERIFY(makeJpeg(path));
    ExifInfo info;
    QSignalSpy changed(&info, &ExifInfo::exifChanged);
    QSignalSpy pathChanged(&info, &FileInfo::filePathChanged);

    // A JPEG without Exif data, a missing file and a text file: not valid.
    QVERIFY(!info.load(path));
    QVERIFY(!info.load(m_dir.filePath("missing.jpg")));
    QVERIFY(!info.exists());
    const QString text = m_dir.filePath("text.jpg");
    QVERIFY(writeFile(text, "not an image"));
    QVERIFY(!info.load(text));
    QCOMPARE(changed.count(), 3);

    // The same file again reads nothing and keeps the last result.
    info.clear();
    QVERIFY(info.isExifValid());
    QVERIFY(info.load(text));
    QCOMPARE(changed.count(), 4);
    info.setUrl(QUrl::fromLocalFile(text));
    QCOMPARE(pathChanged.count(), 3);

    // The corpus: a camera file and an XMP-only one.
    QVERIFY(info.load(TestSupport::dataPath(QStringLiteral("exif/camera/Canon_40D.jpg"))));
    QCOMPARE(info.imageValue(ExifInfo::ImageMake), QVariant("Canon"));
    QVERIFY(!info.load(TestSupport::dataPath(QStringLiteral("exif/broken/image01551.jpg"))));
    QVERIFY(info.imageTags().isEmpty());
}

void tst_ExifInfo::savesForExiftool()
{
    SKIP_WITHOUT_EXIFTOOL();
    const QString path = m_dir.filePath("saved.jpg");
    QVERIFY(makeJpeg(path, 80, 60));

    ExifInfo info;
    info.setImageValue(ExifInfo::ImageMake, QStringLiteral("Loomkit"));
    info.setImageValue(ExifInfo::ImageOrientation, 1);
    info.setImageValue(ExifInfo::ImageXResolution, 72.0);
    info.setImageValue(ExifInfo::ImageXPComment, QStringLiteral("Grüße"));
    info.setExtendedValue(ExifInfo::ExtendedDateTimeOriginal, QDateTime(QDate(2020, 2, 29), QTime(12, 0, 1)));
    info.setExtendedValue(ExifInfo::ExtendedExposureTime, 0.01);
    info.setExtendedValue(ExifInfo::ExtendedExposureBiasValue, -0.3);
    info.setExtendedValue(ExifInfo::ExtendedISOSpeedRatings, QVariantList{100});
    info.setExtendedValue(ExifInfo::ExtendedPixelXDimension, 80);
    info.setGpsLatitude(-33.8568);
    info.setGpsLongitude(151.2153);
    info.setGpsAltitude(58);
    QVERIFY(info.save(path));
    QVERIFY(!QFile::exists(path + QLatin1String(".tmp")));

    QVERIFY(!exiftoolRead(path, {"-validate", "-error"}).contains("ExifTool:Error"));
    const QJsonObject tags = exiftoolRead(path);
    // The versions are added on saving.
    const QVariantMap expected{
        {"IFD0:Make", "Loomkit"}, {"IFD0:Orientation", 1}, {"IFD0:XResolution", 72}, {"IFD0:XPComment", "Grüße"},
        {"ExifIFD:DateTimeOriginal", "2020:02:29 12:00:01"}, {"ExifIFD:ExposureTime", 0.01},
        {"ExifIFD:ExposureCompensation", -0.3}, {"ExifIFD:ISO", 100}, {"ExifIFD:ExifImageWidth", 80},
        {"GPS:GPSLatitude", 33.8568}, {"GPS:GPSLatitudeRef", "S"}, {"GPS:GPSLongitude", 151.2153},
        {"GPS:GPSLongitudeRef", "E"}, {"GPS:GPSAltitude", 58}, {"File:ImageWidth", 80},
        {"ExifIFD:ExifVersion", "0230"}, {"GPS:GPSVersionID", "2 3 0 0"}};
    for (auto it = expected.cbegin(); it != expected.cend(); ++it) {
        const QVariant actual = tags.value(it.key()).toVariant();
        if (it.value().type() == QVariant::Double)
            QVERIFY2(std::fabs(actual.toDouble() - it.value().toDouble()) < 1e-6, qPrintable(it.key()));
        else QCOMPARE(actual.toString(), it.value().toString());
    }

    // And what exiftool changes, we read.
    QVERIFY(exiftoolWrite(path, {"-XPTitle=Über", "-ExposureTime=0.004", "-ISO=400", "-GPSLongitudeRef=W",
                                 "-GPSAltitude=35", "-GPSAltitudeRef=1"}));
    ExifInfo reread;
    QVERIFY(reread.load(QUrl::fromLocalFile(path)));
    QCOMPARE(reread.fileName(), QStringLiteral("saved.jpg"));
    QCOMPARE(reread.imageValue(ExifInfo::ImageXPComment), QVariant("Grüße"));
    QCOMPARE(reread.imageValue(ExifInfo::ImageXPTitle), QVariant("Über"));
    QCOMPARE(reread.extendedValue(ExifInfo::ExtendedDateTimeOriginal),
             QVariant(QDateTime(QDate(2020, 2, 29), QTime(12, 0, 1))));
    QCOMPARE(reread.extendedValue(ExifInfo::ExtendedExposureTime), QVariant(0.004));
    QCOMPARE(reread.extendedValue(ExifInfo::ExtendedISOSpeedRatings), QVariant(400));
    QVERIFY(std::fabs(reread.gpsLatitude() + 33.8568) < 1e-6);
    QVERIFY(std::fabs(reread.gpsLongitude() + 151.2153) < 1e-6);
    QCOMPARE(reread.gpsAltitude(), 35.0);
    QVERIFY(!reread.save(m_dir.filePath("missing.jpg")));
}

void tst_ExifInfo::versionChecks_data()
{
    QTest::addColumn<QVariant>("exifVersion");
    QTest::addColumn<QByteArray>("savedExifVersion");
    QTest::addColumn<QVariant>("gpsVersion");
    QTest::addColumn<QVariant>("savedGpsVersion");

    const QVariant current = QVariantList{2, 3, 0, 0};
    QTest::newRow("older replaced") << QVariant(QByteArray("0220")) << QByteArray("0230")
                                    << QVariant(QVariantList{2, 2, 0, 0}) << current;
    QTest::newRow("newer kept") << QVariant(QByteArray("0232")) << QByteArray("0232")
                                << QVariant(QVariantList{2, 4, 0, 0}) << QVariant(QVariantList{2, 4, 0, 0});
    QTest::newRow("wrong shapes replaced") << QVariant(5) << QByteArray("0230") << QVariant("x") << current;
    QTest::newRow("absent added") << QVariant() << QByteArray("0230") << QVariant() << current;
}

void tst_ExifInfo::versionChecks()
{
    QFETCH(QVariant, exifVersion);
    QFETCH(QByteArray, savedExifVersion);
    QFETCH(QVariant, gpsVersion);
    QFETCH(QVariant, savedGpsVersion);

    const QString path = m_dir.filePath("versions.jpg");
    QVERIFY(makeJpeg(path));
    ExifInfo info;
    if (exifVersion.isValid())
        info.header().setExtendedValue(ExifInfo::ExtendedExifVersion, ExifInfo::toExifValue(exifVersion, 0));
    if (gpsVersion.isValid())
        info.setGpsValue(ExifInfo::GPSVersionID, gpsVersion);
    QVERIFY(info.save(path));
    QVERIFY(info.isExifValid());
    ExifInfo reread;
    QVERIFY(reread.load(path));
    QCOMPARE(reread.extendedValue(ExifInfo::ExtendedExifVersion), QVariant(savedExifVersion));
    QCOMPARE(reread.gpsValue(ExifInfo::GPSVersionID), savedGpsVersion);
}

QTEST_MAIN(tst_ExifInfo)
#include "tst_ExifInfo.moc"
