#include "ExifTestSupport.h"
#include "ImageAttributes.h"

#include <QDir>
#include <QFile>
#include <QImage>
#include <QSignalSpy>
#include <QTemporaryDir>
#include <QtTest>

using namespace ExifTestSupport;

namespace {

// The attribute segments of a file, parsed.
QList<ImageAttributes::Segment> attributeSegments(const ImageAttributes &attributes, const QString &path)
{
    QList<ImageAttributes::Segment> result;
    for (const Segment &segment : segments(readFile(path))) {
        ImageAttributes::Segment parsed;
        if (segment.marker == attributes.appMarker() && attributes.parse(segment.data, &parsed, true))
            result.append(parsed);
    }
    return result;
}

QList<quint16> markers(const QString &path)
{
    QList<quint16> result;
    for (const Segment &segment : segments(readFile(path)))
        result.append(segment.marker);
    return result;
}

} // namespace

class tst_ImageAttributes : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void init();
    void roundTrip_data();
    void roundTrip();
    void chunking_data();
    void chunking();
    void keysAndValues();
    void removal();
    void placement();
    void foreignSegmentsSurvive();
    void targets();
    void filesInAndOut();
    void stillAJpegForOtherTools();
    void properties();

private:
    ImageAttributes *attributes() { return m_attributes.data(); }

    QTemporaryDir m_dir;
    QString m_original;
    QString m_path;
    QScopedPointer<ImageAttributes> m_attributes;
};

void tst_ImageAttributes::initTestCase()
{
    QVERIFY(m_dir.isValid());
    m_original = m_dir.filePath("original.jpg");
    QVERIFY(makeJpeg(m_original));
}

void tst_ImageAttributes::init()
{
    m_path = m_dir.filePath("work.jpg");
    QFile::remove(m_path);
    QVERIFY(QFile::copy(m_original, m_path));
    m_attributes.reset(new ImageAttributes);
    m_attributes->setFilePath(m_path);
}

void tst_ImageAttributes::roundTrip_data()
{
    QTest::addColumn<QVariant>("value");
    QTest::addColumn<int>("valueType");
    QTest::addColumn<QVariant>("expected");

    const QVariantMap map{{"name", "Loom"}, {"list", QVariantList{1, 2.5, "x"}}, {"nested", QVariantMap{{"a", true}}}};
    QTest::newRow("text") << QVariant("Grüße, 世界") << 10 << QVariant("Grüße, 世界");
    QTest::newRow("empty text") << QVariant(QString(QLatin1String(""))) << 10 << QVariant(QString(QLatin1String("")));
    QTest::newRow("bytes") << QVariant(QByteArray("\0\1\2\xff", 4)) << 12 << QVariant(QByteArray("\0\1\2\xff", 4));
    QTest::newRow("map") << QVariant(map) << 8 << QVariant(map);
    QTest::newRow("null") << QVariant::fromValue(nullptr) << 51 << QVariant::fromValue<QObject *>(nullptr);
    // Other values are stored as their text and come back as its bytes.
    QTest::newRow("int") << QVariant(5) << 2 << QVariant(QByteArray("5"));
}

void tst_ImageAttributes::roundTrip()
{
    QFETCH(QVariant, value);
    QFETCH(int, valueType);
    QFETCH(QVariant, expected);

    QVERIFY(attributes()->setValue("key", value));
    QVERIFY(!QFile::exists(m_path + QLatin1String(".tmp")));
    const QList<ImageAttributes::Segment> list = attributeSegments(*attributes(), m_path);
    QCOMPARE(list.size(), 1);
    QCOMPARE(QStringLiteral("%1 %2 %3").arg(list.first().valueType).arg(list.first().version, 0, 16).arg(list.first().key),
             QStringLiteral("%1 502 key").arg(valueType));

    const QVariant back = attributes()->value("key");
    QCOMPARE(back.userType(), expected.userType());
    if (expected.userType() == QMetaType::QObjectStar)
        QCOMPARE(back.value<QObject *>(), nullptr);
    else QCOMPARE(back, expected);
    // Writing it again replaces it.
    QVERIFY(attributes()->setValue("key", "second"));
    QCOMPARE(attributeSegments(*attributes(), m_path).size(), 1);
    QCOMPARE(attributes()->value("key"), QVariant("second"));
}

void tst_ImageAttributes::chunking_data()
{
    QTest::addColumn<int>("size");
    QTest::addColumn<QList<quint32>>("chunkSizes");
    QTest::newRow("empty") << 0 << QList<quint32>{0};
    QTest::newRow("one full segment") << 64483 << QList<quint32>{64483};
    QTest::newRow("one byte more") << 64484 << QList<quint32>{64483, 1};
    QTest::newRow("three") << 150000 << QList<quint32>{64483, 64483, 21034};
}

