// Drawing one frame on several render threads at once: every share is drawn exactly once, so the
// picture is the one a single thread draws, and settings changed while the chart runs show in
// the next frames exactly as a chart built with them draws them.
#include "ChartFixture.h"

#include <QTest>

namespace {

bool WaitForFrames(UniverseView* view, int64_t frames)
{
    return QTest::qWaitFor([&] { return view->FramesRendered() >= frames; }, 20000);
}

int CountLit(const std::vector<uint8_t>& pixels)
{
    int n = 0;
    for (uint8_t p : pixels)
        n += p != 0;
    return n;
}

// The frame a running chart shows a few frames from now: by then every frame begun after the
// call has read the settings as they are now.
QImage ShownSoon(UniverseView* view)
{
    const int64_t now = view->FramesRendered();
    EXPECT_TRUE(WaitForFrames(view, now + 3));
    return view->FrontImage();
}

struct Settings {
    double brightness = 2000.0;
    double contrast = 1.0;
    double clipping = 10000.0; // parsecs
};

} // namespace

class ParallelRenderTest : public ChartTest {
protected:
    // What a chart of the grid universe built with these settings shows once it runs.
    QImage FreshChart(Universe* universe, int32_t threads, const Settings& settings)
    {
        auto view = MakeGridView(universe, threads);
        view->lumFactor = settings.brightness;
        view->stellarContrast = settings.contrast;
        view->distanceFilter = settings.clipping;
        view->AttachedToWindow();
        EXPECT_TRUE(WaitForFrames(view.get(), 2));
        QImage shown = view->FrontImage();
        view->DetachedFromWindow();
        return shown;
    }
};

TEST_F(ParallelRenderTest, TwoToEightThreadsDrawTheOneThreadFramePixelForPixel)
{
    Universe* u = MakeGridUniverse();
    ASSERT_EQ(u->CountItems(), kGridSystems);

    auto single = MakeGridView(u, 1);
    single->CalculateLumCache();
    single->Render();
    const std::vector<uint8_t> reference = Pixels(single.get());
    // Every grid point and the ten glows are there: 13,286 points, each glow well over one
    // pixel, and the overlay on top.
    ASSERT_GT(CountLit(reference), 13286 + 10 * 20);

    for (int32_t threads = 2; threads <= UniverseView::kMaxRenderThreads; threads++) {
        for (bool blocks : { true, false }) {
            auto view = MakeGridView(u, threads);
            view->interleaveBlocks = blocks;
            view->CalculateLumCache();
            // Several frames, so the workers are parked and resumed between them.
            for (int frame = 0; frame < 3; frame++) {
                view->Render();
                ASSERT_EQ(Pixels(view.get()), reference)
                    << threads << " threads, " << (blocks ? "blocks" : "single systems")
                    << ", frame " << frame;
            }
        }
    }
}

TEST_F(ParallelRenderTest, EveryThreadHasSystemsToDraw)
{
    // The grid universe deals each of eight threads at least one block with drawn systems in it:
    // without thread k's share, the frame loses pixels.
    Universe* u = MakeGridUniverse();
    auto whole = MakeGridView(u, 1);
    whole->CalculateLumCache();
    whole->Render();
    const int all = CountLit(Pixels(whole.get()));
    for (int32_t share = 0; share < UniverseView::kMaxRenderThreads; share++) {
        auto view = MakeGridView(u, 1);
        view->CalculateLumCache();
        view->renderLock->Acquire();
        view->RenderBackground();
        for (int32_t k = 0; k < UniverseView::kMaxRenderThreads; k++) {
            if (k != share)
                view->RenderShare(UniverseView::kMaxRenderThreads, k);
        }
        view->renderLock->Release();
        EXPECT_LT(CountLit(Pixels(view.get())), all - 100) << "share " << share;
    }
}

TEST_F(ParallelRenderTest, SettingsChangedWhileRunningDrawLikeAFreshChart)
{
    Universe* u = MakeGridUniverse();
    const int32_t threads = 4;
    auto view = MakeGridView(u, threads);
    view->AttachedToWindow();
    ASSERT_TRUE(WaitForFrames(view.get(), 2));

    Settings settings;
    QImage before = ShownSoon(view.get());
    EXPECT_EQ(before, FreshChart(u, threads, settings));

    // Brighter, then steeper, then clipped to 5 pc: each change shows in the running chart's
    // next frames exactly as a new chart with the same settings draws them.
    const auto step = [&](const char* what) {
        const QImage shown = ShownSoon(view.get());
        EXPECT_NE(shown, before) << what << " changed nothing";
        EXPECT_EQ(shown, FreshChart(u, threads, settings)) << what;
        before = shown;
    };
    settings.brightness = view->lumFactor = 5000.0;
    step("brightness");
    settings.contrast = view->stellarContrast = 1.3;
    step("contrast");
    settings.clipping = view->distanceFilter = 5.0;
    step("clipping");
    // And back out again: the clipped systems return.
    settings.clipping = view->distanceFilter = 10000.0;
    step("clipping undone");

    view->DetachedFromWindow();
}
