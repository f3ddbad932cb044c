// The H-R diagram window: its layout and help, its clear button, following a chart's selection,
// and the control window's button that opens it.
#include "chart/ChartFixture.h"

#include "CommaLocale.h"

#include "controls/ControlWindow.h"
#include "controls/ControlsOnTwoStars.h"
#include "core/MessageCodes.h"
#include "hrd/HRDView.h"
#include "hrd/HRDWindow.h"
#include "platform/qt/RecordingHandler.h"
#include "widgets/IPictureButton.h"
#include "widgets/InfoView.h"
#include "widgets/WidgetEvents.h"

#include <QTest>
#include <gtest/gtest.h>
#include <memory>

namespace {

class HRDWindowTest : public ChartTest {
protected:
    void SendUniverse(HRDWindow* window, Universe* universe)
    {
        Message message(kUniversePointer);
        message.AddPointer(kUniversePtrString, universe);
        ASSERT_TRUE(PostMessageToView(window, "HRView", message));
        DeliverPostedMessages();
    }

    // A window over the Sun and Vega, Vega plotted; the fixture owns it.
    HRDWindow* WindowWithVega()
    {
        Universe* universe
            = MakeUniverse({ { "The Sun", 0, 0, 0, 4.83 }, { "Vega", 1, 4, -5, 0.58, "A0V" } });
        fWindow = std::make_unique<HRDWindow>(BPoint(150, 150), "H-R Diagram", &help);
        SendUniverse(fWindow.get(), universe);
        Message star(kStarMessage);
        star.AddInt32(kSystemIndexString, 1);
        fWindow->View()->MessageReceived(&star);
        return fWindow.get();
    }

    RecordingHandler help;
    std::unique_ptr<HRDWindow> fWindow;
};

} // namespace

TEST_F(HRDWindowTest, TheDiagramAboveAPlotNameLineAndAClearButton)
{
    auto* window = new HRDWindow(BPoint(150, 150), "H-R Diagram", &help);
    const std::unique_ptr<HRDWindow> owner(window);
    EXPECT_TRUE(window->isVisible());
    EXPECT_EQ(window->windowTitle(), "H-R Diagram");
    EXPECT_EQ(window->geometry(), QRect(150, 150, 300, 308));
    EXPECT_EQ(window->minimumSize(), window->maximumSize()) << "the window is of fixed size";
    EXPECT_TRUE(window->testAttribute(Qt::WA_DeleteOnClose));

    auto* main = window->findChild<QWidget*>("mainview");
    ASSERT_NE(main, nullptr);
    EXPECT_EQ(main->geometry(), QRect(0, 0, 300, 308));
    EXPECT_EQ(main->palette().color(QPalette::Window), QColor(220, 220, 220));

    HRDView* view = window->View();
    EXPECT_EQ(window->findChild<HRDView*>("HRView"), view);
    EXPECT_EQ(view->geometry(), QRect(0, 0, 300, 295));
    EXPECT_EQ(view->IGetTarget(), &help);
    EXPECT_EQ(view->PlotNameInfo()->IGetTarget(), window->PlotName());

    InfoView* plotName = window->PlotName();
    EXPECT_EQ(plotName->objectName(), "Plot Name");
    EXPECT_EQ(plotName->geometry(), QRect(0, 296, 288, 12));
    EXPECT_EQ(plotName->text(), "");
    EXPECT_EQ(plotName->IGetTarget(), &help);
    EXPECT_STREQ(plotName->IGetInfo(), "Plot name");

    IPictureButton* clear = window->ClearButton();
    EXPECT_EQ(clear->objectName(), "Clear Button");
    EXPECT_EQ(clear->geometry(), QRect(288, 296, 12, 12));
    EXPECT_EQ(clear->IGetTarget(), &help);
    EXPECT_STREQ(clear->IGetInfo(), "Clear H-R Diagram");
    ASSERT_NE(clear->GetMessage(), nullptr);
    EXPECT_EQ(clear->GetMessage()->what, kHRDClear);
    EXPECT_EQ(clear->Target(), view);
    // Its pictures are the 12 x 12 ones made for it.
    EXPECT_EQ(clear->NormalImage()->Width(), 12);
    EXPECT_NE(::Pixels(*clear->NormalImage()), ::Pixels(*clear->OverImage()));
}

