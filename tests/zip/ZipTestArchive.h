#ifndef ZIPTESTARCHIVE_H
#define ZIPTESTARCHIVE_H

// Builds zip archives byte by byte, so that tests can hold entries no
// well-behaved tool writes: names that climb out, absolute names, links,
// wrong checksums, overlong names.

#include <QByteArray>
#include <QFile>
#include <QList>
#include <QtEndian>

#include <zlib.h>

namespace ZipTestArchive {

struct Entry
{
    QByteArray name;
    QByteArray data;
    bool deflate = false;
    bool badCrc = false;
    bool damage = false;             // garble the stored bytes after the first few
    qint64 declaredSize = -1;        // uncompressed size to claim, if not the real one
    quint32 externalAttributes = 0; // high 16 bits: Unix mode
    quint16 versionMadeBy = 20;      // high byte 3: Unix
    quint16 dosTime = 0x5000;        // 10:00:00
    quint16 dosDate = 0x526e;        // 2021-03-14
};

inline Entry file(const QByteArray &name, const QByteArray &data, bool deflate = false)
{
    Entry entry;
    entry.name = name;
    entry.data = data;
    entry.deflate = deflate;
    return entry;
}

// A Unix symbolic link entry whose data is the link's target.
inline Entry symlink(const QByteArray &name, const QByteArray &target)
{
    Entry entry = file(name, target);
    entry.externalAttributes = quint32(0120777) << 16;
    entry.versionMadeBy = (3 << 8) | 20;
    return entry;
}

inline QByteArray rawDeflate(const QByteArray &data)
{
    z_stream stream = {};
    deflateInit2(&stream, Z_DEFAULT_COMPRESSION, Z_DEFLATED, -MAX_WBITS, 8, Z_DEFAULT_STRATEGY);
    QByteArray out(int(deflateBound(&stream, uLong(data.size()))), '\0');
    stream.next_in = reinterpret_cast<Bytef *>(const_cast<char *>(data.constData()));
    stream.avail_in = uInt(data.size());
    stream.next_out = reinterpret_cast<Bytef *>(out.data());
    stream.avail_out = uInt(out.size());
    deflate(&stream, Z_FINISH);
    out.resize(int(stream.total_out));
    deflateEnd(&stream);
    return out;
}

inline void put16(QByteArray &out, quint16 value)
{
    char bytes[2];
    qToLittleEndian(value, bytes);
    out.append(bytes, 2);
}

inline void put32(QByteArray &out, quint32 value)
{
    char bytes[4];
    qToLittleEndian(value, bytes);
    out.append(bytes, 4);
}

inline QByteArray build(const QList<Entry> &entries)
{
    QByteArray out;
    QByteArray central;
    for (const Entry &entry : entries) {
        QByteArray stored = entry.deflate ? rawDeflate(entry.data) : entry.data;
        if (entry.damage) {
            for (int i = qMin(4, stored.size()); i < stored.size(); ++i)
                stored[i] = char(0xff - i);
        }
        quint32 crc = quint32(crc32(0, reinterpret_cast<const Bytef *>(entry.data.constData()), uInt(entry.data.size())));
        if (entry.badCrc)
            crc ^= 0x5a5a5a5a;
        const quint32 offset = quint32(out.size());
        const quint16 method = entry.deflate ? 8 : 0;

        put32(out, 0x04034b50);
        put16(out, 20);
        put16(out, 0);
        put16(out, method);
        put16(out, entry.dosTime);
        put16(out, entry.dosDate);
        put32(out, crc);
        put32(out, quint32(stored.size()));
        const quint32 size = quint32(entry.declaredSize < 0 ? entry.data.size() : entry.declaredSize);
        put32(out, size);
        put16(out, quint16(entry.name.size()));
        put16(out, 0);
        out.append(entry.name);
        out.append(stored);

        put32(central, 0x02014b50);
        put16(central, entry.versionMadeBy);
        put16(central, 20);
        put16(central, 0);
        put16(central, method);
        put16(central, entry.dosTime);
        put16(central, entry.dosDate);
        put32(central, crc);
        put32(central, quint32(stored.size()));
        put32(central, size);
        put16(central, quint16(entry.name.size()));
        put16(central, 0);
        put16(central, 0);
        put16(central, 0);
        put16(central, 0);
        put32(central, entry.externalAttributes);
        put32(central, offset);
        central.append(entry.name);
    }
    const quint32 centralOffset = quint32(out.size());
    out.append(central);
    put32(out, 0x06054b50);
    put16(out, 0);
    put16(out, 0);
    put16(out, quint16(entries.size()));
    put16(out, quint16(entries.size()));
    put32(out, quint32(central.size()));
    put32(out, centralOffset);
    put16(out, 0);
    return out;
}

inline bool write(const QString &path, const QList<Entry> &entries)
{
    QFile file(path);
    return file.open(QIODevice::WriteOnly | QIODevice::Truncate) && file.write(build(entries)) >= 0;
}

} // namespace ZipTestArchive

#endif // ZIPTESTARCHIVE_H
