#include "StorageInfo.h"
#include "FileUtility.h"
#include "LoomkitLogging.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>

namespace {

bool isOneOf(const QByteArray &value, std::initializer_list<const char *> list)
{
    for (const char *item : list) {
        if (value == item)
            return true;
    }
    return false;
}

// File systems of the kernel's own, which hold no user data.
bool isPseudoFileSystem(const QByteArray &type)
{
    return isOneOf(type, { "proc", "sysfs", "cgroup", "cgroup2", "devpts", "mqueue", "debugfs", "securityfs",
                           "pstore", "bpf", "tracefs", "configfs", "fusectl", "hugetlbfs", "autofs",
                           "binfmt_misc", "nsfs", "rpc_pipefs", "efivarfs", "selinuxfs", "devtmpfs" });
}

bool isRemoteFileSystem(const QByteArray &type)
{
    return isOneOf(type, { "nfs", "nfs4", "cifs", "smb3", "smbfs", "ncpfs", "afs", "9p", "ceph", "glusterfs",
                           "davfs", "fuse.sshfs", "sshfs", "fuse.rclone", "fuse.davfs2", "fuse.glusterfs",
                           "lustre", "gpfs" });
}

QByteArray readSysValue(const QString &path)
{
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly))
        return QByteArray();
    return file.read(64).trimmed();
}

bool isRemovableDevice(const QByteArray &device, const QString &sysBlockFolder)
{
    if (!device.startsWith("/dev/"))
        return false;
    // /dev/mapper/x and /dev/disk/by-*/x are links to the kernel's name.
    QString deviceName = QFileInfo(QFile::decodeName(device)).canonicalFilePath();
    if (deviceName.isEmpty())
        deviceName = QFile::decodeName(device);
    deviceName = QFileInfo(deviceName).fileName();

    const QString entry = QFileInfo(QDir(sysBlockFolder).filePath(deviceName)).canonicalFilePath();
    if (entry.isEmpty())
        return false;
    // A partition's removable flag lives on its disk, one folder up.
    const QString disk = QFileInfo::exists(entry + QLatin1String("/partition"))
        ? QFileInfo(entry).absolutePath() : entry;
    if (readSysValue(disk + QLatin1String("/removable")) == "1")
        return true;
    // USB disks often claim to be fixed; their place on the bus tells.
    return disk.contains(QLatin1String("/usb"));
}

} // namespace

StorageInfo::StorageInfo(QObject *parent)
    : LoomkitObject(parent)
{
}

StorageInfo::StorageInfo(const QString &path, QObject *parent)
    : LoomkitObject(parent)
    , m_path(FileUtility::resolvedPath(path, true))
{
    if (!m_path.isEmpty())
        m_storage.setPath(m_path);
}

QString StorageInfo::path() const
{
    return m_path;
}

void StorageInfo::setPath(const QString &path)
{
    changePath(FileUtility::resolvedPath(path, true));
}

QUrl StorageInfo::url() const
{
    return m_path.isEmpty() ? QUrl() : FileUtility::pathUrl(m_path);
}

void StorageInfo::setUrl(const QUrl &url)
{
    changePath(FileUtility::resolvedPath(url, true));
}

void StorageInfo::changePath(const QString &resolved)
{
    if (resolved == m_path)
        return;
    m_path = resolved;
    m_storage = QStorageInfo();
    if (!m_path.isEmpty())
        m_storage.setPath(m_path);
    if (!m_path.isEmpty() && !m_storage.isValid())
        qCDebug(lcFile) << Q_FUNC_INFO << "No volume for" << m_path;
    emit pathChanged();
    emit storageChanged();
}

bool StorageInfo::isValid() const
{
    return m_storage.isValid();
}

bool StorageInfo::isReady() const
{
    return m_storage.isReady();
}

bool StorageInfo::isReadOnly() const
{
    return m_storage.isReadOnly();
}

bool StorageInfo::isRoot() const
{
    return m_storage.isRoot();
}

