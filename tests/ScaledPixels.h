// Reading how the 8-bit views are shown at a scale factor: pictures of the screen's own pixels
// checked for blur (colours the palette does not have) and, at a scale of 2, for pixels of the
// views that are not whole blocks of 2 x 2 pixels of the screen.
#pragma once

#include "render/SystemPalette.h"

#include <QGuiApplication>
#include <QImage>
#include <QPalette>
#include <QSet>

// How many blocks of 2 x 2 pixels of image, from its top-left, are not all of one colour.
inline int MixedBlocks(const QImage& image)
{
    int mixed = 0;
    for (int y = 0; y + 1 < image.height(); y += 2) {
        for (int x = 0; x + 1 < image.width(); x += 2) {
            const QRgb p = image.pixel(x, y);
            mixed += image.pixel(x + 1, y) != p || image.pixel(x, y + 1) != p
                || image.pixel(x + 1, y + 1) != p;
        }
    }
    return mixed;
}

// How many pixels of image are of a colour that neither the system palette nor the windows'
// backgrounds (the views' grey, the toolkit's window colour, seen where a picture is transparent)
// have: blends of neighbouring pixels.
inline int BlendedPixels(const QImage& image)
{
    static const QSet<QRgb> shown = [] {
        QSet<QRgb> colours;
        for (int i = 0; i < 255; i++) {
            const rgb_color& c = system_colors()->color_list[i];
            colours.insert(qRgb(c.red, c.green, c.blue));
        }
        colours.insert(qRgb(220, 220, 220));
        colours.insert(QGuiApplication::palette().color(QPalette::Window).rgb());
        return colours;
    }();
    int blended = 0;
    for (int y = 0; y < image.height(); y++) {
        for (int x = 0; x < image.width(); x++)
            blended += !shown.contains(image.pixel(x, y) | 0xff000000u);
    }
    return blended;
}

// Whether picture shows more than one colour: something has been drawn.
inline bool Drawn(const QImage& picture)
{
    for (int y = 0; y < picture.height(); y++) {
        for (int x = 0; x < picture.width(); x++) {
            if (picture.pixel(x, y) != picture.pixel(0, 0))
                return true;
        }
    }
    return false;
}
