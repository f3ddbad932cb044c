// HandOverBench.cpp: a finished frame of a maximised chart (1920 x 1061 pixels) handed from the
// render thread to the interface thread and turned into colour there, as every threaded view
// shows its frames: the hand-over alone, and the hand-over with the paint request delivered and
// the conversion the paint does.
#include "platform/qt/FrameHandOver.h"
#include "platform/qt/ThreadMailbox.h"
#include "render/RBitmap8.h"

#include "WidgetBenchMain.h"

#include <QWidget>
#include <random>

namespace {

constexpr int32_t kWidth = 1920, kHeight = 1061; // pixels

// A frame of scattered palette indices: the look-ups do not depend on what they look up, and
// random indices keep the compiler and the branch predictor from guessing them.
RBitmap8& Frame()
{
    static RBitmap8* frame = [] {
        auto* made = new RBitmap8(BRect(0, 0, kWidth - 1, kHeight - 1));
        std::mt19937 random(27);
        for (int32_t i = 0; i < made->BitsLength(); i++)
            made->Bits()[i] = uint8_t(random());
        return made;
    }();
    return *frame;
}

// With convert 1, the interface thread's side too: the conversion a paint does.
void BM_HandOver(benchmark::State& state)
{
    const bool convert = state.range(0) != 0;
    QWidget view;
    FrameHandOver handOver(&view);
    for (auto _ : state) {
        benchmark::DoNotOptimize(handOver.HandOver(Frame()));
        // The paint request, as the interface thread takes it; the view is not shown, so no
        // paint follows.
        ThreadMailbox::Instance().Deliver();
        if (convert)
            benchmark::DoNotOptimize(handOver.NewestImage().constBits());
    }
    state.SetItemsProcessed(state.iterations() * int64_t(kWidth) * kHeight);
}
BENCHMARK(BM_HandOver)->ArgName("convert")->Arg(0)->Arg(1)->Unit(benchmark::kMicrosecond);

} // namespace

int main(int argc, char** argv)
{
    // The frame is made before any benchmark runs, so that none of them pays for it.
    return RunWidgetBenchmarks(argc, argv, [] { Frame(); });
}
