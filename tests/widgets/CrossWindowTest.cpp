// Behaviour across top-level windows on a real X server (Xvfb), driven by xdotool as a person
// would drive it: a message dragged from one window to another, and help shown in one window
// while the mouse is over a button of another.
#include "X11Support.h"

#include "core/MessageCodes.h"
#include "platform/qt/MessageDrag.h"
#include "platform/qt/Messaging.h"
#include "render/RBitmap8.h"
#include "widgets/IButton.h"
#include "widgets/InfoView.h"

#include <QDragEnterEvent>
#include <QMouseEvent>
#include <QProcess>
#include <QTest>
#include <gtest/gtest.h>
#include <optional>

namespace {

// Starts a drag of its message as soon as it is pressed.
class DragSource : public QWidget {
public:
    explicit DragSource(QWidget* parent)
        : QWidget(parent)
        , image(BRect(0, 0, 31, 31))
    {
        image.EraseMap(255);
        image.RenderSquare(8, 8, 16, 63);
    }

    Message message { kStarArrayMessage };
    RBitmap8 image;

protected:
    void mousePressEvent(QMouseEvent*) override
    {
        DragMessage(this, message, &image, BPoint(16, 16));
    }
};

class CrossWindow : public ::testing::Test {
protected:
    void SetUp() override
    {
        if (QGuiApplication::platformName() != "xcb")
            GTEST_SKIP() << "needs an X server: run under scripts/with-xvfb";
    }
};

} // namespace

TEST_F(CrossWindow, AMessageDraggedToAnotherWindowArrivesWithItsFieldsAndDropPoint)
{
    QWidget first, second;
    first.setGeometry(100, 100, 200, 200);
    second.setGeometry(500, 150, 240, 240);
    auto* source = new DragSource(&first);
    source->setGeometry(50, 50, 100, 100);
    auto* target = new DropTarget(&second);
    target->setGeometry(20, 20, 200, 200);
    int mask = 0;
    source->message.AddPointer(kSystemArrayPtrString, &mask);
    source->message.AddInt32(kSystemIndexString, 42);
    first.show();
    second.show();
    ASSERT_TRUE(QTest::qWaitForWindowExposed(&first));
    ASSERT_TRUE(QTest::qWaitForWindowExposed(&second));

    const QPoint from = source->mapToGlobal(QPoint(50, 50));
    const QPoint to = target->mapToGlobal(QPoint(110, 90));
    Xdotool xdotool;
    xdotool.Run(DragSteps(from, to));

    ASSERT_TRUE(QTest::qWaitFor([&] { return target->received.has_value(); }, 15000))
        << "no drop arrived";
    EXPECT_TRUE(QTest::qWaitFor([&] { return xdotool.Finished(); }, 5000));
    const Message& dropped = *target->received;
    EXPECT_EQ(dropped.what, kStarArrayMessage);
    EXPECT_EQ(dropped.FindPointer(kSystemArrayPtrString), &mask);
    EXPECT_EQ(dropped.FindInt32(kSystemIndexString), 42);
    EXPECT_TRUE(dropped.WasDropped());
    EXPECT_EQ(dropped.DropPoint().x, to.x());
    EXPECT_EQ(dropped.DropPoint().y, to.y());
}

TEST_F(CrossWindow, HelpOfAButtonInOneWindowShowsInTheLineOfAnother)
{
    QWidget controls, other;
    controls.setGeometry(100, 100, 200, 100);
    other.setGeometry(500, 100, 320, 60);
    auto* button = new IButton(BRect(20, 20, 119, 49), "New", "New", nullptr, &controls);
    auto* line = new InfoView(BRect(10, 20, 309, 39), "Info View", "", &other);
    button->ISetTarget(line);
    button->ISetInfo("Opens a new star map");
    controls.show();
    other.show();
    ASSERT_TRUE(QTest::qWaitForWindowExposed(&controls));
    ASSERT_TRUE(QTest::qWaitForWindowExposed(&other));

    const QPoint away = other.mapToGlobal(QPoint(300, 50));
    const QPoint over = button->mapToGlobal(QPoint(50, 15));
    Xdotool move;
    move.Run({ "mousemove", Number(away.x()), Number(away.y()), "sleep", "0.2", "mousemove",
        Number(over.x()), Number(over.y()) });
    EXPECT_TRUE(QTest::qWaitFor([&] { return line->text() == "Opens a new star map"; }, 10000))
        << line->text().toStdString();
    EXPECT_TRUE(QTest::qWaitFor([&] { return move.Finished(); }, 5000));

    Xdotool leave;
    leave.Run({ "mousemove", Number(away.x()), Number(away.y()) });
    EXPECT_TRUE(QTest::qWaitFor([&] { return line->text().isEmpty(); }, 10000))
        << line->text().toStdString();
    EXPECT_TRUE(QTest::qWaitFor([&] { return leave.Finished(); }, 5000));
}
