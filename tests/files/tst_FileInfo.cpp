#include "FileFolder.h"
#include "FileInfo.h"
#include "FileTestSupport.h"
#include "FileUtility.h"

#include <QSignalSpy>
#include <QTemporaryDir>

#include <unistd.h>

using namespace FileTestSupport;

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

class tst_FileInfo : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void facts_data();
    void facts();
    void missingPath();
    void pathSetters();
    void symbolicLinkAndRefresh();
    void folderChild();
    void permissions();

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
    QTest::addColumn<QString>("mime");

    QTest::newRow("plain") << "notes.txt" << QByteArray("hello") << "notes" << "txt" << "text/plain";
    QTest::newRow("two suffixes") << "archive.tar.gz" << QByteArray(100, 'x') << "archive" << "gz" << "application/x-compressed-tar";
    QTest::newRow("no suffix") << "README" << QByteArray() << "README" << "" << "text/x-readme";
    QTest::newRow("hidden") << ".profile" << QByteArray("a=b\n") << "" << "profile" << "application/octet-stream";
    const QString nonLatin = QString::fromUtf8("Grüße ✓");
    QTest::newRow("non-latin") << nonLatin + ".md" << QByteArray("é") << nonLatin << "md" << "text/markdown";
}

void tst_FileInfo::facts()
{
    QFETCH(QString, name);
    QFETCH(QByteArray, content);
    QFETCH(QString, baseName);
    QFETCH(QString, suffix);
    QFETCH(QString, mime);

    const QString path = m_dir.filePath(name);
    QVERIFY(writeBytes(path, content));

    FileInfo info(path);
    QVERIFY(info.exists() && info.isFile() && !info.isFolder() && !info.isSymLink());
    QCOMPARE(info.size(), qlonglong(content.size()));
    QCOMPARE(info.path(), m_dir.path());
    QCOMPARE(info.fileName(), name);
    QCOMPARE(info.baseName(), baseName);
    QCOMPARE(info.suffix(), suffix);
    QVERIFY(qAbs(info.lastModified().secsTo(QDateTime::currentDateTime())) < 60);
    // The type goes by the name alone, whatever the content or whether the
    // file exists.
    QVERIFY(writeBytes(path, QByteArray::fromHex("89504e470d0a1a0a0000000d49484452")));
    QCOMPARE(FileInfo(path).type(), mime);
    QCOMPARE(FileInfo(m_dir.filePath("missing/" + name)).type(), mime);
}

void tst_FileInfo::missingPath()
{
    FileInfo info(m_dir.filePath("nothing/here.txt"));
    QVERIFY(!info.exists() && !info.isFile() && !info.lastModified().isValid());
    QCOMPARE(info.size(), qlonglong(0));
    QCOMPARE(info.fileName(), QStringLiteral("here.txt"));
    QCOMPARE(int(info.permissions()), 0);
    QVERIFY(!info.folder()->exists());
    QVERIFY(!FileInfo().exists());
}

void tst_FileInfo::pathSetters()
{
    QCOMPARE(FileInfo("$HOME/b.txt").filePath(), QDir::homePath() + "/b.txt");

    // Bindings on permissions hear of a new path too.
    FileInfo info;
    QSignalSpy spy(&info, &FileInfo::filePathChanged);
    QSignalSpy permissionSpy(&info, &FileInfo::permissionsChanged);
    info.setFilePath("~/docs/a.txt");
    QCOMPARE(info.filePath(), QDir::homePath() + "/docs/a.txt");
    info.setUrl(QUrl::fromLocalFile(info.filePath()));
    QCOMPARE(spy.count(), 1);
    QCOMPARE(permissionSpy.count(), 1);

    // A derived type's setter must run when QML writes the property.
    RecordingInfo recording;
    QVERIFY(recording.setProperty("filePath", m_dir.path()));
    QCOMPARE(recording.calls, QStringList { m_dir.path() });
    QVERIFY(recording.setProperty("url", QUrl::fromLocalFile(m_dir.filePath("x.jpg"))));
    QCOMPARE(recording.calls.size(), 2);
    QCOMPARE(recording.fileName(), QStringLiteral("x.jpg"));
}

