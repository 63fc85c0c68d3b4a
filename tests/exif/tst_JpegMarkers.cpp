#include "ExifTestSupport.h"
#include "JpegMarkers.h"

#include <QBuffer>
#include <QDirIterator>
#include <QTemporaryDir>
#include <QtTest>

using namespace ExifTestSupport;

class tst_JpegMarkers : public QObject
{
    Q_OBJECT

private slots:
    void init() { QLoggingCategory::setFilterRules(QStringLiteral("Orvane.Loomkit.File.debug=true")); }
    void cleanup() { QLoggingCategory::setFilterRules(QString()); }
    void failures_data();
    void failures();
    void walksARealFile();
    void shortAndOddLengths();
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
    QTest::newRow("no length") << QByteArray("\xff\xe0\x01", 3)
                               << QStringList{"No JPEG payload", "No JPEG content"};
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

void tst_JpegMarkers::walksARealFile()
{
    QTemporaryDir dir;
    const QString path = dir.filePath("a.jpg");
    QVERIFY(makeJpeg(path, 40, 30));
    QByteArray data = readFile(path);
    int sos = -1;
    const QList<Segment> expected = segments(data, &sos);
    QBuffer buffer(&data);
    QVERIFY(buffer.open(QIODevice::ReadOnly));
    JpegMarkers markers(&buffer);
    QVERIFY(markers.first());
    for (const Segment &segment : expected) {
        QVERIFY(markers.next());
        QCOMPARE(quint16(markers.markerType()), segment.marker);
        QCOMPARE(markers.markerData(), segment.data);
    }
    // The walk ends at SOS with the device at the scan: entropy-coded data isn't walked.
    QVERIFY(markers.next());
    QCOMPARE(markers.markerType(), JpegMarkers::JpegMarkerSOS);
    QCOMPARE(markers.markerOffset(), qint64(sos));
    const qint64 scanStart = buffer.pos();
    QCOMPARE(scanStart, qint64(sos + 2 + markers.markerSize()));
    QLoggingCategory::setFilterRules(QString());
    QVERIFY(!markers.next());
    QCOMPARE(buffer.pos(), scanStart);
}

void tst_JpegMarkers::shortAndOddLengths()
{
    // Length 2: no data. Length 0: no data, and the walk goes on from there.
    // A length past the end keeps the bytes that came.
    QByteArray data("\xff\xd8" "\xff\xe0\x00\x02" "\xff\xe1\x00\x00" "\xff\xfe\x00\x05" "abc" "\xff\xd0"
                    "\xff\xdb\x10\x00" "xyz",
                    2 + 4 + 4 + 7 + 2 + 7);
    QBuffer buffer(&data);
    QVERIFY(buffer.open(QIODevice::ReadOnly));
    JpegMarkers markers(&buffer);
    QVERIFY(markers.first());
    const QList<QPair<JpegMarkers::JpegMarkerType, QByteArray>> expected{
        {JpegMarkers::JpegMarkerAPP0, QByteArray()}, {JpegMarkers::JpegMarkerAPP1, QByteArray()},
        {JpegMarkers::JpegMarkerCOM, "abc"},         {JpegMarkers::JpegMarkerRST0, QByteArray()},
        {JpegMarkers::JpegMarkerDQT, "xyz"}};
    const QList<qint64> offsets{2, 6, 10, 17, 19};
    for (int i = 0; i < expected.size(); ++i) {
        QVERIFY(markers.next());
        QCOMPARE(markers.markerType(), expected[i].first);
        QCOMPARE(markers.markerData(), expected[i].second);
        QCOMPARE(markers.markerOffset(), offsets[i]);
    }
    QCOMPARE(markers.markerSize(), qint64(2 + 3)); // what came, not what the length said
    QLoggingCategory::setFilterRules(QString());
    QVERIFY(!markers.next());
    QVERIFY(markers.endOfData());
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
        if (markers.first()) {
            while (markers.next()) {
                ++steps;
                bytes += markers.markerData().size();
                QVERIFY(markers.markerOffset() < file.size());
            }
        }
        // Every step moves on by at least two bytes.
        QVERIFY2(steps <= file.size() / 2, qPrintable(file.fileName()));
        QVERIFY2(bytes <= file.size(), qPrintable(file.fileName()));
        ++files;
    }
    QVERIFY(files > 40);
}

QTEST_MAIN(tst_JpegMarkers)
#include "tst_JpegMarkers.moc"
