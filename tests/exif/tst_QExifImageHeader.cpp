#include "ExifTestSupport.h"
#include "QExifImageHeader.h"

#include <QBuffer>
#include <QDirIterator>
#include <QFile>
#include <QTemporaryDir>
#include <QtTest>

using namespace ExifTestSupport;

namespace {

// Reads a little-endian TIFF block the way a plain reader would; entry i of the IFD at ifd.
struct Block
{
    QByteArray data;

    quint16 u16(int offset) const { return quint16(uchar(data.at(offset)) | uchar(data.at(offset + 1)) << 8); }
    quint32 u32(int offset) const { return u16(offset) | quint32(u16(offset + 2)) << 16; }
    quint16 tag(int ifd, int i) const { return u16(ifd + 2 + 12 * i); }
    quint32 count(int ifd, int i) const { return u32(ifd + 2 + 12 * i + 4); }
    quint32 word(int ifd, int i) const { return u32(ifd + 2 + 12 * i + 8); }
    QByteArray raw(int ifd, int i) const { return data.mid(ifd + 2 + 12 * i + 8, 4); }
};

// A little-endian TIFF block by hand, for inputs our writer never makes.
struct TiffBuilder
{
    QByteArray data = QByteArray("II\x2a\0", 4);

    TiffBuilder &u16(quint16 v) { return data.append(char(v)).append(char(v >> 8)), *this; }
    TiffBuilder &u32(quint32 v) { return u16(quint16(v)).u16(quint16(v >> 16)); }
    TiffBuilder &entry(quint16 tag, quint16 type, quint32 count, quint32 word)
    {
        return u16(tag).u16(type).u32(count).u32(word);
    }
};

struct SequentialBuffer : QBuffer
{
    using QBuffer::QBuffer;
    bool isSequential() const override { return true; }
};

QByteArray app1(const QByteArray &tiff)
{
    const QByteArray body = QByteArray("Exif\0\0", 6) + tiff;
    const int length = body.size() + 2;
    return QByteArray("\xff\xd8\xff\xe1", 4) + char(length >> 8) + char(length) + body + QByteArray("\xff\xd9", 2);
}

struct Reread : QExifImageHeader
{
    explicit Reread(const QByteArray &block) { read(block); }
};

} // namespace

class tst_QExifImageHeader : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void exiftoolRoundTrip_data();
    void exiftoolRoundTrip();
    void onlyTheFirstApp1Counts();
    void blockLayout();
    void thumbnailDefaults();
    void inlineValues_data();
    void inlineValues();
    void unknownTypeWarns();
    void cameraFiles_data();
    void cameraFiles();
    void hostileInputs_data();
    void hostileInputs();
    void hardening_data();
    void hardening();
    void sharedValuesDontMultiplyMemory();
    void saveFailuresKeepTheOriginal();

private:
    QString taggedFile(const QString &name, const QString &byteOrder);

    QTemporaryDir m_dir;
    QString m_thumbnail;
};

void tst_QExifImageHeader::initTestCase()
{
    QVERIFY(m_dir.isValid());
    m_thumbnail = m_dir.filePath("thumb.jpg");
    QVERIFY(makeJpeg(m_thumbnail, 16, 12, Qt::red));
}

QString tst_QExifImageHeader::taggedFile(const QString &name, const QString &byteOrder)
{
    const QString path = m_dir.filePath(name);
    const QStringList arguments{"-ExifByteOrder=" + byteOrder, "-Make=Acme", "-Model=Cam 1", "-Artist=Ann",
                                "-Orientation#=6", "-XResolution=300", "-ExposureTime=0.01", "-ExposureCompensation=-0.5",
                                "-InteropIndex=R98", "-GPSLatitude=33.5", "-GPSLatitudeRef=S",
                                "-ThumbnailImage<=" + m_thumbnail, "-XMP-dc:Title=Loom"};
    return makeJpeg(path) && exiftoolWrite(path, arguments) ? path : QString();
}

