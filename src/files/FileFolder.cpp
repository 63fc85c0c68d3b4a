#include "FileFolder.h"
#include "File.h"
#include "FileFolderWorker.h"
#include "FileInfo.h"
#include "FileUtility.h"
#include "JsonUtility.h"
#include "LoomkitLogging.h"

#include <QDirIterator>
#include <QFile>
#include <QFileInfo>
#include <QJSValue>
#include <QQmlEngine>
#include <QThread>

namespace {

// Hidden files count towards the size; symbolic links don't.
constexpr QDir::Filters kSizeFilter = QDir::Dirs | QDir::Files | QDir::NoSymLinks | QDir::Hidden
                                      | QDir::NoDot | QDir::NoDotDot;
constexpr QDir::Filters kCopyFilter = QDir::Dirs | QDir::Files | QDir::Hidden | QDir::System
                                      | QDir::NoDot | QDir::NoDotDot;
constexpr QDir::Filters kFileNamesFilter = QDir::Dirs | QDir::Files | QDir::NoDot | QDir::NoDotDot;
constexpr QDir::Filters kFolderNamesFilter = QDir::Dirs | QDir::NoDot | QDir::NoDotDot;

// Large enough to stream fast; the result does not depend on it.
constexpr qint64 kCopyBlockSize = 64 * 1024;

// A name filter may be a list or anything with a text; empty texts are
// dropped, and no list at all (or only empty texts) matches every entry.
QStringList nameFiltersFrom(QVariant value)
{
    if (value.userType() == qMetaTypeId<QJSValue>())
        value = value.value<QJSValue>().toVariant();
    if (!value.isValid() || value.isNull())
        return QStringList();

    QStringList filters;
    if (value.userType() == QMetaType::QStringList || value.userType() == QMetaType::QVariantList)
        filters = value.toStringList();
    else if (value.canConvert<QString>())
        filters.append(value.toString());
    filters.removeAll(QString());
    filters.removeAll(QLatin1String(""));
    return filters;
}

qint64 folderSize(const QString &path)
{
    qint64 total = 0;
    QDirIterator it(path, kSizeFilter);
    while (it.hasNext()) {
        it.next();
        const QFileInfo info = it.fileInfo();
        if (info.isDir())
            total += folderSize(info.filePath());
        else
            total += info.size();
    }
    return total;
}

// Absolute, clean form of a path whose tail may not exist yet, with the part
// that exists resolved through symbolic links.
QString canonicalOrClean(const QString &path)
{
    QString existing = QDir::cleanPath(QFileInfo(path).absoluteFilePath());
    QString tail;
    while (!existing.isEmpty() && !QFileInfo::exists(existing)) {
        const int slash = existing.lastIndexOf(QLatin1Char('/'));
        if (slash <= 0)
            return QDir::cleanPath(QFileInfo(path).absoluteFilePath());
        tail.prepend(existing.mid(slash));
        existing.truncate(slash);
    }
    return QFileInfo(existing).canonicalFilePath() + tail;
}

bool isInside(const QString &path, const QString &folder)
{
    const QString prefix = folder.endsWith(QLatin1Char('/')) ? folder : folder + QLatin1Char('/');
    return path == folder || path.startsWith(prefix);
}

struct Listing
{
    QStringList nameFilters;
    QDir::Filters filters;
    bool wantFolders = false;
    bool subFolders = false;
};

// Folders pass the name filters too: they decide which folders are entered.
void collectNames(const Listing &listing, const QString &folderPath, const QString &prefix,
                  QStringList *chain, QStringList *result)
{
    const QFileInfoList entries = QDir(folderPath).entryInfoList(listing.nameFilters, listing.filters);
    for (const QFileInfo &entry : entries) {
        const QString name = prefix + entry.fileName();
        if (!entry.isDir()) {
            result->append(name);
            continue;
        }
        if (listing.wantFolders)
            result->append(name);
        if (!listing.subFolders)
            continue;
        // A link back to a folder already being listed would never end.
        const QString canonical = entry.canonicalFilePath();
        if (chain->contains(canonical)) {
            qCWarning(lcFile) << Q_FUNC_INFO << "Not entering a folder that links back:" << entry.filePath();
            continue;
        }
        chain->append(canonical);
        collectNames(listing, entry.filePath(), name + QDir::separator(), chain, result);
        chain->removeLast();
    }
}

} // namespace

