// A chart window on a real X server (Xvfb), worked with xdotool as a person would: hovering a
// star, clicking it twice and dragging it to another window; and two charts at one place, each
// showing its own frame when it is on top.
#include "ChartFixture.h"
#include "X11Support.h"

#include "chart/UniverseWindow.h"
#include "core/MessageCodes.h"
#include "platform/qt/RecordingHandler.h"
#include "widgets/InfoView.h"

#include <QScreen>
#include <QTest>

namespace {

// The screen's own pixels over widget (one GetImage of the root window).
QImage OnScreen(const QWidget* widget)
{
    const QPoint at = widget->mapToGlobal(QPoint(0, 0));
    return QGuiApplication::primaryScreen()
        ->grabWindow(0, at.x(), at.y(), widget->width(), widget->height())
        .toImage()
        .convertToFormat(QImage::Format_RGB32);
}

// A view's last finished frame in the colours and the pixels the screen shows: at a whole scale
// factor each of its pixels a block of scale x scale identical pixels.
QImage Shown(UniverseView* view)
{
    const QImage frame = view->FrontImage().convertToFormat(QImage::Format_RGB32);
    const int scale = int(view->devicePixelRatio());
    return scale == 1
        ? frame
        : frame.scaled(frame.size() * scale, Qt::IgnoreAspectRatio, Qt::FastTransformation);
}

int LitPixels(const QImage& image)
{
    int lit = 0;
    for (int y = 0; y < image.height(); y++) {
        for (int x = 0; x < image.width(); x++)
            lit += qGray(image.pixel(x, y)) > 20;
    }
    return lit;
}

} // namespace

TEST_F(ChartTest, AStarHoveredClickedTwiceAndDraggedToAnotherWindow)
{
    if (QGuiApplication::platformName() != "xcb")
        GTEST_SKIP() << "needs an X server: run under scripts/with-xvfb";
    Universe* universe = MakeUniverse({
        { "The Sun", 0, 0, 0, 4.83 },
        { "Sirius", -0.494, -0.759, 2.477, 1.454, "A0" },
        { "Procyon", -1.365, 0.320, 3.228, 2.68, "F5" },
    });
    QWidget controls;
    controls.setGeometry(900, 50, 320, 60);
    auto* help = new InfoView(BRect(0, 20, 319, 39), "Info View", "", &controls);
    controls.show();

    auto* window = new UniverseWindow(BPoint(90, 140), 328, 340, "Nightdome", help, universe);
    UniverseView* view = window->View();
    *view->GetRadialVelocityY() = 0; // a still chart, so the stars stay where they were found
    auto* strip = window->findChild<InfoView*>("SystemName");

    QWidget receiver;
    receiver.setGeometry(600, 140, 240, 240);
    auto* target = new DropTarget(&receiver);
    target->setGeometry(0, 0, 240, 240);
    receiver.show();
    ASSERT_TRUE(QTest::qWaitForWindowExposed(window));
    ASSERT_TRUE(QTest::qWaitForWindowExposed(&receiver));

    // Sirius, wherever the camera shows it.
    BPoint where;
    ASSERT_TRUE(QTest::qWaitFor(
        [&] {
            where = view->ScreenPointOf(1);
            return where.x > 0;
        },
        5000));
    const QPoint sirius = view->mapToGlobal(QPoint(int(where.x), int(where.y)));
    Xdotool hover;
    hover.Run({ "mousemove", Number(sirius.x()), Number(sirius.y()) });
    EXPECT_TRUE(QTest::qWaitFor([&] { return strip->text() == "1: Sirius ( 1.5 A0 )"; }, 10000))
        << strip->text().toStdString();
    EXPECT_TRUE(QTest::qWaitFor(
        [&] { return help->text() == "Click star to make Selection or drag to another view"; },
        10000))
        << help->text().toStdString();
    EXPECT_TRUE(QTest::qWaitFor([&] { return hover.Finished(); }, 5000));

    Xdotool select;
    select.Run(ClickAt(sirius));
    EXPECT_TRUE(QTest::qWaitFor([&] { return view->GetSelectedSystem() == 1; }, 10000));
    EXPECT_TRUE(
        QTest::qWaitFor([&] { return help->text() == "Click star to change Origin"; }, 10000))
        << help->text().toStdString();
    EXPECT_TRUE(QTest::qWaitFor([&] { return select.Finished(); }, 5000));

    Xdotool origin;
    origin.Run(ClickAt(sirius));
    EXPECT_TRUE(
        QTest::qWaitFor([&] { return view->ReadOut().rfind("Origin: Sirius\n", 0) == 0; }, 10000))
        << view->ReadOut();
    EXPECT_TRUE(QTest::qWaitFor([&] { return origin.Finished(); }, 5000));

    // The chart glides to its new origin: Sirius ends at the centre, where it is dragged from.
    ASSERT_TRUE(QTest::qWaitFor(
        [&] {
            const BPoint now = view->ScreenPointOf(1);
            return std::abs(now.x - view->Frame().right / 2) < 2
                && std::abs(now.y - view->Frame().bottom / 2) < 2;
        },
        10000));
    const BPoint centre = view->ScreenPointOf(1);
    const QPoint from = view->mapToGlobal(QPoint(int(centre.x), int(centre.y)));
    const QPoint to = target->mapToGlobal(QPoint(120, 120));
    Xdotool drag;
    drag.Run(DragSteps(from, to));
    ASSERT_TRUE(QTest::qWaitFor([&] { return target->received.has_value(); }, 15000)) << "no drop";
    EXPECT_TRUE(QTest::qWaitFor([&] { return drag.Finished(); }, 5000));
    EXPECT_EQ(target->received->what, kStarMessage);
    EXPECT_EQ(target->received->FindInt32(kSystemIndexString), 1);
    EXPECT_TRUE(target->received->WasDropped());
    EXPECT_EQ(target->received->DropPoint().x, to.x());
    EXPECT_EQ(target->received->DropPoint().y, to.y());

    window->close();
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
}