TEST_F(HRDWindowTest, TheClearButtonEmptiesTheDiagram)
{
    HRDWindow* window = WindowWithVega();
    ASSERT_EQ(window->View()->PlotCount(), 1);

    QTest::mouseClick(window->ClearButton(), Qt::LeftButton, Qt::NoModifier, QPoint(6, 6));
    DeliverPostedMessages();
    EXPECT_EQ(window->View()->PlotCount(), 0);
    EXPECT_EQ(::Pixels(*window->View()->Canvas()), ::Pixels(*window->View()->Background()));
}

TEST_F(HRDWindowTest, HoveringAMarkerWritesThePlotNameLine)
{
    HRDWindow* window = WindowWithVega();
    const HRPlot& plot = window->View()->Plots()[0];
    QTest::mouseMove(window->View(), QPoint(int(plot.x), int(plot.y)));
    DeliverPostedMessages();
    EXPECT_EQ(window->PlotName()->text(), "Vega ( 0.6 A0.0 )");
    QTest::mouseMove(window->View(), QPoint(150, 20));
    DeliverPostedMessages();
    EXPECT_EQ(window->PlotName()->text(), "");
}

TEST_F(HRDWindowTest, SelectingOnAFollowedChartPlotsTheSelection)
{
    Universe* universe = MakeUniverse({ { "The Sun", 0, 0, 0, 4.83 },
        { "Vega", 1, 4, -5, 0.58, "A0V" }, { "Sirius", -0.5, -0.8, 2.5, 1.43, "A1V" } });
    UniverseView* chart = MakeView(universe);
    auto* window = new HRDWindow(BPoint(150, 150), "H-R Diagram", &help);
    auto owner = std::unique_ptr<HRDWindow>(window);
    SendUniverse(window, universe);
    window->FollowSelection(chart);
    DeliverPostedMessages();
    ASSERT_EQ(chart->subscribers.CountItems(), 1);
    const auto* subscriber = static_cast<const SISubscriber*>(chart->subscribers.ItemAt(0));
    EXPECT_EQ(subscriber->handler, window->View());
    EXPECT_EQ(subscriber->looper, window);
    EXPECT_EQ(subscriber->flags, kSISelectionChanged | kSIWithSelection);

    chart->mouseInside = true;
    chart->UpdateData(2, 1); // Sirius selected, Vega under the mouse
    DeliverPostedMessages();
    ASSERT_EQ(window->View()->PlotCount(), 1);
    EXPECT_EQ(window->View()->Plots()[0].systemIndex, 2);
    chart->UpdateData(2, 0); // only the target moved: nothing new
    chart->UpdateData(1, 0);
    DeliverPostedMessages();
    ASSERT_EQ(window->View()->PlotCount(), 2);
    EXPECT_EQ(window->View()->Plots()[1].systemIndex, 1);

    // Closed, the window hears nothing more, and the chart forgets it at the next subscription.
    owner.reset();
    chart->UpdateData(0, 0);
    DeliverPostedMessages();
    auto* next = new HRDWindow(BPoint(150, 150), "H-R Diagram", &help);
    const std::unique_ptr<HRDWindow> nextOwner(next);
    next->FollowSelection(chart);
    DeliverPostedMessages();
    ASSERT_EQ(chart->subscribers.CountItems(), 1);
    EXPECT_EQ(
        static_cast<const SISubscriber*>(chart->subscribers.ItemAt(0))->handler, next->View());
}

TEST_F(HRDWindowTest, TheFirstEntryPutsTheDiagramsHelpOnTheHelpLine)
{
    InfoView helpLine(BRect(0, 0, 299, 11), "Info View", "");
    Universe* universe = MakeUniverse({ { "The Sun", 0, 0, 0, 4.83 } });
    HRDWindow window(BPoint(150, 150), "H-R Diagram", &helpLine);
    SendUniverse(&window, universe);
    HRDView* view = window.View();

    // In from the left edge, as a hand moves the mouse: the diagram is empty, and says how to
    // fill it.
    Enter(view);
    for (int x = 2; x <= 40; x += 6)
        MoveMouse(view, QPoint(x, 200));
    EXPECT_EQ(helpLine.text(), "Drag & drop stars from other views here");
    Leave(view);
    DeliverPostedMessages();
    EXPECT_EQ(helpLine.text(), "");

    // With a star plotted, the help over empty space offers them all.
    Message star(kStarMessage);
    star.AddInt32(kSystemIndexString, 0);
    view->MessageReceived(&star);
    Enter(view);
    MoveMouse(view, QPoint(2, 200));
    MoveMouse(view, QPoint(8, 200));
    EXPECT_EQ(helpLine.text(), "Click to drag & drop all stars");
}

