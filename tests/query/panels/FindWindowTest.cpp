// The find window: its six panels in a column, its size limits and the scroll range, and the
// control window's button that opens it.
#include "PanelFixture.h"

#include "catalog/TempCatalogue.h"
#include "controls/ControlWindow.h"
#include "platform/ExecutablePath.h"
#include "platform/qt/RecordingHandler.h"
#include "query/panels/DECQueryView.h"
#include "query/panels/DistQueryView.h"
#include "query/panels/FindWindow.h"
#include "query/panels/MGQueryView.h"
#include "query/panels/NameQueryView.h"
#include "query/panels/RAQueryView.h"
#include "query/panels/SCQueryView.h"
#include "query/panels/TextControl.h"
#include "render/SpectralTables.h"
#include "widgets/InfoView.h"

#include <QScrollBar>
#include <QTest>
#include <cstdlib>

namespace {

// The window's panels in their order down the column.
std::vector<StarQueryView*> Panels(const FindWindow& window)
{
    return { window.nameQuery, window.scQuery, window.mgQuery, window.raQuery, window.decQuery,
        window.distQuery };
}

} // namespace

TEST_F(PanelTest, TheFindWindowStacksItsSixPanels)
{
    RecordingHandler help;
    FindWindow window(BPoint(170, 140), 394, 370, "Find Star", &help, &universe);
    EXPECT_TRUE(window.isVisible());
    EXPECT_EQ(window.windowTitle(), "Find Star");
    EXPECT_EQ(window.geometry(), QRect(170, 140, 395, 371));
    // The width is fixed; the height goes from 70 to what the window was made with.
    EXPECT_EQ(window.minimumSize(), QSize(395, 71));
    EXPECT_EQ(window.maximumSize(), QSize(395, 371));
    EXPECT_FLOAT_EQ(window.contentHeight, 370);

    const QWidget* column = window.findChild<QWidget*>("mainview");
    ASSERT_NE(column, nullptr);
    EXPECT_EQ(column->palette().color(QPalette::Window), QColor(220, 220, 220));
    EXPECT_EQ(column->width(), 395 - 14);
    ASSERT_NE(window.findChild<QWidget*>("Find Scroller"), nullptr);

    const char* const names[]
        = { "Name Query", "SC Query", "SC Query", "SC Query", "SC Query", "Dist Query" };
    const char* const titles[]
        = { "Find by Name", "Find by Spectral Class", "Find by Absolute Magnitude",
              "Find by Right Ascension", "Find by Declination", "Find by Distance" };
    const std::vector<StarQueryView*> panels = Panels(window);
    for (size_t i = 0; i < panels.size(); i++) {
        EXPECT_EQ(panels[i]->parentWidget(), column);
        EXPECT_EQ(panels[i]->objectName(), names[i]);
        EXPECT_EQ(panels[i]->title(), titles[i]);
        // From (10, 10), 60 apart, 10 short of the column's right edge.
        EXPECT_EQ(panels[i]->geometry(), QRect(10, 10 + 60 * int(i), column->width() - 20, 51));
        EXPECT_EQ(panels[i]->IGetTarget(), &help);
        EXPECT_EQ(panels[i]->Dragger()->IGetTarget(), &help);
    }
    EXPECT_EQ(window.distQuery->referenceLabel->IGetTarget(), &help);

    // Nothing to scroll until the window is first resized.
    EXPECT_EQ(window.scrollBar->minimum(), 0);
    EXPECT_EQ(window.scrollBar->maximum(), 0);
    EXPECT_EQ(window.scrollBar->singleStep(), 10);
    EXPECT_EQ(window.scrollBar->geometry(), QRect(395 - 14, 0, 14, 371));
}

