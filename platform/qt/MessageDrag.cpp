// Message drags with their render-bitmap pictures.
#include "platform/qt/MessageDrag.h"

#include "platform/qt/BitmapImage.h"
#include "render/RBitmap8.h"

#include <QCoreApplication>
#include <QDrag>
#include <QDropEvent>
#include <QGuiApplication>
#include <QPointer>
#include <QWidget>
#include <QWindow>

namespace {

// Qt shows a drag's picture in a small window of its own, a QShapedPixmapWindow. Where a
// compositing manager runs, that window's alpha channel makes index 255 see-through. Where none
// runs (a bare X server, or one under openbox, which does not composite) Qt does not count on
// the alpha channel: the window paints the palette's base colour, white, under the picture and
// is meant to be cut to the picture's outline. Qt 6.4 asks for that outline before the window
// exists, so it is lost and the picture shows on a white square. This filter cuts the window
// itself when it is shown (it exists by then and is not yet on the screen) and again whenever
// it is exposed; with a compositor the outline changes nothing.
class DragImageShaper : public QObject {
public:
    DragImageShaper(const RBitmap8& image, QDrag* drag)
        : QObject(drag)
        , fShape(OpaqueRegion(image))
    {
        if (QCoreApplication* application = QCoreApplication::instance())
            application->installEventFilter(this);
    }

    ~DragImageShaper() override
    {
        if (QCoreApplication* application = QCoreApplication::instance())
            application->removeEventFilter(this);
    }

protected:
    bool eventFilter(QObject* watched, QEvent* event) override
    {
        if ((event->type() == QEvent::Show || event->type() == QEvent::Expose)
            && watched->isWindowType() && watched->inherits("QShapedPixmapWindow")) {
            auto* window = static_cast<QWindow*>(watched);
            if (window->mask() != fShape)
                window->setMask(fShape);
        }
        return false;
    }

private:
    QRegion fShape; // the picture's opaque pixels, in its own (device-independent) pixels
};

// The view whose drag is running, for drops that Qt does not tell the source of (a drag handed
// to a starter). Drags run on the application's thread only, one at a time.
QPointer<const QWidget>& DragSource()
{
    static QPointer<const QWidget> source;
    return source;
}

// Notes source as the running drag's for as long as it lives.
class DragUnderWay {
public:
    explicit DragUnderWay(const QWidget* source)
        : fPrevious(DragSource())
    {
        DragSource() = source;
    }
    ~DragUnderWay() { DragSource() = fPrevious; }

private:
    QPointer<const QWidget> fPrevious;
};

} // namespace

MessageMimeData::MessageMimeData(const Message& message)
    : fMessage(message)
{
    // Announce the private type; the bytes are never read, the message travels as an object.
    setData(kMessageMimeType, QByteArray());
}

QDrag* MakeMessageDrag(QWidget* source, const Message& message, RBitmap8* image, BPoint hotSpot)
{
    return MakeMessageDrag(source, new MessageMimeData(message), image, hotSpot);
}

QDrag* MakeMessageDrag(QWidget* source, MessageMimeData* data, RBitmap8* image, BPoint hotSpot)
{
    auto* drag = new QDrag(source);
    drag->setMimeData(data);
    if (image) {
        drag->setPixmap(DragPixmap(*image));
        // Only X11 asks for the outline (Wayland composites always); the shaper is owned by the
        // drag and lives as long as it does.
        if (QGuiApplication::platformName() == "xcb")
            new DragImageShaper(*image, drag);
        drag->setHotSpot(QPoint(static_cast<int>(hotSpot.x), static_cast<int>(hotSpot.y)));
    }
    return drag;
}

Qt::DropAction DragMessage(QWidget* source, const Message& message, RBitmap8* image, BPoint hotSpot)
{
    return DragMessage(source, new MessageMimeData(message), image, hotSpot);
}

Qt::DropAction DragMessage(QWidget* source, MessageMimeData* data, RBitmap8* image, BPoint hotSpot)
{
    QDrag* drag = MakeMessageDrag(source, data, image, hotSpot);
    const DragUnderWay running(source);
    return drag->exec(Qt::CopyAction);
}

void StartMessageDrag(const DragStarter& starter, QWidget* source, const Message& message,
    RBitmap8* image, BPoint hotSpot)
{
    if (starter) {
        const DragUnderWay running(source);
        starter(message, image, hotSpot);
    } else
        DragMessage(source, message, image, hotSpot);
}

const Message* DraggedMessage(const QMimeData* data)
{
    const auto* ours = dynamic_cast<const MessageMimeData*>(data);
    return ours ? &ours->GetMessage() : nullptr;
}

void AcceptMessageDrag(QDragMoveEvent* event)
{
    if (DraggedMessage(event->mimeData()))
        event->acceptProposedAction();
}

bool TakeDroppedMessage(QDropEvent* event, QWidget* receiver, Message* message)
{
    const Message* dragged = DraggedMessage(event->mimeData());
    if (!dragged) {
        event->ignore();
        return false;
    }
    *message = *dragged;
    const QPoint screen = receiver->mapToGlobal(event->position().toPoint());
    message->SetDropped(BPoint(static_cast<float>(screen.x()), static_cast<float>(screen.y())));
    event->acceptProposedAction();
    return true;
}

bool DroppedOnItsSource(const QDropEvent* event, const QWidget* receiver)
{
    const QWidget* source = qobject_cast<const QWidget*>(event->source());
    if (!source)
        source = DragSource();
    return source && receiver && (source == receiver || receiver->isAncestorOf(source));
}
