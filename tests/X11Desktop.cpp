// The desktop helpers of the window tests: openbox, window places, closing, and xwd dumps.
#include "X11Desktop.h"

#include <QTest>
#include <X11/Xatom.h>
#include <X11/Xlib.h>
#include <bit>
#include <cstdint>

namespace {

// A connection of its own for one question; X errors (a window that has gone) are noted instead
// of ending the program, as Xlib's default handler would.
class Connection {
public:
    Connection()
        : fDisplay(XOpenDisplay(nullptr))
    {
        sFailed = false;
        fOldHandler = XSetErrorHandler([](Display*, XErrorEvent*) {
            sFailed = true;
            return 0;
        });
    }
    ~Connection()
    {
        if (fDisplay) {
            XSync(fDisplay, False);
            XCloseDisplay(fDisplay);
        }
        XSetErrorHandler(fOldHandler);
    }
    Display* display() const { return fDisplay; }
    // Whether a request so far failed; waits for the server's answers first.
    bool Failed() const
    {
        XSync(fDisplay, False);
        return sFailed;
    }

private:
    Display* fDisplay;
    XErrorHandler fOldHandler;
    static inline bool sFailed = false;
};

uint32_t BigEndianWord(const QByteArray& bytes, qsizetype at)
{
    const auto* p = reinterpret_cast<const uint8_t*>(bytes.constData() + at);
    return uint32_t(p[0]) << 24 | uint32_t(p[1]) << 16 | uint32_t(p[2]) << 8 | uint32_t(p[3]);
}

// The 8-bit channel that mask selects in pixel.
int Channel(uint32_t pixel, uint32_t mask)
{
    if (mask == 0)
        return 0;
    const uint32_t value = (pixel & mask) >> std::countr_zero(mask);
    const uint32_t top = mask >> std::countr_zero(mask);
    return int(value * 255 / top);
}

} // namespace

bool WindowManager::Start(int timeoutMs)
{
    // openbox takes the screen early in its start-up, and a window mapped before the end of it
    // can be left unmanaged, never shown: so it is asked to say when it is done.
    fProcess.setStandardErrorFile(QProcess::nullDevice()); // it complains of a missing menu
    fProcess.start("openbox", { "--sm-disable", "--startup", "echo started" });
    if (!fProcess.waitForStarted(5000))
        return false;
    QByteArray said;
    return QTest::qWaitFor(
        [&] {
            said += fProcess.readAllStandardOutput();
            return said.contains("started") && WindowManagerRunning();
        },
        timeoutMs);
}

void WindowManager::Stop()
{
    if (fProcess.state() == QProcess::NotRunning)
        return;
    fProcess.terminate();
    if (!fProcess.waitForFinished(5000)) {
        fProcess.kill();
        fProcess.waitForFinished(5000);
    }
}

bool WindowManagerRunning()
{
    Connection connection;
    Display* display = connection.display();
    if (!display)
        return false;
    if (XGetSelectionOwner(display, XInternAtom(display, "WM_S0", False)) == None)
        return false;
    Atom type = None;
    int format = 0;
    unsigned long count = 0, left = 0;
    unsigned char* data = nullptr;
    XGetWindowProperty(display, DefaultRootWindow(display),
        XInternAtom(display, "_NET_SUPPORTING_WM_CHECK", False), 0, 1, False, XA_WINDOW, &type,
        &format, &count, &left, &data);
    const bool named = type == XA_WINDOW && count == 1;
    if (data)
        XFree(data);
    return named;
}

QRect ClientArea(unsigned long window)
{
    Connection connection;
    Display* display = connection.display();
    if (!display || window == 0)
        return {};
    XWindowAttributes attributes {};
    if (!XGetWindowAttributes(display, window, &attributes) || connection.Failed())
        return {};
    int x = 0, y = 0;
    Window child = None;
    XTranslateCoordinates(display, window, DefaultRootWindow(display), 0, 0, &x, &y, &child);
    if (connection.Failed())
        return {};
    return QRect(x, y, attributes.width, attributes.height);
}

QRect FrameArea(unsigned long window)
{
    const QRect client = ClientArea(window);
    Connection connection;
    Display* display = connection.display();
    if (!display || client.isEmpty())
        return client;
    Atom type = None;
    int format = 0;
    unsigned long count = 0, left = 0;
    unsigned char* data = nullptr;
    XGetWindowProperty(display, window, XInternAtom(display, "_NET_FRAME_EXTENTS", False), 0, 4,
        False, XA_CARDINAL, &type, &format, &count, &left, &data);
    QRect frame = client;
    if (type == XA_CARDINAL && format == 32 && count == 4 && !connection.Failed()) {
        // Left, right, top, bottom; Xlib hands 32-bit items over as longs.
        const auto* extents = reinterpret_cast<const long*>(data);
        frame
            = client.adjusted(-int(extents[0]), -int(extents[2]), int(extents[1]), int(extents[3]));
    }
    if (data)
        XFree(data);
    return frame;
}

void AskToClose(unsigned long window)
{
    Connection connection;
    Display* display = connection.display();
    if (!display)
        return;
    XEvent event {};
    event.xclient.type = ClientMessage;
    event.xclient.window = window;
    event.xclient.message_type = XInternAtom(display, "WM_PROTOCOLS", False);
    event.xclient.format = 32;
    event.xclient.data.l[0] = long(XInternAtom(display, "WM_DELETE_WINDOW", False));
    event.xclient.data.l[1] = CurrentTime;
    XSendEvent(display, window, False, NoEventMask, &event);
}

QImage XwdRootImage()
{
    QProcess xwd;
    xwd.start("xwd", { "-root", "-silent" });
    if (!xwd.waitForFinished(20000) || xwd.exitStatus() != QProcess::NormalExit
        || xwd.exitCode() != 0)
        return {};
    return DecodeXwd(xwd.readAllStandardOutput());
}

QImage DecodeXwd(const QByteArray& dump)
{
    // The header: 25 big-endian words, then the window's name up to headerSize, then ncolors
    // colour entries of 12 bytes, then the rows.
    if (dump.size() < 100)
        return {};
    auto word = [&](int field) { return BigEndianWord(dump, field * 4); };
    const uint32_t headerSize = word(0), width = word(4), height = word(5);
    const bool lsbFirst = word(7) == 0;
    const uint32_t bitsPerPixel = word(11), bytesPerLine = word(12), visualClass = word(13);
    const uint32_t red = word(14), green = word(15), blue = word(16), colours = word(19);
    // TrueColor or DirectColor only: the pixel holds its channels.
    if ((visualClass != 4 && visualClass != 5) || (bitsPerPixel != 24 && bitsPerPixel != 32))
        return {};
    const qsizetype start = qsizetype(headerSize) + qsizetype(colours) * 12;
    if (dump.size() < start + qsizetype(bytesPerLine) * height)
        return {};
    const int bytes = int(bitsPerPixel / 8);
    QImage image(int(width), int(height), QImage::Format_RGB32);
    for (uint32_t y = 0; y < height; y++) {
        const auto* row
            = reinterpret_cast<const uint8_t*>(dump.constData() + start + y * bytesPerLine);
        for (uint32_t x = 0; x < width; x++) {
            const uint8_t* p = row + x * uint32_t(bytes);
            uint32_t pixel = 0;
            for (int i = 0; i < bytes; i++)
                pixel |= uint32_t(p[lsbFirst ? i : bytes - 1 - i]) << (8 * i);
            image.setPixel(int(x), int(y),
                qRgb(Channel(pixel, red), Channel(pixel, green), Channel(pixel, blue)));
        }
    }
    return image;
}
