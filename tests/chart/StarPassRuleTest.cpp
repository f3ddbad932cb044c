// The star pass, however it is sped up, draws exactly what the rule draws system by system:
// transform, cull on the truncated screen point, brightness over the depth squared, a pixel or a
// glow. Checked over many systems in several views, with points placed a hair from the edges of
// pixels and of the frame, where a rounding different from the rule's would show.
#include "ChartFixture.h"

#include "chart/CoarseCull.h"
#include "core/Truncate.h"

#include <bit>
#include <random>

namespace {

// The glow's side for brightness b (at least 16), as the rule gives it.
int32_t RuleGlowSize(double b)
{
    const auto n = static_cast<uint64_t>(std::min(b, 9.2e18));
    int32_t k = 63;
    while (k > 2 && !(n >> k & 1))
        k--;
    return std::min(64, k * k / 8);
}

} // namespace

class StarPassRuleTest : public ChartTest {
protected:
    void EveryView();

    // What the rule draws for every system of the view's universe in its present transform, in
    // the order of the systems, into a bitmap of the view's frame.
    std::vector<uint8_t> RulePicture(UniverseView* view)
    {
        RBitmap8 picture(view->Frame(), false, false);
        picture.EraseMap(0);
        const BRect& frame = view->Frame();
        for (int32_t i = 0; i < view->universe->CountItems(); i++) {
            const StarSystem* system = view->universe->SystemAt(i);
            if (!view->drawMask->GetStateSafe(i))
                continue;
            SVector p = system->position;
            view->transform.Transform(&p);
            if (!(p.z > 0))
                continue;
            const int32_t sx = TruncateToInt32(p.x * view->focalLength / p.z + frame.right * 0.5);
            const int32_t sy = TruncateToInt32(-p.y * view->focalLength / p.z + frame.bottom * 0.5);
            if (!(0 < sx && sx < frame.right && 0 < sy && sy < frame.bottom))
                continue;
            const double b = view->lumCache[size_t(i)] / (p.z * p.z);
            if (b < 16.0) {
                const auto n = static_cast<int32_t>(b);
                if (n >= 1)
                    picture.RenderPointAdd(sx, sy, system->colorTable, uint8_t(8 * n));
            } else {
                const int32_t size = RuleGlowSize(b);
                picture.RenderBitmapAdd(
                    sx - size / 2, sy - size / 2, view->starSprite, size, system->colorTable);
            }
        }
        std::vector<uint8_t> pixels;
        for (int y = 0; y < picture.Height(); y++) {
            const uint8_t* row = picture.Bits() + y * picture.BytesPerRow();
            pixels.insert(pixels.end(), row, row + picture.Width());
        }
        return pixels;
    }
};

namespace {

// Systems spread through a cube of 120 pc about the Sun, with magnitudes from -4 to 16.
std::vector<TestSystem> Scattered(int count, uint64_t seed)
{
    std::mt19937_64 random(seed);
    std::uniform_real_distribution<double> coordinate(-60, 60), magnitude(-4, 16);
    const char* classes[] = { "O5V", "B2V", "A0V", "F5V", "G2V", "K5V", "M4V" };
    std::vector<TestSystem> systems;
    for (int i = 0; i < count; i++) {
        systems.push_back({ "S" + std::to_string(i), coordinate(random), coordinate(random),
            coordinate(random), magnitude(random), classes[random() % 7] });
    }
    return systems;
}

} // namespace

// The views of the test below, drawn with the coarse test at hand.
void StarPassRuleTest::EveryView()
{
    std::mt19937_64 random(20261124);
    std::vector<TestSystem> systems = Scattered(30000, 20261124);
    // Straight down the z axis from 25 pc back, single pixels (luminosity 1 at depth 25) within a
    // few units of the last place of pixel borders and of the frame's edges, x f / z + right / 2 =
    // k + d with |d| < 1e-13: there a product or quotient rounded otherwise than the rule's lands
    // on the other pixel.
    const double f = 199, c = 199 * 0.5, depth = 25;
    std::uniform_real_distribution<double> hair(-1e-13, 1e-13);
    for (int k = -1; k <= 201; k++) {
        for (int n = 0; n < 12; n++) {
            const double offset = (k + hair(random) - c) * depth / f;
            systems.push_back({ "X", offset, 0.3 + 0.01 * n, 0.0, 4.7, "G2V" });
            systems.push_back({ "Y", -0.7 - 0.01 * n, -offset, 0.0, 4.7, "K0V" });
        }
    }
    Universe* u = MakeUniverse(systems);
    UniverseView* view = MakeView(u, 1, 200);
    view->showClipSphere = false;
    view->CalculateLumCache();

    // The view along z from 25 pc back (where the points on the borders are aimed), then the
    // chart's own start and three turned and zoomed views.
    view->transform.InitIdentity();
    SMatrix back;
    back.InitTranslation(0, 0, depth);
    view->transform *= back;
    view->Render();
    EXPECT_EQ(Pixels(view), RulePicture(view)) << "along z";

    const double turns[][3]
        = { { 0.0, 0.0, 0.0 }, { 0.7, 0.2, -10 }, { -2.1, -0.4, 30 }, { 1.3, 0.9, -24.5 } };
    int drawn = 0;
    for (const auto& [yaw, pitch, zoom] : turns) {
        view->radialVelocityY = yaw;
        view->radialVelocityX = pitch / 0.9;
        view->cameraVelocityZ = zoom / 0.9;
        view->NextTransform();
        view->radialVelocityY = 0;
        view->radialVelocityX = 0;
        view->cameraVelocityZ = 0;
        view->Render();
        const std::vector<uint8_t> rule = RulePicture(view);
        EXPECT_EQ(Pixels(view), rule) << "turned " << yaw << ", " << pitch << ", " << zoom;
        for (uint8_t p : rule)
            drawn += p != 0;
    }
    // The views are not empty: thousands of pixels lit in all.
    EXPECT_GT(drawn, 5000);
}

