#include "ImageAttributes.h"
#include "FileUtility.h"
#include "JpegMarkers.h"
#include "LoomkitLogging.h"

#include <QBuffer>
#include <QFile>
#include <QJsonDocument>
#include <QJsonObject>
#include <QRegExp>

namespace {

// Value types as stored in a segment: QVariant type numbers.
const int typeMap = QMetaType::QVariantMap;
const int typeString = QMetaType::QString;
const int typeBytes = QMetaType::QByteArray;
const int typeNull = QMetaType::Nullptr;

const QString referencePrefix = QStringLiteral("blob://imageattributes/");

void putBigEndian16(char *p, quint16 value)
{
    p[0] = char(value >> 8);
    p[1] = char(value);
}

void putBigEndian32(char *p, quint32 value)
{
    putBigEndian16(p, quint16(value >> 16));
    putBigEndian16(p + 2, quint16(value));
}

quint16 bigEndian16(const char *p)
{
    return quint16(uchar(p[0]) << 8 | uchar(p[1]));
}

quint32 bigEndian32(const char *p)
{
    return quint32(bigEndian16(p)) << 16 | bigEndian16(p + 2);
}

QVariant decodedValue(const QByteArray &bytes, int valueType)
{
    switch (valueType) {
    case typeMap:
        return QJsonDocument::fromJson(bytes).toVariant();
    case typeString:
        return QString::fromUtf8(bytes);
    case typeNull:
        return QVariant::fromValue<QObject *>(nullptr);
    default:
        // Numbers and the like come back as the text they were stored as.
        return bytes;
    }
}

// Copies the rest of a device in large blocks.
bool copyRest(QIODevice *source, QIODevice *destination)
{
    QByteArray buffer(65536, Qt::Uninitialized);
    for (;;) {
        const qint64 got = source->read(buffer.data(), buffer.size());
        if (got <= 0)
            return true;
        if (destination->write(buffer.constData(), got) != got)
            return false;
    }
}

} // namespace

QString ImageAttributes::defaultSignature()
{
    return QStringLiteral("ZETH");
}

ImageAttributes::ImageAttributes(QObject *parent)
    : QObject(parent)
    , m_signature(defaultSignature())
    , m_signatureBytes(defaultSignature().toUtf8().leftJustified(8, '\0', true))
{
}

int ImageAttributes::appMarker() const
{
    return m_appMarker;
}

void ImageAttributes::setAppMarker(int appMarker)
{
    if (m_appMarker == appMarker)
        return;
    m_appMarker = appMarker;
    emit appMarkerChanged();
}

QString ImageAttributes::signature() const
{
    return m_signature;
}

void ImageAttributes::setSignature(const QString &signature)
{
    if (m_signature == signature)
        return;
    m_signature = signature;
    m_signatureBytes = signature.toUtf8().leftJustified(8, '\0', true);
    emit signatureChanged();
}

ushort ImageAttributes::version() const
{
    return m_version;
}

void ImageAttributes::setVersion(ushort version)
{
    if (m_version == version)
        return;
    m_version = version;
    emit versionChanged();
}

QString ImageAttributes::filePath() const
{
    return m_filePath;
}

void ImageAttributes::setFilePath(const QString &filePath)
{
    const QString resolved = FileUtility::resolvedPath(filePath);
    if (m_filePath == resolved)
        return;
    m_filePath = resolved;
    emit filePathChanged();
    emit fileUrlChanged();
}

QUrl ImageAttributes::fileUrl() const
{
    return FileUtility::pathUrl(m_filePath);
}

void ImageAttributes::setFileUrl(const QUrl &fileUrl)
{
    if (fileUrl == this->fileUrl())
        return;
    setFilePath(FileUtility::resolvedPath(fileUrl));
}

QString ImageAttributes::destFilePath() const
{
    return m_destFilePath;
}

void ImageAttributes::setDestFilePath(const QString &destFilePath)
{
    const QString resolved = FileUtility::resolvedPath(destFilePath);
    if (m_destFilePath == resolved)
        return;
    m_destFilePath = resolved;
    emit destFilePathChanged();
    emit destFileUrlChanged();
}

QUrl ImageAttributes::destFileUrl() const
{
    return FileUtility::pathUrl(m_destFilePath);
}

void ImageAttributes::setDestFileUrl(const QUrl &destFileUrl)
{
    if (destFileUrl == this->destFileUrl())
        return;
    setDestFilePath(FileUtility::resolvedPath(destFileUrl));
}

QVariant ImageAttributes::keys()
{
    QFile file(m_filePath);
    if (m_filePath.isEmpty() || !file.open(QIODevice::ReadOnly))
        return QVariant();

    QStringList keys;
    JpegMarkers markers(&file);
    if (markers.first()) {
        Segment segment;
        while (markers.next()) {
            if (markers.markerType() == m_appMarker && parse(markers.markerData(), &segment, false)
                && segment.chunkOffset == 0) {
                keys.append(segment.key);
            }
        }
    }
    return keys;
}

bool ImageAttributes::loadValueFromFile(const QString &key, const QString &filePath)
{
    return loadValueFromFile(key, FileUtility::pathUrl(FileUtility::resolvedPath(filePath)));
}

