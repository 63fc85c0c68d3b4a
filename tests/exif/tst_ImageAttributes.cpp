#include "ExifTestSupport.h"
#include "ImageAttributes.h"
#include "TestSupport.h"

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
    void binaryValuesAreReferences();
    void longKeysAreCut();
    void removal();
    void placement();
    void foreignSegmentsSurvive();
    void separateTarget();
    void notAJpeg();
    void filesInAndOut();
    void chunksOutOfOrder();
    void keysAndWildcards();
    void stillAJpegForOtherTools();
    void properties();

private:
    QTemporaryDir m_dir;
    QString m_original;
    QString m_path;
};

void tst_ImageAttributes::initTestCase()
{
    QVERIFY(m_dir.isValid());
    m_original = m_dir.filePath(QStringLiteral("original.jpg"));
    QVERIFY(makeJpeg(m_original));
}

void tst_ImageAttributes::init()
{
    m_path = m_dir.filePath(QStringLiteral("work.jpg"));
    QFile::remove(m_path);
    QVERIFY(QFile::copy(m_original, m_path));
}

void tst_ImageAttributes::roundTrip_data()
{
    QTest::addColumn<QVariant>("value");
    QTest::addColumn<int>("valueType");
    QTest::addColumn<QVariant>("expected");

    QVariantMap map;
    map.insert(QStringLiteral("name"), QStringLiteral("Loom"));
    map.insert(QStringLiteral("list"), QVariantList{1, 2.5, QStringLiteral("x")});
    map.insert(QStringLiteral("nested"), QVariantMap{{QStringLiteral("a"), true}});

    QTest::newRow("text") << QVariant(QStringLiteral("Grüße, 世界")) << 10 << QVariant(QStringLiteral("Grüße, 世界"));
    QTest::newRow("empty text") << QVariant(QString(QLatin1String(""))) << 10 << QVariant(QString(QLatin1String("")));
    QTest::newRow("bytes") << QVariant(QByteArray("\0\1\2\xff", 4)) << 12 << QVariant(QByteArray("\0\1\2\xff", 4));
    QTest::newRow("map") << QVariant(map) << 8 << QVariant(map);
    QTest::newRow("null") << QVariant::fromValue(nullptr) << 51 << QVariant::fromValue<QObject *>(nullptr);
    // Other values are stored as their text and come back as its bytes.
    QTest::newRow("int") << QVariant(5) << 2 << QVariant(QByteArray("5"));
    QTest::newRow("double") << QVariant(2.5) << 6 << QVariant(QByteArray("2.5"));
    QTest::newRow("bool") << QVariant(true) << 1 << QVariant(QByteArray("true"));
}

void tst_ImageAttributes::roundTrip()
{
    QFETCH(QVariant, value);
    QFETCH(int, valueType);
    QFETCH(QVariant, expected);

    ImageAttributes attributes;
    attributes.setFilePath(m_path);
    QVERIFY(attributes.setValue(QStringLiteral("key"), value));
    QVERIFY(!QFile::exists(m_path + QLatin1String(".tmp")));

    const QList<ImageAttributes::Segment> list = attributeSegments(attributes, m_path);
    QCOMPARE(list.size(), 1);
    QCOMPARE(int(list.first().valueType), valueType);
    QCOMPARE(list.first().version, quint16(0x0502));
    QCOMPARE(list.first().key, QStringLiteral("key"));

    const QVariant back = attributes.value(QStringLiteral("key"));
    QCOMPARE(back.userType(), expected.userType());
    if (expected.userType() == QMetaType::QObjectStar)
        QCOMPARE(back.value<QObject *>(), nullptr);
    else
        QCOMPARE(back, expected);
    if (valueType != 12)
        QCOMPARE(attributes.values().value(QStringLiteral("key")), back);

    // Writing it again replaces it.
    QVERIFY(attributes.setValue(QStringLiteral("key"), QStringLiteral("second")));
    QCOMPARE(attributeSegments(attributes, m_path).size(), 1);
    QCOMPARE(attributes.value(QStringLiteral("key")), QVariant(QStringLiteral("second")));
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

    ImageAttributes attributes;
    attributes.setFilePath(m_path);
    QVERIFY(attributes.setValue(QStringLiteral("blob"), data));

    const QList<ImageAttributes::Segment> list = attributeSegments(attributes, m_path);
    QCOMPARE(list.size(), chunkSizes.size());
    quint32 offset = 0;
    for (int i = 0; i < list.size(); ++i) {
        QCOMPARE(list[i].chunkOffset, offset);
        QCOMPARE(list[i].chunkSize, chunkSizes[i]);
        QCOMPARE(list[i].totalSize, quint32(size));
        offset += chunkSizes[i];
    }
    // The longest segment still fits the 16-bit length field.
    for (const Segment &segment : segments(readFile(m_path)))
        QVERIFY(segment.data.size() + 2 <= 65535);
    QCOMPARE(attributes.value(QStringLiteral("blob")).toByteArray(), data);
    QVERIFY(!QImage(m_path).isNull());
}