TEST_F(StarPassRuleTest, EveryViewDrawsWhatTheRuleDrawsPixelForPixel)
{
    EveryView();
}

#ifdef ND_COARSE_CULL_AVX2
// The same views where the processor's vector version of the coarse test is not used.
TEST_F(StarPassRuleTest, EveryViewDrawsTheSameWithoutTheVectorCoarseTest)
{
    gCoarseCullPlain = true;
    EveryView();
    gCoarseCullPlain = false;
}
#endif

// Hidden systems are not drawn, faint ones neither (while the mouse is in the view they are all
// looked at, and draw nothing all the same), and the brightness and the contrast move what is
// drawn: the coarse test reads the mask and the brightness in one array, kept as they change.
TEST_F(StarPassRuleTest, HiddenFaintAndBrightenedSystemsDrawAsTheRuleDraws)
{
    Universe* u = MakeUniverse(Scattered(20000, 7));
    UniverseView* view = MakeView(u, 1, 200);
    view->showClipSphere = false;
    view->CalculateLumCache();
    view->HideGreaterThan(40);
    int hidden = 0;
    for (int32_t i = 0; i < u->CountItems(); i++)
        hidden += !view->drawMask->GetStateSafe(i);
    ASSERT_GT(hidden, 5000);

    const auto drawnPixels = [](const std::vector<uint8_t>& pixels) {
        return std::count_if(pixels.begin(), pixels.end(), [](uint8_t p) { return p != 0; });
    };
    view->Render();
    const std::vector<uint8_t> dim = RulePicture(view);
    EXPECT_EQ(Pixels(view), dim) << "a part hidden";
    EXPECT_GT(drawnPixels(dim), 500);

    view->mouseInside = true;
    view->Render();
    EXPECT_EQ(Pixels(view), RulePicture(view)) << "the mouse in the view";
    view->mouseInside = false;

    view->lumFactor = view->lumFactor.load() * 64;
    view->stellarContrast = 1.5;
    view->CalculateLumCache();
    view->Render();
    const std::vector<uint8_t> bright = RulePicture(view);
    EXPECT_EQ(Pixels(view), bright) << "brighter, more contrast";
    EXPECT_GT(drawnPixels(bright), drawnPixels(dim));

    view->HideGreaterThan(1000);
    view->Render();
    EXPECT_EQ(Pixels(view), RulePicture(view)) << "all shown again";
}

// A universe whose systems bring more colour tables than a byte can number: every system is
// still drawn with its own.
TEST_F(StarPassRuleTest, ThreeHundredColourTablesEachDrawTheirSystems)
{
    Universe* u = MakeUniverse(Scattered(3000, 11));
    std::vector<ColorTable> tables(300);
    for (size_t t = 0; t < tables.size(); t++) {
        tables[t] = *u->SystemAt(0)->colorTable;
        for (int k = 1; k < 256; k++)
            tables[t].colors[k] = { uint8_t(k * (t + 1) % 256), uint8_t(t % 256), uint8_t(k), 255 };
    }
    for (int32_t i = 0; i < u->CountItems(); i++)
        u->SystemAt(i)->colorTable = &tables[size_t(i) % tables.size()];
    UniverseView* view = MakeView(u, 1, 200);
    view->showClipSphere = false;
    view->CalculateLumCache();
    view->Render();
    const std::vector<uint8_t> rule = RulePicture(view);
    EXPECT_EQ(Pixels(view), rule);
    // The picture differs from one drawn with one table for all.
    for (int32_t i = 0; i < u->CountItems(); i++)
        u->SystemAt(i)->colorTable = &tables[0];
    EXPECT_NE(RulePicture(view), rule);
}
