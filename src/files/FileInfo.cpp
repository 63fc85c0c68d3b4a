#include "FileInfo.h"
#include "FileUtility.h"
#include "LoomkitLogging.h"

#include <QFile>
#include <QMimeDatabase>

namespace {

template <typename T>
T logged(const char *function, const char *name, const T &value)
{
    qCInfo(lcFile) << function << name << value;
    return value;
}

} // namespace

FileInfo::FileInfo(QObject *parent)
    : LoomkitObject(parent)
{
}

FileInfo::FileInfo(const QString &path, QObject *parent)
    : LoomkitObject(parent)
    , m_info(FileUtility::resolvedPath(path, true))
{
}

FileInfo::FileInfo(const QUrl &url, QObject *parent)
    : LoomkitObject(parent)
    , m_info(FileUtility::resolvedPath(url, true))
{
}

void FileInfo::setFileInfo(const QString &resolvedPath)
{
    m_info.setFile(resolvedPath);
    qCInfo(lcFile) << Q_FUNC_INFO << "file: " << m_info.filePath();
    if (m_folder)
        m_folder->setPath(m_info.absolutePath());
}

QString FileInfo::filePath() const
{
    return logged(Q_FUNC_INFO, "filePath", m_info.filePath());
}

void FileInfo::setFilePath(const QString &path)
{
    qCInfo(lcFile) << Q_FUNC_INFO << "filePath: " << path;
    setFileInfo(FileUtility::resolvedPath(path, true));
    emit filePathChanged();
}

QUrl FileInfo::url() const
{
    return logged(Q_FUNC_INFO, "url", FileUtility::pathUrl(m_info.filePath()));
}

void FileInfo::setUrl(const QUrl &url)
{
    if (url == this->url())
        return;
    setFilePath(FileUtility::resolvedPath(url, true));
}

bool FileInfo::exists() const
{
    return logged(Q_FUNC_INFO, "exists", m_info.exists());
}

qlonglong FileInfo::size() const
{
    return logged(Q_FUNC_INFO, "size", qlonglong(m_info.size()));
}

QString FileInfo::path() const
{
    return logged(Q_FUNC_INFO, "path", m_info.path());
}

QString FileInfo::displayName() const
{
    return logged(Q_FUNC_INFO, "displayName", m_info.fileName());
}

QString FileInfo::fileName() const
{
    return logged(Q_FUNC_INFO, "fileName", m_info.fileName());
}

QString FileInfo::baseName() const
{
    return logged(Q_FUNC_INFO, "baseName", m_info.baseName());
}

QString FileInfo::suffix() const
{
    return logged(Q_FUNC_INFO, "suffix", m_info.suffix());
}

QString FileInfo::type() const
{
    // By the name alone: the contents are not read, so a file of the same
    // name in the current folder can't change the answer.
    const QString fileName = m_info.fileName();
    const QMimeType mimeType = QMimeDatabase().mimeTypeForFile(fileName, QMimeDatabase::MatchExtension);
    qCInfo(lcFile) << Q_FUNC_INFO << "fileName: " << fileName << "mime: " << mimeType.name();
    return mimeType.name();
}

QDateTime FileInfo::created() const
{
    return logged(Q_FUNC_INFO, "created", m_info.birthTime());
}

QDateTime FileInfo::lastModified() const
{
    return logged(Q_FUNC_INFO, "lastModified", m_info.lastModified());
}

bool FileInfo::isFile() const
{
    return logged(Q_FUNC_INFO, "isFile", m_info.isFile());
}

bool FileInfo::isFolder() const
{
    return logged(Q_FUNC_INFO, "isFolder", m_info.isDir());
}

bool FileInfo::isReadable() const
{
    return logged(Q_FUNC_INFO, "isReadable", m_info.isReadable());
}

bool FileInfo::isWritable() const
{
    return logged(Q_FUNC_INFO, "isWritable", m_info.isWritable());
}

bool FileInfo::isNativePath() const
{
    return logged(Q_FUNC_INFO, "isNativePath", m_info.isNativePath());
}

bool FileInfo::isSymLink() const
{
    return logged(Q_FUNC_INFO, "isSymLink", m_info.isSymLink());
}

QString FileInfo::symLinkTarget() const
{
    return logged(Q_FUNC_INFO, "symLinkTarget", m_info.symLinkTarget());
}

FileFolder *FileInfo::folder()
{
    if (!m_folder)
        m_folder = new FileFolder(m_info.absolutePath(), this);
    qCInfo(lcFile) << Q_FUNC_INFO << "folder" << m_folder;
    return m_folder;
}

FileInfo::Permission FileInfo::permissions() const
{
    return logged(Q_FUNC_INFO, "permissions", Permission(int(m_info.permissions())));
}

void FileInfo::refresh()
{
    m_info.refresh();
    emit filePathChanged();
    emit permissionsChanged();
}

bool FileInfo::setPermissions(Permission permission)
{
    QFile file(m_info.filePath());
    if (!file.setPermissions(QFileDevice::Permissions(int(permission)))) {
        qCWarning(lcFile) << Q_FUNC_INFO << "Unable to set permissions to" << Qt::hex << int(permission)
                          << "on" << m_info.filePath();
        return false;
    }
    // QFileInfo caches what it read; the new bits must show at once.
    m_info.refresh();
    emit permissionsChanged();
    return true;
}

bool FileInfo::hasExtendedProperty(const QString &name)
{
    Q_UNUSED(name)
    return false;
}

QJSValue FileInfo::getExtendedProperty(const QString &name)
{
    Q_UNUSED(name)
    return QJSValue(QJSValue::UndefinedValue);
}

bool FileInfo::setExtendedProperty(const QString &name, const QJSValue &value)
{
    Q_UNUSED(name)
    Q_UNUSED(value)
    return false;
}
