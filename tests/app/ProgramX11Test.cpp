// The real program on a real X server (Xvfb), worked with xdotool as a person would: the
// trackball, the camera and clipping controls, a second chart, closing windows and quitting.
// What the charts show is read off the screen: the origin read-out is decoded glyph by glyph with
// the program's own font, and stars are counted as lit pixels.
#include "X11Support.h"

#include "core/MessageCodes.h"
#include "render/RBMFont8.h"
#include "render/SystemPalette.h"
#include "resources/ResourceData.h"

#include <QDir>
#include <QFile>
#include <QGuiApplication>
#include <QImage>
#include <QProcess>
#include <QScreen>
#include <QTemporaryDir>
#include <QTest>
#include <X11/Xlib.h>
#include <X11/Xutil.h>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <memory>

namespace {

// Where the program puts its windows (no window manager moves them under Xvfb).
const QRect kControls(90, 60, 320, 45);
const QPoint kChartOrigin(90, 140);
constexpr int kChartWidth = 329, kChartHeight = 329; // the view, above the 12-pixel strip

QImage Grab(QRect area)
{
    return QGuiApplication::primaryScreen()
        ->grabWindow(0, area.x(), area.y(), area.width(), area.height())
        .toImage()
        .convertToFormat(QImage::Format_RGB32);
}

// Reads the four lines of the origin read-out of a chart whose view's top-left is at `view`:
// each 7 x 14 cell is matched against the program's font, ink being the overlay's green.
class ReadOutReader {
public:
    ReadOutReader()
        : fResources((InitResources(), true))
        , fFont(int32_t(kFontType), kSystemFontId, kSystemFontStripWidth, kSystemFontCharHeight,
              kSystemFontCharWidth, kSystemFontFirstChar, kSystemFontLastChar)
    {
        const rgb_color green = system_colors()->color_list[55];
        fInk = qRgb(green.red, green.green, green.blue);
    }

    std::string Read(QPoint view) const
    {
        const int baseline = static_cast<int>(kChartHeight - 1 - 45.0);
        const QImage image = Grab(QRect(view.x(), view.y() + baseline - 13, 40 * 7 + 10, 4 * 14));
        std::string text;
        for (int line = 0; line < 4; line++) {
            std::string row;
            for (int cell = 0; cell < 38; cell++)
                row += Decode(image, 10 + cell * 7, line * 14);
            while (!row.empty() && row.back() == ' ')
                row.pop_back();
            text += row + "\n";
        }
        return text;
    }

private:
    // The character whose ink is exactly the green of the cell; '?' when none is.
    char Decode(const QImage& image, int left, int top) const
    {
        for (char c = kSystemFontFirstChar; c <= kSystemFontLastChar && c > 0; c++) {
            const uint8_t* glyph = fFont.GlyphBits(c);
            bool same = true;
            for (int y = 0; y < 14 && same; y++) {
                for (int x = 0; x < 7 && same; x++) {
                    const bool ink = glyph[y * fFont.StripBytesPerRow() + x] == 255;
                    same = ink == (image.pixel(left + x, top + y) == fInk);
                }
            }
            if (same)
                return c;
        }
        return '?';
    }

