// Memory given back: what the program holds after its windows have closed, measured as the
// resident set the kernel counts for the process.
#include "app/ThreeDNightdomeApp.h"
#include "chart/UniverseView.h"
#include "chart/UniverseWindow.h"
#include "controls/ControlWindow.h"
#include "hrd/HRDWindow.h"
#include "info/StarInfoWindow.h"
#include "lists/ListWindow.h"
#include "platform/qt/Messaging.h"
#include "platform/qt/ThreadMailbox.h"

#include <QPointer>
#include <QTest>
#include <cstdio>
#include <filesystem>
#include <gtest/gtest.h>
#include <malloc.h>
#include <unistd.h>

namespace {

// Under the sanitizers the allocator is the sanitizer's own: it holds freed memory back on
// purpose (to catch late uses) and keeps books of its own, so neither the resident set nor the
// heap in use says anything about the program there. Those builds run fewer windows through
// the same paths, for what the sanitizers check, and do not weigh the memory.
#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
constexpr bool kSanitized = true;
constexpr int kCharts = 6, kWarmUpCycles = 3, kCycles = 20;
#else
constexpr bool kSanitized = false;
constexpr int kCharts = 24, kWarmUpCycles = 30, kCycles = 300;
#endif

// Bytes the allocator has handed out and not had back, in all its arenas.
int64_t HeapInUseKB()
{
    return int64_t(mallinfo2().uordblks) / 1024;
}

// Resident memory of this process in kilobytes, from the kernel's page count.
int64_t ResidentKB()
{
    std::FILE* statm = std::fopen("/proc/self/statm", "r");
    if (!statm)
        return -1;
    long size = 0, resident = 0;
    const int read = std::fscanf(statm, "%ld %ld", &size, &resident);
    std::fclose(statm);
    if (read != 2)
        return -1;
    return int64_t(resident) * (sysconf(_SC_PAGESIZE) / 1024);
}

class MemoryTest : public ::testing::Test {
protected:
    void SetUp() override
    {
        int argc = 1;
        char name[] = "nightdome";
        char* argv[] = { name, nullptr };
        // The catalogue the program is installed with: the charts draw a real sky.
        StartOptions options;
        options.catalogue
            = (std::filesystem::path(ND_PROGRAM).parent_path() / "stars.dat").string();
        ASSERT_TRUE(std::filesystem::exists(options.catalogue)) << "run scripts/setup, then build";
        fApplication = new ThreeDNightdomeApp(argc, argv, options);
        fControls = fApplication->GetControlWindow();
    }
    void TearDown() override
    {
        delete fApplication;
        QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    }

    // Clicks the control window's button named button, as the user does, and lets the window it
    // opens draw its first frames.
    void Click(const char* button)
    {
        auto* widget = fControls->findChild<QWidget*>(button);
        ASSERT_NE(widget, nullptr) << button;
        QTest::mouseClick(widget, Qt::LeftButton, Qt::NoModifier, QPoint(16, 16));
        Settle();
    }

    // Every window closes as the window manager's close button closes it; then what its close
    // posted and its deletion are carried out.
    static void Close(QWidget* window)
    {
        window->windowHandle()->close();
        Settle();
    }

    // Delivers what is posted and what waits to be deleted, a few rounds so that what those
    // post is delivered too.
    static void Settle()
    {
        for (int round = 0; round < 3; round++) {
            DeliverPostedMessages();
            ThreadMailbox::Instance().Deliver();
            QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
            QCoreApplication::processEvents();
        }
    }

    // Waits until the chart has drawn a few frames, at most five seconds.
    static bool Draws(UniverseWindow* chart)
    {
        UniverseView* view = chart->View();
        const int64_t start = view->FramesRendered();
        return QTest::qWaitFor([&] { return view->FramesRendered() >= start + 3; }, 5000);
    }

    ThreeDNightdomeApp* fApplication = nullptr;
    ControlWindow* fControls = nullptr;
};

} // namespace

TEST_F(MemoryTest, ClosingTwentyFourChartsGivesTheirMemoryBack)
{
    ASSERT_EQ(fControls->UniverseWindows().size(), 1);
    ASSERT_TRUE(Draws(fControls->UniverseWindows()[0]));
    Settle();
    const int64_t oneChart = ResidentKB();
    for (int i = 1; i < kCharts; i++)
        Click("New Nightdome Button");
    ASSERT_EQ(fControls->UniverseWindows().size(), kCharts);
    for (const QPointer<UniverseWindow>& chart : fControls->UniverseWindows())
        ASSERT_TRUE(Draws(chart));
    const int64_t allCharts = ResidentKB();
    const QList<QPointer<UniverseWindow>> charts = fControls->UniverseWindows();
    for (const QPointer<UniverseWindow>& chart : charts)
        Close(chart);
    ASSERT_TRUE(fControls->UniverseWindows().isEmpty());
    for (const QPointer<UniverseWindow>& chart : charts)
        EXPECT_TRUE(chart.isNull()) << "a closed chart was not deleted";
    const int64_t closed = ResidentKB();
    std::printf("resident: one chart %lld kB, %d charts %lld kB, all closed %lld kB\n",
        (long long)oneChart, kCharts, (long long)allCharts, (long long)closed);
    if (!kSanitized) {
        EXPECT_LT(closed, oneChart + 10 * 1024);
    }
}

TEST_F(MemoryTest, OpeningAndClosingWindowsAgainAndAgainDoesNotGrow)
{
    // A chart, a list, an H-R diagram and a star information window, opened with their buttons
    // and closed as the window manager closes them.
    const auto cycle = [&] {
        Click("New Nightdome Button");
        Click("New List Window Button");
        Click("Show H-R Window Button");
        Click("Show Info Window Button");
        ASSERT_EQ(fControls->OtherWindows().size(), 3);
        QList<QPointer<QWidget>> opened { fControls->UniverseWindows().last().data() };
        for (QWidget* window : fControls->OtherWindows())
            opened.append(window);
        for (const QPointer<QWidget>& window : opened)
            Close(window);
        for (const QPointer<QWidget>& window : opened)
            ASSERT_TRUE(window.isNull()) << "a closed window was not deleted";
    };
    for (int i = 0; i < kWarmUpCycles; i++)
        ASSERT_NO_FATAL_FAILURE(cycle());
    const int64_t warmResident = ResidentKB();
    const int64_t warmHeap = HeapInUseKB();
    for (int i = 0; i < kCycles; i++)
        ASSERT_NO_FATAL_FAILURE(cycle());
    const int64_t resident = ResidentKB();
    const int64_t heap = HeapInUseKB();
    std::printf("after the warm-up: resident %lld kB, heap in use %lld kB; after %d cycles more: "
                "%lld kB, %lld kB\n",
        (long long)warmResident, (long long)warmHeap, kCycles, (long long)resident,
        (long long)heap);
    EXPECT_EQ(fControls->UniverseWindows().size(), 1);
    if (!kSanitized) {
        EXPECT_LT(resident - warmResident, 1024);
        // Tighter than the resident set, which the allocator's reuse of freed memory hides:
        // what stays allocated. A few hundred bytes a cycle are Qt's (fonts, style); a window's
        // worth of anything is kilobytes.
        EXPECT_LT(heap - warmHeap, 512);
    }
}
