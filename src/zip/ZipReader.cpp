#include "ZipReader.h"
#include "FileUtility.h"
#include "JsonUtility.h"
#include "LoomkitLogging.h"
#include "ZipEntryStream.h"
#include "ZipExtractTarget.h"
#include "ZipFileInfo.h"

#include <QFileInfo>
#include <QSet>

#include <cstring>
#include <sys/stat.h>

namespace {

// minizip's rule numbers for unzLocateFile: 1 compares exactly, 2 without
// regard to case. 0 would mean "the platform's default", exact on Linux.
constexpr int CaseSensitiveCompare = 1;
constexpr int CaseInsensitiveCompare = 2;

// readFile holds a whole entry in memory, and script turns it into text:
// refuse what cannot be sensible.
constexpr ZPOS64_T MaxReadSize = ZPOS64_T(256) << 20;

QString entryName(const QByteArray &raw)
{
    QString name = QString::fromUtf8(raw);
    name.replace(QLatin1Char('\\'), QLatin1Char('/'));
    return name;
}

bool isLink(const QString &path)
{
    struct stat st;
    return ::lstat(QFile::encodeName(path).constData(), &st) == 0 && S_ISLNK(st.st_mode);
}

} // namespace

ZipReader::ZipReader(QObject *parent)
    : LoomkitObject(parent)
    , m_bufferSize(ZipEntryStream::ChunkSize)
{
}

ZipReader::~ZipReader()
{
    closeHandle();
}

void ZipReader::setPath(const QString &path)
{
    const QString resolved = FileUtility::resolvedPath(path);
    if (resolved == m_path)
        return;
    m_path = resolved;
    closeHandle();
    emit pathChanged();
    emit fileNamesChanged();
    emit folderNamesChanged();
}

void ZipReader::setCaseSensitive(bool caseSensitive)
{
    if (caseSensitive == m_caseSensitive)
        return;
    m_caseSensitive = caseSensitive;
    emit caseSensitiveChanged();
}

QStringList ZipReader::fileNames()
{
    return names(ListFiles);
}

QStringList ZipReader::folderNames()
{
    return names(ListFolders);
}

void ZipReader::close()
{
    closeHandle();
}

void ZipReader::closeHandle()
{
    if (m_zipFile) {
        unzClose(m_zipFile);
        m_zipFile = nullptr;
    }
}

bool ZipReader::zrOpen()
{
    if (m_zipFile)
        return true;
    if (m_path.isEmpty() || !QFileInfo(m_path).exists())
        return false;
    m_zipFile = unzOpen64(m_path.toUtf8().constData());
    if (!m_zipFile) {
        qCWarning(lcFile) << Q_FUNC_INFO << "Unable to open:" << m_path;
        return false;
    }
    return true;
}

int ZipReader::locateSensitivity() const
{
    return m_caseSensitive ? CaseSensitiveCompare : CaseInsensitiveCompare;
}

bool ZipReader::gotoFirstFile()
{
    if (!m_zipFile)
        return false;
    unz_global_info64 globalInfo;
    int result = unzGetGlobalInfo64(m_zipFile, &globalInfo);
    if (result != UNZ_OK) {
        qCCritical(lcFile) << Q_FUNC_INFO << "Error %d with zipfile in unzGetGlobalInfo \n";
        return false;
    }
    result = unzGoToFirstFile(m_zipFile);
    if (result != UNZ_OK) {
        qCCritical(lcFile) << Q_FUNC_INFO << "Error %d with zipfile in unzGoToFirstFile \n";
        return false;
    }
    return true;
}

bool ZipReader::gotoNextFile()
{
    if (!m_zipFile)
        return false;
    const int result = unzGoToNextFile(m_zipFile);
    if (result == UNZ_OK)
        return true;
    if (result != UNZ_END_OF_LIST_OF_FILE)
        qCCritical(lcFile) << Q_FUNC_INFO << "Error %d with zipfile in unzGoToNextFile \n";
    return false;
}

