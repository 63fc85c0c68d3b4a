#include "ExifTestSupport.h"
#include "QExifImageHeader.h"
#include "TestSupport.h"

#include <QBuffer>
#include <QDir>
#include <QDirIterator>
#include <QFile>
#include <QJsonArray>
#include <QTemporaryDir>
#include <QtTest>

using namespace ExifTestSupport;

namespace {

double ratio(const QExifURational &r)
{
    return double(r.first) / r.second;
}

double ratio(const QExifSRational &r)
{
    return double(r.first) / r.second;
}

// Reads numbers out of a TIFF block the way a plain reader would.
struct Block
{
    QByteArray data;
    bool le = true;

    quint16 u16(int offset) const
    {
        const uchar *p = reinterpret_cast<const uchar *>(data.constData()) + offset;
        return le ? quint16(p[0] | p[1] << 8) : quint16(p[0] << 8 | p[1]);
    }
    quint32 u32(int offset) const
    {
        return le ? quint32(u16(offset)) | quint32(u16(offset + 2)) << 16
                  : quint32(u16(offset)) << 16 | u16(offset + 2);
    }
    // Entry i of the IFD at offset: tag, type, count, last word.
    quint16 tag(int ifd, int i) const { return u16(ifd + 2 + 12 * i); }
    quint16 type(int ifd, int i) const { return u16(ifd + 2 + 12 * i + 2); }
    quint32 count(int ifd, int i) const { return u32(ifd + 2 + 12 * i + 4); }
    quint32 word(int ifd, int i) const { return u32(ifd + 2 + 12 * i + 8); }
    QByteArray raw(int ifd, int i) const { return data.mid(ifd + 2 + 12 * i + 8, 4); }
};

// Builds a little-endian TIFF block by hand, for inputs our writer never makes.
class TiffBuilder
{
public:
    QByteArray data = QByteArray("II\x2a\0", 4);

    TiffBuilder &u16(quint16 v)
    {
        data.append(char(v)).append(char(v >> 8));
        return *this;
    }
    TiffBuilder &u32(quint32 v)
    {
        return u16(quint16(v)).u16(quint16(v >> 16));
    }
    TiffBuilder &entry(quint16 tag, quint16 type, quint32 count, quint32 word)
    {
        return u16(tag).u16(type).u32(count).u32(word);
    }
    TiffBuilder &pad(int size, char fill = 'x')
    {
        data.append(QByteArray(size, fill));
        return *this;
    }
};

class SequentialBuffer : public QBuffer
{
public:
    using QBuffer::QBuffer;
    bool isSequential() const override { return true; }
};

QByteArray app1(const QByteArray &tiff)
{
    const QByteArray body = QByteArray("Exif\0\0", 6) + tiff;
    const int length = body.size() + 2;
    return QByteArray("\xff\xd8\xff\xe1", 4) + char(length >> 8) + char(length) + body + QByteArray("\xff\xd9", 2);
}

} // namespace

class tst_QExifImageHeader : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void readsExiftoolFiles_data();
    void readsExiftoolFiles();
    void onlyTheFirstApp1Counts();
    void savedFilesReadByExiftool_data();
    void savedFilesReadByExiftool();
    void blockLayout();
    void secondSaveRepeatsGpsPointer();
    void thumbnailLayout();
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
    QString taggedFile(const QString &name, const QString &byteOrder, const QStringList &extra = QStringList());

    QTemporaryDir m_dir;
    QString m_thumbnail;
};

void tst_QExifImageHeader::initTestCase()
{
    QVERIFY(m_dir.isValid());
    m_thumbnail = m_dir.filePath(QStringLiteral("thumb.jpg"));
    QVERIFY(makeJpeg(m_thumbnail, 16, 12, Qt::red));
}

QString tst_QExifImageHeader::taggedFile(const QString &name, const QString &byteOrder, const QStringList &extra)
{
    const QString path = m_dir.filePath(name);
    if (!makeJpeg(path))
        return QString();
    const QStringList arguments = QStringList{
        QStringLiteral("-ExifByteOrder=") + byteOrder,
        QStringLiteral("-Make=Acme"),
        QStringLiteral("-Model=Cam 1"),
        QStringLiteral("-Artist=Ann"),
        QStringLiteral("-ImageDescription=A description longer than four"),
        QStringLiteral("-Orientation#=6"),
        QStringLiteral("-XResolution=300"),
        QStringLiteral("-DateTimeOriginal=2024:05:06 07:08:09"),
        QStringLiteral("-ExposureTime=0.01"),
        QStringLiteral("-FNumber=2.8"),
        QStringLiteral("-ISO=200"),
        QStringLiteral("-ExposureCompensation=-0.5"),
        QStringLiteral("-InteropIndex=R98"),
        QStringLiteral("-GPSLatitude=33.5"),
        QStringLiteral("-GPSLatitudeRef=S"),
        QStringLiteral("-GPSLongitude=151.25"),
        QStringLiteral("-GPSLongitudeRef=E"),
        QStringLiteral("-GPSAltitude=12.5"),
        QStringLiteral("-ThumbnailImage<=") + m_thumbnail,
    } + extra;
    return exiftoolWrite(path, arguments) ? path : QString();
}

