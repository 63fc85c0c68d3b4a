// Writes <count> distinct JPEGs of 640x480 into a folder, and one small
// thumbnail, for run.sh to tag with exiftool.
#include <QGuiApplication>
#include <QDir>
#include <QImage>
#include <QPainter>

int main(int argc, char **argv)
{
    QGuiApplication app(argc, argv);
    if (argc < 3)
        return 2;
    const QDir dir(QString::fromLocal8Bit(argv[1]));
    const int count = atoi(argv[2]);
    for (int i = 0; i < count; ++i) {
        QImage image(640, 480, QImage::Format_RGB32);
        image.fill(QColor::fromHsv((i * 37) % 360, 120 + i % 100, 200));
        QPainter painter(&image);
        for (int k = 0; k < 40; ++k)
            painter.fillRect((k * 53 + i * 7) % 600, (k * 31 + i * 3) % 440, 40, 40, QColor::fromHsv((k * 23) % 360, 200, 150));
        painter.end();
        if (!image.save(dir.filePath(QStringLiteral("photo-%1.jpg").arg(i, 3, 10, QLatin1Char('0'))), "JPG", 85))
            return 1;
    }
    QImage thumbnail(160, 120, QImage::Format_RGB32);
    thumbnail.fill(Qt::darkGreen);
    return thumbnail.save(dir.filePath(QStringLiteral("thumbnail.jpg")), "JPG", 75) ? 0 : 1;
}
