#include "File.h"
#include "FileTestSupport.h"

#include <QJSEngine>
#include <QSignalSpy>
#include <QTemporaryDir>

using namespace FileTestSupport;

static QByteArray utf16Bytes(const QString &text)
{
    return QByteArray(reinterpret_cast<const char *>(text.utf16()), text.size() * 2);
}

class tst_File : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void lines_data();
    void lines();
    void openAndTextMode();
    void closedFileAndPath();
    void positionAppendAndTruncate();
    void writeValues_data();
    void writeValues();
    void writeErrorOnFullDevice();

private:
    QString path(const QString &name) const { return m_dir.filePath(name); }
    QTemporaryDir m_dir;
};

void tst_File::initTestCase()
{
    QVERIFY(m_dir.isValid());
}

void tst_File::lines_data()
{
    QTest::addColumn<int>("encoding");
    QTest::addColumn<QByteArray>("bytes");
    QTest::addColumn<QStringList>("lines");

    const int utf8 = File::TextEncodingUtf8;
    const int utf16 = File::TextEncodingUtf16;
    QTest::newRow("utf8 non-latin") << utf8 << QByteArray("\xc3\xa9\xe2\x9c\x93\n\n") << QStringList { QString::fromUtf8("é✓\n"), "\n" };
    QTest::newRow("latin1") << int(File::TextEncodingLatin1) << QByteArray("\xe9\nb\n") << QStringList { QString::fromUtf8("é\n"), "b\n" };
    const QString longLine = QString(70000, QChar(0x0A0A)) + QString::fromUtf8("é\n");
    QTest::newRow("utf8 long line") << utf8 << (longLine + "b\n" + longLine).toUtf8() << QStringList { longLine, "b\n", longLine };
    QTest::newRow("utf16 long line") << utf16 << utf16Bytes(longLine + longLine) << QStringList { longLine, longLine };
    // U+0A0A and U+0D0A hold the line feed byte inside one character.
    const QString tricky = QString(QChar(0x0A0A)) + QChar(0x0D0A) + QChar(0x0A00) + QLatin1Char('x');
    const QStringList trickyLines { tricky + "\n", tricky + tricky + "\n" };
    QTest::newRow("utf16 line feed bytes inside characters") << utf16 << utf16Bytes(trickyLines.join(QString())) << trickyLines;
    // Lines decode as C strings: a NUL ends the text of its line, while the
    // position still moves past the whole line. The last line has no ending.
    QTest::newRow("latin1 with NUL") << int(File::TextEncodingLatin1) << QByteArray("a\0b\nc", 5) << QStringList { "a", "c" };
    // An odd byte at the end of UTF-16 text is half a character: dropped.
    QTest::newRow("utf16 odd tail") << utf16 << utf16Bytes("ab") + "\n" << QStringList { "ab" };
}

void tst_File::lines()
{
    QFETCH(int, encoding);
    QFETCH(QByteArray, bytes);
    QFETCH(QStringList, lines);

    const QString name = path(QStringLiteral("lines-%1.txt").arg(QTest::currentDataTag()));
    const bool whole = std::all_of(lines.cbegin(), lines.cend(), [](const QString &l) { return l.endsWith('\n'); });
    if (whole) {
        File file(name);
        file.setTextEncoding(File::TextEncoding(encoding));
        QVERIFY(file.open(File::OpenModeWriteOnly | File::OpenModeTruncate));
        for (const QString &line : qAsConst(lines))
            file.writeLine(line.chopped(1));
        file.close();
        QCOMPARE(contents(name), bytes);
    } else {
        QVERIFY(writeBytes(name, bytes));
    }

    File file(name);
    file.setTextEncoding(File::TextEncoding(encoding));
    QVERIFY(file.open(File::OpenModeReadOnly));
    QStringList read;
    while (!file.atEnd())
        read << file.readLine();
    QCOMPARE(read, lines);
    QCOMPARE(file.position(), qlonglong(bytes.size()));
    QVERIFY(file.readLine().isEmpty());
}

void tst_File::openAndTextMode()
{
    const QString name = path("textmode.txt");
    QVERIFY(writeBytes(name, "a\r\nb\r\n"));

    File file(name);
    expectWarning("setTextMode.*File not open");
    file.setTextMode(true);
    QVERIFY(!file.textMode());

    // Opened without a mode it reads text; the mode is changed only once.
    QSignalSpy modeSpy(&file, &File::openModeChanged);
    QVERIFY(file.open());
    QCOMPARE(file.openMode(), int(File::OpenModeReadOnly | File::OpenModeText));
    file.setTextMode(true);
    QCOMPARE(file.readLine(), QStringLiteral("a\n"));
    file.setTextMode(false);
    QCOMPARE(file.readLine(), QStringLiteral("b\r\n"));
    file.close();
    file.close();
    QCOMPARE(file.openMode(), int(File::NotOpen));
    QCOMPARE(modeSpy.count(), 3);

    // A file closed by its end keeps what was written.
    {
        File written(name);
        QVERIFY(written.open(File::OpenModeWriteOnly));
        written.write(QJSValue("kept"));
    }
    QCOMPARE(contents(name), QByteArray("kept"));
}

