#include "ExifTestSupport.h"

#include <QFile>
#include <QImage>
#include <QJsonArray>
#include <QJsonDocument>

namespace ExifTestSupport {

QString describe(const QExifValue &value)
{
    QStringList items;
    const auto numbers = [&items](const auto &vector) {
        for (auto v : vector)
            items.append(QString::number(v));
    };
    const auto pairs = [&items](const auto &vector) {
        for (const auto &v : vector)
            items.append(QStringLiteral("%1/%2").arg(v.first).arg(v.second));
    };
    switch (value.type()) {
    case QExifValue::Byte: numbers(value.toByteVector()); break;
    case QExifValue::Ascii: items.append(value.toString()); break;
    case QExifValue::Short: numbers(value.toShortVector()); break;
    case QExifValue::Long: numbers(value.toLongVector()); break;
    case QExifValue::Rational: pairs(value.toRationalVector()); break;
    case QExifValue::Undefined: items.append(QString::fromLatin1(value.toByteArray().toPercentEncoding())); break;
    case QExifValue::SignedLong: numbers(value.toSignedLongVector()); break;
    case QExifValue::SignedRational: pairs(value.toSignedRationalVector()); break;
    }
    return QString::number(value.type()) + QLatin1Char(':') + items.join(QLatin1Char(','));
}

bool makeJpeg(const QString &path, int width, int height, const QColor &color)
{
    QImage image(width, height, QImage::Format_RGB32);
    image.fill(color);
    for (int y = 0; y < height; y += 4)
        image.setPixel(y % width, y, qRgb(255, 255, 255));
    return image.save(path, "JPG", 90);
}

bool exiftoolWrite(const QString &path, const QStringList &arguments)
{
    int exitCode = -1;
    TestSupport::run(QStringLiteral("exiftool"),
                     QStringList{QStringLiteral("-q"), QStringLiteral("-overwrite_original")} + arguments + QStringList{path},
                     &exitCode);
    return exitCode == 0;
}

QJsonObject exiftoolRead(const QString &path, const QStringList &arguments)
{
    int exitCode = -1;
    const QByteArray output = TestSupport::run(
        QStringLiteral("exiftool"),
        QStringList{QStringLiteral("-j"), QStringLiteral("-n"), QStringLiteral("-a"), QStringLiteral("-G1")} + arguments
            + QStringList{path},
        &exitCode);
    const QJsonArray array = QJsonDocument::fromJson(output).array();
    return array.isEmpty() ? QJsonObject() : array.first().toObject();
}

QList<Segment> segments(const QByteArray &jpeg, int *sosOffset)
{
    QList<Segment> result;
    int pos = 2;
    while (pos + 4 <= jpeg.size()) {
        const quint16 marker = quint16(uchar(jpeg[pos]) << 8 | uchar(jpeg[pos + 1]));
        if (marker == 0xffda) {
            if (sosOffset)
                *sosOffset = pos;
            return result;
        }
        const int length = uchar(jpeg[pos + 2]) << 8 | uchar(jpeg[pos + 3]);
        result.append(Segment{marker, jpeg.mid(pos + 4, length - 2)});
        pos += 2 + length;
    }
    if (sosOffset)
        *sosOffset = -1;
    return result;
}

QByteArray readFile(const QString &path)
{
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}

bool writeFile(const QString &path, const QByteArray &data)
{
    QFile file(path);
    return file.open(QIODevice::WriteOnly) && file.write(data) == data.size();
}

} // namespace ExifTestSupport
