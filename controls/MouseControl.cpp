// The mouse controls' pictures, hover behaviour and drag loop.
#include "controls/MouseControl.h"

#include "core/MessageCodes.h"
#include "platform/qt/BitmapImage.h"
#include "widgets/WidgetGeometry.h"

#include <QCursor>
#include <QMouseEvent>
#include <QPainter>

namespace {

constexpr int32_t kSide = 32; // pixels, both ways
constexpr int32_t kPictureBytes = kSide * kSide; // 8-bit pixels, no row padding

std::unique_ptr<RBitmap8> LoadPicture(int32_t resourceID, int32_t index)
{
    auto picture
        = std::make_unique<RBitmap8>(BRect(0, 0, float(kSide - 1), float(kSide - 1)), kSide);
    picture->LoadFromResource(
        int32_t(kMouseControlType), resourceID, index * kPictureBytes, kPictureBytes);
    return picture;
}

} // namespace

MouseControl::MouseControl(
    BRect frame, const char* name, int32_t resourceID, Qt::CursorShape cursor, QWidget* parent)
    : TransitView<QWidget>(parent)
    , normalImage(LoadPicture(resourceID, 0))
    , hoverImage(LoadPicture(resourceID, 1))
    , pressedImage(LoadPicture(resourceID, 2))
    , ownCursor(cursor)
    , shown(normalImage.get())
{
    PlaceWidget(this, frame, name);
    // Until the pointer first comes over the control it looks as it does after leaving.
    setCursor(Qt::PointingHandCursor);
    dragTimer.setInterval(kSampleInterval);
    connect(&dragTimer, &QTimer::timeout, this, [this] { SamplePointer(); });
}

MouseControl::~MouseControl() = default;

void MouseControl::Calculate(double, double)
{
}

void MouseControl::MouseMoved(QPoint, Transit transit)
{
    if (transit == B_ENTERED_VIEW) {
        setCursor(ownCursor);
        if (!Dragging())
            Show(hoverImage.get());
    } else if (transit == B_EXITED_VIEW) {
        setCursor(Qt::PointingHandCursor);
        // While held the control keeps looking pressed; the release decides what follows.
        if (!Dragging())
            Show(normalImage.get());
    }
    IBroadcastOnTransit(transit);
}

void MouseControl::mousePressEvent(QMouseEvent* event)
{
    if (Dragging())
        return; // another button while one is held: the drag under way goes on
    Show(pressedImage.get());
    previous = event->position().toPoint();
    // The first sample is taken at once: whatever the pointer did between the press and now.
    SamplePointer();
    dragTimer.start();
}

void MouseControl::SamplePointer()
{
    const QPoint current = mapFromGlobal(QCursor::pos());
    Calculate(double(previous.x() - current.x()), double(previous.y() - current.y()));
    previous = current;
}

void MouseControl::mouseReleaseEvent(QMouseEvent* event)
{
    // The drag lasts while any button is held.
    if (!Dragging() || event->buttons() != Qt::NoButton)
        return;
    EndDrag(rect().contains(event->position().toPoint()));
}

void MouseControl::hideEvent(QHideEvent* event)
{
    // A hidden control gets no release; its drag ends here.
    if (Dragging())
        EndDrag(false);
    TransitView<QWidget>::hideEvent(event);
}

void MouseControl::EndDrag(bool inside)
{
    dragTimer.stop();
    if (inside) {
        setCursor(ownCursor);
        Show(hoverImage.get());
    } else {
        setCursor(Qt::PointingHandCursor);
        Show(normalImage.get());
    }
}

void MouseControl::Show(RBitmap8* image)
{
    if (shown != image) {
        shown = image;
        update();
    }
}

void MouseControl::paintEvent(QPaintEvent*)
{
    QPainter painter(this);
    painter.drawImage(QPoint(0, 0), ImageOf(*shown));
}
