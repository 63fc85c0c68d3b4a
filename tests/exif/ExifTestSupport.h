#ifndef EXIFTESTSUPPORT_H
#define EXIFTESTSUPPORT_H

#include <QByteArray>
#include <QColor>
#include <QJsonObject>
#include <QList>
#include <QString>
#include <QStringList>

// Helpers shared by the Exif and JPEG tests: sample JPEGs made with QImage,
// exiftool as the oracle, and a plain marker splitter to look at results.
namespace ExifTestSupport {

struct Segment
{
    quint16 marker;
    QByteArray data; // without marker and length
};

// A small baseline JPEG of the given size and colour, written by QImage.
bool makeJpeg(const QString &path, int width = 64, int height = 48, const QColor &color = Qt::darkCyan);

// Runs exiftool with -q -overwrite_original and the arguments on the file.
bool exiftoolWrite(const QString &path, const QStringList &arguments);

// exiftool -j -n -a -G1 of one file, with any extra arguments; empty on failure.
QJsonObject exiftoolRead(const QString &path, const QStringList &arguments = QStringList());

// The segments ahead of Start of Scan (SOI excluded) and the offset of SOS.
QList<Segment> segments(const QByteArray &jpeg, int *sosOffset = nullptr);

// A JPEG put together again from SOI, the segments and everything from SOS on.
QByteArray assemble(const QList<Segment> &segments, const QByteArray &scanAndRest);

QByteArray readFile(const QString &path);
bool writeFile(const QString &path, const QByteArray &data);

} // namespace ExifTestSupport

#endif // EXIFTESTSUPPORT_H