bool ZipReader::locateFile(const QString &fileName, int caseSensitivity)
{
    if (!m_zipFile || unzLocateFile(m_zipFile, fileName.toUtf8().constData(), caseSensitivity) != UNZ_OK) {
        qCDebug(lcFile) << Q_FUNC_INFO << "File not found:" << fileName;
        return false;
    }
    return true;
}

QString ZipReader::currentFileName()
{
    if (!m_zipFile)
        return QString();
    QByteArray raw;
    unz_file_info64 info;
    std::memset(&info, 0, sizeof(info));
    if (ZipEntryStream::currentEntry(m_zipFile, &raw, &info) != UNZ_OK)
        qCCritical(lcFile) << Q_FUNC_INFO << "Error %d with zipfile in unzGetCurrentFileInfo \n";
    return entryName(raw);
}

QDateTime ZipReader::currentFileDateTime()
{
    if (!m_zipFile)
        return QDateTime();
    return ZipEntryStream::dateTime(currentFileInfo().tmu_date);
}

unz_file_info64 ZipReader::currentFileInfo()
{
    unz_file_info64 info;
    std::memset(&info, 0, sizeof(info));
    if (!m_zipFile || unzGetCurrentFileInfo64(m_zipFile, &info, nullptr, 0, nullptr, 0, nullptr, 0) != UNZ_OK)
        qCCritical(lcFile) << Q_FUNC_INFO << "Error %d with zipfile in unzGetCurrentFileInfo \n";
    return info;
}

QStringList ZipReader::names(int flags)
{
    QStringList list;
    if (!zrOpen()) {
        qCWarning(lcFile) << Q_FUNC_INFO << "ZIP not open" << m_path;
        return list;
    }
    if (!gotoFirstFile())
        return list;

    // The folder list keeps its first spelling of each folder; the set makes
    // the duplicate check constant time.
    QSet<QString> seen;
    do {
        const QString name = currentFileName();
        const bool isFolder = name.endsWith(QLatin1Char('/'));
        if (flags & ListFolders) {
            const QString folder = isFolder ? name.left(name.size() - 1) : QFileInfo(name).path();
            const QString key = m_caseSensitive ? folder : folder.toCaseFolded();
            if (!seen.contains(key)) {
                seen.insert(key);
                list.append(folder);
            }
        }
        if ((flags & ListFiles) && !isFolder)
            list.append(name);
    } while (gotoNextFile());
    return list;
}

bool ZipReader::exists(const QString &fileName)
{
    if (!zrOpen()) {
        qCWarning(lcFile) << Q_FUNC_INFO << "ZIP not open" << m_path;
        return false;
    }
    return locateFile(fileName, locateSensitivity());
}

ZipFileInfo *ZipReader::fileInfo(const QString &fileName)
{
    if (!zrOpen()) {
        qCWarning(lcFile) << Q_FUNC_INFO << "ZIP not open" << m_path;
        return nullptr;
    }
    if (!locateFile(fileName, locateSensitivity())) {
        qCWarning(lcFile) << Q_FUNC_INFO << "File not found" << fileName;
        return nullptr;
    }
    return new ZipFileInfo(fileName, currentFileInfo());
}

bool ZipReader::extractFile(const QString &fileName, const QString &outputFilePath)
{
    if (!zrOpen()) {
        qCWarning(lcFile) << Q_FUNC_INFO << "ZIP not open" << m_path;
        return false;
    }
    if (!locateFile(fileName, locateSensitivity()) || !extractCurrentFile(outputFilePath)) {
        qCCritical(lcFile) << Q_FUNC_INFO << "Extracting:" << fileName << "->" << outputFilePath;
        return false;
    }
    return true;
}

bool ZipReader::extractAll(const QString &outputPath, const QString &basePath)
{
    if (!zrOpen()) {
        qCWarning(lcFile) << Q_FUNC_INFO << "ZIP not open" << m_path;
        return false;
    }
    QDir dir(outputPath);
    if (!extractAll(dir, basePath)) {
        qCCritical(lcFile) << Q_FUNC_INFO << "outputPath:" << outputPath << "basePath:" << basePath;
        return false;
    }
    return true;
}

