#include "platform/qt/RecordingHandler.h"

#include "core/MessageCodes.h"
#include "platform/qt/BitmapImage.h"
#include "platform/qt/MessageDrag.h"
#include "render/RBitmap8.h"

#include <QDrag>
#include <QDropEvent>
#include <QGuiApplication>
#include <QMimeData>
#include <QMouseEvent>
#include <QTimer>
#include <QWindow>
#include <gtest/gtest.h>

TEST(MessageDrag, ADragCarriesTheMessageAndItsPicture)
{
    QWidget source;
    RBitmap8 image(BRect(0, 0, 31, 31));
    image.EraseMap(255);
    image.RenderSquare(11, 11, 10, 63);
    int mask = 0;
    Message message(kStarArrayMessage);
    message.AddPointer(kSystemArrayPtrString, &mask);
    message.AddInt32(kSystemIndexString, 17);

    QDrag* drag = MakeMessageDrag(&source, message, &image, BPoint(15, 16));
    const Message* carried = DraggedMessage(drag->mimeData());
    ASSERT_NE(carried, nullptr);
    EXPECT_EQ(carried->what, kStarArrayMessage);
    EXPECT_EQ(carried->FindPointer(kSystemArrayPtrString), &mask);
    EXPECT_EQ(carried->FindInt32(kSystemIndexString), 17);
    EXPECT_TRUE(drag->mimeData()->hasFormat(kMessageMimeType));
    EXPECT_EQ(drag->hotSpot(), QPoint(15, 16));

    const QImage picture = drag->pixmap().toImage().convertToFormat(QImage::Format_ARGB32);
    ASSERT_EQ(picture.size(), QSize(32, 32));
    EXPECT_EQ(qAlpha(picture.pixel(0, 0)), 0); // index 255 is transparent
    EXPECT_EQ(picture.pixel(15, 15), qRgba(255, 255, 255, 255));
    EXPECT_EQ(qAlpha(picture.pixel(10, 15)), 0);
    delete drag;
}

TEST(MessageDrag, APictureIsCutToItsOpaquePixels)
{
    RBitmap8 image(BRect(0, 0, 31, 31));
    image.EraseMap(255);
    image.RenderSquare(11, 11, 10, 63);
    image.RenderPoint(30, 2, 0); // index 0 (black) is opaque like any other colour but 255
    image.RenderPoint(31, 31, 254);
    const QRegion outline = OpaqueRegion(image);
    QRegion expected(11, 11, 10, 10);
    expected += QRect(30, 2, 1, 1);
    expected += QRect(31, 31, 1, 1);
    EXPECT_EQ(outline, expected);

    image.EraseMap(255);
    EXPECT_TRUE(OpaqueRegion(image).isEmpty());
    image.EraseMap(7);
    EXPECT_EQ(OpaqueRegion(image), QRegion(0, 0, 32, 32));
}

TEST(MessageDrag, ADropGivesBackTheMessageMarkedDroppedWhereItWasLetGo)
{
    RecordingHandler target;
    target.setGeometry(100, 200, 300, 300);
    Message message(kStarMessage);
    message.AddInt32(kSystemIndexString, 3);
    MessageMimeData data(message);
    QDropEvent drop(QPointF(40, 50), Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);

    Message dropped;
    ASSERT_TRUE(TakeDroppedMessage(&drop, &target, &dropped));
    EXPECT_TRUE(drop.isAccepted());
    EXPECT_TRUE(dropped.WasDropped());
    EXPECT_EQ(dropped.FindInt32(kSystemIndexString), 3);
    const QPoint screen = target.mapToGlobal(QPoint(40, 50));
    EXPECT_EQ(dropped.DropPoint().x, screen.x());
    EXPECT_EQ(dropped.DropPoint().y, screen.y());
    EXPECT_FALSE(message.WasDropped()); // the sender's message is untouched
}

