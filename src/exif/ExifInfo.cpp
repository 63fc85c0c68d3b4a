#include "ExifInfo.h"
#include "EnumUtility.h"
#include "FileUtility.h"
#include "LoomkitLogging.h"

#include <QDateTime>
#include <QJSValue>
#include <QRegularExpression>
#include <QTextCodec>

#include <algorithm>
#include <cmath>
#include <limits>

namespace {

using Conversion = ExifInfo::Conversion;

const Conversion imageConversions[] = {
    {ExifInfo::ImageWidth, ExifInfo::ConvertLong, 1},
    {ExifInfo::ImageLength, ExifInfo::ConvertLong, 1},
    {ExifInfo::ImageBitsPerSample, ExifInfo::ConvertShort, 3},
    {ExifInfo::ImageCompression, ExifInfo::ConvertShort, 1},
    {ExifInfo::ImagePhotometricInterpretation, ExifInfo::ConvertShort, 1},
    {ExifInfo::ImageOrientation, ExifInfo::ConvertShort, 1},
    {ExifInfo::ImageSamplesPerPixel, ExifInfo::ConvertShort, 1},
    {ExifInfo::ImagePlanarConfiguration, ExifInfo::ConvertShort, 1},
    {ExifInfo::ImageYCbCrSubSampling, ExifInfo::ConvertShort, 2},
    {ExifInfo::ImageXResolution, ExifInfo::ConvertRational, 1},
    {ExifInfo::ImageYResolution, ExifInfo::ConvertRational, 1},
    {ExifInfo::ImageResolutionUnit, ExifInfo::ConvertShort, 1},
    {ExifInfo::ImageStripOffsets, ExifInfo::ConvertLong, 0},
    {ExifInfo::ImageRowsPerStrip, ExifInfo::ConvertLong, 1},
    {ExifInfo::ImageStripByteCounts, ExifInfo::ConvertLong, 0},
    {ExifInfo::ImageTransferFunction, ExifInfo::ConvertShort, 768},
    {ExifInfo::ImageWhitePoint, ExifInfo::ConvertRational, 2},
    {ExifInfo::ImagePrimaryChromaticities, ExifInfo::ConvertRational, 6},
    {ExifInfo::ImageYCbCrCoefficients, ExifInfo::ConvertRational, 3},
    {ExifInfo::ImageReferenceBlackWhite, ExifInfo::ConvertRational, 6},
    {ExifInfo::ImageDateTime, ExifInfo::ConvertAscii, 20},
    {ExifInfo::ImageDescription, ExifInfo::ConvertAscii, 0},
    {ExifInfo::ImageMake, ExifInfo::ConvertAscii, 0},
    {ExifInfo::ImageModel, ExifInfo::ConvertAscii, 0},
    {ExifInfo::ImageSoftware, ExifInfo::ConvertAscii, 0},
    {ExifInfo::ImageArtist, ExifInfo::ConvertAscii, 0},
    {ExifInfo::ImageCopyright, ExifInfo::ConvertAscii, 0},
    {ExifInfo::ImageXPTitle, ExifInfo::ConvertUtf16, 0},
    {ExifInfo::ImageXPComment, ExifInfo::ConvertUtf16, 0},
    {ExifInfo::ImageXPAuthor, ExifInfo::ConvertUtf16, 0},
    {ExifInfo::ImageXPKeywords, ExifInfo::ConvertUtf16, 0},
    {ExifInfo::ImageXPSubject, ExifInfo::ConvertUtf16, 0},
    {ExifInfo::ImageRating, ExifInfo::ConvertShort, 1},
    {ExifInfo::ImageRatingPercent, ExifInfo::ConvertShort, 1},
    {ExifInfo::ImageLensSpecification, ExifInfo::ConvertRational, 4},
    {ExifInfo::ImageLensMake, ExifInfo::ConvertAscii, 0},
    {ExifInfo::ImageLensModel, ExifInfo::ConvertAscii, 0},
    {ExifInfo::ImageLensSerialNumber, ExifInfo::ConvertAscii, 0},
};

const Conversion extendedConversions[] = {
    {ExifInfo::ExtendedExifVersion, ExifInfo::ConvertUndefined, 4},
    {ExifInfo::ExtendedFlashPixVersion, ExifInfo::ConvertUndefined, 4},
    {ExifInfo::ExtendedComponentsConfiguration, ExifInfo::ConvertUndefined, 4},
    {ExifInfo::ExtendedColorSpace, ExifInfo::ConvertShort, 1},
    {ExifInfo::ExtendedCompressedBitsPerPixel, ExifInfo::ConvertRational, 1},
    {ExifInfo::ExtendedPixelXDimension, ExifInfo::ConvertLong, 1},
    {ExifInfo::ExtendedPixelYDimension, ExifInfo::ConvertLong, 1},
    {ExifInfo::ExtendedMakerNote, ExifInfo::ConvertUndefined, 0},
    {ExifInfo::ExtendedUserComment, ExifInfo::ConvertUndefined, 0},
    {ExifInfo::ExtendedOecf, ExifInfo::ConvertUndefined, 0},
    {ExifInfo::ExtendedSpatialFrequencyResponse, ExifInfo::ConvertUndefined, 0},
    {ExifInfo::ExtendedCfaPattern, ExifInfo::ConvertUndefined, 0},
    {ExifInfo::ExtendedDeviceSettingDescription, ExifInfo::ConvertUndefined, 0},
    {ExifInfo::ExtendedFileSource, ExifInfo::ConvertUndefined, 1},
    {ExifInfo::ExtendedSceneType, ExifInfo::ConvertUndefined, 1},
    {ExifInfo::ExtendedRelatedSoundFile, ExifInfo::ConvertAscii, 13},
    {ExifInfo::ExtendedDateTimeOriginal, ExifInfo::ConvertAscii, 20},
    {ExifInfo::ExtendedDateTimeDigitized, ExifInfo::ConvertAscii, 20},
    {ExifInfo::ExtendedSubSecTime, ExifInfo::ConvertAscii, 0},
    {ExifInfo::ExtendedSubSecTimeOriginal, ExifInfo::ConvertAscii, 0},
    {ExifInfo::ExtendedSubSecTimeDigitized, ExifInfo::ConvertAscii, 0},
    {ExifInfo::ExtendedSpectralSensitivity, ExifInfo::ConvertAscii, 0},
    {ExifInfo::ExtendedImageUniqueId, ExifInfo::ConvertAscii, 33},
    {ExifInfo::ExtendedExposureTime, ExifInfo::ConvertRational, 1},
    {ExifInfo::ExtendedFNumber, ExifInfo::ConvertRational, 1},
    {ExifInfo::ExtendedApertureValue, ExifInfo::ConvertRational, 1},
    {ExifInfo::ExtendedMaxApertureValue, ExifInfo::ConvertRational, 1},
    {ExifInfo::ExtendedSubjectDistance, ExifInfo::ConvertRational, 1},
    {ExifInfo::ExtendedFocalLength, ExifInfo::ConvertRational, 1},
    {ExifInfo::ExtendedFlashEnergy, ExifInfo::ConvertRational, 1},
    {ExifInfo::ExtendedFocalPlaneXResolution, ExifInfo::ConvertRational, 1},
    {ExifInfo::ExtendedFocalPlaneYResolution, ExifInfo::ConvertRational, 1},
    {ExifInfo::ExtendedExposureIndex, ExifInfo::ConvertRational, 1},
    {ExifInfo::ExtendedDigitalZoomRatio, ExifInfo::ConvertRational, 1},
    {ExifInfo::ExtendedGainControl, ExifInfo::ConvertRational, 1},
    {ExifInfo::ExtendedShutterSpeedValue, ExifInfo::ConvertSignedRational, 1},
    {ExifInfo::ExtendedBrightnessValue, ExifInfo::ConvertSignedRational, 1},
    {ExifInfo::ExtendedExposureBiasValue, ExifInfo::ConvertSignedRational, 1},
    {ExifInfo::ExtendedExposureProgram, ExifInfo::ConvertShort, 1},
    {ExifInfo::ExtendedMeteringMode, ExifInfo::ConvertShort, 1},
    {ExifInfo::ExtendedLightSource, ExifInfo::ConvertShort, 1},
    {ExifInfo::ExtendedFlash, ExifInfo::ConvertShort, 1},
    {ExifInfo::ExtendedFocalPlaneResolutionUnit, ExifInfo::ConvertShort, 1},
    {ExifInfo::ExtendedSensingMethod, ExifInfo::ConvertShort, 1},
    {ExifInfo::ExtendedCustomRendered, ExifInfo::ConvertShort, 1},
    {ExifInfo::ExtendedExposureMode, ExifInfo::ConvertShort, 1},
    {ExifInfo::ExtendedWhiteBalance, ExifInfo::ConvertShort, 1},
    {ExifInfo::ExtendedFocalLengthIn35mmFilm, ExifInfo::ConvertShort, 1},
    {ExifInfo::ExtendedSceneCaptureType, ExifInfo::ConvertShort, 1},
    {ExifInfo::ExtendedContrast, ExifInfo::ConvertShort, 1},
    {ExifInfo::ExtendedSaturation, ExifInfo::ConvertShort, 1},
    {ExifInfo::ExtendedSharpness, ExifInfo::ConvertShort, 1},
    {ExifInfo::ExtendedSubjectDistanceRange, ExifInfo::ConvertShort, 1},
    {ExifInfo::ExtendedISOSpeedRatings, ExifInfo::ConvertShort, 0},
    {ExifInfo::ExtendedSubjectArea, ExifInfo::ConvertShort, 0},
    {ExifInfo::ExtendedSubjectLocation, ExifInfo::ConvertShort, 2},
};

const Conversion gpsConversions[] = {
    {ExifInfo::GPSVersionID, ExifInfo::ConvertByte, 4},
    {ExifInfo::GPSLatitudeRef, ExifInfo::ConvertAscii, 2},
    {ExifInfo::GPSLatitude, ExifInfo::ConvertCoordinate, 3},
    {ExifInfo::GPSLongitudeRef, ExifInfo::ConvertAscii, 2},
    {ExifInfo::GPSLongitude, ExifInfo::ConvertCoordinate, 3},
    {ExifInfo::GPSAltitudeRef, ExifInfo::ConvertByte, 1},
    {ExifInfo::GPSAltitude, ExifInfo::ConvertRational, 1},
    {ExifInfo::GPSTimeStamp, ExifInfo::ConvertRational, 3},
    {ExifInfo::GPSSatellites, ExifInfo::ConvertAscii, 0},
    {ExifInfo::GPSStatus, ExifInfo::ConvertAscii, 2},
    {ExifInfo::GPSMeasureMode, ExifInfo::ConvertAscii, 2},
    {ExifInfo::GPSDOP, ExifInfo::ConvertRational, 1},
    {ExifInfo::GPSSpeedRef, ExifInfo::ConvertAscii, 2},
    {ExifInfo::GPSSpeed, ExifInfo::ConvertRational, 1},
    {ExifInfo::GPSTrackRef, ExifInfo::ConvertAscii, 2},
    {ExifInfo::GPSTrack, ExifInfo::ConvertRational, 1},
    {ExifInfo::GPSImgDirectionRef, ExifInfo::ConvertAscii, 2},
    {ExifInfo::GPSImgDirection, ExifInfo::ConvertRational, 1},
    {ExifInfo::GPSMapDatum, ExifInfo::ConvertAscii, 0},
    {ExifInfo::GPSDestLatitudeRef, ExifInfo::ConvertAscii, 2},
    {ExifInfo::GPSDestLatitude, ExifInfo::ConvertCoordinate, 3},
    {ExifInfo::GPSDestLongitudeRef, ExifInfo::ConvertAscii, 2},
    {ExifInfo::GPSDestLongitude, ExifInfo::ConvertCoordinate, 3},
    {ExifInfo::GPSDestBearingRef, ExifInfo::ConvertAscii, 2},
    {ExifInfo::GPSDestBearing, ExifInfo::ConvertRational, 1},
    {ExifInfo::GPSDestDistanceRef, ExifInfo::ConvertAscii, 2},
    {ExifInfo::GPSDestDistance, ExifInfo::ConvertRational, 1},
    {ExifInfo::GPSProcessingMethod, ExifInfo::ConvertUndefined, 0},
    {ExifInfo::GPSAreaInformation, ExifInfo::ConvertUndefined, 0},
    {ExifInfo::GPSDateStamp, ExifInfo::ConvertAscii, 11},
    {ExifInfo::GPSDifferential, ExifInfo::ConvertShort, 1},
    {ExifInfo::GPSHPositioningError, ExifInfo::ConvertRational, 1},
};

template <size_t N>
const Conversion *findConversion(const Conversion (&table)[N], int tag)
{
    const auto it = std::find_if(std::begin(table), std::end(table),
                                 [tag](const Conversion &row) { return row.tag == tag; });
    return it == std::end(table) ? nullptr : it;
}

const char exifDateFormat[] = "yyyy:MM:dd HH:mm:ss";

void notImplemented(const char *function, const QVariant &value)
{
    qCDebug(lcFile) << function << value.typeName() << "not implemented (yet)";
}

// A double's integer part as 32 bits, wrapping like a plain conversion on
// this platform but without its undefined cases (NaN, out of range).
quint32 wrapped32(double value)
{
    if (!(value == value))
        return 0;
    const double limit = 9.2e18;
    return quint32(quint64(qint64(qBound(-limit, value, limit))));
}

// The steps of the rational converter: a power of ten as denominator, at
// most ten times, until the fraction is within a millionth of the value.
QExifURational approximate(double value)
{
    quint32 denominator = 1;
    quint32 numerator = wrapped32(value + 0.5);
    for (int i = 0; i < 10 && std::fabs(double(numerator) / denominator - value) > value / 1000000; ++i) {
        denominator *= 10;
        numerator = wrapped32(double(denominator) * value + 0.5);
    }
    return QExifURational(numerator, denominator);
}

QVariant plainVariant(const QVariant &value)
{
    if (value.userType() == qMetaTypeId<QJSValue>())
        return value.value<QJSValue>().toVariant();
    return value;
}

bool isList(const QVariant &value)
{
    return value.userType() == QMetaType::QVariantList || value.userType() == QMetaType::QStringList;
}

template <typename T>
QExifValue numberValue(const QVariant &input, int size)
{
    QVariant value = input;
    if (value.userType() == QMetaType::QString) {
        // QRegularExpression matches from a const object: safe on any thread.
        static const QRegularExpression digits(QStringLiteral("^(\\d)(,\\d)*\\z"));
        const QString text = value.toString();
        if (digits.match(text).hasMatch()) {
            // The digits go on as text, which the loop below can't take.
            QVariantList list;
            for (const QString &digit : text.split(QLatin1Char(',')))
                list.append(digit);
            value = list;
        }
    }
    const QVariantList list = isList(value) ? value.toList() : QVariantList{value};

    int count = list.size();
    if (size != 0 && size < count)
        count = size;
    QVector<T> numbers;
    numbers.reserve(qMax(count, size));
    for (int i = 0; i < count; ++i) {
        const QVariant &element = list.at(i);
        switch (element.userType()) {
        case QMetaType::Int:
            numbers.append(T(element.toInt()));
            break;
        case QMetaType::UInt:
            numbers.append(T(element.toUInt()));
            break;
        case QMetaType::Double:
            numbers.append(T(wrapped32(element.toDouble())));
            break;
        default:
            notImplemented(Q_FUNC_INFO, element);
            break;
        }
    }
    // Padding counts from the list's length, so skipped elements leave the
    // value short.
    for (int i = count; i < size; ++i)
        numbers.append(T(0));
    return QExifValue(numbers);
}

QString exifText(const QVariant &value)
{
    if (value.userType() == QMetaType::QDateTime)
        return value.toDateTime().toString(QLatin1String(exifDateFormat));
    return value.toString();
}

template <typename R, typename Convert>
QExifValue rationalValue(const QVariantList &list, int size, Convert convert)
{
    int count = list.size();
    if (size != 0 && size < count)
        count = size;
    QVector<R> rationals;
    rationals.reserve(qMax(count, size));
    for (int i = 0; i < count; ++i)
        rationals.append(convert(list.at(i).toDouble()));
    for (int i = count; i < size; ++i)
        rationals.append(R(0, 1));
    return QExifValue(rationals);
}

QVariant scalarVariant(const QExifValue &value, int index)
{
    switch (value.type()) {
    case QExifValue::Byte:
        return index < 0 ? int(value.toByte()) : int(value.toByteVector().at(index));
    case QExifValue::Short:
        return index < 0 ? int(value.toShort()) : int(value.toShortVector().at(index));
    case QExifValue::Long:
        return index < 0 ? value.toLong() : value.toLongVector().at(index);
    case QExifValue::SignedLong:
        return index < 0 ? int(value.toLong()) : int(value.toSignedLongVector().at(index));
    case QExifValue::Rational: {
        const QExifURational r = index < 0 ? value.toRational() : value.toRationalVector().at(index);
        return double(r.first) / double(r.second);
    }
    case QExifValue::SignedRational: {
        const QExifSRational r = index < 0 ? value.toSignedRational() : value.toSignedRationalVector().at(index);
        return double(r.first) / double(r.second);
    }
    default:
        return QVariant();
    }
}

QVariant taggedValue(const QExifValue &value, const Conversion *conversion)
{
    if (conversion && conversion->converter == ExifInfo::ConvertUtf16 && value.type() == QExifValue::Byte) {
        const QVector<quint8> bytes = value.toByteVector();
        QByteArray text(reinterpret_cast<const char *>(bytes.constData()), bytes.size());
        while (text.size() >= 2 && text.at(text.size() - 1) == 0 && text.at(text.size() - 2) == 0)
            text.chop(2);
        if (QTextCodec *codec = QTextCodec::codecForName("UTF-16LE"))
            return codec->toUnicode(text);
        return QVariant();
    }
    return ExifInfo::toVariant(value);
}

QString tagName(const char *enumName, int tag)
{
    return QString::fromLatin1(EnumUtility::enumValueName(ExifInfo::staticMetaObject, enumName, tag));
}

} // namespace

