// Small universes for chart tests, written as catalogues and read the way the program reads
// them, with the spectral tables and the program's images in place.
#pragma once

#include "catalog/TempCatalogue.h"

#include "catalog/Universe.h"
#include "chart/UniverseView.h"
#include "render/SpectralTables.h"
#include "render/SystemPalette.h"
#include "resources/ResourceData.h"

#include <gtest/gtest.h>

#include <cmath>
#include <memory>
#include <string>
#include <vector>

struct TestSystem {
    std::string name;
    double x, y, z; // parsecs
    double magnitude; // absolute; 4.7 gives luminosity 1
    std::string spectralClass = "G2V";
};

class ChartTest : public ::testing::Test {
protected:
    static void SetUpTestSuite() { InitResources(); }

    // A universe of the given systems, one star each.
    Universe* MakeUniverse(const std::vector<TestSystem>& systems)
    {
        std::string text;
        for (const TestSystem& s : systems) {
            text += s.name + "\n" + s.spectralClass + " " + std::to_string(s.magnitude) + " "
                + CatalogueNumber(s.x) + " " + CatalogueNumber(s.y) + " " + CatalogueNumber(s.z)
                + "\n";
        }
        const TempCatalogue file(text);
        fUniverse = std::make_unique<Universe>(file.PathString().c_str(), 1000000, 5000);
        return fUniverse.get();
    }

    // A view of 100 x 100 pixels (frame 0, 0, 99, 99) with its offscreen, not yet rendering.
    UniverseView* MakeView(Universe* universe, int32_t threads = 1, int size = 100)
    {
        fView = std::make_unique<UniverseView>(
            BRect(0, 0, float(size - 1), float(size - 1)), "UniverseView", universe, threads);
        fView->InitOffscreen();
        fView->radialVelocityY = 0; // a still chart unless a test turns it
        return fView.get();
    }

    // Aims the camera straight down the z axis from the origin: a point (x, y, z) lands at depth
    // z, at (x f / z + right / 2, -y f / z + bottom / 2).
    static void LookAlongZ(UniverseView* view) { view->transform.InitIdentity(); }

    // The side of the square view the grid universe is laid out for, and the camera distance it
    // is seen from (parsecs) with no turn at all: a system at (x, y, 0) lands at depth 25.
    static constexpr int kGridView = 320;
    static constexpr double kGridCamera = 25.0;
    static constexpr int32_t kGridSystems = 40000;

    // Where a system must stand on the plane z = 0 to land in the middle of pixel (px, py) of
    // the grid view.
    static TestSystem OnPixel(const std::string& name, int px, int py, double magnitude)
    {
        const double f = kGridView - 1, c = (kGridView - 1) * 0.5;
        return { name, (px + 0.5 - c) * kGridCamera / f, -(py + 0.5 - c) * kGridCamera / f, 0.0,
            magnitude };
    }

    // A universe big enough that every one of eight render threads has blocks to draw: 40,000
    // systems, a third of them faint points on a grid two pixels apart (no two on one pixel),
    // ten bright glows in a row below the grid spaced 30 pixels apart, one in each block of
    // 4,096 systems, and the rest behind the camera, where the star pass culls them. Since
    // nothing drawn overlaps, the picture does not depend on which thread drew what first.
    Universe* MakeGridUniverse()
    {
        std::vector<TestSystem> systems;
        systems.reserve(kGridSystems);
        int gridX = 10, gridY = 10, glow = 0;
        for (int32_t i = 0; i < kGridSystems; i++) {
            const std::string name = "S" + std::to_string(i);
            if (i % UniverseView::kShareBlock == 1 && glow < 10) {
                // Luminosity 1000: brightness about 3,200 from 25 pc, a glow 15 pixels wide.
                systems.push_back(OnPixel(name, 15 + 30 * glow++, 230, 4.7 - 7.5));
            } else if (i % 3 == 0 && gridY <= 190) {
                // Luminosity 0.5 to 1.5: brightness 1.6 to 4.8, single pixels.
                const double luminosity = 0.5 + (i % 11) / 10.0;
                systems.push_back(
                    OnPixel(name, gridX, gridY, 4.7 - std::log(luminosity) / std::log(2.512)));
                gridX += 2;
                if (gridX > 300) {
                    gridX = 10;
                    gridY += 2;
                }
            } else {
                systems.push_back({ name, i * 0.001, 1.0, -300.0, 4.7 });
            }
        }
        return MakeUniverse(systems);
    }

    // A view of the grid universe straight down the z axis, the camera 25 pc out, nothing
    // turning; with the transform set so that a frame drawn without the frame loop (Render)
    // sees it the same way.
    static std::unique_ptr<UniverseView> MakeGridView(Universe* universe, int32_t threads)
    {
        auto view = std::make_unique<UniverseView>(
            BRect(0, 0, kGridView - 1, kGridView - 1), "UniverseView", universe, threads);
        view->InitOffscreen();
        view->radialVelocityY = 0;
        view->pitch.InitIdentity();
        view->transform.InitTranslation(0, 0, kGridCamera);
        return view;
    }

    // The offscreen's pixels, row after row, without the padding.
    static std::vector<uint8_t> Pixels(UniverseView* view)
    {
        RBitmap8* o = view->Offscreen();
        std::vector<uint8_t> pixels;
        for (int y = 0; y < o->Height(); y++) {
            const uint8_t* row = o->Bits() + y * o->BytesPerRow();
            pixels.insert(pixels.end(), row, row + o->Width());
        }
        return pixels;
    }

    static uint8_t Pixel(UniverseView* view, int x, int y)
    {
        RBitmap8* o = view->Offscreen();
        return o->Bits()[y * o->BytesPerRow() + x];
    }

    static int CountNonZero(UniverseView* view)
    {
        int n = 0;
        RBitmap8* o = view->Offscreen();
        for (int y = 0; y < o->Height(); y++) {
            for (int x = 0; x < o->Width(); x++)
                n += Pixel(view, x, y) != 0;
        }
        return n;
    }

    static int CountIndex(UniverseView* view, uint8_t index)
    {
        int n = 0;
        RBitmap8* o = view->Offscreen();
        for (int y = 0; y < o->Height(); y++) {
            for (int x = 0; x < o->Width(); x++)
                n += Pixel(view, x, y) == index;
        }
        return n;
    }

    // The index a pixel of black becomes when entry `intensity` of a table is added to it.
    static uint8_t OnBlack(const ColorTable* table, int intensity)
    {
        return RBitmap8::AddedIndexReference(system_colors(), 0, table->colors[intensity]);
    }

    ScopedSpectralTables fTables;
    std::unique_ptr<Universe> fUniverse;
    std::unique_ptr<UniverseView> fView;

private:
    static std::string CatalogueNumber(double v)
    {
        char text[64];
        std::snprintf(text, sizeof text, "%.17g", v);
        return text;
    }
};