TEST(MessageDrag, ForeignDropsAreRefused)
{
    RecordingHandler target;
    QMimeData text;
    text.setText("Sirius");
    QDropEvent drop(QPointF(1, 1), Qt::CopyAction, &text, Qt::LeftButton, Qt::NoModifier);
    Message dropped(kClipToggle);
    EXPECT_FALSE(TakeDroppedMessage(&drop, &target, &dropped));
    EXPECT_FALSE(drop.isAccepted());
    EXPECT_EQ(dropped.what, kClipToggle); // untouched
    EXPECT_EQ(DraggedMessage(&text), nullptr);

    QMimeData files;
    files.setUrls({ QUrl::fromLocalFile("/tmp/stars.dat") });
    EXPECT_EQ(DraggedMessage(&files), nullptr);
}

TEST(MessageDrag, ADropKnowsWhenItLandsBackOnTheViewItsDragStartedFrom)
{
    QWidget window, other;
    auto* view = new QWidget(&window);
    auto* handle = new QWidget(view);
    const Message message(kStarMessage);
    MessageMimeData data(message);
    QDropEvent drop(QPointF(5, 5), Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);

    // No drag runs: no drop is on its source.
    EXPECT_FALSE(DroppedOnItsSource(&drop, view));

    // While the view's own drag runs, handed to a starter: the view and what holds it are its
    // source, other views are not.
    int asked = 0;
    const DragStarter starter = [&](const Message&, RBitmap8*, BPoint) {
        asked++;
        EXPECT_TRUE(DroppedOnItsSource(&drop, view));
        EXPECT_TRUE(DroppedOnItsSource(&drop, &window));
        EXPECT_FALSE(DroppedOnItsSource(&drop, handle));
        EXPECT_FALSE(DroppedOnItsSource(&drop, &other));
    };
    StartMessageDrag(starter, view, message, nullptr, BPoint(0, 0));
    EXPECT_EQ(asked, 1);
    // A drag from the handle inside the view lands on its source over the view too.
    const DragStarter fromHandle
        = [&](const Message&, RBitmap8*, BPoint) { EXPECT_TRUE(DroppedOnItsSource(&drop, view)); };
    StartMessageDrag(fromHandle, handle, message, nullptr, BPoint(0, 0));

    // Once the drag is over, nothing is its source any more.
    EXPECT_FALSE(DroppedOnItsSource(&drop, view));
}

// The picture of a running drag stands in a window of Qt's own. Only X11 without a compositor
// needs that window cut to the picture's outline; elsewhere it keeps the shape Qt gives it. Qt's
// generic drag, the one its Wayland platform builds on, runs on the minimal platform (the
// headless one runs no drag at all): CTest runs this there.
TEST(MessageDrag, OffX11ThePictureWindowIsNotCut)
{
    if (QGuiApplication::platformName() != "minimal")
        GTEST_SKIP() << "runs on the minimal platform";
    QWidget source;
    source.resize(40, 40);
    source.show();
    RBitmap8 image(BRect(0, 0, 31, 31));
    image.EraseMap(255);
    image.RenderSquare(11, 11, 10, 63);
    bool seen = false;
    QRegion mask;
    // Runs inside the drag's own event loop: reads the picture's window, then lets go.
    QTimer::singleShot(100, [&] {
        for (QWindow* window : QGuiApplication::allWindows()) {
            if (window->inherits("QShapedPixmapWindow") && window->isVisible()) {
                seen = true;
                mask = window->mask();
            }
        }
        QMouseEvent release(QEvent::MouseButtonRelease, QPointF(5, 5), QPointF(5, 5),
            Qt::LeftButton, Qt::NoButton, Qt::NoModifier);
        QCoreApplication::sendEvent(&source, &release);
    });
    DragMessage(&source, Message(kStarMessage), &image, BPoint(15, 16));
    ASSERT_TRUE(seen) << "the drag showed no picture";
    EXPECT_TRUE(mask.isEmpty()) << "the picture's window was cut to its outline";
}