void tst_ImageAttributes::binaryValuesAreReferences()
{
    ImageAttributes attributes;
    attributes.setFilePath(m_path);
    QVERIFY(attributes.setValues({{QStringLiteral("a"), QByteArray("raw")}, {QStringLiteral("b"), QStringLiteral("text")}}));

    const QVariantMap all = attributes.values();
    QCOMPARE(all.size(), 2);
    QCOMPARE(all.value(QStringLiteral("a")), QVariant(QUrl(QStringLiteral("blob://imageattributes/a"))));
    QCOMPARE(all.value(QStringLiteral("b")), QVariant(QStringLiteral("text")));
    QCOMPARE(attributes.value(QStringLiteral("a")), QVariant(QByteArray("raw")));
    QCOMPARE(attributes.values(QStringLiteral("b")).keys(), QStringList{QStringLiteral("b")});
    QVERIFY(!attributes.value(QStringLiteral("missing")).isValid());
}

void tst_ImageAttributes::longKeysAreCut()
{
    ImageAttributes attributes;
    attributes.setFilePath(m_path);
    const QString longKey(1030, QLatin1Char('k'));
    const QString exactKey(1024, QLatin1Char('e'));
    QVERIFY(attributes.setValue(longKey, QStringLiteral("long")));
    QVERIFY(attributes.setValue(exactKey, QStringLiteral("exact")));

    QVERIFY(!attributes.value(longKey).isValid());
    QCOMPARE(attributes.value(longKey.left(1024)), QVariant(QStringLiteral("long")));
    // A key of exactly 1024 bytes has no terminator and still reads whole.
    QCOMPARE(attributes.value(exactKey), QVariant(QStringLiteral("exact")));
    // New values go ahead of the ones already there.
    QCOMPARE(attributes.keys().toStringList(), (QStringList{exactKey, longKey.left(1024)}));
}

void tst_ImageAttributes::removal()
{
    ImageAttributes attributes;
    attributes.setFilePath(m_path);
    QVERIFY(attributes.setValues({{QStringLiteral("a"), QStringLiteral("1")},
                                  {QStringLiteral("b"), QStringLiteral("2")},
                                  {QStringLiteral("c"), QStringLiteral("3")}}));
    const QByteArray before = readFile(m_path);

    // Removing what isn't there leaves the file as it was, and no temporary.
    attributes.remove(QStringLiteral("zzz"));
    QCOMPARE(readFile(m_path), before);
    QVERIFY(!QFile::exists(m_path + QLatin1String(".tmp")));

    attributes.remove(QStringLiteral("b"));
    QCOMPARE(attributes.keys().toStringList(), (QStringList{QStringLiteral("a"), QStringLiteral("c")}));
    attributes.remove(QStringList{QStringLiteral("a"), QStringLiteral("c")});
    QVERIFY(attributes.keys().toStringList().isEmpty());

    QVERIFY(attributes.setValues({{QStringLiteral("x"), 1}, {QStringLiteral("y"), 2}}));
    // A key of "*" removes nothing unless it is a pattern.
    attributes.remove(QStringLiteral("*"));
    QCOMPARE(attributes.keys().toStringList().size(), 2);
    attributes.removeAll();
    QVERIFY(attributes.keys().toStringList().isEmpty());
    QCOMPARE(readFile(m_path), readFile(m_original));

    // setValue with an invalid value removes too.
    QVERIFY(attributes.setValue(QStringLiteral("a"), QStringLiteral("1")));
    QVERIFY(attributes.setValue(QStringLiteral("a"), QVariant()));
    QCOMPARE(readFile(m_path), readFile(m_original));
}

