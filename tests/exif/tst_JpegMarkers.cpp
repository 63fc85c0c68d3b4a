#include "ExifTestSupport.h"
#include "JpegMarkers.h"

#include <QBuffer>
#include <QDirIterator>
#include <QTemporaryDir>
#include <QtTest>

using namespace ExifTestSupport;

namespace {

QString step(quint16 marker, qint64 offset, qint64 size, const QByteArray &data)
{
    return QStringLiteral("%1@%2+%3:%4").arg(marker, 0, 16).arg(offset).arg(size).arg(QString::fromLatin1(data.toHex()));
}

// Every step of a walk from first() on, as "marker@offset+size:data".
QStringList walk(QBuffer *buffer)
{
    JpegMarkers markers(buffer);
    QStringList steps;
    for (bool more = markers.first(); more; more = markers.next())
        steps << step(markers.markerType(), markers.markerOffset(), markers.markerSize(), markers.markerData());
    return steps;
}

} // namespace

class tst_JpegMarkers : public QObject
{
    Q_OBJECT

private slots:
    void init() { QLoggingCategory::setFilterRules(QStringLiteral("Orvane.Loomkit.File.debug=true")); }
    void cleanup() { QLoggingCategory::setFilterRules(QString()); }
    void failures_data();
    void failures();
    void walks();
    void writes();
    void hostileFilesEnd();
};

void tst_JpegMarkers::failures_data()
{
    QTest::addColumn<QByteArray>("data");
    QTest::addColumn<QStringList>("messages");

    const QStringList noContent{QStringLiteral("No JPEG marker"), QStringLiteral("No JPEG content")};
    QTest::newRow("empty") << QByteArray() << noContent;
    QTest::newRow("one byte") << QByteArray("\xff", 1) << noContent;
    QTest::newRow("EOI first") << QByteArray("\xff\xd9", 2) << QStringList{"No JPEG SOI marker"};
    QTest::newRow("no length") << QByteArray("\xff\xe0\x01", 3) << QStringList{"No JPEG payload", "No JPEG content"};
    QTest::newRow("text") << QByteArray("hello world") << QStringList{"No JPEG SOI marker"};
    QTest::newRow("SOI alone") << QByteArray("\xff\xd8", 2) << QStringList{"No JPEG marker"};
}

void tst_JpegMarkers::failures()
{
    QFETCH(QByteArray, data);
    QFETCH(QStringList, messages);

    QBuffer buffer(&data);
    QVERIFY(buffer.open(QIODevice::ReadOnly));
    JpegMarkers markers(&buffer);
    for (const QString &message : messages)
        QTest::ignoreMessage(QtDebugMsg, QRegularExpression(QRegularExpression::escape(message) + QLatin1Char('$')));
    const bool soi = data == QByteArray("\xff\xd8", 2);
    QCOMPARE(markers.first(), soi);
    if (soi) {
        QCOMPARE(markers.markerType(), JpegMarkers::JpegMarkerSOI);
        QVERIFY(!markers.next());
    }
    QVERIFY(markers.endOfData());
    QCOMPARE(int(markers.markerType()), 0);
    QCOMPARE(markers.markerSize(), qint64(0));
    QVERIFY(!markers.next());

    JpegMarkers unopened(nullptr);
    QTest::ignoreMessage(QtDebugMsg, QRegularExpression(QStringLiteral("Not opened$")));
    QVERIFY(!unopened.first());
}

void tst_JpegMarkers::walks()
{
    // Length 2 or 0: no data, and the walk goes on from there. A length past
    // the end keeps the bytes that came.
    QByteArray odd("\xff\xd8" "\xff\xe0\x00\x02" "\xff\xe1\x00\x00" "\xff\xfe\x00\x05" "abc" "\xff\xd0" "\xff\xdb\x10\x00" "xyz",
                   2 + 4 + 4 + 7 + 2 + 7);
    QBuffer buffer(&odd);
    QVERIFY(buffer.open(QIODevice::ReadOnly));
    QCOMPARE(walk(&buffer), QStringList({"ffd8@0+2:", "ffe0@2+2:", "ffe1@6+2:", "fffe@10+5:616263", "ffd0@17+2:",
                                         "ffdb@19+5:78797a"}));

    // A real file: the walk ends at SOS with the device at the scan, as entropy-coded data isn't walked.
    QTemporaryDir dir;
    const QString path = dir.filePath("a.jpg");
    QVERIFY(makeJpeg(path, 40, 30));
    QByteArray data = readFile(path);
    int sos = -1;
    QStringList expected{step(0xffd8, 0, 2, QByteArray())};
    qint64 offset = 2;
    for (const Segment &segment : segments(data, &sos)) {
        expected << step(segment.marker, offset, segment.data.size() + 2, segment.data);
        offset += 4 + segment.data.size();
    }
    const int sosSize = uchar(data[sos + 2]) << 8 | uchar(data[sos + 3]);
    expected << step(0xffda, sos, sosSize, data.mid(sos + 4, sosSize - 2));
    QBuffer file(&data);
    QVERIFY(file.open(QIODevice::ReadOnly));
    QCOMPARE(walk(&file), expected);
    QCOMPARE(file.pos(), qint64(sos + 2 + sosSize));
}

void tst_JpegMarkers::writes()
{
    QBuffer buffer;
    QVERIFY(buffer.open(QIODevice::WriteOnly));
    JpegMarkers markers(&buffer);
    QVERIFY(markers.write(JpegMarkers::JpegMarkerSOI, QByteArray("ignored")));
    QVERIFY(markers.write(JpegMarkers::JpegMarkerAPP10, QByteArray("data")));
    QCOMPARE(markers.markerOffset(), qint64(2));
    QVERIFY(markers.write(JpegMarkers::JpegMarkerEOI, QByteArray()));
    QCOMPARE(buffer.data(), QByteArray("\xff\xd8\xff\xea\x00\x06" "data\xff\xd9", 12));
    // Devices that refuse to write.
    buffer.close();
    QVERIFY(buffer.open(QIODevice::ReadOnly));
    QTest::ignoreMessage(QtWarningMsg, "QIODevice::write (QBuffer): ReadOnly device");
    QVERIFY(!JpegMarkers(&buffer).write(JpegMarkers::JpegMarkerSOI, QByteArray()));
    QVERIFY(!JpegMarkers(nullptr).write(JpegMarkers::JpegMarkerSOI, QByteArray()));
}

void tst_JpegMarkers::hostileFilesEnd()
{
    QLoggingCategory::setFilterRules(QString());
    int files = 0;
    QDirIterator it(TestSupport::dataPath(QStringLiteral("exif")), QDir::Files, QDirIterator::Subdirectories);
    while (it.hasNext()) {
        QFile file(it.next());
        QVERIFY(file.open(QIODevice::ReadOnly));
        JpegMarkers markers(&file);
        int steps = 0;
        qint64 bytes = 0;
        for (bool more = markers.first(); more; more = markers.next(), ++steps) {
            bytes += markers.markerData().size();
            QVERIFY(markers.markerOffset() < file.size());
        }
        // Every step moves on by at least two bytes.
        QVERIFY2(steps <= file.size() / 2 && bytes <= file.size(), qPrintable(file.fileName()));
        ++files;
    }
    QVERIFY(files > 40);
}

QTEST_MAIN(tst_JpegMarkers)
#include "tst_JpegMarkers.moc"
