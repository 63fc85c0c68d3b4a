#ifndef FILEINFO_H
#define FILEINFO_H

#include "FileFolder.h"
#include "LoomkitObject.h"

#include <QDateTime>
#include <QFileInfo>
#include <QJSValue>
#include <QString>
#include <QUrl>

// The facts about one path, for QML. Derived types that read a file's
// contents (such as its metadata) override the two path setters and use
// setFileInfo() to point the facts at the resolved path.
class FileInfo : public LoomkitObject
{
    Q_OBJECT

    Q_PROPERTY(QString filePath READ filePath WRITE setFilePath NOTIFY filePathChanged)
    Q_PROPERTY(QUrl url READ url WRITE setUrl NOTIFY filePathChanged)
    Q_PROPERTY(bool exists READ exists NOTIFY filePathChanged)
    Q_PROPERTY(qlonglong size READ size NOTIFY filePathChanged)
    Q_PROPERTY(QString path READ path NOTIFY filePathChanged)
    Q_PROPERTY(QString displayName READ displayName NOTIFY filePathChanged)
    Q_PROPERTY(QString fileName READ fileName NOTIFY filePathChanged)
    Q_PROPERTY(QString baseName READ baseName NOTIFY filePathChanged)
    Q_PROPERTY(QString suffix READ suffix NOTIFY filePathChanged)
    Q_PROPERTY(QString type READ type NOTIFY filePathChanged)
    Q_PROPERTY(QDateTime created READ created NOTIFY filePathChanged)
    Q_PROPERTY(QDateTime lastModified READ lastModified NOTIFY filePathChanged)
    Q_PROPERTY(bool isFile READ isFile NOTIFY filePathChanged)
    Q_PROPERTY(bool isFolder READ isFolder NOTIFY filePathChanged)
    Q_PROPERTY(bool isReadable READ isReadable NOTIFY filePathChanged)
    Q_PROPERTY(bool isWritable READ isWritable NOTIFY filePathChanged)
    Q_PROPERTY(bool isNativePath READ isNativePath NOTIFY filePathChanged)
    Q_PROPERTY(bool isSymLink READ isSymLink NOTIFY filePathChanged)
    Q_PROPERTY(QString symLinkTarget READ symLinkTarget NOTIFY filePathChanged)
    Q_PROPERTY(FileFolder *folder READ folder NOTIFY filePathChanged)
    Q_PROPERTY(Permission permissions READ permissions WRITE setPermissions NOTIFY permissionsChanged)

public:
    enum Permission {
        ReadOwner = 0x4000,
        WriteOwner = 0x2000,
        ExeOwner = 0x1000,
        ReadUser = 0x0400,
        WriteUser = 0x0200,
        ExeUser = 0x0100,
        ReadGroup = 0x0040,
        WriteGroup = 0x0020,
        ExeGroup = 0x0010,
        ReadOther = 0x0004,
        WriteOther = 0x0002,
        ExeOther = 0x0001
    };
    Q_ENUM(Permission)

    explicit FileInfo(QObject *parent = nullptr);
    FileInfo(const QString &path, QObject *parent = nullptr);
    FileInfo(const QUrl &url, QObject *parent = nullptr);

    QString filePath() const;
    virtual void setFilePath(const QString &path);
    QUrl url() const;
    virtual void setUrl(const QUrl &url);
    bool exists() const;
    qlonglong size() const;
    QString path() const;
    QString displayName() const;
    QString fileName() const;
    QString baseName() const;
    QString suffix() const;
    QString type() const;
    QDateTime created() const;
    QDateTime lastModified() const;
    bool isFile() const;
    bool isFolder() const;
    bool isReadable() const;
    bool isWritable() const;
    bool isNativePath() const;
    bool isSymLink() const;
    QString symLinkTarget() const;
    FileFolder *folder();
    Permission permissions() const;

    const QFileInfo &info() const { return m_info; }

    Q_INVOKABLE void refresh();
    Q_INVOKABLE bool setPermissions(Permission permission);
    Q_INVOKABLE bool hasExtendedProperty(const QString &name);
    Q_INVOKABLE QJSValue getExtendedProperty(const QString &name);
    Q_INVOKABLE bool setExtendedProperty(const QString &name, const QJSValue &value);

signals:
    void filePathChanged();
    void permissionsChanged();

protected:
    // Points the facts at an already resolved path, and the folder child at
    // its folder. Emits nothing: the caller emits filePathChanged when done.
    void setFileInfo(const QString &resolvedPath);

    QFileInfo m_info;

private:
    FileFolder *m_folder = nullptr;
};

#endif // FILEINFO_H
