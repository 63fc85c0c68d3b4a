#include "QExifImageHeader.h"
#include "LoomkitLogging.h"

#include <QBuffer>
#include <QFile>
#include <QVector>

#include <algorithm>

class QExifImageHeaderPrivate
{
public:
    qint32 byteOrder = QDataStream::LittleEndian;
    qint64 size = -1;
    QMap<int, QExifValue> imageIfdValues;
    QMap<int, QExifValue> extendedIfdValues;
    QMap<int, QExifValue> gpsIfdValues;
    QByteArray thumbnailData;
    QExifValue thumbnailXResolution;
    QExifValue thumbnailYResolution;
    QExifValue thumbnailResolutionUnit;
    QExifValue thumbnailOrientation;

    QMap<int, QExifValue> &group(QExifImageHeader::Group group)
    {
        return group == QExifImageHeader::ImageGroup      ? imageIfdValues
               : group == QExifImageHeader::ExtendedGroup ? extendedIfdValues
                                                          : gpsIfdValues;
    }
    const QMap<int, QExifValue> &group(QExifImageHeader::Group group) const
    {
        return const_cast<QExifImageHeaderPrivate *>(this)->group(group);
    }
};

namespace {

const char exifSignature[6] = {'E', 'x', 'i', 'f', 0, 0};

inline quint16 get16(const uchar *p, bool littleEndian)
{
    return littleEndian ? quint16(p[0] | p[1] << 8) : quint16(p[0] << 8 | p[1]);
}

inline quint32 get32(const uchar *p, bool littleEndian)
{
    return littleEndian ? quint32(p[0]) | quint32(p[1]) << 8 | quint32(p[2]) << 16 | quint32(p[3]) << 24
                        : quint32(p[0]) << 24 | quint32(p[1]) << 16 | quint32(p[2]) << 8 | quint32(p[3]);
}

// Reads a TIFF block held in memory. Every offset and count is checked
// against the block, and the bytes of all out-of-line values together may not
// exceed the block's size, so that entries sharing one large value can't
// multiply the memory a file asks for.
class TiffReader
{
public:
    struct Entry
    {
        quint16 tag;
        quint16 type;
        quint32 count;
        uchar raw[4];
    };

    explicit TiffReader(const QByteArray &block)
        : m_data(reinterpret_cast<const uchar *>(block.constData()))
        , m_size(quint64(block.size()))
        , m_budget(quint64(block.size()))
    {
    }

    bool littleEndian = true;

    quint64 size() const { return m_size; }
    quint16 u16(quint64 offset) const { return get16(m_data + offset, littleEndian); }
    quint32 u32(quint64 offset) const { return get32(m_data + offset, littleEndian); }

    // The entry headers of the IFD at offset. An IFD that runs past the
    // block keeps the entries that fit; one whose count can't be read, or
    // that was read before, gives false.
    bool readEntries(quint32 offset, QVector<Entry> *entries, quint32 *nextIfd)
    {
        entries->clear();
        if (nextIfd)
            *nextIfd = 0;
        if (quint64(offset) + 2 > m_size || m_visited.contains(offset))
            return false;
        m_visited.append(offset);

        const quint32 declared = u16(offset);
        const quint64 fitting = (m_size - offset - 2) / 12;
        const quint32 count = quint32(std::min<quint64>(declared, fitting));
        entries->reserve(int(count));
        const uchar *p = m_data + offset + 2;
        for (quint32 i = 0; i < count; ++i, p += 12) {
            Entry entry;
            entry.tag = get16(p, littleEndian);
            entry.type = get16(p + 2, littleEndian);
            entry.count = get32(p + 4, littleEndian);
            memcpy(entry.raw, p + 8, 4);
            entries->append(entry);
        }
        const quint64 next = quint64(offset) + 2 + 12 * quint64(declared);
        if (nextIfd && count == declared && next + 4 <= m_size)
            *nextIfd = u32(next);
        return true;
    }

    QMap<int, QExifValue> readValues(const QVector<Entry> &entries)
    {
        QMap<int, QExifValue> values;
        for (const Entry &entry : entries)
            values.insert(entry.tag, readValue(entry));
        return values;
    }