void tst_QExifImageHeader::exiftoolRoundTrip_data()
{
    QTest::addColumn<QString>("byteOrder");
    QTest::newRow("II") << QStringLiteral("II");
    QTest::newRow("MM") << QStringLiteral("MM");
}

void tst_QExifImageHeader::exiftoolRoundTrip()
{
    SKIP_WITHOUT_EXIFTOOL();
    QFETCH(QString, byteOrder);
    const QString path = taggedFile(QStringLiteral("trip-%1.jpg").arg(byteOrder), byteOrder);
    QVERIFY(!path.isEmpty());
    const bool le = byteOrder == QLatin1String("II");
    int sos = -1;
    segments(readFile(path), &sos);
    const QByteArray scan = readFile(path).mid(sos);

    // What the camera files don't show: inline text, the pointers, signed and reversed values.
    QExifImageHeader header;
    QVERIFY(header.loadFromJpeg(path));
    QCOMPARE(header.imageValue(315).toString(), QStringLiteral("Ann"));
    QCOMPARE(header.imageValue(282).toRational(), QExifURational(300, 1));
    // The IFD pointers are structure, not tags.
    QVERIFY(!header.containsImageTag(34665) && !header.containsImageTag(34853) && !header.containsExtendedTag(40965));
    QCOMPARE(ratio(header.extendedValue(37380).toSignedRational()), -0.5);
    // Short UNDEFINED values lie in the entry as a word: big-endian files give them back reversed.
    QCOMPARE(header.extendedValue(36864).toByteArray(), le ? QByteArray("0232") : QByteArray("2320"));
    QCOMPARE(header.gpsValue(0).toByteVector(), (QVector<quint8>{2, 3, 0, 0}));
    const QVector<QExifURational> latitude = header.gpsValue(2).toRationalVector();
    QCOMPARE(header.thumbnailData(), readFile(m_thumbnail));

    header.setImageValue(271, QExifValue(QStringLiteral("Loomkit")));
    header.setExtendedValue(37510, QExifValue(QStringLiteral("hello"), QExifValue::AsciiEncoding));
    header.setExtendedValue(37382, QExifValue(QExifURational(5, 2)));
    QVERIFY(header.saveToJpeg(path));
    QVERIFY(!QFile::exists(path + QLatin1String(".tmp")));

    // One APP1 first, all other application segments gone, the scan intact.
    const QByteArray saved = readFile(path);
    const QList<Segment> list = segments(saved, &sos);
    QCOMPARE(list.first().marker, quint16(0xffe1));
    for (int i = 1; i < list.size(); ++i)
        QVERIFY2(list[i].marker < 0xffe0 || list[i].marker > 0xffef, qPrintable(QString::number(list[i].marker, 16)));
    QCOMPARE(saved.mid(sos), scan);

    const QJsonObject validation = exiftoolRead(path, {"-validate", "-error"});
    QVERIFY(validation.contains("ExifTool:Validate") && !validation.contains("ExifTool:Error"));
    const QJsonObject tags = exiftoolRead(path);
    const QList<QPair<QString, QJsonValue>> expected{
        {"ExifIFD:UserComment", "hello"}, {"IFD0:Make", "Loomkit"}, {"IFD0:Model", "Cam 1"}, {"IFD0:Artist", "Ann"},
        {"IFD0:Orientation", 6}, {"ExifIFD:ExposureTime", 0.01}, {"ExifIFD:ExposureCompensation", -0.5},
        {"ExifIFD:SubjectDistance", 2.5}, {"GPS:GPSLatitude", 33.5}, {"GPS:GPSLatitudeRef", "S"},
        // The interoperability IFD and the XMP segment are not carried over.
        {"InteropIFD:InteropIndex", QJsonValue::Undefined}, {"XMP-dc:Title", QJsonValue::Undefined}};
    for (const auto &tag : expected)
        QVERIFY2(tags.value(tag.first) == tag.second, qPrintable(tag.first));
    // Reversed short UNDEFINED values are written as they were read.
    QCOMPARE(tags.value("ExifIFD:ExifVersion").toVariant().toString(), le ? QStringLiteral("0232") : QStringLiteral("2320"));
    QCOMPARE(TestSupport::run("exiftool", {"-b", "-ThumbnailImage", path}), readFile(m_thumbnail));

    // What we wrote, we read back; the GPS pointer added on saving is dropped.
    QExifImageHeader again;
    QVERIFY(again.loadFromJpeg(path));
    QList<int> expectedTags = header.imageTags();
    expectedTags.removeAll(34853);
    QCOMPARE(again.imageTags(), expectedTags);
    QCOMPARE(again.extendedValue(37510).toString(), QStringLiteral("hello"));
    QCOMPARE(again.gpsValue(2).toRationalVector(), latitude);
    QCOMPARE(again.thumbnailData(), header.thumbnailData());
}

