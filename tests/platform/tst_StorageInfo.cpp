#include "../files/FileTestSupport.h"
#include "StorageInfo.h"
#include "TestSupport.h"

#include <QQmlComponent>
#include <QQmlEngine>
#include <QSignalSpy>
#include <QTemporaryDir>

namespace {

// What findmnt says of the volume that holds a path: mount point, type.
QStringList findmnt(const QString &path)
{
    int exitCode = -1;
    const QByteArray out = TestSupport::run("findmnt", { "-n", "-o", "TARGET,FSTYPE", "--target", path }, &exitCode);
    return exitCode == 0 ? QString::fromLocal8Bit(out).simplified().split(QLatin1Char(' ')) : QStringList();
}

} // namespace

class tst_StorageInfo : public QObject
{
    Q_OBJECT

private slots:
    void homeVolume();
    void invalidPath();
    void mountedVolumes();
    void classification_data();
    void classification();
    void registeredEnumeration();
};

void tst_StorageInfo::homeVolume()
{
    if (!TestSupport::hasProgram("findmnt") || !TestSupport::hasProgram("stat"))
        QSKIP("findmnt or stat is missing");

    const QString home = QDir::homePath();
    StorageInfo info(QStringLiteral("~"));
    QCOMPARE(info.path(), home);
    QVERIFY(info.isValid() && info.isReady());

    const QStringList mount = findmnt(home);
    QCOMPARE(mount.size(), 2);
    QCOMPARE(info.rootPath(), mount.at(0));
    QCOMPARE(info.fileSystemType(), mount.at(1));
    QCOMPARE(info.isRoot(), mount.at(0) == QLatin1String("/"));

    int exitCode = -1;
    const QStringList blocks = QString::fromLatin1(TestSupport::run("stat", { "-f", "-c", "%S %b %f %a", home }, &exitCode))
                                   .simplified().split(' ');
    QCOMPARE(exitCode, 0);
    QCOMPARE(blocks.size(), 4);
    const qint64 unit = blocks.at(0).toLongLong();
    QSignalSpy storageSpy(&info, &StorageInfo::storageChanged);
    info.refresh();
    QCOMPARE(storageSpy.count(), 1);
    QCOMPARE(info.bytesTotal(), unit * blocks.at(1).toLongLong());
    // Other processes write meanwhile; the free counts may drift a little.
    const qint64 slack = 256 * 1024 * 1024;
    QVERIFY(qAbs(info.bytesFree() - unit * blocks.at(2).toLongLong()) < slack);
    QVERIFY(qAbs(info.bytesAvailable() - unit * blocks.at(3).toLongLong()) < slack);

    const QVariantMap map = info.toVariantMap();
    QCOMPARE(map.value("rootPath").toString(), info.rootPath());
    QCOMPARE(map.value("bytesTotal").toLongLong(), info.bytesTotal());
    QCOMPARE(map.value("storageType").toInt(), int(info.storageType()));

    // A new path tells both the path and the storage bindings.
    QSignalSpy pathSpy(&info, &StorageInfo::pathChanged);
    info.setUrl(QUrl::fromLocalFile("/"));
    info.setPath("/");
    QCOMPARE(pathSpy.count(), 1);
    QCOMPARE(storageSpy.count(), 2);
    QVERIFY(info.isRoot());

    // Real volumes whose type is sure: memory and the kernel's own.
    if (findmnt("/dev/shm").value(1) == QLatin1String("tmpfs"))
        QCOMPARE(StorageInfo(QStringLiteral("/dev/shm")).storageType(), StorageInfo::StorageTypeRam);
    if (findmnt("/proc").value(1) == QLatin1String("proc"))
        QCOMPARE(StorageInfo(QStringLiteral("/proc")).storageType(), StorageInfo::StorageTypeUnknown);
}

void tst_StorageInfo::invalidPath()
{
    StorageInfo info(QStringLiteral("/no/such/path/anywhere"));
    QVERIFY(!info.isValid() && !info.isReady() && info.rootPath().isEmpty());
    QCOMPARE(info.storageType(), StorageInfo::StorageTypeNoRoot);
    QCOMPARE(info.bytesTotal(), qlonglong(0));
    QCOMPARE(StorageInfo().toVariantMap().value("isValid").toBool(), false);
}

void tst_StorageInfo::mountedVolumes()
{
    QStringList roots;
    for (const QVariant &volume : StorageInfo().mountedVolumes()) {
        QVERIFY(volume.toMap().value("isValid").toBool());
        roots << volume.toMap().value("rootPath").toString();
    }
    QVERIFY2(roots.contains("/"), qPrintable(roots.join(' ')));
    QVERIFY(roots.contains(StorageInfo(QDir::homePath()).rootPath()));
}