    QByteArray bytes(quint32 offset, quint32 length)
    {
        if (!claim(offset, length))
            return QByteArray();
        return QByteArray(reinterpret_cast<const char *>(m_data + offset), int(length));
    }

private:
    // True if length bytes at offset lie inside the block and within what is
    // left of the budget, which they then use up.
    bool claim(quint32 offset, quint64 length)
    {
        if (quint64(offset) + length > m_size || length > m_budget)
            return false;
        m_budget -= length;
        return true;
    }

    template <typename T, typename Read>
    QVector<T> vector(const Entry &entry, int width, Read read)
    {
        const quint32 offset = get32(entry.raw, littleEndian);
        QVector<T> values;
        if (!claim(offset, quint64(entry.count) * quint64(width)))
            return values;
        values.reserve(int(entry.count));
        const uchar *p = m_data + offset;
        for (quint32 i = 0; i < entry.count; ++i, p += width)
            values.append(read(p));
        return values;
    }

    QExifValue readValue(const Entry &entry)
    {
        const bool le = littleEndian;
        switch (entry.type) {
        case QExifValue::Byte:
            if (entry.count < 1)
                return QExifValue(QVector<quint8>());
            if (entry.count < 5)
                return QExifValue(QVector<quint8>(entry.raw, entry.raw + entry.count));
            return QExifValue(vector<quint8>(entry, 1, [](const uchar *p) { return quint8(*p); }));
        case QExifValue::Ascii:
            if (entry.count < 5) {
                // A count of 0 reads the inline bytes up to their first NUL.
                const int length = entry.count == 0 ? int(qstrnlen(reinterpret_cast<const char *>(entry.raw), 4))
                                                    : int(entry.count) - 1;
                return QExifValue(QString::fromLatin1(reinterpret_cast<const char *>(entry.raw), length));
            } else {
                const QByteArray text = bytes(get32(entry.raw, le), entry.count);
                return QExifValue(QString::fromLatin1(text.constData(), qMax(0, text.size() - 1)));
            }
        case QExifValue::Short:
            if (entry.count < 1)
                return QExifValue(QVector<quint16>());
            if (entry.count < 3) {
                QVector<quint16> values(1, get16(entry.raw, le));
                if (entry.count == 2)
                    values.append(get16(entry.raw + 2, le));
                return QExifValue(values);
            }
            return QExifValue(vector<quint16>(entry, 2, [le](const uchar *p) { return get16(p, le); }));
        case QExifValue::Long:
            if (entry.count < 1)
                return QExifValue(QVector<quint32>());
            if (entry.count == 1)
                return QExifValue(get32(entry.raw, le));
            return QExifValue(vector<quint32>(entry, 4, [le](const uchar *p) { return get32(p, le); }));
        case QExifValue::SignedLong:
            if (entry.count < 1)
                return QExifValue(QVector<qint32>());
            if (entry.count == 1)
                return QExifValue(qint32(get32(entry.raw, le)));
            return QExifValue(vector<qint32>(entry, 4, [le](const uchar *p) { return qint32(get32(p, le)); }));
        case QExifValue::Rational:
            return QExifValue(vector<QExifURational>(entry, 8, [le](const uchar *p) {
                return QExifURational(get32(p, le), get32(p + 4, le));
            }));
        case QExifValue::SignedRational:
            return QExifValue(vector<QExifSRational>(entry, 8, [le](const uchar *p) {
                return QExifSRational(qint32(get32(p, le)), qint32(get32(p + 4, le)));
            }));
        case QExifValue::Undefined:
            if (entry.count < 5) {
                // The inline word, read as a number in the file's order and
                // taken as it lies in little-endian memory: big-endian files
                // come out reversed.
                uchar word[4];
                for (int i = 0; i < 4; ++i)
                    word[i] = le ? entry.raw[i] : entry.raw[3 - i];
                return QExifValue(QByteArray(reinterpret_cast<const char *>(word), int(entry.count)));
            }
            return QExifValue(bytes(get32(entry.raw, le), entry.count));
        default:
            qCWarning(lcFile) << Q_FUNC_INFO << "Invalid Ifd Type" << entry.type;
            return QExifValue();
        }
    }