void tst_ImageAttributes::chunking()
{
    QFETCH(int, size);
    QFETCH(QList<quint32>, chunkSizes);

    QByteArray data(size, Qt::Uninitialized);
    for (int i = 0; i < size; ++i)
        data[i] = char(i * 7 + i / 251);
    QVERIFY(attributes()->setValue("blob", data));

    const QList<ImageAttributes::Segment> list = attributeSegments(*attributes(), m_path);
    QCOMPARE(list.size(), chunkSizes.size());
    quint32 offset = 0;
    for (int i = 0; i < list.size(); ++i) {
        QCOMPARE(list[i].chunkOffset, offset);
        QCOMPARE(list[i].chunkSize, chunkSizes[i]);
        QCOMPARE(list[i].totalSize, quint32(size));
        offset += chunkSizes[i];
    }
    QCOMPARE(attributes()->value("blob").toByteArray(), data);
    QVERIFY(!QImage(m_path).isNull());
    if (size < 70000)
        return;

    // Without its first chunk a value never completes; keys() goes by first chunks.
    QVERIFY(attributes()->setValue("small", "s"));
    QVERIFY(editSegments(m_path, [this](QList<Segment> &segments) {
        for (int i = 0; i < segments.size(); ++i) {
            ImageAttributes::Segment parsed;
            if (attributes()->parse(segments[i].data, &parsed, false) && parsed.key == QLatin1String("blob")
                && parsed.chunkOffset == 0)
                segments.removeAt(i--);
        }
    }));
    QVERIFY(!attributes()->value("blob").isValid());
    QCOMPARE(attributes()->keys().toStringList(), QStringList{"small"});
}

void tst_ImageAttributes::keysAndValues()
{
    QVERIFY(ImageAttributes::keyMatches("photo.1", {"photo.*"}, true));
    QVERIFY(!ImageAttributes::keyMatches("photo.1", {"photo.*"}, false));
    QVERIFY(!ImageAttributes::keyMatches("Photo.1", {"photo.*"}, true));
    QVERIFY(ImageAttributes::keyMatches("a1", {"x", "a?"}, true));
    QVERIFY(!ImageAttributes::keyMatches("a12", {"a?"}, true));

    QVERIFY(attributes()->setValues({{"photo.1", "1"}, {"photo.2", QByteArray("raw")}, {"other", "3"}}));
    QCOMPARE(attributes()->values("photo.*").keys(), (QStringList{"photo.1", "photo.2"}));
    // Binary values are listed as references and read whole by value().
    const QVariantMap some = attributes()->values(QStringList{"oth*", "photo.2"});
    QCOMPARE(some.keys(), (QStringList{"other", "photo.2"}));
    QCOMPARE(some.value("photo.2"), QVariant(QUrl(QStringLiteral("blob://imageattributes/photo.2"))));
    QCOMPARE(attributes()->value("photo.2"), QVariant(QByteArray("raw")));
    // value() takes the key literally.
    QVERIFY(!attributes()->value("photo.*").isValid());

    // Keys are cut to 1024 bytes; one of exactly 1024 has no terminator and
    // still reads whole. New values go ahead of the ones already there.
    const QString longKey(1030, QLatin1Char('k'));
    const QString exactKey(1024, QLatin1Char('e'));
    attributes()->removeAll();
    QVERIFY(attributes()->setValue(longKey, "long"));
    QVERIFY(attributes()->setValue(exactKey, "exact"));
    QVERIFY(!attributes()->value(longKey).isValid());
    QCOMPARE(attributes()->value(longKey.left(1024)), QVariant("long"));
    QCOMPARE(attributes()->value(exactKey), QVariant("exact"));
    QCOMPARE(attributes()->keys().toStringList(), (QStringList{exactKey, longKey.left(1024)}));
}

void tst_ImageAttributes::removal()
{
    QVERIFY(attributes()->setValues({{"a", "1"}, {"b", "2"}, {"c", "3"}}));
    const QByteArray before = readFile(m_path);
    // Removing what isn't there leaves the file as it was, and no temporary.
    attributes()->remove("zzz");
    QCOMPARE(readFile(m_path), before);
    QVERIFY(!QFile::exists(m_path + QLatin1String(".tmp")));
    attributes()->remove("b");
    QCOMPARE(attributes()->keys().toStringList(), (QStringList{"a", "c"}));
    // A key of "*" removes nothing unless it is a pattern.
    attributes()->remove("*");
    QCOMPARE(attributes()->keys().toStringList().size(), 2);
    attributes()->remove(QStringList{"a", "c"});
    QCOMPARE(readFile(m_path), readFile(m_original));
    // setValue with an invalid value removes too.
    QVERIFY(attributes()->setValue("a", "1"));
    QVERIFY(attributes()->setValue("a", QVariant()));
    QCOMPARE(readFile(m_path), readFile(m_original));
}

