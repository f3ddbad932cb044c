// A button drawn from three pictures: normal, with the mouse over it, pressed.
#pragma once

#include "widgets/BitmapControl.h"

#include <QTimer>

class IPictureButton : public BitmapControl {
public:
    // The three frames come from resource 'IPCL' number resourceId, back to back.
    IPictureButton(BRect frame, const char* name, const char* label, int32_t resourceId,
        Message* message, QWidget* parent = nullptr);

    const RBitmap8* NormalImage() const { return Frame(0); }
    const RBitmap8* OverImage() const { return Frame(1); }
    const RBitmap8* PressedImage() const { return Frame(2); }

protected:
    void MouseMoved(QPoint where, Transit transit) override;
    void mousePressEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;

private:
    // While the button is held: pressed when the pointer is over it, over otherwise.
    void SamplePointer();

    QTimer fHoldTimer; // 50 ms while a mouse button is held
};
