#include "File.h"

#include <QFile>
#include <QJSEngine>
#include <QSignalSpy>
#include <QTemporaryDir>
#include <QtTest>

namespace {

QByteArray contents(const QString &path)
{
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray("<unreadable>");
}

QByteArray utf16Bytes(const QString &text)
{
    return QByteArray(reinterpret_cast<const char *>(text.utf16()), text.size() * 2);
}

} // namespace

class tst_File : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void lines_data();
    void lines();
    void openAndClose();
    void openFailure();
    void pathWhileOpen();
    void closedFile();
    void positionAndRead();
    void writeValues_data();
    void writeValues();
    void append();
    void textMode();
    void urlForm();
    void destructorCloses();
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
    QTest::addColumn<QStringList>("lines");
    QTest::addColumn<QByteArray>("bytes");

    QTest::newRow("utf8 one char") << int(File::TextEncodingUtf8) << QStringList { "a" } << QByteArray("a\n");
    QTest::newRow("utf8 non-latin") << int(File::TextEncodingUtf8) << QStringList { QString::fromUtf8("é✓"), "" }
                                    << QByteArray("\xc3\xa9\xe2\x9c\x93\n\n");
    QTest::newRow("latin1") << int(File::TextEncodingLatin1) << QStringList { QString::fromUtf8("é"), "b" }
                            << QByteArray("\xe9\nb\n");
    QTest::newRow("local 8-bit") << int(File::TextEncodingLocal8Bit) << QStringList { "plain" }
                                 << QByteArray("plain\n");
    QTest::newRow("utf16") << int(File::TextEncodingUtf16) << QStringList { "ab", "c" }
                           << utf16Bytes(QStringLiteral("ab\nc\n"));
    // U+0A0A and U+0D0A hold the line feed byte inside one character.
    const QString tricky = QString(QChar(0x0A0A)) + QChar(0x0D0A) + QChar(0x0A00) + QLatin1Char('x');
    QTest::newRow("utf16 line feed bytes inside characters") << int(File::TextEncodingUtf16)
                                                             << QStringList { tricky, tricky + tricky }
                                                             << utf16Bytes(tricky + "\n" + tricky + tricky + "\n");
}

void tst_File::lines()
{
    QFETCH(int, encoding);
    QFETCH(QStringList, lines);
    QFETCH(QByteArray, bytes);

    const QString name = path(QStringLiteral("lines-%1.txt").arg(QTest::currentDataTag()));
    {
        File file(name);
        file.setTextEncoding(File::TextEncoding(encoding));
        QVERIFY(file.open(File::OpenModeWriteOnly | File::OpenModeTruncate));
        for (const QString &line : qAsConst(lines))
            file.writeLine(line);
        file.close();
    }
    QCOMPARE(contents(name), bytes);

    File file(name);
    file.setTextEncoding(File::TextEncoding(encoding));
    QVERIFY(file.open(File::OpenModeReadOnly));
    for (const QString &line : qAsConst(lines))
        QCOMPARE(file.readLine(), line + QLatin1Char('\n'));
    QVERIFY(file.atEnd());
    QVERIFY(file.readLine().isEmpty());
}

void tst_File::openAndClose()
{
    const QString name = path(QStringLiteral("open.txt"));
    QVERIFY(QFile(name).open(QIODevice::WriteOnly));

    File file(name);
    QCOMPARE(file.openMode(), int(File::NotOpen));
    QVERIFY(file.exists());

    QStringList order;
    connect(&file, &File::pathChanged, this, [&] { order << "path"; });
    connect(&file, &File::openModeChanged, this, [&] { order << "openMode"; });
    connect(&file, &File::positionChanged, this, [&] { order << "position"; });

    QVERIFY(file.open());
    QCOMPARE(order.value(0), QStringLiteral("path"));
    QCOMPARE(order.count(QStringLiteral("openMode")), 1);
    QCOMPARE(order.count(QStringLiteral("position")), 1);
    QCOMPARE(file.openMode(), int(File::OpenModeReadOnly | File::OpenModeText));
    QVERIFY(file.isReadable());
    QVERIFY(!file.isWritable());
    QVERIFY(file.textMode());

    order.clear();
    file.close();
    order.sort();
    QCOMPARE(order, (QStringList { "openMode", "position" }));
    QCOMPARE(file.openMode(), int(File::NotOpen));

    order.clear();
    file.close();
    QVERIFY(order.isEmpty());
}

