// The star information view on a real X server (Xvfb), driven by xdotool as a hand drives it:
// a system dragged out of the view and let go over the view itself, on the other half or where
// it was pressed, changes nothing, while a system dragged in from another view fills the half
// it is let go over.
#include "NeighboursOnX11.h"
#include "X11Support.h"
#include "info/StarInfoScreen.h"

#include "core/MessageCodes.h"
#include "info/StarIView.h"

#include <QTest>
#include <gtest/gtest.h>
#include <string>
#include <vector>

namespace {

class StarInfoX11 : public NeighboursOnX11 {
protected:
    // A view alone in a window at place, over the universe, system in its upper slot.
    StarIView* View(QWidget& window, QPoint place, int32_t system)
    {
        window.setGeometry(QRect(place, QSize(365, 186)));
        auto* view = new StarIView(BPoint(0, 0), "Star Info View", &window);
        Message message(kUniversePointer);
        message.AddPointer(kUniversePtrString, &universe);
        view->MessageReceived(&message);
        Message star(kStarMessage);
        star.AddInt32(kSystemIndexString, system);
        view->MessageReceived(&star);
        window.show();
        EXPECT_TRUE(QTest::qWaitForWindowExposed(&window));
        return view;
    }

    // Runs the commands, then moves the pointer over the view's lower half and then its upper
    // half and waits until the view has named each (the half remembered is one for every star
    // information view, so the last half over another view counts too): every event before, a
    // drag's own loop included, has been handled. Then waits for the view's thread to have
    // typed everything.
    void RunThenCross(QStringList commands, StarIView* view)
    {
        const QPoint lower = view->mapToGlobal(QPoint(200, 150));
        const QPoint upper = view->mapToGlobal(QPoint(200, 30));
        MoveOver(commands, lower, view, "Star 2: Drop star here");
        MoveOver({}, upper, view, "Star 1: Drop star here");
        EXPECT_TRUE(
            QTest::qWaitFor([&] { return view->HWTIsDone() && view->IsSuspended(); }, 60000));
    }

    // Runs the commands, then moves the pointer to where (in two steps: the first may only
    // bring it in) and waits until the view's help reads help.
    static void MoveOver(QStringList commands, QPoint where, StarIView* view, const char* help)
    {
        Xdotool xdotool;
        xdotool.Run(commands << "sleep"
                             << "0.3"
                             << "mousemove" << Number(where.x() - 1) << Number(where.y()) << "sleep"
                             << "0.1"
                             << "mousemove" << Number(where.x()) << Number(where.y()));
        EXPECT_TRUE(QTest::qWaitFor([&] { return xdotool.Finished(); }, 20000));
        EXPECT_TRUE(QTest::qWaitFor([&] { return std::string(view->IGetInfo()) == help; }, 10000))
            << help;
    }

    static std::vector<std::string> Screen(const StarIView& view)
    {
        std::vector<std::string> rows;
        for (int32_t row = 0; row < view.Rows(); row++)
            rows.push_back(ScreenRow(view, row));
        return rows;
    }
};

} // namespace

TEST_F(StarInfoX11, ASystemLetGoOverItsOwnViewChangesNothing)
{
    QWidget window, otherWindow;
    StarIView* view = View(window, QPoint(100, 100), sirius);
    Message lower(kStarMessage);
    lower.AddInt32(kSystemIndexString, vega);
    const QPoint lowerHalf = view->mapToGlobal(QPoint(200, 150));
    lower.SetDropped(BPoint(float(lowerHalf.x()), float(lowerHalf.y())));
    view->MessageReceived(&lower);
    ASSERT_EQ(view->Index2(), vega);
    RunThenCross({}, view);
    const std::vector<std::string> before = Screen(*view);

    // Sirius dragged from the upper half to the lower, then Vega clicked where it is.
    const QPoint upperHalf = view->mapToGlobal(QPoint(200, 30));
    RunThenCross(DragSteps(upperHalf, lowerHalf), view);
    EXPECT_EQ(view->Index1(), sirius);
    EXPECT_EQ(view->Index2(), vega) << "the view took its own system back";
    RunThenCross(ClickAt(lowerHalf), view);
    EXPECT_EQ(view->Index1(), sirius);
    EXPECT_EQ(view->Index2(), vega) << "a click put the view's own system back";
    EXPECT_EQ(Screen(*view), before);

    // The Sun dragged in from another view fills the lower half.
    StarIView* other = View(otherWindow, QPoint(600, 100), sun);
    RunThenCross(DragSteps(other->mapToGlobal(QPoint(200, 30)), lowerHalf), view);
    EXPECT_EQ(view->Index2(), sun);
    EXPECT_EQ(ScreenText(*view, 10, 4, 23), "The Sun");
}