bool ZipReader::extractAll(const QString &outputPath)
{
    return extractAll(outputPath, QString());
}

void ZipReader::refresh()
{
    closeHandle();
    emit fileNamesChanged();
    emit folderNamesChanged();
}

QString ZipReader::readTextFile(const QString &fileName)
{
    if (!zrOpen()) {
        qCCritical(lcFile) << Q_FUNC_INFO << "ZIP not open" << m_path;
        return QString();
    }
    if (!locateFile(fileName, locateSensitivity())) {
        qCCritical(lcFile) << Q_FUNC_INFO << "Unable to locate file" << fileName;
        return QString();
    }
    return QString::fromUtf8(readFile());
}

QVariantMap ZipReader::readJsonFile(const QString &fileName)
{
    return JsonUtility::fromString(readTextFile(fileName));
}

bool ZipReader::extractCurrentFile(QString outputFile)
{
    if (!m_zipFile)
        return false;
    QByteArray raw;
    unz_file_info64 info;
    std::memset(&info, 0, sizeof(info));
    const int result = ZipEntryStream::currentEntry(m_zipFile, &raw, &info);
    if (result != UNZ_OK) {
        qCCritical(lcFile) << Q_FUNC_INFO << "unzGetCurrentFileInfo64" << result;
        return false;
    }
    return extractEntry(entryName(raw), info, outputFile, outputFile, false);
}

bool ZipReader::extractEntry(const QString &name, const unz_file_info64 &info, const QString &outputFile,
                             const QString &shownFile, bool noFollow)
{
    int result = unzOpenCurrentFile(m_zipFile);
    if (result != UNZ_OK) {
        qCCritical(lcFile) << Q_FUNC_INFO << "unzOpenCurrentFile" << result;
        return false;
    }

    QFile file;
    if (!ZipEntryStream::openOutput(file, outputFile, noFollow)) {
        unzCloseCurrentFile(m_zipFile);
        if (noFollow && isLink(outputFile)) {
            qCCritical(lcFile) << Q_FUNC_INFO << "Refusing to write through a link:" << name << "->" << outputFile;
            emit error(name, shownFile, ParameterError);
        } else {
            qCCritical(lcFile) << Q_FUNC_INFO << "Error opening:" << outputFile;
        }
        return false;
    }

    const double total = double(info.uncompressed_size);
    result = ZipEntryStream::copyCurrent(m_zipFile, file, m_buffer, [&](qint64 count) {
        emit progress(name, shownFile, double(count) / total * 100.0);
    });
    if (result < 0) {
        qCCritical(lcFile) << Q_FUNC_INFO << "unzReadCurrentFile error:" << result << "Extracting:" << name
                           << " to " << outputFile << "Buffer size:" << m_bufferSize;
        unzCloseCurrentFile(m_zipFile);
        emit error(name, shownFile, Result(result));
        return false;
    }

    file.close();
    // The library checks the entry's checksum only here, when the entry closes.
    const int closed = unzCloseCurrentFile(m_zipFile);
    const QDateTime modified = ZipEntryStream::dateTime(info.tmu_date);
    FileUtility::setDateTime(outputFile, modified, modified);
    if (closed == UNZ_CRCERROR) {
        qCCritical(lcFile) << Q_FUNC_INFO << "Checksum mismatch:" << name << "->" << outputFile;
        emit error(name, shownFile, CrcError);
        return false;
    }
    emit progress(name, shownFile, 100.0);
    return true;
}

