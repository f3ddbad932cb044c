// Charts.cpp: the chart-side images: the empty H-R diagram, the drag images, the plot marker and
// the "star3" glow sprite.
#include "Images.h"

#include "Paint.h"

#include "core/Constants.h"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <cstring>
#include <functional>

namespace {

Resource Single(const char* type, int32_t id, int w, int h, const char* name,
    const std::function<void(RBitmap8&)>& paint)
{
    RBitmap8 bitmap(BRect(0.0f, 0.0f, float(w - 1), float(h - 1)));
    bitmap.EraseMap(kClear);
    paint(bitmap);
    Resource r { type, id, w, h, 1, name, {} };
    r.bytes.assign(bitmap.Bits(), bitmap.Bits() + w * h);
    return r;
}

// The H-R diagram's geometry, shared with the viewer: class value v (O = 1 .. M = 7) at
// x = (v - 1) * 40 + 20, absolute magnitude m at y = (m + 7) * 11.2 + 15.
double ClassX(double v)
{
    return (v - 1.0) * 40.0 + 20.0;
}
double MagnitudeY(double m)
{
    return (m + 7.0) * 11.2 + 15.0;
}

void Text(RBitmap8& b, int x, int baseline, const char* text, Rgb colour)
{
    int32_t cx = x, cy = baseline;
    b.RenderString(x, cx, cy, text, Nearest(colour));
}

Resource Diagram(RBMFont8& font)
{
    return Single("Raw8", 0, 300, 295, "Empty H-R diagram: classes O..M, magnitudes -7..+17",
        [&](RBitmap8& b) {
            b.SetBMFont(&font);
            b.EraseMap(Nearest({ 0, 0, 30 }));
            const uint8_t grid = Nearest({ 0, 51, 102 });
            const uint8_t axis = Nearest({ 152, 152, 152 });
            const Rgb label { 203, 203, 203 };
            const int axisX = 18, axisY = 279;
            // Grid: a column at the start of every class, a row every five magnitudes, dotted.
            for (int v = 1; v <= 7; ++v) {
                const int x = int(ClassX(v));
                for (int y = 15; y < axisY; y += 2)
                    b.RenderPoint(x, y, grid);
                b.RenderVLine(x, axisY, 4, axis);
            }
            for (int m = -5; m <= 15; m += 5) {
                const int y = int(MagnitudeY(m));
                for (int x = axisX + 2; x < 300; x += 2)
                    b.RenderPoint(x, y, grid);
            }
            // Axes and ticks: one a magnitude, longer every five.
            b.RenderVLine(axisX, 15, axisY - 15 + 1, axis);
            b.RenderHLine(axisX, axisY, 300 - axisX, axis);
            for (int m = -7; MagnitudeY(m) < axisY; ++m)
                b.RenderHLine(
                    axisX - (m % 5 == 0 ? 4 : 2), int(MagnitudeY(m)), m % 5 == 0 ? 4 : 2, axis);
            // Magnitude labels, right-aligned against the ticks and centred on their rows.
            for (int m = -5; m <= 15; m += 5) {
                char text[8];
                std::snprintf(text, sizeof text, "%d", m);
                const int width = int(std::strlen(text)) * 7;
                Text(b, std::max(0, axisX - 3 - width), int(MagnitudeY(m)) + 5, text, label);
            }
            // Class letters under their columns, each in the colour of its stars.
            const char letters[] = "OBAFGKM";
            const Rgb colours[] = { { 102, 152, 255 }, { 152, 203, 255 }, { 203, 203, 255 },
                { 255, 255, 203 }, { 255, 255, 102 }, { 255, 152, 51 }, { 255, 102, 51 } };
            for (int v = 1; v <= 7; ++v) {
                const char text[2] = { letters[v - 1], 0 };
                Text(b, int(ClassX(v)) - 3, 294, text, colours[v - 1]);
            }
            // Axis titles along the top, above magnitude -7.
            Text(b, 1, 13, "Mv", label);
            Text(b, 300 - 14 * 7 - 2, 13, "Spectral class", label);
            Text(b, 22, 13, "Hot", colours[0]);
            Text(b, 22 + 4 * 7, 13, "Cool", colours[6]);
        });
}

Resource StarDrag(int32_t id)
{
    const bool several = id == 3;
    return Single("Raw8", id, 32, 32,
        several ? "Drag image: several star systems" : "Drag image: one star system",
        [&](RBitmap8& b) {
            struct Star {
                double x, y, size;
                Rgb core, rays;
            };
            const Star one[] = { { 15.5, 15.5, 12.0, { 255, 255, 220 }, { 255, 203, 51 } } };
            const Star many[] = { { 11.0, 11.0, 8.5, { 255, 255, 220 }, { 255, 203, 51 } },
                { 23.5, 8.0, 4.5, { 220, 230, 255 }, { 102, 152, 255 } },
                { 23.0, 22.0, 6.5, { 255, 230, 200 }, { 255, 120, 51 } },
                { 8.0, 25.0, 4.0, { 220, 230, 255 }, { 152, 203, 255 } } };
            const Star* stars = several ? many : one;
            const int count = several ? 4 : 1;
            // A dark halo first, so the star stands out on the light window background too.
            for (int i = 0; i < count; ++i)
                Disc(b, stars[i].x, stars[i].y, stars[i].size * 0.45, { 24, 24, 56 });
            for (int i = 0; i < count; ++i)
                Sparkle(b, stars[i].x, stars[i].y, stars[i].size, stars[i].core, stars[i].rays);
        });
}

Resource Marker()
{
    return Single("Raw8", 4, 8, 8, "Circle marker of a plotted star", [](RBitmap8& b) {
        Disc(b, 3.5, 3.5, 3.0, { 255, 255, 152 });
        Ring(b, 3.5, 3.5, 3.0, 1.0, { 203, 102, 0 });
        b.RenderPoint(2, 2, Nearest({ 255, 255, 255 }));
    });
}

// Intensity of the glow at distance r from its centre, at the polar angle a: saturated to
// 7 pixels, then a smooth fall whose reach wobbles a little with the angle so the rim is not a
// perfect circle; zero by about 29 pixels.
int GlowAt(double r, double a)
{
    constexpr double core = 7.0, reach = 22.0;
    if (r <= core)
        return 255;
    const double wobble = 1.0 + 0.05 * std::sin(5.0 * a + 0.7) + 0.03 * std::sin(11.0 * a + 2.1);
    const double s = std::clamp((r - core) / reach * wobble, 0.0, 1.0);
    const double fall = 1.0 - s * s * (3.0 - 2.0 * s); // smoothstep from 1 to 0
    return int(std::lround(255.0 * fall * fall));
}

Resource Glow()
{
    return Single("Raw8", 5, 64, 64, "\"star3\" glow (intensities)", [](RBitmap8& b) {
        for (int y = 0; y < 64; ++y) {
            for (int x = 0; x < 64; ++x) {
                const double dx = x - 31.5, dy = y - 31.5;
                b.RenderPoint(x, y, uint8_t(GlowAt(std::hypot(dx, dy), std::atan2(dy, dx) + kPI)));
            }
        }
    });
}

} // namespace

std::vector<Resource> ChartImages(RBMFont8& font)
{
    return { Diagram(font), StarDrag(2), StarDrag(3), Marker(), Glow() };
}
