// The help window on a small screen at a large scale factor: it stays inside the screen's free
// area and its page scrolls down to the last line.
#include "ControlsOnTwoStars.h"
#include "ScaledRun.h"

#include "controls/HelpWindow.h"

#include <QApplication>
#include <QLabel>
#include <QScreen>
#include <QScrollArea>
#include <QScrollBar>
#include <QTest>
#include <QWheelEvent>
#include <gtest/gtest.h>

namespace {

QWidget* ShownHelpWindow()
{
    for (QWidget* window : QApplication::topLevelWidgets()) {
        if (window->isVisible() && window->windowTitle() == "Nightdome Help")
            return window;
    }
    return nullptr;
}

// One notch of the wheel turned toward the user, over the middle of widget.
void WheelDown(QWidget* widget)
{
    const QPointF at(widget->width() / 2.0, widget->height() / 2.0);
    QWheelEvent wheel(at, widget->mapToGlobal(at), QPoint(), QPoint(0, -120), Qt::NoButton,
        Qt::NoModifier, Qt::NoScrollPhase, false);
    QApplication::sendEvent(widget, &wheel);
}

// Whether the band of rows [top, bottom) of image holds text: pixels much darker than the
// page's background, which is the colour of the band's first pixel row at its left end.
bool HoldsText(const QImage& image, int top, int bottom)
{
    top = std::max(top, 0);
    bottom = std::min(bottom, image.height());
    if (top >= bottom)
        return false;
    const int background = qGray(image.pixel(0, top));
    int dark = 0;
    for (int y = top; y < bottom; y++) {
        for (int x = 0; x < image.width(); x++) {
            if (qGray(image.pixel(x, y)) < background - 80)
                dark++;
        }
    }
    return dark > 20;
}

void CheckHelpWindowOnTheScaledScreen()
{
    QScreen* screen = QGuiApplication::primaryScreen();
    ASSERT_NE(screen, nullptr);
    ASSERT_EQ(screen->devicePixelRatio(), 2.0);
    const QRect available = screen->availableGeometry();
    ASSERT_EQ(available.size(), QSize(960, 540));

    ControlsOnTwoStars program;
    program.controls.activateWindow();
    ASSERT_TRUE(QTest::qWaitForWindowActive(&program.controls));
    QTest::keyClick(program.controls.windowHandle(), Qt::Key_F1);
    QWidget* help = ShownHelpWindow();
    ASSERT_NE(help, nullptr);
    ASSERT_TRUE(QTest::qWaitForWindowExposed(help));

    // Inside the free area, in the program's pixels and in the screen's.
    EXPECT_TRUE(available.contains(help->frameGeometry()))
        << help->frameGeometry().x() << "," << help->frameGeometry().y() << " "
        << help->frameGeometry().width() << "x" << help->frameGeometry().height();
    EXPECT_LE(help->frameGeometry().height() * 2, 1080);
    EXPECT_LE(help->frameGeometry().width() * 2, 1920);

    // The page is taller than the window: it scrolls, down to its last line.
    auto* page = help->findChild<QLabel*>("Help Text");
    auto* scroller = help->findChild<QScrollArea*>();
    ASSERT_NE(page, nullptr);
    ASSERT_NE(scroller, nullptr);
    QWidget* viewport = scroller->viewport();
    QScrollBar* bar = scroller->verticalScrollBar();
    ASSERT_GT(bar->maximum(), 0);
    for (int notch = 0; notch < 200 && bar->value() < bar->maximum(); notch++)
        WheelDown(viewport);
    EXPECT_EQ(bar->value(), bar->maximum());

    // The last line ("F1  This help.") is drawn at the bottom of what is shown: the text's last
    // line ends a bottom margin above the page's end, and the page ends inside the viewport.
    const int pageEnd = page->mapTo(viewport, QPoint(0, page->height())).y();
    EXPECT_LE(pageEnd, viewport->height());
    const int lineHeight = page->fontMetrics().height();
    const int textEnd = pageEnd - page->contentsMargins().bottom();
    const QImage shown = viewport->grab().toImage().scaled(viewport->size());
    EXPECT_TRUE(HoldsText(shown, textEnd - lineHeight, textEnd))
        << "no text in rows " << textEnd - lineHeight << " to " << textEnd;
    // Below it, only the margin.
    EXPECT_FALSE(HoldsText(shown, textEnd + 2, pageEnd));
    if (const char* shots = std::getenv("ND_SCREENSHOTS")) {
        EXPECT_TRUE(help->grab().save(QString(shots) + "/help-window-scale-2.png"));
    }
}

} // namespace

TEST(HelpWindowTest, AtScaleTwoOnAFullHDScreenFitsAndScrollsToItsLastLine)
{
    if (InScaledRun())
        CheckHelpWindowOnTheScaledScreen();
    else
        RunScaled("HelpWindowTest.AtScaleTwoOnAFullHDScreenFitsAndScrollsToItsLastLine", 2);
}