void tst_QExifImageHeader::readsExiftoolFiles_data()
{
    QTest::addColumn<QString>("byteOrder");
    QTest::newRow("II") << QStringLiteral("II");
    QTest::newRow("MM") << QStringLiteral("MM");
}

void tst_QExifImageHeader::readsExiftoolFiles()
{
    if (!TestSupport::hasProgram(QStringLiteral("exiftool")))
        QSKIP("exiftool is not installed");
    QFETCH(QString, byteOrder);
    const QString path = taggedFile(QStringLiteral("read-%1.jpg").arg(byteOrder), byteOrder);
    QVERIFY(!path.isEmpty());
    const bool le = byteOrder == QLatin1String("II");

    QExifImageHeader header;
    QVERIFY(header.loadFromJpeg(path));
    QCOMPARE(header.byteOrder(), le ? QDataStream::LittleEndian : QDataStream::BigEndian);

    QCOMPARE(header.imageValue(271).toString(), QStringLiteral("Acme"));
    QCOMPARE(header.imageValue(272).toString(), QStringLiteral("Cam 1"));
    QCOMPARE(header.imageValue(315).toString(), QStringLiteral("Ann")); // inline ASCII
    QCOMPARE(header.imageValue(270).toString(), QStringLiteral("A description longer than four"));
    QCOMPARE(header.imageValue(274).toShort(), quint16(6));
    QCOMPARE(header.imageValue(282).toRational(), QExifURational(300, 1));
    QVERIFY(!header.containsImageTag(34665));
    QVERIFY(!header.containsImageTag(34853));

    QCOMPARE(header.extendedValue(36867).toString(), QStringLiteral("2024:05:06 07:08:09"));
    QCOMPARE(ratio(header.extendedValue(33434).toRational()), 0.01);
    QCOMPARE(ratio(header.extendedValue(33437).toRational()), 2.8);
    QCOMPARE(header.extendedValue(34855).toShort(), quint16(200));
    QCOMPARE(ratio(header.extendedValue(37380).toSignedRational()), -0.5);
    QVERIFY(!header.containsExtendedTag(40965));

    // Short UNDEFINED values lie in the entry as a word: big-endian files
    // give them back reversed.
    QCOMPARE(header.extendedValue(36864).toByteArray(), le ? QByteArray("0232") : QByteArray("2320"));
    QCOMPARE(header.extendedValue(37121).toByteArray(),
             le ? QByteArray("\1\2\3\0", 4) : QByteArray("\0\3\2\1", 4));

    QCOMPARE(header.gpsValue(0).toByteVector(), (QVector<quint8>{2, 3, 0, 0}));
    QCOMPARE(header.gpsValue(1).toString(), QStringLiteral("S"));
    const QVector<QExifURational> latitude = header.gpsValue(2).toRationalVector();
    QCOMPARE(latitude.size(), 3);
    QCOMPARE(ratio(latitude[0]) + ratio(latitude[1]) / 60 + ratio(latitude[2]) / 3600, 33.5);
    QCOMPARE(header.gpsValue(3).toString(), QStringLiteral("E"));
    QCOMPARE(ratio(header.gpsValue(6).toRational()), 12.5);

    QCOMPARE(header.thumbnailData(), readFile(m_thumbnail));
    QVERIFY(!header.thumbnailXResolution().isNull());
}

void tst_QExifImageHeader::onlyTheFirstApp1Counts()
{
    if (!TestSupport::hasProgram(QStringLiteral("exiftool")))
        QSKIP("exiftool is not installed");
    const QString path = taggedFile(QStringLiteral("xmp.jpg"), QStringLiteral("II"),
                                    {QStringLiteral("-XMP-dc:Title=Loom")});
    QVERIFY(!path.isEmpty());
    QExifImageHeader header;
    QVERIFY(header.loadFromJpeg(path));

    // Move the XMP segment ahead of the Exif one: now there is no Exif data.
    int sos = -1;
    const QByteArray jpeg = readFile(path);
    QList<Segment> list = segments(jpeg, &sos);
    int xmp = -1;
    for (int i = 0; i < list.size(); ++i) {
        if (list[i].marker == 0xffe1 && list[i].data.startsWith("http://ns.adobe.com/xap/1.0/"))
            xmp = i;
    }
    QVERIFY(xmp > 0);
    list.prepend(list.takeAt(xmp));
    const QString reordered = m_dir.filePath(QStringLiteral("xmp-first.jpg"));
    QVERIFY(writeFile(reordered, assemble(list, jpeg.mid(sos))));
    QVERIFY(!exiftoolRead(reordered).value(QStringLiteral("IFD0:Make")).toString().isEmpty());
    QVERIFY(!header.loadFromJpeg(reordered));
    QVERIFY(header.imageTags().isEmpty());

    // The corpus files whose APP1 holds XMP only.
    for (const QString &name : {QStringLiteral("image01551.jpg"), QStringLiteral("image02206.jpg")})
        QVERIFY(!header.loadFromJpeg(TestSupport::dataPath(QStringLiteral("exif/broken/") + name)));
}

void tst_QExifImageHeader::savedFilesReadByExiftool_data()
{
    QTest::addColumn<QString>("byteOrder");
    QTest::newRow("II") << QStringLiteral("II");
    QTest::newRow("MM") << QStringLiteral("MM");
}

