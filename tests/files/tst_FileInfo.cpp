#include "FileFolder.h"
#include "FileInfo.h"
#include "FileUtility.h"

#include <QDir>
#include <QFile>
#include <QSignalSpy>
#include <QTemporaryDir>
#include <QtTest>

#include <unistd.h>

namespace {

bool writeBytes(const QString &path, const QByteArray &bytes)
{
    QFile file(path);
    return file.open(QIODevice::WriteOnly) && file.write(bytes) == bytes.size();
}

// Records which path setter ran, as a type that reads a file's contents would.
class RecordingInfo : public FileInfo
{
public:
    using FileInfo::FileInfo;
    void setFilePath(const QString &path) override
    {
        calls.append(path);
        setFileInfo(FileUtility::resolvedPath(path, true));
        emit filePathChanged();
    }
    QStringList calls;
};

} // namespace

class tst_FileInfo : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void facts_data();
    void facts();
    void type_data();
    void type();
    void missingPath();
    void pathForms_data();
    void pathForms();
    void urlSetter();
    void symbolicLink();
    void folderChild();
    void permissions();
    void permissionsRefused();
    void refresh();
    void extendedProperties();
    void overriddenSetterThroughProperty();

private:
    QTemporaryDir m_dir;
};

void tst_FileInfo::initTestCase()
{
    QVERIFY(m_dir.isValid());
}

void tst_FileInfo::facts_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<QByteArray>("content");
    QTest::addColumn<QString>("baseName");
    QTest::addColumn<QString>("suffix");

    QTest::newRow("plain") << "notes.txt" << QByteArray("hello") << "notes" << "txt";
    QTest::newRow("two suffixes") << "archive.tar.gz" << QByteArray(100, 'x') << "archive" << "gz";
    QTest::newRow("no suffix") << "README" << QByteArray() << "README" << "";
    QTest::newRow("hidden") << ".profile" << QByteArray("a=b\n") << "" << "profile";
    QTest::newRow("non-latin") << QString::fromUtf8("Grüße ✓.md") << QByteArray("é") << QString::fromUtf8("Grüße ✓") << "md";
}

void tst_FileInfo::facts()
{
    QFETCH(QString, name);
    QFETCH(QByteArray, content);
    QFETCH(QString, baseName);
    QFETCH(QString, suffix);

    const QString path = m_dir.filePath(name);
    QVERIFY(writeBytes(path, content));

    FileInfo info(path);
    QVERIFY(info.exists());
    QVERIFY(info.isFile());
    QVERIFY(!info.isFolder());
    QVERIFY(!info.isSymLink());
    QVERIFY(info.isNativePath());
    QCOMPARE(info.size(), qlonglong(content.size()));
    QCOMPARE(info.filePath(), path);
    QCOMPARE(info.path(), m_dir.path());
    QCOMPARE(info.fileName(), name);
    QCOMPARE(info.displayName(), name);
    QCOMPARE(info.baseName(), baseName);
    QCOMPARE(info.suffix(), suffix);
    QCOMPARE(info.url(), QUrl::fromLocalFile(path));
    QVERIFY(qAbs(info.lastModified().secsTo(QDateTime::currentDateTime())) < 60);
}

void tst_FileInfo::type_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<QString>("mime");

    QTest::newRow("text") << "a.txt" << "text/plain";
    QTest::newRow("upper-case suffix") << "photo.JPG" << "image/jpeg";
    QTest::newRow("json") << "data.json" << "application/json";
    QTest::newRow("no match") << "blob.unknownsuffix" << "application/octet-stream";
    QTest::newRow("no suffix") << "noext" << "application/octet-stream";
}

void tst_FileInfo::type()
{
    QFETCH(QString, name);
    QFETCH(QString, mime);

    // The content says PNG, but the type goes by the name alone.
    const QString path = m_dir.filePath(name);
    QVERIFY(writeBytes(path, QByteArray::fromHex("89504e470d0a1a0a0000000d49484452")));
    QCOMPARE(FileInfo(path).type(), mime);
    // A file that does not exist has a type too.
    QCOMPARE(FileInfo(m_dir.filePath(QStringLiteral("missing/") + name)).type(), mime);
}

