// The application object's start and end.
#include "app/ThreeDNightdomeApp.h"

#include "app/StartUniverse.h"
#include "chart/UniverseWindow.h"
#include "widgets/InfoView.h"

#include "controls/ControlWindow.h"
#include "core/MessageCodes.h"
#include "render/SpectralTables.h"
#include "resources/ResourceData.h"

#include <QIcon>
#include <cstdio>

// The icons are compiled into this library, a static one, so the program must ask for them.
static void InitIconResources()
{
    Q_INIT_RESOURCE(nightdome_icons);
}

ThreeDNightdomeApp::ThreeDNightdomeApp(int& argc, char** argv, const StartOptions& options)
{
    if (!QCoreApplication::instance())
        fApplication = std::make_unique<QApplication>(argc, argv);
    // No display name: Qt would append it to every window's title, and the windows' own titles
    // ("Star List", "H-R Diagram") are what a window manager has room for.
    QGuiApplication::setApplicationName("Nightdome");
    QGuiApplication::setApplicationVersion(ProgramVersion());
    QGuiApplication::setDesktopFileName(kDesktopFileId);
    InitIconResources();
    QIcon icon;
    for (int size : { 16, 32, 48, 64, 128, 256 })
        icon.addFile(QString(":/nightdome-icons/nightdome-%1.png").arg(size), QSize(size, size));
    QGuiApplication::setWindowIcon(icon);
    // Only the control window ends the program (it asks for the quit when it closes). Qt would
    // also quit when the last chart closes: the control window is a tool window, which Qt does
    // not count among the windows that keep a program running.
    QGuiApplication::setQuitOnLastWindowClosed(false);
    // Before the first window exists, so that every window is on the screen's default colormap.
    QCoreApplication::instance()->installEventFilter(&fColormaps);
    QCoreApplication::instance()->installEventFilter(&fTrimmer);
    // The tables are written here, before any window or render thread exists, and only read
    // afterwards.
    gSpectralCTable = BuildSpectralTables();
    InitResources();
    UniverseWindow::SetRenderThreadCount(options.threads);
    const StartedUniverse started = StartUniverse(options);
    std::fputs(started.report.c_str(), stderr);
    fControlWindow = new ControlWindow(BPoint(90, 60), "3D Nightdome", this, started.universe);
    if (!started.helpLine.empty())
        fControlWindow->GetInfoView()->setText(QString::fromStdString(started.helpLine));
}

ThreeDNightdomeApp::~ThreeDNightdomeApp()
{
    delete fControlWindow.data();
    FreeSpectralTables(gSpectralCTable);
    gSpectralCTable = nullptr;
}

int ThreeDNightdomeApp::Run()
{
    return QCoreApplication::exec();
}

void ThreeDNightdomeApp::MessageReceived(Message* message)
{
    if (message->what == B_QUIT_REQUESTED)
        QCoreApplication::quit();
}
