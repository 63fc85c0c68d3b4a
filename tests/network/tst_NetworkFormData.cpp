#include "NetworkFilePart.h"
#include "NetworkFormData.h"

#include <QFile>
#include <QSignalSpy>
#include <QTemporaryDir>
#include <QTest>

class tst_NetworkFormData : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void filePartWindow_data();
    void filePartWindow();
    void filePartRewinds();
    void chainReadsInOrder_data();
    void chainReadsInOrder();
    void seekBackAndForward();
    void progressAndEnd();
    void abortedStopsAtOnce();
    void missingFileFails();
    void fileShrinksUnderRead();

private:
    QTemporaryDir m_dir;
    QString m_path;
    QByteArray m_content;
};

void tst_NetworkFormData::initTestCase()
{
    QVERIFY(m_dir.isValid());
    m_content.resize(1000);
    for (int i = 0; i < m_content.size(); ++i)
        m_content[i] = char(i % 251);
    m_path = m_dir.filePath("content.bin");
    QFile file(m_path);
    QVERIFY(file.open(QIODevice::WriteOnly));
    file.write(m_content);
}

void tst_NetworkFormData::filePartWindow_data()
{
    QTest::addColumn<qint64>("offset");
    QTest::addColumn<qint64>("size");
    QTest::addColumn<int>("from");
    QTest::addColumn<int>("count");
    QTest::newRow("middle") << qint64(100) << qint64(50) << 100 << 50;
    QTest::newRow("to the end") << qint64(900) << qint64(-1) << 900 << 100;
    QTest::newRow("size past the end") << qint64(990) << qint64(100) << 990 << 10;
    QTest::newRow("offset at the end") << qint64(1000) << qint64(5) << 1000 << 0;
    QTest::newRow("offset past the end") << qint64(5000) << qint64(-1) << 1000 << 0;
    QTest::newRow("size 0") << qint64(0) << qint64(0) << 0 << 0;
    QTest::newRow("negative offset counts as 0") << qint64(-20) << qint64(10) << 0 << 10;
    QTest::newRow("negative size gives nothing") << qint64(10) << qint64(-7) << 10 << 0;
}

void tst_NetworkFormData::filePartWindow()
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
    QCOMPARE(part.pos(), qint64(0));
    // Read in odd pieces so that the window's end is hit mid-read.
    QByteArray read;
    while (!part.atEnd()) {
        const QByteArray piece = part.read(7);
        if (piece.isEmpty())
            break;
        read += piece;
    }
    QCOMPARE(read, m_content.mid(from, count));
    QTest::ignoreMessage(QtWarningMsg, "QIODevice::write (NetworkFilePart): ReadOnly device");
    QCOMPARE(part.write("x"), qint64(-1)); // read-only
}

void tst_NetworkFormData::filePartRewinds()
{
    QFile file(m_path);
    QVERIFY(file.open(QIODevice::ReadOnly));
    NetworkFilePart part(&file, 200, 300);
    QCOMPARE(part.readAll(), m_content.mid(200, 300));
    QVERIFY(part.seek(0));
    QCOMPARE(part.pos(), qint64(0));
    QCOMPARE(part.read(10), m_content.mid(200, 10));
    QVERIFY(part.seek(250));
    QCOMPARE(part.readAll(), m_content.mid(450, 50));

    NetworkFilePart empty(nullptr, 0, -1);
    QCOMPARE(empty.size(), qint64(0));
    QCOMPARE(empty.pos(), qint64(0));
    QVERIFY(empty.readAll().isEmpty());
}

void tst_NetworkFormData::chainReadsInOrder_data()
{
    QTest::addColumn<int>("chunk");
    QTest::newRow("1") << 1;
    QTest::newRow("13") << 13;
    QTest::newRow("4096") << 4096;
}