void tst_FileInfo::missingPath()
{
    FileInfo info(m_dir.filePath(QStringLiteral("nothing/here.txt")));
    QVERIFY(!info.exists());
    QVERIFY(!info.isFile());
    QVERIFY(!info.isFolder());
    QCOMPARE(info.size(), qlonglong(0));
    QVERIFY(!info.lastModified().isValid());
    QCOMPARE(info.fileName(), QStringLiteral("here.txt"));
    QCOMPARE(int(info.permissions()), 0);
    QVERIFY(!info.folder()->exists());

    FileInfo empty;
    QVERIFY(!empty.exists());
    QCOMPARE(empty.filePath(), QString());
}

void tst_FileInfo::pathForms_data()
{
    QTest::addColumn<QString>("given");
    QTest::addColumn<QString>("expected");

    const QString home = QDir::homePath();
    QTest::newRow("tilde") << "~/docs/a.txt" << home + "/docs/a.txt";
    QTest::newRow("variable") << "$HOME/b.txt" << home + "/b.txt";
    QTest::newRow("plain") << "/x/y.txt" << "/x/y.txt";
}

void tst_FileInfo::pathForms()
{
    QFETCH(QString, given);
    QFETCH(QString, expected);

    FileInfo info(given);
    QCOMPARE(info.filePath(), expected);

    FileInfo byUrl(QUrl::fromLocalFile(expected));
    QCOMPARE(byUrl.filePath(), expected);

    FileInfo set;
    QSignalSpy spy(&set, &FileInfo::filePathChanged);
    set.setFilePath(given);
    QCOMPARE(set.filePath(), expected);
    QCOMPARE(spy.count(), 1);
}

void tst_FileInfo::urlSetter()
{
    const QString path = m_dir.filePath(QStringLiteral("url.txt"));
    QVERIFY(writeBytes(path, "u"));

    FileInfo info;
    QSignalSpy spy(&info, &FileInfo::filePathChanged);
    info.setUrl(QUrl::fromLocalFile(path));
    QCOMPARE(spy.count(), 1);
    QCOMPARE(info.filePath(), path);
    QVERIFY(info.exists());

    info.setUrl(QUrl::fromLocalFile(path));
    QCOMPARE(spy.count(), 1);

    // Through the property system, as QML sets it.
    QVERIFY(info.setProperty("url", QUrl::fromLocalFile(m_dir.path())));
    QCOMPARE(spy.count(), 2);
    QVERIFY(info.isFolder());
}

void tst_FileInfo::symbolicLink()
{
    const QString target = m_dir.filePath(QStringLiteral("target.bin"));
    const QString link = m_dir.filePath(QStringLiteral("link.bin"));
    QVERIFY(writeBytes(target, QByteArray(42, '\0')));
    QVERIFY(QFile::link(target, link));

    FileInfo info(link);
    QVERIFY(info.isSymLink());
    QCOMPARE(info.symLinkTarget(), target);
    QVERIFY(info.isFile());
    QCOMPARE(info.size(), qlonglong(42));

    QVERIFY(QFile::remove(target));
    info.refresh();
    QVERIFY(info.isSymLink());
    QVERIFY(!info.exists());
}

void tst_FileInfo::folderChild()
{
    QVERIFY(QDir(m_dir.path()).mkpath(QStringLiteral("one/two")));
    const QString path = m_dir.filePath(QStringLiteral("one/two/f.txt"));
    QVERIFY(writeBytes(path, "f"));

    FileInfo info(path);
    FileFolder *folder = info.folder();
    QVERIFY(folder);
    QCOMPARE(folder->parent(), &info);
    QCOMPARE(info.folder(), folder);
    QCOMPARE(folder->path(), m_dir.filePath(QStringLiteral("one/two")));
    QVERIFY(folder->fileExists(QStringLiteral("f.txt")));

    // The child stays the same object and follows the path.
    info.setFilePath(m_dir.filePath(QStringLiteral("one/g.txt")));
    QCOMPARE(info.folder(), folder);
    QCOMPARE(folder->path(), m_dir.filePath(QStringLiteral("one")));

    const QVariant viaProperty = info.property("folder");
    QCOMPARE(viaProperty.value<FileFolder *>(), folder);
}

