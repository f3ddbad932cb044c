// The application object: the process-wide spectral colour tables, the program's images, and
// the control window, which opens everything else.
#pragma once

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

class ThreeDNightdomeApp : public QObject, public BHandler {
public:
    // Makes the QApplication from argc and argv unless one exists (tests make their own), builds
    // the spectral tables and opens the control window at (90, 60), titled "3D Nightdome".
    ThreeDNightdomeApp(int& argc, char** argv);
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
    QPointer<ControlWindow> fControlWindow;
};
