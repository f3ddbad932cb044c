// The frame's model steps: brightness cache, camera, star pass, overlay and the distance filter.
#include "chart/StarBrightness.h"
#include "chart/UniverseView.h"

#include "core/CCoord.h"
#include "core/ShownCoord.h"
#include "core/Truncate.h"
#include "render/AsciiText.h"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <string>

namespace {

// Palette indices of the overlay: the clipping cube, cross and read-out; the markers.
constexpr uint8_t kOverlayIndex = 55;
constexpr uint8_t kMarkerIndex = 42;

// base^exponent as the brightness cache needs it: 0 for base 0 and a positive exponent, whole
// exponents by repeated squaring (a negative one inverts the base first, 0 gives 1), anything
// else through the base-2 logarithm.
double LumPow(double base, double exponent)
{
    if (base == 0 && exponent > 0)
        return 0;
    if (exponent == std::trunc(exponent) && std::fabs(exponent) < 1e9) {
        auto n = static_cast<int64_t>(exponent);
        if (n < 0) {
            base = 1 / base;
            n = -n;
        }
        double result = 1;
        while (n > 0) {
            if (n & 1)
                result *= base;
            base *= base;
            n >>= 1;
        }
        return result;
    }
    return std::exp2(exponent * std::log2(base));
}

} // namespace

void UniverseView::CalculateLumCache()
{
    const double factor = lumFactor.load(std::memory_order_relaxed);
    const double contrast = stellarContrast.load(std::memory_order_relaxed);
    for (size_t i = 0; i < lumCache.size(); i++)
        lumCache[i] = factor * LumPow(universe->SystemAt(int32_t(i))->luminosity, contrast);
    RebuildPassLum();
}

void UniverseView::RebuildPassLum()
{
    const size_t count = std::min(lumCache.size(), size_t(drawMask->GetSystemCount()));
    fPassLum.resize(count);
    for (size_t i = 0; i < count; i++) {
        const double lum = lumCache[i];
        const float pass = lum >= 0 ? RoundedUpToFloat(lum) : kPassDark;
        fPassLum[i] = drawMask->states[i] ? pass : kPassHidden;
    }
}

void UniverseView::NextTransform()
{
    // Glide toward the origin system, closing 15% of the gap each frame.
    cameraPosition.x += (originOffset.x - cameraPosition.x) * 0.15;
    cameraPosition.y += (originOffset.y - cameraPosition.y) * 0.15;
    cameraPosition.z += (originOffset.z - cameraPosition.z) * 0.15;
    originTranslation.InitTranslation(cameraPosition.x, cameraPosition.y, cameraPosition.z);

    // The turn about y keeps its speed; the turn about x and the zoom die away.
    SMatrix yStep, xStep;
    yStep.InitYRotation(radialVelocityY.load(std::memory_order_relaxed));
    const double vx = radialVelocityX.load(std::memory_order_relaxed) * 0.9;
    radialVelocityX.store(vx, std::memory_order_relaxed);
    xStep.InitXRotation(vx);
    const double vz = cameraVelocityZ.load(std::memory_order_relaxed) * 0.9;
    cameraVelocityZ.store(vz, std::memory_order_relaxed);
    cameraDistance += vz;
    if (zoomToOrigin)
        cameraDistance -= cameraDistance * 0.2;
    if (cameraDistance < 0.05) {
        cameraDistance = 0.05;
        zoomToOrigin = false;
    }

    selectedPointX = -1;
    selectedPointY = -1;
    targetPointX = -1;
    targetPointY = -1;
    zoomTranslation.InitTranslation(0, 0, cameraDistance);
    // The new steps come after the turns so far: yaw about the world's y, pitch about the
    // screen's horizontal axis.
    yaw *= yStep;
    pitch *= xStep;
    transform = originTranslation;
    transform *= yaw;
    transform *= pitch;
    transform *= zoomTranslation;
}

UniverseView::ScreenPoint UniverseView::Project(const SVector& point) const
{
    SVector p = point;
    transform.Transform(&p);
    return { TruncateToInt32(p.x * focalLength / p.z + frame.right * 0.5),
        TruncateToInt32(-p.y * focalLength / p.z + frame.bottom * 0.5), p.z };
}

void UniverseView::RenderBackground()
{
    offscreen->EraseMap(0);
    targetFound = false;
    targetDepth = 1e50;
}

void UniverseView::DrawClipCube()
{
    const double d = distanceFilter.load(std::memory_order_relaxed);
    const SVector c(-cameraPosition.x, -cameraPosition.y, -cameraPosition.z);
    ScreenPoint corner[8];
    for (int k = 0; k < 8; k++)
        corner[k] = Project(
            SVector(c.x + (k & 1 ? d : -d), c.y + (k & 2 ? d : -d), c.z + (k & 4 ? d : -d)));
    // The twelve edges join corners that differ in one coordinate; an edge that crosses the
    // camera plane is left out, not clipped.
    for (int a = 0; a < 8; a++) {
        for (int bit = 1; bit < 8; bit <<= 1) {
            const int b = a | bit;
            if (b == a || !(corner[a].z > 0 && corner[b].z > 0))
                continue;
            offscreen->RenderLine(
                corner[a].x, corner[a].y, corner[b].x, corner[b].y, kOverlayIndex);
        }
    }
    const auto cx = static_cast<int32_t>(frame.right * 0.5);
    const auto cy = static_cast<int32_t>(frame.bottom * 0.5);
    offscreen->RenderHLine(cx - 10, cy, 21, kOverlayIndex);
    offscreen->RenderVLine(cx, cy - 10, 21, kOverlayIndex);
}