void tst_FileInfo::permissions()
{
    const QString path = m_dir.filePath(QStringLiteral("perm.txt"));
    QVERIFY(writeBytes(path, "p"));

    FileInfo info(path);
    QSignalSpy spy(&info, &FileInfo::permissionsChanged);

    // The "User" bits describe the running user, not the file's mode, and the
    // superuser may execute anything that anyone may; compare the mode bits.
    const int modeBits = 0x7077;
    const int ownerOnly = FileInfo::ReadOwner | FileInfo::WriteOwner;
    QVERIFY(info.setPermissions(FileInfo::Permission(ownerOnly)));
    QCOMPARE(spy.count(), 1);
    QCOMPARE(int(info.permissions()) & modeBits, ownerOnly);
    QCOMPARE(int(QFileInfo(path).permissions()) & modeBits, ownerOnly);

    const int everyone = ownerOnly | FileInfo::ReadGroup | FileInfo::ReadOther | FileInfo::ExeOther;
    QVERIFY(info.setProperty("permissions", everyone));
    QCOMPARE(spy.count(), 2);
    QCOMPARE(int(info.permissions()) & modeBits, everyone);
    QCOMPARE(QFileInfo(path).permissions() & modeBits, QFileDevice::Permissions(everyone));

    // Read-only to its owner: the check bites unless we are the superuser.
    QVERIFY(info.setPermissions(FileInfo::Permission(FileInfo::ReadOwner | FileInfo::ReadUser)));
    if (::geteuid() == 0)
        QSKIP("Permission checks don't apply to the superuser");
    info.refresh();
    QVERIFY(info.isReadable());
    QVERIFY(!info.isWritable());
}

void tst_FileInfo::permissionsRefused()
{
    FileInfo info(m_dir.filePath(QStringLiteral("absent.txt")));
    QSignalSpy spy(&info, &FileInfo::permissionsChanged);
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("Unable to set permissions to.*absent\\.txt")));
    QVERIFY(!info.setPermissions(FileInfo::ReadOwner));
    QCOMPARE(spy.count(), 0);
}

void tst_FileInfo::refresh()
{
    const QString path = m_dir.filePath(QStringLiteral("grow.txt"));
    QVERIFY(writeBytes(path, "12"));

    FileInfo info(path);
    QCOMPARE(info.size(), qlonglong(2));

    QVERIFY(writeBytes(path, "12345"));
    QSignalSpy pathSpy(&info, &FileInfo::filePathChanged);
    QSignalSpy permissionSpy(&info, &FileInfo::permissionsChanged);
    info.refresh();
    QCOMPARE(info.size(), qlonglong(5));
    QCOMPARE(pathSpy.count(), 1);
    QCOMPARE(permissionSpy.count(), 1);
}

void tst_FileInfo::extendedProperties()
{
    FileInfo info(m_dir.path());
    QVERIFY(!info.hasExtendedProperty(QStringLiteral("System.Title")));
    QVERIFY(info.getExtendedProperty(QStringLiteral("System.Title")).isUndefined());
    QVERIFY(info.getExtendedProperty(QString()).isUndefined());
    QVERIFY(!info.setExtendedProperty(QStringLiteral("System.Title"), QJSValue(QStringLiteral("x"))));
}

void tst_FileInfo::overriddenSetterThroughProperty()
{
    // A derived type's setter must run when QML writes the property.
    RecordingInfo info;
    QVERIFY(info.setProperty("filePath", m_dir.path()));
    QCOMPARE(info.calls, QStringList { m_dir.path() });

    QVERIFY(info.setProperty("url", QUrl::fromLocalFile(m_dir.filePath(QStringLiteral("x.jpg")))));
    QCOMPARE(info.calls.size(), 2);
    QCOMPARE(info.fileName(), QStringLiteral("x.jpg"));
}

QTEST_GUILESS_MAIN(tst_FileInfo)
#include "tst_FileInfo.moc"