void tst_ImageAttributes::placement()
{
    // SOI, APP0, APP9, APP11, then the rest: the new segment goes before APP11.
    QVERIFY(editSegments(m_path, [](QList<Segment> &list) {
        list.insert(1, Segment{0xffe9, QByteArray("nine")});
        list.insert(2, Segment{0xffeb, QByteArray("eleven")});
        list.insert(3, Segment{0xffe1, QByteArray("late APP1")});
    }));
    const QByteArray scan = readFile(m_path).mid(readFile(m_path).indexOf("\xff\xda"));
    QVERIFY(attributes()->setValue("k", "v"));
    QCOMPARE(markers(m_path).mid(0, 5), (QList<quint16>{0xffe0, 0xffe9, 0xffea, 0xffeb, 0xffe1}));
    QVERIFY(readFile(m_path).endsWith(scan));

    // An old value elsewhere is dropped wherever it was.
    ImageAttributes other;
    other.setFilePath(m_path);
    other.setAppMarker(0xffe2);
    QVERIFY(other.setValue("k", "APP2 value"));
    QCOMPARE(markers(m_path).mid(0, 6), (QList<quint16>{0xffe0, 0xffe2, 0xffe9, 0xffea, 0xffeb, 0xffe1}));
    QCOMPARE(attributes()->value("k"), QVariant("v"));
}

void tst_ImageAttributes::foreignSegmentsSurvive()
{
    // Same marker, other signature; and one of ours whose sizes don't agree.
    QByteArray broken = QByteArray("ZETH\0\0\0\0", 8) + QByteArray(1040, '\0');
    broken[15] = 100; // totalSize 100 but no data
    broken[23] = 100; // chunkSize 100
    QVERIFY(editSegments(m_path, [&broken](QList<Segment> &list) {
        list.insert(1, Segment{0xffea, QByteArray("OTHER\0\0\0payload", 15)});
        list.insert(2, Segment{0xffea, broken});
    }));
    QVERIFY(attributes()->values().isEmpty());
    QVERIFY(attributes()->setValue("k", "v"));
    attributes()->removeAll();
    QCOMPARE(markers(m_path).count(0xffea), 2);

    // Another signature makes another namespace.
    ImageAttributes mine;
    mine.setFilePath(m_path);
    mine.setSignature("MINEMINEMINE");
    QVERIFY(mine.setValue("k", "mine"));
    QVERIFY(attributes()->setValue("k", "ours"));
    QCOMPARE(mine.value("k"), QVariant("mine"));
    QCOMPARE(attributes()->value("k"), QVariant("ours"));
}

void tst_ImageAttributes::targets()
{
    // Nothing matched, nothing written: still a full copy.
    const QString target = m_dir.filePath("target.jpg");
    QFile::remove(target);
    attributes()->setDestFilePath(target);
    attributes()->remove("none");
    QCOMPARE(readFile(target), readFile(m_path));
    QVERIFY(attributes()->setValue("k", "v"));
    QCOMPARE(readFile(m_path), readFile(m_original));
    ImageAttributes reader;
    reader.setFilePath(target);
    QCOMPARE(reader.value("k"), QVariant("v"));
    // The same path as the source counts as in place.
    attributes()->setDestFilePath(m_path);
    QVERIFY(attributes()->setValue("k", "here"));
    QCOMPARE(reader.value("k"), QVariant("v"));
    attributes()->setDestFilePath(QString());
    QCOMPARE(attributes()->value("k"), QVariant("here"));

    // Not a JPEG: written in place, nothing changes.
    const QString text = m_dir.filePath("text.jpg");
    const QByteArray notJpeg("AB\0\x05xyzREST-OF-FILE", 19);
    QVERIFY(writeFile(text, notJpeg));
    attributes()->setFilePath(text);
    QVERIFY(attributes()->setValue("k", "v"));
    QCOMPARE(readFile(text), notJpeg);
    QVERIFY(!QFile::exists(text + QLatin1String(".tmp")));
    QVERIFY(attributes()->values().isEmpty());
    // A separate target gets what follows the point where reading stopped:
    // the first "marker", its length and its data were consumed.
    attributes()->setDestFilePath(target);
    QVERIFY(attributes()->setValue("k", "v"));
    QCOMPARE(readFile(target), QByteArray("REST-OF-FILE"));
    // Missing files.
    attributes()->setFilePath(m_dir.filePath("missing.jpg"));
    QVERIFY(!attributes()->setValue("k", "v"));
    QVERIFY(!attributes()->keys().isValid());
}

