#include "ExifTestSupport.h"
#include "JpegMarkers.h"
#include "TestSupport.h"

#include <QBuffer>
#include <QDirIterator>
#include <QSignalSpy>
#include <QTemporaryDir>
#include <QtTest>

using namespace ExifTestSupport;

class tst_JpegMarkers : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void cleanup();
    void failures_data();
    void failures();
    void walksARealFile();
    void shortAndOddLengths();
    void writes();
    void signalsOnlyOnChange();
    void hostileFilesEnd();
    void enumCoversEveryCode();
};

void tst_JpegMarkers::init()
{
    QLoggingCategory::setFilterRules(QStringLiteral("Orvane.Loomkit.File.debug=true"));
}

void tst_JpegMarkers::cleanup()
{
    QLoggingCategory::setFilterRules(QString());
}

void tst_JpegMarkers::failures_data()
{
    QTest::addColumn<QByteArray>("data");
    QTest::addColumn<bool>("first");
    QTest::addColumn<QStringList>("messages");

    QTest::newRow("empty") << QByteArray() << false
                           << QStringList{QStringLiteral("No JPEG marker"), QStringLiteral("No JPEG content")};
    QTest::newRow("one byte") << QByteArray("\xff", 1) << false
                              << QStringList{QStringLiteral("No JPEG marker"), QStringLiteral("No JPEG content")};
    QTest::newRow("EOI first") << QByteArray("\xff\xd9", 2) << false << QStringList{QStringLiteral("No JPEG SOI marker")};
    QTest::newRow("no length") << QByteArray("\xff\xe0\x01", 3) << false
                               << QStringList{QStringLiteral("No JPEG payload"), QStringLiteral("No JPEG content")};
    QTest::newRow("text") << QByteArray("hello world") << false << QStringList{QStringLiteral("No JPEG SOI marker")};
    QTest::newRow("SOI alone") << QByteArray("\xff\xd8", 2) << true << QStringList{QStringLiteral("No JPEG marker")};
}

void tst_JpegMarkers::failures()
{
    QFETCH(QByteArray, data);
    QFETCH(bool, first);
    QFETCH(QStringList, messages);

    QBuffer buffer(&data);
    QVERIFY(buffer.open(QIODevice::ReadOnly));
    JpegMarkers markers(&buffer);
    for (const QString &message : messages)
        QTest::ignoreMessage(QtDebugMsg, QRegularExpression(QRegularExpression::escape(message) + QLatin1Char('$')));
    QCOMPARE(markers.first(), first);
    if (first) {
        QCOMPARE(markers.markerType(), JpegMarkers::JpegMarkerSOI);
        QCOMPARE(markers.markerSize(), qint64(2));
        QVERIFY(!markers.next());
    }
    QVERIFY(markers.endOfData());
    QCOMPARE(int(markers.markerType()), 0);
    QCOMPARE(markers.markerSize(), qint64(0));
    QVERIFY(!markers.next());

    JpegMarkers unopened(nullptr);
    QTest::ignoreMessage(QtDebugMsg, QRegularExpression(QStringLiteral("Not opened$")));
    QVERIFY(!unopened.first());
    QTest::ignoreMessage(QtDebugMsg, QRegularExpression(QStringLiteral("Not opened$")));
    QVERIFY(!unopened.next());
}

