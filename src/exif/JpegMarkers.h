#ifndef JPEGMARKERS_H
#define JPEGMARKERS_H

#include <QByteArray>
#include <QObject>

class QIODevice;

// Walks the marker segments of a JPEG stream, one at a time, up to Start of
// Scan; and writes such segments. The device is not owned.
class JpegMarkers : public QObject
{
    Q_OBJECT

    Q_PROPERTY(bool endOfData READ endOfData NOTIFY endOfDataChanged)
    Q_PROPERTY(qlonglong markerOffset READ markerOffset NOTIFY markerOffsetChanged)
    Q_PROPERTY(JpegMarkerType markerType READ markerType NOTIFY markerTypeChanged)
    Q_PROPERTY(QByteArray markerData READ markerData NOTIFY markerDataChanged)
    Q_PROPERTY(qlonglong markerSize READ markerSize NOTIFY markerDataChanged)

public:
    enum JpegMarkerType : quint16 {
        JpegMarkerSOF0 = 0xffc0,
        JpegMarkerSOF1,
        JpegMarkerSOF2,
        JpegMarkerSOF3,
        JpegMarkerDHT,
        JpegMarkerSOF5,
        JpegMarkerSOF6,
        JpegMarkerSOF7,
        JpegMarkerJPG,
        JpegMarkerSOF9,
        JpegMarkerSOF10,
        JpegMarkerSOF11,
        JpegMarkerDAC,
        JpegMarkerSOF13,
        JpegMarkerSOF14,
        JpegMarkerSOF15,
        JpegMarkerRST0,
        JpegMarkerRST1,
        JpegMarkerRST2,
        JpegMarkerRST3,
        JpegMarkerRST4,
        JpegMarkerRST5,
        JpegMarkerRST6,
        JpegMarkerRST7,
        JpegMarkerSOI,
        JpegMarkerEOI,
        JpegMarkerSOS,
        JpegMarkerDQT,
        JpegMarkerDNL,
        JpegMarkerDRI,
        JpegMarkerDHP,
        JpegMarkerEXP,
        JpegMarkerAPP0,
        JpegMarkerAPP1,
        JpegMarkerAPP2,
        JpegMarkerAPP3,
        JpegMarkerAPP4,
        JpegMarkerAPP5,
        JpegMarkerAPP6,
        JpegMarkerAPP7,
        JpegMarkerAPP8,
        JpegMarkerAPP9,
        JpegMarkerAPP10,
        JpegMarkerAPP11,
        JpegMarkerAPP12,
        JpegMarkerAPP13,
        JpegMarkerAPP14,
        JpegMarkerAPP15,
        JpegMarkerJPG0,
        JpegMarkerJPG1,
        JpegMarkerJPG2,
        JpegMarkerJPG3,
        JpegMarkerJPG4,
        JpegMarkerJPG5,
        JpegMarkerJPG6,
        JpegMarkerJPG7,
        JpegMarkerJPG8,
        JpegMarkerJPG9,
        JpegMarkerJPG10,
        JpegMarkerJPG11,
        JpegMarkerJPG12,
        JpegMarkerJPG13,
        JpegMarkerCOM
    };
    Q_ENUM(JpegMarkerType)

    explicit JpegMarkers(QIODevice *device = nullptr, QObject *parent = nullptr);

    bool endOfData() const;
    qint64 markerOffset() const;
    JpegMarkerType markerType() const;
    QByteArray markerData() const;
    qint64 markerSize() const;

    bool first();
    bool next();
    bool write(JpegMarkerType type, const QByteArray &data);

    void raiseError(const QString &message);

    // SOI, EOI and the restart markers stand alone, with no length.
    static bool hasNoPayload(quint16 type) { return type >= JpegMarkerRST0 && type <= JpegMarkerEOI; }

signals:
    void endOfDataChanged();
    void markerOffsetChanged();
    void markerTypeChanged();
    void markerDataChanged();

private:
    bool readMarker();
    void setEndState();
    void setMarkerOffset(qint64 offset);
    void setMarkerType(quint16 type);
    void setEndOfData(bool endOfData);
    void setMarkerData(const QByteArray &data);

    QIODevice *m_device = nullptr;
    bool m_endOfData = true;
    qint64 m_markerOffset = 0;
    quint16 m_markerType = 0;
    QByteArray m_markerData;
};

#endif // JPEGMARKERS_H