FileFolder::FileFolder(QObject *parent)
    : LoomkitObject(parent)
    , m_path(QDir::tempPath())
    , m_dir(QDir::temp())
{
    connectSignals();
}

FileFolder::FileFolder(const QDir &dir, QObject *parent)
    : LoomkitObject(parent)
    , m_path(dir.path())
    , m_dir(dir)
{
    connectSignals();
}

FileFolder::FileFolder(const QString &path, QObject *parent)
    : LoomkitObject(parent)
    , m_path(FileUtility::resolvedPath(path, true))
    , m_dir(m_path)
{
    connectSignals();
}

FileFolder::FileFolder(const QUrl &url, QObject *parent)
    : LoomkitObject(parent)
    , m_path(FileUtility::resolvedPath(url, true))
    , m_dir(m_path)
{
    connectSignals();
}

FileFolder::~FileFolder()
{
    // Threads of moveFileToTrashAsync are children; they must end before
    // QObject deletes them. Their workers only post a call, so this is quick.
    const QList<QThread *> threads = findChildren<QThread *>(QString(), Qt::FindDirectChildrenOnly);
    for (QThread *thread : threads) {
        thread->quit();
        thread->wait();
    }
}

void FileFolder::connectSignals()
{
    connect(this, &FileFolder::pathChanged, this, &FileFolder::onPathChanged);
    connect(this, &FileFolder::pathChanged, this, &FileFolder::existsChanged);
}

void FileFolder::onPathChanged()
{
    m_size = -1;
    emit sizeChanged();
}

bool FileFolder::checkConstant(const char *function) const
{
    if (!m_constant)
        return true;
    qCWarning(lcFile) << function << "This is a constant folder" << m_dir;
    return false;
}

bool FileFolder::checkReadOnly(const char *function) const
{
    if (!m_readOnly)
        return true;
    qCWarning(lcFile) << function << "This is a read only folder" << m_dir;
    return false;
}

// Properties

QString FileFolder::path() const
{
    return m_dir.absolutePath();
}

void FileFolder::setPath(const QString &path)
{
    if (!checkConstant(Q_FUNC_INFO))
        return;
    changePath(FileUtility::resolvedPath(path, true));
}

QUrl FileFolder::url() const
{
    return FileUtility::pathUrl(m_dir.absolutePath());
}

void FileFolder::setUrl(const QUrl &url)
{
    if (!checkConstant(Q_FUNC_INFO))
        return;
    m_error.clear();
    changePath(FileUtility::resolvedPath(url, true));
}

void FileFolder::changePath(const QString &resolved)
{
    // A folder made on no path at all gets one only by a real path.
    if (resolved == m_path || (!m_path.isEmpty() && QDir(resolved).absolutePath() == m_dir.absolutePath()))
        return;
    m_path = resolved;
    m_dir.setPath(resolved);
    emit pathChanged();
}

bool FileFolder::exists() const
{
    return m_dir.exists();
}

QString FileFolder::folderName() const
{
    return m_dir.dirName();
}

qlonglong FileFolder::size()
{
    if (m_size < 0)
        m_size = folderSize(m_dir.absolutePath());
    return m_size;
}

QChar FileFolder::separator() const
{
    return QDir::separator();
}

QChar FileFolder::listSeparator() const
{
    return QDir::listSeparator();
}

// Navigation

bool FileFolder::cdUp()
{
    if (!checkConstant(Q_FUNC_INFO))
        return false;
    if (!m_dir.cdUp())
        return false;
    m_path = m_dir.absolutePath();
    emit pathChanged();
    return true;
}

bool FileFolder::cd(const QString &path)
{
    if (!checkConstant(Q_FUNC_INFO))
        return false;
    if (!m_dir.cd(path))
        return false;
    m_path = m_dir.absolutePath();
    emit pathChanged();
    return true;
}

// Listing

QStringList FileFolder::entryNames(const QVariant &nameFilter, bool subFolders, QDir::Filters filters) const
{
    Listing listing;
    listing.nameFilters = nameFiltersFrom(nameFilter);
    listing.filters = filters;
    listing.wantFolders = !filters.testFlag(QDir::Files);
    listing.subFolders = subFolders;

    QStringList result;
    QStringList chain(QFileInfo(m_dir.absolutePath()).canonicalFilePath());
    collectNames(listing, m_dir.absolutePath(), QString(), &chain, &result);
    return result;
}