void tst_File::openFailure()
{
    File file(path(QStringLiteral("missing/none.txt")));
    QSignalSpy errorSpy(&file, &File::errorChanged);
    QSignalSpy modeSpy(&file, &File::openModeChanged);
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("none\\.txt")));
    QVERIFY(!file.open(File::OpenModeReadOnly));
    QCOMPARE(errorSpy.count(), 1);
    QCOMPARE(modeSpy.count(), 0);
    QCOMPARE(file.error(), int(File::ErrorOpen));
    QVERIFY(!file.errorString().isEmpty());
    QVERIFY(!file.exists());

    // Writing into a folder that is not there fails the same way.
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("none\\.txt")));
    QVERIFY(!file.open(File::OpenModeWriteOnly));
    QVERIFY(!QFileInfo::exists(path(QStringLiteral("missing"))));
}

void tst_File::pathWhileOpen()
{
    const QString first = path(QStringLiteral("first.txt"));
    File file(first);
    QVERIFY(file.open(File::OpenModeWriteOnly));

    QSignalSpy spy(&file, &File::pathChanged);
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("File is open:.*first\\.txt")));
    file.setPath(path(QStringLiteral("second.txt")));
    QCOMPARE(file.path(), first);
    QCOMPARE(spy.count(), 0);

    file.close();
    file.setPath(path(QStringLiteral("second.txt")));
    QCOMPARE(file.path(), path(QStringLiteral("second.txt")));
    QCOMPARE(spy.count(), 1);
    file.setPath(path(QStringLiteral("second.txt")));
    QCOMPARE(spy.count(), 1);
}

void tst_File::closedFile()
{
    File file(path(QStringLiteral("closed.txt")));
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("readLine.*File not open")));
    const QString line = file.readLine();
    QVERIFY(line.isNull());

    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("File not open")));
    file.writeLine(QStringLiteral("lost"));
    QVERIFY(!QFileInfo::exists(file.path()));

    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("File not open")));
    QVERIFY(file.readAll().toByteArray().isEmpty());
}

void tst_File::positionAndRead()
{
    const QString name = path(QStringLiteral("position.bin"));
    {
        QFile raw(name);
        QVERIFY(raw.open(QIODevice::WriteOnly));
        raw.write("0123456789");
    }

    File file(name);
    QVERIFY(file.open(File::OpenModeReadOnly));
    QSignalSpy spy(&file, &File::positionChanged);

    QCOMPARE(file.read(3).toByteArray(), QByteArray("012"));
    QCOMPARE(file.position(), qlonglong(3));
    QCOMPARE(spy.count(), 1);

    QVERIFY(file.setProperty("position", 8));
    QCOMPARE(spy.count(), 2);
    QCOMPARE(file.read(100).toByteArray(), QByteArray("89"));
    QVERIFY(file.atEnd());

    file.setPosition(file.position());
    QCOMPARE(spy.count(), 3);

    QVERIFY(file.read(-1).toByteArray().isEmpty());
    QVERIFY(file.reset());
    QCOMPARE(file.position(), qlonglong(0));
    QCOMPARE(file.readAll().toByteArray(), QByteArray("0123456789"));
    QCOMPARE(file.read(5).toByteArray(), QByteArray());
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
    QTest::newRow("bytes utf16") << int(File::TextEncodingUtf16) << true << QByteArray("\x00\xff\x0a", 3);
    QTest::newRow("bytes latin1") << int(File::TextEncodingLatin1) << true << QByteArray("\x00\xff\x0a", 3);
}