void tst_ImageAttributes::placement()
{
    // SOI, APP0, APP9, APP11, then the rest: the new segment goes before APP11.
    int sos = -1;
    const QByteArray jpeg = readFile(m_original);
    QList<Segment> list = segments(jpeg, &sos);
    QCOMPARE(list.first().marker, quint16(0xffe0));
    list.insert(1, Segment{0xffe9, QByteArray("nine")});
    list.insert(2, Segment{0xffeb, QByteArray("eleven")});
    list.insert(3, Segment{0xffe1, QByteArray("late APP1")});
    QVERIFY(writeFile(m_path, assemble(list, jpeg.mid(sos))));

    ImageAttributes attributes;
    attributes.setFilePath(m_path);
    QVERIFY(attributes.setValue(QStringLiteral("k"), QStringLiteral("v")));
    const QList<quint16> order = markers(m_path);
    QCOMPARE(order.mid(0, 5), (QList<quint16>{0xffe0, 0xffe9, 0xffea, 0xffeb, 0xffe1}));
    QCOMPARE(readFile(m_path).mid(readFile(m_path).size() - (jpeg.size() - sos)), jpeg.mid(sos));

    // An old value elsewhere is dropped wherever it was.
    ImageAttributes other;
    other.setFilePath(m_path);
    other.setAppMarker(0xffe2);
    QVERIFY(other.setValue(QStringLiteral("k"), QStringLiteral("APP2 value")));
    QCOMPARE(markers(m_path).mid(0, 6), (QList<quint16>{0xffe0, 0xffe2, 0xffe9, 0xffea, 0xffeb, 0xffe1}));
    QCOMPARE(attributes.value(QStringLiteral("k")), QVariant(QStringLiteral("v")));
    QCOMPARE(other.value(QStringLiteral("k")), QVariant(QStringLiteral("APP2 value")));
}

void tst_ImageAttributes::foreignSegmentsSurvive()
{
    int sos = -1;
    const QByteArray jpeg = readFile(m_original);
    QList<Segment> list = segments(jpeg, &sos);
    // Same marker, other signature; and one of ours whose sizes don't agree.
    list.insert(1, Segment{0xffea, QByteArray("OTHER\0\0\0payload", 15)});
    ImageAttributes attributes;
    QByteArray broken = QByteArray("ZETH\0\0\0\0", 8) + QByteArray(1040, '\0');
    broken[15] = 100; // totalSize 100 but no data
    broken[23] = 100; // chunkSize 100
    list.insert(2, Segment{0xffea, broken});
    QVERIFY(writeFile(m_path, assemble(list, jpeg.mid(sos))));

    attributes.setFilePath(m_path);
    QVERIFY(attributes.values().isEmpty());
    QVERIFY(attributes.setValue(QStringLiteral("k"), QStringLiteral("v")));
    attributes.removeAll();
    const QList<Segment> after = segments(readFile(m_path));
    int foreign = 0;
    for (const Segment &segment : after)
        foreign += segment.marker == 0xffea ? 1 : 0;
    QCOMPARE(foreign, 2);

    // Another signature makes another namespace.
    ImageAttributes mine;
    mine.setFilePath(m_path);
    mine.setSignature(QStringLiteral("MINEMINEMINE"));
    QVERIFY(mine.setValue(QStringLiteral("k"), QStringLiteral("mine")));
    QVERIFY(attributes.setValue(QStringLiteral("k"), QStringLiteral("ours")));
    QCOMPARE(mine.value(QStringLiteral("k")), QVariant(QStringLiteral("mine")));
    QCOMPARE(attributes.value(QStringLiteral("k")), QVariant(QStringLiteral("ours")));
}

