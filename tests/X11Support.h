// Driving real windows under Xvfb for tests: xdotool run without blocking the event loop, and a
// view that records the messages dropped on it.
#pragma once

#include "platform/qt/MessageDrag.h"
#include "platform/qt/Messaging.h"

#include <QDragEnterEvent>
#include <QDropEvent>
#include <QGuiApplication>
#include <QProcess>
#include <QScreen>
#include <QStringList>
#include <QWidget>
#include <cmath>
#include <gtest/gtest.h>
#include <optional>

// Takes message drops and keeps the last one.
class DropTarget : public QWidget, public BHandler {
public:
    explicit DropTarget(QWidget* parent)
        : QWidget(parent)
    {
        setAcceptDrops(true);
    }
    void MessageReceived(Message* message) override { received = *message; }

    std::optional<Message> received;

protected:
    void dragEnterEvent(QDragEnterEvent* event) override
    {
        if (DraggedMessage(event->mimeData()))
            event->acceptProposedAction();
    }
    void dragMoveEvent(QDragMoveEvent* event) override
    {
        if (DraggedMessage(event->mimeData()))
            event->acceptProposedAction();
    }
    void dropEvent(QDropEvent* event) override
    {
        Message message;
        if (TakeDroppedMessage(event, this, &message))
            MessageReceived(&message);
    }
};

// xdotool's arguments with each pointer position (the two numbers after "mousemove") taken from
// this process's pixels to the screen's: they differ at a scale factor (QT_SCALE_FACTOR), and
// positions worked out from widgets are in this process's pixels. The top-left pixel of the
// screen's that show a pixel of this process's is taken.
inline QStringList InScreenPixels(QStringList arguments)
{
    const QScreen* screen = qGuiApp ? QGuiApplication::primaryScreen() : nullptr;
    const double scale = screen ? screen->devicePixelRatio() : 1.0;
    if (scale == 1.0)
        return arguments;
    for (qsizetype i = 0; i + 2 < arguments.size(); i++) {
        if (arguments[i] != "mousemove")
            continue;
        bool isX = false, isY = false;
        const double x = arguments[i + 1].toDouble(&isX), y = arguments[i + 2].toDouble(&isY);
        if (isX && isY) {
            arguments[i + 1] = QString::number(int(std::floor(x * scale)));
            arguments[i + 2] = QString::number(int(std::floor(y * scale)));
        }
    }
    return arguments;
}

// Runs xdotool with the given commands without blocking the event loop: a drag runs a nested
// loop of its own while the pointer moves. Pointer positions are in this process's pixels.
class Xdotool {
public:
    void Run(const QStringList& arguments)
    {
        fProcess.start("xdotool", InScreenPixels(arguments));
        ASSERT_TRUE(fProcess.waitForStarted(5000)) << "xdotool is not installed";
    }
    bool Finished() const { return fProcess.state() == QProcess::NotRunning; }

private:
    QProcess fProcess;
};

inline QString Number(int n)
{
    return QString::number(n);
}

// xdotool commands for a drag as a hand makes it: to `from`, press, ten steps to `to`, release.
inline QStringList DragSteps(QPoint from, QPoint to)
{
    QStringList steps { "mousemove", Number(from.x()), Number(from.y()), "sleep", "0.3",
        "mousedown", "1", "sleep", "0.3" };
    for (int i = 1; i <= 10; i++) {
        const QPoint p = from + (to - from) * i / 10;
        steps << "mousemove" << Number(p.x()) << Number(p.y()) << "sleep"
              << "0.05";
    }
    steps << "sleep"
          << "0.3"
          << "mouseup"
          << "1";
    return steps;
}

// A click where the pointer is now.
inline QStringList ClickAt(QPoint where)
{
    return { "mousemove", Number(where.x()), Number(where.y()), "sleep", "0.2", "click", "1" };
}