void tst_QExifImageHeader::savedFilesReadByExiftool()
{
    if (!TestSupport::hasProgram(QStringLiteral("exiftool")))
        QSKIP("exiftool is not installed");
    QFETCH(QString, byteOrder);
    const QString path = taggedFile(QStringLiteral("save-%1.jpg").arg(byteOrder), byteOrder,
                                    {QStringLiteral("-XMP-dc:Title=Loom")});
    QVERIFY(!path.isEmpty());
    int scanStart = -1;
    segments(readFile(path), &scanStart);
    const QByteArray scan = readFile(path).mid(scanStart);

    QExifImageHeader header;
    QVERIFY(header.loadFromJpeg(path));
    header.setImageValue(271, QExifValue(QStringLiteral("Loomkit")));
    header.setExtendedValue(37510, QExifValue(QStringLiteral("hello"), QExifValue::AsciiEncoding));
    header.setExtendedValue(37382, QExifValue(QExifURational(5, 2)));
    QVERIFY(header.saveToJpeg(path));
    QVERIFY(!QFile::exists(path + QLatin1String(".tmp")));

    // One APP1 first, all other application segments gone, the scan intact.
    int sos = -1;
    const QByteArray saved = readFile(path);
    const QList<Segment> list = segments(saved, &sos);
    QVERIFY(!list.isEmpty());
    QCOMPARE(list.first().marker, quint16(0xffe1));
    for (int i = 1; i < list.size(); ++i)
        QVERIFY2(list[i].marker < 0xffe0 || list[i].marker > 0xffef, qPrintable(QString::number(list[i].marker, 16)));
    QCOMPARE(saved.mid(sos), scan);

    const QJsonObject tags = exiftoolRead(path);
    QVERIFY(!tags.contains(QStringLiteral("ExifTool:Error")));
    const QJsonObject validation = exiftoolRead(path, {QStringLiteral("-validate"), QStringLiteral("-error")});
    QVERIFY(validation.contains(QStringLiteral("ExifTool:Validate")));
    QVERIFY(!validation.contains(QStringLiteral("ExifTool:Error")));
    QCOMPARE(tags.value(QStringLiteral("ExifIFD:UserComment")).toString(), QStringLiteral("hello"));
    QCOMPARE(tags.value(QStringLiteral("IFD0:Make")).toString(), QStringLiteral("Loomkit"));
    QCOMPARE(tags.value(QStringLiteral("IFD0:Model")).toString(), QStringLiteral("Cam 1"));
    QCOMPARE(tags.value(QStringLiteral("IFD0:Artist")).toString(), QStringLiteral("Ann"));
    QCOMPARE(tags.value(QStringLiteral("IFD0:Orientation")).toInt(), 6);
    QCOMPARE(tags.value(QStringLiteral("ExifIFD:DateTimeOriginal")).toString(), QStringLiteral("2024:05:06 07:08:09"));
    QCOMPARE(tags.value(QStringLiteral("ExifIFD:ExposureTime")).toDouble(), 0.01);
    QCOMPARE(tags.value(QStringLiteral("ExifIFD:FNumber")).toDouble(), 2.8);
    QCOMPARE(tags.value(QStringLiteral("ExifIFD:ISO")).toInt(), 200);
    QCOMPARE(tags.value(QStringLiteral("ExifIFD:ExposureCompensation")).toDouble(), -0.5);
    QCOMPARE(tags.value(QStringLiteral("ExifIFD:SubjectDistance")).toDouble(), 2.5);
    QCOMPARE(tags.value(QStringLiteral("GPS:GPSLatitude")).toDouble(), 33.5);
    QCOMPARE(tags.value(QStringLiteral("GPS:GPSLatitudeRef")).toString(), QStringLiteral("S"));
    QCOMPARE(tags.value(QStringLiteral("GPS:GPSLongitude")).toDouble(), 151.25);
    QCOMPARE(tags.value(QStringLiteral("GPS:GPSAltitude")).toDouble(), 12.5);
    QCOMPARE(tags.value(QStringLiteral("IFD1:ThumbnailLength")).toInt(), readFile(m_thumbnail).size());
    // The interoperability IFD and the XMP segment are not carried over.
    QVERIFY(!tags.contains(QStringLiteral("InteropIFD:InteropIndex")));
    QVERIFY(!tags.contains(QStringLiteral("XMP-dc:Title")));
    // A big-endian file's short UNDEFINED values come back reversed and are
    // written as they were read.
    QCOMPARE(tags.value(QStringLiteral("ExifIFD:ExifVersion")).toVariant().toString(),
             byteOrder == QLatin1String("II") ? QStringLiteral("0232") : QStringLiteral("2320"));

    int exitCode = -1;
    const QByteArray thumbnail = TestSupport::run(QStringLiteral("exiftool"),
                                                  {QStringLiteral("-b"), QStringLiteral("-ThumbnailImage"), path},
                                                  &exitCode);
    QCOMPARE(thumbnail, readFile(m_thumbnail));

    // What we wrote, we read back.
    QExifImageHeader again;
    QVERIFY(again.loadFromJpeg(path));
    QList<int> expectedTags = header.imageTags();
    expectedTags.removeAll(34853);
    QCOMPARE(again.imageTags(), expectedTags);
    QCOMPARE(again.extendedValue(37510).toString(), QStringLiteral("hello"));
    QCOMPARE(again.gpsValue(2).toRationalVector(), header.gpsValue(2).toRationalVector());
    QCOMPARE(again.thumbnailData(), header.thumbnailData());
}