void tst_QExifImageHeader::onlyTheFirstApp1Counts()
{
    SKIP_WITHOUT_EXIFTOOL();
    const QString path = taggedFile(QStringLiteral("xmp-first.jpg"), QStringLiteral("II"));
    QExifImageHeader header;
    QVERIFY(header.loadFromJpeg(path));

    // The XMP segment moved ahead of the Exif one: other readers still see the Exif data, we don't.
    QVERIFY(editSegments(path, [](QList<Segment> &list) {
        for (int i = 1; i < list.size(); ++i) {
            if (list[i].marker == 0xffe1 && list[i].data.startsWith("http://ns.adobe.com/xap/1.0/"))
                list.prepend(list.takeAt(i));
        }
    }));
    QVERIFY(!exiftoolRead(path).value("IFD0:Make").toString().isEmpty());
    QVERIFY(!header.loadFromJpeg(path));
    QVERIFY(header.imageTags().isEmpty());
}

void tst_QExifImageHeader::blockLayout()
{
    QExifImageHeader header;
    header.setImageValue(270, QExifValue(QStringLiteral("abc")));
    header.setImageValue(271, QExifValue(QStringLiteral("Acme Corp"))); // count 10
    header.setExtendedValue(36864, QExifValue(QByteArray("0230")));
    header.setExtendedValue(33434, QExifValue(QExifURational(1, 100)));

    // IFD0 holds its entries and the Exif pointer, then its values.
    const Block block{header.toTiffBlock()};
    QCOMPARE(block.word(8, 1), 26u + 12 * 2);
    QCOMPARE(block.u32(8 + 2 + 36), 0u); // next IFD: no thumbnail
    QCOMPARE(block.data.mid(50, 10), QByteArray("Acme Corp\0", 10));
    const int exif = int(block.word(8, 2));
    QCOMPARE(exif, 60);
    QCOMPARE(block.word(exif, 0), quint32(exif + 2 + 24));
    QCOMPARE(block.raw(exif, 1), QByteArray("0230"));
    // In the Exif IFD the zero word follows the values, not the entries.
    QCOMPARE(block.u32(exif + 2 + 24), 1u);
    QCOMPARE(block.u32(exif + 2 + 24 + 8), 0u);
    QCOMPARE(header.size(), qint64(block.data.size()));
    QCOMPARE(block.data.size(), exif + 2 + 24 + 8 + 4);
    QCOMPARE(Reread(block.data).extendedTags(), (QList<int>{33434, 36864}));

    // The GPS pointer stays in the map, so a second save writes a stale copy among the sorted entries.
    header.setGpsValue(1, QExifValue(QStringLiteral("N")));
    const Block first{header.toTiffBlock()};
    const Block second{header.toTiffBlock()};
    QCOMPARE(second.u16(8), quint16(5));
    QCOMPARE(second.tag(8, 2), quint16(34853));
    QCOMPARE(second.word(8, 2), first.word(8, 3));
    QCOMPARE(second.tag(8, 4), quint16(34853));
    QCOMPARE(second.word(8, 4), first.word(8, 3) + 12);
    QCOMPARE(second.data.size(), first.data.size() + 12);
    const Reread back(second.data); // a reader drops both copies
    QCOMPARE(back.imageTags(), (QList<int>{270, 271}));
    QCOMPARE(back.gpsValue(1).toString(), QStringLiteral("N"));
}

