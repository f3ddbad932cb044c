// The common part of the picture and toggle buttons: a control of fixed size that shows one of
// its render bitmaps (owned) and sends its message when used.
#pragma once

#include "platform/BRect.h"
#include "platform/qt/TransitView.h"
#include "render/RBitmap8.h"
#include "widgets/IBroadcaster.h"
#include "widgets/Invoker.h"

#include <QWidget>
#include <memory>
#include <vector>

class BitmapControl : public TransitView<QWidget>, public IBroadcaster, public Invoker {
public:
    int32_t Value() const { return fValue; }
    virtual void SetValue(int32_t value);

    // The frame shown now; for tests and for anyone who wants to know what the button looks
    // like without reading pixels.
    const RBitmap8* ShownImage() const { return fShown; }

protected:
    // Makes frameCount bitmaps of the frame's size and fills them, back to back, from resource
    // (type, resourceId).
    BitmapControl(BRect frame, const char* name, uint32_t type, int32_t resourceId,
        int32_t frameCount, Message* message, QWidget* parent);

    RBitmap8* Frame(int32_t index) const { return fFrames[index].get(); }
    // Shows image (one of the frames) from now on.
    void Show(const RBitmap8* image);

    void paintEvent(QPaintEvent* event) override;

private:
    std::vector<std::unique_ptr<RBitmap8>> fFrames;
    const RBitmap8* fShown = nullptr;
    int32_t fValue = 0;
};