void tst_JpegMarkers::walksARealFile()
{
    QTemporaryDir dir;
    const QString path = dir.filePath(QStringLiteral("a.jpg"));
    QVERIFY(makeJpeg(path, 40, 30));
    QByteArray data = readFile(path);
    int sos = -1;
    const QList<Segment> expected = segments(data, &sos);

    QBuffer buffer(&data);
    QVERIFY(buffer.open(QIODevice::ReadOnly));
    JpegMarkers markers(&buffer);
    QVERIFY(markers.first());
    QCOMPARE(markers.markerOffset(), qint64(0));
    for (const Segment &segment : expected) {
        QVERIFY(markers.next());
        QCOMPARE(quint16(markers.markerType()), segment.marker);
        QCOMPARE(markers.markerData(), segment.data);
        QCOMPARE(markers.markerSize(), qint64(segment.data.size() + 2));
    }
    QVERIFY(markers.next());
    QCOMPARE(markers.markerType(), JpegMarkers::JpegMarkerSOS);
    QCOMPARE(markers.markerOffset(), qint64(sos));
    const qint64 scanStart = buffer.pos();
    QCOMPARE(scanStart, qint64(sos + 2 + markers.markerSize()));

    // The entropy-coded data isn't walked: the device stays where it is.
    QLoggingCategory::setFilterRules(QString());
    QVERIFY(!markers.next());
    QVERIFY(markers.endOfData());
    QCOMPARE(buffer.pos(), scanStart);

    // first() starts over.
    QVERIFY(markers.first());
    QVERIFY(markers.next());
    QCOMPARE(quint16(markers.markerType()), expected.first().marker);
}

void tst_JpegMarkers::shortAndOddLengths()
{
    // Length 2: no data. Length 0: no data, and the walk goes on from there.
    // A length past the end keeps the bytes that came.
    QByteArray data("\xff\xd8"
                    "\xff\xe0\x00\x02"
                    "\xff\xe1\x00\x00"
                    "\xff\xfe\x00\x05" "abc"
                    "\xff\xd0"
                    "\xff\xdb\x10\x00" "xyz",
                    2 + 4 + 4 + 7 + 2 + 7);
    QBuffer buffer(&data);
    QVERIFY(buffer.open(QIODevice::ReadOnly));
    JpegMarkers markers(&buffer);
    QVERIFY(markers.first());

    QVERIFY(markers.next());
    QCOMPARE(markers.markerType(), JpegMarkers::JpegMarkerAPP0);
    QVERIFY(markers.markerData().isEmpty());
    QCOMPARE(markers.markerSize(), qint64(2));

    QVERIFY(markers.next());
    QCOMPARE(markers.markerType(), JpegMarkers::JpegMarkerAPP1);
    QVERIFY(markers.markerData().isEmpty());
    QCOMPARE(markers.markerOffset(), qint64(6));

    QVERIFY(markers.next());
    QCOMPARE(markers.markerType(), JpegMarkers::JpegMarkerCOM);
    QCOMPARE(markers.markerData(), QByteArray("abc"));

    QVERIFY(markers.next());
    QCOMPARE(markers.markerType(), JpegMarkers::JpegMarkerRST0);
    QCOMPARE(markers.markerSize(), qint64(2));

    QVERIFY(markers.next());
    QCOMPARE(markers.markerType(), JpegMarkers::JpegMarkerDQT);
    QCOMPARE(markers.markerData(), QByteArray("xyz"));

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
    QCOMPARE(buffer.data(), QByteArray("\xff\xd8", 2));
    QVERIFY(markers.write(JpegMarkers::JpegMarkerAPP10, QByteArray("data")));
    QCOMPARE(markers.markerOffset(), qint64(2));
    QCOMPARE(markers.markerType(), JpegMarkers::JpegMarkerAPP10);
    QCOMPARE(markers.markerData(), QByteArray("data"));
    QVERIFY(markers.write(JpegMarkers::JpegMarkerEOI, QByteArray()));
    QCOMPARE(buffer.data(), QByteArray("\xff\xd8\xff\xea\x00\x06" "data\xff\xd9", 12));

    // What is written reads back.
    QByteArray written = buffer.data();
    QBuffer reader(&written);
    QVERIFY(reader.open(QIODevice::ReadOnly));
    JpegMarkers walk(&reader);
    QVERIFY(walk.first());
    QVERIFY(walk.next());
    QCOMPARE(walk.markerData(), QByteArray("data"));

    // A device that refuses to write.
    QBuffer readOnly(&written);
    QVERIFY(readOnly.open(QIODevice::ReadOnly));
    JpegMarkers failing(&readOnly);
    QTest::ignoreMessage(QtWarningMsg, "QIODevice::write (QBuffer): ReadOnly device");
    QVERIFY(!failing.write(JpegMarkers::JpegMarkerSOI, QByteArray()));
    QVERIFY(!JpegMarkers(nullptr).write(JpegMarkers::JpegMarkerSOI, QByteArray()));
}