    const uchar *m_data;
    quint64 m_size;
    quint64 m_budget;
    QVector<quint32> m_visited;
};

// Builds a TIFF block in memory in one byte order.
class TiffWriter
{
public:
    explicit TiffWriter(bool littleEndian)
        : m_littleEndian(littleEndian)
    {
    }

    QByteArray data;

    quint32 position() const { return quint32(data.size()); }

    void put16(quint16 value)
    {
        const char bytes[2] = {char(m_littleEndian ? value : value >> 8), char(m_littleEndian ? value >> 8 : value)};
        data.append(bytes, 2);
    }

    void put32(quint32 value)
    {
        if (m_littleEndian) {
            put16(quint16(value));
            put16(quint16(value >> 16));
        } else {
            put16(quint16(value >> 16));
            put16(quint16(value));
        }
    }

    static bool knownType(int type)
    {
        switch (type) {
        case QExifValue::Byte:
        case QExifValue::Ascii:
        case QExifValue::Short:
        case QExifValue::Long:
        case QExifValue::Rational:
        case QExifValue::Undefined:
        case QExifValue::SignedLong:
        case QExifValue::SignedRational:
            return true;
        default:
            return false;
        }
    }

    static bool isInline(const QExifValue &value)
    {
        const quint32 count = value.count();
        switch (value.type()) {
        case QExifValue::Byte:
        case QExifValue::Ascii:
        case QExifValue::Undefined:
            return count <= 4;
        case QExifValue::Short:
            return count <= 2;
        case QExifValue::Long:
        case QExifValue::SignedLong:
            return count <= 1;
        case QExifValue::Rational:
        case QExifValue::SignedRational:
            return count == 0;
        default:
            return true;
        }
    }

    // Bytes an out-of-line value takes after the entries.
    static quint32 advance(const QExifValue &value)
    {
        if (isInline(value))
            return 0;
        const quint32 count = value.count();
        switch (value.type()) {
        case QExifValue::Short:
            return count * 2;
        case QExifValue::Long:
        case QExifValue::SignedLong:
            return count * 4;
        case QExifValue::Rational:
        case QExifValue::SignedRational:
            return count * 8;
        default:
            return count;
        }
    }

    // An entry's size for laying out what follows its IFD. An unknown type
    // counts as nothing, although its 12 bytes are written.
    static quint32 layoutSize(const QExifValue &value)
    {
        if (!knownType(value.type()))
            return 0;
        return 12 + advance(value);
    }

    static quint32 ifdLayoutSize(const QMap<int, QExifValue> &values)
    {
        quint32 size = 2;
        for (const QExifValue &value : values)
            size += layoutSize(value);
        return size;
    }

    void putEntry(int tag, const QExifValue &value, quint32 *valueOffset)
    {
        put16(quint16(tag));
        put16(quint16(value.type()));
        put32(value.count());
        if (!knownType(value.type())) {
            qCWarning(lcFile) << Q_FUNC_INFO << "Invalid Ifd Type" << value.type();
            put32(0);
            return;
        }
        if (!isInline(value)) {
            put32(*valueOffset);
            *valueOffset += advance(value);
            return;
        }
        const int start = data.size();
        putValue(value);
        data.append(4 - (data.size() - start), '\0');
    }

    // The value's bytes: inline in an entry, or out of line after it.
    void putValue(const QExifValue &value)
    {
        switch (value.type()) {
        case QExifValue::Byte:
            for (quint8 byte : value.toByteVector())
                data.append(char(byte));
            break;
        case QExifValue::Ascii:
            data.append(value.toString().toLatin1());
            data.append('\0');
            break;
        case QExifValue::Short:
            for (quint16 number : value.toShortVector())
                put16(number);
            break;
        case QExifValue::Long:
            for (quint32 number : value.toLongVector())
                put32(number);
            break;
        case QExifValue::SignedLong:
            for (qint32 number : value.toSignedLongVector())
                put32(quint32(number));
            break;
        case QExifValue::Rational:
            for (const QExifURational &number : value.toRationalVector()) {
                put32(number.first);
                put32(number.second);
            }
            break;
        case QExifValue::SignedRational:
            for (const QExifSRational &number : value.toSignedRationalVector()) {
                put32(quint32(number.first));
                put32(quint32(number.second));
            }
            break;
        case QExifValue::Undefined:
            data.append(value.toByteArray());
            break;
        default:
            break;
        }
    }

