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

QRegion OpaqueRegion(const RBitmap8& bitmap)
{
    // One rectangle for each run of opaque pixels in a row; drag images are 32 x 32, so the
    // handful of unions costs nothing.
    QRegion region;
    const uint8_t* row = bitmap.Bits();
    for (int32_t y = 0; y < bitmap.Height(); ++y, row += bitmap.BytesPerRow()) {
        int32_t x = 0;
        while (x < bitmap.Width()) {
            while (x < bitmap.Width() && row[x] == 255)
                ++x;
            const int32_t start = x;
            while (x < bitmap.Width() && row[x] != 255)
                ++x;
            if (x > start)
                region += QRect(start, y, x - start, 1);
        }
    }
    return region;
}