void tst_StorageInfo::classification_data()
{
    QTest::addColumn<QByteArray>("fileSystemType");
    QTest::addColumn<QByteArray>("device");
    QTest::addColumn<int>("expected");

    QTest::newRow("fixed disk partition") << QByteArray("ext4") << QByteArray("/dev/sda1") << int(StorageInfo::StorageTypeFixed);
    QTest::newRow("removable flag on the disk") << QByteArray("vfat") << QByteArray("/dev/sdb1") << int(StorageInfo::StorageTypeRemovable);
    QTest::newRow("removable whole disk") << QByteArray("vfat") << QByteArray("/dev/sdb") << int(StorageInfo::StorageTypeRemovable);
    QTest::newRow("disk on the usb bus") << QByteArray("ext4") << QByteArray("/dev/sdc1") << int(StorageInfo::StorageTypeRemovable);
    QTest::newRow("unknown to sysfs") << QByteArray("ext4") << QByteArray("/dev/nvme9n1p1") << int(StorageInfo::StorageTypeFixed);
    QTest::newRow("tmpfs") << QByteArray("tmpfs") << QByteArray("tmpfs") << int(StorageInfo::StorageTypeRam);
    QTest::newRow("nfs") << QByteArray("nfs4") << QByteArray("server:/export") << int(StorageInfo::StorageTypeRemote);
    QTest::newRow("cifs") << QByteArray("cifs") << QByteArray("//server/share") << int(StorageInfo::StorageTypeRemote);
    QTest::newRow("optical") << QByteArray("iso9660") << QByteArray("/dev/sr0") << int(StorageInfo::StorageTypeOptical);
    QTest::newRow("proc") << QByteArray("proc") << QByteArray("proc") << int(StorageInfo::StorageTypeUnknown);
    QTest::newRow("overlay") << QByteArray("overlay") << QByteArray("overlay") << int(StorageInfo::StorageTypeFixed);
    QTest::newRow("nothing") << QByteArray() << QByteArray() << int(StorageInfo::StorageTypeUnknown);
}

void tst_StorageInfo::classification()
{
    QFETCH(QByteArray, fileSystemType);
    QFETCH(QByteArray, device);
    QFETCH(int, expected);

    // A small sysfs: sda fixed, sdb removable, sdc a fixed disk behind usb.
    QTemporaryDir sys;
    QVERIFY(sys.isValid());
    const QString devices = sys.filePath(QStringLiteral("devices"));
    const QString classBlock = sys.filePath(QStringLiteral("class/block"));
    QVERIFY(QDir().mkpath(classBlock));
    const QList<QPair<QString, QByteArray>> disks {
        { QStringLiteral("pci0/ata1/block/sda"), "0\n" },
        { QStringLiteral("pci0/ata2/block/sdb"), "1\n" },
        { QStringLiteral("pci0/usb1/1-1/block/sdc"), "0\n" },
    };
    for (const auto &disk : disks) {
        const QString folder = devices + QLatin1Char('/') + disk.first;
        const QString name = QFileInfo(folder).fileName();
        QVERIFY(FileTestSupport::writeBytes(folder + QStringLiteral("/removable"), disk.second));
        QVERIFY(FileTestSupport::writeBytes(folder + QLatin1Char('/') + name + QStringLiteral("1/partition"), "1\n"));
        QVERIFY(QFile::link(folder, classBlock + QLatin1Char('/') + name));
        QVERIFY(QFile::link(folder + QLatin1Char('/') + name + QLatin1Char('1'), classBlock + QLatin1Char('/') + name + QLatin1Char('1')));
    }

    QCOMPARE(int(StorageInfo::storageType(fileSystemType, device, classBlock)), expected);
}

void tst_StorageInfo::registeredEnumeration()
{
    const QByteArray name("StorageInfo::StorageType");
    QCOMPARE(QMetaType::type(name.constData()), int(QMetaType::UnknownType));

    // Importing the module registers the enumeration by name.
    QQmlEngine engine;
    engine.addImportPath(qEnvironmentVariable("LOOMKIT_BINARY_DIR") + QStringLiteral("/qml"));
    QQmlComponent component(&engine);
    component.setData("import QtQml 2.15\nimport Orvane.Loomkit 1.0\nQtObject {}", QUrl());
    QScopedPointer<QObject> object(component.create());
    QVERIFY2(object, qPrintable(component.errorString()));

    const int id = QMetaType::type(name.constData());
    QVERIFY(id != QMetaType::UnknownType);
    QVERIFY(QMetaType::typeFlags(id).testFlag(QMetaType::IsEnumeration));
}

QTEST_GUILESS_MAIN(tst_StorageInfo)
#include "tst_StorageInfo.moc"
