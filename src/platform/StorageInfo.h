#ifndef STORAGEINFO_H
#define STORAGEINFO_H

#include "LoomkitObject.h"

#include <QStorageInfo>
#include <QString>
#include <QUrl>
#include <QVariantList>
#include <QVariantMap>

// The mounted volume that holds a path: its names, file system, sizes and
// states, and the list of all mounted volumes.
class StorageInfo : public LoomkitObject
{
    Q_OBJECT

    Q_PROPERTY(QString path READ path WRITE setPath NOTIFY pathChanged)
    Q_PROPERTY(QUrl url READ url WRITE setUrl NOTIFY pathChanged)
    Q_PROPERTY(bool isValid READ isValid NOTIFY storageChanged)
    Q_PROPERTY(bool isReady READ isReady NOTIFY storageChanged)
    Q_PROPERTY(bool isReadOnly READ isReadOnly NOTIFY storageChanged)
    Q_PROPERTY(bool isRoot READ isRoot NOTIFY storageChanged)
    Q_PROPERTY(QString rootPath READ rootPath NOTIFY storageChanged)
    Q_PROPERTY(QString name READ name NOTIFY storageChanged)
    Q_PROPERTY(QString displayName READ displayName NOTIFY storageChanged)
    Q_PROPERTY(QString device READ device NOTIFY storageChanged)
    Q_PROPERTY(QString subvolume READ subvolume NOTIFY storageChanged)
    Q_PROPERTY(QString fileSystemType READ fileSystemType NOTIFY storageChanged)
    Q_PROPERTY(qlonglong bytesTotal READ bytesTotal NOTIFY storageChanged)
    Q_PROPERTY(qlonglong bytesFree READ bytesFree NOTIFY storageChanged)
    Q_PROPERTY(qlonglong bytesAvailable READ bytesAvailable NOTIFY storageChanged)
    Q_PROPERTY(int blockSize READ blockSize NOTIFY storageChanged)
    Q_PROPERTY(StorageType storageType READ storageType NOTIFY storageChanged)
    Q_PROPERTY(QVariantList mountedVolumes READ mountedVolumes NOTIFY storageChanged)

public:
    // Numbered as the drive types of the platform the module came from.
    enum StorageType {
        StorageTypeUnknown = 0,
        StorageTypeNoRoot = 1,
        StorageTypeRemovable = 2,
        StorageTypeFixed = 3,
        StorageTypeRemote = 4,
        StorageTypeOptical = 5,
        StorageTypeRam = 6
    };
    Q_ENUM(StorageType)

    explicit StorageInfo(QObject *parent = nullptr);
    StorageInfo(const QString &path, QObject *parent = nullptr);

    QString path() const;
    void setPath(const QString &path);
    QUrl url() const;
    void setUrl(const QUrl &url);
    bool isValid() const;
    bool isReady() const;
    bool isReadOnly() const;
    bool isRoot() const;
    QString rootPath() const;
    QString name() const;
    QString displayName() const;
    QString device() const;
    QString subvolume() const;
    QString fileSystemType() const;
    qlonglong bytesTotal() const;
    qlonglong bytesFree() const;
    qlonglong bytesAvailable() const;
    int blockSize() const;
    StorageType storageType() const;
    QVariantList mountedVolumes() const;

    // Reads the volume's sizes and states again.
    Q_INVOKABLE void refresh();
    // The facts of this volume as one map, keyed like the properties.
    Q_INVOKABLE QVariantMap toVariantMap() const;

    static QVariantMap volumeMap(const QStorageInfo &volume);
    static StorageType storageType(const QStorageInfo &volume);
    // Classifies a volume by its file system type and device; the block
    // device facts come from the sysfs folder given.
    static StorageType storageType(const QByteArray &fileSystemType, const QByteArray &device,
                                   const QString &sysBlockFolder = QStringLiteral("/sys/class/block"));

signals:
    void pathChanged();
    void storageChanged();

private:
    void changePath(const QString &resolved);

    QString m_path;
    QStorageInfo m_storage;
};

#endif // STORAGEINFO_H