TEST_F(ChartTest, TwoChartsAtOnePlaceEachShowItsOwnFrameOnTop)
{
    if (QGuiApplication::platformName() != "xcb")
        GTEST_SKIP() << "needs an X server: run under scripts/with-xvfb";
    Universe* universe = MakeUniverse({
        { "The Sun", 0, 0, 0, 4.83 },
        { "Sirius", -0.494, -0.759, 2.477, 1.454, "A0" },
        { "Procyon", -1.365, 0.320, 3.228, 2.68, "F5" },
        { "Altair", 2.54, 0.87, -4.31, 2.22, "A7" },
        { "Vega", 1.0, 4.9, -5.0, 0.58, "A0" },
    });
    QWidget controls;
    controls.setGeometry(900, 50, 320, 60);
    auto* help = new InfoView(BRect(0, 20, 319, 39), "Info View", "", &controls);
    controls.show();

    // The second opens exactly over the first. Both stand still, and they differ: the one on
    // top has no clipping overlay.
    auto* below = new UniverseWindow(BPoint(90, 140), 328, 340, "Nightdome", help, universe);
    auto* above = new UniverseWindow(BPoint(90, 140), 328, 340, "Nightdome", help, universe);
    ASSERT_EQ(above->geometry(), below->geometry());
    *below->View()->GetRadialVelocityY() = 0;
    *above->View()->GetRadialVelocityY() = 0;
    Message toggle(kClipToggle);
    above->View()->MessageReceived(&toggle);
    ASSERT_TRUE(QTest::qWaitForWindowExposed(below));
    ASSERT_TRUE(QTest::qWaitForWindowExposed(above));
    // Frames drawn after the change, so that each view's frame is its still picture.
    const int64_t belowFrames = below->View()->FramesRendered();
    const int64_t aboveFrames = above->View()->FramesRendered();
    ASSERT_TRUE(QTest::qWaitFor(
        [&] {
            return below->View()->FramesRendered() > belowFrames + 2
                && above->View()->FramesRendered() > aboveFrames + 2;
        },
        10000));
    ASSERT_NE(Shown(above->View()), Shown(below->View()));

    // On the screen the place shows the top chart's own frame, stars and all.
    EXPECT_TRUE(
        QTest::qWaitFor([&] { return OnScreen(above->View()) == Shown(above->View()); }, 10000));
    EXPECT_NE(OnScreen(above->View()), Shown(below->View()));
    EXPECT_GT(LitPixels(OnScreen(above->View())), 20);

    // Raised, the other chart shows its own.
    below->raise();
    EXPECT_TRUE(
        QTest::qWaitFor([&] { return OnScreen(below->View()) == Shown(below->View()); }, 10000));
    EXPECT_GT(LitPixels(OnScreen(below->View())), 20);

    above->close();
    below->close();
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
}