    void putOutOfLineValues(const QVector<QExifValue> &values)
    {
        for (const QExifValue &value : values) {
            if (knownType(value.type()) && !isInline(value))
                putValue(value);
        }
    }

    // An Exif or GPS IFD laid out at start: its entries, their values, then
    // the zero word.
    void putIfd(const QMap<int, QExifValue> &values, quint32 start)
    {
        put16(quint16(values.size()));
        quint32 valueOffset = start + 2 + 12 * quint32(values.size());
        for (auto it = values.cbegin(); it != values.cend(); ++it)
            putEntry(it.key(), it.value(), &valueOffset);
        putOutOfLineValues(values.values().toVector());
        put32(0);
    }

private:
    bool m_littleEndian;
};

bool readFully(QIODevice *device, char *data, qint64 length)
{
    return device->read(data, length) == length;
}

// Steps over length bytes; false if the device ends first.
bool skipFully(QIODevice *device, qint64 length)
{
    if (device->isSequential())
        return device->skip(length) == length;
    const qint64 target = device->pos() + length;
    return target <= device->size() && device->seek(target);
}

bool writeFully(QIODevice *device, const QByteArray &data)
{
    return device->write(data) == data.size();
}

// Reads a device from its position on. A device that can seek is read in
// windows of at least a page at the places asked for, so that the segments
// stepped over are never read; a sequential one is read as it comes.
class SegmentSource
{
public:
    explicit SegmentSource(QIODevice *device)
        : m_device(device)
        , m_random(!device->isSequential())
        , m_position(device->pos())
        , m_size(m_random ? device->size() : -1)
    {
    }

    bool take(uchar *data, int length)
    {
        if (!m_random)
            return readFully(m_device, reinterpret_cast<char *>(data), length);
        if (!fetch(length))
            return false;
        memcpy(data, m_window.constData() + (m_position - m_windowStart), size_t(length));
        m_position += length;
        return true;
    }

    bool skip(qint64 length)
    {
        if (!m_random)
            return m_device->skip(length) == length;
        if (m_position + length > m_size)
            return false;
        m_position += length;
        return true;
    }

    // Up to length bytes: fewer where the device ends first.
    QByteArray takeUpTo(qint64 length)
    {
        if (!m_random)
            return m_device->read(length);
        length = qMin(length, m_size - m_position);
        if (length <= 0 || !fetch(length))
            return QByteArray();
        const QByteArray bytes = m_window.mid(int(m_position - m_windowStart), int(length));
        m_position += length;
        return bytes;
    }

private:
    bool fetch(qint64 length)
    {
        if (m_position >= m_windowStart && m_position + length <= m_windowStart + m_window.size())
            return true;
        if (m_position + length > m_size || !m_device->seek(m_position))
            return false;
        m_window = m_device->read(qMax<qint64>(length, 4096));
        m_windowStart = m_position;
        return m_window.size() >= length;
    }

    QIODevice *m_device;
    bool m_random;
    qint64 m_position;
    qint64 m_size;
    QByteArray m_window;
    qint64 m_windowStart = 0;
};

QByteArray bigEndian16(quint16 value)
{
    const char bytes[2] = {char(value >> 8), char(value)};
    return QByteArray(bytes, 2);
}

} // namespace

QExifImageHeader::QExifImageHeader()
    : d(new QExifImageHeaderPrivate)
{
}

QExifImageHeader::~QExifImageHeader() = default;

void QExifImageHeader::clear()
{
    d->imageIfdValues.clear();
    d->extendedIfdValues.clear();
    d->gpsIfdValues.clear();
    d->thumbnailData.clear();
    d->size = -1;
}

bool QExifImageHeader::loadFromJpeg(const QString &fileName)
{
    // Unbuffered: the reads below ask for what they need, nothing more.
    QFile file(fileName);
    if (!file.open(QIODevice::ReadOnly | QIODevice::Unbuffered)) {
        clear();
        return false;
    }
    return loadFromJpeg(&file);
}