ExifInfo::ExifInfo(QObject *parent)
    : FileInfo(parent)
{
}

ExifInfo::~ExifInfo() = default;

bool ExifInfo::isExifValid() const
{
    return m_valid;
}

QList<int> ExifInfo::imageTags() const
{
    return m_header.imageTags();
}

QList<int> ExifInfo::extendedTags() const
{
    return m_header.extendedTags();
}

QList<int> ExifInfo::gpsTags() const
{
    return m_header.gpsTags();
}

double ExifInfo::gpsLongitude() const
{
    if (!m_valid || !m_header.containsGpsTag(GPSLongitude))
        return qQNaN();
    const double degrees = toDegrees(m_header.gpsValue(GPSLongitude));
    if (m_header.containsGpsTag(GPSLongitudeRef)
        && m_header.gpsValue(GPSLongitudeRef).toString().left(1).toUpper() == QLatin1String("W")) {
        return -degrees;
    }
    return degrees;
}

void ExifInfo::setGpsLongitude(double longitude)
{
    setGpsValue(GPSLongitude, toDegreesMinutesSeconds(longitude));
    setGpsValue(GPSLongitudeRef, longitude < 0 ? QStringLiteral("W") : QStringLiteral("E"));
}

double ExifInfo::gpsLatitude() const
{
    if (!m_valid || !m_header.containsGpsTag(GPSLatitude))
        return qQNaN();
    const double degrees = toDegrees(m_header.gpsValue(GPSLatitude));
    if (m_header.containsGpsTag(GPSLatitudeRef)
        && m_header.gpsValue(GPSLatitudeRef).toString().left(1).toUpper() == QLatin1String("S")) {
        return -degrees;
    }
    return degrees;
}

