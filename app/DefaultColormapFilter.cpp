// Windows onto the default colormap: asking the X server what a window was made with, and
// changing its colormap before Qt maps it.
#include "app/DefaultColormapFilter.h"

#include <QGuiApplication>
#include <QPlatformSurfaceEvent>
#include <QWindow>
#include <cstdlib>
#include <memory>
#include <xcb/xcb.h>

namespace {

// xcb's replies are malloc'ed and the caller's to free.
struct FreeReply {
    void operator()(void* reply) const { std::free(reply); }
};
template <typename T> using Reply = std::unique_ptr<T, FreeReply>;

} // namespace

DefaultColormapFilter::DefaultColormapFilter(QObject* parent)
    : QObject(parent)
{
}

bool DefaultColormapFilter::UseDefaultColormap(QWindow* window)
{
    // Only Qt's xcb platform has windows of the X server; the offscreen one answers to the X11
    // interface too, without a connection.
    if (!window || !window->handle() || QGuiApplication::platformName() != "xcb")
        return false;
    auto* x11 = qGuiApp->nativeInterface<QNativeInterface::QX11Application>();
    xcb_connection_t* connection = x11 ? x11->connection() : nullptr;
    if (!connection)
        return false;
    const auto id = xcb_window_t(window->winId());
    // Both questions go out before either answer is awaited: one round trip.
    const xcb_get_window_attributes_cookie_t attributesAsked
        = xcb_get_window_attributes(connection, id);
    const xcb_get_geometry_cookie_t geometryAsked = xcb_get_geometry(connection, id);
    const Reply<xcb_get_window_attributes_reply_t> attributes(
        xcb_get_window_attributes_reply(connection, attributesAsked, nullptr));
    const Reply<xcb_get_geometry_reply_t> geometry(
        xcb_get_geometry_reply(connection, geometryAsked, nullptr));
    if (!attributes || !geometry)
        return false;
    for (xcb_screen_iterator_t screens = xcb_setup_roots_iterator(xcb_get_setup(connection));
         screens.rem; xcb_screen_next(&screens)) {
        const xcb_screen_t* screen = screens.data;
        if (screen->root != geometry->root)
            continue;
        // The default colormap belongs to the root's visual; any other visual keeps its own.
        if (attributes->visual != screen->root_visual
            || attributes->colormap == screen->default_colormap)
            return false;
        // Requests on Qt's connection keep their order, so this lands before Qt maps the window.
        const uint32_t colormap = screen->default_colormap;
        xcb_change_window_attributes(connection, id, XCB_CW_COLORMAP, &colormap);
        return true;
    }
    return false;
}

bool DefaultColormapFilter::eventFilter(QObject* watched, QEvent* event)
{
    if (event->type() == QEvent::PlatformSurface && watched->isWindowType()
        && static_cast<QPlatformSurfaceEvent*>(event)->surfaceEventType()
            == QPlatformSurfaceEvent::SurfaceCreated)
        UseDefaultColormap(static_cast<QWindow*>(watched));
    return QObject::eventFilter(watched, event);
}
