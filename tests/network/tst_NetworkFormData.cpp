#include "NetworkFilePart.h"
#include "NetworkFormData.h"

#include <QFile>
#include <QSignalSpy>
#include <QTemporaryDir>
#include <QTest>

// Reads pieces of `chunk` bytes until a read gives nothing.
static QByteArray readInPieces(QIODevice *device, int chunk)
{
    QByteArray read;
    for (QByteArray piece = device->read(chunk); !piece.isEmpty(); piece = device->read(chunk))
        read += piece;
    return read;
}

class tst_NetworkFormData : public QObject
{
    Q_OBJECT

    QTemporaryDir m_dir;
    QString m_path;
    QByteArray m_content;

private slots:
    void initTestCase()
    {
        QVERIFY(m_dir.isValid());
        for (int i = 0; i < 1000; ++i)
            m_content += char(i % 251);
        m_path = m_dir.filePath("content.bin");
        QFile file(m_path);
        QVERIFY(file.open(QIODevice::WriteOnly));
        file.write(m_content);
    }

    void filePartWindow_data()
    {
        QTest::addColumn<qint64>("offset");
        QTest::addColumn<qint64>("size");
        QTest::addColumn<int>("from");
        QTest::addColumn<int>("count");
        QTest::newRow("middle") << qint64(100) << qint64(50) << 100 << 50;
        QTest::newRow("to the end") << qint64(900) << qint64(-1) << 900 << 100;
        QTest::newRow("size past the end") << qint64(990) << qint64(100) << 990 << 10;
        QTest::newRow("offset past the end") << qint64(5000) << qint64(-1) << 1000 << 0;
        QTest::newRow("size 0") << qint64(0) << qint64(0) << 0 << 0;
        QTest::newRow("negative offset counts as 0") << qint64(-20) << qint64(10) << 0 << 10;
        QTest::newRow("negative size gives nothing") << qint64(10) << qint64(-7) << 10 << 0;
    }

    void filePartWindow()
    {
        QFETCH(qint64, offset);
        QFETCH(qint64, size);
        QFETCH(int, from);
        QFETCH(int, count);
        QFile file(m_path);
        QVERIFY(file.open(QIODevice::ReadOnly));
        NetworkFilePart part(&file, offset, size);
        QVERIFY(!part.isSequential());
        QCOMPARE(part.size(), qint64(count));
        // Odd pieces hit the window's end mid-read.
        QCOMPARE(readInPieces(&part, 7), m_content.mid(from, count));
        QVERIFY(part.atEnd());
        // Seeks are within the window.
        QVERIFY(part.seek(count / 2));
        QCOMPARE(part.readAll(), m_content.mid(from + count / 2, count - count / 2));
        QTest::ignoreMessage(QtWarningMsg, "QIODevice::write (NetworkFilePart): ReadOnly device");
        QCOMPARE(part.write("x"), qint64(-1));
    }

    void chainReads_data()
    {
        QTest::addColumn<int>("chunk");
        QTest::newRow("1") << 1;
        QTest::newRow("13") << 13;
        QTest::newRow("4096") << 4096;
    }

    void chainReads()
    {
        QFETCH(int, chunk);
        NetworkFormData body;
        QVERIFY(body.appendData("head\r\n"));
        QVERIFY(body.appendPath(m_path));
        QVERIFY(body.appendData("\r\nmiddle\r\n"));
        QVERIFY(body.appendPath(m_path, 10, 20));
        QVERIFY(body.appendData("--end--\r\n"));
        const QByteArray expected = "head\r\n" + m_content + "\r\nmiddle\r\n" + m_content.mid(10, 20) + "--end--\r\n";
        QCOMPARE(body.size(), qint64(expected.size()));
        QVERIFY(!body.isSequential());
        QCOMPARE(readInPieces(&body, chunk), expected);
        QCOMPARE(body.pos(), qint64(expected.size()));

        // A re-sent request rewinds: everything reads again, files included.
        QVERIFY(body.reset());
        QCOMPARE(body.readAll(), expected);
        for (int at : { 300, expected.size() - 25, 5 }) {
            QVERIFY(body.seek(at));
            QCOMPARE(body.pos(), qint64(at));
            QCOMPARE(body.read(20), expected.mid(at, 20));
        }
    }

    void progressAndAbort()
    {
        NetworkFormData body;
        body.appendData(QByteArray(100, 'a'));
        body.appendData(QByteArray(100, 'b'));
        QSignalSpy progressSpy(&body, &NetworkFormData::readProgress);
        QCOMPARE(body.read(150).size(), 150);
        QCOMPARE(progressSpy.last().first().toDouble(), 0.75);
        QCOMPARE(body.read(100).size(), 50);
        QCOMPARE(progressSpy.last().first().toDouble(), 1.0);
        // The end reads as 0, with full progress; so does an empty body.
        progressSpy.clear();
        char buffer[8];
        QCOMPARE(body.read(buffer, 8), qint64(0));
        QCOMPARE(progressSpy.last().first().toDouble(), 1.0);
        NetworkFormData empty;
        QSignalSpy emptySpy(&empty, &NetworkFormData::readProgress);
        QVERIFY(empty.readAll().isEmpty());
        QCOMPARE(emptySpy.last().first().toDouble(), 1.0);

        // An aborted body stops at once, with full progress.
        NetworkFormData file;
        file.appendPath(m_path);
        QCOMPARE(file.read(10).size(), 10);
        file.setAborted(true);
        QSignalSpy abortedSpy(&file, &NetworkFormData::readProgress);
        QVERIFY(file.read(10).isEmpty());
        QCOMPARE(abortedSpy.count(), 1);
        QCOMPARE(abortedSpy.first().first().toDouble(), 1.0);
    }

    void badFiles()
    {
        NetworkFormData body;
        QSignalSpy readySpy(&body, &NetworkFormData::readyRead);
        QVERIFY(!body.appendPath(m_dir.filePath("missing")));
        QVERIFY(!body.appendPath(m_dir.path())); // a folder is no file
        QCOMPARE(readySpy.count(), 0);
        QCOMPARE(body.size(), qint64(0));
        NetworkFilePart noFile(nullptr, 0, -1);
        QCOMPARE(noFile.size(), qint64(0));
        QVERIFY(noFile.readAll().isEmpty());

        // A file that shrinks under the read: what is gone is skipped, and
        // the read ends instead of waiting.
        const QString path = m_dir.filePath("shrinks.bin");
        QVERIFY(QFile::copy(m_path, path));
        body.appendPath(path, 0, 800);
        body.appendData("after");
        QCOMPARE(body.read(100).size(), 100);
        QVERIFY(QFile::resize(path, 50));
        QByteArray rest;
        for (int i = 0; i < 10; ++i)
            rest += body.read(4096);
        QVERIFY(rest.endsWith("after"));
    }
};

QTEST_MAIN(tst_NetworkFormData)

#include "tst_NetworkFormData.moc"
