// The H-R diagram of the real sky: the systems within 25 parsecs, dropped as one set, lie along
// the main sequence, with the white dwarfs of the Sun's neighbourhood together far below it.
#include "catalog/Star.h"
#include "catalog/Universe.h"
#include "core/MessageCodes.h"
#include "hrd/HRDView.h"
#include "hrd/HRDWindow.h"
#include "platform/qt/RecordingHandler.h"
#include "resources/ResourceData.h"
#include "widgets/InfoView.h"

#include <QTest>
#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <gtest/gtest.h>
#include <iterator>
#include <string>

namespace {

// Absolute visual magnitudes of main-sequence stars by class, after the mean dwarf sequence of
// Pecaut and Mamajek (2013, ApJS 208, 9; the table as kept up to date by E. Mamajek), rounded
// to a tenth. The class is on the program's scale: A0 = 3, F0 = 4, ... M0 = 7.
struct SequencePoint {
    double spectralClass, magnitude;
};
constexpr SequencePoint kMainSequence[] = {
    { 3.0, 1.1 }, // A0
    { 3.5, 1.9 }, // A5
    { 4.0, 2.5 }, // F0
    { 4.5, 3.4 }, // F5
    { 5.0, 4.4 }, // G0
    { 5.5, 5.1 }, // G5
    { 6.0, 5.9 }, // K0
    { 6.5, 7.3 }, // K5
    { 7.0, 8.9 }, // M0
    { 7.2, 10.3 }, // M2
    { 7.4, 12.8 }, // M4
    { 7.6, 16.6 }, // M6
    { 7.8, 18.8 }, // M8
    { 7.95, 19.4 }, // M9.5
};

// The main sequence's magnitude at a class between A0 and M9.9, by straight lines between the
// table's points.
double MainSequence(double spectralClass)
{
    const auto* next = std::find_if(std::begin(kMainSequence), std::end(kMainSequence),
        [&](const SequencePoint& p) { return p.spectralClass >= spectralClass; });
    if (next == std::begin(kMainSequence))
        return next->magnitude;
    if (next == std::end(kMainSequence))
        return std::prev(next)->magnitude;
    const SequencePoint& before = *std::prev(next);
    const double t
        = (spectralClass - before.spectralClass) / (next->spectralClass - before.spectralClass);
    return before.magnitude + t * (next->magnitude - before.magnitude);
}

// How far either way from the sequence a dwarf may stand: the sequence's own width (metallicity,
// age, unresolved pairs) plus the catalogue's errors.
constexpr double kBand = 1.5;
constexpr double kRadius = 25; // parsecs

} // namespace