bool ImageAttributes::loadValueFromFile(const QString &key, const QUrl &fileUrl)
{
    QVariantMap values;
    values.insert(key, fileUrl);
    return write(values, false);
}

void ImageAttributes::remove(const QString &key)
{
    remove(QStringList(key));
}

void ImageAttributes::remove(const QStringList &keys)
{
    QVariantMap values;
    for (const QString &key : keys)
        values.insert(key, QVariant());
    write(values, false);
}

void ImageAttributes::removeAll()
{
    QVariantMap values;
    values.insert(QStringLiteral("*"), QVariant());
    write(values, true);
}

bool ImageAttributes::saveValueToFile(const QString &key, const QString &filePath)
{
    const QString path = FileUtility::resolvedPath(filePath);
    if (key.isEmpty() || path.isEmpty())
        return false;

    const QVariant value = this->value(key);
    if (value.isNull())
        return false;
    const bool isBytes = value.userType() == QMetaType::QByteArray;
    const QByteArray bytes = isBytes ? value.toByteArray() : value.toString().toUtf8();
    if (bytes.isEmpty())
        return false;

    QFile file(path);
    if (!file.open(QIODevice::WriteOnly))
        return false;
    file.write(bytes);
    return true;
}

bool ImageAttributes::saveValueToFile(const QString &key, const QUrl &fileUrl)
{
    if (fileUrl.isEmpty() || !fileUrl.isValid())
        return false;
    return saveValueToFile(key, fileUrl.toLocalFile());
}

bool ImageAttributes::setValue(const QString &key, const QVariant &value)
{
    QVariantMap values;
    values.insert(key, value);
    return write(values, false);
}

bool ImageAttributes::setValues(const QVariantMap &values)
{
    return write(values, false);
}

QVariant ImageAttributes::value(const QString &key)
{
    return read(QStringList(key), false, true).value(key);
}

QVariantMap ImageAttributes::values(const QString &key)
{
    return read(QStringList(key), true, false);
}

QVariantMap ImageAttributes::values()
{
    return read(QStringList(QStringLiteral("*")), true, false);
}

QVariantMap ImageAttributes::values(const QStringList &keys)
{
    return read(keys, true, false);
}

bool ImageAttributes::parse(const QByteArray &data, Segment *segment, bool withChunk) const
{
    if (data.size() < headerSize || !data.startsWith(m_signatureBytes))
        return false;
    const char *p = data.constData();
    const quint32 totalSize = bigEndian32(p + 12);
    const quint32 chunkOffset = bigEndian32(p + 16);
    const quint32 chunkSize = bigEndian32(p + 20);
    if (quint64(chunkOffset) + chunkSize > totalSize || quint64(chunkSize) + headerSize != quint64(data.size()))
        return false;

    segment->version = bigEndian16(p + 8);
    segment->valueType = bigEndian16(p + 10);
    segment->totalSize = totalSize;
    segment->chunkOffset = chunkOffset;
    segment->chunkSize = chunkSize;
    segment->key = QString::fromUtf8(p + 24, int(qstrnlen(p + 24, keySize)));
    segment->chunk = withChunk ? data.mid(headerSize) : QByteArray();
    return true;
}

bool ImageAttributes::keyMatches(const QString &key, const QStringList &keys, bool wildcard)
{
    if (!wildcard)
        return keys.contains(key);
    for (const QString &pattern : keys) {
        if (QRegExp(pattern, Qt::CaseSensitive, QRegExp::Wildcard).exactMatch(key))
            return true;
    }
    return false;
}

QVariantMap ImageAttributes::read(const QStringList &keys, bool wildcard, bool raw)
{
    QVariantMap result;
    QFile file(m_filePath);
    if (m_filePath.isEmpty() || !file.open(QIODevice::ReadOnly))
        return result;

    JpegMarkers markers(&file);
    if (!markers.first())
        return result;

    // Chunks of a value must follow each other from offset 0; a gap drops
    // the rest of that value.
    QByteArray accumulated;
    Segment segment;
    while (markers.next()) {
        if (markers.markerType() != m_appMarker)
            continue;
        const QByteArray data = markers.markerData();
        if (!parse(data, &segment, false) || !keyMatches(segment.key, keys, wildcard))
            continue;
        if (segment.chunkOffset == 0)
            accumulated.clear();
        if (quint32(accumulated.size()) != segment.chunkOffset)
            continue;
        if (!raw && segment.valueType == typeBytes) {
            result.insert(segment.key, QUrl(referencePrefix + segment.key, QUrl::TolerantMode));
            continue;
        }
        accumulated.append(data.constData() + headerSize, int(segment.chunkSize));
        if (quint32(accumulated.size()) == segment.totalSize)
            result.insert(segment.key, decodedValue(accumulated, segment.valueType));
    }
    return result;
}

