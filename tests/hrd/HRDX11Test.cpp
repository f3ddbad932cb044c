// The H-R diagram on a real X server (Xvfb), driven by xdotool as a hand drives it: the drags
// the diagram starts run as real drags, and one let go over the diagram itself, a click on
// empty space among them, plots nothing more, while a marker dragged in from another diagram is
// plotted.
#include "NeighboursOnX11.h"
#include "X11Support.h"

#include "core/MessageCodes.h"
#include "hrd/HRDView.h"

#include <QTest>
#include <gtest/gtest.h>

namespace {

class HRDX11 : public NeighboursOnX11 {
protected:
    // A diagram alone in a window at place, over the universe.
    HRDView* Diagram(QWidget& window, QPoint place)
    {
        window.setGeometry(QRect(place, QSize(HRDView::kWidth, HRDView::kHeight)));
        auto* view = new HRDView(BPoint(0, 0), "HRView", &window);
        Message message(kUniversePointer);
        message.AddPointer(kUniversePtrString, &universe);
        view->MessageReceived(&message);
        window.show();
        EXPECT_TRUE(QTest::qWaitForWindowExposed(&window));
        return view;
    }

    // Where the marker of the first star of system index is centred, on the screen.
    QPoint MarkerOf(const HRDView* view, int32_t index) const
    {
        const Star* s = universe.SystemAt(index)->StarAt(0);
        return view->mapToGlobal(QPoint(int(HRDView::SpectralClassToX(s->GetSpectralClass())),
            int(HRDView::AbsMagnitudeToY(s->GetMagnitude()))));
    }

    // Runs the commands and waits until they are done and the diagram, hovered over system
    // index's marker afterwards, has seen the pointer there: every event before has been
    // handled, a drag's own loop included.
    void RunThenHover(QStringList commands, HRDView* view, int32_t index)
    {
        const QPoint marker = MarkerOf(view, index);
        commands << "sleep"
                 << "0.3"
                 << "mousemove" << Number(marker.x() - 1) << Number(marker.y()) << "sleep"
                 << "0.1"
                 << "mousemove" << Number(marker.x()) << Number(marker.y());
        Xdotool xdotool;
        xdotool.Run(commands);
        EXPECT_TRUE(QTest::qWaitFor([&] { return xdotool.Finished(); }, 20000));
        EXPECT_TRUE(QTest::qWaitFor([&] { return view->HoverIndex() == index; }, 10000))
            << "the diagram did not see the pointer come over the marker";
    }
};

} // namespace

TEST_F(HRDX11, ADragLetGoOverTheDiagramItselfPlotsNothingMore)
{
    QWidget window, otherWindow;
    HRDView* view = Diagram(window, QPoint(100, 100));
    StarSysMask set(universe.CountItems(), false, 0);
    set.SetStateSafe(sun, true);
    set.SetStateSafe(vega, true);
    Message dropped(kStarArrayMessage);
    dropped.AddPointer(kSystemArrayPtrString, &set);
    view->MessageReceived(&dropped);
    const int32_t plotted = view->PlotCount();
    ASSERT_EQ(plotted, 2);

    // A click on empty space, then a drag from empty space to elsewhere in the diagram.
    const QPoint empty = view->mapToGlobal(QPoint(150, 250));
    RunThenHover(ClickAt(empty), view, vega);
    EXPECT_EQ(view->PlotCount(), plotted) << "a click plotted the diagram's sets again";
    RunThenHover(DragSteps(empty, empty + QPoint(-60, -30)), view, sun);
    EXPECT_EQ(view->PlotCount(), plotted) << "a drag within the diagram plotted its sets again";
    // A marker dragged a little way.
    RunThenHover(
        DragSteps(MarkerOf(view, vega), MarkerOf(view, vega) + QPoint(40, 40)), view, vega);
    EXPECT_EQ(view->PlotCount(), plotted)
        << "a marker dragged within the diagram was plotted again";

    // Sirius dragged in from another diagram is plotted.
    HRDView* other = Diagram(otherWindow, QPoint(600, 100));
    Message star(kStarMessage);
    star.AddInt32(kSystemIndexString, sirius);
    other->MessageReceived(&star);
    RunThenHover(DragSteps(MarkerOf(other, sirius), empty), view, sirius);
    EXPECT_EQ(view->PlotCount(), plotted + 2);
}