TEST_F(PanelTest, ShrinkingTheFindWindowScrollsTheColumn)
{
    RecordingHandler help;
    FindWindow window(BPoint(170, 140), 394, 370, "Find Star", &help, &universe);
    // 70 high: the column is 30 more than the window was made with, 70 of it shown.
    window.resize(395, 71);
    QScrollBar* bar = window.scrollBar;
    EXPECT_EQ(bar->maximum(), 30 + 370 - 70);
    EXPECT_EQ(bar->pageStep(), 70);
    // The thumb's share is 70 / 400.
    EXPECT_DOUBLE_EQ(
        double(bar->pageStep()) / (bar->maximum() - bar->minimum() + bar->pageStep()), 70.0 / 400);

    // A step moves 10, a page 60; the column moves with the bar.
    bar->triggerAction(QAbstractSlider::SliderSingleStepAdd);
    EXPECT_EQ(bar->value(), 10);
    bar->triggerAction(QAbstractSlider::SliderPageStepAdd);
    EXPECT_EQ(bar->value(), 70);
    EXPECT_EQ(window.findChild<QWidget*>("mainview")->y(), -70);
    EXPECT_EQ(window.distQuery->mapTo(&window, QPoint(0, 0)).y(), 310 - 70);
    bar->triggerAction(QAbstractSlider::SliderPageStepSub);
    EXPECT_EQ(bar->value(), 10);
    bar->triggerAction(QAbstractSlider::SliderToMaximum);
    EXPECT_EQ(bar->value(), 330);

    // The whole height again: still 30 to scroll.
    window.resize(395, 371);
    EXPECT_EQ(bar->maximum(), 30);
    EXPECT_EQ(bar->value(), 30);

    // The window cannot be made wider, nor shorter than 70.
    window.resize(600, 20);
    EXPECT_EQ(window.size(), QSize(395, 71));
}

TEST_F(PanelTest, FrameResizedSetsTheRangeFromTheFrameHeight)
{
    RecordingHandler help;
    FindWindow window(BPoint(170, 140), 394, 370, "Find Star", &help, &universe);
    window.FrameResized(394, 200);
    EXPECT_EQ(window.scrollBar->maximum(), 200);
    EXPECT_EQ(window.scrollBar->pageStep(), 200);
}

namespace {

class FindFromControlWindow : public ::testing::Test {
protected:
    static void SetUpTestSuite() { InitResources(); }

    ScopedSpectralTables fTables;
    CatalogueBesideProgram fCatalogue {
        "The Sun\nG2V 4.83 0 0 0\nSirius\nA0 1.45 -0.49 -0.76 2.48\n"
    };
};

} // namespace

TEST_F(FindFromControlWindow, TheFindButtonOpensAFindWindowOnTheUniverse)
{
    ControlWindow controls(BPoint(90, 60), "3D Nightdome");
    EXPECT_TRUE(controls.OtherWindows().isEmpty());
    auto* button = controls.findChild<QWidget*>("Show Find Window Button");
    ASSERT_NE(button, nullptr);
    QTest::mouseClick(button, Qt::LeftButton, Qt::NoModifier, QPoint(16, 16));
    DeliverPostedMessages();

    ASSERT_EQ(controls.OtherWindows().size(), 1);
    auto* window = dynamic_cast<FindWindow*>(controls.OtherWindows().front());
    ASSERT_NE(window, nullptr);
    EXPECT_EQ(window->windowTitle(), "Find Star");
    EXPECT_EQ(window->geometry(), QRect(170, 140, 395, 371));
    EXPECT_TRUE(window->isVisible());
    EXPECT_EQ(window->nameQuery->IGetTarget(), controls.GetInfoView());
    EXPECT_EQ(window->distQuery->referenceLabel->text(), "parsecs from The Sun");

    // It searches the control window's universe: Sirius by name.
    window->nameQuery->starName->SetText("sirius");
    const std::optional<CaughtDrag> drag = PressHandle(window->nameQuery);
    ASSERT_TRUE(drag.has_value());
    EXPECT_EQ(drag->message.FindInt32(kSystemIndexString), 1);

    // A second press of the button opens a second window; a closed one leaves the list.
    controls.MessageReceived(std::make_unique<Message>(kNewFindWindow).get());
    ASSERT_EQ(controls.OtherWindows().size(), 2);
    window->close();
    DeliverPostedMessages();
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    EXPECT_EQ(controls.OtherWindows().size(), 1);
    // The one still open goes with the control window, before the universe.
}

TEST_F(PanelTest, FindWindowScreenshot)
{
    // Written where ND_SCREENSHOTS points, for a person to look at; checked for its size here.
    RecordingHandler help;
    FindWindow window(BPoint(170, 140), 394, 370, "Find Star", &help, &universe);
    const QImage shot = window.grab().toImage();
    EXPECT_EQ(shot.size(), QSize(395, 371));
    if (const char* shots = std::getenv("ND_SCREENSHOTS"))
        shot.save(QString(shots) + "/find-window-offscreen.png");
}