bool QExifImageHeader::loadFromJpeg(QIODevice *device)
{
    clear();
    if (!device)
        return false;
    SegmentSource source(device);

    uchar bytes[4];
    if (!source.take(bytes, 2) || bytes[0] != 0xff || bytes[1] != 0xd8)
        return false;

    // Every segment is skipped by its length up to the first APP1, also past
    // Start of Scan. A length below 2 would step backwards, so it ends the walk.
    quint16 length = 0;
    for (;;) {
        if (!source.take(bytes, 4))
            return false;
        length = get16(bytes + 2, false);
        if (bytes[0] == 0xff && bytes[1] == 0xe1)
            break;
        if (length < 2 || !source.skip(length - 2))
            return false;
    }

    uchar signature[6];
    if (!source.take(signature, 4) || memcmp(signature, exifSignature, 4) != 0)
        return false;
    if (length <= 8 || !source.take(signature + 4, 2))
        return false;
    const QByteArray block = source.takeUpTo(length - 8);
    if (block.isEmpty())
        return false;
    return read(block);
}

bool QExifImageHeader::read(QIODevice *device)
{
    clear();
    if (!device)
        return false;
    return read(device->readAll());
}

bool QExifImageHeader::read(const QByteArray &tiffBlock)
{
    clear();
    TiffReader reader(tiffBlock);
    if (reader.size() < 8)
        return false;

    const char *header = tiffBlock.constData();
    if (header[0] == 'I' && header[1] == 'I')
        d->byteOrder = QDataStream::LittleEndian;
    else if (header[0] == 'M' && header[1] == 'M')
        d->byteOrder = QDataStream::BigEndian;
    else
        return false;
    reader.littleEndian = d->byteOrder == QDataStream::LittleEndian;
    if (reader.u16(2) != 0x2a)
        return false;

    QVector<TiffReader::Entry> entries;
    quint32 nextIfd = 0;
    if (!reader.readEntries(reader.u32(4), &entries, &nextIfd))
        return false;
    d->imageIfdValues = reader.readValues(entries);

    const QExifValue exifPointer = d->imageIfdValues.take(ExifIfdPointer);
    const QExifValue gpsPointer = d->imageIfdValues.take(GpsIfdPointer);
    if (exifPointer.type() == QExifValue::Long && exifPointer.count() == 1
        && reader.readEntries(exifPointer.toLong(), &entries, nullptr)) {
        d->extendedIfdValues = reader.readValues(entries);
    }
    if (gpsPointer.type() == QExifValue::Long && gpsPointer.count() == 1
        && reader.readEntries(gpsPointer.toLong(), &entries, nullptr)) {
        d->gpsIfdValues = reader.readValues(entries);
    }
    d->extendedIfdValues.remove(InteroperabilityIfdPointer);

    if (nextIfd != 0 && reader.readEntries(nextIfd, &entries, nullptr)) {
        const QMap<int, QExifValue> thumbnail = reader.readValues(entries);
        const QExifValue offset = thumbnail.value(ThumbnailOffset);
        const QExifValue length = thumbnail.value(ThumbnailLength);
        if (offset.type() == QExifValue::Long && offset.count() == 1 && length.type() == QExifValue::Long
            && length.count() == 1) {
            d->thumbnailData = reader.bytes(offset.toLong(), length.toLong());
            d->thumbnailXResolution = thumbnail.value(ThumbnailXResolution);
            d->thumbnailYResolution = thumbnail.value(ThumbnailYResolution);
            d->thumbnailResolutionUnit = thumbnail.value(ThumbnailResolutionUnit);
            d->thumbnailOrientation = thumbnail.value(ThumbnailOrientation);
        }
    }
    return true;
}

