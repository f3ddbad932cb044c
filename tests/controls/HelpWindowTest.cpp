// The help window on a small screen at a large scale factor: it stays inside the screen's free
// area and its page scrolls down to the last line.
#include "ControlsOnTwoStars.h"

#include "controls/HelpWindow.h"

#include <QApplication>
#include <QFile>
#include <QLabel>
#include <QProcess>
#include <QScreen>
#include <QScrollArea>
#include <QScrollBar>
#include <QTemporaryDir>
#include <QTest>
#include <QWheelEvent>
#include <gtest/gtest.h>

namespace {

// Set in the copy of this program that runs the checks at scale 2.
constexpr char kScaledRun[] = "ND_HELP_WINDOW_SCALED_RUN";

// A full-HD screen at twice the size: 960 by 540 in the program's own pixels.
constexpr char kScreenConfig[]
    = R"({ "screens": [ { "name": "FullHD", "x": 0, "y": 0, "width": 1920, "height": 1080,
           "logicalDpi": 96, "logicalBaseDpi": 96, "dpr": 1 } ] })";

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
    if (qEnvironmentVariableIsSet(kScaledRun)) {
        CheckHelpWindowOnTheScaledScreen();
        return;
    }
    // The scale factor is read when the application starts: this test runs again in a copy of
    // this program started at scale 2 on a screen of 1920 by 1080 pixels.
    QTemporaryDir folder;
    ASSERT_TRUE(folder.isValid());
    QFile config(folder.filePath("screen.json"));
    ASSERT_TRUE(config.open(QIODevice::WriteOnly));
    config.write(kScreenConfig);
    config.close();

    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    environment.insert(kScaledRun, "1");
    environment.insert("QT_SCALE_FACTOR", "2");
    environment.insert("QT_QPA_PLATFORM", "offscreen:configfile=" + config.fileName());
    environment.remove("DISPLAY");
    QProcess copy;
    copy.setProcessEnvironment(environment);
    copy.setProcessChannelMode(QProcess::MergedChannels);
    copy.start(QCoreApplication::applicationFilePath(),
        { "--gtest_filter=HelpWindowTest.AtScaleTwoOnAFullHDScreenFitsAndScrollsToItsLastLine" });
    ASSERT_TRUE(copy.waitForFinished(120000));
    const QString output = QString::fromLocal8Bit(copy.readAll());
    EXPECT_EQ(copy.exitStatus(), QProcess::NormalExit) << output.toStdString();
    EXPECT_EQ(copy.exitCode(), 0) << output.toStdString();
    // The copy ran the test rather than finding nothing to run.
    EXPECT_TRUE(output.contains("[  PASSED  ] 1 test")) << output.toStdString();
}
