// BitmapImageTest.cpp: render bitmaps shown through Qt without copying, and drag pixmaps with
// index 255 transparent.
#include "platform/qt/BitmapImage.h"
#include "render/RBitmap8.h"
#include "render/SystemPalette.h"

#include <QGuiApplication>
#include <gtest/gtest.h>

namespace {

QGuiApplication& App()
{
    static int argc = 1;
    static char name[] = "test_resources";
    static char* argv[] = { name, nullptr };
    static QGuiApplication* app = new QGuiApplication(argc, argv);
    return *app;
}

TEST(BitmapImage, WrapsThePixelsWithoutCopying)
{
    RBitmap8 bitmap(BRect(0.0f, 0.0f, 9.0f, 4.0f));
    bitmap.EraseMap(0);
    bitmap.RenderPoint(3, 2, 42);
    QImage image = ImageOf(bitmap);
    EXPECT_EQ(image.constBits(), bitmap.Bits());
    EXPECT_EQ(image.width(), 10);
    EXPECT_EQ(image.height(), 5);
    EXPECT_EQ(image.bytesPerLine(), 12);
    EXPECT_EQ(image.format(), QImage::Format_Indexed8);
    const rgb_color c = system_colors()->color_list[42];
    EXPECT_EQ(image.pixel(3, 2), qRgb(c.red, c.green, c.blue));
    // Drawing after the wrap shows through: the image reads the bitmap's memory.
    bitmap.RenderPoint(4, 2, 63);
    EXPECT_EQ(image.pixelIndex(4, 2), 63);
}

TEST(BitmapImage, ColourTableIsThePaletteWithATransparentLastEntry)
{
    const QList<QRgb>& table = SystemColorTable();
    ASSERT_EQ(table.size(), 256);
    EXPECT_EQ(&table, &SystemColorTable());
    for (int i = 0; i < 255; ++i) {
        const rgb_color& c = system_colors()->color_list[i];
        EXPECT_EQ(table[i], qRgba(c.red, c.green, c.blue, 255)) << i;
    }
    EXPECT_EQ(qAlpha(table[255]), 0);
}

TEST(BitmapImage, DragPixmapIsTransparentWhereTheIndexIs255)
{
    App();
    RBitmap8 bitmap(BRect(0.0f, 0.0f, 31.0f, 31.0f));
    bitmap.EraseMap(255);
    bitmap.RenderSquare(8, 8, 4, 63);
    const QImage image = DragPixmap(bitmap).toImage();
    ASSERT_EQ(image.size(), QSize(32, 32));
    EXPECT_TRUE(image.hasAlphaChannel());
    EXPECT_EQ(qAlpha(image.pixel(0, 0)), 0);
    EXPECT_EQ(qAlpha(image.pixel(9, 9)), 255);
    EXPECT_EQ(image.pixel(9, 9) & 0xFFFFFF, 0xFFFFFFu);
}

} // namespace