void tst_QExifImageHeader::blockLayout()
{
    QExifImageHeader header;
    header.setImageValue(270, QExifValue(QStringLiteral("abc")));       // inline, count 4
    header.setImageValue(271, QExifValue(QStringLiteral("Acme Corp"))); // count 10
    header.setExtendedValue(36864, QExifValue(QByteArray("0230")));
    header.setExtendedValue(33434, QExifValue(QExifURational(1, 100)));

    // Without GPS data: IFD0 holds its entries and the Exif pointer.
    Block block{header.toTiffBlock(), true};
    QCOMPARE(block.data.left(8), QByteArray("II\x2a\0\x08\0\0\0", 8));
    QCOMPARE(block.u16(8), quint16(3));
    QCOMPARE(block.tag(8, 0), quint16(270));
    QCOMPARE(block.raw(8, 0), QByteArray("abc\0", 4));
    QCOMPARE(block.tag(8, 1), quint16(271));
    QCOMPARE(block.word(8, 1), 26u + 12 * 2);
    QCOMPARE(block.tag(8, 2), quint16(34665));
    QCOMPARE(block.u32(8 + 2 + 36), 0u); // next IFD: no thumbnail
    QCOMPARE(block.data.mid(50, 10), QByteArray("Acme Corp\0", 10));
    const quint32 exif = block.word(8, 2);
    QCOMPARE(exif, 60u);
    QCOMPARE(block.u16(int(exif)), quint16(2));
    QCOMPARE(block.tag(int(exif), 0), quint16(33434));
    QCOMPARE(block.word(int(exif), 0), exif + 2 + 24);
    QCOMPARE(block.raw(int(exif), 1), QByteArray("0230"));
    // The zero word follows the values, not the entries.
    QCOMPARE(block.u32(int(exif) + 2 + 24), 1u);
    QCOMPARE(block.u32(int(exif) + 2 + 24 + 8), 0u);
    QCOMPARE(block.data.size(), int(exif) + 2 + 24 + 8 + 4);
    QCOMPARE(header.size(), qint64(block.data.size()));

    // With GPS data: one more pointer, and everything moves by 12.
    header.setGpsValue(0, QExifValue(QVector<quint8>{2, 3, 0, 0}));
    header.setGpsValue(2, QExifValue(QVector<QExifURational>{{33, 1}, {30, 1}, {0, 1}}));
    header.setByteOrder(QDataStream::BigEndian);
    block = Block{header.toTiffBlock(), false};
    QCOMPARE(block.data.left(8), QByteArray("MM\0\x2a\0\0\0\x08", 8));
    QCOMPARE(block.u16(8), quint16(4));
    QCOMPARE(block.word(8, 1), 38u + 12 * 2);
    QCOMPARE(block.tag(8, 3), quint16(34853));
    const quint32 exifOffset = block.word(8, 2);
    const quint32 gps = block.word(8, 3);
    QCOMPARE(exifOffset, 72u);
    QCOMPARE(gps, exifOffset + 2 + 12 + 20 + 4);
    QCOMPARE(block.u16(int(gps)), quint16(2));
    QCOMPARE(block.raw(int(gps), 0), QByteArray("\2\3\0\0", 4));
    QCOMPARE(block.word(int(gps), 1), gps + 2 + 24);
    QCOMPARE(block.u32(int(gps) + 2 + 24), 33u);
    QCOMPARE(block.data.size(), int(gps) + 2 + 24 + 24 + 4);

    // The block reads back into the same maps.
    QExifImageHeader reread;
    QVERIFY(reread.read(block.data));
    QCOMPARE(reread.imageTags(), (QList<int>{270, 271}));
    QCOMPARE(reread.extendedTags(), (QList<int>{33434, 36864}));
    QCOMPARE(reread.gpsValue(2).toRationalVector(), header.gpsValue(2).toRationalVector());
    QCOMPARE(reread.imageValue(271).toString(), QStringLiteral("Acme Corp"));
}

void tst_QExifImageHeader::secondSaveRepeatsGpsPointer()
{
    QExifImageHeader header;
    header.setImageValue(271, QExifValue(QStringLiteral("Acme")));
    header.setGpsValue(1, QExifValue(QStringLiteral("N")));

    const Block first{header.toTiffBlock(), true};
    QCOMPARE(first.u16(8), quint16(3));
    QVERIFY(header.containsImageTag(34853));

    const Block second{header.toTiffBlock(), true};
    QCOMPARE(second.u16(8), quint16(4));
    QCOMPARE(second.tag(8, 1), quint16(34853)); // the stale copy, among the sorted entries
    QCOMPARE(second.word(8, 1), first.word(8, 2));
    QCOMPARE(second.tag(8, 2), quint16(34665));
    QCOMPARE(second.tag(8, 3), quint16(34853));
    QCOMPARE(second.word(8, 3), first.word(8, 2) + 12);
    QCOMPARE(second.data.size(), first.data.size() + 12);

    // A reader drops both copies.
    QExifImageHeader reread;
    QVERIFY(reread.read(second.data));
    QCOMPARE(reread.imageTags(), QList<int>{271});
    QCOMPARE(reread.gpsValue(1).toString(), QStringLiteral("N"));
}

