#include "JpegMarkers.h"
#include "LoomkitLogging.h"

#include <QIODevice>

namespace {

bool readBigEndian16(QIODevice *device, quint16 *value)
{
    uchar bytes[2];
    if (device->read(reinterpret_cast<char *>(bytes), 2) != 2)
        return false;
    *value = quint16(bytes[0] << 8 | bytes[1]);
    return true;
}

bool writeBigEndian16(QIODevice *device, quint16 value)
{
    const char bytes[2] = {char(value >> 8), char(value)};
    return device->write(bytes, 2) == 2;
}

} // namespace

JpegMarkers::JpegMarkers(QIODevice *device, QObject *parent)
    : QObject(parent)
    , m_device(device)
{
}

bool JpegMarkers::endOfData() const
{
    return m_endOfData;
}

qint64 JpegMarkers::markerOffset() const
{
    return m_markerOffset;
}

JpegMarkers::JpegMarkerType JpegMarkers::markerType() const
{
    return JpegMarkerType(m_markerType);
}

QByteArray JpegMarkers::markerData() const
{
    return m_markerData;
}

qint64 JpegMarkers::markerSize() const
{
    if (!m_device || m_endOfData)
        return 0;
    if (hasNoPayload(m_markerType))
        return 2;
    return m_markerData.size() + 2;
}

bool JpegMarkers::first()
{
    if (!m_device) {
        raiseError(tr("Not opened"));
        return false;
    }
    m_device->reset();
    if (!readMarker()) {
        raiseError(tr("No JPEG content"));
        return false;
    }
    if (m_markerType != JpegMarkerSOI) {
        raiseError(tr("No JPEG SOI marker"));
        setEndState();
        return false;
    }
    return true;
}

bool JpegMarkers::next()
{
    if (!m_device) {
        raiseError(tr("Not opened"));
        return false;
    }
    if (m_endOfData)
        return false;
    // The entropy-coded data after Start of Scan is not walked.
    if (m_markerType == JpegMarkerSOS) {
        setEndState();
        return false;
    }
    return readMarker();
}

bool JpegMarkers::write(JpegMarkerType type, const QByteArray &data)
{
    if (!m_device)
        return false;
    setMarkerOffset(m_device->pos());
    if (!writeBigEndian16(m_device, type))
        return false;
    setMarkerType(type);
    if (hasNoPayload(type))
        return true;
    const bool written = writeBigEndian16(m_device, quint16(data.size() + 2))
                         && m_device->write(data) == data.size();
    setMarkerData(data);
    return written;
}

void JpegMarkers::raiseError(const QString &message)
{
    qCDebug(lcFile).noquote() << Q_FUNC_INFO << message;
}

bool JpegMarkers::readMarker()
{
    if (!m_device) {
        raiseError(tr("Not opened"));
        setEndState();
        return false;
    }
    setMarkerOffset(m_device->pos());

    quint16 type = 0;
    if (!readBigEndian16(m_device, &type)) {
        raiseError(tr("No JPEG marker"));
        setEndState();
        return false;
    }

    QByteArray data;
    if (!hasNoPayload(type)) {
        quint16 length = 0;
        if (!readBigEndian16(m_device, &length)) {
            raiseError(tr("No JPEG payload"));
            setEndState();
            return false;
        }
        // A length below 2 gives no data and the walk goes on from here. A
        // short read keeps what came; the buffer never outgrows the device.
        qint64 wanted = qint64(length) - 2;
        if (!m_device->isSequential())
            wanted = qMin(wanted, m_device->size() - m_device->pos());
        if (wanted > 0)
            data = m_device->read(wanted);
    }

    setMarkerType(type);
    setEndOfData(false);
    setMarkerData(data);
    return true;
}

void JpegMarkers::setEndState()
{
    setMarkerType(0);
    setEndOfData(true);
    setMarkerData(QByteArray());
}

void JpegMarkers::setMarkerOffset(qint64 offset)
{
    if (m_markerOffset == offset)
        return;
    m_markerOffset = offset;
    emit markerOffsetChanged();
}

void JpegMarkers::setMarkerType(quint16 type)
{
    if (m_markerType == type)
        return;
    m_markerType = type;
    emit markerTypeChanged();
}

void JpegMarkers::setEndOfData(bool endOfData)
{
    if (m_endOfData == endOfData)
        return;
    m_endOfData = endOfData;
    emit endOfDataChanged();
}

void JpegMarkers::setMarkerData(const QByteArray &data)
{
    if (m_markerData == data)
        return;
    m_markerData = data;
    emit markerDataChanged();
}