void ExifInfo::setGpsLatitude(double latitude)
{
    setGpsValue(GPSLatitude, toDegreesMinutesSeconds(latitude));
    setGpsValue(GPSLatitudeRef, latitude < 0 ? QStringLiteral("S") : QStringLiteral("N"));
}

double ExifInfo::gpsAltitude() const
{
    if (!m_valid || !m_header.containsGpsTag(GPSAltitude))
        return qQNaN();
    // The reference is looked at but not applied: an altitude below sea
    // level reads as positive.
    const bool belowSeaLevel = toNumber(m_header.gpsValue(GPSAltitudeRef)) == 1;
    Q_UNUSED(belowSeaLevel)
    return toNumber(m_header.gpsValue(GPSAltitude));
}

void ExifInfo::setGpsAltitude(double altitude)
{
    setGpsValue(GPSAltitude, std::fabs(altitude));
    setGpsValue(GPSAltitudeRef, altitude < 0 ? 1 : 0);
}

QVariantMap ExifInfo::values() const
{
    QVariantMap map;
    for (int tag : m_header.imageTags())
        map.insert(tagName("ImageTag", tag), taggedValue(m_header.imageValue(tag), imageConversion(tag)));
    for (int tag : m_header.extendedTags())
        map.insert(tagName("ExtendedTag", tag), toVariant(m_header.extendedValue(tag)));
    for (int tag : m_header.gpsTags())
        map.insert(tagName("GpsTag", tag), toVariant(m_header.gpsValue(tag)));
    return map;
}