bool ZipReader::extractAll(QDir &dir, const QString &basePath)
{
    QString base = QDir::cleanPath(basePath);
    if (!base.isEmpty() && !base.endsWith(QLatin1Char('/')))
        base.append(QLatin1Char('/'));
    const Qt::CaseSensitivity sensitivity = m_caseSensitive ? Qt::CaseSensitive : Qt::CaseInsensitive;
    ZipExtractTarget guard(dir);

    if (gotoFirstFile()) {
        do {
            QByteArray raw;
            unz_file_info64 info;
            std::memset(&info, 0, sizeof(info));
            if (ZipEntryStream::currentEntry(m_zipFile, &raw, &info) != UNZ_OK)
                qCCritical(lcFile) << Q_FUNC_INFO << "Error %d with zipfile in unzGetCurrentFileInfo \n";
            const QString current = entryName(raw);
            const bool isFolder = current.endsWith(QLatin1Char('/'));
            QString name = QDir::cleanPath(current);
            if (!basePath.isEmpty()) {
                const QString folder = QFileInfo(name).path() + QLatin1Char('/');
                if (!folder.startsWith(base, sensitivity))
                    continue;
                name.remove(0, base.size());
            }
            if (name.isEmpty())
                continue;

            const QString target = dir.filePath(name);
            const QString safeTarget = guard.target(name, isFolder);
            bool refused = safeTarget.isNull();
            if (!refused) {
                const QString folder = isFolder ? safeTarget : QFileInfo(safeTarget).path();
                if (!guard.makeFolder(folder, &refused) && !refused) {
                    if (isFolder)
                        qCCritical(lcFile) << Q_FUNC_INFO << "Unable to create dir:" << target;
                    else
                        qCCritical(lcFile) << Q_FUNC_INFO << "Unable to create path:" << QFileInfo(target).path();
                    continue;
                }
            }
            if (refused) {
                qCCritical(lcFile) << Q_FUNC_INFO << "Refusing entry outside the output folder:" << current << "->"
                                   << target;
                emit error(current, target, ParameterError);
                continue;
            }
            if (!isFolder)
                extractEntry(current, info, safeTarget, target, true);
        } while (gotoNextFile());
    }

    emit completed();
    return true;
}

QByteArray ZipReader::readFile()
{
    int result = unzOpenCurrentFile(m_zipFile);
    if (result != UNZ_OK) {
        qCCritical(lcFile) << Q_FUNC_INFO << "unzOpenCurrentFile" << result;
        return QByteArray();
    }
    QByteArray raw;
    unz_file_info64 info;
    std::memset(&info, 0, sizeof(info));
    result = ZipEntryStream::currentEntry(m_zipFile, &raw, &info);
    if (result != UNZ_OK) {
        qCCritical(lcFile) << Q_FUNC_INFO << "unzGetCurrentFileInfo64" << result;
        return QByteArray();
    }
    // Read by chunks rather than trusting the declared size: a header can
    // claim far more than the entry holds (Debian's minizip also leaves the
    // Zip64 marker 0xffffffff in place of a size it does not parse).
    // The first chunk is one byte more than declared, so that an honest
    // entry is read in one call and its end seen in the next.
    const ZPOS64_T declared = info.uncompressed_size;
    QByteArray data;
    qint64 total = 0;
    qint64 chunk = qint64(qMin<ZPOS64_T>(declared + 1, ZipEntryStream::ChunkSize));
    for (;; chunk = ZipEntryStream::ChunkSize) {
        const qint64 room = qMin<qint64>(qint64(MaxReadSize) - total, chunk);
        if (room <= 0) {
            qCCritical(lcFile) << Q_FUNC_INFO << "Entry too large to read into memory:" << entryName(raw)
                               << "Size:" << declared;
            unzCloseCurrentFile(m_zipFile);
            return QByteArray();
        }
        data.resize(int(total + room));
        result = unzReadCurrentFile(m_zipFile, data.data() + total, unsigned(room));
        if (result < 0) {
            qCCritical(lcFile) << Q_FUNC_INFO << "unzReadCurrentFile error:" << result << "Extracting:"
                               << entryName(raw) << "Size:" << declared;
            unzCloseCurrentFile(m_zipFile);
            return QByteArray();
        }
        total += result;
        if (result == 0)
            break;
    }
    unzCloseCurrentFile(m_zipFile);
    // A damaged entry that holds less than it declares gives what it holds:
    // padding it to the declared size would let a header ask for memory.
    data.resize(int(total));
    return data;
}