void tst_ImageAttributes::separateTarget()
{
    const QString target = m_dir.filePath(QStringLiteral("target.jpg"));
    QFile::remove(target);
    ImageAttributes attributes;
    attributes.setFilePath(m_path);
    attributes.setDestFilePath(target);

    // Nothing matched, nothing written: still a full copy.
    attributes.remove(QStringLiteral("none"));
    QCOMPARE(readFile(target), readFile(m_path));

    QVERIFY(attributes.setValue(QStringLiteral("k"), QStringLiteral("v")));
    QCOMPARE(readFile(m_path), readFile(m_original));
    ImageAttributes reader;
    reader.setFilePath(target);
    QCOMPARE(reader.value(QStringLiteral("k")), QVariant(QStringLiteral("v")));
    QVERIFY(!QImage(target).isNull());

    // The same path as the source counts as in place.
    attributes.setDestFilePath(m_path);
    QVERIFY(attributes.setValue(QStringLiteral("k"), QStringLiteral("here")));
    QCOMPARE(reader.value(QStringLiteral("k")), QVariant(QStringLiteral("v")));
    attributes.setDestFilePath(QString());
    QCOMPARE(attributes.value(QStringLiteral("k")), QVariant(QStringLiteral("here")));
}

void tst_ImageAttributes::notAJpeg()
{
    const QString text = m_dir.filePath(QStringLiteral("text.jpg"));
    const QByteArray notJpeg("AB\0\x05xyzREST-OF-FILE", 19);
    QVERIFY(writeFile(text, notJpeg));
    ImageAttributes attributes;
    attributes.setFilePath(text);
    QVERIFY(attributes.setValue(QStringLiteral("k"), QStringLiteral("v")));
    QCOMPARE(readFile(text), notJpeg);
    QVERIFY(!QFile::exists(text + QLatin1String(".tmp")));
    QVERIFY(attributes.values().isEmpty());
    QVERIFY(attributes.keys().toStringList().isEmpty());

    // A separate target gets what follows the point where reading stopped:
    // the first "marker", its length and its data were consumed.
    const QString target = m_dir.filePath(QStringLiteral("text-target.jpg"));
    attributes.setDestFilePath(target);
    QVERIFY(attributes.setValue(QStringLiteral("k"), QStringLiteral("v")));
    QCOMPARE(readFile(target), QByteArray("REST-OF-FILE"));
    QCOMPARE(readFile(text), notJpeg);

    // Missing files.
    attributes.setFilePath(m_dir.filePath(QStringLiteral("missing.jpg")));
    QVERIFY(!attributes.setValue(QStringLiteral("k"), QStringLiteral("v")));
    QVERIFY(!attributes.keys().isValid());
    QVERIFY(attributes.values().isEmpty());
}

void tst_ImageAttributes::filesInAndOut()
{
    QByteArray content(200000, Qt::Uninitialized);
    for (int i = 0; i < content.size(); ++i)
        content[i] = char(i % 253);
    const QString source = m_dir.filePath(QStringLiteral("content.bin"));
    QVERIFY(writeFile(source, content));

    ImageAttributes attributes;
    attributes.setFilePath(m_path);
    QVERIFY(attributes.loadValueFromFile(QStringLiteral("file"), source));
    QCOMPARE(attributeSegments(attributes, m_path).size(), 4);
    QVERIFY(attributes.loadValueFromFile(QStringLiteral("url"), QUrl::fromLocalFile(source)));

    const QString out = m_dir.filePath(QStringLiteral("out.bin"));
    QVERIFY(attributes.saveValueToFile(QStringLiteral("file"), out));
    QCOMPARE(readFile(out), content);
    QVERIFY(attributes.saveValueToFile(QStringLiteral("url"), QUrl::fromLocalFile(out)));
    QCOMPARE(readFile(out), content);

    QVERIFY(attributes.setValue(QStringLiteral("text"), QStringLiteral("ünï")));
    QVERIFY(attributes.saveValueToFile(QStringLiteral("text"), out));
    QCOMPARE(readFile(out), QStringLiteral("ünï").toUtf8());

    // Nothing to save, or nowhere to save it.
    QVERIFY(attributes.setValue(QStringLiteral("empty"), QString(QLatin1String(""))));
    QVERIFY(!attributes.saveValueToFile(QStringLiteral("empty"), out));
    QVERIFY(!attributes.saveValueToFile(QStringLiteral("missing"), out));
    QVERIFY(!attributes.saveValueToFile(QString(), out));
    QVERIFY(!attributes.saveValueToFile(QStringLiteral("text"), QString()));
    QVERIFY(!attributes.saveValueToFile(QStringLiteral("text"), QUrl()));
    QVERIFY(!attributes.saveValueToFile(QStringLiteral("text"), m_dir.filePath(QStringLiteral("no/such/dir/x"))));

    // A file that can't be read changes nothing and says so.
    const QByteArray before = readFile(m_path);
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Unable to read")));
    QVERIFY(!attributes.loadValueFromFile(QStringLiteral("nope"), m_dir.filePath(QStringLiteral("absent.bin"))));
    QCOMPARE(readFile(m_path), before);
    QVERIFY(!QFile::exists(m_path + QLatin1String(".tmp")));
}