void ExifInfo::setValues(const QVariantMap &values)
{
    clear();
    for (auto it = values.cbegin(); it != values.cend(); ++it) {
        const QString &key = it.key();
        if (key.startsWith(QLatin1String("Image"))) {
            setImageValue(ImageTag(EnumUtility::enumValue(staticMetaObject, "ImageTag", key, 0)), it.value());
        } else if (key.startsWith(QLatin1String("Extended"))) {
            setExtendedValue(ExtendedTag(EnumUtility::enumValue(staticMetaObject, "ExtendedTag", key, 0)), it.value());
        } else if (key.startsWith(QLatin1String("Gps"))) {
            setGpsValue(GpsTag(EnumUtility::enumValue(staticMetaObject, "GpsTag", key, 0)), it.value());
        }
    }
    emit exifChanged();
}

void ExifInfo::setFilePath(const QString &path)
{
    const QString resolved = FileUtility::resolvedPath(path, true);
    if (resolved == m_info.filePath())
        return;
    loadResolvedPath(resolved);
}

void ExifInfo::setUrl(const QUrl &url)
{
    if (url == FileUtility::pathUrl(m_info.filePath()))
        return;
    loadResolvedPath(FileUtility::resolvedPath(url, true));
}

void ExifInfo::loadResolvedPath(const QString &resolvedPath)
{
    setFileInfo(resolvedPath);
    m_header.clear();
    m_valid = false;
    if (m_info.exists())
        m_valid = m_header.loadFromJpeg(resolvedPath);
    emit filePathChanged();
    emit exifChanged();
}

