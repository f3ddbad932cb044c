#include "widgets/WidgetEvents.h"

#include "core/MessageCodes.h"
#include "resources/ResourceData.h"
#include "widgets/IButton.h"
#include "widgets/IPictureButton.h"
#include "widgets/IToggleButton.h"
#include "widgets/InfoView.h"

#include <QCursor>
#include <QEnterEvent>
#include <QTest>
#include <cstring>
#include <gtest/gtest.h>

namespace {

class Widgets : public ::testing::Test {
protected:
    static void SetUpTestSuite() { InitResources(); }
};

} // namespace

TEST_F(Widgets, EnteringWithoutATargetPostsNothingWithOneInfoThenClear)
{
    QWidget window;
    RecordingHandler help(&window);
    IButton button(BRect(0, 0, 79, 23), "New", "New", nullptr, &window);
    button.ISetInfo("Opens a new star map");
    Enter(&button);
    Leave(&button);
    DeliverPostedMessages();
    EXPECT_TRUE(help.received.empty());
    EXPECT_FALSE(button.IBroadcastInfo());

    button.ISetTarget(&help);
    EXPECT_EQ(button.IGetTarget(), &help);
    Enter(&button);
    DeliverPostedMessages();
    ASSERT_EQ(Codes(help), (std::vector<uint32_t> { kInfoMessage }));
    EXPECT_STREQ(help.received[0].FindString(kInfoStringField), "Opens a new star map");
    Leave(&button);
    DeliverPostedMessages();
    EXPECT_EQ(Codes(help), (std::vector<uint32_t> { kInfoMessage, kClearInfoMessage }));
    EXPECT_EQ(help.received[1].CountFields(), 0);
}

TEST_F(Widgets, InfoViewShowsTheTextAndBlanksOnClear)
{
    InfoView line(BRect(0, 0, 299, 15), "Info View", "Welcome");
    EXPECT_EQ(line.text(), "Welcome");
    EXPECT_EQ(line.objectName(), "Info View");
    EXPECT_EQ(line.width(), 300);
    Message info(kInfoMessage);
    info.AddString(kInfoStringField, "Clear H-R Diagram");
    PostMessage(&line, info);
    DeliverPostedMessages();
    EXPECT_EQ(line.text(), "Clear H-R Diagram");
    PostMessage(&line, Message(kClearInfoMessage));
    DeliverPostedMessages();
    EXPECT_EQ(line.text(), "");
}

TEST_F(Widgets, AButtonOverTheLineShowsItsHelpThere)
{
    QWidget window;
    InfoView line(BRect(0, 40, 299, 55), "Info View", "", &window);
    ICheckBox box(BRect(0, 0, 99, 19), "Show List", "Show List", nullptr, &window);
    box.ISetTarget(&line);
    box.ISetInfo("Shows or hides the list");
    Enter(&box);
    DeliverPostedMessages();
    EXPECT_EQ(line.text(), "Shows or hides the list");
    Leave(&box);
    DeliverPostedMessages();
    EXPECT_EQ(line.text(), "");
}

TEST_F(Widgets, ButtonsSendTheirMessageToTheirTarget)
{
    RecordingHandler target;
    IButton button(BRect(0, 0, 79, 23), "Clear", "Clear", new Message(kHRDClear));
    button.SetTarget(&target);
    QTest::mouseClick(&button, Qt::LeftButton);
    ICheckBox box(BRect(0, 0, 99, 19), "Show List", "Show List", new Message(kShowListChanged));
    box.SetTarget(&target);
    QTest::mouseClick(&box, Qt::LeftButton, {}, QPoint(5, 10));
    DeliverPostedMessages();
    EXPECT_EQ(Codes(target), (std::vector<uint32_t> { kHRDClear, kShowListChanged }));
    EXPECT_TRUE(box.isChecked());
}

TEST_F(Widgets, PictureButtonFramesComeFromItsResource)
{
    IPictureButton button(
        BRect(0, 0, 31, 31), "New Nightdome", "", 0, new Message(kNewUniverseWindow));
    EXPECT_EQ(button.width(), 32);
    EXPECT_EQ(button.NormalImage()->Width(), 32);
    EXPECT_FALSE(SamePixels(button.NormalImage(), button.OverImage()));
    EXPECT_FALSE(SamePixels(button.OverImage(), button.PressedImage()));
    EXPECT_EQ(button.ShownImage(), button.NormalImage());
    Enter(&button);
    EXPECT_EQ(button.ShownImage(), button.OverImage());
    Leave(&button);
    EXPECT_EQ(button.ShownImage(), button.NormalImage());
}

