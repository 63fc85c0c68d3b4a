#include "UnZipFile.h"
#include "FileUtility.h"
#include "LoomkitLogging.h"
#include "ZipEntryStream.h"
#include "ZipExtractTarget.h"

#include <QFileInfo>

#include <cstring>

UnZipFile::UnZipFile(QObject *parent)
    : QObject(parent)
{
}

UnZipFile::~UnZipFile()
{
    close();
}

bool UnZipFile::open(const QString &path)
{
    close();
    m_zipFile = unzOpen64(path.toUtf8().constData());
    return m_zipFile != nullptr;
}

void UnZipFile::close()
{
    if (m_zipFile) {
        unzClose(m_zipFile);
        m_zipFile = nullptr;
    }
}

bool UnZipFile::gotoFirstFile()
{
    if (!m_zipFile)
        return false;
    unz_global_info64 globalInfo;
    if (unzGetGlobalInfo64(m_zipFile, &globalInfo) != UNZ_OK) {
        qCDebug(lcFile) << "UnZipFile:Error %d with zipfile in unzGetGlobalInfo \n";
        return false;
    }
    if (unzGoToFirstFile(m_zipFile) != UNZ_OK) {
        qCDebug(lcFile) << "UnZipFile::Error %d with zipfile in unzGoToFirstFile \n";
        return false;
    }
    return true;
}

bool UnZipFile::gotoNextFile()
{
    if (!m_zipFile)
        return false;
    const int result = unzGoToNextFile(m_zipFile);
    if (result == UNZ_OK)
        return true;
    if (result != UNZ_END_OF_LIST_OF_FILE)
        qCCritical(lcFile) << "UnZipFile::Error %d with zipfile in unzGoToNextFile \n";
    return false;
}

QString UnZipFile::currentFileName()
{
    if (!m_zipFile)
        return QString();
    QByteArray raw;
    unz_file_info64 info;
    std::memset(&info, 0, sizeof(info));
    if (ZipEntryStream::currentEntry(m_zipFile, &raw, &info) != UNZ_OK)
        qCDebug(lcFile) << "UnZipFile::Error %d with zipfile in unzGetCurrentFileInfo \n";
    return QString::fromUtf8(raw);
}

QDateTime UnZipFile::currentFileDateTime()
{
    if (!m_zipFile)
        return QDateTime();
    unz_file_info64 info;
    std::memset(&info, 0, sizeof(info));
    if (unzGetCurrentFileInfo64(m_zipFile, &info, nullptr, 0, nullptr, 0, nullptr, 0) != UNZ_OK)
        qCDebug(lcFile) << "UnZipFile::Error %d with zipfile in unzGetCurrentFileInfo \n";
    return ZipEntryStream::dateTime(info.tmu_date);
}

QStringList UnZipFile::fileNames()
{
    QStringList names;
    if (gotoFirstFile()) {
        do {
            names.append(currentFileName());
        } while (gotoNextFile());
    }
    return names;
}

bool UnZipFile::extractCurrentFile(const QString &outputFile)
{
    if (!m_zipFile)
        return false;
    QByteArray raw;
    unz_file_info64 info;
    std::memset(&info, 0, sizeof(info));
    const int result = ZipEntryStream::currentEntry(m_zipFile, &raw, &info);
    if (result != UNZ_OK) {
        qCDebug(lcFile) << "UnZipFile::Error %d with zipfile in unzGetCurrentFileInfo \n";
        return false;
    }
    return extractEntry(QString::fromUtf8(raw), info, outputFile, false);
}

bool UnZipFile::extractEntry(const QString &name, const unz_file_info64 &info, const QString &outputFile,
                             bool noFollow)
{
    int result = unzOpenCurrentFile(m_zipFile);
    if (result != UNZ_OK) {
        qCCritical(lcFile) << "UnZipFile::extractCurrentFile: - unzOpenCurrentFile" << result;
        return false;
    }

    QFile file;
    if (!ZipEntryStream::openOutput(file, outputFile, noFollow)) {
        unzCloseCurrentFile(m_zipFile);
        qCCritical(lcFile) << "UnZipFile::extractCurrentFile:Error opening:" << outputFile;
        return false;
    }

    result = ZipEntryStream::copyCurrent(m_zipFile, file, m_buffer, [](qint64) {});
    if (result < 0) {
        qCDebug(lcFile) << "UnZipFile::extractCurrentFile:Extracting:" << name << " to " << outputFile
                        << "Buffer size:" << ZipEntryStream::ChunkSize;
        qCDebug(lcFile) << "UnZipFile::extractCurrentFile - unzReadCurrentFile" << result;
        unzCloseCurrentFile(m_zipFile);
        return false;
    }

    file.close();
    const int closed = unzCloseCurrentFile(m_zipFile);
    const QDateTime modified = ZipEntryStream::dateTime(info.tmu_date);
    FileUtility::setDateTime(outputFile, modified, modified);
    if (closed == UNZ_CRCERROR) {
        qCCritical(lcFile) << "UnZipFile::extractCurrentFile - checksum mismatch:" << name << "->" << outputFile;
        return false;
    }
    return true;
}

bool UnZipFile::extractAll(QDir &dir)
{
    ZipExtractTarget guard(dir);
    if (gotoFirstFile()) {
        do {
            QByteArray raw;
            unz_file_info64 info;
            std::memset(&info, 0, sizeof(info));
            if (ZipEntryStream::currentEntry(m_zipFile, &raw, &info) != UNZ_OK)
                qCDebug(lcFile) << "UnZipFile::Error %d with zipfile in unzGetCurrentFileInfo \n";
            const QString name = QString::fromUtf8(raw);

            // Every entry is taken for a file, with its folder made first; a
            // name ending in "/" then fails to open, its folder made.
            QString target = guard.target(name);
            bool refused = target.isNull();
            if (!refused) {
                const QString folder = QFileInfo(name).path();
                if (!folder.isEmpty() && folder != QLatin1String(".")) {
                    const QString safeFolder = guard.target(folder, true);
                    refused = safeFolder.isNull();
                    if (!refused)
                        guard.makeFolder(safeFolder, &refused);
                }
                if (name.endsWith(QLatin1Char('/')))
                    target.append(QLatin1Char('/'));
            }
            if (refused) {
                qCCritical(lcFile) << "UnZipFile::extractAll: refusing entry outside the output folder:" << name;
                continue;
            }
            extractEntry(name, info, target, true);
        } while (gotoNextFile());
    }
    return true;
}
