#ifndef EXIFINFO_H
#define EXIFINFO_H

#include "FileInfo.h"
#include "QExifImageHeader.h"

#include <QList>
#include <QUrl>
#include <QVariant>
#include <QVariantMap>

// A file's Exif data for QML: the tags of IFD0 ("image"), of the Exif IFD
// ("extended") and of the GPS IFD, converted from and to QVariant, with the
// position as decimal degrees. Being a FileInfo, it also describes the file.
class ExifInfo : public FileInfo
{
    Q_OBJECT

    Q_PROPERTY(bool isExifValid READ isExifValid NOTIFY exifChanged)
    Q_PROPERTY(QList<int> imageTags READ imageTags NOTIFY exifChanged)
    Q_PROPERTY(QList<int> extendedTags READ extendedTags NOTIFY exifChanged)
    Q_PROPERTY(QList<int> gpsTags READ gpsTags NOTIFY exifChanged)
    Q_PROPERTY(double gpsLongitude READ gpsLongitude WRITE setGpsLongitude NOTIFY exifChanged)
    Q_PROPERTY(double gpsLatitude READ gpsLatitude WRITE setGpsLatitude NOTIFY exifChanged)
    Q_PROPERTY(double gpsAltitude READ gpsAltitude WRITE setGpsAltitude NOTIFY exifChanged)
    Q_PROPERTY(QVariantMap values READ values WRITE setValues NOTIFY exifChanged)

public:
    enum ImageTag {
        ImageWidth = 256,
        ImageLength = 257,
        ImageBitsPerSample = 258,
        ImageCompression = 259,
        ImagePhotometricInterpretation = 262,
        ImageOrientation = 274,
        ImageSamplesPerPixel = 277,
        ImagePlanarConfiguration = 284,
        ImageYCbCrSubSampling = 530,
        ImageYCbCrPosition = 531,
        ImageXResolution = 282,
        ImageYResolution = 283,
        ImageResolutionUnit = 296,
        ImageStripOffsets = 273,
        ImageRowsPerStrip = 278,
        ImageStripByteCounts = 279,
        ImageTransferFunction = 301,
        ImageWhitePoint = 318,
        ImagePrimaryChromaticities = 319,
        ImageYCbCrCoefficients = 529,
        ImageReferenceBlackWhite = 532,
        ImageDateTime = 306,
        ImageDescription = 270,
        ImageMake = 271,
        ImageModel = 272,
        ImageSoftware = 305,
        ImageArtist = 315,
        ImageCopyright = 33432,
        ImageXPTitle = 40091,
        ImageXPComment = 40092,
        ImageXPAuthor = 40093,
        ImageXPKeywords = 40094,
        ImageXPSubject = 40095,
        ImageRating = 18246,
        ImageRatingPercent = 18249,
        ImageLensSpecification = 42034,
        // Make and model share one number; the name lookup finds the make.
        ImageLensMake = 42035,
        ImageLensModel = 42035,
        ImageLensSerialNumber = 42036
    };
    Q_ENUM(ImageTag)