TEST_F(HRDWindowTest, ThePlotNameLineWritesNumbersWithAPointInADecimalCommaLocale)
{
    // The catalogue is written before the locale changes: it is read as a file of the program.
    HRDWindow* window = WindowWithVega();
    const CommaLocale comma;
    ASSERT_TRUE(comma.Active()) << "the de_DE.UTF-8 locale is missing: run scripts/setup";
    const HRPlot& plot = window->View()->Plots()[0];
    Enter(window->View());
    MoveMouse(window->View(), QPoint(int(plot.x) - 8, int(plot.y)));
    MoveMouse(window->View(), QPoint(int(plot.x), int(plot.y)));
    EXPECT_EQ(window->PlotName()->text(), "Vega ( 0.6 A0.0 )");
}

namespace {

// Watches every message the application delivers for one that names a given handler.
class HandlerWatch : public QObject {
public:
    explicit HandlerWatch(const void* handler)
        : fHandler(handler)
    {
        // Filters installed last see events first: this one comes before the dispatcher.
        Message nothing;
        PostMessage(QCoreApplication::instance(), nothing);
        DeliverPostedMessages();
        QCoreApplication::instance()->installEventFilter(this);
    }
    ~HandlerWatch() override { QCoreApplication::instance()->removeEventFilter(this); }

    bool named = false;

protected:
    bool eventFilter(QObject*, QEvent* event) override
    {
        if (event->type() == MessageEvent::EventType()
            && static_cast<MessageEvent*>(event)->message.FindPointer(kSIHandlerPtrString)
                == fHandler)
            named = true;
        return false;
    }

private:
    const void* fHandler;
};

} // namespace

TEST_F(HRDWindowTest, AWindowClosedBeforeTheChartGetsItsSubscriptionIsNotSubscribed)
{
    Universe* universe = MakeUniverse({ { "The Sun", 0, 0, 0, 4.83 },
        { "Vega", 1, 4, -5, 0.58, "A0V" }, { "Sirius", -0.5, -0.8, 2.5, 1.43, "A1V" } });
    UniverseView* chart = MakeView(universe);
    auto window = std::make_unique<HRDWindow>(BPoint(150, 150), "H-R Diagram", &help);
    const HandlerWatch watch(static_cast<QObject*>(window->View()));
    window->FollowSelection(chart);
    // Closed while the request still waits in the chart's queue: the chart is never handed a
    // pointer to it, and subscribes nothing.
    window.reset();
    DeliverPostedMessages();
    EXPECT_FALSE(watch.named) << "the chart was handed the closed diagram";
    EXPECT_EQ(chart->subscribers.CountItems(), 0);

    // The chart's next selection goes nowhere.
    chart->mouseInside = true;
    chart->UpdateData(2, 1);
    DeliverPostedMessages();
    EXPECT_EQ(chart->subscribers.CountItems(), 0);
}

TEST(HRDFromControlWindow, TheButtonOpensADiagramThatFollowsEveryChart)
{
    ControlsOnTwoStars program;
    ControlWindow& controls = program.controls;
    auto* window = program.Open<HRDWindow>("Show H-R Window Button");
    ASSERT_NE(window, nullptr);
    EXPECT_EQ(controls.OtherWindows().size(), 1);
    EXPECT_EQ(window->windowTitle(), "H-R Diagram");
    EXPECT_EQ(window->geometry(), QRect(150, 150, 300, 308));
    EXPECT_EQ(window->View()->IGetTarget(), controls.GetInfoView());
    // The universe came to the view by message.
    ASSERT_NE(window->View()->PlottedSystems(), nullptr);
    EXPECT_EQ(window->View()->PlottedSystems()->GetSystemCount(), 2);

    const auto subscribed = [window](UniverseWindow* chartWindow) {
        auto* chart = chartWindow->findChild<UniverseView*>("UniverseView");
        chart->renderLock->Acquire();
        bool found = false;
        for (int32_t i = 0; i < chart->subscribers.CountItems(); i++) {
            found |= static_cast<const SISubscriber*>(chart->subscribers.ItemAt(i))->handler
                == window->View();
        }
        chart->renderLock->Release();
        return found;
    };
    ASSERT_EQ(controls.UniverseWindows().size(), 1);
    EXPECT_TRUE(subscribed(controls.UniverseWindows().front()));

    // A chart opened later is followed too.
    Message newChart(kNewUniverseWindow);
    controls.MessageReceived(&newChart);
    DeliverPostedMessages();
    ASSERT_EQ(controls.UniverseWindows().size(), 2);
    EXPECT_TRUE(subscribed(controls.UniverseWindows().back()));
}
