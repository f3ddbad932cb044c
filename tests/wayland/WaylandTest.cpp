// The program under a real Wayland compositor: weston's headless back end, started by
// with-weston around this test. What the compositor shows is read from weston itself: where it
// put each window from its scene graph (weston-debug), and the pixels from its screenshooter.
#include <QDir>
#include <QFileInfo>
#include <QImage>
#include <QProcess>
#include <QRegularExpression>
#include <QTemporaryDir>
#include <QTest>
#include <gtest/gtest.h>
#include <vector>

namespace {

// A top-level window as the compositor shows it: its title, the process that made it, and the
// rectangle of its contents on the output (inside the decorations Qt draws around it).
struct ShownWindow {
    QString title;
    qint64 pid = 0;
    QRect inside;
};

QString Run(const QString& program, const QStringList& arguments, const QString& folder = {})
{
    QProcess process;
    if (!folder.isEmpty())
        process.setWorkingDirectory(folder);
    process.start(program, arguments);
    if (!process.waitForFinished(20000)) {
        process.kill();
        process.waitForFinished(5000);
    }
    return QString::fromUtf8(process.readAllStandardOutput());
}

// The top-level windows on the output, the front-most first.
std::vector<ShownWindow> ShownWindows()
{
    static const QRegularExpression view(
        R"(View \d+ \(role xdg_toplevel, PID (\d+), .*top-level window '(.*)' of )");
    static const QRegularExpression opaque(R"(\[opaque: \((\d+), (\d+)\) -> \((\d+), (\d+)\)\])");
    std::vector<ShownWindow> windows;
    bool inWindow = false;
    for (const QString& line : Run("weston-debug", { "scene-graph" }).split('\n')) {
        if (line.contains("View ")) {
            const QRegularExpressionMatch match = view.match(line);
            inWindow = match.hasMatch();
            if (inWindow)
                windows.push_back({ match.captured(2), match.captured(1).toLongLong(), {} });
            continue;
        }
        const QRegularExpressionMatch match = opaque.match(line);
        if (inWindow && match.hasMatch()) {
            const QPoint from(match.captured(1).toInt(), match.captured(2).toInt());
            const QPoint to(match.captured(3).toInt(), match.captured(4).toInt());
            windows.back().inside = QRect(from, to - QPoint(1, 1));
        }
    }
    return windows;
}

// The windows of one process, the front-most first.
std::vector<ShownWindow> WindowsOf(qint64 pid)
{
    std::vector<ShownWindow> windows = ShownWindows();
    std::erase_if(windows, [pid](const ShownWindow& w) { return w.pid != pid; });
    return windows;
}

// The whole output as the compositor last drew it.
QImage Screenshot(const QString& folder)
{
    QDir dir(folder);
    dir.mkpath("shot");
    dir.cd("shot");
    Run("weston-screenshooter", {}, dir.path());
    QImage shot;
    for (const QFileInfo& file : dir.entryInfoList({ "*.png" }, QDir::Files)) {
        shot.load(file.filePath());
        QFile::remove(file.filePath());
    }
    return shot.convertToFormat(QImage::Format_RGB32);
}

// Pixels in area of image brighter than the chart's faint stars: the bright stars and lines.
int BrightPixels(const QImage& image, const QRect& area)
{
    int bright = 0;
    const QRect inside = area & image.rect();
    for (int y = inside.top(); y <= inside.bottom(); y++) {
        for (int x = inside.left(); x <= inside.right(); x++)
            bright += qGray(image.pixel(x, y)) > 100;
    }
    return bright;
}

// The share of the picture's pixels that the output shows alike at `at`.
double ShownAlike(const QImage& shot, QPoint at, const QImage& picture)
{
    const QImage own = picture.convertToFormat(QImage::Format_RGB32);
    int alike = 0;
    for (int y = 0; y < own.height(); y++) {
        for (int x = 0; x < own.width(); x++) {
            const QPoint there = at + QPoint(x, y);
            if (!shot.rect().contains(there))
                continue;
            const QRgb a = own.pixel(x, y), b = shot.pixel(there);
            alike += std::abs(qRed(a) - qRed(b)) <= 8 && std::abs(qGreen(a) - qGreen(b)) <= 8
                && std::abs(qBlue(a) - qBlue(b)) <= 8;
        }
    }
    return own.isNull() ? 0 : double(alike) / double(own.width() * own.height());
}

// The pixels of area that differ between two shots.
int Changed(const QImage& before, const QImage& after, const QRect& area)
{
    int changed = 0;
    for (int y = area.top(); y <= area.bottom(); y++) {
        for (int x = area.left(); x <= area.right(); x++)
            changed += before.pixel(x, y) != after.pixel(x, y);
    }
    return changed;
}

// The control window's fixed size.
const QSize kControlsSize(320, 45);

class Wayland : public ::testing::Test {
protected:
    void SetUp() override
    {
        if (qEnvironmentVariableIsEmpty("WAYLAND_DISPLAY"))
            GTEST_SKIP() << "needs a Wayland compositor: run under tests/wayland/with-weston";
        ASSERT_TRUE(fDir.isValid());
        QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
        environment.insert("QT_QPA_PLATFORM", "wayland");
        environment.remove("DISPLAY");
        fProgram.setProcessEnvironment(environment);
        fProgram.setWorkingDirectory(fDir.path());
    }

    void TearDown() override
    {
        if (fProgram.state() != QProcess::NotRunning) {
            fProgram.kill();
            fProgram.waitForFinished(5000);
        }
    }