    bool fResources; // read before the font: the strip comes from them
    RBMFont8 fFont;
    QRgb fInk;
};

// The number after label in the read-out; for "DEC: " the whole angle, minutes included.
double Field(const std::string& text, const std::string& label)
{
    const size_t at = text.find(label);
    if (at == std::string::npos)
        return -1e9;
    double value = 0, minutes = 0;
    const char* p = text.c_str() + at + label.size();
    if (label == "DEC: " && std::sscanf(p, "%lfd %lf'", &value, &minutes) == 2)
        return value + (std::signbit(value) ? -minutes : minutes) / 60;
    return std::atof(p);
}

// Pixels of a chart that show stars: lit, and not the overlay's green or the markers' red.
int StarPixels(QPoint view)
{
    const QImage image = Grab(QRect(view, QSize(kChartWidth, kChartHeight - 60)));
    const rgb_color g = system_colors()->color_list[55], r = system_colors()->color_list[42];
    int lit = 0;
    for (int y = 0; y < image.height(); y++) {
        for (int x = 0; x < image.width(); x++) {
            const QRgb p = image.pixel(x, y);
            lit += qGray(p) > 20 && p != qRgb(g.red, g.green, g.blue)
                && p != qRgb(r.red, r.green, r.blue);
        }
    }
    return lit;
}

// Asks a window politely to close, as a window manager's close button does.
void CloseWindow(unsigned long window)
{
    Display* display = XOpenDisplay(nullptr);
    XEvent event {};
    event.xclient.type = ClientMessage;
    event.xclient.window = window;
    event.xclient.message_type = XInternAtom(display, "WM_PROTOCOLS", False);
    event.xclient.format = 32;
    event.xclient.data.l[0] = long(XInternAtom(display, "WM_DELETE_WINDOW", False));
    event.xclient.data.l[1] = CurrentTime;
    XSendEvent(display, window, False, NoEventMask, &event);
    XFlush(display);
    XCloseDisplay(display);
}

// Runs xdotool to its end (no drag of ours runs meanwhile) and returns what it printed.
QString RunXdotool(const QStringList& arguments)
{
    QProcess process;
    process.start("xdotool", arguments);
    process.waitForFinished(20000);
    return QString::fromUtf8(process.readAllStandardOutput()).trimmed();
}

// A drag of a mouse control: pressed at `from`, moved in steps by (dx, dy) each, let go.
void DragControl(QPoint from, int steps, int dx, int dy)
{
    QStringList arguments { "mousemove", Number(from.x()), Number(from.y()), "mousedown", "1",
        "sleep", "0.1" };
    QPoint at = from;
    for (int i = 0; i < steps; i++) {
        at += QPoint(dx, dy);
        arguments << "mousemove" << Number(at.x()) << Number(at.y()) << "sleep"
                  << "0.06";
    }
    arguments << "mouseup"
              << "1";
    RunXdotool(arguments);
}

QPoint ControlCentre(int item)
{
    return kControls.topLeft() + QPoint(32 * item + 16, 16);
}

class Program : public ::testing::Test {
protected:
    void SetUp() override
    {
        if (QGuiApplication::platformName() != "xcb")
            GTEST_SKIP() << "needs an X server: run under scripts/with-xvfb";
        InitResources();
        // The program with a small catalogue beside it: the Sun and stars from 3 to 20 pc.
        ASSERT_TRUE(fDir.isValid());
        ASSERT_TRUE(QFile::copy(ND_PROGRAM, fDir.filePath("nightdome")));
        QFile::setPermissions(fDir.filePath("nightdome"), QFile::ReadOwner | QFile::ExeOwner);
        QFile catalogue(fDir.filePath("stars.dat"));
        ASSERT_TRUE(catalogue.open(QIODevice::WriteOnly));
        catalogue.write("The Sun\nG2V 4.83 0 0 0\n"
                        "Sirius\nA0 1.45 -0.494 -0.759 2.477\n"
                        "Procyon\nF5 2.68 -1.365 0.320 3.228\n"
                        "Altair\nA7 2.22 2.54 0.87 -4.31\n"
                        "Vega\nA0 0.58 1.0 4.9 -5.0\n"
                        "Fomalhaut\nA3 1.74 7.1 -3.7 -1.1\n"
                        "Pollux\nK0 1.08 -5.0 3.4 7.9\n"
                        "Arcturus\nK2 -0.3 -8.8 3.7 -5.9\n"
                        "Capella\nG8 -0.5 2.0 8.5 10.0\n"
                        "Far One\nB5 -1.0 15.0 -5.0 8.0\n");
        catalogue.close();
        fProgram.setProgram(fDir.filePath("nightdome"));
        fProgram.setProcessChannelMode(QProcess::ForwardedChannels);
        fProgram.start();
        ASSERT_TRUE(fProgram.waitForStarted(10000));
    }

    void TearDown() override
    {
        if (fProgram.state() != QProcess::NotRunning) {
            fProgram.kill();
            fProgram.waitForFinished(5000);
        }
    }

    // The read-out of the chart at `view` once it shows the Sun as origin, or whatever it shows
    // after `timeout`.
    std::string WaitForReadOut(
        QPoint view, const std::function<bool(const std::string&)>& ready, int timeout = 10000)
    {
        std::string text;
        // A read-out that never gets ready is returned as it stands, for the caller to report.
        (void)QTest::qWaitFor(
            [&] {
                text = fReader.Read(view);
                return ready(text);
            },
            timeout);
        return text;
    }

    // A value of the read-out once it has stopped changing (a turn or a zoom dies away over a
    // few dozen frames). A read spoilt by a cube edge crossing the text counts as a change.
    double Settled(QPoint view, const std::string& label)
    {
        double last = -1e9;
        (void)QTest::qWaitFor(
            [&] {
                const double now = Field(fReader.Read(view), label);
                const bool settled = now == last && now > -1e8;
                last = now;
                QTest::qWait(250);
                return settled;
            },
            10000);
        return last;
    }

    unsigned long WindowNamed(const char* name, int index = 0)
    {
        const QStringList ids
            = RunXdotool({ "search", "--onlyvisible", "--name", QString("^%1$").arg(name) })
                  .split('\n', Qt::SkipEmptyParts);
        return index < ids.size() ? ids[index].toULong() : 0;
    }

    QTemporaryDir fDir;
    QProcess fProgram;
    ReadOutReader fReader;
};

} // namespace