void tst_QExifImageHeader::thumbnailLayout()
{
    QExifImageHeader header;
    const QByteArray thumbnail = QByteArray("\xff\xd8thumbnail\xff\xd9");
    header.setThumbnailData(thumbnail);
    header.setThumbnailXResolution(QExifValue(QExifURational(96, 1)));

    const Block block{header.toTiffBlock(), true};
    const quint32 ifd1 = block.u32(8 + 2 + 12);
    QCOMPARE(ifd1, quint32(8 + 2 + 12 + 4 + 2 + 4));
    QCOMPARE(block.u16(int(ifd1)), quint16(7));
    const QList<quint16> tags{259, 282, 283, 296, 274, 513, 514};
    for (int i = 0; i < tags.size(); ++i)
        QCOMPARE(block.tag(int(ifd1), i), tags[i]);
    QCOMPARE(block.word(int(ifd1), 0), 6u);
    QCOMPARE(block.word(int(ifd1), 1), ifd1 + 86);
    QCOMPARE(block.u32(int(ifd1) + 86), 96u);
    QCOMPARE(block.word(int(ifd1), 2), ifd1 + 94);
    QCOMPARE(block.u32(int(ifd1) + 94), 72u); // default resolution
    QCOMPARE(block.word(int(ifd1), 3), 2u);
    QCOMPARE(block.word(int(ifd1), 4), 0u); // default orientation
    QCOMPARE(block.word(int(ifd1), 5), ifd1 + 102);
    QCOMPARE(block.word(int(ifd1), 6), quint32(thumbnail.size()));
    QCOMPARE(block.data.mid(int(ifd1) + 102), thumbnail);

    QExifImageHeader reread;
    QVERIFY(reread.read(block.data));
    QCOMPARE(reread.thumbnailData(), thumbnail);
    QCOMPARE(reread.thumbnailXResolution().toRational(), QExifURational(96, 1));
    QCOMPARE(reread.thumbnailOrientation().toShort(), quint16(0));
    // clear keeps the thumbnail's values but drops its data.
    reread.clear();
    QVERIFY(reread.thumbnailData().isEmpty());
    QCOMPARE(reread.thumbnailXResolution().toRational(), QExifURational(96, 1));
    QCOMPARE(reread.size(), qint64(-1));
}

void tst_QExifImageHeader::inlineValues_data()
{
    QTest::addColumn<QExifValue>("value");
    QTest::addColumn<bool>("isInline");
    QTest::addColumn<QByteArray>("inlineBytes");

    QTest::newRow("ascii of 4 with terminator") << QExifValue(QStringLiteral("abc")) << true << QByteArray("abc\0", 4);
    QTest::newRow("ascii of 5") << QExifValue(QStringLiteral("abcd")) << false << QByteArray();
    QTest::newRow("byte x4") << QExifValue(QVector<quint8>{1, 2, 3, 4}) << true << QByteArray("\1\2\3\4", 4);
    QTest::newRow("byte x5") << QExifValue(QVector<quint8>{1, 2, 3, 4, 5}) << false << QByteArray();
    QTest::newRow("short x1 padded") << QExifValue(quint16(0x0102)) << true << QByteArray("\2\1\0\0", 4);
    QTest::newRow("short x3") << QExifValue(QVector<quint16>{1, 2, 3}) << false << QByteArray();
    QTest::newRow("long x0") << QExifValue(QVector<quint32>()) << true << QByteArray(4, '\0');
    QTest::newRow("long x2") << QExifValue(QVector<quint32>{1, 2}) << false << QByteArray();
    QTest::newRow("rational x0") << QExifValue(QVector<QExifURational>()) << true << QByteArray(4, '\0');
    QTest::newRow("rational x1 never inline") << QExifValue(QExifURational(1, 1)) << false << QByteArray();
    QTest::newRow("undefined x2 padded") << QExifValue(QByteArray("ab")) << true << QByteArray("ab\0\0", 4);
}

void tst_QExifImageHeader::inlineValues()
{
    QFETCH(QExifValue, value);
    QFETCH(bool, isInline);
    QFETCH(QByteArray, inlineBytes);

    QExifImageHeader header;
    header.setImageValue(700, value);
    const Block block{header.toTiffBlock(), true};
    const quint32 valuesStart = 26 + 12;
    QCOMPARE(block.count(8, 0), value.count());
    if (isInline) {
        QCOMPARE(block.raw(8, 0), inlineBytes);
        QCOMPARE(block.word(8, 1), valuesStart);
    } else {
        QCOMPARE(block.word(8, 0), valuesStart);
        QVERIFY(block.word(8, 1) > valuesStart);
    }

    // Whatever the form, the value reads back as written, in both orders.
    for (QDataStream::ByteOrder order : {QDataStream::LittleEndian, QDataStream::BigEndian}) {
        header.setByteOrder(order);
        QExifImageHeader reread;
        QVERIFY(reread.read(header.toTiffBlock()));
        const QExifValue back = reread.imageValue(700);
        QCOMPARE(back.type(), value.type());
        QCOMPARE(back.count(), value.count());
        if (value.type() == QExifValue::Undefined && order == QDataStream::BigEndian)
            QCOMPARE(back.toByteArray(), QByteArray("\0\0", 2)); // reversed word, first two bytes
        else if (value.type() == QExifValue::Undefined)
            QCOMPARE(back.toByteArray(), value.toByteArray());
        QCOMPARE(back.toString(), value.toString());
        QCOMPARE(back.toShortVector(), value.toShortVector());
        QCOMPARE(back.toRationalVector(), value.toRationalVector());
        QCOMPARE(back.toByteVector(), value.toByteVector());
    }
}

