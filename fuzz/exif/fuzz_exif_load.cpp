// The Exif block reader, from a JPEG stream and from a bare TIFF block; what
// was read is written again and read back.
#include "QExifImageHeader.h"

#include <QBuffer>
#include <QLoggingCategory>

extern "C" int LLVMFuzzerInitialize(int *, char ***)
{
    QLoggingCategory::setFilterRules(QStringLiteral("*.warning=false"));
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    const QByteArray bytes = QByteArray::fromRawData(reinterpret_cast<const char *>(data), int(size));

    QBuffer buffer;
    buffer.setData(bytes);
    buffer.open(QIODevice::ReadOnly);
    QExifImageHeader header;
    if (header.loadFromJpeg(&buffer)) {
        QByteArray jpeg("\xff\xd8\xff\xda\x00\x02scan\xff\xd9", 12);
        QBuffer source(&jpeg);
        source.open(QIODevice::ReadOnly);
        QBuffer destination;
        destination.open(QIODevice::WriteOnly);
        header.saveToJpeg(&source, &destination);
    }

    QExifImageHeader bare;
    if (bare.read(bytes)) {
        const QByteArray block = bare.toTiffBlock();
        QExifImageHeader again;
        again.read(block);
    }
    return 0;
}