    // Waits until the compositor shows the program's window titled title (in front of the
    // program's others, at least as large as atLeast), and returns it.
    ShownWindow WaitForWindow(const QString& title, bool inFront = false, QSize atLeast = QSize())
    {
        ShownWindow found;
        (void)QTest::qWaitFor(
            [&] {
                for (const ShownWindow& window : WindowsOf(fProgram.processId())) {
                    if (window.title == title && !window.inside.isEmpty()
                        && window.inside.width() >= atLeast.width()
                        && window.inside.height() >= atLeast.height()) {
                        found = window;
                        return true;
                    }
                    if (inFront)
                        return false;
                }
                return false;
            },
            20000);
        return found;
    }

    // Waits until the chart shown inside `chart` draws stars and returns its view's rectangle
    // (the window less its 12-pixel read-out strip) on the output; empty if it never does.
    QRect WaitForSky(const ShownWindow& chart)
    {
        const QRect view = chart.inside.adjusted(0, 0, 0, -12);
        const bool drawn = QTest::qWaitFor(
            [&] { return BrightPixels(Screenshot(fDir.path()), view) >= 40; }, 20000);
        return drawn ? view : QRect();
    }

    // The line the test build writes in answer to command.
    QString Ask(const char* command)
    {
        fProgram.write(command);
        fProgram.write("\n");
        if (!QTest::qWaitFor([&] { return fProgram.canReadLine(); }, 20000))
            return {};
        return QString::fromUtf8(fProgram.readLine()).trimmed();
    }

    QTemporaryDir fDir;
    QProcess fProgram;
};

TEST_F(Wayland, TheProgramShowsItsWindowsDrawsTheSkyAndTurnsIt)
{
    fProgram.setProgram(ND_PROGRAM);
    fProgram.start();
    ASSERT_TRUE(fProgram.waitForStarted(10000));
    // The control window, once the catalogue's reading (under the same title, narrower) is
    // over.
    const ShownWindow controls = WaitForWindow("3D Nightdome", false, kControlsSize);
    EXPECT_EQ(controls.inside.size(), kControlsSize) << "the control window never showed";
    const ShownWindow chart = WaitForWindow("Nightdome");
    ASSERT_FALSE(chart.inside.isEmpty()) << "the chart never showed";
    const QRect view = WaitForSky(chart);
    ASSERT_FALSE(view.isEmpty()) << "the chart shows no stars";
    // The chart starts turning: its stars move from one frame to the next.
    const QImage first = Screenshot(fDir.path());
    EXPECT_TRUE(QTest::qWaitFor(
        [&] { return Changed(first, Screenshot(fDir.path()), view) >= 100; }, 10000))
        << "the chart does not turn";
    EXPECT_EQ(fProgram.state(), QProcess::Running);
    const QByteArray errors = fProgram.readAllStandardError();
    EXPECT_TRUE(errors.isEmpty()) << errors.constData();
}

TEST_F(Wayland, EveryWindowOpensAndDrawsAndClosingTheControlsEndsTheProgram)
{
    fProgram.setProgram(ND_WAYLAND_APP);
    fProgram.start();
    ASSERT_TRUE(fProgram.waitForStarted(10000));
    ASSERT_FALSE(WaitForWindow("3D Nightdome", false, kControlsSize).inside.isEmpty());
    ASSERT_FALSE(WaitForSky(WaitForWindow("Nightdome")).isEmpty());

    // Each window the control window opens (its buttons, and F1 for the help) comes to the
    // front, where the compositor shows all of it: what it shows there is what the window drew.
    const char* const commands[] = { "open 0", "open 1", "open 2", "open 3", "open 4", "help" };
    const char* const titles[]
        = { "Nightdome", "Star Info", "H-R Diagram", "Find Star", "Star List", "Nightdome Help" };
    for (int n = 0; n < 6; n++) {
        const QString title = titles[n];
        ASSERT_EQ(Ask(commands[n]), "opened " + title);
        const ShownWindow window = WaitForWindow(title, true);
        ASSERT_FALSE(window.inside.isEmpty()) << title.toStdString() << " is not in front";
        if (title == "Nightdome") {
            EXPECT_FALSE(WaitForSky(window).isEmpty()) << "the new chart shows no stars";
            continue;
        }
        const QImage own(fDir.filePath(title + ".png"));
        EXPECT_EQ(own.size(), window.inside.size()) << title.toStdString();
        double alike = 0;
        EXPECT_TRUE(QTest::qWaitFor(
            [&] {
                alike = ShownAlike(Screenshot(fDir.path()), window.inside.topLeft(), own);
                return alike >= 0.95;
            },
            10000))
            << title.toStdString() << ": " << alike * 100 << "% of it shown as drawn";
    }
    QStringList shown;
    for (const ShownWindow& window : WindowsOf(fProgram.processId()))
        shown << window.title;
    EXPECT_EQ(shown.size(), 8) << shown.join(", ").toStdString();

    // A chart maximised by the compositor fills the output (less weston's panel and the frame
    // Qt draws) and goes on drawing.
    ASSERT_EQ(Ask("maximize"), "maximized");
    const ShownWindow zoomed = WaitForWindow("Nightdome", false, QSize(1900, 1000));
    EXPECT_FALSE(zoomed.inside.isEmpty()) << "the chart was not maximised";
    EXPECT_FALSE(WaitForSky(zoomed).isEmpty()) << "the maximised chart shows no stars";

    fProgram.write("close\n");
    ASSERT_TRUE(fProgram.waitForFinished(20000)) << "closing the controls did not end it";
    EXPECT_EQ(fProgram.exitStatus(), QProcess::NormalExit);
    EXPECT_EQ(fProgram.exitCode(), 0);
    const QByteArray errors = fProgram.readAllStandardError();
    EXPECT_TRUE(errors.isEmpty()) << errors.constData();
}

} // namespace