void tst_JpegMarkers::signalsOnlyOnChange()
{
    QByteArray data("\xff\xd8\xff\xe0\x00\x04" "ab\xff\xe0\x00\x04" "ab\xff\xe0\x00\x04" "cd", 20);
    QBuffer buffer(&data);
    QVERIFY(buffer.open(QIODevice::ReadOnly));
    JpegMarkers markers(&buffer);
    QSignalSpy type(&markers, &JpegMarkers::markerTypeChanged);
    QSignalSpy end(&markers, &JpegMarkers::endOfDataChanged);
    QSignalSpy payload(&markers, &JpegMarkers::markerDataChanged);
    QSignalSpy offset(&markers, &JpegMarkers::markerOffsetChanged);

    QVERIFY(markers.first()); // offset 0 is no change
    QCOMPARE(type.count(), 1);
    QCOMPARE(end.count(), 1);
    QCOMPARE(payload.count(), 0);
    QCOMPARE(offset.count(), 0);
    QVERIFY(markers.next());
    QCOMPARE(type.count(), 2);
    QCOMPARE(payload.count(), 1);
    QVERIFY(markers.next()); // same type, same data
    QCOMPARE(type.count(), 2);
    QCOMPARE(payload.count(), 1);
    QCOMPARE(offset.count(), 2);
    QVERIFY(markers.next());
    QCOMPARE(payload.count(), 2);
    QLoggingCategory::setFilterRules(QString());
    QVERIFY(!markers.next());
    QCOMPARE(end.count(), 2);
    QCOMPARE(type.count(), 3);
    QCOMPARE(payload.count(), 3);
}

void tst_JpegMarkers::hostileFilesEnd()
{
    QLoggingCategory::setFilterRules(QString());
    QStringList paths;
    for (const QString &folder : {QStringLiteral("exif/hostile"), QStringLiteral("exif/broken"),
                                  QStringLiteral("exif/camera"), QStringLiteral("exif/libexif")}) {
        QDirIterator it(TestSupport::dataPath(folder), QDir::Files, QDirIterator::Subdirectories);
        while (it.hasNext())
            paths.append(it.next());
    }
    QVERIFY(paths.size() > 40);
    for (const QString &path : paths) {
        QFile file(path);
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
        QVERIFY2(steps <= file.size() / 2, qPrintable(path));
        QVERIFY2(bytes <= file.size(), qPrintable(path));
    }
}

void tst_JpegMarkers::enumCoversEveryCode()
{
    const QMetaEnum metaEnum = QMetaEnum::fromType<JpegMarkers::JpegMarkerType>();
    QCOMPARE(metaEnum.keyCount(), 63);
    for (int code = 0xffc0; code <= 0xfffe; ++code)
        QVERIFY(metaEnum.valueToKey(code));
    QCOMPARE(metaEnum.keyToValue("JpegMarkerAPP10"), 65514);
    QCOMPARE(metaEnum.keyToValue("JpegMarkerSOS"), 0xffda);
    QCOMPARE(metaEnum.keyToValue("JpegMarkerJPG13"), 0xfffd);
    QCOMPARE(metaEnum.keyToValue("JpegMarkerCOM"), 65534);
    QCOMPARE(metaEnum.keyToValue("JpegMarkerDHT"), 0xffc4);
}

QTEST_MAIN(tst_JpegMarkers)
#include "tst_JpegMarkers.moc"
