#ifndef IMAGEATTRIBUTES_H
#define IMAGEATTRIBUTES_H

#include <QByteArray>
#include <QObject>
#include <QStringList>
#include <QUrl>
#include <QVariant>
#include <QVariantMap>

class QIODevice;
class JpegMarkers;

// Named values stored inside a JPEG file, in application segments of their
// own, so that they travel with the image. A value larger than one segment
// spans several.
class ImageAttributes : public QObject
{
    Q_OBJECT

    Q_PROPERTY(int appMarker READ appMarker WRITE setAppMarker NOTIFY appMarkerChanged)
    Q_PROPERTY(QString signature READ signature WRITE setSignature NOTIFY signatureChanged)
    Q_PROPERTY(ushort version READ version WRITE setVersion NOTIFY versionChanged)
    Q_PROPERTY(QString filePath READ filePath WRITE setFilePath NOTIFY filePathChanged)
    Q_PROPERTY(QUrl fileUrl READ fileUrl WRITE setFileUrl NOTIFY fileUrlChanged)
    Q_PROPERTY(QString destFilePath READ destFilePath WRITE setDestFilePath NOTIFY destFilePathChanged)
    Q_PROPERTY(QUrl destFileUrl READ destFileUrl WRITE setDestFileUrl NOTIFY destFileUrlChanged)

public:
    static const int defaultAppMarker = 0xffea;
    static const quint16 defaultVersion = 0x0502;
    static const qint64 maxChunkSize = 0xfbe3;
    static const int headerSize = 1048;
    static const int keySize = 1024;
    static QString defaultSignature();

    // One parsed segment.
    struct Segment
    {
        quint16 version = 0;
        quint16 valueType = 0;
        quint32 totalSize = 0;
        quint32 chunkOffset = 0;
        quint32 chunkSize = 0;
        QString key;
        QByteArray chunk;
    };

    explicit ImageAttributes(QObject *parent = nullptr);

    int appMarker() const;
    void setAppMarker(int appMarker);
    QString signature() const;
    void setSignature(const QString &signature);
    ushort version() const;
    void setVersion(ushort version);
    QString filePath() const;
    void setFilePath(const QString &filePath);
    QUrl fileUrl() const;
    void setFileUrl(const QUrl &fileUrl);
    QString destFilePath() const;
    void setDestFilePath(const QString &destFilePath);
    QUrl destFileUrl() const;
    void setDestFileUrl(const QUrl &destFileUrl);

    Q_INVOKABLE QVariant keys();
    Q_INVOKABLE bool loadValueFromFile(const QString &key, const QString &filePath);
    Q_INVOKABLE bool loadValueFromFile(const QString &key, const QUrl &fileUrl);
    Q_INVOKABLE void remove(const QString &key);
    Q_INVOKABLE void remove(const QStringList &keys);
    Q_INVOKABLE void removeAll();
    Q_INVOKABLE bool saveValueToFile(const QString &key, const QString &filePath);
    Q_INVOKABLE bool saveValueToFile(const QString &key, const QUrl &fileUrl);
    Q_INVOKABLE bool setValue(const QString &key, const QVariant &value);
    Q_INVOKABLE bool setValues(const QVariantMap &values);
    Q_INVOKABLE QVariant value(const QString &key);
    Q_INVOKABLE QVariantMap values(const QString &key);
    Q_INVOKABLE QVariantMap values();
    Q_INVOKABLE QVariantMap values(const QStringList &keys);

    // Checks one segment's data against the signature and its sizes; the
    // chunk is copied only on request.
    bool parse(const QByteArray &data, Segment *segment, bool withChunk) const;
    static bool keyMatches(const QString &key, const QStringList &keys, bool wildcard);
    QVariantMap read(const QStringList &keys, bool wildcard, bool raw);
    bool write(const QVariantMap &values, bool wildcard);

signals:
    void appMarkerChanged();
    void signatureChanged();
    void versionChanged();
    void filePathChanged();
    void fileUrlChanged();
    void destFilePathChanged();
    void destFileUrlChanged();

private:
    bool writeValues(JpegMarkers *markers, const QVariantMap &values, bool *unreadable);
    bool writeStream(JpegMarkers *markers, QIODevice *device, const QString &key, int valueType);
    bool writeData(JpegMarkers *markers, const QByteArray &data, const QString &key, int valueType);
    QByteArray segmentHeader(const QString &key, int valueType, quint32 totalSize, quint32 chunkOffset,
                             quint32 chunkSize) const;

    int m_appMarker = defaultAppMarker;
    QString m_signature;
    QByteArray m_signatureBytes;
    quint16 m_version = defaultVersion;
    QString m_filePath;
    QString m_destFilePath;
};

#endif // IMAGEATTRIBUTES_H