    enum ExtendedTag {
        ExtendedExifVersion = 36864,
        ExtendedFlashPixVersion = 40960,
        ExtendedColorSpace = 40961,
        ExtendedComponentsConfiguration = 37121,
        ExtendedCompressedBitsPerPixel = 37122,
        ExtendedPixelXDimension = 40962,
        ExtendedPixelYDimension = 40963,
        ExtendedMakerNote = 37500,
        ExtendedUserComment = 37510,
        ExtendedRelatedSoundFile = 40964,
        ExtendedDateTimeOriginal = 36867,
        ExtendedDateTimeDigitized = 36868,
        ExtendedSubSecTime = 37520,
        ExtendedSubSecTimeOriginal = 37521,
        ExtendedSubSecTimeDigitized = 37522,
        ExtendedImageUniqueId = 42016,
        ExtendedExposureTime = 33434,
        ExtendedFNumber = 33437,
        ExtendedExposureProgram = 34850,
        ExtendedSpectralSensitivity = 34852,
        ExtendedISOSpeedRatings = 34855,
        ExtendedOecf = 34856,
        ExtendedShutterSpeedValue = 37377,
        ExtendedApertureValue = 37378,
        ExtendedBrightnessValue = 37379,
        ExtendedExposureBiasValue = 37380,
        ExtendedMaxApertureValue = 37381,
        ExtendedSubjectDistance = 37382,
        ExtendedMeteringMode = 37383,
        ExtendedLightSource = 37384,
        ExtendedFlash = 37385,
        ExtendedFocalLength = 37386,
        ExtendedSubjectArea = 37396,
        ExtendedFlashEnergy = 41483,
        ExtendedSpatialFrequencyResponse = 41484,
        ExtendedFocalPlaneXResolution = 41486,
        ExtendedFocalPlaneYResolution = 41487,
        ExtendedFocalPlaneResolutionUnit = 41488,
        ExtendedSubjectLocation = 41492,
        ExtendedExposureIndex = 41493,
        ExtendedSensingMethod = 41495,
        ExtendedFileSource = 41728,
        ExtendedSceneType = 41729,
        ExtendedCfaPattern = 41730,
        ExtendedCustomRendered = 41985,
        ExtendedExposureMode = 41986,
        ExtendedWhiteBalance = 41987,
        ExtendedDigitalZoomRatio = 41988,
        ExtendedFocalLengthIn35mmFilm = 41989,
        ExtendedSceneCaptureType = 41990,
        ExtendedGainControl = 41991,
        ExtendedContrast = 41992,
        ExtendedSaturation = 41993,
        ExtendedSharpness = 41994,
        ExtendedDeviceSettingDescription = 41995,
        // Not the Exif number of this tag; kept as files carry it.
        ExtendedSubjectDistanceRange = 1036
    };
    Q_ENUM(ExtendedTag)

    // Every GPS tag under two names: the Exif form first, which the name
    // lookup finds, then the form whose keys begin with "Gps".
    enum GpsTag {
        GPSVersionID = 0,
        GPSLatitudeRef = 1,
        GPSLatitude = 2,
        GPSLongitudeRef = 3,
        GPSLongitude = 4,
        GPSAltitudeRef = 5,
        GPSAltitude = 6,
        GPSTimeStamp = 7,
        GPSSatellites = 8,
        GPSStatus = 9,
        GPSMeasureMode = 10,
        GPSDOP = 11,
        GPSSpeedRef = 12,
        GPSSpeed = 13,
        GPSTrackRef = 14,
        GPSTrack = 15,
        GPSImgDirectionRef = 16,
        GPSImgDirection = 17,
        GPSMapDatum = 18,
        GPSDestLatitudeRef = 19,
        GPSDestLatitude = 20,
        GPSDestLongitudeRef = 21,
        GPSDestLongitude = 22,
        GPSDestBearingRef = 23,
        GPSDestBearing = 24,
        GPSDestDistanceRef = 25,
        GPSDestDistance = 26,
        GPSProcessingMethod = 27,
        GPSAreaInformation = 28,
        GPSDateStamp = 29,
        GPSDifferential = 30,
        GPSHPositioningError = 31,
        GpsVersionId = 0,
        GpsLatitudeRef = 1,
        GpsLatitude = 2,
        GpsLongitudeRef = 3,
        GpsLongitude = 4,
        GpsAltitudeRef = 5,
        GpsAltitude = 6,
        GpsTimeStamp = 7,
        GpsSatellites = 8,
        GpsStatus = 9,
        GpsMeasureMode = 10,
        GpsDop = 11,
        GpsSpeedRef = 12,
        GpsSpeed = 13,
        GpsTrackRef = 14,
        GpsTrack = 15,
        GpsImageDirectionRef = 16,
        GpsImageDirection = 17,
        GpsMapDatum = 18,
        GpsDestLatitudeRef = 19,
        GpsDestLatitude = 20,
        GpsDestLongitudeRef = 21,
        GpsDestLongitude = 22,
        GpsDestBearingRef = 23,
        GpsDestBearing = 24,
        GpsDestDistanceRef = 25,
        GpsDestDistance = 26,
        GpsProcessingMethod = 27,
        GpsAreaInformation = 28,
        GpsDateStamp = 29,
        GpsDifferential = 30,
        GpsHorizontalPositionError = 31
    };
    Q_ENUM(GpsTag)

