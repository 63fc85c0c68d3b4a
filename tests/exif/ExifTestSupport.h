#ifndef EXIFTESTSUPPORT_H
#define EXIFTESTSUPPORT_H

#include "QExifValue.h"
#include "TestSupport.h"

#include <QByteArray>
#include <QColor>
#include <QJsonObject>
#include <QList>
#include <QString>
#include <QStringList>

// Oracle tests need exiftool; scripts/setup-debian.sh installs it.
#define SKIP_WITHOUT_EXIFTOOL()                                                                                          \
    if (!TestSupport::hasProgram(QStringLiteral("exiftool")))                                                            \
    QSKIP("exiftool is not installed")

// Helpers shared by the Exif and JPEG tests: sample JPEGs made with QImage,
// exiftool as the oracle, and a plain marker splitter to look at results.
namespace ExifTestSupport {

struct Segment
{
    quint16 marker;
    QByteArray data; // without marker and length
};

template<typename Pair>
double ratio(const Pair &r)
{
    return double(r.first) / r.second;
}

// A value as "type:item,item", e.g. "3:8,0,0", "5:1/2" or "7:01%00" for
// UNDEFINED bytes (percent-encoded), to compare values and show them.
QString describe(const QExifValue &value);

// A small baseline JPEG of the given size and colour, written by QImage.
bool makeJpeg(const QString &path, int width = 64, int height = 48, const QColor &color = Qt::darkCyan);

// Runs exiftool with -q -overwrite_original and the arguments on the file.
bool exiftoolWrite(const QString &path, const QStringList &arguments);

// exiftool -j -n -a -G1 of one file, with any extra arguments; empty on failure.
QJsonObject exiftoolRead(const QString &path, const QStringList &arguments = QStringList());

// The segments ahead of Start of Scan (SOI excluded) and the offset of SOS.
QList<Segment> segments(const QByteArray &jpeg, int *sosOffset = nullptr);

QByteArray readFile(const QString &path);
bool writeFile(const QString &path, const QByteArray &data);

// Rewrites the file with its segments passed through edit; false on failure.
template<typename Edit>
bool editSegments(const QString &path, Edit edit)
{
    int sos = -1;
    const QByteArray jpeg = readFile(path);
    QList<Segment> list = segments(jpeg, &sos);
    edit(list);
    QByteArray edited("\xff\xd8", 2);
    for (const Segment &segment : list) {
        const int length = segment.data.size() + 2;
        edited.append(char(segment.marker >> 8)).append(char(segment.marker)).append(char(length >> 8)).append(char(length));
        edited.append(segment.data);
    }
    return sos > 0 && writeFile(path, edited + jpeg.mid(sos));
}

} // namespace ExifTestSupport

#endif // EXIFTESTSUPPORT_H