void tst_NetworkFormData::chainReadsInOrder()
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

    QByteArray read;
    for (;;) {
        const QByteArray piece = body.read(chunk);
        if (piece.isEmpty())
            break;
        read += piece;
    }
    QCOMPARE(read, expected);
    QCOMPARE(body.pos(), qint64(expected.size()));
    QVERIFY(body.atEnd());
}

void tst_NetworkFormData::seekBackAndForward()
{
    NetworkFormData body;
    body.appendData("0123456789");
    body.appendPath(m_path, 500, -1);
    body.appendData("tail");
    const QByteArray expected = "0123456789" + m_content.mid(500) + "tail";
    QCOMPARE(body.readAll(), expected);

    // A re-sent request rewinds: everything reads again, files included.
    QVERIFY(body.reset());
    QCOMPARE(body.pos(), qint64(0));
    QCOMPARE(body.readAll(), expected);

    QVERIFY(body.seek(300));
    QCOMPARE(body.pos(), qint64(300));
    QCOMPARE(body.read(20), expected.mid(300, 20));
    QVERIFY(body.seek(5));
    QCOMPARE(body.readAll(), expected.mid(5));
}

void tst_NetworkFormData::progressAndEnd()
{
    NetworkFormData body;
    body.appendData(QByteArray(100, 'a'));
    body.appendData(QByteArray(100, 'b'));
    QSignalSpy progressSpy(&body, &NetworkFormData::readProgress);
    QCOMPARE(body.read(150).size(), 150);
    QVERIFY(progressSpy.count() >= 2);
    QCOMPARE(progressSpy.last().first().toDouble(), 0.75);
    QCOMPARE(body.read(100).size(), 50);
    QCOMPARE(progressSpy.last().first().toDouble(), 1.0);
    // The end reads as 0, with full progress.
    progressSpy.clear();
    char buffer[8];
    QCOMPARE(body.read(buffer, 8), qint64(0));
    QCOMPARE(progressSpy.last().first().toDouble(), 1.0);
    QCOMPARE(body.size(), qint64(200));

    NetworkFormData empty;
    QSignalSpy emptySpy(&empty, &NetworkFormData::readProgress);
    QVERIFY(empty.readAll().isEmpty());
    QCOMPARE(emptySpy.last().first().toDouble(), 1.0);

    body.clear();
    QCOMPARE(body.size(), qint64(0));
    QCOMPARE(body.pos(), qint64(0));
}

void tst_NetworkFormData::abortedStopsAtOnce()
{
    NetworkFormData body;
    body.appendPath(m_path);
    QCOMPARE(body.read(10).size(), 10);
    body.setAborted(true);
    QSignalSpy progressSpy(&body, &NetworkFormData::readProgress);
    QVERIFY(body.read(10).isEmpty());
    QCOMPARE(progressSpy.count(), 1);
    QCOMPARE(progressSpy.first().first().toDouble(), 1.0);
}

void tst_NetworkFormData::missingFileFails()
{
    NetworkFormData body;
    QSignalSpy readySpy(&body, &NetworkFormData::readyRead);
    QVERIFY(!body.appendPath(m_dir.filePath("missing")));
    QVERIFY(!body.appendPath(m_dir.path())); // a folder is no file
    QCOMPARE(readySpy.count(), 0);
    QCOMPARE(body.size(), qint64(0));
}

void tst_NetworkFormData::fileShrinksUnderRead()
{
    const QString path = m_dir.filePath("shrinks.bin");
    {
        QFile file(path);
        QVERIFY(file.open(QIODevice::WriteOnly));
        file.write(m_content);
    }
    NetworkFormData body;
    body.appendPath(path, 0, 800);
    body.appendData("after");
    QCOMPARE(body.read(100).size(), 100);
    QVERIFY(QFile::resize(path, 50));
    // Whatever is gone is skipped; the read ends instead of waiting.
    QByteArray rest;
    for (int i = 0; i < 10; ++i)
        rest += body.read(4096);
    QVERIFY(rest.endsWith("after"));
}

QTEST_MAIN(tst_NetworkFormData)

#include "tst_NetworkFormData.moc"
