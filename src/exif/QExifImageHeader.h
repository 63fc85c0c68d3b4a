#ifndef QEXIFIMAGEHEADER_H
#define QEXIFIMAGEHEADER_H

#include "QExifValue.h"

#include <QByteArray>
#include <QDataStream>
#include <QList>
#include <QMap>
#include <QScopedPointer>
#include <QString>

class QIODevice;
class QExifImageHeaderPrivate;

// The Exif block of a JPEG file: the tags of IFD0, of the Exif IFD and of
// the GPS IFD, and the thumbnail. Reads the first APP1 segment of a file and
// writes a new block into a copy of it. It knows the TIFF layout, not what
// the tags mean.
class QExifImageHeader
{
public:
    // Tags that structure the block rather than describe the image.
    enum StructureTag {
        ExifIfdPointer = 34665,
        GpsIfdPointer = 34853,
        InteroperabilityIfdPointer = 40965,
        ThumbnailCompression = 259,
        ThumbnailOrientation = 274,
        ThumbnailXResolution = 282,
        ThumbnailYResolution = 283,
        ThumbnailResolutionUnit = 296,
        ThumbnailOffset = 513,
        ThumbnailLength = 514
    };

    QExifImageHeader();
    ~QExifImageHeader();

    void clear();

    bool loadFromJpeg(const QString &fileName);
    bool loadFromJpeg(QIODevice *device);
    // Reads a bare TIFF block from the device's position to its end.
    bool read(QIODevice *device);
    bool read(const QByteArray &tiffBlock);

    bool saveToJpeg(const QString &fileName);
    bool saveToJpeg(QIODevice *source, QIODevice *destination);
    // Writes the TIFF block at the device's position; returns its size, -1
    // when the device takes fewer bytes.
    qint64 write(QIODevice *device);
    QByteArray toTiffBlock();

    QDataStream::ByteOrder byteOrder() const;
    void setByteOrder(QDataStream::ByteOrder byteOrder);
    qint64 size() const;

    // The three tag maps: IFD0, the Exif IFD and the GPS IFD.
    enum Group { ImageGroup, ExtendedGroup, GpsGroup };

    QList<int> tags(Group group) const;
    bool contains(Group group, int tag) const;
    QExifValue value(Group group, int tag) const;
    void setValue(Group group, int tag, const QExifValue &value);
    void remove(Group group, int tag);

    QList<int> imageTags() const { return tags(ImageGroup); }
    bool containsImageTag(int tag) const { return contains(ImageGroup, tag); }
    QExifValue imageValue(int tag) const { return value(ImageGroup, tag); }
    void setImageValue(int tag, const QExifValue &value) { setValue(ImageGroup, tag, value); }
    void removeImageValue(int tag) { remove(ImageGroup, tag); }

    QList<int> extendedTags() const { return tags(ExtendedGroup); }
    bool containsExtendedTag(int tag) const { return contains(ExtendedGroup, tag); }
    QExifValue extendedValue(int tag) const { return value(ExtendedGroup, tag); }
    void setExtendedValue(int tag, const QExifValue &value) { setValue(ExtendedGroup, tag, value); }
    void removeExtendedValue(int tag) { remove(ExtendedGroup, tag); }

    QList<int> gpsTags() const { return tags(GpsGroup); }
    bool containsGpsTag(int tag) const { return contains(GpsGroup, tag); }
    QExifValue gpsValue(int tag) const { return value(GpsGroup, tag); }
    void setGpsValue(int tag, const QExifValue &value) { setValue(GpsGroup, tag, value); }
    void removeGpsValue(int tag) { remove(GpsGroup, tag); }

    QByteArray thumbnailData() const;
    void setThumbnailData(const QByteArray &data);
    QExifValue thumbnailXResolution() const;
    void setThumbnailXResolution(const QExifValue &value);
    QExifValue thumbnailYResolution() const;
    void setThumbnailYResolution(const QExifValue &value);
    QExifValue thumbnailResolutionUnit() const;
    void setThumbnailResolutionUnit(const QExifValue &value);
    QExifValue thumbnailOrientation() const;
    void setThumbnailOrientation(const QExifValue &value);

private:
    Q_DISABLE_COPY(QExifImageHeader)

    QScopedPointer<QExifImageHeaderPrivate> d;
};

#endif // QEXIFIMAGEHEADER_H