void tst_QExifImageHeader::thumbnailDefaults()
{
    QExifImageHeader header;
    const QByteArray thumbnail = QByteArray("\xff\xd8thumbnail\xff\xd9");
    header.setThumbnailData(thumbnail);
    header.setThumbnailXResolution(QExifValue(QExifURational(96, 1)));

    // Unset values get defaults: 72 dpi and orientation 0.
    Reread back(header.toTiffBlock());
    QCOMPARE(back.thumbnailData(), thumbnail);
    QCOMPARE(back.thumbnailXResolution().toRational(), QExifURational(96, 1));
    QCOMPARE(back.thumbnailYResolution().toRational(), QExifURational(72, 1));
    QCOMPARE(describe(back.thumbnailOrientation()), QStringLiteral("3:0"));
    // clear keeps the thumbnail's values but drops its data.
    back.clear();
    QVERIFY(back.thumbnailData().isEmpty());
    QCOMPARE(back.thumbnailXResolution().toRational(), QExifURational(96, 1));
    QCOMPARE(back.size(), qint64(-1));
}

void tst_QExifImageHeader::inlineValues_data()
{
    QTest::addColumn<QExifValue>("value");
    QTest::addColumn<QByteArray>("inlineBytes"); // empty: out of line

    QTest::newRow("ascii of 4 with terminator") << QExifValue(QStringLiteral("abc")) << QByteArray("abc\0", 4);
    QTest::newRow("ascii of 5") << QExifValue(QStringLiteral("abcd")) << QByteArray();
    QTest::newRow("byte x4") << QExifValue(QVector<quint8>{1, 2, 3, 4}) << QByteArray("\1\2\3\4", 4);
    QTest::newRow("byte x5") << QExifValue(QVector<quint8>{1, 2, 3, 4, 5}) << QByteArray();
    QTest::newRow("short x1 padded") << QExifValue(quint16(0x0102)) << QByteArray("\2\1\0\0", 4);
    QTest::newRow("short x3") << QExifValue(QVector<quint16>{1, 2, 3}) << QByteArray();
    QTest::newRow("long x0") << QExifValue(QVector<quint32>()) << QByteArray(4, '\0');
    QTest::newRow("long x2") << QExifValue(QVector<quint32>{1, 2}) << QByteArray();
    QTest::newRow("rational x0") << QExifValue(QVector<QExifURational>()) << QByteArray(4, '\0');
    QTest::newRow("rational x1 never inline") << QExifValue(QExifURational(1, 1)) << QByteArray();
    QTest::newRow("undefined x2 padded") << QExifValue(QByteArray("ab")) << QByteArray("ab\0\0", 4);
}

void tst_QExifImageHeader::inlineValues()
{
    QFETCH(QExifValue, value);
    QFETCH(QByteArray, inlineBytes);

    QExifImageHeader header;
    header.setImageValue(700, value);
    const Block block{header.toTiffBlock()};
    const quint32 valuesStart = 26 + 12;
    QCOMPARE(block.count(8, 0), value.count());
    if (!inlineBytes.isEmpty()) {
        QCOMPARE(block.raw(8, 0), inlineBytes);
        QCOMPARE(block.word(8, 1), valuesStart);
    } else {
        QCOMPARE(block.word(8, 0), valuesStart);
        QVERIFY(block.word(8, 1) > valuesStart);
    }

    // Whatever the form, the value reads back as written, in both orders.
    for (QDataStream::ByteOrder order : {QDataStream::LittleEndian, QDataStream::BigEndian}) {
        header.setByteOrder(order);
        const QExifValue back = Reread(header.toTiffBlock()).imageValue(700);
        // Big-endian: a short UNDEFINED value comes back as the reversed word's first bytes.
        const bool reversed = value.type() == QExifValue::Undefined && order == QDataStream::BigEndian;
        QCOMPARE(describe(back), reversed ? QStringLiteral("7:%00%00") : describe(value));
    }
}

