// The common part of the mouse-drag controls: three 32 x 32 pictures (idle, pointer over it,
// button held), the control's own cursor, context help, and the drag loop that turns pointer
// movement into Calculate(dx, dy) calls while a button is held.
#pragma once

#include "platform/BRect.h"
#include "platform/qt/TransitView.h"
#include "render/RBitmap8.h"
#include "widgets/IBroadcaster.h"

#include <QPoint>
#include <QTimer>
#include <QWidget>
#include <memory>

class MouseControl : public TransitView<QWidget>, public IBroadcaster {
public:
    // frame is in the parent's inclusive pixel coordinates. The pictures are read from resource
    // 'McPc' number resourceID: normal, hover and pressed, 1024 bytes each, back to back.
    // cursor is shown while the pointer is over the control.
    MouseControl(BRect frame, const char* name, int32_t resourceID, Qt::CursorShape cursor,
        QWidget* parent = nullptr);
    ~MouseControl() override;

    // Turns one sample of the drag into a change of the linked values. dx and dy are the previous
    // pointer position minus the current one, in pixels: dragging right or down gives negative
    // values. Does nothing here.
    virtual void Calculate(double dx, double dy);

    const RBitmap8* NormalImage() const { return normalImage.get(); }
    const RBitmap8* HoverImage() const { return hoverImage.get(); }
    const RBitmap8* PressedImage() const { return pressedImage.get(); }
    // The picture shown now and the cursor set now; for tests and for anyone who wants to know
    // the control's state without reading pixels.
    const RBitmap8* ShownImage() const { return shown; }
    Qt::CursorShape CursorShape() const { return QWidget::cursor().shape(); }
    Qt::CursorShape OwnCursor() const { return ownCursor; }
    // Whether a drag is under way (a button went down on the control and is still held).
    bool Dragging() const { return dragTimer.isActive(); }

    // The interval between two samples of a drag, in milliseconds.
    static constexpr int kSampleInterval = 50;

protected:
    void MouseMoved(QPoint where, Transit transit) override;
    void mousePressEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;
    void hideEvent(QHideEvent* event) override;
    void paintEvent(QPaintEvent* event) override;

private:
    void Show(RBitmap8* image);
    // One step of the drag: Calculate with the movement since the last sample.
    void SamplePointer();
    // Ends the drag; the pictures and cursor then follow where the pointer is.
    void EndDrag(bool inside);

    std::unique_ptr<RBitmap8> normalImage; // owned
    std::unique_ptr<RBitmap8> hoverImage; // owned
    std::unique_ptr<RBitmap8> pressedImage; // owned
    Qt::CursorShape ownCursor;
    RBitmap8* shown = nullptr; // one of the three; not owned
    QTimer dragTimer; // runs every kSampleInterval ms while a button is held
    QPoint previous; // the pointer at the last sample, in control coordinates
};
