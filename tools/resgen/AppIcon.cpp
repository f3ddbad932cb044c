// AppIcon.cpp: the icon is a function of the point on a unit square, sampled 5 x 5 times per
// pixel, so every size is drawn from the same picture rather than scaled from another size.
#include "AppIcon.h"

#include <QImage>
#include <algorithm>
#include <cmath>

namespace {

struct Light {
    double r, g, b;
};

struct IconStar {
    double u, v; // centre, as fractions of the icon's width and height
    double core; // radius of the bright core, a fraction of the width
    double glow; // reach of the faint halo
    Light colour;
    double spikes; // length of the four rays; 0 for none
};

// The Sun a little left of and below the middle, where a chart centred on it would show it
// coming toward the viewer; Rigel's blue and a red dwarf's red beside it; four faint stars
// that only the larger sizes resolve.
constexpr IconStar kStars[] = {
    { 0.43, 0.56, 0.070, 0.20, { 1.00, 0.93, 0.68 }, 0.34 },
    { 0.70, 0.31, 0.045, 0.12, { 0.68, 0.80, 1.00 }, 0.16 },
    { 0.69, 0.73, 0.036, 0.09, { 1.00, 0.55, 0.40 }, 0.0 },
    { 0.27, 0.31, 0.020, 0.05, { 0.95, 0.95, 1.00 }, 0.0 },
    { 0.53, 0.19, 0.016, 0.04, { 1.00, 0.90, 0.80 }, 0.0 },
    { 0.24, 0.71, 0.018, 0.05, { 1.00, 0.80, 0.60 }, 0.0 },
    { 0.84, 0.52, 0.016, 0.04, { 0.85, 0.90, 1.00 }, 0.0 },
};

constexpr double kDomeRadius = 0.47;

// The light at (u, v) inside the dome, before the edge is cut.
Light DomeLight(double u, double v)
{
    // A deep blue night, brightest a little above the middle, darkening to the rim.
    const double dx = u - 0.5, dy = v - 0.42;
    const double fromTop = std::min(1.0, std::sqrt(dx * dx + dy * dy) / 0.55);
    Light light { 0.05 + 0.05 * (1 - fromTop), 0.07 + 0.08 * (1 - fromTop),
        0.22 + 0.20 * (1 - fromTop) };

    // A tilted ellipse through the middle: the plane the chart turns in.
    const double angle = -0.35;
    const double eu = u - 0.5, ev = v - 0.52;
    const double ru = eu * std::cos(angle) - ev * std::sin(angle);
    const double rv = eu * std::sin(angle) + ev * std::cos(angle);
    const double ellipse = std::sqrt((ru / 0.36) * (ru / 0.36) + (rv / 0.12) * (rv / 0.12));
    const double ring = std::exp(-std::pow((ellipse - 1.0) / 0.035, 2));
    light.r += 0.16 * ring;
    light.g += 0.28 * ring;
    light.b += 0.45 * ring;

    for (const IconStar& star : kStars) {
        const double sx = u - star.u, sy = v - star.v;
        const double d = std::sqrt(sx * sx + sy * sy);
        double intensity = std::exp(-2.0 * (d / star.core) * (d / star.core))
            + 0.35 * std::exp(-3.0 * d / star.glow);
        if (star.spikes > 0) {
            // Thin rays along both axes, fading with distance.
            const double width = star.core * 0.18;
            const double along = std::max(0.0, 1 - d / star.spikes);
            intensity += along * along
                * (std::exp(-(sx / width) * (sx / width)) + std::exp(-(sy / width) * (sy / width)));
        }
        light.r += star.colour.r * intensity;
        light.g += star.colour.g * intensity;
        light.b += star.colour.b * intensity;
    }

    // A thin, lighter rim so the dome stands out on a dark panel.
    const double rim = std::sqrt((u - 0.5) * (u - 0.5) + (v - 0.5) * (v - 0.5));
    const double edge = std::exp(-std::pow((kDomeRadius - rim) / 0.012, 2));
    light.r += 0.25 * edge;
    light.g += 0.35 * edge;
    light.b += 0.55 * edge;
    return light;
}

int Channel(double value)
{
    return std::clamp(int(std::lround(value * 255)), 0, 255);
}

} // namespace

std::vector<uint32_t> DrawAppIcon(int size)
{
    constexpr int kSamples = 5;
    std::vector<uint32_t> pixels(size_t(size) * size);
    for (int y = 0; y < size; y++) {
        for (int x = 0; x < size; x++) {
            // Premultiplied sums over the samples inside the dome.
            double r = 0, g = 0, b = 0, covered = 0;
            for (int sy = 0; sy < kSamples; sy++) {
                for (int sx = 0; sx < kSamples; sx++) {
                    const double u = (x + (sx + 0.5) / kSamples) / size;
                    const double v = (y + (sy + 0.5) / kSamples) / size;
                    if ((u - 0.5) * (u - 0.5) + (v - 0.5) * (v - 0.5) > kDomeRadius * kDomeRadius)
                        continue;
                    const Light light = DomeLight(u, v);
                    r += std::min(1.0, light.r);
                    g += std::min(1.0, light.g);
                    b += std::min(1.0, light.b);
                    covered += 1;
                }
            }
            const double alpha = covered / (kSamples * kSamples);
            uint32_t pixel = 0;
            if (covered > 0) {
                pixel = uint32_t(Channel(alpha)) << 24 | uint32_t(Channel(r / covered)) << 16
                    | uint32_t(Channel(g / covered)) << 8 | uint32_t(Channel(b / covered));
            }
            pixels[size_t(y) * size + x] = pixel;
        }
    }
    return pixels;
}

bool WriteAppIcons(const std::filesystem::path& folder, std::string* reason)
{
    std::error_code error;
    std::filesystem::create_directories(folder, error);
    if (error) {
        *reason = error.message();
        return false;
    }
    for (int size : kAppIconSizes) {
        const std::vector<uint32_t> pixels = DrawAppIcon(size);
        const QImage image(reinterpret_cast<const uchar*>(pixels.data()), size, size,
            size * int(sizeof(uint32_t)), QImage::Format_ARGB32);
        const std::filesystem::path path = folder / ("nightdome-" + std::to_string(size) + ".png");
        // Through a temporary name, so no half-written icon is left behind.
        const std::string part = path.string() + ".part";
        if (!image.save(QString::fromStdString(part), "PNG")) {
            *reason = "cannot write " + part;
            return false;
        }
        std::filesystem::rename(part, path, error);
        if (error) {
            *reason = "cannot write " + path.string() + ": " + error.message();
            return false;
        }
    }
    return true;
}
