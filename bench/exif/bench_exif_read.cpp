// Reads every tag of every file given and prints "group.name value" lines.
// Reports on stderr the files per second of the loop itself.
#include "ExifInfo.h"
#include "QExifImageHeader.h"

#include <QCoreApplication>
#include <QElapsedTimer>
#include <QMetaEnum>
#include <QTextStream>

#include <cstdio>

namespace {

QByteArray text(const QVariant &value)
{
    if (value.userType() == QMetaType::QVariantList) {
        QByteArray out;
        for (const QVariant &element : value.toList()) {
            if (!out.isEmpty())
                out += ' ';
            out += element.toString().toUtf8();
        }
        return out;
    }
    if (value.userType() == QMetaType::QByteArray)
        return value.toByteArray().toHex(' ');
    return value.toString().toUtf8();
}

void print(QByteArray &out, const char *group, const QMetaEnum &names, int tag, const QVariant &value)
{
    out += group;
    out += '.';
    const char *name = names.valueToKey(tag);
    out += name ? QByteArray(name) : QByteArray::number(tag);
    out += ' ';
    out += text(value);
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
            print(out, "Image", imageNames, tag, ExifInfo::toVariant(header.imageValue(tag)));
        for (int tag : header.extendedTags())
            print(out, "Extended", extendedNames, tag, ExifInfo::toVariant(header.extendedValue(tag)));
        for (int tag : header.gpsTags())
            print(out, "Gps", gpsNames, tag, ExifInfo::toVariant(header.gpsValue(tag)));
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