void tst_File::writeValues()
{
    QFETCH(int, encoding);
    QFETCH(bool, binary);
    QFETCH(QByteArray, expected);

    QJSEngine engine;
    const QJSValue value = binary ? engine.toScriptValue(expected)
                                  : QJSValue(QString::fromUtf8("ä1"));
    if (binary)
        QVERIFY(!value.isString());

    const QString name = path(QStringLiteral("value-%1.bin").arg(QTest::currentDataTag()));
    File file(name);
    file.setTextEncoding(File::TextEncoding(encoding));
    QVERIFY(file.open(File::OpenModeWriteOnly));
    QSignalSpy spy(&file, &File::positionChanged);
    if (encoding == File::TextEncodingUnknown)
        QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Undefined encoding")));
    file.write(value);
    QCOMPARE(spy.count(), 1);
    QCOMPARE(file.position(), qlonglong(expected.size()));
    file.close();
    QCOMPARE(contents(name), expected);
}

void tst_File::append()
{
    const QString name = path(QStringLiteral("append.txt"));
    for (int i = 0; i < 3; ++i) {
        File file(name);
        QVERIFY(file.open(File::OpenModeWriteOnly | File::OpenModeAppend));
        file.writeLine(QString::number(i));
    }
    QCOMPARE(contents(name), QByteArray("0\n1\n2\n"));

    File file(name);
    QVERIFY(file.open(File::OpenModeReadWrite | File::OpenModeTruncate));
    QCOMPARE(file.readAll().toByteArray(), QByteArray());
}

void tst_File::textMode()
{
    const QString name = path(QStringLiteral("textmode.txt"));
    {
        QFile raw(name);
        QVERIFY(raw.open(QIODevice::WriteOnly));
        raw.write("a\r\nb\r\n");
    }

    File file(name);
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("setTextMode.*File not open")));
    file.setTextMode(true);
    QVERIFY(!file.textMode());

    QVERIFY(file.open(File::OpenModeReadOnly));
    QSignalSpy spy(&file, &File::openModeChanged);
    file.setTextMode(true);
    QCOMPARE(spy.count(), 1);
    QVERIFY(file.openMode() & File::OpenModeText);
    QCOMPARE(file.readLine(), QStringLiteral("a\n"));
    file.setTextMode(true);
    QCOMPARE(spy.count(), 1);
    file.setTextMode(false);
    QCOMPARE(file.readLine(), QStringLiteral("b\r\n"));
}

void tst_File::urlForm()
{
    const QString name = path(QStringLiteral("url form.txt"));
    File file(QUrl::fromLocalFile(name));
    QCOMPARE(file.path(), name);
    QCOMPARE(file.url(), QUrl::fromLocalFile(name));

    QSignalSpy spy(&file, &File::pathChanged);
    file.setUrl(QUrl::fromLocalFile(name));
    QCOMPARE(spy.count(), 0);
    file.setUrl(QUrl(QStringLiteral("qrc:/x/y.txt")));
    QCOMPARE(spy.count(), 1);
    QCOMPARE(file.path(), QStringLiteral(":/x/y.txt"));
    QCOMPARE(file.url(), QUrl(QStringLiteral("qrc:///x/y.txt")));
}

void tst_File::destructorCloses()
{
    const QString name = path(QStringLiteral("destructor.txt"));
    int modeChanges = 0;
    {
        File file(name);
        QVERIFY(file.open(File::OpenModeWriteOnly));
        file.write(QJSValue(QStringLiteral("kept")));
        connect(&file, &File::openModeChanged, this, [&] { ++modeChanges; });
    }
    QCOMPARE(modeChanges, 1);
    QCOMPARE(contents(name), QByteArray("kept"));
}

void tst_File::writeErrorOnFullDevice()
{
    if (!QFileInfo::exists(QStringLiteral("/dev/full")))
        QSKIP("No /dev/full here");
    File file(QStringLiteral("/dev/full"));
    QVERIFY(file.open(File::OpenModeWriteOnly));
    QSignalSpy spy(&file, &File::errorChanged);
    file.write(QJSValue(QStringLiteral("nowhere to go")));
    const bool flushed = file.flush();
    QVERIFY(!flushed);
    QVERIFY(spy.count() >= 1);
    // No space left is a resource error.
    QCOMPARE(file.error(), int(File::ErrorResource));
}

QTEST_GUILESS_MAIN(tst_File)
#include "tst_File.moc"