void tst_FileInfo::symbolicLinkAndRefresh()
{
    const QString target = m_dir.filePath("target.bin");
    const QString link = m_dir.filePath("link.bin");
    QVERIFY(writeBytes(target, QByteArray(42, '\0')));
    QVERIFY(QFile::link(target, link));

    FileInfo info(link);
    QVERIFY(info.isSymLink());
    QCOMPARE(info.symLinkTarget(), target);
    QCOMPARE(info.size(), qlonglong(42));

    // Facts are cached until refresh, which tells every binding.
    QVERIFY(writeBytes(target, "12345"));
    QCOMPARE(info.size(), qlonglong(42));
    QSignalSpy pathSpy(&info, &FileInfo::filePathChanged);
    QSignalSpy permissionSpy(&info, &FileInfo::permissionsChanged);
    info.refresh();
    QCOMPARE(info.size(), qlonglong(5));
    QCOMPARE(pathSpy.count(), 1);
    QCOMPARE(permissionSpy.count(), 1);

    QVERIFY(QFile::remove(target));
    info.refresh();
    QVERIFY(info.isSymLink());
    QVERIFY(!info.exists());
}

void tst_FileInfo::folderChild()
{
    const QString path = m_dir.filePath("one/two/f.txt");
    QVERIFY(QDir(m_dir.path()).mkpath("one/two"));
    QVERIFY(writeBytes(path, "f"));

    FileInfo info(path);
    FileFolder *folder = info.folder();
    QCOMPARE(folder->parent(), &info);
    QCOMPARE(folder->path(), m_dir.filePath("one/two"));
    QVERIFY(folder->fileExists("f.txt"));

    // The child stays the same object and follows the path.
    info.setFilePath(m_dir.filePath("one/g.txt"));
    QCOMPARE(info.property("folder").value<FileFolder *>(), folder);
    QCOMPARE(folder->path(), m_dir.filePath("one"));
}

void tst_FileInfo::permissions()
{
    const QString path = m_dir.filePath("perm.txt");
    QVERIFY(writeBytes(path, "p"));

    FileInfo info(path);
    QSignalSpy spy(&info, &FileInfo::permissionsChanged);

    // The "User" bits describe the running user, not the file's mode, and the
    // superuser may execute anything that anyone may; compare the mode bits.
    const int modeBits = 0x7077;
    const int ownerOnly = FileInfo::ReadOwner | FileInfo::WriteOwner;
    QVERIFY(info.setPermissions(FileInfo::Permission(ownerOnly)));
    QCOMPARE(int(QFileInfo(path).permissions()) & modeBits, ownerOnly);
    const int everyone = ownerOnly | FileInfo::ReadGroup | FileInfo::ReadOther | FileInfo::ExeOther;
    QVERIFY(info.setProperty("permissions", everyone));
    QCOMPARE(int(info.permissions()) & modeBits, everyone);
    QCOMPARE(int(QFileInfo(path).permissions()) & modeBits, everyone);
    QCOMPARE(spy.count(), 2);

    FileInfo absent(m_dir.filePath("absent.txt"));
    QSignalSpy absentSpy(&absent, &FileInfo::permissionsChanged);
    QVERIFY(expectWarning("Unable to set permissions to.*absent\\.txt") && !absent.setPermissions(FileInfo::ReadOwner));
    QCOMPARE(absentSpy.count(), 0);

    // Read-only to its owner: the check bites unless we are the superuser.
    QVERIFY(info.setPermissions(FileInfo::Permission(FileInfo::ReadOwner | FileInfo::ReadUser)));
    if (::geteuid() == 0)
        QSKIP("Permission checks don't apply to the superuser");
    info.refresh();
    QVERIFY(info.isReadable() && !info.isWritable());
}

QTEST_GUILESS_MAIN(tst_FileInfo)
#include "tst_FileInfo.moc"
