#include "NetworkFormData.h"
#include "LoomkitLogging.h"
#include "NetworkFilePart.h"

#include <QBuffer>
#include <QFile>

NetworkFormData::NetworkFormData(QObject *parent)
    : QIODevice(parent)
{
    // Unbuffered: the network asks for the sizes it wants, and gets them
    // straight from the devices below without another copy.
    open(QIODevice::ReadOnly | QIODevice::Unbuffered);
}

NetworkFormData::~NetworkFormData()
{
    clear();
}

bool NetworkFormData::appendData(const QByteArray &data)
{
    auto *bytes = new QByteArray(data);
    auto *buffer = new QBuffer(bytes);
    buffer->open(QIODevice::ReadOnly);
    m_byteArrays.append(bytes);
    m_buffers.append(buffer);
    m_sequence.append(buffer);
    emit readyRead();
    return true;
}

bool NetworkFormData::appendPath(const QString &path, qint64 offset, qint64 size)
{
    auto *file = new QFile(path);
    if (!file->open(QIODevice::ReadOnly)) {
        qCDebug(lcNetwork) << Q_FUNC_INFO << "Cannot open" << path << file->errorString();
        delete file;
        return false;
    }
    m_files.append(file);
    if (offset != 0 || size != -1) {
        auto *part = new NetworkFilePart(file, offset, size);
        m_fileParts.append(part);
        m_sequence.append(part);
    } else {
        m_sequence.append(file);
    }
    emit readyRead();
    return true;
}

void NetworkFormData::clear()
{
    for (QIODevice *device : qAsConst(m_sequence))
        device->close();
    qDeleteAll(m_fileParts);
    qDeleteAll(m_files);
    qDeleteAll(m_buffers);
    qDeleteAll(m_byteArrays);
    m_sequence.clear();
    m_fileParts.clear();
    m_files.clear();
    m_buffers.clear();
    m_byteArrays.clear();
    m_currentIndex = 0;
    m_bytesRead = 0;
    QIODevice::seek(0);
}

bool NetworkFormData::isAborted() const
{
    return m_aborted;
}

void NetworkFormData::setAborted(bool aborted)
{
    m_aborted = aborted;
}

bool NetworkFormData::isSequential() const
{
    return false;
}

qint64 NetworkFormData::pos() const
{
    return m_bytesRead;
}

qint64 NetworkFormData::size() const
{
    qint64 total = 0;
    for (QIODevice *device : m_sequence)
        total += device->size();
    return total;
}

bool NetworkFormData::seek(qint64 position)
{
    if (position < m_bytesRead) {
        m_currentIndex = 0;
        m_bytesRead = 0;
        for (QIODevice *device : qAsConst(m_sequence))
            device->seek(0);
    }
    if (position > m_bytesRead)
        readData(nullptr, position - m_bytesRead);
    // Keep QIODevice's own idea of the position in step with ours.
    QIODevice::seek(m_bytesRead);
    return true;
}

void NetworkFormData::emitProgress(qint64 total)
{
    emit readProgress(total < 1 ? 0.0 : double(m_bytesRead) / double(total));
}

qint64 NetworkFormData::readData(char *data, qint64 maxlen)
{
    if (m_aborted || m_currentIndex >= m_sequence.size()) {
        emit readProgress(1.0);
        return 0;
    }

    const qint64 total = size();
    qint64 result = 0;
    while (maxlen > 0 && m_currentIndex < m_sequence.size()) {
        QIODevice *device = m_sequence.at(int(m_currentIndex));
        // A null destination skips: seek forward instead of reading.
        qint64 count = data ? device->read(data, maxlen) : device->skip(maxlen);
        if (count > 0) {
            if (data)
                data += count;
            m_bytesRead += count;
            result += count;
            maxlen -= count;
        }
        emitProgress(total);
        // A device that gives nothing (a file cut short under us) counts
        // as ended, so that the body never waits for bytes that cannot come.
        if (count <= 0 || device->atEnd())
            ++m_currentIndex;
    }
    emitProgress(total);
    return result;
}

qint64 NetworkFormData::writeData(const char *data, qint64 len)
{
    Q_UNUSED(data)
    Q_UNUSED(len)
    return 0;
}
