// Bitmap-faced controls: their frames, and painting the one shown.
#include "widgets/BitmapControl.h"

#include "platform/qt/BitmapImage.h"
#include "widgets/WidgetGeometry.h"

#include <QPainter>
#include <cmath>

BitmapControl::BitmapControl(BRect frame, const char* name, uint32_t type, int32_t resourceId,
    int32_t frameCount, Message* message, QWidget* parent)
    : TransitView<QWidget>(parent)
    , Invoker(message)
{
    PlaceWidget(this, frame, name);
    const auto w = static_cast<int32_t>(std::trunc(frame.right - frame.left + 1));
    const auto h = static_cast<int32_t>(std::trunc(frame.bottom - frame.top + 1));
    for (int32_t i = 0; i < frameCount; i++) {
        // Exactly w bytes a row: the frames lie back to back in the resource, w x h each.
        auto image = std::make_unique<RBitmap8>(BRect(0, 0, float(w - 1), float(h - 1)), w);
        image->LoadFromResource(int32_t(type), resourceId, i * w * h, w * h);
        fFrames.push_back(std::move(image));
    }
    fShown = fFrames.front().get();
}

void BitmapControl::SetValue(int32_t value)
{
    if (fValue != value) {
        fValue = value;
        update();
    }
}

void BitmapControl::Show(const RBitmap8* image)
{
    if (fShown != image) {
        fShown = image;
        update();
    }
}

void BitmapControl::paintEvent(QPaintEvent*)
{
    QPainter painter(this);
    painter.drawImage(QPoint(0, 0), ImageOf(*const_cast<RBitmap8*>(fShown)));
}