void tst_QExifImageHeader::unknownTypeWarns()
{
    QExifImageHeader header;
    header.setImageValue(300, QExifValue());
    header.setExtendedValue(301, QExifValue());
    header.setExtendedValue(302, QExifValue(QVector<quint32>{7, 8}));
    header.setGpsValue(1, QExifValue(QStringLiteral("N")));
    for (int i = 0; i < 2; ++i)
        QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Invalid Ifd Type 0$")));
    const Block block{header.toTiffBlock()};
    QCOMPARE(block.tag(8, 0), quint16(300));
    QCOMPARE(block.u16(8 + 2 + 2), quint16(0)); // type
    QCOMPARE(block.word(8, 0), 0u);
    // The unknown entry takes 12 bytes but counts as none in the layout, so
    // the GPS pointer falls 12 bytes short of where its IFD lies.
    const quint32 gps = block.word(8, 2);
    QCOMPARE(gps, block.word(8, 1) + 2 + 20 + 4);
    QCOMPARE(block.u16(int(gps) + 12), quint16(1));

    // The reader keeps a null value under an unknown type's tag.
    TiffBuilder tiff;
    tiff.u32(8).u16(1).entry(400, 13, 1, 5).u32(0);
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Invalid Ifd Type 13$")));
    const Reread back(tiff.data);
    QVERIFY(back.containsImageTag(400) && back.imageValue(400).isNull());
}

void tst_QExifImageHeader::cameraFiles_data()
{
    QTest::addColumn<QString>("path");
    for (const QString &folder : {QStringLiteral("exif/camera"), QStringLiteral("exif/libexif")}) {
        QDirIterator it(TestSupport::dataPath(folder), {QStringLiteral("*.jpg"), QStringLiteral("*.jpeg")});
        while (it.hasNext()) {
            const QString path = it.next();
            QTest::newRow(qPrintable(QFileInfo(path).fileName())) << path;
        }
    }
}

