// The mouse's comings and goings over a view as one hook: MouseMoved(where, transit), where is
// in view coordinates. Enter, move (with mouse tracking on) and leave events all arrive there.
#pragma once

#include <QEnterEvent>
#include <QMouseEvent>
#include <QPoint>
#include <QWidget>

enum Transit : uint32_t {
    B_ENTERED_VIEW = 0,
    B_INSIDE_VIEW = 1,
    B_EXITED_VIEW = 2,
    B_OUTSIDE_VIEW = 3,
};

template <class Base> class TransitView : public Base {
public:
    template <typename... Args>
    explicit TransitView(Args&&... args)
        : Base(std::forward<Args>(args)...)
    {
        Base::setMouseTracking(true);
    }

protected:
    // Called for every transit; the default does nothing.
    virtual void MouseMoved(QPoint, Transit) { }
    // Whether the base class still sees the enter, move and leave events (controls keep their
    // own hover behaviour; a view that handles everything itself says no).
    virtual bool PassesTransitsOn() const { return true; }

    void enterEvent(QEnterEvent* event) override
    {
        if (PassesTransitsOn())
            Base::enterEvent(event);
        MouseMoved(event->position().toPoint(), B_ENTERED_VIEW);
    }
    void mouseMoveEvent(QMouseEvent* event) override
    {
        if (PassesTransitsOn())
            Base::mouseMoveEvent(event);
        const QPoint where = event->position().toPoint();
        MouseMoved(where, Base::rect().contains(where) ? B_INSIDE_VIEW : B_OUTSIDE_VIEW);
    }
    void leaveEvent(QEvent* event) override
    {
        if (PassesTransitsOn())
            Base::leaveEvent(event);
        MouseMoved(Base::mapFromGlobal(QCursor::pos()), B_EXITED_VIEW);
    }
};