void tst_QExifImageHeader::unknownTypeWarns()
{
    QExifImageHeader header;
    header.setImageValue(300, QExifValue());
    header.setExtendedValue(301, QExifValue());
    header.setExtendedValue(302, QExifValue(QVector<quint32>{7, 8}));
    header.setGpsValue(1, QExifValue(QStringLiteral("N")));
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Invalid Ifd Type 0$")));
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Invalid Ifd Type 0$")));
    const Block block{header.toTiffBlock(), true};
    QCOMPARE(block.tag(8, 0), quint16(300));
    QCOMPARE(block.type(8, 0), quint16(0));
    QCOMPARE(block.word(8, 0), 0u);
    // The unknown entry takes 12 bytes but counts as none in the layout, so
    // the GPS pointer falls 12 bytes short of where its IFD lies.
    const quint32 exif = block.word(8, 1);
    const quint32 gps = block.word(8, 2);
    QCOMPARE(gps, exif + 2 + 20 + 4);
    QCOMPARE(block.u16(int(gps) + 12), quint16(1));

    // The reader keeps a null value under an unknown type's tag.
    TiffBuilder tiff;
    tiff.u32(8).u16(1).entry(400, 13, 1, 5).u32(0);
    QExifImageHeader reread;
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Invalid Ifd Type 13$")));
    QVERIFY(reread.read(tiff.data));
    QVERIFY(reread.containsImageTag(400));
    QVERIFY(reread.imageValue(400).isNull());
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
    if (!TestSupport::hasProgram(QStringLiteral("exiftool")))
        QSKIP("exiftool is not installed");
    QFETCH(QString, path);
    const QJsonObject tags = exiftoolRead(path);
    QVERIFY(!tags.isEmpty());

    QExifImageHeader header;
    QVERIFY(header.loadFromJpeg(path));
    const QString order = tags.value(QStringLiteral("File:ExifByteOrder")).toString();
    QCOMPARE(header.byteOrder(), order == QLatin1String("II") ? QDataStream::LittleEndian : QDataStream::BigEndian);

    // exiftool trims trailing blanks and NULs; we drop the last byte of the
    // count whether or not it is the terminator.
    const auto sameText = [](const QString &ours, const QJsonValue &theirs) {
        const QString expected = theirs.toVariant().toString();
        const QString actual = QString(ours).remove(QChar(0)).trimmed();
        return expected.startsWith(actual) && expected.size() - actual.size() <= 1;
    };
    const auto compareText = [&](int tag, const QString &key) {
        const QJsonValue expected = tags.value(key);
        if (expected.isUndefined())
            QVERIFY(!header.containsImageTag(tag));
        else
            QVERIFY2(sameText(header.imageValue(tag).toString(), expected), qPrintable(key));
    };
    compareText(271, QStringLiteral("IFD0:Make"));
    compareText(272, QStringLiteral("IFD0:Model"));
    compareText(306, QStringLiteral("IFD0:ModifyDate"));
    if (tags.contains(QStringLiteral("IFD0:Orientation")))
        QCOMPARE(int(header.imageValue(274).toShort()), tags.value(QStringLiteral("IFD0:Orientation")).toInt());
    if (tags.contains(QStringLiteral("ExifIFD:DateTimeOriginal")))
        QVERIFY(sameText(header.extendedValue(36867).toString(), tags.value(QStringLiteral("ExifIFD:DateTimeOriginal"))));
    if (tags.contains(QStringLiteral("ExifIFD:ExposureTime"))) {
        const double expected = tags.value(QStringLiteral("ExifIFD:ExposureTime")).toDouble();
        QVERIFY(qAbs(ratio(header.extendedValue(33434).toRational()) - expected) <= expected * 1e-9);
    }
    if (tags.contains(QStringLiteral("GPS:GPSLatitude"))) {
        const QVector<QExifURational> v = header.gpsValue(2).toRationalVector();
        QCOMPARE(v.size(), 3);
        const double degrees = ratio(v[0]) + ratio(v[1]) / 60 + ratio(v[2]) / 3600;
        QVERIFY(qAbs(degrees - tags.value(QStringLiteral("GPS:GPSLatitude")).toDouble()) < 1e-6);
    }
    const int thumbnailLength = tags.value(QStringLiteral("IFD1:ThumbnailLength")).toInt();
    if (tags.value(QStringLiteral("IFD1:ThumbnailOffset")).isDouble() && thumbnailLength > 0) {
        QCOMPARE(header.thumbnailData().size(), thumbnailLength);
        QVERIFY(header.thumbnailData().startsWith("\xff\xd8"));
    }
    // Every IFD0 tag exiftool lists is in the map.
    int listed = 0;
    for (auto it = tags.begin(); it != tags.end(); ++it)
        listed += it.key().startsWith(QLatin1String("IFD0:")) ? 1 : 0;
    QVERIFY2(header.imageTags().size() >= listed, qPrintable(QStringLiteral("%1 < %2").arg(header.imageTags().size()).arg(listed)));

    // Rewriting keeps the values a reader can see. Files with no image
    // data (SOI, APP1, EOI) are refused and stay as they were.
    const QString copy = m_dir.filePath(QStringLiteral("camera-copy.jpg"));
    QFile::remove(copy);
    QVERIFY(QFile::copy(path, copy));
    QFile::setPermissions(copy, QFile::ReadOwner | QFile::WriteOwner);
    if (!tags.contains(QStringLiteral("File:ImageWidth"))) {
        QVERIFY(!header.saveToJpeg(copy));
        QCOMPARE(readFile(copy), readFile(path));
        return;
    }
    QVERIFY(header.saveToJpeg(copy));
    const QJsonObject rewritten = exiftoolRead(copy);
    QVERIFY(!rewritten.contains(QStringLiteral("ExifTool:Error")));
    for (const QString &key : {QStringLiteral("IFD0:Model"), QStringLiteral("ExifIFD:DateTimeOriginal")}) {
        if (tags.contains(key))
            QVERIFY2(sameText(rewritten.value(key).toVariant().toString(), tags.value(key)), qPrintable(key));
    }
    QCOMPARE(rewritten.value(QStringLiteral("GPS:GPSLatitude")), tags.value(QStringLiteral("GPS:GPSLatitude")));
    QCOMPARE(rewritten.value(QStringLiteral("File:ImageWidth")), tags.value(QStringLiteral("File:ImageWidth")));
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
    // Whatever was read can be written again.
    header.toTiffBlock();
    QLoggingCategory::setFilterRules(QString());

    if (bare && data.size() <= 65000)
        QCOMPARE(wrappedLoaded, loaded);
    // No value holds more than the input has bytes.
    qint64 total = header.thumbnailData().size();
    for (const QExifImageHeader *h : {&header, &wrapped}) {
        for (int tag : h->imageTags())
            total += h->imageValue(tag).count();
        for (int tag : h->extendedTags())
            total += h->extendedValue(tag).count();
        for (int tag : h->gpsTags())
            total += h->gpsValue(tag).count();
    }
    QVERIFY2(total <= 2 * data.size() + 64, qPrintable(QString::number(total)));
    if (!loaded)
        QVERIFY(header.imageTags().isEmpty());
}

