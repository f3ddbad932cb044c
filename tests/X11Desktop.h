// The test's X server as a person's desktop: a window manager on it, where windows stand, asking a
// window to close as a title bar's close button does, and the screen as xwd dumps it. Window ids
// are X window ids. Everything here opens its own short connection to $DISPLAY; none of it needs
// the Qt application (Xlib stays out of this header: its macros clash with Qt's and GoogleTest's
// names).
#pragma once

#include <QImage>
#include <QProcess>
#include <QRect>

// openbox on the test's display, stopped when this object goes.
class WindowManager {
public:
    ~WindowManager() { Stop(); }
    // Starts openbox and waits, at most timeoutMs, until it manages the screen and has finished
    // starting; false when it did not start or never took over.
    bool Start(int timeoutMs = 10000);
    // Ends openbox (its windows go back to the bare root) and waits for it to be gone.
    void Stop();

private:
    QProcess fProcess;
};

// Whether a window manager holds the screen: the ICCCM selection WM_S0 has an owner and the root
// window names the manager's supporting window (_NET_SUPPORTING_WM_CHECK).
bool WindowManagerRunning();

// Where window's inside (what the program draws, without a manager's frame) stands on the
// screen, in root coordinates; empty when there is no such window.
QRect ClientArea(unsigned long window);

// Where window stands on the screen with the frame a window manager has put around it (the
// client area grown by the window's _NET_FRAME_EXTENTS); the client area alone when it has none.
QRect FrameArea(unsigned long window);

// Sends WM_DELETE_WINDOW to window, as a window manager's close button does.
void AskToClose(unsigned long window);

// The whole screen as `xwd -root` dumps it (xwd reads windows on other colormaps or visuals one
// by one, as screenshot tools do), decoded to RGB; null when xwd fails or writes a format this
// does not read.
QImage XwdRootImage();

// Decodes an XWD dump of a TrueColor or DirectColor screen with 24 or 32 bits a pixel.
QImage DecodeXwd(const QByteArray& dump);
