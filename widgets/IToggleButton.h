// A two-picture button that stays on or off, framed in red while the mouse is over it.
#pragma once

#include "widgets/BitmapControl.h"

class IToggleButton : public BitmapControl {
public:
    // The two frames, on then off, come from resource 'TGcL' number resourceId.
    IToggleButton(BRect frame, const char* name, const char* label, int32_t resourceId,
        Message* message, QWidget* parent = nullptr);

    const RBitmap8* OnImage() const { return Frame(0); }
    const RBitmap8* OffImage() const { return Frame(1); }
    bool HoverFrameShown() const { return fHover; }

    // 1 shows the on picture, anything else the off one.
    void SetValue(int32_t value) override;

protected:
    void MouseMoved(QPoint where, Transit transit) override;
    void mousePressEvent(QMouseEvent* event) override;
    void paintEvent(QPaintEvent* event) override;

private:
    bool fHover = false;
};