QStringList FileFolder::fileNames(const QVariant &nameFilter, bool subFolders)
{
    return entryNames(nameFilter, subFolders, kFileNamesFilter);
}

QStringList FileFolder::fileNames(const QVariant &nameFilter)
{
    return fileNames(nameFilter, false);
}

QStringList FileFolder::fileNames()
{
    return fileNames(QVariant(), false);
}

QStringList FileFolder::folderNames(const QVariant &nameFilter, bool subFolders)
{
    return entryNames(nameFilter, subFolders, kFolderNamesFilter);
}

QStringList FileFolder::folderNames(const QVariant &nameFilter)
{
    return folderNames(nameFilter, false);
}

QStringList FileFolder::folderNames()
{
    return folderNames(QVariant(), false);
}

// Folders

bool FileFolder::makeFolder()
{
    if (!checkReadOnly(Q_FUNC_INFO))
        return false;
    if (m_path.isEmpty() || m_dir.absolutePath().isEmpty()) {
        qCWarning(lcFile) << Q_FUNC_INFO << "No path";
        return false;
    }
    if (m_dir.exists())
        return true;

    const QFileInfo info(m_dir.absolutePath());
    const QString parentPath = info.absolutePath();
    const QString name = m_dir.dirName();
    if (!QDir(parentPath).mkpath(name)) {
        qCWarning(lcFile) << Q_FUNC_INFO << "Error creating:" << parentPath << name;
        return false;
    }
    emit existsChanged();
    return true;
}

bool FileFolder::removeFolder()
{
    if (!checkReadOnly(Q_FUNC_INFO))
        return false;
    if (m_path.isEmpty() || m_dir.absolutePath().isEmpty()) {
        qCWarning(lcFile) << Q_FUNC_INFO << "No path";
        return false;
    }
    if (!m_dir.exists())
        return true;
    if (m_dir.isRoot()) {
        qCWarning(lcFile) << Q_FUNC_INFO << "Not removing a root folder:" << m_dir.absolutePath();
        return false;
    }

    qCDebug(lcFile) << Q_FUNC_INFO << m_dir.absolutePath();
    if (!m_dir.removeRecursively())
        return false;
    m_size = -1;
    emit existsChanged();
    emit sizeChanged();
    return true;
}

bool FileFolder::removeFolder(const QString &folderName, bool recursive)
{
    if (!checkReadOnly(Q_FUNC_INFO))
        return false;
    // An empty name would name this folder itself.
    if (folderName.isEmpty()) {
        qCWarning(lcFile) << Q_FUNC_INFO << "No folder name";
        return false;
    }
    QDir dir(m_dir.filePath(folderName));
    if (!dir.exists())
        return true;
    if (dir.isRoot()) {
        qCWarning(lcFile) << Q_FUNC_INFO << "Not removing a root folder:" << dir.absolutePath();
        return false;
    }

    qCDebug(lcFile) << Q_FUNC_INFO << dir.absolutePath() << recursive;
    if (recursive)
        return dir.removeRecursively();
    return dir.rmdir(dir.absolutePath());
}

bool FileFolder::removeFolder(const QString &folderName)
{
    return removeFolder(folderName, false);
}

bool FileFolder::makePath(const QString &path)
{
    if (!checkReadOnly(Q_FUNC_INFO))
        return false;
    if (!m_dir.mkpath(path)) {
        qCWarning(lcFile) << Q_FUNC_INFO << "Error creating:" << m_dir.filePath(path);
        return false;
    }
    emit existsChanged();
    return true;
}

bool FileFolder::removePath(const QString &path)
{
    if (!checkReadOnly(Q_FUNC_INFO))
        return false;
    if (!m_dir.rmpath(path)) {
        qCWarning(lcFile) << Q_FUNC_INFO << "Error removing:" << m_dir.filePath(path);
        return false;
    }
    return true;
}

// Files

QString FileFolder::filePath(const QString &fileName) const
{
    return m_dir.filePath(fileName);
}

QString FileFolder::relativeFilePath(const QString &fileName) const
{
    return m_dir.relativeFilePath(fileName);
}

