#include "NetworkFilePart.h"

NetworkFilePart::NetworkFilePart(QIODevice *file, qint64 offset, qint64 size, QObject *parent)
    : QIODevice(parent)
    , m_file(file)
    // A negative offset would make the window start before the file.
    , m_offset(qMax<qint64>(0, offset))
    , m_size(size)
{
    // Unbuffered: the file below buffers already, and reads pass straight on.
    open(QIODevice::ReadOnly | QIODevice::Unbuffered);
    if (m_file && m_offset > 0)
        m_file->seek(m_offset);
}

bool NetworkFilePart::isSequential() const
{
    return false;
}

qint64 NetworkFilePart::pos() const
{
    return m_file ? m_file->pos() - m_offset : 0;
}

qint64 NetworkFilePart::size() const
{
    if (!m_file)
        return 0;
    const qint64 fileSize = m_file->size();
    if (m_offset >= fileSize)
        return 0;
    const qint64 available = fileSize - m_offset;
    if (m_size == -1)
        return available;
    return qBound<qint64>(0, m_size, available);
}

qint64 NetworkFilePart::end() const
{
    const qint64 fileSize = m_file->size();
    const qint64 wanted = m_size == -1 ? fileSize : m_offset + qMax<qint64>(0, m_size);
    return qMin(wanted, fileSize);
}

bool NetworkFilePart::seek(qint64 position)
{
    // Rewinding must move the file too, or a re-sent body would be empty.
    if (!m_file || position < 0)
        return false;
    if (!m_file->seek(m_offset + position))
        return false;
    return QIODevice::seek(position);
}

qint64 NetworkFilePart::readData(char *data, qint64 maxlen)
{
    if (!m_file)
        return 0;
    const qint64 count = qMin(end() - m_file->pos(), maxlen);
    if (count < 1)
        return 0;
    const qint64 read = m_file->read(data, count);
    return read < 0 ? 0 : read;
}

qint64 NetworkFilePart::writeData(const char *data, qint64 len)
{
    Q_UNUSED(data)
    Q_UNUSED(len)
    return 0;
}
