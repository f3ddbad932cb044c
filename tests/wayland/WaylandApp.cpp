// The program as the Wayland test runs it: the real application object and windows on the real
// sky, with a hand on the control window that the test steers through standard input, since a
// compositor with no input devices gives no other way in.
//
// Lines it reads: "open <n>" clicks the n-th button of the control window (0 a new chart, 1 the
// star information, 2 the H-R diagram, 3 the find window, 4 a star list); "close" closes the
// control window with QWindow::close(), the call Qt's Wayland platform makes when the compositor
// sends xdg_toplevel.close; "maximize" maximises a chart; "help" opens the help window (F1).
// Lines it writes: "opened <title>" once the window a click opened is shown by the compositor
// and its own picture is saved as <title>.png in the working folder; "not opened" when none
// came within ten seconds; "maximized" or "not maximized".
#include "app/ThreeDNightdomeApp.h"
#include "controls/ControlWindow.h"

#include <QApplication>
#include <QShortcut>
#include <QSocketNotifier>
#include <QTest>
#include <QWidget>
#include <QWindow>
#include <cstdio>
#include <functional>
#include <iterator>
#include <unistd.h>

namespace {

// The buttons of the control window, in the order "open <n>" counts them.
constexpr const char* kButtonNames[] = { "New Nightdome Button", "Show Info Window Button",
    "Show H-R Window Button", "Show Find Window Button", "New List Window Button" };

// The top-level windows the compositor shows.
QList<QWidget*> ExposedWindows()
{
    QList<QWidget*> shown;
    for (QWidget* widget : QApplication::topLevelWidgets()) {
        if (widget->isVisible() && widget->windowHandle() && widget->windowHandle()->isExposed())
            shown.append(widget);
    }
    return shown;
}

void Say(const QString& line)
{
    std::fprintf(stdout, "%s\n", line.toUtf8().constData());
    std::fflush(stdout);
}

// Clicks button n, the way a pointer does.
void Click(ControlWindow* controls, int n)
{
    if (n >= 0 && n < int(std::size(kButtonNames))) {
        if (QWidget* button = controls->findChild<QWidget*>(kButtonNames[n]))
            QTest::mouseClick(button, Qt::LeftButton, Qt::NoModifier, QPoint(16, 16));
    }
}

// Presses F1 as far as the program can tell: a compositor without a keyboard gives no window
// the focus that key events need, so the shortcut is set off directly.
void PressF1(ControlWindow* controls)
{
    for (QShortcut* shortcut : controls->findChildren<QShortcut*>()) {
        if (shortcut->key() == QKeySequence(Qt::Key_F1))
            emit shortcut->activated();
    }
}

// Asks the compositor to maximise a chart (the zoom button of its frame does the same), which
// also asks for the control window to come to the front, and reports when it is maximised.
void Maximize()
{
    QWidget* chart = nullptr;
    for (QWidget* widget : ExposedWindows()) {
        if (widget->windowTitle() == "Nightdome")
            chart = widget;
    }
    if (!chart) {
        Say("not maximized");
        return;
    }
    chart->showMaximized();
    Say(QTest::qWaitFor([chart] { return chart->isMaximized(); }, 10000) ? "maximized"
                                                                         : "not maximized");
}

// Does what opens a window and reports the window it opened.
void Open(const std::function<void()>& action)
{
    const QList<QWidget*> before = QApplication::topLevelWidgets();
    action();
    QWidget* opened = nullptr;
    const bool shown = QTest::qWaitFor(
        [&] {
            for (QWidget* widget : ExposedWindows()) {
                if (!before.contains(widget))
                    opened = widget;
            }
            return opened != nullptr;
        },
        10000);
    if (!shown) {
        Say("not opened");
        return;
    }
    opened->grab().toImage().save(opened->windowTitle() + ".png");
    Say("opened " + opened->windowTitle());
}

} // namespace

int main(int argc, char** argv)
{
    StartOptions options;
    options.catalogue = ND_SKY_FILE;
    auto* application = new ThreeDNightdomeApp(argc, argv, options);
    ControlWindow* controls = application->GetControlWindow();

    QSocketNotifier commands(STDIN_FILENO, QSocketNotifier::Read);
    QObject::connect(&commands, &QSocketNotifier::activated, [&] {
        char line[64];
        const ssize_t length = read(STDIN_FILENO, line, sizeof line - 1);
        if (length <= 0) {
            commands.setEnabled(false);
            return;
        }
        line[length] = '\0';
        int n = -1;
        if (std::sscanf(line, "open %d", &n) == 1)
            Open([&] { Click(controls, n); });
        else if (QByteArray(line).startsWith("maximize"))
            Maximize();
        else if (QByteArray(line).startsWith("help"))
            Open([&] { PressF1(controls); });
        else if (QByteArray(line).startsWith("close") && controls)
            controls->windowHandle()->close();
    });

    const int status = application->Run();
    delete application;
    return status;
}
