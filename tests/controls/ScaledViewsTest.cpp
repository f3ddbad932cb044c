// The views drawn from 8-bit bitmaps in every window (mouse controls and picture buttons, the
// chart and its toggle, the star information terminal, the H-R diagram, drop pads, the find
// window's handles) at the scale factors of high-density screens, painted as for the screen into
// pictures of the screen's pixels (the headless platform keeps no such pixels of its own): at 2
// each pixel of a view is a block of 2 x 2 identical pixels of the screen, and at 1.5 as at 2 the
// screen shows no colour the bitmaps cannot hold (no blur).
#include "ControlsOnTwoStars.h"
#include "ScaledPixels.h"
#include "ScaledRun.h"

#include "chart/UniverseView.h"
#include "controls/MouseControl.h"
#include "hrd/HRDView.h"
#include "hrd/HRDWindow.h"
#include "info/HWTerminal.h"
#include "info/StarInfoWindow.h"
#include "lists/DropPad.h"
#include "lists/ListWindow.h"
#include "query/panels/DragHandle.h"
#include "query/panels/FindWindow.h"
#include "widgets/BitmapControl.h"

#include <QApplication>
#include <QScreen>
#include <QTest>
#include <gtest/gtest.h>
#include <string>

namespace {

// The shown views of the open windows that are drawn from 8-bit bitmaps.
QList<QWidget*> BitmapViews()
{
    QList<QWidget*> views;
    for (QWidget* window : QApplication::topLevelWidgets()) {
        if (!window->isVisible())
            continue;
        for (QWidget* widget : window->findChildren<QWidget*>()) {
            if (widget->isVisible()
                && (dynamic_cast<MouseControl*>(widget) || dynamic_cast<BitmapControl*>(widget)
                    || dynamic_cast<UniverseView*>(widget) || dynamic_cast<HRDView*>(widget)
                    || dynamic_cast<HWTerminal*>(widget) || dynamic_cast<DropPad*>(widget)
                    || dynamic_cast<DragHandle*>(widget)))
                views.append(widget);
        }
    }
    return views;
}

std::string NameOf(const QWidget* view)
{
    return view->window()->windowTitle().toStdString() + " / " + view->objectName().toStdString();
}

// In the copy at the scale: every window opened, then each bitmap view once it shows something.
void CheckBitmapViews()
{
    const double scale = QGuiApplication::primaryScreen()->devicePixelRatio();
    ControlsOnTwoStars program;
    ASSERT_NE(program.Open<StarInfoWindow>("Show Info Window Button"), nullptr);
    ASSERT_NE(program.Open<HRDWindow>("Show H-R Window Button"), nullptr);
    ASSERT_NE(program.Open<FindWindow>("Show Find Window Button"), nullptr);
    ASSERT_NE(program.Open<ListWindow>("New List Window Button"), nullptr);
    for (QWidget* window : QApplication::topLevelWidgets()) {
        if (window->isVisible()) {
            ASSERT_TRUE(QTest::qWaitForWindowExposed(window))
                << window->windowTitle().toStdString();
        }
    }

    const QList<QWidget*> views = BitmapViews();
    // Ten control items, the chart and its toggle, a terminal, a diagram and its clear button,
    // seven pads and a handle for each of the six panels at least.
    ASSERT_GE(views.size(), 29);
    for (QWidget* view : views) {
        QImage shown;
        // The chart and the terminal draw on threads of their own: wait for their first frame.
        EXPECT_TRUE(QTest::qWaitFor(
            [&] {
                shown = view->grab().toImage().convertToFormat(QImage::Format_RGB32);
                return Drawn(shown);
            },
            10000))
            << NameOf(view) << " shows nothing";
        EXPECT_EQ(shown.size(), (QSizeF(view->size()) * scale).toSize()) << NameOf(view);
        EXPECT_EQ(BlendedPixels(shown), 0) << NameOf(view) << " is blurred";
        if (scale == 2) {
            EXPECT_EQ(MixedBlocks(shown), 0)
                << NameOf(view) << ": its pixels are not blocks of 2 x 2 pixels of the screen";
        }
    }
}

} // namespace

TEST(ScaledViewsTest, AtScaleTwoEachPixelOfABitmapViewIsTwoByTwoPixelsOfTheScreen)
{
    if (InScaledRun())
        CheckBitmapViews();
    else
        RunScaled("ScaledViewsTest.AtScaleTwoEachPixelOfABitmapViewIsTwoByTwoPixelsOfTheScreen", 2);
}

TEST(ScaledViewsTest, AtScaleOneAndAHalfTheBitmapViewsAreNotBlurred)
{
    if (InScaledRun())
        CheckBitmapViews();
    else
        RunScaled("ScaledViewsTest.AtScaleOneAndAHalfTheBitmapViewsAreNotBlurred", 1.5);
}