TEST_F(Program, ControlsDriveTheActiveChartAndClosingTheControlsEndsTheProgram)
{
    const std::string first = WaitForReadOut(kChartOrigin,
        [](const std::string& t) { return t.rfind("Origin: The Sun\nDistance: 25.00\n", 0) == 0; });
    ASSERT_EQ(first.rfind("Origin: The Sun\nDistance: 25.00\n", 0), 0u) << first;
    EXPECT_NE(first.find("DEC: -29d 47.6'"), std::string::npos) << first;
    if (const char* shots = std::getenv("ND_SCREENSHOTS")) {
        Grab(kControls.adjusted(-4, -4, 4, 4)).save(QString(shots) + "/control-window.png");
    }

    // The trackball, dragged sideways: the chart pitches (horizontal drags drive the turn about
    // the screen's horizontal axis), so its declination changes, and stays once the turn dies.
    DragControl(ControlCentre(0), 8, 5, 0);
    const std::string pitched = WaitForReadOut(kChartOrigin, [](const std::string& t) {
        return t.find("DEC: -29d 47.6'") == std::string::npos && t.find('?') == std::string::npos;
    });
    EXPECT_NE(pitched.find("DEC: "), std::string::npos) << pitched;
    const double dec = Settled(kChartOrigin, "DEC: ");
    EXPECT_GT(std::abs(dec + 29.79), 1) << pitched; // turned by more than a degree
    QTest::qWait(300);
    // The turn died away: a tenth of a degree at most is left of a turn of several degrees.
    EXPECT_NEAR(Settled(kChartOrigin, "DEC: "), dec, 0.1);

    // The camera control, dragged downward: the camera moves out.
    DragControl(ControlCentre(1), 8, 0, 5);
    const std::string zoomed = WaitForReadOut(
        kChartOrigin, [](const std::string& t) { return Field(t, "Distance: ") > 26; });
    EXPECT_GT(Field(zoomed, "Distance: "), 26) << zoomed;
    if (const char* shots = std::getenv("ND_SCREENSHOTS"))
        Grab(QRect(kChartOrigin, QSize(kChartWidth, kChartHeight + 12)))
            .save(QString(shots) + "/chart-turned.png");

    // The clipping sphere, dragged far to the right: the radius falls to its minimum of half a
    // parsec, and the stars around the Sun go out.
    const int before = StarPixels(kChartOrigin);
    ASSERT_GT(before, 20);
    DragControl(ControlCentre(4), 20, 45, 0);
    EXPECT_TRUE(QTest::qWaitFor([&] { return StarPixels(kChartOrigin) < before / 4; }, 10000))
        << StarPixels(kChartOrigin) << " of " << before;

    // A second chart, moved aside; the controls follow whichever chart was activated last.
    RunXdotool(
        { "mousemove", Number(ControlCentre(5).x()), Number(ControlCentre(5).y()), "click", "1" });
    unsigned long second = 0;
    ASSERT_TRUE(
        QTest::qWaitFor([&] { return (second = WindowNamed("Nightdome", 1)) != 0; }, 10000));
    const unsigned long firstWindow = WindowNamed("Nightdome", 0);
    RunXdotool({ "windowmove", QString::number(second), "600", "140" });
    const QPoint secondOrigin(600, 140);
    const std::string fresh = WaitForReadOut(secondOrigin,
        [](const std::string& t) { return t.rfind("Origin: The Sun\nDistance: 25.00\n", 0) == 0; });
    ASSERT_EQ(fresh.rfind("Origin: The Sun\nDistance: 25.00\n", 0), 0u) << fresh;

    RunXdotool({ "windowfocus", QString::number(second) });
    const double firstDistance = Settled(kChartOrigin, "Distance: ");
    DragControl(ControlCentre(1), 8, 0, 5);
    EXPECT_TRUE(QTest::qWaitFor(
        [&] { return Field(fReader.Read(secondOrigin), "Distance: ") > 26; }, 10000));
    EXPECT_NEAR(Settled(kChartOrigin, "Distance: "), firstDistance, 0.1);

    RunXdotool({ "windowfocus", QString::number(firstWindow) });
    const double secondDistance = Settled(secondOrigin, "Distance: ");
    DragControl(ControlCentre(1), 8, 0, 5);
    EXPECT_TRUE(QTest::qWaitFor(
        [&] { return Field(fReader.Read(kChartOrigin), "Distance: ") > firstDistance + 1; },
        10000));
    EXPECT_NEAR(Settled(secondOrigin, "Distance: "), secondDistance, 0.1);

    // Closing the active chart, then working a control: nothing breaks.
    CloseWindow(firstWindow);
    EXPECT_TRUE(QTest::qWaitFor([&] { return WindowNamed("Nightdome", 1) == 0; }, 10000));
    DragControl(ControlCentre(0), 6, 5, 0);
    DragControl(ControlCentre(2), 6, 5, 0);
    QTest::qWait(300);
    EXPECT_EQ(fProgram.state(), QProcess::Running);

    // Closing the control window ends the program, the other chart still open.
    CloseWindow(WindowNamed("3D Nightdome"));
    ASSERT_TRUE(fProgram.waitForFinished(10000));
    EXPECT_EQ(fProgram.exitStatus(), QProcess::NormalExit);
    EXPECT_EQ(fProgram.exitCode(), 0);
}