QString StorageInfo::rootPath() const
{
    return m_storage.rootPath();
}

QString StorageInfo::name() const
{
    return m_storage.name();
}

QString StorageInfo::displayName() const
{
    return m_storage.isValid() ? m_storage.displayName() : QString();
}

QString StorageInfo::device() const
{
    return QFile::decodeName(m_storage.device());
}

QString StorageInfo::subvolume() const
{
    return QFile::decodeName(m_storage.subvolume());
}

QString StorageInfo::fileSystemType() const
{
    return QString::fromLatin1(m_storage.fileSystemType());
}

qlonglong StorageInfo::bytesTotal() const
{
    return m_storage.isValid() ? m_storage.bytesTotal() : 0;
}

qlonglong StorageInfo::bytesFree() const
{
    return m_storage.isValid() ? m_storage.bytesFree() : 0;
}

qlonglong StorageInfo::bytesAvailable() const
{
    return m_storage.isValid() ? m_storage.bytesAvailable() : 0;
}

int StorageInfo::blockSize() const
{
    return m_storage.isValid() ? m_storage.blockSize() : 0;
}

StorageInfo::StorageType StorageInfo::storageType() const
{
    return storageType(m_storage);
}

QVariantList StorageInfo::mountedVolumes() const
{
    QVariantList list;
    const QList<QStorageInfo> volumes = QStorageInfo::mountedVolumes();
    for (const QStorageInfo &volume : volumes)
        list.append(volumeMap(volume));
    return list;
}

void StorageInfo::refresh()
{
    m_storage.refresh();
    emit storageChanged();
}

QVariantMap StorageInfo::toVariantMap() const
{
    return volumeMap(m_storage);
}

QVariantMap StorageInfo::volumeMap(const QStorageInfo &volume)
{
    const bool valid = volume.isValid();
    return QVariantMap {
        { QStringLiteral("isValid"), valid },
        { QStringLiteral("isReady"), volume.isReady() },
        { QStringLiteral("isReadOnly"), volume.isReadOnly() },
        { QStringLiteral("isRoot"), volume.isRoot() },
        { QStringLiteral("rootPath"), volume.rootPath() },
        { QStringLiteral("name"), volume.name() },
        { QStringLiteral("displayName"), valid ? volume.displayName() : QString() },
        { QStringLiteral("device"), QFile::decodeName(volume.device()) },
        { QStringLiteral("subvolume"), QFile::decodeName(volume.subvolume()) },
        { QStringLiteral("fileSystemType"), QString::fromLatin1(volume.fileSystemType()) },
        { QStringLiteral("bytesTotal"), valid ? volume.bytesTotal() : 0 },
        { QStringLiteral("bytesFree"), valid ? volume.bytesFree() : 0 },
        { QStringLiteral("bytesAvailable"), valid ? volume.bytesAvailable() : 0 },
        { QStringLiteral("blockSize"), valid ? volume.blockSize() : 0 },
        { QStringLiteral("storageType"), int(storageType(volume)) },
    };
}

StorageInfo::StorageType StorageInfo::storageType(const QStorageInfo &volume)
{
    if (!volume.isValid())
        return StorageTypeNoRoot;
    return storageType(volume.fileSystemType(), volume.device());
}

StorageInfo::StorageType StorageInfo::storageType(const QByteArray &fileSystemType, const QByteArray &device,
                                                  const QString &sysBlockFolder)
{
    if (fileSystemType.isEmpty() || isPseudoFileSystem(fileSystemType))
        return StorageTypeUnknown;
    if (fileSystemType == "tmpfs" || fileSystemType == "ramfs")
        return StorageTypeRam;
    if (isRemoteFileSystem(fileSystemType) || device.startsWith("//"))
        return StorageTypeRemote;
    if (fileSystemType == "iso9660" || fileSystemType == "udf")
        return StorageTypeOptical;
    if (isRemovableDevice(device, sysBlockFolder))
        return StorageTypeRemovable;
    return StorageTypeFixed;
}