QExifImageHeader &ExifInfo::header()
{
    return m_header;
}

void ExifInfo::clear()
{
    m_header.clear();
    m_valid = true;
    emit exifChanged();
}

QVariant ExifInfo::imageValue(ImageTag tag) const
{
    if (!m_header.containsImageTag(tag))
        return QVariant();
    return taggedValue(m_header.imageValue(tag), imageConversion(tag));
}

void ExifInfo::setImageValue(ImageTag tag, const QVariant &value)
{
    setValue(QExifImageHeader::ImageGroup, tag, toExifValue(plainVariant(value), imageConversion(tag)));
}

void ExifInfo::removeImageValue(ImageTag tag)
{
    removeValue(QExifImageHeader::ImageGroup, tag);
}

QString ExifInfo::imageTagName(ImageTag tag) const
{
    return tagName("ImageTag", tag);
}

QVariant ExifInfo::extendedValue(ExtendedTag tag) const
{
    return groupValue(QExifImageHeader::ExtendedGroup, tag);
}

void ExifInfo::setExtendedValue(ExtendedTag tag, const QVariant &value)
{
    setValue(QExifImageHeader::ExtendedGroup, tag, toExifValue(plainVariant(value), extendedConversion(tag)));
}

void ExifInfo::removeExtendedValue(ExtendedTag tag)
{
    removeValue(QExifImageHeader::ExtendedGroup, tag);
}

