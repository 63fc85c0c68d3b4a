// Reads every tag of every file given and prints "group.name value" lines,
// as exiv2 -pa and exiftool -s print theirs.
// Reports on stderr the files per second of the loop itself.
#include "ExifInfo.h"
#include "QExifImageHeader.h"

#include <QCoreApplication>
#include <QElapsedTimer>
#include <QMetaEnum>
#include <QTextStream>

#include <cstdio>

namespace {

// A value as text, the way a dump tool prints it: numbers, fractions, the
// string, or the bytes in hexadecimal.
void appendValue(QByteArray &out, const QExifValue &value)
{
    const auto join = [&out](const auto &vector, auto format) {
        for (int i = 0; i < vector.size(); ++i) {
            if (i)
                out += ' ';
            format(vector.at(i));
        }
    };
    const auto number = [&out](qint64 n) { out += QByteArray::number(n); };
    const auto fraction = [&out](const auto &r) {
        out += QByteArray::number(qint64(r.first));
        out += '/';
        out += QByteArray::number(qint64(r.second));
    };
    switch (value.type()) {
    case QExifValue::Ascii:
        out += value.toString().toUtf8();
        break;
    case QExifValue::Undefined:
        out += value.toByteArray().left(64).toHex(' ');
        break;
    case QExifValue::Byte:
        join(value.toByteVector(), number);
        break;
    case QExifValue::Short:
        join(value.toShortVector(), number);
        break;
    case QExifValue::Long:
        join(value.toLongVector(), number);
        break;
    case QExifValue::SignedLong:
        join(value.toSignedLongVector(), number);
        break;
    case QExifValue::Rational:
        join(value.toRationalVector(), fraction);
        break;
    case QExifValue::SignedRational:
        join(value.toSignedRationalVector(), fraction);
        break;
    default:
        break;
    }
}

void print(QByteArray &out, const char *group, const QMetaEnum &names, int tag, const QExifValue &value)
{
    out += group;
    out += '.';
    const char *name = names.valueToKey(tag);
    out += name ? QByteArray(name) : QByteArray::number(tag);
    out += ' ';
    appendValue(out, value);
    out += '\n';
}

} // namespace

int main(int argc, char **argv)
{
    QCoreApplication app(argc, argv);
    const QStringList files = app.arguments().mid(1);
    const QMetaEnum imageNames = QMetaEnum::fromType<ExifInfo::ImageTag>();
    const QMetaEnum extendedNames = QMetaEnum::fromType<ExifInfo::ExtendedTag>();
    const QMetaEnum gpsNames = QMetaEnum::fromType<ExifInfo::GpsTag>();

    QElapsedTimer timer;
    timer.start();
    QByteArray out;
    out.reserve(1 << 20);
    int loaded = 0;
    qint64 tags = 0;
    QExifImageHeader header;
    for (const QString &file : files) {
        if (!header.loadFromJpeg(file))
            continue;
        ++loaded;
        out += "== ";
        out += file.toUtf8();
        out += '\n';
        for (int tag : header.imageTags())
            print(out, "Image", imageNames, tag, header.imageValue(tag));
        for (int tag : header.extendedTags())
            print(out, "Extended", extendedNames, tag, header.extendedValue(tag));
        for (int tag : header.gpsTags())
            print(out, "Gps", gpsNames, tag, header.gpsValue(tag));
        tags += header.imageTags().size() + header.extendedTags().size() + header.gpsTags().size();
        if (out.size() > (1 << 20)) {
            fwrite(out.constData(), 1, size_t(out.size()), stdout);
            out.clear();
        }
    }
    fwrite(out.constData(), 1, size_t(out.size()), stdout);
    fflush(stdout);
    const double seconds = timer.nsecsElapsed() / 1e9;
    fprintf(stderr, "loomkit: %d of %d files with Exif, %lld tags, %.4f s in the loop, %.0f files/s\n", loaded,
            int(files.size()), tags, seconds, files.size() / seconds);
    return loaded == files.size() ? 0 : 1;
}