QUrl FileFolder::fileUrl(const QString &fileName) const
{
    const QString path = m_dir.filePath(fileName);
    if (QFileInfo(path).isNativePath())
        return QUrl::fromLocalFile(path);
    return FileUtility::qrcUrl(path);
}

bool FileFolder::fileExists(const QString &fileName) const
{
    return m_dir.exists(fileName);
}

bool FileFolder::removeFile(const QString &fileName)
{
    if (!checkReadOnly(Q_FUNC_INFO))
        return false;
    return m_dir.remove(fileName);
}

bool FileFolder::renameFile(const QString &oldFileName, const QString &newFileName)
{
    if (!checkReadOnly(Q_FUNC_INFO))
        return false;
    if (!m_dir.rename(oldFileName, newFileName)) {
        qCWarning(lcFile) << Q_FUNC_INFO << "dir:" << m_dir.absolutePath() << "oldFileName:" << oldFileName
                          << "newFileName:" << newFileName;
        return false;
    }
    return true;
}

bool FileFolder::copyFile(const QString &fileName, const QString &filePath)
{
    const QString source = m_dir.filePath(fileName);
    const QFileInfo sourceInfo(source);
    if (!sourceInfo.exists()) {
        qCCritical(lcFile) << Q_FUNC_INFO << "File doesn't exist:" << source;
        return false;
    }
    if (!sourceInfo.isReadable()) {
        qCCritical(lcFile) << Q_FUNC_INFO << "File is not readable:" << source;
        return false;
    }

    QString target = FileUtility::resolvedPath(filePath, true);
    if (sourceInfo.isDir()) {
        // Copying a folder into itself would never end.
        if (isInside(canonicalOrClean(target), sourceInfo.canonicalFilePath())) {
            qCCritical(lcFile) << Q_FUNC_INFO << "Target is inside the source folder:" << source << "->" << target;
            return false;
        }
        QStringList chain;
        return copyFolder(source, target, &chain);
    }

    if (QFileInfo(target).isDir())
        target = QDir(target).filePath(sourceInfo.fileName());
    if (QFileInfo::exists(target) || QFileInfo(target).isSymLink()) {
        qCCritical(lcFile) << Q_FUNC_INFO << "Target file already exists:" << target;
        return false;
    }
    if (!QFile::copy(source, target)) {
        qCWarning(lcFile) << Q_FUNC_INFO << "Copy failed:" << source << "->" << target;
        return false;
    }
    return true;
}

bool FileFolder::copyFolder(const QString &source, const QString &target, QStringList *chain)
{
    const QFileInfo sourceInfo(source);
    if (!sourceInfo.isDir()) {
        // Sockets, fifos, devices and dangling links hold nothing to copy,
        // and opening a fifo would block.
        if (!sourceInfo.isFile()) {
            qCWarning(lcFile) << Q_FUNC_INFO << "Skipping what is not a regular file:" << source;
            return true;
        }
        if (!QFile::copy(source, target)) {
            qCWarning(lcFile) << Q_FUNC_INFO << "copyFile failed:" << source << "->" << target;
            return false;
        }
        return true;
    }

    const QString canonical = sourceInfo.canonicalFilePath();
    if (chain->contains(canonical)) {
        qCCritical(lcFile) << Q_FUNC_INFO << "Folder links back to itself:" << source;
        return false;
    }

    if (!QDir(target).exists() && !QDir().mkpath(target)) {
        qCCritical(lcFile) << Q_FUNC_INFO << "mkpath failed:" << target;
        return false;
    }

    chain->append(canonical);
    const QStringList entries = QDir(source).entryList(kCopyFilter);
    bool copied = true;
    for (const QString &entry : entries) {
        if (!copyFolder(QDir(source).filePath(entry), QDir(target).filePath(entry), chain)) {
            copied = false;
            break;
        }
    }
    chain->removeLast();
    return copied;
}

File *FileFolder::file(const QString &fileName)
{
    auto *object = new File(filePath(fileName));
    QQmlEngine::setObjectOwnership(object, QQmlEngine::JavaScriptOwnership);
    return object;
}

FileInfo *FileFolder::fileInfo(const QString &fileName)
{
    auto *object = new FileInfo(filePath(fileName));
    QQmlEngine::setObjectOwnership(object, QQmlEngine::JavaScriptOwnership);
    return object;
}