QString ExifInfo::extendedTagName(ExtendedTag tag) const
{
    return tagName("ExtendedTag", tag);
}

QVariant ExifInfo::gpsValue(GpsTag tag) const
{
    return groupValue(QExifImageHeader::GpsGroup, tag);
}

void ExifInfo::setGpsValue(GpsTag tag, const QVariant &value)
{
    setValue(QExifImageHeader::GpsGroup, tag, toExifValue(plainVariant(value), gpsConversion(tag)));
}

void ExifInfo::removeGpsValue(GpsTag tag)
{
    removeValue(QExifImageHeader::GpsGroup, tag);
}

QString ExifInfo::gpsTagName(GpsTag tag) const
{
    return tagName("GpsTag", tag);
}

QVariant ExifInfo::groupValue(QExifImageHeader::Group group, int tag) const
{
    if (!m_header.contains(group, tag))
        return QVariant();
    return toVariant(m_header.value(group, tag));
}

// Every change, also to nothing, makes the data valid: it can be saved.
void ExifInfo::setValue(QExifImageHeader::Group group, int tag, const QExifValue &value)
{
    m_header.setValue(group, tag, value);
    m_valid = true;
    emit exifChanged();
}

void ExifInfo::removeValue(QExifImageHeader::Group group, int tag)
{
    m_header.remove(group, tag);
    m_valid = true;
    emit exifChanged();
}

bool ExifInfo::load(const QString &filePath)
{
    setFilePath(filePath);
    return m_valid;
}

bool ExifInfo::load(const QUrl &fileUrl)
{
    setUrl(fileUrl);
    return m_valid;
}

bool ExifInfo::save(const QString &filePath)
{
    static const QByteArray minimumExifVersion("0230");
    const QVariant exifVersion = extendedValue(ExtendedExifVersion);
    if (exifVersion.userType() != QMetaType::QByteArray || exifVersion.toByteArray() < minimumExifVersion) {
        m_header.setExtendedValue(ExtendedExifVersion, QExifValue(minimumExifVersion));
        m_valid = true;
    }

    const QVariantList gpsVersion = gpsValue(GPSVersionID).toList();
    const bool fourInts = gpsValue(GPSVersionID).userType() == QMetaType::QVariantList && gpsVersion.size() == 4
                          && std::all_of(gpsVersion.cbegin(), gpsVersion.cend(),
                                         [](const QVariant &v) { return v.userType() == QMetaType::Int; });
    if (!fourInts
        || ((gpsVersion[0].toInt() * 100 + gpsVersion[1].toInt()) * 100 + gpsVersion[2].toInt()) * 100
                   + gpsVersion[3].toInt()
               < 2030000) {
        m_header.setGpsValue(GPSVersionID, QExifValue(QVector<quint8>{2, 3, 0, 0}));
        m_valid = true;
    }

    return m_header.saveToJpeg(FileUtility::resolvedPath(filePath, true));
}