void tst_QExifImageHeader::cameraFiles()
{
    SKIP_WITHOUT_EXIFTOOL();
    QFETCH(QString, path);
    const QJsonObject tags = exiftoolRead(path);
    QVERIFY(!tags.isEmpty());
    const auto tag = [&](const char *key) { return tags.value(QLatin1String(key)); };

    QExifImageHeader header;
    QVERIFY(header.loadFromJpeg(path));
    QCOMPARE(header.byteOrder(), tag("File:ExifByteOrder") == "II" ? QDataStream::LittleEndian : QDataStream::BigEndian);

    // exiftool trims trailing blanks and NULs; we drop the last byte of the
    // count whether or not it is the terminator.
    const auto sameText = [](const QString &ours, const QJsonValue &theirs) {
        const QString expected = theirs.toVariant().toString();
        const QString actual = QString(ours).remove(QChar(0)).trimmed();
        return expected.startsWith(actual) && expected.size() - actual.size() <= 1;
    };
    for (const auto &text : QList<QPair<int, const char *>>{{271, "IFD0:Make"}, {272, "IFD0:Model"}, {306, "IFD0:ModifyDate"}}) {
        if (tags.contains(QLatin1String(text.second)))
            QVERIFY2(sameText(header.imageValue(text.first).toString(), tag(text.second)), text.second);
        else QVERIFY(!header.containsImageTag(text.first));
    }
    if (tags.contains("IFD0:Orientation"))
        QCOMPARE(int(header.imageValue(274).toShort()), tag("IFD0:Orientation").toInt());
    if (tags.contains("ExifIFD:DateTimeOriginal"))
        QVERIFY(sameText(header.extendedValue(36867).toString(), tag("ExifIFD:DateTimeOriginal")));
    if (tags.contains("GPS:GPSLatitude")) {
        const QVector<QExifURational> v = header.gpsValue(2).toRationalVector();
        QCOMPARE(v.size(), 3);
        QVERIFY(qAbs(ratio(v[0]) + ratio(v[1]) / 60 + ratio(v[2]) / 3600 - tag("GPS:GPSLatitude").toDouble()) < 1e-6);
    }
    if (tag("IFD1:ThumbnailOffset").isDouble() && tag("IFD1:ThumbnailLength").toInt() > 0)
        QCOMPARE(header.thumbnailData().size(), tag("IFD1:ThumbnailLength").toInt());
    // Every IFD0 tag exiftool lists is in the map.
    const int listed = tags.keys().filter(QRegularExpression(QStringLiteral("^IFD0:"))).size();
    QVERIFY2(header.imageTags().size() >= listed, qPrintable(QString::number(header.imageTags().size())));

    // Rewriting keeps the values a reader can see. Files with no image
    // data (SOI, APP1, EOI) are refused and stay as they were.
    const QString copy = m_dir.filePath("camera-copy.jpg");
    QFile::remove(copy);
    QVERIFY(QFile::copy(path, copy));
    QFile::setPermissions(copy, QFile::ReadOwner | QFile::WriteOwner);
    if (!tags.contains("File:ImageWidth")) {
        QVERIFY(!header.saveToJpeg(copy));
        QCOMPARE(readFile(copy), readFile(path));
        return;
    }
    QVERIFY(header.saveToJpeg(copy));
    const QJsonObject rewritten = exiftoolRead(copy);
    QVERIFY(!rewritten.contains("ExifTool:Error"));
    for (const char *key : {"IFD0:Model", "ExifIFD:DateTimeOriginal"}) {
        if (tags.contains(QLatin1String(key)))
            QVERIFY2(sameText(rewritten.value(QLatin1String(key)).toVariant().toString(), tag(key)), key);
    }
    QCOMPARE(rewritten.value("GPS:GPSLatitude"), tag("GPS:GPSLatitude"));
    QCOMPARE(rewritten.value("File:ImageWidth"), tag("File:ImageWidth"));
}

void tst_QExifImageHeader::hostileInputs_data()
{
    QTest::addColumn<QString>("path");
    QTest::addColumn<bool>("bare");
    for (const QString &folder : {QStringLiteral("tiff"), QStringLiteral("jpeg")}) {
        QDirIterator it(TestSupport::dataPath(QStringLiteral("exif/hostile/") + folder), QDir::Files);
        while (it.hasNext()) {
            const QString path = it.next();
            QTest::newRow(qPrintable(folder + QLatin1Char('/') + QFileInfo(path).fileName()))
                << path << (folder == QLatin1String("tiff"));
        }
    }
}

