// What the tests of the real program share: the program started beside a small catalogue under
// the test's X server, its windows found and worked with xdotool, and what its charts show read
// off the screen (the origin read-out decoded glyph by glyph with the program's own font, stars
// counted as lit pixels).
#pragma once

#include "X11Desktop.h"
#include "X11Support.h"

#include "core/MessageCodes.h"
#include "render/RBMFont8.h"
#include "render/SystemPalette.h"
#include "resources/ResourceData.h"

#include <QFile>
#include <QGuiApplication>
#include <QImage>
#include <QProcess>
#include <QScreen>
#include <QTemporaryDir>
#include <QTest>
#include <algorithm>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <functional>
#include <string>

// Where the program puts its windows' insides. No window manager moves them: openbox puts its
// frame around a window where the window asked to stand.
inline const QRect kControls(90, 60, 320, 45);
inline const QPoint kChartOrigin(90, 140);
constexpr int kChartWidth = 329, kChartHeight = 329; // the view, above the 12-pixel strip

// The screen's own pixels (one GetImage of the root window).
inline QImage Grab(QRect area)
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

    std::string Read(QPoint view) const { return Read(Grab(Area(view)), QPoint(0, 0)); }

    // The same read from a picture of the screen (an xwd dump, say) whose point `at` shows the
    // top-left of the read-out's area.
    std::string Read(const QImage& image, QPoint at) const
    {
        std::string text;
        for (int line = 0; line < 4; line++) {
            std::string row;
            for (int cell = 0; cell < 38; cell++)
                row += Decode(image, at.x() + 10 + cell * 7, at.y() + line * 14);
            while (!row.empty() && row.back() == ' ')
                row.pop_back();
            text += row + "\n";
        }
        return text;
    }

    // Where the read-out of the chart whose view's top-left is at `view` stands on the screen.
    static QRect Area(QPoint view)
    {
        const int baseline = static_cast<int>(kChartHeight - 1 - 45.0);
        return QRect(view.x(), view.y() + baseline - 13, 40 * 7 + 10, 4 * 14);
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
inline double Field(const std::string& text, const std::string& label)
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

// The part of a chart's view above its read-out, where stars are counted.
inline QRect StarArea(QPoint view)
{
    return QRect(view, QSize(kChartWidth, kChartHeight - 60));
}

// Whether a pixel of a chart shows a star: lit, and not the overlay's green or the markers' red.
inline bool IsStarPixel(QRgb p)
{
    const rgb_color g = system_colors()->color_list[55], r = system_colors()->color_list[42];
    return qGray(p) > 20 && p != qRgb(g.red, g.green, g.blue) && p != qRgb(r.red, r.green, r.blue);
}

// Pixels of a picture of a chart that show stars.
inline int StarPixels(const QImage& image)
{
    int lit = 0;
    for (int y = 0; y < image.height(); y++) {
        for (int x = 0; x < image.width(); x++)
            lit += IsStarPixel(image.pixel(x, y));
    }
    return lit;
}

// The same on the screen, in the chart whose view's top-left is at `view`.
inline int StarPixels(QPoint view)
{
    return StarPixels(Grab(StarArea(view)));
}

// Pixels that differ between two pictures of one area; every pixel when the sizes differ.
inline int DifferentPixels(const QImage& a, const QImage& b)
{
    if (a.size() != b.size())
        return std::max(a.width() * a.height(), b.width() * b.height());
    int different = 0;
    for (int y = 0; y < a.height(); y++) {
        for (int x = 0; x < a.width(); x++)
            different += a.pixel(x, y) != b.pixel(x, y);
    }
    return different;
}

// Runs xdotool to its end (no drag of ours runs meanwhile) and returns what it printed.
inline QString RunXdotool(const QStringList& arguments)
{
    QProcess process;
    process.start("xdotool", arguments);
    process.waitForFinished(20000);
    return QString::fromUtf8(process.readAllStandardOutput()).trimmed();
}

// A drag of a mouse control: pressed at `from`, moved in steps by (dx, dy) each, let go.
inline void DragControl(QPoint from, int steps, int dx, int dy)
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

inline QPoint ControlCentre(int item)
{
    return kControls.topLeft() + QPoint(32 * item + 16, 16);
}

class Program : public ::testing::Test {
protected:
    // Whether openbox manages the screen while the program runs; it starts first.
    virtual bool WithWindowManager() const { return false; }

    void SetUp() override
    {
        if (QGuiApplication::platformName() != "xcb")
            GTEST_SKIP() << "needs an X server: run under scripts/with-xvfb";
        if (WithWindowManager()) {
            ASSERT_TRUE(fWindowManager.Start()) << "openbox did not take over the screen";
        }
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
        fWindowManager.Stop();
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

    // The shown windows titled name, in the order xdotool finds them.
    static QList<unsigned long> WindowsNamed(const char* name)
    {
        QList<unsigned long> windows;
        for (const QString& id :
            RunXdotool({ "search", "--onlyvisible", "--name", QString("^%1$").arg(name) })
                .split('\n', Qt::SkipEmptyParts))
            windows.append(id.toULong());
        return windows;
    }

    static unsigned long WindowNamed(const char* name, int index = 0)
    {
        const QList<unsigned long> windows = WindowsNamed(name);
        return index < windows.size() ? windows[index] : 0;
    }

    WindowManager fWindowManager;
    QTemporaryDir fDir;
    QProcess fProgram;
    ReadOutReader fReader;
};
