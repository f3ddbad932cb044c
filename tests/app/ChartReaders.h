// Reading the real program's charts off the test's screen: the origin read-out decoded glyph by
// glyph with the program's own font, stars counted as lit pixels, pictures compared.
#pragma once

#include "core/MessageCodes.h"
#include "render/RBMFont8.h"
#include "render/SystemPalette.h"
#include "resources/ResourceData.h"

#include <QElapsedTimer>
#include <QGuiApplication>
#include <QImage>
#include <QScreen>
#include <QTest>
#include <algorithm>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <string>

constexpr int kChartWidth = 329, kChartHeight = 329; // a chart's view, above its 12-pixel strip

// The screen's own pixels (one GetImage of the root window).
inline QImage Grab(QRect area)
{
    return QGuiApplication::primaryScreen()
        ->grabWindow(0, area.x(), area.y(), area.width(), area.height())
        .toImage()
        .convertToFormat(QImage::Format_RGB32);
}

// Reads the four lines of the origin read-out of a chart whose view's top-left is at `view`:
// each 7 x 14 cell is matched against the program's font, ink being the overlay's green.
class ReadOutReader {
public:
    ReadOutReader()
        : fResources((InitResources(), true))
        , fFont(int32_t(kFontType), kSystemFontId, kSystemFontStripWidth, kSystemFontCharHeight,
              kSystemFontCharWidth, kSystemFontFirstChar, kSystemFontLastChar)
    {
        const rgb_color green = system_colors()->color_list[55];
        fInk = qRgb(green.red, green.green, green.blue);
    }

    std::string Read(QPoint view) const { return Read(Grab(Area(view)), QPoint(0, 0)); }

    // The same read from a picture of the screen (an xwd dump, say) whose point `at` shows the
    // top-left of the read-out's area.
    std::string Read(const QImage& image, QPoint at) const
    {
        std::string text;
        for (int line = 0; line < 4; line++) {
            std::string row;
            for (int cell = 0; cell < 38; cell++)
                row += Decode(image, at.x() + 10 + cell * 7, at.y() + line * 14);
            while (!row.empty() && row.back() == ' ')
                row.pop_back();
            text += row + "\n";
        }
        return text;
    }

    // Where the read-out of the chart whose view's top-left is at `view` stands on the screen.
    static QRect Area(QPoint view)
    {
        const int baseline = static_cast<int>(kChartHeight - 1 - 45.0);
        return QRect(view.x(), view.y() + baseline - 13, 40 * 7 + 10, 4 * 14);
    }

private:
    // The character whose ink is exactly the green of the cell; '?' when none is.
    char Decode(const QImage& image, int left, int top) const
    {
        for (char c = kSystemFontFirstChar; c <= kSystemFontLastChar && c > 0; c++) {
            const uint8_t* glyph = fFont.GlyphBits(c);
            bool same = true;
            for (int y = 0; y < 14 && same; y++) {
                for (int x = 0; x < 7 && same; x++) {
                    const bool ink = glyph[y * fFont.StripBytesPerRow() + x] == 255;
                    same = ink == (image.pixel(left + x, top + y) == fInk);
                }
            }
            if (same)
                return c;
        }
        return '?';
    }

    bool fResources; // read before the font: the strip comes from them
    RBMFont8 fFont;
    QRgb fInk;
};

// The number after label in the read-out; for "DEC: " the whole angle, minutes included.
inline double Field(const std::string& text, const std::string& label)
{
    const size_t at = text.find(label);
    if (at == std::string::npos)
        return -1e9;
    double value = 0, minutes = 0;
    const char* p = text.c_str() + at + label.size();
    if (label == "DEC: " && std::sscanf(p, "%lfd %lf'", &value, &minutes) == 2)
        return value + (std::signbit(value) ? -minutes : minutes) / 60;
    return std::atof(p);
}

// The part of a chart's view above its read-out, where stars are counted.
inline QRect StarArea(QPoint view)
{
    return QRect(view, QSize(kChartWidth, kChartHeight - 60));
}

// Whether a pixel of a chart shows a star: lit, and not the overlay's green or the markers' red.
inline bool IsStarPixel(QRgb p)
{
    const rgb_color g = system_colors()->color_list[55], r = system_colors()->color_list[42];
    return qGray(p) > 20 && p != qRgb(g.red, g.green, g.blue) && p != qRgb(r.red, r.green, r.blue);
}

// Pixels of a picture of a chart that show stars.
inline int StarPixels(const QImage& image)
{
    int lit = 0;
    for (int y = 0; y < image.height(); y++) {
        for (int x = 0; x < image.width(); x++)
            lit += IsStarPixel(image.pixel(x, y));
    }
    return lit;
}

// The same on the screen, in the chart whose view's top-left is at `view`.
inline int StarPixels(QPoint view)
{
    return StarPixels(Grab(StarArea(view)));
}

// Pixels that differ between two pictures of one area; every pixel when the sizes differ.
inline int DifferentPixels(const QImage& a, const QImage& b)
{
    if (a.size() != b.size())
        return std::max(a.width() * a.height(), b.width() * b.height());
    int different = 0;
    for (int y = 0; y < a.height(); y++) {
        for (int x = 0; x < a.width(); x++)
            different += a.pixel(x, y) != b.pixel(x, y);
    }
    return different;
}

// A picture of area once it differs from `before` and has stayed the same for half a second;
// what area shows after `timeout` when that never comes.
inline QImage NewPicture(QRect area, const QImage& before, int timeout = 10000)
{
    QImage last, now;
    QElapsedTimer unchanged;
    (void)QTest::qWaitFor(
        [&] {
            now = Grab(area);
            if (now != last) {
                last = now;
                unchanged.start();
            }
            return now != before && unchanged.elapsed() >= 500;
        },
        timeout);
    return now;
}