bool ImageAttributes::write(const QVariantMap &values, bool wildcard)
{
    QFile source(m_filePath);
    if (m_filePath.isEmpty() || !source.open(QIODevice::ReadOnly))
        return false;

    QString targetPath = m_destFilePath.isEmpty() ? m_filePath : m_destFilePath;
    const bool inPlace = targetPath == m_filePath;
    if (inPlace)
        targetPath = m_filePath + QLatin1String(".tmp");
    QFile target(targetPath);
    if (!target.open(QIODevice::WriteOnly))
        return false;

    JpegMarkers reader(&source);
    JpegMarkers writer(&target);
    const QStringList keys = values.keys();
    bool pending = true;
    bool changed = false;
    bool written = true;
    bool unreadable = false;

    if (reader.first()) {
        do {
            const quint16 type = reader.markerType();
            const QByteArray data = reader.markerData();
            if (pending && type != JpegMarkers::JpegMarkerSOI) {
                // New segments go after the application segments numbered
                // below our own marker, ahead of everything else.
                if (type >= JpegMarkers::JpegMarkerAPP0 && type < m_appMarker) {
                    written = writer.write(JpegMarkers::JpegMarkerType(type), data) && written;
                    continue;
                }
                changed = writeValues(&writer, values, &unreadable);
                pending = false;
            }
            Segment segment;
            if (type == m_appMarker && parse(data, &segment, false) && keyMatches(segment.key, keys, wildcard)) {
                changed = true;
                continue;
            }
            written = writer.write(JpegMarkers::JpegMarkerType(type), data) && written;
        } while (reader.next());
    }

    if (!inPlace || changed) {
        written = copyRest(&source, &target) && written;
        source.close();
        target.close();
        // A target that failed to take every byte must not replace the source.
        if (!written || target.error() != QFileDevice::NoError) {
            qCWarning(lcFile) << Q_FUNC_INFO << "Unable to write" << targetPath << target.errorString();
            target.remove();
            return false;
        }
        if (inPlace) {
            QFile::remove(m_filePath);
            QFile::rename(targetPath, m_filePath);
        }
    } else {
        source.close();
        target.close();
        target.remove();
    }
    return !unreadable;
}

bool ImageAttributes::writeValues(JpegMarkers *markers, const QVariantMap &values, bool *unreadable)
{
    bool changed = false;
    for (auto it = values.cbegin(); it != values.cend(); ++it) {
        const QVariant &value = it.value();
        const int type = value.userType();
        if (!value.isValid())
            continue;

        bool written = false;
        if (type == typeString) {
            written = writeData(markers, value.toString().toUtf8(), it.key(), typeString);
        } else if (type == typeBytes) {
            written = writeData(markers, value.toByteArray(), it.key(), typeBytes);
        } else if (type == QMetaType::QUrl) {
            QFile file(FileUtility::resolvedPath(value.toUrl()));
            if (!file.exists() || !file.open(QIODevice::ReadOnly)) {
                qCWarning(lcFile) << Q_FUNC_INFO << "Unable to read" << value.toUrl() << file.errorString();
                *unreadable = true;
                return false;
            }
            written = writeStream(markers, &file, it.key(), typeBytes);
        } else if (type == typeNull) {
            written = writeData(markers, QByteArray(), it.key(), typeNull);
        } else if (value.canConvert<QVariantMap>()) {
            const QJsonDocument document(QJsonObject::fromVariantMap(value.toMap()));
            written = writeData(markers, document.toJson(), it.key(), typeMap);
        } else {
            written = writeData(markers, value.toString().toUtf8(), it.key(), type);
        }
        changed = changed || written;
    }
    return changed;
}

bool ImageAttributes::writeData(JpegMarkers *markers, const QByteArray &data, const QString &key, int valueType)
{
    QByteArray copy = data;
    QBuffer buffer(&copy);
    buffer.open(QIODevice::ReadOnly);
    return writeStream(markers, &buffer, key, valueType);
}

bool ImageAttributes::writeStream(JpegMarkers *markers, QIODevice *device, const QString &key, int valueType)
{
    const quint32 totalSize = quint32(device->size());
    quint32 chunkOffset = 0;
    QByteArray chunk = device->read(maxChunkSize);
    // At least one segment, also for an empty value.
    do {
        const quint32 chunkSize = quint32(chunk.size());
        const QByteArray header = segmentHeader(key, valueType, totalSize, chunkOffset, chunkSize);
        if (!markers->write(JpegMarkers::JpegMarkerType(m_appMarker), header + chunk))
            return false;
        chunkOffset += chunkSize;
        chunk = device->read(maxChunkSize);
    } while (!chunk.isEmpty());
    return true;
}

QByteArray ImageAttributes::segmentHeader(const QString &key, int valueType, quint32 totalSize,
                                          quint32 chunkOffset, quint32 chunkSize) const
{
    QByteArray header(headerSize, '\0');
    char *p = header.data();
    memcpy(p, m_signatureBytes.constData(), 8);
    putBigEndian16(p + 8, m_version);
    putBigEndian16(p + 10, quint16(valueType));
    putBigEndian32(p + 12, totalSize);
    putBigEndian32(p + 16, chunkOffset);
    putBigEndian32(p + 20, chunkSize);
    const QByteArray keyBytes = key.toUtf8().left(keySize);
    memcpy(p + 24, keyBytes.constData(), size_t(keyBytes.size()));
    return header;
}