bool ExifInfo::save(const QUrl &fileUrl)
{
    return save(FileUtility::resolvedPath(fileUrl, true));
}

const ExifInfo::Conversion *ExifInfo::imageConversion(int tag)
{
    return findConversion(imageConversions, tag);
}

const ExifInfo::Conversion *ExifInfo::extendedConversion(int tag)
{
    return findConversion(extendedConversions, tag);
}

const ExifInfo::Conversion *ExifInfo::gpsConversion(int tag)
{
    return findConversion(gpsConversions, tag);
}

QExifValue ExifInfo::toExifValue(const QVariant &value, const Conversion *conversion)
{
    if (!conversion)
        return toExifValue(value, 0);
    const int size = conversion->size;
    switch (conversion->converter) {
    case ConvertByte:
        return toExifValueByte(value, size);
    case ConvertShort:
        return toExifValueShort(value, size);
    case ConvertLong:
        return toExifValueLong(value, size);
    case ConvertRational:
        return toExifValueRational(value, size);
    case ConvertSignedRational:
        return toExifValueSignedRational(value, size);
    case ConvertCoordinate:
        return toExifValueRational(value, size, true);
    case ConvertAscii:
        return toExifValueAscii(value, size);
    case ConvertUtf16:
        return toExifValueUtf16(value);
    case ConvertUndefined:
        return toExifValueUndefined(value, size);
    case ConvertDefault:
        break;
    }
    return toExifValue(value, size);
}

QExifValue ExifInfo::toExifValue(const QVariant &value, int size)
{
    if (isList(value)) {
        const QVariantList list = value.toList();
        if (list.isEmpty())
            return QExifValue();
        // A list's numbers go by its first element; note that a plain int
        // below takes another converter.
        switch (list.first().userType()) {
        case QMetaType::Int:
            return toExifValueByte(value, size);
        case QMetaType::UInt:
            return toExifValueLong(value, size);
        case QMetaType::Double:
            return toExifValueRational(value, size);
        default:
            notImplemented(Q_FUNC_INFO, list.first());
            return QExifValue();
        }
    }
    switch (value.userType()) {
    case QMetaType::Int:
        return toExifValueShort(value, size);
    case QMetaType::UInt:
        return toExifValueLong(value, size);
    case QMetaType::Double:
        return toExifValueRational(value, size);
    case QMetaType::QString:
    case QMetaType::QDateTime:
        return toExifValueAscii(value, size);
    case QMetaType::QByteArray:
        return toExifValueUndefined(value, size);
    default:
        return QExifValue();
    }
}

QExifValue ExifInfo::toExifValueByte(const QVariant &value, int size)
{
    return numberValue<quint8>(value, size);
}

QExifValue ExifInfo::toExifValueShort(const QVariant &value, int size)
{
    return numberValue<quint16>(value, size);
}

QExifValue ExifInfo::toExifValueLong(const QVariant &value, int size)
{
    return numberValue<quint32>(value, size);
}

QExifValue ExifInfo::toExifValueRational(const QVariant &value, int size, bool degrees)
{
    QVariantList list;
    if (value.userType() == QMetaType::QDateTime) {
        const QTime time = value.toDateTime().toUTC().time();
        list = {double(time.hour()), double(time.minute()), time.second() + time.msec() / 1000.0};
    } else if (isList(value)) {
        list = value.toList();
    } else if (degrees) {
        list = toDegreesMinutesSeconds(value.toDouble());
    } else {
        list = {value};
    }
    return rationalValue<QExifURational>(list, size, &ExifInfo::toRational);
}

QExifValue ExifInfo::toExifValueSignedRational(const QVariant &value, int size)
{
    const QVariantList list = isList(value) ? value.toList() : QVariantList{value};
    return rationalValue<QExifSRational>(list, size, &ExifInfo::toSignedRational);
}

QExifValue ExifInfo::toExifValueAscii(const QVariant &value, int size)
{
    QString text = exifText(value);
    if (size != 0)
        text = text.leftJustified(size - 1, QLatin1Char(' '), true);
    return QExifValue(text, QExifValue::NoEncoding);
}