FileFolder *FileFolder::folder(const QString &folderName)
{
    auto *object = new FileFolder(filePath(folderName));
    QQmlEngine::setObjectOwnership(object, QQmlEngine::JavaScriptOwnership);
    return object;
}

// Reading and writing

QByteArray FileFolder::readFileData(const QString &filePath, bool *ok)
{
    if (ok)
        *ok = false;
    const QFileInfo info(filePath);
    if (!info.exists())
        return QByteArray();
    if (!info.isFile()) {
        qCWarning(lcFile) << Q_FUNC_INFO << "Not a regular file:" << filePath;
        return QByteArray();
    }
    QFile file(filePath);
    if (!file.open(QIODevice::ReadOnly)) {
        qCWarning(lcFile) << Q_FUNC_INFO << "Error opening" << filePath << file.errorString();
        return QByteArray();
    }
    const QByteArray data = file.readAll();
    if (ok)
        *ok = file.error() == QFileDevice::NoError;
    return data;
}

bool FileFolder::writeFileData(const QString &filePath, const QByteArray &data)
{
    QFile file(filePath);
    if (!file.open(QIODevice::WriteOnly | QIODevice::Truncate)) {
        qCWarning(lcFile) << Q_FUNC_INFO << "Error opening" << filePath << file.errorString();
        return false;
    }
    const qint64 written = file.write(data);
    // Close here so that a failure to flush the last block counts.
    file.close();
    if (written < data.size() || file.error() != QFileDevice::NoError) {
        qCWarning(lcFile) << Q_FUNC_INFO << "Error writing" << filePath << file.errorString();
        return false;
    }
    return true;
}

QVariant FileFolder::readFile(const QString &fileName, const QVariantMap &options)
{
    const QByteArray bytes = readFileData(m_dir.filePath(fileName));
    const QString encode = options.value(QStringLiteral("encode")).toString();
    if (encode.compare(QLatin1String("base64"), Qt::CaseInsensitive) == 0)
        return bytes.toBase64();
    if (encode.compare(QLatin1String("hex"), Qt::CaseInsensitive) == 0)
        return bytes.toHex();
    return bytes;
}

QVariant FileFolder::readFile(const QString &fileName)
{
    return readFile(fileName, QVariantMap());
}

bool FileFolder::writeDevice(const QString &filePath, QIODevice *device) const
{
    // Truncating the target first would destroy a source that is that file.
    if (auto *sourceFile = qobject_cast<QFile *>(device)) {
        const QString sourcePath = QFileInfo(sourceFile->fileName()).canonicalFilePath();
        if (!sourcePath.isEmpty() && sourcePath == QFileInfo(filePath).canonicalFilePath()) {
            qCWarning(lcFile) << Q_FUNC_INFO << "Source and target are the same file:" << filePath;
            return false;
        }
    }

    const bool wasOpen = device->isOpen();
    if (!wasOpen && !device->open(QIODevice::ReadOnly)) {
        qCWarning(lcFile) << Q_FUNC_INFO << "Unable to open the source:" << device->errorString();
        return false;
    }
    if (!device->isReadable()) {
        qCWarning(lcFile) << Q_FUNC_INFO << "Source is not readable";
        return false;
    }

    QFile target(filePath);
    if (!target.open(QIODevice::WriteOnly | QIODevice::Truncate)) {
        qCWarning(lcFile) << Q_FUNC_INFO << "Error opening" << filePath << target.errorString();
        if (!wasOpen)
            device->close();
        return false;
    }

    QByteArray buffer(int(kCopyBlockSize), Qt::Uninitialized);
    bool copied = true;
    for (;;) {
        const qint64 count = device->read(buffer.data(), kCopyBlockSize);
        if (count < 0) {
            copied = false;
            break;
        }
        if (count == 0)
            break;
        if (target.write(buffer.constData(), count) < count) {
            copied = false;
            break;
        }
    }
    target.close();
    copied = copied && target.error() == QFileDevice::NoError;
    if (!copied)
        qCWarning(lcFile) << Q_FUNC_INFO << "Error copying to" << filePath << target.errorString();
    if (!wasOpen)
        device->close();
    return copied;
}