void tst_QExifImageHeader::hardening_data()
{
    QTest::addColumn<QByteArray>("jpeg");
    QTest::addColumn<bool>("loaded");
    QTest::addColumn<QList<int>>("imageTags");
    QTest::addColumn<QList<int>>("extendedTags");
    QTest::addColumn<int>("thumbnailSize");

    QTest::newRow("segment length 0") << QByteArray("\xff\xd8\xff\xe0\0\0\xff\xe1\0\0", 10) << false << QList<int>()
                                      << QList<int>() << 0;
    QTest::newRow("segment length 1") << QByteArray("\xff\xd8\xff\xdb\0\x01xxxx", 10) << false << QList<int>()
                                      << QList<int>() << 0;
    QTest::newRow("walk runs off the end") << QByteArray("\xff\xd8\xff\xe0\0\x10JFIF", 10) << false << QList<int>()
                                           << QList<int>() << 0;
    QTest::newRow("only SOI") << QByteArray("\xff\xd8", 2) << false << QList<int>() << QList<int>() << 0;
    QTest::newRow("no SOI") << QByteArray("\xff\xe1\0\x10" "Exif\0\0II*\0", 14) << false << QList<int>() << QList<int>()
                            << 0;
    QTest::newRow("APP1 shorter than its signature")
        << QByteArray("\xff\xd8\xff\xe1\0\x06Exif\0\0", 12) << false << QList<int>() << QList<int>() << 0;

    TiffBuilder outside;
    outside.u32(4000).u16(0);
    QTest::newRow("IFD0 outside the block") << app1(outside.data) << false << QList<int>() << QList<int>() << 0;

    TiffBuilder past;
    past.u32(8).u16(3).entry(270, 2, 1000, 20).entry(273, 4, 0x40000000, 8).entry(274, 3, 1, 6).u32(0);
    QTest::newRow("counts past the block") << app1(past.data) << true << QList<int>{270, 273, 274} << QList<int>() << 0;

    TiffBuilder truncated;
    truncated.u32(8).u16(50).entry(271, 2, 2, 0x41).entry(272, 2, 2, 0x42);
    QTest::newRow("IFD cut short") << app1(truncated.data) << true << QList<int>{271, 272} << QList<int>() << 0;

    TiffBuilder selfLoop;
    selfLoop.u32(8).u16(2).entry(271, 2, 2, 0x41).entry(34665, 4, 1, 8).u32(8);
    QTest::newRow("IFDs pointing back at IFD0") << app1(selfLoop.data) << true << QList<int>{271} << QList<int>() << 0;

    TiffBuilder exifLoop;
    exifLoop.u32(8).u16(3).entry(271, 2, 2, 0x41).entry(34665, 4, 1, 50).entry(34853, 4, 1, 50).u32(50);
    exifLoop.u16(1).entry(33434, 4, 1, 9).u32(0);
    QTest::newRow("GPS and IFD1 at the Exif IFD")
        << app1(exifLoop.data) << true << QList<int>{271} << QList<int>{33434} << 0;

    TiffBuilder thumbnail;
    thumbnail.u32(8).u16(1).entry(271, 2, 2, 0x41).u32(26);
    thumbnail.u16(2).entry(513, 4, 1, 0x7ffffff0).entry(514, 4, 1, 0x7fffffff).u32(0);
    QTest::newRow("thumbnail outside the block") << app1(thumbnail.data) << true << QList<int>{271} << QList<int>()
                                                 << 0;

    TiffBuilder good;
    good.u32(8).u16(1).entry(271, 2, 2, 0x41).u32(26);
    good.u16(2).entry(513, 4, 1, 56).entry(514, 4, 1, 4).u32(0).data.append("\xff\xd8\xff\xd9");
    QTest::newRow("thumbnail inside the block") << app1(good.data) << true << QList<int>{271} << QList<int>() << 4;

    QTest::newRow("bad magic") << app1(QByteArray("II\x2b\0\x08\0\0\0\0\0", 10)) << false << QList<int>()
                               << QList<int>() << 0;
    QTest::newRow("bad byte order") << app1(QByteArray("IM\x2a\0\x08\0\0\0\0\0", 10)) << false << QList<int>()
                                    << QList<int>() << 0;
}