void tst_QExifImageHeader::hostileInputs()
{
    QFETCH(QString, path);
    QFETCH(bool, bare);
    const QByteArray data = readFile(path);
    QVERIFY(!data.isEmpty());

    QLoggingCategory::setFilterRules(QStringLiteral("Orvane.Loomkit.File.warning=false"));
    QExifImageHeader header;
    const bool loaded = bare ? header.read(data) : header.loadFromJpeg(path);
    // The same bytes wrapped in an APP1 segment must give the same result.
    QExifImageHeader wrapped;
    QBuffer buffer;
    buffer.setData(app1(data.left(65000)));
    QVERIFY(buffer.open(QIODevice::ReadOnly));
    const bool wrappedLoaded = wrapped.loadFromJpeg(&buffer);
    header.toTiffBlock(); // whatever was read can be written again
    QLoggingCategory::setFilterRules(QString());

    if (bare && data.size() <= 65000)
        QCOMPARE(wrappedLoaded, loaded);
    // No value holds more than the input has bytes.
    qint64 total = header.thumbnailData().size();
    for (const QExifImageHeader *h : {&header, &wrapped}) {
        for (auto group : {QExifImageHeader::ImageGroup, QExifImageHeader::ExtendedGroup, QExifImageHeader::GpsGroup}) {
            for (int tag : h->tags(group))
                total += h->value(group, tag).count();
        }
    }
    QVERIFY2(total <= 2 * data.size() + 64, qPrintable(QString::number(total)));
    if (!loaded)
        QVERIFY(header.imageTags().isEmpty());
}

void tst_QExifImageHeader::hardening_data()
{
    QTest::addColumn<QByteArray>("jpeg");
    QTest::addColumn<QList<int>>("imageTags"); // empty: the load fails
    QTest::addColumn<QList<int>>("extendedTags");
    QTest::addColumn<int>("thumbnailSize");

    const auto row = [](const char *name, const QByteArray &jpeg, QList<int> image = {}, QList<int> extended = {}) {
        QTest::newRow(name) << jpeg << image << extended << 0;
    };
    row("segment length 0", QByteArray("\xff\xd8\xff\xe0\0\0\xff\xe1\0\0", 10));
    row("segment length 1", QByteArray("\xff\xd8\xff\xdb\0\x01xxxx", 10));
    row("walk runs off the end", QByteArray("\xff\xd8\xff\xe0\0\x10JFIF", 10));
    row("only SOI", QByteArray("\xff\xd8", 2));
    row("no SOI", QByteArray("\xff\xe1\0\x10" "Exif\0\0II*\0", 14));
    row("APP1 shorter than its signature", QByteArray("\xff\xd8\xff\xe1\0\x06Exif\0\0", 12));
    row("IFD0 outside the block", app1(TiffBuilder().u32(4000).u16(0).data));
    row("bad magic", app1(QByteArray("II\x2b\0\x08\0\0\0\0\0", 10)));
    row("bad byte order", app1(QByteArray("IM\x2a\0\x08\0\0\0\0\0", 10)));
    row("counts past the block",
        app1(TiffBuilder().u32(8).u16(3).entry(270, 2, 1000, 20).entry(273, 4, 0x40000000, 8).entry(274, 3, 1, 6).u32(0).data),
        {270, 273, 274});
    row("IFD cut short", app1(TiffBuilder().u32(8).u16(50).entry(271, 2, 2, 0x41).entry(272, 2, 2, 0x42).data), {271, 272});
    row("IFDs pointing back at IFD0",
        app1(TiffBuilder().u32(8).u16(2).entry(271, 2, 2, 0x41).entry(34665, 4, 1, 8).u32(8).data), {271});
    row("GPS and IFD1 at the Exif IFD",
        app1(TiffBuilder().u32(8).u16(3).entry(271, 2, 2, 0x41).entry(34665, 4, 1, 50).entry(34853, 4, 1, 50).u32(50)
                 .u16(1).entry(33434, 4, 1, 9).u32(0).data),
        {271}, {33434});
    TiffBuilder thumbnail;
    thumbnail.u32(8).u16(1).entry(271, 2, 2, 0x41).u32(26).u16(2);
    row("thumbnail outside the block",
        app1(TiffBuilder(thumbnail).entry(513, 4, 1, 0x7ffffff0).entry(514, 4, 1, 0x7fffffff).u32(0).data), {271});
    thumbnail.entry(513, 4, 1, 56).entry(514, 4, 1, 4).u32(0).data.append("\xff\xd8\xff\xd9");
    QTest::newRow("thumbnail inside the block") << app1(thumbnail.data) << QList<int>{271} << QList<int>() << 4;
}