void tst_ImageAttributes::chunksOutOfOrder()
{
    ImageAttributes attributes;
    attributes.setFilePath(m_path);
    QVERIFY(attributes.setValues({{QStringLiteral("big"), QByteArray(70000, 'b')}, {QStringLiteral("small"), QStringLiteral("s")}}));

    // Drop the first chunk of "big": what is left never completes.
    int sos = -1;
    const QByteArray jpeg = readFile(m_path);
    QList<Segment> list = segments(jpeg, &sos);
    for (int i = 0; i < list.size(); ++i) {
        ImageAttributes::Segment parsed;
        if (attributes.parse(list[i].data, &parsed, false) && parsed.key == QLatin1String("big") && parsed.chunkOffset == 0) {
            list.removeAt(i);
            break;
        }
    }
    QVERIFY(writeFile(m_path, assemble(list, jpeg.mid(sos))));
    QVERIFY(!attributes.value(QStringLiteral("big")).isValid());
    QCOMPARE(attributes.value(QStringLiteral("small")), QVariant(QStringLiteral("s")));
    // keys() lists values by their first chunk only.
    QCOMPARE(attributes.keys().toStringList(), QStringList{QStringLiteral("small")});
}

void tst_ImageAttributes::keysAndWildcards()
{
    QVERIFY(ImageAttributes::keyMatches(QStringLiteral("photo.1"), {QStringLiteral("photo.*")}, true));
    QVERIFY(!ImageAttributes::keyMatches(QStringLiteral("photo.1"), {QStringLiteral("photo.*")}, false));
    QVERIFY(ImageAttributes::keyMatches(QStringLiteral("photo.*"), {QStringLiteral("photo.*")}, false));
    QVERIFY(!ImageAttributes::keyMatches(QStringLiteral("Photo.1"), {QStringLiteral("photo.*")}, true));
    QVERIFY(ImageAttributes::keyMatches(QStringLiteral("a1"), {QStringLiteral("x"), QStringLiteral("a?")}, true));
    QVERIFY(!ImageAttributes::keyMatches(QStringLiteral("a12"), {QStringLiteral("a?")}, true));
    QVERIFY(ImageAttributes::keyMatches(QStringLiteral("b"), {QStringLiteral("[abc]")}, true));

    ImageAttributes attributes;
    attributes.setFilePath(m_path);
    QVERIFY(attributes.setValues({{QStringLiteral("photo.1"), QStringLiteral("1")},
                                  {QStringLiteral("photo.2"), QStringLiteral("2")},
                                  {QStringLiteral("other"), QStringLiteral("3")}}));
    QCOMPARE(attributes.values(QStringLiteral("photo.*")).keys(),
             (QStringList{QStringLiteral("photo.1"), QStringLiteral("photo.2")}));
    QCOMPARE(attributes.values(QStringList{QStringLiteral("oth*"), QStringLiteral("photo.2")}).keys(),
             (QStringList{QStringLiteral("other"), QStringLiteral("photo.2")}));
    // value() takes the key literally.
    QVERIFY(!attributes.value(QStringLiteral("photo.*")).isValid());
    QCOMPARE(attributes.keys().toStringList(),
             (QStringList{QStringLiteral("other"), QStringLiteral("photo.1"), QStringLiteral("photo.2")}));
}

