// What a widget shows now, read from what its window last put on the screen (on the headless
// platform, the window's backing store) rather than by painting it again as grab() does: so a
// paint that drew nothing shows as such.
#pragma once

#include <QGuiApplication>
#include <QImage>
#include <QScreen>
#include <QWidget>

inline QImage ShownPixels(const QWidget* widget)
{
    const QWidget* window = widget->window();
    const QPoint at = widget->mapTo(window, QPoint(0, 0));
    QScreen* screen = window->screen() ? window->screen() : QGuiApplication::primaryScreen();
    return screen->grabWindow(window->winId(), at.x(), at.y(), widget->width(), widget->height())
        .toImage()
        .convertToFormat(QImage::Format_RGB32);
}