TEST(RealSkyHRD, TheNeighbourhoodFormsAMainSequenceWithWhiteDwarfsBelow)
{
    const std::string file = std::string(ND_APP_DIR) + "/stars.dat";
    ASSERT_TRUE(std::filesystem::exists(file)) << "run scripts/setup, then build";
    InitResources();
    Universe sky(file.c_str(), 1000000, 5000);
    RecordingHandler help;
    HRDWindow window(BPoint(150, 150), "H-R Diagram", &help);
    window.setAttribute(Qt::WA_DeleteOnClose, false);
    HRDView* view = window.View();
    Message universe(kUniversePointer);
    universe.AddPointer(kUniversePtrString, &sky);
    view->MessageReceived(&universe);

    StarSysMask near(sky.CountItems(), false, 0);
    int32_t stars = 0;
    for (int32_t i = 0; i < sky.CountItems(); i++) {
        if (sky.SystemAt(i)->position.Magnitude() < kRadius) {
            near.SetStateSafe(i, true);
            stars += sky.SystemAt(i)->CountItems();
        }
    }
    ASSERT_GT(stars, 1000) << "the sky within 25 pc is too thin to tell anything";
    ASSERT_LT(stars, HRDView::kMaxPlots) << "more stars than plots: the last slot is overwritten";
    Message set(kStarArrayMessage);
    set.AddPointer(kSystemArrayPtrString, &near);
    view->MessageReceived(&set);
    EXPECT_EQ(view->PlottedSystems()->CountItems(true), near.CountItems(true));

    // Of the stars of classes A to M most stand on the main sequence: all but giants, white
    // dwarfs and stars whose published type is uncertain. Of those typed as dwarfs (luminosity
    // class V) nearly all do.
    int32_t dwarfClasses = 0, onSequence = 0, typedDwarfs = 0, typedOnSequence = 0;
    int32_t placedOnDiagram = 0;
    for (int32_t i = 0; i < view->PlotCount(); i++) {
        const HRPlot& plot = view->Plots()[i];
        placedOnDiagram
            += plot.x >= 20 && plot.x < HRDView::kWidth && plot.y >= 0 && plot.y < HRDView::kHeight;
        const SpectralClass* sc = plot.star->GetSpectralClass();
        if (sc->GetHarvardClass() < kClassA || sc->GetHarvardClass() > kClassM)
            continue;
        const bool on
            = std::abs(plot.star->GetMagnitude() - MainSequence(sc->SCToDouble())) <= kBand;
        const char* type = sc->GetSCString();
        const bool typedDwarf = std::strchr(type, 'V') && !std::strchr(type, 'I');
        dwarfClasses++;
        onSequence += on;
        typedDwarfs += typedDwarf;
        typedOnSequence += typedDwarf && on;
    }
    const double share = double(onSequence) / dwarfClasses;
    const double typedShare = double(typedOnSequence) / typedDwarfs;
    std::printf("%d stars plotted, %d on the diagram; of classes A to M %d, %d (%.1f %%) within "
                "%.1f mag of the main sequence; typed as dwarfs %d, %d (%.1f %%)\n",
        view->PlotCount(), placedOnDiagram, dwarfClasses, onSequence, 100 * share, kBand,
        typedDwarfs, typedOnSequence, 100 * typedShare);
    EXPECT_EQ(view->PlotCount(), stars) << "every star is plotted";
    EXPECT_GT(dwarfClasses, 1000);
    EXPECT_GE(share, 0.75) << "the main sequence does not show";
    EXPECT_GT(typedDwarfs, 300);
    EXPECT_GE(typedShare, 0.9) << "stars typed as dwarfs stray from the main sequence";

    // The sequence runs from upper left to lower right: the mean magnitude of each class is
    // fainter than that of the class before.
    double meanBefore = -100;
    for (int32_t letter = kClassA; letter <= kClassM; letter++) {
        double sum = 0;
        int32_t count = 0;
        for (int32_t i = 0; i < view->PlotCount(); i++) {
            const Star* star = view->Plots()[i].star;
            if (star->GetSpectralClass()->GetHarvardClass() == letter
                && std::abs(
                       star->GetMagnitude() - MainSequence(star->GetSpectralClass()->SCToDouble()))
                    <= kBand) {
                sum += star->GetMagnitude();
                count++;
            }
        }
        ASSERT_GT(count, 5) << "class " << SpectralClass::HCToChar(HarvardClass(letter));
        EXPECT_GT(sum / count, meanBefore)
            << "class " << SpectralClass::HCToChar(HarvardClass(letter));
        meanBefore = sum / count;
    }

    // The white dwarfs: plotted on the diagram, each at least seven magnitudes fainter than a
    // dwarf of its class, and together in a group (within four classes and four magnitudes).
    const auto plotOf = [&](const char* system, bool (*which)(const Star*)) -> const HRPlot* {
        for (int32_t i = 0; i < view->PlotCount(); i++) {
            const HRPlot& plot = view->Plots()[i];
            if (std::strcmp(sky.SystemAt(int32_t(plot.systemIndex))->GetName(), system) == 0
                && which(plot.star))
                return &plot;
        }
        return nullptr;
    };
    const auto isWhiteDwarf
        = [](const Star* star) { return star->GetSpectralClassString()[0] == 'D'; };
    const HRPlot* whiteDwarfs[] = {
        plotOf("Sirius", isWhiteDwarf),
        plotOf("Procyon", isWhiteDwarf),
        plotOf("Keid", isWhiteDwarf), // 40 Eridani B
        plotOf("van Maanen's Star", isWhiteDwarf),
    };
    const char* names[] = { "Sirius B", "Procyon B", "40 Eridani B", "van Maanen's Star" };
    float left = 1e9f, right = -1e9f, top = 1e9f, bottom = -1e9f;
    for (size_t i = 0; i < std::size(whiteDwarfs); i++) {
        const HRPlot* plot = whiteDwarfs[i];
        ASSERT_NE(plot, nullptr) << names[i] << " is not plotted";
        const Star* star = plot->star;
        EXPECT_TRUE(plot->x >= 20 && plot->x < HRDView::kWidth && plot->y < HRDView::kHeight)
            << names[i] << " (" << star->GetSpectralClassString() << ") is off the diagram at "
            << plot->x << ", " << plot->y;
        EXPECT_GT(star->GetMagnitude(), MainSequence(star->GetSpectralClass()->SCToDouble()) + 7)
            << names[i] << " is not below the main sequence";
        left = std::min(left, plot->x);
        right = std::max(right, plot->x);
        top = std::min(top, plot->y);
        bottom = std::max(bottom, plot->y);
    }
    EXPECT_LE(right - left, 4 * 40) << "the white dwarfs are spread over the classes";
    EXPECT_LE(bottom - top, 4 * 11.2f) << "the white dwarfs are spread over the magnitudes";

    // A picture of it, with Sirius B named on the plot-name line.
    if (const char* shots = std::getenv("ND_SCREENSHOTS")) {
        window.show();
        QTest::mouseMove(view, QPoint(int(whiteDwarfs[0]->x), int(whiteDwarfs[0]->y)));
        DeliverPostedMessages();
        EXPECT_TRUE(window.grab().save(QString(shots) + "/hr-diagram.png"));
    }
}
