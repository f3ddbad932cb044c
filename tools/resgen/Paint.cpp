// Paint.cpp: coverage blending by distance: a pixel's coverage is how far its centre lies inside
// a shape's edge, clamped to 0..1, which gives half-pixel-accurate edges in the palette's colours.
#include "Paint.h"

#include "render/SystemPalette.h"

#include <algorithm>
#include <cmath>

uint8_t Nearest(Rgb c)
{
    const auto channel = [](int v) { return uint8_t(std::clamp(v, 0, 255)); };
    return system_colors()->index_map[IndexOf15(channel(c.r), channel(c.g), channel(c.b))];
}

Rgb ColorOf(uint8_t index)
{
    const rgb_color& c = system_colors()->color_list[index];
    return { c.red, c.green, c.blue };
}

Rgb Mix(Rgb a, Rgb b, double t)
{
    const auto lerp = [t](int u, int v) { return int(std::lround(u + (v - u) * t)); };
    return { lerp(a.r, b.r), lerp(a.g, b.g), lerp(a.b, b.b) };
}

void Blend(RBitmap8& bitmap, int x, int y, Rgb colour, double coverage)
{
    if (x < 0 || y < 0 || x >= bitmap.Width() || y >= bitmap.Height() || coverage <= 0.0)
        return;
    const uint8_t current = bitmap.Bits()[y * bitmap.BytesPerRow() + x];
    if (current == kClear) {
        if (coverage >= 0.5)
            bitmap.RenderPoint(x, y, Nearest(colour));
        return;
    }
    bitmap.RenderPoint(x, y, Nearest(Mix(ColorOf(current), colour, std::min(coverage, 1.0))));
}

namespace {

template <typename Coverage>
void Shade(RBitmap8& bitmap, double x0, double y0, double x1, double y1, Rgb colour, Coverage f)
{
    const int left = std::max(0, int(std::floor(x0)) - 1);
    const int top = std::max(0, int(std::floor(y0)) - 1);
    const int right = std::min(bitmap.Width() - 1, int(std::ceil(x1)) + 1);
    const int bottom = std::min(bitmap.Height() - 1, int(std::ceil(y1)) + 1);
    for (int y = top; y <= bottom; ++y) {
        for (int x = left; x <= right; ++x)
            Blend(bitmap, x, y, colour, std::clamp(f(x, y), 0.0, 1.0));
    }
}

} // namespace

void Disc(RBitmap8& bitmap, double cx, double cy, double radius, Rgb colour)
{
    Shade(bitmap, cx - radius, cy - radius, cx + radius, cy + radius, colour,
        [=](int x, int y) { return radius + 0.5 - std::hypot(x - cx, y - cy); });
}

void Ring(RBitmap8& bitmap, double cx, double cy, double radius, double thickness, Rgb colour)
{
    const double outer = radius + thickness / 2.0;
    Shade(bitmap, cx - outer, cy - outer, cx + outer, cy + outer, colour, [=](int x, int y) {
        return thickness / 2.0 + 0.5 - std::fabs(std::hypot(x - cx, y - cy) - radius);
    });
}

void Stroke(
    RBitmap8& bitmap, double x0, double y0, double x1, double y1, double thickness, Rgb colour)
{
    const double dx = x1 - x0, dy = y1 - y0;
    const double lengthSquared = std::max(dx * dx + dy * dy, 1e-9);
    const double half = thickness / 2.0;
    Shade(bitmap, std::min(x0, x1) - half, std::min(y0, y1) - half, std::max(x0, x1) + half,
        std::max(y0, y1) + half, colour, [=](int x, int y) {
            const double t = std::clamp(((x - x0) * dx + (y - y0) * dy) / lengthSquared, 0.0, 1.0);
            return half + 0.5 - std::hypot(x - (x0 + t * dx), y - (y0 + t * dy));
        });
}

void Arrow(
    RBitmap8& bitmap, double x0, double y0, double x1, double y1, double thickness, Rgb colour)
{
    Stroke(bitmap, x0, y0, x1, y1, thickness, colour);
    const double angle = std::atan2(y1 - y0, x1 - x0);
    const double head = 2.0 + thickness * 1.6;
    for (const double side : { 2.5, -2.5 }) {
        Stroke(bitmap, x1, y1, x1 + head * std::cos(angle + side),
            y1 + head * std::sin(angle + side), thickness, colour);
    }
}

