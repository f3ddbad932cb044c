// The control window: its strip, the charts it opens, and linking the controls to the chart
// that was activated last.
#include "catalog/TempCatalogue.h"

#include "chart/UniverseView.h"
#include "chart/UniverseWindow.h"
#include "controls/ControlWindow.h"
#include "controls/SliderControl.h"
#include "controls/TrackballControl.h"
#include "core/MessageCodes.h"
#include "platform/ExecutablePath.h"
#include "render/SpectralTables.h"
#include "resources/ResourceData.h"
#include "widgets/IPictureButton.h"
#include "widgets/InfoView.h"

#include <QTest>
#include <gtest/gtest.h>
#include <memory>

namespace {

class ControlWindowTest : public ::testing::Test {
protected:
    static void SetUpTestSuite() { InitResources(); }

    static UniverseView* ViewOf(UniverseWindow* window) { return window->View(); }

    static bool LinkedTo(ControlWindow& controls, UniverseView* view)
    {
        return controls.trackball->LinkX() == view->GetRadialVelocityX()
            && controls.trackball->LinkY() == view->GetRadialVelocityY()
            && controls.cameraZ->LinkX() == nullptr
            && controls.cameraZ->LinkY() == view->GetCameraVelocityZ()
            && controls.brightnessSlider->Link() == view->GetLumFactor()
            && controls.contrastSlider->Link() == view->GetStellarContrast()
            && controls.clippingSlider->Link() == view->GetDistanceFilter();
    }

    ScopedSpectralTables fTables;
    CatalogueBesideProgram fCatalogue {
        "The Sun\nG2V 4.83 0 0 0\nSirius\nA0 1.45 -0.49 -0.76 2.48\n"
    };
};

} // namespace

TEST_F(ControlWindowTest, TheStripOfControlsAndButtons)
{
    ControlWindow controls(BPoint(90, 60), "3D Nightdome");
    EXPECT_EQ(controls.windowTitle(), "3D Nightdome");
    EXPECT_EQ(controls.geometry(), QRect(90, 60, 320, 45));
    EXPECT_EQ(controls.GetUniverse()->CountItems(), 2);
    EXPECT_STREQ(controls.GetInfoView()->IGetInfo(), "Context sensitive help");
    const char* names[] = { "Track Ball", "Camera Z", "Stellar Brightness", "Stellar Contrast",
        "Clipping Sphere", "New Nightdome Button", "Show Info Window Button",
        "Show H-R Window Button", "Show Find Window Button", "New List Window Button" };
    for (int i = 0; i < 10; i++) {
        auto* item = controls.findChild<QWidget*>(names[i]);
        ASSERT_NE(item, nullptr) << names[i];
        EXPECT_EQ(item->geometry(), QRect(32 * i, 0, 32, 32)) << names[i];
    }
    EXPECT_STREQ(controls.findChild<IPictureButton*>("Show H-R Window Button")->IGetInfo(),
        "New Hertzprung-Russell Diagram window");
    EXPECT_STREQ(controls.findChild<IPictureButton*>("New Nightdome Button")->IGetInfo(),
        "New Nightdome  [Ctrl+N]");
    // The first chart is open and driven.
    ASSERT_EQ(controls.UniverseWindows().size(), 1);
    UniverseWindow* first = controls.UniverseWindows()[0];
    EXPECT_EQ(first->windowTitle(), "Nightdome");
    EXPECT_EQ(first->geometry(), QRect(90, 140, 329, 341));
    EXPECT_TRUE(LinkedTo(controls, ViewOf(first)));
}

