// What the tests of the real program share: the program started beside a small catalogue under
// the test's X server, where its windows stand and what is in them, its windows found and
// worked with xdotool, and the gestures that carry sets from window to window.
#pragma once

#include "ChartReaders.h"
#include "SmallCatalogue.h"
#include "X11Desktop.h"
#include "X11Support.h"

#include "core/MessageCodes.h"
#include "resources/ResourceData.h"

#include <QElapsedTimer>
#include <QFile>
#include <QGuiApplication>
#include <QImage>
#include <QProcess>
#include <QTemporaryDir>
#include <QTest>
#include <cstdlib>
#include <functional>
#include <iterator>
#include <string>
#include <utility>
#include <vector>

// Where the program puts its windows' insides. No window manager moves them: openbox puts its
// frame around a window where the window asked to stand.
inline const QRect kControls(90, 60, 320, 45);
inline const QPoint kChartOrigin(90, 140);
// Where sets are dropped on the chart: the middle of its view, well above the read-out.
inline const QPoint kDropPoint = kChartOrigin + QPoint(kChartWidth / 2, kChartHeight / 3);
// Where the pointer rests between gestures: over none of the program's windows.
inline const QPoint kRestPoint(1250, 1000);

// The find window's distance panel in its column, and in a panel the middle of its handle and
// of its controls, all in the row under the panel's title.
inline const QPoint kDistancePanel(10, 310);
constexpr int kPanelRow = 33;
inline const QPoint kPanelHandle(322 + 16, kPanelRow);
inline const QPoint kDistanceMode(10 + 55, kPanelRow);
inline const QPoint kDistanceField(130 + 20, kPanelRow);
// The panels' mode menus: "is", "is less than", "is greater than".
constexpr int kModeCount = 3, kLessThan = 1;

// A list window's drop pads, its handle and its count line (as far as the check box: the line
// reaches past 100 pixels so that counts of many digits show whole).
inline const QPoint kPlusPad(16, 16);
inline const QPoint kEqualsPad(40 + 16, 16);
inline const QPoint kNotPad(2 + 16, 34 + 8);
inline const QPoint kAndPad(42 + 16, 34 + 8);
inline const QPoint kXorPad(122 + 16, 34 + 8);
inline const QPoint kStarDragger(188 + 16, 10 + 16);
inline const QRect kCountLine(0, 54, 150, 13);

