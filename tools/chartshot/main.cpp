// nightdome-chartshot: renders one frame of a catalogue as the chart draws it and writes it to a
// PNG, without a window. For screenshots, documentation and looking at what a change did.
#include "catalog/Star.h"
#include "catalog/StarSystem.h"
#include "catalog/Universe.h"
#include "chart/UniverseView.h"
#include "platform/qt/BitmapImage.h"
#include "render/SpectralTables.h"
#include "resources/ResourceData.h"

#include <QApplication>
#include <cstdio>
#include <cstring>
#include <filesystem>
#include <string>

namespace {

const char* kUsage = R"(Usage: nightdome-chartshot [options] CATALOGUE OUTPUT.png

Renders one frame of the star chart of CATALOGUE (a stars.dat) and writes it as a PNG.

Options:
  --size=WxH        the chart's size in pixels (default 640x480)
  --distance=PC     the camera's distance from the origin in parsecs (default 25)
  --turn=RADIANS    turn the chart about the vertical axis first (default 0)
  --pitch=RADIANS   then tilt it about the screen's horizontal axis (default 0)
  --brightness=F    the brightness factor the chart's brightness slider sets (default 2000)
  --contrast=F      the stellar contrast its contrast slider sets (default 1)
  --clip=PC         hide the systems farther than PC parsecs from the origin, as the
                    chart's distance slider does (default: none)
  --origin=NAME     make the system of the star named NAME the origin, as a click on
                    it in the chart does (default: the Sun)
  --threads=N       render threads (default 1)
  --frames=N        frames to advance before the picture (default 1)
)";

bool Value(const char* arg, const char* option, std::string* value)
{
    const size_t n = std::strlen(option);
    if (std::strncmp(arg, option, n) != 0 || arg[n] != '=')
        return false;
    *value = arg + n + 1;
    return true;
}

} // namespace

int main(int argc, char** argv)
{
    if (qEnvironmentVariableIsEmpty("QT_QPA_PLATFORM"))
        qputenv("QT_QPA_PLATFORM", "offscreen");
    QApplication application(argc, argv);

    int width = 640, height = 480, threads = 1, frames = 1;
    double distance = 25, turn = 0, tilt = 0, brightness = 2000, contrast = 1, clip = -1;
    std::string catalogue, output, value, origin;
    for (int i = 1; i < argc; i++) {
        if (Value(argv[i], "--size", &value)) {
            if (std::sscanf(value.c_str(), "%dx%d", &width, &height) != 2 || width < 8
                || height < 8) {
                std::fprintf(
                    stderr, "nightdome-chartshot: --size needs WxH, not '%s'\n", value.c_str());
                return 2;
            }
        } else if (Value(argv[i], "--distance", &value)) {
            distance = std::atof(value.c_str());
        } else if (Value(argv[i], "--turn", &value)) {
            turn = std::atof(value.c_str());
        } else if (Value(argv[i], "--pitch", &value)) {
            tilt = std::atof(value.c_str());
        } else if (Value(argv[i], "--brightness", &value)) {
            brightness = std::atof(value.c_str());
        } else if (Value(argv[i], "--clip", &value)) {
            clip = std::atof(value.c_str());
        } else if (Value(argv[i], "--contrast", &value)) {
            contrast = std::atof(value.c_str());
        } else if (Value(argv[i], "--origin", &value)) {
            origin = value;
        } else if (Value(argv[i], "--threads", &value)) {
            threads = std::atoi(value.c_str());
        } else if (Value(argv[i], "--frames", &value)) {
            frames = std::max(1, std::atoi(value.c_str()));
        } else if (!std::strcmp(argv[i], "-h") || !std::strcmp(argv[i], "--help")) {
            std::fputs(kUsage, stdout);
            return 0;
        } else if (catalogue.empty()) {
            catalogue = argv[i];
        } else if (output.empty()) {
            output = argv[i];
        } else {
            std::fputs(kUsage, stderr);
            return 2;
        }
    }
    if (output.empty()) {
        std::fputs(kUsage, stderr);
        return 2;
    }

    InitResources();
    ScopedSpectralTables tables;
    // Named on the command line, so relative to the working directory, not to the program.
    const std::string path = std::filesystem::absolute(catalogue).string();
    Universe universe(path.c_str(), 1000000, 5000);
    if (universe.CountItems() == 0)
        std::fprintf(stderr, "nightdome-chartshot: %s holds no stars; the chart is empty\n",
            catalogue.c_str());
    UniverseView view(
        BRect(0, 0, float(width - 1), float(height - 1)), "UniverseView", &universe, threads);
    view.InitOffscreen();
    view.cameraDistance = distance;
    *view.GetLumFactor() = brightness;
    *view.GetStellarContrast() = contrast;
    if (!origin.empty()) {
        const StarSystem* found = nullptr;
        for (int32_t i = 0; i < universe.CountItems() && !found; i++) {
            const StarSystem* system = universe.SystemAt(i);
            for (int32_t s = 0; s < system->CountItems() && !found; s++) {
                if (origin == system->StarAt(s)->GetName()) {
                    found = system;
                    view.originSystem = i;
                }
            }
        }
        if (!found) {
            std::fprintf(stderr, "nightdome-chartshot: no star named '%s' in %s\n", origin.c_str(),
                catalogue.c_str());
            return 1;
        }
        // Straight there, without the glide a click starts.
        view.originOffset.Set(-found->position.x, -found->position.y, -found->position.z);
        view.cameraPosition = view.originOffset;
    }
    *view.GetRadialVelocityY() = turn;
    view.radialVelocityX = tilt / 0.9; // the first frame's step damps it by 0.9
    if (clip >= 0)
        *view.GetDistanceFilter() = clip;
    view.HideGreaterThan(*view.GetDistanceFilter());
    view.CalculateLumCache();
    for (int f = 0; f < frames; f++) {
        view.NextTransform();
        *view.GetRadialVelocityY() = 0;
        view.radialVelocityX = 0;
    }
    view.Render();
    if (!ImageOf(*view.Offscreen()).save(QString::fromStdString(output), "PNG")) {
        std::fprintf(stderr, "nightdome-chartshot: cannot write %s\n", output.c_str());
        return 1;
    }
    return 0;
}
