#include "ZipWriter.h"
#include "FileUtility.h"
#include "LoomkitLogging.h"
#include "ZipEntryStream.h"

#include <QDateTime>
#include <QDir>
#include <QFile>
#include <QFileInfo>

#include <cstring>

ZipWriter::ZipWriter(QObject *parent)
    : LoomkitObject(parent)
{
}

ZipWriter::~ZipWriter()
{
    zwClose();
}

void ZipWriter::setPath(const QString &path)
{
    const QString resolved = FileUtility::resolvedPath(path);
    if (resolved == m_path)
        return;
    m_path = resolved;
    zwClose();
    emit pathChanged();
}

void ZipWriter::close()
{
    zwClose();
}

bool ZipWriter::addFile(const QString &filePath, const QString &archivedFilePath, const QString &comment, bool append)
{
    if (!m_zipFile && !zwOpen(m_path, append)) {
        qCDebug(lcFile) << Q_FUNC_INFO << "ZIP not open" << m_path << append;
        return false;
    }
    const bool added = zwAddFile(filePath, archivedFilePath, comment, true);
    zwClose();
    if (added)
        emit pathChanged();
    return added;
}

bool ZipWriter::addFile(const QString &filePath, const QString &archivedFilePath, const QString &comment)
{
    return addFile(filePath, archivedFilePath, comment, true);
}

bool ZipWriter::addFile(const QString &filePath, const QString &archivedFilePath)
{
    return addFile(filePath, archivedFilePath, QString(), true);
}

bool ZipWriter::addFile(const QString &filePath)
{
    return addFile(filePath, QString(), QString(), true);
}

bool ZipWriter::zwOpen(const QString &path, bool append)
{
    zwClose();
    const int mode = append && QFileInfo::exists(path) ? APPEND_STATUS_ADDINZIP : APPEND_STATUS_CREATE;
    m_zipFile = zipOpen64(path.toUtf8().constData(), mode);
    return m_zipFile != nullptr;
}

void ZipWriter::zwClose()
{
    if (m_zipFile) {
        // An empty comment, not a null one, so an old archive comment goes.
        zipClose(m_zipFile, "");
        m_zipFile = nullptr;
    }
}

bool ZipWriter::zwAddFile(const QString &filePath, const QString &archivedFilePath, const QString &comment,
                          bool cleanPath)
{
    if (!m_zipFile)
        return false;
    const QFileInfo fileInfo(filePath);
    if (!fileInfo.exists()) {
        qCCritical(lcFile) << Q_FUNC_INFO << "File not found:" << filePath;
        return false;
    }
    QFile file(filePath);
    if (!file.open(QIODevice::ReadOnly | QIODevice::Unbuffered)) {
        qCCritical(lcFile) << Q_FUNC_INFO << "Error opening:" << filePath;
        return false;
    }

    QString name = archivedFilePath.isEmpty() ? fileInfo.fileName() : archivedFilePath;
    if (cleanPath)
        name = QDir::cleanPath(name);
    name.replace(QLatin1Char('\\'), QLatin1Char('/'));

    // The day is stored one earlier; ZipReader adds it back.
    const QDateTime modified = fileInfo.lastModified().toLocalTime();
    zip_fileinfo zipInfo;
    std::memset(&zipInfo, 0, sizeof(zipInfo));
    zipInfo.tmz_date.tm_sec = uInt(modified.time().second());
    zipInfo.tmz_date.tm_min = uInt(modified.time().minute());
    zipInfo.tmz_date.tm_hour = uInt(modified.time().hour());
    zipInfo.tmz_date.tm_mday = uInt(modified.date().day() - 1);
    zipInfo.tmz_date.tm_mon = uInt(modified.date().month() - 1);
    zipInfo.tmz_date.tm_year = uInt(modified.date().year());

    const int result = zipOpenNewFileInZip64(m_zipFile, name.toUtf8().constData(), &zipInfo, nullptr, 0, nullptr,
                                             0, comment.toUtf8().constData(), Z_DEFLATED, Z_DEFAULT_COMPRESSION, 0);
    if (result != ZIP_OK) {
        qCDebug(lcFile) << Q_FUNC_INFO << "Error %d zipOpenNewFileInZip64\n";
        return false;
    }

    if (m_buffer.size() != ZipEntryStream::ChunkSize)
        m_buffer.resize(ZipEntryStream::ChunkSize);
    char *data = m_buffer.data();
    for (;;) {
        const qint64 read = file.read(data, m_buffer.size());
        if (read < 0) {
            qCDebug(lcFile) << Q_FUNC_INFO << QStringLiteral("Error reading input file:%1").arg(read);
            zipCloseFileInZip(m_zipFile);
            return false;
        }
        if (read == 0)
            break;
        if (zipWriteInFileInZip(m_zipFile, data, unsigned(read)) != ZIP_OK) {
            qCDebug(lcFile) << Q_FUNC_INFO << "Error %d with zipfile in zipWriteInFileInZip\n";
            zipCloseFileInZip(m_zipFile);
            return false;
        }
    }
    file.close();
    zipCloseFileInZip(m_zipFile);
    return true;
}
