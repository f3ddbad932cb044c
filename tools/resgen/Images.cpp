// Images.cpp: the pictures. Buttons share one bevelled face (Paint.cpp) and one set of ink
// colours, so the control window, the list window and the H-R window read as one program.
#include "Images.h"

#include "Paint.h"

#include "core/Constants.h"

#include <cmath>
#include <functional>

namespace {

// Ink of the light buttons, and of the night-sky mouse controls.
constexpr Rgb kInk { 28, 36, 64 };
constexpr Rgb kInkHover { 0, 51, 152 };
constexpr Rgb kSkyInk { 176, 196, 255 };
constexpr Rgb kSkyInkHover { 232, 240, 255 };
constexpr Rgb kStarCore { 255, 255, 210 };
constexpr Rgb kStarRays { 255, 203, 51 };

using Painter = std::function<void(RBitmap8&, int frame)>;

Resource Make(
    const char* type, int32_t id, int w, int h, int frames, const char* name, const Painter& paint)
{
    Resource resource { type, id, w, h, frames, name, {} };
    for (int f = 0; f < frames; ++f) {
        RBitmap8 bitmap(BRect(0.0f, 0.0f, float(w - 1), float(h - 1)));
        bitmap.EraseMap(kClear);
        paint(bitmap, f);
        // All sizes are multiples of 4, so rows lie back to back.
        const uint8_t* bits = bitmap.Bits();
        resource.bytes.insert(resource.bytes.end(), bits, bits + w * h);
    }
    return resource;
}

// A small window picture: title bar and a body of the given colour, (x, y) its top-left.
void Window(RBitmap8& b, int x, int y, int w, int h, Rgb body, Rgb ink)
{
    for (int j = 0; j < h; ++j)
        b.RenderHLine(x, y + j, w, Nearest(j < 3 ? Rgb { 255, 203, 51 } : body));
    b.RenderRect(BRect(float(x), float(y), float(x + w - 1), float(y + h - 1)), Nearest(ink));
    b.RenderHLine(x, y + 3, w, Nearest(ink));
}

// The green "new" badge in the bottom-right corner of the window buttons.
void NewBadge(RBitmap8& b, double dx, double dy)
{
    Disc(b, 24.5 + dx, 24.5 + dy, 4.6, { 24, 96, 24 });
    Disc(b, 24.5 + dx, 24.5 + dy, 3.8, { 51, 203, 51 });
    Stroke(b, 22.0 + dx, 24.5 + dy, 27.0 + dx, 24.5 + dy, 1.2, { 255, 255, 255 });
    Stroke(b, 24.5 + dx, 22.0 + dy, 24.5 + dx, 27.0 + dy, 1.2, { 255, 255, 255 });
}

void DoubleArrow(RBitmap8& b, double x0, double y0, double x1, double y1, Rgb ink)
{
    const double mx = (x0 + x1) / 2.0, my = (y0 + y1) / 2.0;
    Arrow(b, mx, my, x0, y0, 1.3, ink);
    Arrow(b, mx, my, x1, y1, 1.3, ink);
}

// The five mouse controls: night-sky faces with light ink, three frames each.
Resource MouseControl(
    int32_t id, const char* name, const std::function<void(RBitmap8&, double, double, Rgb)>& icon)
{
    return Make("McPc", id, 32, 32, 3, name, [&](RBitmap8& b, int f) {
        ButtonFace(b, Face(f), true);
        const double d = f == 2 ? 1.0 : 0.0;
        icon(b, d, d, f == 1 ? kSkyInkHover : kSkyInk);
    });
}

// The window buttons of the control window: light faces, dark ink, three frames each.
Resource Button(const char* type, int32_t id, int size, const char* name,
    const std::function<void(RBitmap8&, double, double, Rgb)>& icon)
{
    return Make(type, id, size, size, 3, name, [&](RBitmap8& b, int f) {
        ButtonFace(b, Face(f), false);
        const double d = f == 2 ? 1.0 : 0.0;
        icon(b, d, d, f == 1 ? kInkHover : kInk);
    });
}

void Specks(RBitmap8& b, double dx, double dy, int count, int seed, Rgb colour)
{
    // A fixed scatter (linear congruential), the same on every run.
    uint32_t state = uint32_t(seed) * 2654435761u + 1u;
    for (int i = 0; i < count; ++i) {
        state = state * 1664525u + 1013904223u;
        const int x = 4 + int((state >> 8) % 24);
        state = state * 1664525u + 1013904223u;
        const int y = 4 + int((state >> 8) % 24);
        Blend(b, x + int(dx), y + int(dy), colour, 0.35 + (i % 3) * 0.25);
    }
}

std::vector<Resource> MouseControls()
{
    std::vector<Resource> out;
    out.push_back(MouseControl(
        1, "Trackball: turn the chart", [](RBitmap8& b, double dx, double dy, Rgb ink) {
            Specks(b, dx, dy, 6, 1, ink);
            const double cx = 15.5 + dx, cy = 16.5 + dy;
            Disc(b, cx, cy, 9.5, { 24, 48, 120 });
            Ring(b, cx, cy, 9.5, 1.2, ink);
            Ellipse(b, cx, cy, 9.5, 3.5, 1.0, ink, 0.0, kPI);
            Ellipse(b, cx, cy, 4.0, 9.5, 1.0, ink, -kPI / 2, kPI / 2);
            Ellipse(b, cx, cy, 13.0, 13.0, 1.1, ink, -kPI * 0.85, -kPI * 0.55);
            Ellipse(b, cx, cy, 13.0, 13.0, 1.1, ink, -kPI * 0.45, -kPI * 0.15);
            Arrow(b, cx + 13 * std::cos(-kPI * 0.2), cy + 13 * std::sin(-kPI * 0.2),
                cx + 13 * std::cos(-kPI * 0.15), cy + 13 * std::sin(-kPI * 0.15), 1.1, ink);
            Arrow(b, cx + 13 * std::cos(-kPI * 0.8), cy + 13 * std::sin(-kPI * 0.8),
                cx + 13 * std::cos(-kPI * 0.85), cy + 13 * std::sin(-kPI * 0.85), 1.1, ink);
        }));
    out.push_back(MouseControl(
        2, "Camera distance: drag up and down", [](RBitmap8& b, double dx, double dy, Rgb ink) {
            Specks(b, dx, dy, 5, 2, ink);
            DoubleArrow(b, 8.5 + dx, 5.0 + dy, 8.5 + dx, 27.0 + dy, ink);
            Sparkle(b, 21.5 + dx, 10.5 + dy, 3.0, kStarCore, Mix(ink, kStarRays, 0.5));
            Sparkle(b, 21.5 + dx, 22.0 + dy, 6.5, kStarCore, kStarRays);
        }));
    out.push_back(MouseControl(3, "Stellar brightness: drag left and right",
        [](RBitmap8& b, double dx, double dy, Rgb ink) {
            Specks(b, dx, dy, 4, 3, ink);
            Disc(b, 15.5 + dx, 12.5 + dy, 5.5, { 96, 72, 24 });
            Sparkle(b, 15.5 + dx, 12.5 + dy, 9.0, kStarCore, kStarRays);
            DoubleArrow(b, 5.0 + dx, 26.5 + dy, 26.0 + dx, 26.5 + dy, ink);
        }));
    out.push_back(MouseControl(
        4, "Clipping sphere: drag left and right", [](RBitmap8& b, double dx, double dy, Rgb ink) {
            const double cx = 15.5 + dx, cy = 13.0 + dy;
            for (int k = 0; k < 12; ++k) {
                const double a = k * kPI / 6;
                Ellipse(b, cx, cy, 9.0, 9.0, 1.1, ink, a, a + kPI / 10);
            }
            Disc(b, cx - 3, cy - 2, 1.2, kStarCore);
            Disc(b, cx + 3, cy + 3, 1.0, kStarRays);
            Disc(b, cx + 2, cy - 4, 0.8, kStarCore);
            Blend(b, int(cx - 12), int(cy + 8), ink, 0.4);
            Blend(b, int(cx + 12), int(cy - 9), ink, 0.4);
            DoubleArrow(b, 5.0 + dx, 27.0 + dy, 26.0 + dx, 27.0 + dy, ink);
        }));
    out.push_back(MouseControl(
        5, "Stellar contrast: drag left and right", [](RBitmap8& b, double dx, double dy, Rgb ink) {
            Specks(b, dx, dy, 3, 5, ink);
            Sparkle(b, 10.5 + dx, 12.5 + dy, 7.0, kStarCore, kStarRays);
            Sparkle(b, 23.0 + dx, 12.5 + dy, 3.0, { 152, 152, 203 }, { 96, 96, 152 });
            DoubleArrow(b, 5.0 + dx, 26.5 + dy, 26.0 + dx, 26.5 + dy, ink);
        }));
    return out;
}

std::vector<Resource> WindowButtons()
{
    std::vector<Resource> out;
    out.push_back(
        Button("IPCL", 0, 32, "New chart window", [](RBitmap8& b, double dx, double dy, Rgb ink) {
            Window(b, 4 + int(dx), 5 + int(dy), 21, 18, { 0, 0, 55 }, ink);
            Sparkle(b, 12.5 + dx, 14.5 + dy, 3.0, kStarCore, kStarRays);
            b.RenderPoint(19 + int(dx), 11 + int(dy), Nearest({ 203, 203, 255 }));
            b.RenderPoint(8 + int(dx), 19 + int(dy), Nearest({ 152, 152, 203 }));
            b.RenderPoint(20 + int(dx), 18 + int(dy), Nearest({ 255, 152, 102 }));
            NewBadge(b, dx, dy);
        }));
    out.push_back(Button("IPCL", 1, 32, "New star information window",
        [](RBitmap8& b, double dx, double dy, Rgb ink) {
            Window(b, 4 + int(dx), 5 + int(dy), 21, 18, { 0, 0, 0 }, ink);
            const uint8_t green = Nearest({ 51, 255, 51 });
            const int lengths[] = { 12, 8, 14, 6 };
            for (int i = 0; i < 4; ++i)
                b.RenderHLine(7 + int(dx), 11 + 3 * i + int(dy), lengths[i], green);
            NewBadge(b, dx, dy);
        }));
    out.push_back(Button(
        "IPCL", 2, 32, "New H-R diagram window", [](RBitmap8& b, double dx, double dy, Rgb ink) {
            Window(b, 4 + int(dx), 5 + int(dy), 21, 18, { 0, 0, 30 }, ink);
            const int ox = int(dx), oy = int(dy);
            b.RenderVLine(7 + ox, 10 + oy, 11, Nearest({ 152, 152, 152 }));
            b.RenderHLine(7 + ox, 20 + oy, 16, Nearest({ 152, 152, 152 }));
            // A main sequence from hot and bright to cool and faint, and two giants.
            const Rgb colours[] = { { 102, 152, 255 }, { 203, 203, 255 }, { 255, 255, 203 },
                { 255, 255, 102 }, { 255, 152, 51 }, { 255, 102, 51 } };
            for (int i = 0; i < 6; ++i)
                b.RenderPoint(9 + 2 * i + ox, 11 + (3 * i) / 2 + oy, Nearest(colours[i]));
            b.RenderPoint(19 + ox, 12 + oy, Nearest({ 255, 152, 51 }));
            b.RenderPoint(21 + ox, 11 + oy, Nearest({ 255, 102, 51 }));
            NewBadge(b, dx, dy);
        }));
    out.push_back(
        Button("IPCL", 3, 32, "Find a star", [](RBitmap8& b, double dx, double dy, Rgb ink) {
            Disc(b, 13.0 + dx, 13.0 + dy, 7.0, { 203, 230, 255 });
            Sparkle(b, 13.0 + dx, 13.0 + dy, 3.5, kStarCore, kStarRays);
            Ring(b, 13.0 + dx, 13.0 + dy, 7.5, 2.2, ink);
            Stroke(b, 18.8 + dx, 18.8 + dy, 25.5 + dx, 25.5 + dy, 3.6, ink);
        }));
    out.push_back(Button(
        "IPCL", 4, 12, "Clear the H-R diagram (12x12)", [](RBitmap8& b, double dx, double dy, Rgb) {
            const Rgb red { 203, 0, 0 };
            Stroke(b, 3.5 + dx, 3.5 + dy, 7.5 + dx, 7.5 + dy, 1.7, red);
            Stroke(b, 7.5 + dx, 3.5 + dy, 3.5 + dx, 7.5 + dy, 1.7, red);
        }));
    out.push_back(Button(
        "IPCL", 5, 32, "New star list window", [](RBitmap8& b, double dx, double dy, Rgb ink) {
            Window(b, 4 + int(dx), 5 + int(dy), 21, 18, { 255, 255, 255 }, ink);
            for (int i = 0; i < 4; ++i) {
                const int y = 11 + 3 * i + int(dy);
                b.RenderSquare(7 + int(dx), y - 1, 2,
                    Nearest(i == 1 ? Rgb { 255, 152, 0 } : Rgb { 0, 102, 203 }));
                b.RenderHLine(11 + int(dx), y, 10 - 2 * (i % 2), Nearest({ 102, 102, 102 }));
            }
            NewBadge(b, dx, dy);
        }));
    return out;
}

Resource Toggle()
{
    // Frames on, then off: the clipping sphere shown lit or dimmed.
    return Make("TGcL", 0, 12, 12, 2, "Clipping-sphere toggle: on, off", [](RBitmap8& b, int f) {
        ButtonFace(b, Face::Normal, false);
        const bool on = f == 0;
        if (on)
            Disc(b, 5.5, 5.5, 3.2, { 0, 102, 203 });
        Ring(b, 5.5, 5.5, 3.2, 1.2, on ? Rgb { 0, 51, 152 } : Rgb { 144, 144, 144 });
        Disc(b, 5.5, 5.5, 0.9, on ? Rgb { 255, 255, 203 } : Rgb { 144, 144, 144 });
    });
}

std::vector<Resource> DropPads(RBMFont8& font)
{
    std::vector<Resource> out;
    const Rgb green { 0, 128, 0 }, blue { 0, 51, 203 }, red { 203, 0, 0 };
    const auto pad
        = [](int32_t id, const char* name, const std::function<void(RBitmap8&, int)>& symbol) {
              return Make("Dzon", id, 32, 32, 2, name, [&](RBitmap8& b, int f) {
                  ButtonFace(b, f ? Face::Hover : Face::Normal, false);
                  symbol(b, f);
              });
          };
    out.push_back(pad(0, "Drop pad Plus: add to list", [&](RBitmap8& b, int f) {
        const Rgb c = f ? Mix(green, { 0, 255, 0 }, 0.4) : green;
        Stroke(b, 8.0, 15.5, 23.0, 15.5, 4.0, c);
        Stroke(b, 15.5, 8.0, 15.5, 23.0, 4.0, c);
    }));
    out.push_back(pad(1, "Drop pad Equals: copy list", [&](RBitmap8& b, int f) {
        const Rgb c = f ? Mix(blue, { 0, 153, 255 }, 0.5) : blue;
        Stroke(b, 8.0, 11.5, 23.0, 11.5, 3.6, c);
        Stroke(b, 8.0, 19.5, 23.0, 19.5, 3.6, c);
    }));
    out.push_back(pad(2, "Drop pad Minus: remove from list", [&](RBitmap8& b, int f) {
        const Rgb c = f ? Mix(red, { 255, 51, 51 }, 0.5) : red;
        Stroke(b, 8.0, 15.5, 23.0, 15.5, 4.0, c);
    }));
    const char* words[] = { "NOT", "AND", "OR", "XOR" };
    const char* names[]
        = { "Drop pad NOT: copy and invert", "Drop pad AND", "Drop pad OR", "Drop pad XOR" };
    for (int i = 0; i < 4; ++i) {
        out.push_back(Make("Dzon", 3 + i, 32, 16, 2, names[i], [&](RBitmap8& b, int f) {
            ButtonFace(b, f ? Face::Hover : Face::Normal, false);
            b.SetBMFont(&font);
            const int length = int(std::char_traits<char>::length(words[i]));
            int32_t x = (32 - length * 7) / 2 + 1, y = 14;
            b.RenderString(x, x, y, words[i], Nearest(f ? kInkHover : kInk));
        }));
    }
    return out;
}

} // namespace

// Charts.cpp draws the rest.
std::vector<Resource> ChartImages(RBMFont8& font);

std::vector<Resource> DrawImages(RBMFont8& font)
{
    std::vector<Resource> all = ChartImages(font);
    for (auto* group : { &MouseControls, &WindowButtons }) {
        for (Resource& r : (*group)())
            all.push_back(std::move(r));
    }
    all.push_back(Toggle());
    for (Resource& r : DropPads(font))
        all.push_back(std::move(r));
    return all;
}
