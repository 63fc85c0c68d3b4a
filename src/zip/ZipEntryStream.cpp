#include "ZipEntryStream.h"
#include "LoomkitLogging.h"

#include <QDate>
#include <QTime>

#include <cerrno>
#include <cstring>
#include <fcntl.h>
#include <unistd.h>

int ZipEntryStream::currentEntry(unzFile zip, QByteArray *name, unz_file_info64 *info)
{
    // The library fills the buffer without a terminating NUL when the name
    // is as long as the buffer or longer; keep one byte for it.
    char buffer[NameBufferSize + 1];
    const int result = unzGetCurrentFileInfo64(zip, info, buffer, NameBufferSize, nullptr, 0, nullptr, 0);
    buffer[NameBufferSize] = '\0';
    if (result != UNZ_OK) {
        // What a failed call leaves is undefined; only its first name bytes
        // up to a NUL are kept.
        const uLong length = info->size_filename < uLong(NameBufferSize) ? info->size_filename : NameBufferSize;
        buffer[length] = '\0';
    } else if (info->size_filename < uLong(NameBufferSize)) {
        buffer[info->size_filename] = '\0';
    }
    *name = QByteArray(buffer, int(qstrnlen(buffer, NameBufferSize)));
    return result;
}

QDateTime ZipEntryStream::dateTime(const tm_unz &date)
{
    return QDateTime(QDate(int(date.tm_year), int(date.tm_mon) + 1, int(date.tm_mday) + 1),
                     QTime(int(date.tm_hour), int(date.tm_min), int(date.tm_sec), 0));
}

bool ZipEntryStream::openOutput(QFile &file, const QString &path, bool noFollow)
{
    if (!noFollow) {
        file.setFileName(path);
        return file.open(QIODevice::WriteOnly | QIODevice::Truncate | QIODevice::Unbuffered);
    }

    const int flags = O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC | O_NOFOLLOW;
    const QByteArray native = QFile::encodeName(path);
    int fd;
    do {
        fd = ::open(native.constData(), flags, 0666);
    } while (fd < 0 && errno == EINTR);
    if (fd < 0)
        return false;
    if (!file.open(fd, QIODevice::WriteOnly | QIODevice::Unbuffered, QFileDevice::AutoCloseHandle)) {
        ::close(fd);
        return false;
    }
    return true;
}

void ZipEntryStream::reportShortWrite(const QFile &file)
{
    qCCritical(lcFile) << Q_FUNC_INFO << "Short write:" << file.fileName() << file.errorString();
}
