// Draws src/images/defaultThumbnail.png: the picture shown for an item that
// has no thumbnail of its own. Run once; the PNG is committed.
#include <QGuiApplication>
#include <QImage>
#include <QLinearGradient>
#include <QPainter>
#include <QPainterPath>

int main(int argc, char *argv[])
{
    QGuiApplication app(argc, argv);
    const QString output = argc > 1 ? QString::fromLocal8Bit(argv[1]) : QStringLiteral("defaultThumbnail.png");

    const int width = 400, height = 266;
    QImage image(width, height, QImage::Format_ARGB32_Premultiplied);
    QPainter painter(&image);
    painter.setRenderHint(QPainter::Antialiasing);

    QLinearGradient background(0, 0, width, height);
    background.setColorAt(0, QColor(0x2b, 0x3a, 0x55));
    background.setColorAt(1, QColor(0x1b, 0x6a, 0x8a));
    painter.fillRect(image.rect(), background);

    // A soft woven pattern of diagonal threads.
    painter.setPen(QPen(QColor(255, 255, 255, 18), 10));
    for (int x = -height; x < width; x += 28)
        painter.drawLine(x, height, x + height, 0);

    // Four rounded tiles: a catalogue of items.
    const int tile = 54, gap = 14;
    const int left = (width - 2 * tile - gap) / 2, top = (height - 2 * tile - gap) / 2;
    const QColor tiles[] = { QColor(0xf2, 0xb1, 0x34), QColor(0xef, 0xef, 0xef),
                             QColor(0xef, 0xef, 0xef), QColor(0x5f, 0xd0, 0xc4) };
    for (int i = 0; i < 4; ++i) {
        const QRectF rect(left + (i % 2) * (tile + gap), top + (i / 2) * (tile + gap), tile, tile);
        painter.setPen(Qt::NoPen);
        painter.setBrush(QColor(0, 0, 0, 50));
        painter.drawRoundedRect(rect.translated(0, 3), 12, 12);
        painter.setBrush(tiles[i]);
        painter.drawRoundedRect(rect, 12, 12);
    }
    painter.end();
    return image.save(output) ? 0 : 1;
}