void tst_QExifImageHeader::hardening()
{
    QFETCH(QByteArray, jpeg);
    QFETCH(QList<int>, imageTags);
    QFETCH(QList<int>, extendedTags);
    QFETCH(int, thumbnailSize);

    QBuffer buffer(&jpeg);
    QVERIFY(buffer.open(QIODevice::ReadOnly));
    QExifImageHeader header;
    QCOMPARE(header.loadFromJpeg(&buffer), !imageTags.isEmpty());
    QCOMPARE(header.imageTags(), imageTags);
    QCOMPARE(header.extendedTags(), extendedTags);
    QVERIFY(header.gpsTags().isEmpty());
    QCOMPARE(header.thumbnailData().size(), thumbnailSize);
    // Values that don't fit read as empty values of their type.
    for (int tag : imageTags) {
        const QExifValue value = header.imageValue(tag);
        QVERIFY(!value.isNull() && (value.count() <= 2 || value.type() == QExifValue::Short));
    }
}

void tst_QExifImageHeader::sharedValuesDontMultiplyMemory()
{
    // 2000 entries that all point at one 40000-byte value: only the first
    // reads it, as the values may not take more bytes than the block holds.
    TiffBuilder tiff;
    const int entries = 2000;
    tiff.u32(8).u16(entries);
    for (int i = 0; i < entries; ++i)
        tiff.entry(quint16(1000 + i), 7, 40000, 8 + 2 + 12 * entries + 4);
    tiff.u32(0).data.append(QByteArray(40000, 'x'));

    const Reread header(tiff.data);
    QCOMPARE(header.imageTags().size(), entries);
    int full = 0;
    for (int tag : header.imageTags())
        full += header.imageValue(tag).toByteArray().size() == 40000 ? 1 : 0;
    QCOMPARE(full, 1);
}

void tst_QExifImageHeader::saveFailuresKeepTheOriginal()
{
    const QString text = m_dir.filePath("not-a-jpeg.jpg");
    QVERIFY(writeFile(text, QByteArray("plain text, no image")));
    QExifImageHeader header;
    header.setImageValue(271, QExifValue(QStringLiteral("Acme")));
    QVERIFY(!header.saveToJpeg(text));
    QCOMPARE(readFile(text), QByteArray("plain text, no image"));

    // A JPEG cut before its scan: the copy runs out and the save fails.
    const QString jpeg = m_dir.filePath("cut.jpg");
    QVERIFY(makeJpeg(jpeg));
    const QByteArray whole = readFile(jpeg);
    const QByteArray cut = whole.left(whole.indexOf("\xff\xda"));
    QVERIFY(writeFile(jpeg, cut));
    QVERIFY(!header.saveToJpeg(jpeg));
    QCOMPARE(readFile(jpeg), cut);
    QVERIFY(!header.saveToJpeg(m_dir.filePath("missing.jpg")));
    for (const QString &path : {text, jpeg, m_dir.filePath("missing.jpg")})
        QVERIFY(!QFile::exists(path + QLatin1String(".tmp")));

    // A block too large for one segment is refused, not wrapped.
    QVERIFY(writeFile(jpeg, whole));
    header.setThumbnailData(QByteArray(70000, 'x'));
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Exif block too large")));
    QVERIFY(!header.saveToJpeg(jpeg));
    QCOMPARE(readFile(jpeg), whole);

    // A sequential source is refused.
    header.setThumbnailData(QByteArray());
    QByteArray source = whole;
    SequentialBuffer sequential(&source);
    QVERIFY(sequential.open(QIODevice::ReadOnly));
    QBuffer sink;
    QVERIFY(sink.open(QIODevice::WriteOnly));
    QVERIFY(!header.saveToJpeg(&sequential, &sink));
    QVERIFY(sink.data().isEmpty());
}

QTEST_MAIN(tst_QExifImageHeader)
#include "tst_QExifImageHeader.moc"