QByteArray QExifImageHeader::toTiffBlock()
{
    TiffWriter writer(d->byteOrder == QDataStream::LittleEndian);
    writer.data.reserve(1024 + d->thumbnailData.size());
    writer.data.append(d->byteOrder == QDataStream::LittleEndian ? "II" : "MM", 2);
    writer.put16(0x2a);
    writer.put32(8);

    const bool hasGps = !d->gpsIfdValues.isEmpty();
    const QMap<int, QExifValue> image = d->imageIfdValues;
    const quint32 entryCount = quint32(image.size()) + (hasGps ? 2 : 1);
    writer.put16(quint16(entryCount));

    quint32 valueOffset = 8 + 2 + 12 * entryCount + 4;
    for (auto it = image.cbegin(); it != image.cend(); ++it)
        writer.putEntry(it.key(), it.value(), &valueOffset);

    const quint32 exifOffset = valueOffset;
    quint32 reached = exifOffset + TiffWriter::ifdLayoutSize(d->extendedIfdValues) + 4;
    writer.putEntry(ExifIfdPointer, QExifValue(exifOffset), &valueOffset);
    quint32 gpsOffset = 0;
    if (hasGps) {
        gpsOffset = reached;
        writer.putEntry(GpsIfdPointer, QExifValue(gpsOffset), &valueOffset);
        // Kept in the map: a later save writes it again among the sorted
        // entries, next to the fresh pointer.
        d->imageIfdValues.insert(GpsIfdPointer, QExifValue(gpsOffset));
        reached = gpsOffset + TiffWriter::ifdLayoutSize(d->gpsIfdValues) + 4;
    }
    const bool hasThumbnail = !d->thumbnailData.isEmpty();
    writer.put32(hasThumbnail ? reached : 0);
    writer.putOutOfLineValues(image.values().toVector());

    writer.putIfd(d->extendedIfdValues, exifOffset);
    if (hasGps)
        writer.putIfd(d->gpsIfdValues, gpsOffset);

    quint32 end = reached;
    if (hasThumbnail) {
        const auto orDefault = [](const QExifValue &value, const QExifValue &fallback) {
            return value.isNull() ? fallback : value;
        };
        const QExifValue defaultResolution(QExifURational(72, 1));
        const QVector<QExifValue> leading = {
            QExifValue(quint16(6)),
            orDefault(d->thumbnailXResolution, defaultResolution),
            orDefault(d->thumbnailYResolution, defaultResolution),
            orDefault(d->thumbnailResolutionUnit, QExifValue(quint16(2))),
            orDefault(d->thumbnailOrientation, QExifValue(quint16(0))),
        };
        static const int leadingTags[] = {ThumbnailCompression, ThumbnailXResolution, ThumbnailYResolution,
                                          ThumbnailResolutionUnit, ThumbnailOrientation};
        valueOffset = reached + 86;
        quint32 thumbnailOffset = valueOffset;
        for (const QExifValue &value : leading)
            thumbnailOffset += TiffWriter::advance(value);

        writer.put16(7);
        for (int i = 0; i < leading.size(); ++i)
            writer.putEntry(leadingTags[i], leading.at(i), &valueOffset);
        writer.putEntry(ThumbnailOffset, QExifValue(thumbnailOffset), &valueOffset);
        writer.putEntry(ThumbnailLength, QExifValue(quint32(d->thumbnailData.size())), &valueOffset);
        writer.putOutOfLineValues(leading);
        writer.data.append(d->thumbnailData);
        end = thumbnailOffset + quint32(d->thumbnailData.size());
    }

    // The offset reached by the layout; it is short of the bytes written
    // only when an entry of unknown type was laid out as nothing.
    d->size = end;
    return writer.data;
}

qint64 QExifImageHeader::write(QIODevice *device)
{
    const QByteArray block = toTiffBlock();
    if (!device || !writeFully(device, block))
        return -1;
    return d->size;
}

bool QExifImageHeader::saveToJpeg(const QString &fileName)
{
    QFile source(fileName);
    if (!source.open(QIODevice::ReadOnly))
        return false;
    QFile temporary(fileName + QLatin1String(".tmp"));
    if (!temporary.open(QIODevice::ReadWrite | QIODevice::Truncate))
        return false;

    const bool saved = saveToJpeg(&source, &temporary);
    source.close();
    temporary.close();
    if (!saved) {
        temporary.remove();
        return false;
    }
    if (!source.remove()) {
        temporary.remove();
        return false;
    }
    return temporary.rename(fileName);
}