void tst_ImageAttributes::stillAJpegForOtherTools()
{
    if (!TestSupport::hasProgram(QStringLiteral("exiftool")))
        QSKIP("exiftool is not installed");
    QVERIFY(exiftoolWrite(m_path, {QStringLiteral("-Make=Acme"), QStringLiteral("-XMP-dc:Title=Loom")}));

    ImageAttributes attributes;
    attributes.setFilePath(m_path);
    QVERIFY(attributes.setValues({{QStringLiteral("big"), QByteArray(100000, 'z')}, {QStringLiteral("t"), QStringLiteral("text")}}));

    const QJsonObject tags = exiftoolRead(m_path);
    QVERIFY(!tags.contains(QStringLiteral("ExifTool:Error")));
    QCOMPARE(tags.value(QStringLiteral("IFD0:Make")).toString(), QStringLiteral("Acme"));
    QCOMPARE(tags.value(QStringLiteral("XMP-dc:Title")).toString(), QStringLiteral("Loom"));
    QCOMPARE(tags.value(QStringLiteral("File:ImageWidth")).toInt(), 64);
    const QJsonObject validation = exiftoolRead(m_path, {QStringLiteral("-validate"), QStringLiteral("-error")});
    QVERIFY(!validation.contains(QStringLiteral("ExifTool:Error")));
    QCOMPARE(QImage(m_path).size(), QSize(64, 48));

    // exiftool rewrites the file and keeps our segments.
    QVERIFY(exiftoolWrite(m_path, {QStringLiteral("-Model=Cam")}));
    QCOMPARE(attributes.value(QStringLiteral("t")), QVariant(QStringLiteral("text")));
    QCOMPARE(attributes.value(QStringLiteral("big")).toByteArray(), QByteArray(100000, 'z'));
}

void tst_ImageAttributes::properties()
{
    ImageAttributes attributes;
    // No file yet: empty results.
    QVERIFY(!attributes.keys().isValid());
    QVERIFY(attributes.values().isEmpty());
    QVERIFY(!attributes.setValue(QStringLiteral("k"), 1));
    QCOMPARE(attributes.appMarker(), 65514);
    QCOMPARE(attributes.signature(), QStringLiteral("ZETH"));
    QCOMPARE(attributes.version(), ushort(1282));

    QSignalSpy path(&attributes, &ImageAttributes::filePathChanged);
    QSignalSpy url(&attributes, &ImageAttributes::fileUrlChanged);
    attributes.setFilePath(QStringLiteral("~/pictures/a.jpg"));
    QCOMPARE(attributes.filePath(), QDir::homePath() + QStringLiteral("/pictures/a.jpg"));
    QCOMPARE(attributes.fileUrl(), QUrl::fromLocalFile(QDir::homePath() + QStringLiteral("/pictures/a.jpg")));
    QCOMPARE(path.count(), 1);
    QCOMPARE(url.count(), 1);
    attributes.setFilePath(QStringLiteral("~/pictures/a.jpg"));
    attributes.setFileUrl(QUrl::fromLocalFile(QDir::homePath() + QStringLiteral("/pictures/a.jpg")));
    QCOMPARE(path.count(), 1);
    attributes.setFileUrl(QUrl::fromLocalFile(m_path));
    QCOMPARE(attributes.filePath(), m_path);
    QCOMPARE(url.count(), 2);

    QSignalSpy dest(&attributes, &ImageAttributes::destFilePathChanged);
    QSignalSpy destUrl(&attributes, &ImageAttributes::destFileUrlChanged);
    attributes.setDestFileUrl(QUrl::fromLocalFile(m_path));
    QCOMPARE(attributes.destFilePath(), m_path);
    QCOMPARE(dest.count(), 1);
    QCOMPARE(destUrl.count(), 1);

    QSignalSpy marker(&attributes, &ImageAttributes::appMarkerChanged);
    QSignalSpy signature(&attributes, &ImageAttributes::signatureChanged);
    QSignalSpy version(&attributes, &ImageAttributes::versionChanged);
    attributes.setAppMarker(65514);
    attributes.setSignature(QStringLiteral("ZETH"));
    attributes.setVersion(1282);
    QCOMPARE(marker.count() + signature.count() + version.count(), 0);
    attributes.setAppMarker(0xffeb);
    attributes.setVersion(7);
    QCOMPARE(marker.count(), 1);
    QCOMPARE(version.count(), 1);

    // The version is written, never compared.
    QVERIFY(attributes.setValue(QStringLiteral("v"), QStringLiteral("seven")));
    QCOMPARE(attributeSegments(attributes, m_path).first().version, quint16(7));
    ImageAttributes reader;
    reader.setFilePath(m_path);
    reader.setAppMarker(0xffeb);
    QCOMPARE(reader.value(QStringLiteral("v")), QVariant(QStringLiteral("seven")));
    QCOMPARE(markers(m_path).at(1), quint16(0xffeb));
}

QTEST_MAIN(tst_ImageAttributes)
#include "tst_ImageAttributes.moc"