TEST_F(Widgets, PictureButtonReleasedInsideSendsItsMessage)
{
    RecordingHandler target;
    IPictureButton button(BRect(0, 0, 31, 31), "Find", "", 3, new Message(kNewFindWindow));
    button.SetTarget(&target);
    QTest::mousePress(&button, Qt::LeftButton, {}, QPoint(10, 10));
    EXPECT_EQ(button.ShownImage(), button.PressedImage());
    QTest::mouseRelease(&button, Qt::LeftButton, {}, QPoint(12, 12));
    EXPECT_EQ(button.ShownImage(), button.OverImage());
    DeliverPostedMessages();
    EXPECT_EQ(Codes(target), (std::vector<uint32_t> { kNewFindWindow }));
}

TEST_F(Widgets, PictureButtonReleasedOutsideSendsNothingAndLooksNormal)
{
    RecordingHandler target;
    IPictureButton button(BRect(0, 0, 31, 31), "Find", "", 3, new Message(kNewFindWindow));
    button.SetTarget(&target);
    QTest::mousePress(&button, Qt::LeftButton, {}, QPoint(10, 10));
    QTest::mouseRelease(&button, Qt::LeftButton, {}, QPoint(60, 10));
    EXPECT_EQ(button.ShownImage(), button.NormalImage());
    DeliverPostedMessages();
    EXPECT_TRUE(target.received.empty());
}

TEST_F(Widgets, PictureButtonHeldFollowsThePointerOutAndBack)
{
    QWidget window;
    window.setGeometry(50, 50, 200, 200);
    IPictureButton button(BRect(10, 10, 41, 41), "New List", "", 5, nullptr, &window);
    window.show();
    QCursor::setPos(button.mapToGlobal(QPoint(5, 5)));
    QTest::mousePress(&button, Qt::LeftButton, {}, QPoint(5, 5));
    EXPECT_EQ(button.ShownImage(), button.PressedImage());
    // The button samples the pointer every 50 ms while it is held.
    QCursor::setPos(button.mapToGlobal(QPoint(100, 100)));
    EXPECT_TRUE(QTest::qWaitFor([&] { return button.ShownImage() == button.OverImage(); }, 2000));
    QCursor::setPos(button.mapToGlobal(QPoint(6, 6)));
    EXPECT_TRUE(
        QTest::qWaitFor([&] { return button.ShownImage() == button.PressedImage(); }, 2000));
    QTest::mouseRelease(&button, Qt::LeftButton, {}, QPoint(6, 6));
    EXPECT_EQ(button.ShownImage(), button.OverImage());
}

TEST_F(Widgets, ToggleTwiceReturnsToTheStartAndSendsTwice)
{
    RecordingHandler target;
    IToggleButton toggle(BRect(0, 0, 11, 11), "Clip", "", 0, new Message(kClipToggle));
    toggle.SetTarget(&target);
    EXPECT_EQ(toggle.Value(), 0);
    EXPECT_EQ(toggle.ShownImage(), toggle.OffImage());
    QTest::mouseClick(&toggle, Qt::LeftButton, {}, QPoint(5, 5));
    EXPECT_EQ(toggle.Value(), 1);
    EXPECT_EQ(toggle.ShownImage(), toggle.OnImage());
    QTest::mouseClick(&toggle, Qt::LeftButton, {}, QPoint(5, 5));
    EXPECT_EQ(toggle.Value(), 0);
    EXPECT_EQ(toggle.ShownImage(), toggle.OffImage());
    DeliverPostedMessages();
    EXPECT_EQ(Codes(target), (std::vector<uint32_t> { kClipToggle, kClipToggle }));
    EXPECT_FALSE(SamePixels(toggle.OnImage(), toggle.OffImage()));
}

TEST_F(Widgets, ToggleShowsARedFrameWhileTheMouseIsOverIt)
{
    QWidget window;
    InfoView line(BRect(0, 40, 299, 55), "Info View", "", &window);
    IToggleButton toggle(BRect(0, 0, 11, 11), "Clip", "", 0, nullptr, &window);
    toggle.ISetTarget(&line);
    toggle.ISetInfo("Clipping sphere on or off");
    EXPECT_NE(toggle.grab().toImage().pixel(0, 0), qRgb(255, 0, 0));
    Enter(&toggle);
    EXPECT_TRUE(toggle.HoverFrameShown());
    const QImage hovered = toggle.grab().toImage();
    EXPECT_EQ(hovered.pixel(0, 0), qRgb(255, 0, 0));
    EXPECT_EQ(hovered.pixel(11, 6), qRgb(255, 0, 0));
    EXPECT_NE(hovered.pixel(6, 6), qRgb(255, 0, 0));
    DeliverPostedMessages();
    EXPECT_EQ(line.text(), "Clipping sphere on or off");
    Leave(&toggle);
    EXPECT_FALSE(toggle.HoverFrameShown());
    EXPECT_NE(toggle.grab().toImage().pixel(0, 0), qRgb(255, 0, 0));
    DeliverPostedMessages();
    EXPECT_EQ(line.text(), "");
}