// Runs xdotool to its end (no drag of ours runs meanwhile) and returns what it printed. Pointer
// positions are in this process's pixels; windows are moved in the screen's.
inline QString RunXdotool(const QStringList& arguments)
{
    QProcess process;
    process.start("xdotool", InScreenPixels(arguments));
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
        ASSERT_TRUE(fDir.isValid());
        ASSERT_NO_FATAL_FAILURE(PrepareProgram());
        fProgram.setProcessChannelMode(QProcess::ForwardedChannels);
        fProgram.start();
        ASSERT_TRUE(fProgram.waitForStarted(10000));
    }

    // The program with a small catalogue beside it.
    virtual void PrepareProgram()
    {
        ASSERT_TRUE(QFile::copy(ND_PROGRAM, fDir.filePath("nightdome")));
        QFile::setPermissions(fDir.filePath("nightdome"), QFile::ReadOwner | QFile::ExeOwner);
        QFile catalogue(fDir.filePath("stars.dat"));
        ASSERT_TRUE(catalogue.open(QIODevice::WriteOnly));
        catalogue.write(kSmallCatalogue);
        catalogue.close();
        fProgram.setProgram(fDir.filePath("nightdome"));
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

    // The program's windows that are shown: its windows, and a pop-up menu while one is open.
    QList<unsigned long> ProgramWindows() const
    {
        QList<unsigned long> windows;
        for (const QString& id : RunXdotool(
                 { "search", "--onlyvisible", "--pid", QString::number(fProgram.processId()) })
                                     .split('\n', Qt::SkipEmptyParts))
            windows.append(id.toULong());
        return windows;
    }

    // Whether the first chart comes to show the Sun as its origin, as it does when the program
    // is up; with the read-out it shows instead when it does not.
    ::testing::AssertionResult StartedAtTheSun()
    {
        const std::string text = WaitForReadOut(kChartOrigin,
            [](const std::string& t) { return t.rfind("Origin: The Sun\n", 0) == 0; });
        if (text.rfind("Origin: The Sun\n", 0) == 0)
            return ::testing::AssertionSuccess();
        return ::testing::AssertionFailure() << "the chart's read-out shows\n" << text;
    }

    // Clicks control window item `item` and returns the window titled `title` that it opened,
    // one not in `known`; 0 when none came.
    static unsigned long Open(int item, const char* title, const QList<unsigned long>& known = {})
    {
        return OpenAt(ControlCentre(item), title, known);
    }

    // Clicks the screen at `click` and returns the window titled `title` that it opened, one not
    // in `known`; 0 when none came.
    static unsigned long OpenAt(
        QPoint click, const char* title, const QList<unsigned long>& known = {})
    {
        RunXdotool(ClickAt(click));
        return ShownWindow(title, known);
    }

    // Waits for a window titled `title`, not one in `known`, to be shown with an inside; 0 when
    // none came.
    static unsigned long ShownWindow(const char* title, const QList<unsigned long>& known = {})
    {
        unsigned long shown = 0;
        (void)QTest::qWaitFor(
            [&] {
                for (unsigned long window : WindowsNamed(title)) {
                    if (!known.contains(window) && !ClientArea(window).isEmpty()) {
                        shown = window;
                        return true;
                    }
                }
                return false;
            },
            10000);
        return shown;
    }

    // Moves window to `place` and returns where its inside then stands, once it has left where
    // it stood; under a window manager the frame goes where asked, the inside a little below.
    static QPoint Move(unsigned long window, QPoint place)
    {
        const QPoint from = ClientArea(window).topLeft();
        RunXdotool({ "windowmove", QString::number(window), Number(place.x()), Number(place.y()) });
        QPoint at = from;
        (void)QTest::qWaitFor(
            [&] {
                at = ClientArea(window).topLeft();
                return at != from && (at - place).manhattanLength() < 60;
            },
            10000);
        return at;
    }

    // Opens the pop-up menu whose field's middle is at `field`, clicks item `index` of its
    // `count` and waits for it to close; false when no menu came up or it stayed.
    bool Choose(QPoint field, int index, int count) const
    {
        const QList<unsigned long> before = ProgramWindows();
        RunXdotool(ClickAt(field));
        unsigned long menu = 0;
        QRect area;
        const bool opened = QTest::qWaitFor(
            [&] {
                for (unsigned long window : ProgramWindows()) {
                    if (!before.contains(window)) {
                        menu = window;
                        area = ClientArea(window);
                        return area.height() > count * 8;
                    }
                }
                return false;
            },
            5000);
        if (!opened)
            return false;
        // The items are of one height, between a frame a few pixels thick.
        const QPoint item(
            area.center().x(), area.top() + area.height() * (2 * index + 1) / (2 * count));
        RunXdotool(ClickAt(item));
        return QTest::qWaitFor([&] { return !ProgramWindows().contains(menu); }, 5000);
    }

    // Sets the find window whose inside stands at `find` to find the systems nearer the Sun
    // than `distance` parsecs: "is less than" on its distance panel, the distance typed in.
    bool ChooseNearerThan(QPoint find, double distance) const
    {
        if (!Choose(find + kDistancePanel + kDistanceMode, kLessThan, kModeCount))
            return false;
        const QPoint field = find + kDistancePanel + kDistanceField;
        RunXdotool({ "mousemove", Number(field.x()), Number(field.y()), "click", "1", "sleep",
            "0.2", "key", "ctrl+a", "type", QString::number(distance) });
        return true;
    }

    // Drags from `from` to `to` as a hand does, then takes the pointer off every window.
    static void Drag(QPoint from, QPoint to)
    {
        RunXdotool(DragSteps(from, to));
        RestThePointer();
    }

    static void RestThePointer()
    {
        RunXdotool({ "mousemove", Number(kRestPoint.x()), Number(kRestPoint.y()) });
    }

    // The chart's stars once its picture differs from `before` and has stayed the same for
    // half a second.
    static QImage NewStars(const QImage& before)
    {
        return NewPicture(StarArea(kChartOrigin), before);
    }

    // The chart's stars once its picture has stayed the same for half a second.
    static QImage SteadyStars() { return NewStars(QImage()); }

    // Stops the chart's steady turn, so that pictures of it taken apart can be laid over each
    // other: the trackball held still eases the turn away, sample by sample. It is let go once
    // the picture has stayed the same for a second; false when it never did.
    static bool StopTheTurn()
    {
        const QPoint trackball = ControlCentre(0);
        RunXdotool({ "mousemove", Number(trackball.x()), Number(trackball.y()), "mousedown", "1" });
        QImage last;
        QElapsedTimer unchanged;
        const bool still = QTest::qWaitFor(
            [&] {
                const QImage now = Grab(StarArea(kChartOrigin));
                if (now != last) {
                    last = now;
                    unchanged.start();
                }
                return unchanged.elapsed() >= 1000;
            },
            15000);
        RunXdotool({ "mouseup", "1" });
        RestThePointer();
        return still;
    }

    // Whether no two of the windows, frames included, overlap; each pair that does is
    // reported as a failure.
    static bool Apart(const std::vector<std::pair<const char*, unsigned long>>& windows)
    {
        bool apart = true;
        for (auto a = windows.begin(); a != windows.end(); ++a) {
            for (auto b = std::next(a); b != windows.end(); ++b) {
                if (FrameArea(a->second).intersects(FrameArea(b->second))) {
                    ADD_FAILURE() << "the " << a->first << " window overlaps the " << b->first
                                  << " window";
                    apart = false;
                }
            }
        }
        return apart;
    }

    // Saves a picture of the windows, frames included, as `file` in the folder ND_SCREENSHOTS
    // names; nothing when it names none.
    static void SaveScreenshot(
        const std::vector<std::pair<const char*, unsigned long>>& windows, const char* file)
    {
        const char* shots = std::getenv("ND_SCREENSHOTS");
        if (!shots)
            return;
        QRect around;
        for (const auto& window : windows)
            around |= FrameArea(window.second);
        EXPECT_TRUE(Grab(around.adjusted(-4, -4, 4, 4)).save(QString(shots) + "/" + file));
    }

    WindowManager fWindowManager;
    QTemporaryDir fDir;
    QProcess fProgram;
    ReadOutReader fReader;
};