void tst_QExifImageHeader::hardening()
{
    QFETCH(QByteArray, jpeg);
    QFETCH(bool, loaded);
    QFETCH(QList<int>, imageTags);
    QFETCH(QList<int>, extendedTags);
    QFETCH(int, thumbnailSize);

    QBuffer buffer(&jpeg);
    QVERIFY(buffer.open(QIODevice::ReadOnly));
    QExifImageHeader header;
    QCOMPARE(header.loadFromJpeg(&buffer), loaded);
    QCOMPARE(header.imageTags(), imageTags);
    QCOMPARE(header.extendedTags(), extendedTags);
    QVERIFY(header.gpsTags().isEmpty());
    QCOMPARE(header.thumbnailData().size(), thumbnailSize);
    // Values that don't fit read as empty values of their type.
    for (int tag : imageTags) {
        const QExifValue value = header.imageValue(tag);
        QVERIFY(!value.isNull());
        QVERIFY(value.count() <= 2 || value.type() == QExifValue::Short);
    }
}

void tst_QExifImageHeader::sharedValuesDontMultiplyMemory()
{
    // 2000 entries that all point at one 40000-byte value: only the first
    // reads it, as the values may not take more bytes than the block holds.
    TiffBuilder tiff;
    const int entries = 2000;
    const quint32 valueOffset = 8 + 2 + 12 * entries + 4;
    tiff.u32(8).u16(entries);
    for (int i = 0; i < entries; ++i)
        tiff.entry(quint16(1000 + i), 7, 40000, valueOffset);
    tiff.u32(0).pad(40000);

    QExifImageHeader header;
    QVERIFY(header.read(tiff.data));
    QCOMPARE(header.imageTags().size(), entries);
    int full = 0;
    for (int tag : header.imageTags())
        full += header.imageValue(tag).toByteArray().size() == 40000 ? 1 : 0;
    QCOMPARE(full, 1);
}

void tst_QExifImageHeader::saveFailuresKeepTheOriginal()
{
    const QString text = m_dir.filePath(QStringLiteral("not-a-jpeg.jpg"));
    QVERIFY(writeFile(text, QByteArray("plain text, no image")));
    QExifImageHeader header;
    header.setImageValue(271, QExifValue(QStringLiteral("Acme")));
    QVERIFY(!header.saveToJpeg(text));
    QCOMPARE(readFile(text), QByteArray("plain text, no image"));
    QVERIFY(!QFile::exists(text + QLatin1String(".tmp")));

    // A JPEG cut before its scan: the copy runs out and the save fails.
    const QString jpeg = m_dir.filePath(QStringLiteral("cut.jpg"));
    QVERIFY(makeJpeg(jpeg));
    const QByteArray whole = readFile(jpeg);
    const QByteArray cut = whole.left(whole.indexOf("\xff\xda"));
    QVERIFY(writeFile(jpeg, cut));
    QVERIFY(!header.saveToJpeg(jpeg));
    QCOMPARE(readFile(jpeg), cut);
    QVERIFY(!QFile::exists(jpeg + QLatin1String(".tmp")));

    QVERIFY(!header.saveToJpeg(m_dir.filePath(QStringLiteral("missing.jpg"))));
    QVERIFY(!QFile::exists(m_dir.filePath(QStringLiteral("missing.jpg.tmp"))));

    // A block too large for one segment is refused, not wrapped.
    QVERIFY(makeJpeg(jpeg));
    const QByteArray original = readFile(jpeg);
    header.setThumbnailData(QByteArray(70000, 'x'));
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Exif block too large")));
    QVERIFY(!header.saveToJpeg(jpeg));
    QCOMPARE(readFile(jpeg), original);

    // A sequential source is refused.
    header.setThumbnailData(QByteArray());
    QByteArray source = original;
    SequentialBuffer sequential(&source);
    QVERIFY(sequential.open(QIODevice::ReadOnly));
    QBuffer sink;
    QVERIFY(sink.open(QIODevice::WriteOnly));
    QVERIFY(!header.saveToJpeg(&sequential, &sink));
    QVERIFY(sink.data().isEmpty());
}

QTEST_MAIN(tst_QExifImageHeader)
#include "tst_QExifImageHeader.moc"