QExifValue ExifInfo::toExifValueUtf16(const QVariant &value)
{
    QTextCodec *codec = QTextCodec::codecForName("UTF-16LE");
    QByteArray bytes = codec ? codec->fromUnicode(value.toString()) : QByteArray();
    // The codec puts a byte-order mark in front.
    if (bytes.startsWith("\xff\xfe"))
        bytes.remove(0, 2);
    return QExifValue(QVector<quint8>(bytes.cbegin(), bytes.cend()));
}

QExifValue ExifInfo::toExifValueUndefined(const QVariant &value, int size)
{
    QByteArray bytes;
    switch (value.userType()) {
    case QMetaType::Int:
    case QMetaType::UInt:
        bytes.append(char(value.toInt()));
        break;
    case QMetaType::Double:
        bytes.append(char(wrapped32(value.toDouble())));
        break;
    case QMetaType::QString:
        bytes = value.toString().toLatin1();
        break;
    case QMetaType::QByteArray:
        bytes = value.toByteArray();
        break;
    default:
        notImplemented(Q_FUNC_INFO, value);
        break;
    }
    if (size != 0) {
        if (bytes.size() > size)
            bytes.truncate(size);
        else
            bytes.append(QByteArray(size - bytes.size(), '\0'));
    }
    return QExifValue(bytes);
}

QVariant ExifInfo::toVariant(const QExifValue &value)
{
    if (value.type() == QExifValue::Ascii) {
        static const QRegularExpression dateTime(
            QStringLiteral("^([\\d]{4}):([\\d]{2}):([\\d]{2}) ([\\d]{2}):([\\d]{2}):([\\d]{2})\\z"));
        const QString text = value.toString();
        if (dateTime.match(text).hasMatch())
            return QDateTime::fromString(text, QLatin1String(exifDateFormat));
        return text;
    }
    if (value.type() == QExifValue::Undefined)
        return value.toByteArray();
    if (value.count() < 2)
        return scalarVariant(value, -1);

    QVariantList list;
    list.reserve(int(value.count()));
    for (int i = 0; i < int(value.count()); ++i)
        list.append(scalarVariant(value, i));
    return list;
}

QExifURational ExifInfo::toRational(double value)
{
    // Negative numbers have no unsigned fraction; they become a marker value.
    if (value < 0)
        return QExifURational(0, 9999);
    if (value == 0)
        return QExifURational(0, 1);
    return approximate(value);
}

QExifSRational ExifInfo::toSignedRational(double value)
{
    if (value == 0)
        return QExifSRational(0, 1);
    // The sign goes on the numerator, negated as 32 bits.
    const auto signedPart = [value](quint32 part) { return qint32(value < 0 ? 0u - part : part); };
    const double magnitude = std::fabs(value);
    if (magnitude >= 1) {
        const QExifURational r = approximate(magnitude);
        return QExifSRational(signedPart(r.first), qint32(r.second));
    }
    // Small values go by their reciprocal, so that they keep their digits.
    const QExifURational r = approximate(1 / magnitude);
    return QExifSRational(signedPart(r.second), qint32(r.first));
}

QVariantList ExifInfo::toDegreesMinutesSeconds(double value)
{
    const double magnitude = std::fabs(value);
    double degrees = std::trunc(magnitude);
    const double rest = (magnitude - degrees) * 60;
    double minutes = std::trunc(rest);
    double seconds = (rest - minutes) * 60;
    if (seconds >= 60) {
        seconds -= 60;
        minutes += 1;
        if (minutes >= 60) {
            minutes -= 60;
            degrees += 1;
        }
    }
    return QVariantList{degrees, minutes, seconds};
}

double ExifInfo::toDegrees(const QExifValue &value)
{
    // Missing minutes or seconds count as nothing.
    double parts[3] = {0, 0, 0};
    if (value.type() == QExifValue::Rational) {
        const QVector<QExifURational> r = value.toRationalVector();
        for (int i = 0; i < 3 && i < r.size(); ++i)
            parts[i] = double(r[i].first) / double(r[i].second);
    } else if (value.type() == QExifValue::SignedRational) {
        const QVector<QExifSRational> r = value.toSignedRationalVector();
        for (int i = 0; i < 3 && i < r.size(); ++i)
            parts[i] = double(r[i].first) / double(r[i].second);
    } else {
        return qQNaN();
    }
    return parts[0] + parts[1] / 60 + parts[2] / 3600;
}

double ExifInfo::toNumber(const QExifValue &value)
{
    if (value.count() != 1)
        return qQNaN();
    const QVariant number = scalarVariant(value, -1);
    return number.isValid() ? number.toDouble() : qQNaN();
}