bool FileFolder::writeFile(const QString &fileName, const QVariant &content, const QVariantMap &options)
{
    if (!checkReadOnly(Q_FUNC_INFO))
        return false;
    const QString path = m_dir.filePath(fileName);

    if (content.canConvert<QObject *>()) {
        QObject *object = content.value<QObject *>();
        QIODevice *device = qobject_cast<QIODevice *>(object);
        if (auto *file = qobject_cast<File *>(object))
            device = file->device();
        if (device)
            return writeDevice(path, device);
    }

    QByteArray bytes;
    const QString decode = options.value(QStringLiteral("decode")).toString();
    if (decode.compare(QLatin1String("base64"), Qt::CaseInsensitive) == 0) {
        bytes = QByteArray::fromBase64(content.toString().toLatin1());
    } else if (decode.compare(QLatin1String("hex"), Qt::CaseInsensitive) == 0) {
        bytes = QByteArray::fromHex(content.toString().toLatin1());
    } else {
        // Content that has no bytes (an object, a list) must not empty the file.
        if (content.isValid() && !content.isNull() && !content.canConvert<QByteArray>()) {
            qCWarning(lcFile) << Q_FUNC_INFO << "Unsupported content:" << content.typeName();
            return false;
        }
        bytes = content.toByteArray();
    }
    return writeFileData(path, bytes);
}

bool FileFolder::writeFile(const QString &fileName, const QVariant &content)
{
    return writeFile(fileName, content, QVariantMap());
}

QVariantMap FileFolder::readJsonFile(const QString &fileName)
{
    return JsonUtility::toVariantMap(readFileData(m_dir.filePath(fileName)), false);
}

bool FileFolder::writeJsonFile(const QString &fileName, const QVariantMap &json)
{
    if (!checkReadOnly(Q_FUNC_INFO))
        return false;
    return writeFileData(m_dir.filePath(fileName), JsonUtility::toJson(json));
}

QString FileFolder::readTextFile(const QString &fileName)
{
    const QByteArray bytes = readFileData(m_dir.filePath(fileName));
    if (bytes.isEmpty())
        return QString();
    return QString::fromUtf8(bytes);
}

bool FileFolder::writeTextFile(const QString &fileName, const QString &text)
{
    if (!checkReadOnly(Q_FUNC_INFO))
        return false;
    return writeFileData(m_dir.filePath(fileName), text.toUtf8());
}

void FileFolder::refresh()
{
    m_dir.refresh();
    m_size = -1;
    emit existsChanged();
    emit sizeChanged();
}

// Trash

QVariant FileFolder::moveFileToTrash(const QString &fileName)
{
    const QUrl url(fileName);
    const QString name = url.isLocalFile() ? FileUtility::resolvedPath(url, true) : fileName;
    const QString path = m_dir.filePath(name);

    if (!QFileInfo::exists(path) && !QFileInfo(path).isSymLink()) {
        qCDebug(lcFile) << Q_FUNC_INFO << "File does not exist..." << path;
        emit movedFileToTrash(fileName, QVariant(), QStringLiteral("File does not exist."));
        return QVariant();
    }

    QString pathInTrash;
    if (!QFile::moveToTrash(path, &pathInTrash)) {
        qCWarning(lcFile) << Q_FUNC_INFO << "Unable to move file to trash:" << path;
        emit movedFileToTrash(fileName, QVariant(), QStringLiteral("Unable to move file to trash."));
        return QVariant();
    }
    emit movedFileToTrash(fileName, pathInTrash, QString());
    return pathInTrash;
}

void FileFolder::moveFileToTrashAsync(const QString &fileName)
{
    auto *worker = new FileFolderWorker(this, QVariantList { QStringLiteral("moveFileToTrash"), fileName });
    auto *thread = new QThread(this);
    connect(thread, &QThread::started, worker, &FileFolderWorker::process);
    connect(worker, &FileFolderWorker::finished, thread, &QThread::quit, Qt::DirectConnection);
    connect(thread, &QThread::finished, worker, &QObject::deleteLater);
    connect(thread, &QThread::finished, thread, &QObject::deleteLater);
    worker->moveToThread(thread);
    thread->start(QThread::InheritPriority);
}

QString FileFolder::toNativeSeparators(const QString &pathName) const
{
    return QDir::toNativeSeparators(pathName);
}

QString FileFolder::fromNativeSeparators(const QString &pathName) const
{
    return QDir::fromNativeSeparators(pathName);
}