void Ellipse(RBitmap8& bitmap, double cx, double cy, double rx, double ry, double thickness,
    Rgb colour, double fromAngle, double toAngle)
{
    const int steps = std::max(8, int((toAngle - fromAngle) * std::max(rx, ry)));
    double px = cx + rx * std::cos(fromAngle), py = cy + ry * std::sin(fromAngle);
    for (int i = 1; i <= steps; ++i) {
        const double a = fromAngle + (toAngle - fromAngle) * i / steps;
        const double qx = cx + rx * std::cos(a), qy = cy + ry * std::sin(a);
        Stroke(bitmap, px, py, qx, qy, thickness, colour);
        px = qx;
        py = qy;
    }
}

void Sparkle(RBitmap8& bitmap, double cx, double cy, double size, Rgb core, Rgb rays)
{
    // A thin dark outline under the rays keeps them visible on light backgrounds; the rays taper
    // from the core as strokes of shrinking width.
    const Rgb outline { 24, 24, 56 };
    Stroke(bitmap, cx - size * 0.8, cy, cx + size * 0.8, cy, 2.6, outline);
    Stroke(bitmap, cx, cy - size * 0.8, cx, cy + size * 0.8, 2.6, outline);
    for (int k = 0; k < 3; ++k) {
        const double reach = size * (1.0 - 0.25 * k);
        const double width = 1.0 + 0.5 * k;
        Stroke(bitmap, cx - reach, cy, cx + reach, cy, width, Mix(rays, core, k / 2.0));
        Stroke(bitmap, cx, cy - reach, cx, cy + reach, width, Mix(rays, core, k / 2.0));
    }
    Disc(bitmap, cx, cy, size * 0.28, core);
}

void ButtonFace(RBitmap8& bitmap, Face face, bool dark)
{
    const int w = bitmap.Width(), h = bitmap.Height();
    bitmap.EraseMap(kClear);
    const double radius = w <= 12 || h <= 12 ? 2.0 : 3.0;
    // Rounded-rectangle coverage of pixel (x, y), inset by inset pixels.
    const auto inside = [&](int x, int y, double inset) {
        const double r = std::max(0.5, radius - inset);
        const double qx = std::clamp(x + 0.0, inset + r, w - 1 - inset - r);
        const double qy = std::clamp(y + 0.0, inset + r, h - 1 - inset - r);
        return r + 0.5 - std::hypot(x - qx, y - qy);
    };
    const bool pressed = face == Face::Pressed;
    const Rgb top = dark ? (face == Face::Hover ? Rgb { 40, 56, 110 } : Rgb { 24, 32, 72 })
                         : (face == Face::Hover ? Rgb { 250, 250, 250 } : Rgb { 236, 236, 236 });
    const Rgb bottom = dark ? Rgb { 0, 0, 24 }
                            : (face == Face::Hover ? Rgb { 214, 220, 232 } : Rgb { 196, 196, 196 });
    const Rgb outline = face == Face::Hover ? Rgb { 0, 80, 200 } : Rgb { 72, 72, 72 };
    const Rgb light = dark ? Rgb { 112, 128, 176 } : Rgb { 255, 255, 255 };
    const Rgb shade = dark ? Rgb { 0, 0, 0 } : Rgb { 144, 144, 144 };
    for (int y = 0; y < h; ++y) {
        const double t = h > 1 ? double(y) / (h - 1) : 0.0;
        const Rgb fill
            = pressed ? Mix(Mix(bottom, shade, 0.25), top, t * 0.6) : Mix(top, bottom, t);
        for (int x = 0; x < w; ++x) {
            const double cover = std::clamp(inside(x, y, 0.0), 0.0, 1.0);
            if (cover <= 0.0)
                continue;
            const double border = std::clamp(inside(x, y, 1.0), 0.0, 1.0);
            // Outline where the inner shape ends; antialiased corners against transparency.
            Rgb colour = Mix(outline, fill, border);
            if (border >= 1.0) {
                const bool topLeft = inside(x, y, 2.0) < 1.0 && (x + y) < (w + h) / 2;
                const bool bottomRight = inside(x, y, 2.0) < 1.0 && !topLeft;
                if (topLeft)
                    colour = pressed ? Mix(fill, shade, 0.6) : Mix(fill, light, 0.7);
                else if (bottomRight)
                    colour = pressed ? Mix(fill, light, 0.3) : Mix(fill, shade, 0.5);
            }
            if (cover >= 0.5)
                bitmap.RenderPoint(x, y, Nearest(colour));
        }
    }
}