void tst_File::closedFileAndPath()
{
    File missing(path("missing/none.txt"));
    QSignalSpy errorSpy(&missing, &File::errorChanged);
    QSignalSpy modeSpy(&missing, &File::openModeChanged);
    QVERIFY(expectWarning("none\\.txt") && !missing.open(File::OpenModeReadOnly));
    QCOMPARE(errorSpy.count(), 1);
    QCOMPARE(modeSpy.count(), 0);
    QCOMPARE(missing.error(), int(File::ErrorOpen));

    // Nothing reads or writes while closed.
    QVERIFY(expectWarning("readLine.*File not open") && missing.readLine().isNull());
    QVERIFY(expectWarning("File not open") && missing.readAll().toByteArray().isEmpty());
    File closed(path("closed.txt"));
    expectWarning("File not open");
    closed.writeLine("lost");
    QVERIFY(!QFileInfo::exists(closed.path()));

    // An open file keeps its path.
    const QString first = path("first.txt");
    File file(first);
    QVERIFY(file.open(File::OpenModeWriteOnly));
    QSignalSpy spy(&file, &File::pathChanged);
    expectWarning("File is open:.*first\\.txt");
    file.setPath(path("second.txt"));
    QCOMPARE(file.path(), first);
    file.close();
    file.setUrl(QUrl::fromLocalFile(path("second.txt")));
    file.setPath(path("second.txt"));
    QCOMPARE(spy.count(), 1);
    file.setUrl(QUrl("qrc:/x/y.txt"));
    QCOMPARE(file.path(), QStringLiteral(":/x/y.txt"));
    QCOMPARE(file.url(), QUrl("qrc:///x/y.txt"));
}

void tst_File::positionAppendAndTruncate()
{
    const QString name = path("position.txt");
    for (const char *part : { "0123", "4567", "89" }) {
        File file(name);
        QVERIFY(file.open(File::OpenModeWriteOnly | File::OpenModeAppend));
        file.write(QJSValue(part));
    }

    File file(name);
    QVERIFY(file.open(File::OpenModeReadWrite));
    QSignalSpy spy(&file, &File::positionChanged);
    QCOMPARE(file.read(3).toByteArray(), QByteArray("012"));
    QVERIFY(file.setProperty("position", 8));
    QCOMPARE(file.read(100).toByteArray(), QByteArray("89"));
    QVERIFY(file.atEnd());
    QCOMPARE(spy.count(), 3);
    QVERIFY(file.read(-1).toByteArray().isEmpty());
    QVERIFY(file.reset());
    QCOMPARE(file.readAll().toByteArray(), QByteArray("0123456789"));
    file.close();

    QVERIFY(file.open(File::OpenModeReadWrite | File::OpenModeTruncate));
    QCOMPARE(file.readAll().toByteArray(), QByteArray());
}

void tst_File::writeValues_data()
{
    QTest::addColumn<int>("encoding");
    QTest::addColumn<bool>("binary");
    QTest::addColumn<QByteArray>("expected");

    const QString text = QString::fromUtf8("ä1");
    QTest::newRow("string utf8") << int(File::TextEncodingUtf8) << false << text.toUtf8();
    QTest::newRow("string latin1") << int(File::TextEncodingLatin1) << false << text.toLatin1();
    QTest::newRow("string utf16") << int(File::TextEncodingUtf16) << false << utf16Bytes(text);
    QTest::newRow("string unknown encoding") << int(File::TextEncodingUnknown) << false << QByteArray();
    // Bytes are no string: they go out unchanged whatever the encoding.
    QTest::newRow("bytes") << int(File::TextEncodingUtf16) << true << QByteArray("\x00\xff\x0a", 3);
}

void tst_File::writeValues()
{
    QFETCH(int, encoding);
    QFETCH(bool, binary);
    QFETCH(QByteArray, expected);

    QJSEngine engine;
    const QJSValue value = binary ? engine.toScriptValue(expected) : QJSValue(QString::fromUtf8("ä1"));
    QCOMPARE(value.isString(), !binary);

    const QString name = path(QStringLiteral("value-%1.bin").arg(QTest::currentDataTag()));
    File file(name);
    file.setTextEncoding(File::TextEncoding(encoding));
    QVERIFY(file.open(File::OpenModeWriteOnly));
    if (encoding == File::TextEncodingUnknown)
        expectWarning("Undefined encoding");
    file.write(value);
    QCOMPARE(file.position(), qlonglong(expected.size()));
    file.close();
    QCOMPARE(contents(name), expected);
}

void tst_File::writeErrorOnFullDevice()
{
    if (!QFileInfo::exists("/dev/full"))
        QSKIP("No /dev/full here");
    File file(QStringLiteral("/dev/full"));
    QVERIFY(file.open(File::OpenModeWriteOnly));
    QSignalSpy spy(&file, &File::errorChanged);
    file.write(QJSValue("nowhere to go"));
    QVERIFY(!file.flush());
    QVERIFY(spy.count() >= 1);
    // No space left is a resource error.
    QCOMPARE(file.error(), int(File::ErrorResource));
}

QTEST_GUILESS_MAIN(tst_File)
#include "tst_File.moc"