void tst_ImageAttributes::filesInAndOut()
{
    QByteArray content(200000, Qt::Uninitialized);
    for (int i = 0; i < content.size(); ++i)
        content[i] = char(i % 253);
    const QString source = m_dir.filePath("content.bin");
    const QString out = m_dir.filePath("out.bin");
    QVERIFY(writeFile(source, content));
    QVERIFY(attributes()->loadValueFromFile("file", QUrl::fromLocalFile(source)));
    QVERIFY(attributes()->saveValueToFile("file", QUrl::fromLocalFile(out)));
    QCOMPARE(readFile(out), content);
    QVERIFY(attributes()->setValue("text", "ünï"));
    QVERIFY(attributes()->saveValueToFile("text", out));
    QCOMPARE(readFile(out), QStringLiteral("ünï").toUtf8());

    // Nothing to save, or nowhere to save it.
    QVERIFY(attributes()->setValue("empty", QString(QLatin1String(""))));
    QVERIFY(!attributes()->saveValueToFile("empty", out));
    QVERIFY(!attributes()->saveValueToFile("missing", out));
    QVERIFY(!attributes()->saveValueToFile("text", QUrl()));
    QVERIFY(!attributes()->saveValueToFile("text", m_dir.filePath("no/such/dir/x")));
    // A file that can't be read changes nothing and says so.
    const QByteArray before = readFile(m_path);
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Unable to read")));
    QVERIFY(!attributes()->loadValueFromFile("nope", m_dir.filePath("absent.bin")));
    QCOMPARE(readFile(m_path), before);
}

void tst_ImageAttributes::stillAJpegForOtherTools()
{
    SKIP_WITHOUT_EXIFTOOL();
    QVERIFY(exiftoolWrite(m_path, {"-Make=Acme", "-XMP-dc:Title=Loom"}));
    QVERIFY(attributes()->setValues({{"big", QByteArray(100000, 'z')}, {"t", "text"}}));

    QVERIFY(!exiftoolRead(m_path, {"-validate", "-error"}).contains("ExifTool:Error"));
    const QJsonObject tags = exiftoolRead(m_path);
    QCOMPARE(tags.value("IFD0:Make").toString(), QStringLiteral("Acme"));
    QCOMPARE(tags.value("XMP-dc:Title").toString(), QStringLiteral("Loom"));
    QCOMPARE(tags.value("File:ImageWidth").toInt(), 64);
    QCOMPARE(QImage(m_path).size(), QSize(64, 48));
    // exiftool rewrites the file and keeps our segments.
    QVERIFY(exiftoolWrite(m_path, {"-Model=Cam"}));
    QCOMPARE(attributes()->value("t"), QVariant("text"));
    QCOMPARE(attributes()->value("big").toByteArray(), QByteArray(100000, 'z'));
}

void tst_ImageAttributes::properties()
{
    // No file yet: empty results. A leading tilde is the home folder.
    ImageAttributes attributes;
    QVERIFY(!attributes.keys().isValid());
    QVERIFY(!attributes.setValue("k", 1));
    QSignalSpy path(&attributes, &ImageAttributes::filePathChanged);
    attributes.setFilePath("~/pictures/a.jpg");
    QCOMPARE(attributes.filePath(), QDir::homePath() + QStringLiteral("/pictures/a.jpg"));
    attributes.setFileUrl(QUrl::fromLocalFile(attributes.filePath()));
    QCOMPARE(path.count(), 1);

    // Marker and version are written; the version is never compared.
    attributes.setFileUrl(QUrl::fromLocalFile(m_path));
    attributes.setAppMarker(0xffeb);
    attributes.setVersion(7);
    QVERIFY(attributes.setValue("v", "seven"));
    QCOMPARE(attributeSegments(attributes, m_path).first().version, quint16(7));
    QCOMPARE(markers(m_path).at(1), quint16(0xffeb));
    ImageAttributes reader;
    reader.setFilePath(m_path);
    reader.setAppMarker(0xffeb);
    QCOMPARE(reader.value("v"), QVariant("seven"));
}

QTEST_MAIN(tst_ImageAttributes)
#include "tst_ImageAttributes.moc"