std::string UniverseView::FormatReadout() const
{
    // The direction the camera looks from, back at the origin, as right ascension and
    // declination; a zero is printed without a minus sign.
    SVector view(0, 0, cameraDistance);
    pitch.Transform(&view);
    yaw.Transform(&view);
    view.z = -view.z;
    const ShownCoord c { CCoord(view) };
    const StarSystem* origin = universe ? universe->SystemAt(originSystem) : nullptr;
    // Drawn with the bitmap font, which has ASCII only: the name is spelled in ASCII.
    const std::string name = origin ? AsciiTransliteration(origin->GetName()) : std::string();
    char text[256] = {};
    std::snprintf(text, sizeof text,
        "Origin: %s\nDistance: %.2f\nRA: %.0fh %.1fm\nDEC: %+.0fd %.1f'\n", name.c_str(),
        cameraDistance, c.raHours, c.raMinutes, c.decDegrees, c.decMinutes);
    return text;
}

void UniverseView::DrawReadout()
{
    const std::string text = FormatReadout();
    int32_t x = 10, y = static_cast<int32_t>(frame.bottom - 45.0);
    offscreen->RenderString(10, x, y, text.c_str(), kOverlayIndex);
}

std::string UniverseView::ReadOut()
{
    renderLock->Acquire();
    const std::string text = FormatReadout();
    renderLock->Release();
    return text;
}

BPoint UniverseView::ScreenPointOf(int32_t index)
{
    renderLock->Acquire();
    BPoint where(-1, -1);
    const StarSystem* system = universe ? universe->SystemAt(index) : nullptr;
    if (system && drawMask->GetStateSafe(index)) {
        const ScreenPoint s = Project(system->position);
        if (s.z > 0 && 0 < s.x && s.x < frame.right && 0 < s.y && s.y < frame.bottom)
            where = BPoint(float(s.x), float(s.y));
    }
    renderLock->Release();
    return where;
}

void UniverseView::DrawSelectionMarker()
{
    const int32_t selected = selectedSystem.load(std::memory_order_relaxed);
    if (selected < 0)
        return;
    const float px = selectedPointX.load(std::memory_order_relaxed);
    const float py = selectedPointY.load(std::memory_order_relaxed);
    if (!(px > 0)) {
        // Not drawn this frame: the zoom-in plays again when it comes back.
        markerFrames = 7;
        markerScale = 0.7f;
        return;
    }
    if (selected != markerSystem) {
        markerSystem = selected;
        markerFrames = 7;
        markerScale = 0.7f;
    }
    if (markerFrames > 0) {
        const float s = markerScale;
        offscreen->RenderRect(BRect(px + s * (frame.left - px), py + s * (frame.top - py),
                                  px + s * (frame.right - px), py + s * (frame.bottom - py)),
            kMarkerIndex);
        markerScale *= 0.6f;
        markerFrames--;
    }
    const auto x = static_cast<int32_t>(px), y = static_cast<int32_t>(py);
    offscreen->RenderVLine(x - 4, y - 3, 7, kMarkerIndex);
    offscreen->RenderHLine(x - 4, y - 3, 2, kMarkerIndex);
    offscreen->RenderHLine(x - 4, y + 4, 2, kMarkerIndex);
    offscreen->RenderVLine(x + 4, y - 3, 7, kMarkerIndex);
    offscreen->RenderHLine(x + 4, y - 3, -1, kMarkerIndex);
    offscreen->RenderHLine(x + 5, y + 4, -2, kMarkerIndex);
}

void UniverseView::RenderForeground()
{
    if (showClipSphere.load(std::memory_order_relaxed)) {
        DrawClipCube();
        DrawReadout();
    }
    DrawSelectionMarker();
    const float tx = targetPointX.load(std::memory_order_relaxed);
    const float ty = targetPointY.load(std::memory_order_relaxed);
    if (targetFound.load(std::memory_order_relaxed) && tx >= 0) {
        offscreen->RenderVLine(
            static_cast<int32_t>(tx), static_cast<int32_t>(ty - 3.0f), 7, kMarkerIndex);
        offscreen->RenderHLine(
            static_cast<int32_t>(tx - 3.0f), static_cast<int32_t>(ty), 7, kMarkerIndex);
    } else {
        targetSystem = -1;
    }
}

void UniverseView::HideGreaterThan(double radius)
{
    const int32_t count
        = std::min(universe ? universe->CountItems() : 0, distanceMask->GetSystemCount());
    for (int32_t i = 0; i < count; i++) {
        SVector p = universe->SystemAt(i)->position;
        p.Set(p.x + originOffset.x, p.y + originOffset.y, p.z + originOffset.z);
        distanceMask->SetStateSafe(i, p.Magnitude() <= radius);
    }
    RebuildDrawMask();
}
