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