bool QExifImageHeader::saveToJpeg(QIODevice *source, QIODevice *destination)
{
    if (!source || !destination || source->isSequential())
        return false;

    QByteArray block = QByteArray(exifSignature, 6) + toTiffBlock();
    // The segment's length field has 16 bits and counts itself; a longer
    // block would wrap it and spoil the image.
    if (block.size() + 2 > 0xffff) {
        qCWarning(lcFile) << Q_FUNC_INFO << "Exif block too large:" << block.size();
        return false;
    }

    char marker[4];
    if (!readFully(source, marker, 2) || uchar(marker[0]) != 0xff || uchar(marker[1]) != 0xd8)
        return false;

    QByteArray head("\xff\xd8\xff\xe1", 4);
    head += bigEndian16(quint16(block.size() + 2));
    if (!writeFully(destination, head) || !writeFully(destination, block))
        return false;

    // Every application segment is dropped, every other one copied, up to
    // Start of Scan. Ends with false at the end of the source.
    for (;;) {
        if (!readFully(source, marker, 4))
            return false;
        const quint16 code = get16(reinterpret_cast<const uchar *>(marker), false);
        const quint16 length = get16(reinterpret_cast<const uchar *>(marker) + 2, false);
        if (code == 0xffda) {
            if (!writeFully(destination, QByteArray(marker, 4)))
                return false;
            break;
        }
        if (length < 2)
            return false;
        if (code >= 0xffe0 && code <= 0xffef) {
            if (!skipFully(source, length - 2))
                return false;
            continue;
        }
        const QByteArray body = source->read(length - 2);
        if (body.size() != length - 2 || !writeFully(destination, QByteArray(marker, 4))
            || !writeFully(destination, body)) {
            return false;
        }
    }

    QByteArray buffer(65536, Qt::Uninitialized);
    for (;;) {
        const qint64 got = source->read(buffer.data(), buffer.size());
        if (got <= 0)
            break;
        if (destination->write(buffer.constData(), got) != got)
            return false;
    }
    return true;
}

QDataStream::ByteOrder QExifImageHeader::byteOrder() const
{
    return QDataStream::ByteOrder(d->byteOrder);
}

void QExifImageHeader::setByteOrder(QDataStream::ByteOrder byteOrder)
{
    d->byteOrder = byteOrder;
}

qint64 QExifImageHeader::size() const
{
    return d->size;
}

QList<int> QExifImageHeader::tags(Group group) const
{
    return d->group(group).keys();
}

bool QExifImageHeader::contains(Group group, int tag) const
{
    return d->group(group).contains(tag);
}

QExifValue QExifImageHeader::value(Group group, int tag) const
{
    return d->group(group).value(tag);
}

void QExifImageHeader::setValue(Group group, int tag, const QExifValue &value)
{
    d->group(group).insert(tag, value);
}

void QExifImageHeader::remove(Group group, int tag)
{
    d->group(group).remove(tag);
}

QByteArray QExifImageHeader::thumbnailData() const
{
    return d->thumbnailData;
}

void QExifImageHeader::setThumbnailData(const QByteArray &data)
{
    d->thumbnailData = data;
}

QExifValue QExifImageHeader::thumbnailXResolution() const
{
    return d->thumbnailXResolution;
}

void QExifImageHeader::setThumbnailXResolution(const QExifValue &value)
{
    d->thumbnailXResolution = value;
}

QExifValue QExifImageHeader::thumbnailYResolution() const
{
    return d->thumbnailYResolution;
}

void QExifImageHeader::setThumbnailYResolution(const QExifValue &value)
{
    d->thumbnailYResolution = value;
}

QExifValue QExifImageHeader::thumbnailResolutionUnit() const
{
    return d->thumbnailResolutionUnit;
}

void QExifImageHeader::setThumbnailResolutionUnit(const QExifValue &value)
{
    d->thumbnailResolutionUnit = value;
}

QExifValue QExifImageHeader::thumbnailOrientation() const
{
    return d->thumbnailOrientation;
}

void QExifImageHeader::setThumbnailOrientation(const QExifValue &value)
{
    d->thumbnailOrientation = value;
}