TEST_F(ControlWindowTest, TheControlsFollowTheChartActivatedLast)
{
    ControlWindow controls(BPoint(90, 60), "3D Nightdome");
    UniverseWindow* first = controls.UniverseWindows()[0];
    QTest::mouseClick(controls.findChild<IPictureButton*>("New Nightdome Button"), Qt::LeftButton);
    DeliverPostedMessages();
    ASSERT_EQ(controls.UniverseWindows().size(), 2);
    UniverseWindow* second = controls.UniverseWindows()[1];

    second->activateWindow();
    ASSERT_TRUE(QTest::qWaitForWindowActive(second));
    DeliverPostedMessages();
    EXPECT_TRUE(LinkedTo(controls, ViewOf(second)));
    first->activateWindow();
    ASSERT_TRUE(QTest::qWaitForWindowActive(first));
    DeliverPostedMessages();
    EXPECT_TRUE(LinkedTo(controls, ViewOf(first)));

    // Closing the driven chart moves the controls to the one still open; closing that one
    // leaves them unlinked, never pointing into a closed chart.
    first->close();
    DeliverPostedMessages();
    ASSERT_EQ(controls.UniverseWindows().size(), 1);
    EXPECT_TRUE(LinkedTo(controls, ViewOf(second)));
    second->close();
    DeliverPostedMessages();
    EXPECT_TRUE(controls.UniverseWindows().isEmpty());
    EXPECT_EQ(controls.trackball->LinkX(), nullptr);
    EXPECT_EQ(controls.clippingSlider->Link(), nullptr);
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
}

TEST_F(ControlWindowTest, ANewChartAfterTheLastOneClosedTakesTheControls)
{
    ControlWindow controls(BPoint(90, 60), "3D Nightdome");
    controls.UniverseWindows()[0]->close();
    DeliverPostedMessages();
    ASSERT_TRUE(controls.UniverseWindows().isEmpty());
    ASSERT_EQ(controls.LinkedWindow(), nullptr);

    // Nothing was driven, so the new chart is, without waiting to be activated.
    QTest::mouseClick(controls.findChild<IPictureButton*>("New Nightdome Button"), Qt::LeftButton);
    DeliverPostedMessages();
    ASSERT_EQ(controls.UniverseWindows().size(), 1);
    UniverseWindow* fresh = controls.UniverseWindows()[0];
    EXPECT_EQ(controls.LinkedWindow(), fresh);
    EXPECT_TRUE(LinkedTo(controls, ViewOf(fresh)));

    // A chart opened while another is driven waits for its activation.
    QTest::mouseClick(controls.findChild<IPictureButton*>("New Nightdome Button"), Qt::LeftButton);
    DeliverPostedMessages();
    ASSERT_EQ(controls.UniverseWindows().size(), 2);
    EXPECT_TRUE(LinkedTo(controls, ViewOf(fresh)));
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
}

TEST_F(ControlWindowTest, AMissingCatalogueStillOpensAnEmptyChart)
{
    std::filesystem::remove(ExecutableDirectory() / "stars.dat");
    ControlWindow controls(BPoint(90, 60), "3D Nightdome");
    EXPECT_EQ(controls.GetUniverse()->CountItems(), 0);
    ASSERT_EQ(controls.UniverseWindows().size(), 1);
    UniverseView* view = ViewOf(controls.UniverseWindows()[0]);
    EXPECT_TRUE(QTest::qWaitFor([&] { return view->FramesRendered() >= 2; }, 5000));
}

TEST_F(ControlWindowTest, TheEndTellsEveryChartToStopBeforeWaitingForAny)
{
    auto* controls = new ControlWindow(BPoint(90, 60), "3D Nightdome");
    for (int i = 0; i < 3; i++) {
        Message open(kNewUniverseWindow);
        controls->MessageReceived(&open);
    }
    ASSERT_EQ(controls->UniverseWindows().size(), 4);
    QList<UniverseView*> views;
    for (const QPointer<UniverseWindow>& window : controls->UniverseWindows()) {
        UniverseView* view = ViewOf(window);
        ASSERT_TRUE(QTest::qWaitFor([&] { return view->FramesRendered() >= 2; }, 5000));
        views.append(view);
    }
    // When the first chart has waited for its render threads and goes, the other charts' loops
    // have been told to end already: their last frames are drawn alongside, not in turn.
    QList<bool> othersRunning;
    QObject::connect(controls->UniverseWindows()[0], &QObject::destroyed, [&] {
        for (qsizetype i = 1; i < views.size(); i++)
            othersRunning.append(views[i]->IsRunning());
    });
    delete controls;
    ASSERT_EQ(othersRunning.size(), 3);
    for (bool running : othersRunning)
        EXPECT_FALSE(running);
}
