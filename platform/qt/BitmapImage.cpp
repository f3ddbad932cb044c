// BitmapImage.cpp: the colour table and the zero-copy wrap of an RBitmap8.
#include "platform/qt/BitmapImage.h"

#include "render/RBitmap8.h"
#include "render/SystemPalette.h"

const QList<QRgb>& SystemColorTable()
{
    static const QList<QRgb> table = [] {
        QList<QRgb> colours;
        colours.reserve(256);
        for (int i = 0; i < 256; ++i) {
            const rgb_color& c = system_colors()->color_list[i];
            colours.push_back(qRgba(c.red, c.green, c.blue, i == 255 ? 0 : 255));
        }
        return colours;
    }();
    return table;
}

QImage ImageOf(RBitmap8& bitmap)
{
    QImage image(bitmap.Bits(), bitmap.Width(), bitmap.Height(), bitmap.BytesPerRow(),
        QImage::Format_Indexed8);
    image.setColorTable(SystemColorTable());
    return image;
}

QPixmap DragPixmap(RBitmap8& bitmap)
{
    return QPixmap::fromImage(ImageOf(bitmap).convertToFormat(QImage::Format_ARGB32));
}