    // How a tag's QVariant becomes a QExifValue.
    enum Converter {
        ConvertDefault,
        ConvertByte,
        ConvertShort,
        ConvertLong,
        ConvertRational,
        ConvertSignedRational,
        ConvertCoordinate,
        ConvertAscii,
        ConvertUtf16,
        ConvertUndefined
    };

    struct Conversion
    {
        int tag;
        Converter converter;
        int size; // elements to produce, 0 for any
    };

    explicit ExifInfo(QObject *parent = nullptr);
    ~ExifInfo() override;

    bool isExifValid() const;
    QList<int> imageTags() const;
    QList<int> extendedTags() const;
    QList<int> gpsTags() const;
    double gpsLongitude() const;
    void setGpsLongitude(double longitude);
    double gpsLatitude() const;
    void setGpsLatitude(double latitude);
    double gpsAltitude() const;
    void setGpsAltitude(double altitude);
    QVariantMap values() const;
    void setValues(const QVariantMap &values);

    void setFilePath(const QString &path) override;
    void setUrl(const QUrl &url) override;

    QExifImageHeader &header();

    Q_INVOKABLE void clear();
    Q_INVOKABLE QVariant imageValue(ImageTag tag) const;
    Q_INVOKABLE void setImageValue(ImageTag tag, const QVariant &value);
    Q_INVOKABLE void removeImageValue(ImageTag tag);
    Q_INVOKABLE QString imageTagName(ImageTag tag) const;
    Q_INVOKABLE QVariant extendedValue(ExtendedTag tag) const;
    Q_INVOKABLE void setExtendedValue(ExtendedTag tag, const QVariant &value);
    Q_INVOKABLE void removeExtendedValue(ExtendedTag tag);
    Q_INVOKABLE QString extendedTagName(ExtendedTag tag) const;
    Q_INVOKABLE QVariant gpsValue(GpsTag tag) const;
    Q_INVOKABLE void setGpsValue(GpsTag tag, const QVariant &value);
    Q_INVOKABLE void removeGpsValue(GpsTag tag);
    Q_INVOKABLE QString gpsTagName(GpsTag tag) const;
    Q_INVOKABLE bool load(const QString &filePath);
    Q_INVOKABLE bool load(const QUrl &fileUrl);
    Q_INVOKABLE bool save(const QString &filePath);
    Q_INVOKABLE bool save(const QUrl &fileUrl);

    // The conversions, for each group's table and the fallback.
    static const Conversion *imageConversion(int tag);
    static const Conversion *extendedConversion(int tag);
    static const Conversion *gpsConversion(int tag);
    static QExifValue toExifValue(const QVariant &value, const Conversion *conversion);
    static QExifValue toExifValue(const QVariant &value, int size);
    static QExifValue toExifValueByte(const QVariant &value, int size);
    static QExifValue toExifValueShort(const QVariant &value, int size);
    static QExifValue toExifValueLong(const QVariant &value, int size);
    static QExifValue toExifValueRational(const QVariant &value, int size, bool degrees = false);
    static QExifValue toExifValueSignedRational(const QVariant &value, int size);
    static QExifValue toExifValueAscii(const QVariant &value, int size);
    static QExifValue toExifValueUtf16(const QVariant &value);
    static QExifValue toExifValueUndefined(const QVariant &value, int size);
    static QVariant toVariant(const QExifValue &value);
    static QExifURational toRational(double value);
    static QExifSRational toSignedRational(double value);
    static QVariantList toDegreesMinutesSeconds(double value);
    static double toDegrees(const QExifValue &value);
    static double toNumber(const QExifValue &value);

signals:
    void exifChanged();

private:
    void loadResolvedPath(const QString &resolvedPath);
    QVariant groupValue(QExifImageHeader::Group group, int tag) const;
    void setValue(QExifImageHeader::Group group, int tag, const QExifValue &value);
    void removeValue(QExifImageHeader::Group group, int tag);

    QExifImageHeader m_header;
    bool m_valid = false;
};

#endif // EXIFINFO_H
