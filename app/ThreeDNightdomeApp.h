// The application object: the process-wide spectral colour tables, the program's images, and
// the control window, which opens everything else.
#pragma once

#include "app/ClosedWindowTrimmer.h"
#include "app/CommandLine.h"
#include "app/DefaultColormapFilter.h"
#include "controls/ControlWindow.h"
#include "platform/qt/Messaging.h"

#include <QApplication>
#include <QObject>
#include <QPointer>
#include <memory>

struct ColorTable;

// Names the application to the desktop.
inline constexpr char kAppSignature[] = "application/x-quillmark-3dnightdome";
// The same name as desktop environments spell it: the desktop entry, the icons and the metainfo
// are installed under it (a MIME type's slash cannot stand in a file name, and software centres
// want a reversed domain name).
inline constexpr char kDesktopFileId[] = "org.quillmark.nightdome";

class ThreeDNightdomeApp : public QObject, public BHandler {
public:
    // Makes the QApplication from argc and argv unless one exists (tests make their own), builds
    // the spectral tables, makes the universe options ask for (reporting trouble on standard
    // error and on the help line) and opens the control window at (90, 60), "3D Nightdome".
    ThreeDNightdomeApp(int& argc, char** argv, const StartOptions& options = StartOptions());
    // Closes what is still open, then frees the spectral tables.
    ~ThreeDNightdomeApp() override;

    // Runs until the control window closes; returns the event loop's result.
    int Run();
    // B_QUIT_REQUESTED ends Run(); nothing else is handled here.
    void MessageReceived(Message* message) override;

    ControlWindow* GetControlWindow() const { return fControlWindow; }

private:
    std::unique_ptr<QApplication> fApplication; // owned when this object made it
    DefaultColormapFilter fColormaps; // watches every window the program creates
    ClosedWindowTrimmer fTrimmer; // watches every window close
    QPointer<ControlWindow> fControlWindow;
};
