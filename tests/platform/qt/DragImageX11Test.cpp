// The picture of a message drag on a real X server (Xvfb), read off the screen and out of an xwd
// dump while the drag is under way: with no window manager at all, and under openbox. Neither
// composites, so the picture's window has no alpha channel to lean on: it must be cut to the
// picture's outline.
#include "X11Desktop.h"
#include "X11Support.h"

#include "core/MessageCodes.h"
#include "platform/qt/BitmapImage.h"
#include "platform/qt/MessageDrag.h"
#include "render/RBitmap8.h"
#include "resources/ResourceData.h"

#include <QDeadlineTimer>
#include <QGuiApplication>
#include <QImage>
#include <QMouseEvent>
#include <QPainter>
#include <QScreen>
#include <QTest>
#include <QTimer>
#include <cmath>
#include <functional>
#include <optional>

namespace {

constexpr int kSide = 32; // the drag images are 32 x 32
const QPoint kHotSpot(1, 1); // the chart holds its pictures by pixel (1, 1)
const QColor kBeneath(40, 120, 60); // what the picture is dragged over: neither black nor white

// What the screen shows in area: Qt copies the root window with the windows on it. (xwd, which
// reads a window of a visual of its own straight from that window, sees the picture's window,
// which has an alpha channel, as a square: black where the screen shows what lies beneath.)
QImage Grab(QRect area)
{
    return QGuiApplication::primaryScreen()
        ->grabWindow(0, area.x(), area.y(), area.width(), area.height())
        .toImage()
        .convertToFormat(QImage::Format_RGB32);
}

// How a grab of the drag picture, in the screen's pixels, differs from the picture: coloured pixels
// must show their palette colour, transparent ones what lies beneath the picture or black (as xwd
// shows them). At a whole scale factor each pixel of the picture is a block of scale x scale
// pixels of the screen, every one of which must show it.
struct Difference {
    int wrongColoured = 0;
    int wrongTransparent = 0;
    QString first; // the first wrong pixel, for the failure message

    bool Empty() const { return wrongColoured == 0 && wrongTransparent == 0; }
};

Difference Compare(const RBitmap8& picture, const QImage& shown, int scale)
{
    Difference difference;
    const QList<QRgb>& palette = SystemColorTable();
    const uint8_t* bits = picture.Bits();
    for (int y = 0; y < kSide * scale; y++) {
        for (int x = 0; x < kSide * scale; x++) {
            const uint8_t index = bits[y / scale * picture.BytesPerRow() + x / scale];
            const QRgb pixel = shown.pixel(x, y) | 0xff000000;
            bool right;
            if (index == 255) {
                right = pixel == kBeneath.rgb() || pixel == qRgb(0, 0, 0);
                difference.wrongTransparent += !right;
            } else {
                right = pixel == (palette[index] | 0xff000000);
                difference.wrongColoured += !right;
            }
            if (!right && difference.first.isEmpty())
                difference.first = QString("(%1, %2): index %3 shows #%4")
                                       .arg(x)
                                       .arg(y)
                                       .arg(index)
                                       .arg(pixel & 0xffffff, 6, 16, QChar('0'));
        }
    }
    return difference;
}

// A window painted kBeneath all over; pressing it drags a message with the given picture, and
// while the drag runs, `during` is called every 50 ms until it answers true. The drag ends when
// the button is let go.
class DragSource : public QWidget {
public:
    explicit DragSource(RBitmap8* picture)
        : fPicture(picture)
    {
    }

    std::function<bool()> during;
    bool dragEnded = false;

protected:
    void paintEvent(QPaintEvent*) override { QPainter(this).fillRect(rect(), kBeneath); }
    void mousePressEvent(QMouseEvent*) override
    {
        QTimer watch;
        watch.setInterval(50);
        QObject::connect(&watch, &QTimer::timeout, [&] {
            if (during && during())
                watch.stop();
        });
        watch.start();
        Message message(kStarMessage);
        message.AddInt32(kSystemIndexString, 1);
        DragMessage(this, message, fPicture, BPoint(kHotSpot.x(), kHotSpot.y()));
        dragEnded = true;
    }

private:
    RBitmap8* fPicture; // not owned
};

class DragImage : public ::testing::Test {
protected:
    void SetUp() override
    {
        if (QGuiApplication::platformName() != "xcb")
            GTEST_SKIP() << "needs an X server: run under scripts/with-xvfb";
        const double scale = QGuiApplication::primaryScreen()->devicePixelRatio();
        if (scale != std::floor(scale))
            GTEST_SKIP() << "the picture is compared pixel by pixel at whole scale factors only";
        InitResources();
    }

    // Starts openbox and waits until it holds the screen and has finished starting.
    void StartOpenbox()
    {
        ASSERT_FALSE(WindowManagerRunning()) << "another window manager runs on this display";
        ASSERT_TRUE(fWindowManager.Start()) << "openbox is not installed or did not start";
    }

    // Drags a star message with the picture 'Raw8' id over a window of kBeneath and, once the
    // pointer has come to rest, reads the picture off the screen and out of an xwd dump; checks
    // both pixel by pixel.
    void DragAndLook(int32_t id)
    {
        RBitmap8 picture(BRect(0, 0, kSide - 1, kSide - 1));
        ASSERT_TRUE(picture.LoadFromResource(int32_t(kRaw8Type), id, 0, kSide * kSide));
        DragSource source(&picture);
        source.setGeometry(200, 200, 300, 200);
        source.show();
        ASSERT_TRUE(QTest::qWaitForWindowExposed(&source));
        source.activateWindow();

        // Pressed at the left, dragged to the middle: the picture lies wholly over the window.
        const QPoint from = source.mapToGlobal(QPoint(20, 100));
        const QPoint to = source.mapToGlobal(QPoint(150, 90));
        const QRect where(to - kHotSpot, QSize(kSide, kSide));
        // The screen's pixels under it, at the scale factor this test runs at.
        const int scale = int(QGuiApplication::primaryScreen()->devicePixelRatio());
        const QRect whereOnScreen(where.topLeft() * scale, where.size() * scale);
        Xdotool hand, release;
        Difference onScreen;
        // xwd is slow: its dump is read once the screen is right, or when time is up.
        std::optional<Difference> inDump;
        const QDeadlineTimer deadline(20000);
        source.during = [&] {
            if (!hand.Finished())
                return false;
            const bool last = deadline.hasExpired();
            onScreen = Compare(picture, Grab(where), scale);
            if (!onScreen.Empty() && !last)
                return false;
            inDump = Compare(picture, XwdRootImage().copy(whereOnScreen), scale);
            if (!inDump->Empty() && !last)
                return false;
            release.Run({ "mouseup", "1" });
            return true;
        };
        QStringList steps = DragSteps(from, to);
        steps.removeLast(); // keep the button down: `during` lets it go once it has looked
        steps.removeLast();
        hand.Run(steps);
        ASSERT_TRUE(QTest::qWaitFor([&] { return source.dragEnded; }, 30000)) << "no drag";
        EXPECT_TRUE(QTest::qWaitFor([&] { return release.Finished(); }, 5000));

        EXPECT_EQ(onScreen.wrongColoured, 0) << "on the screen " << onScreen.first.toStdString();
        EXPECT_EQ(onScreen.wrongTransparent, 0) << "on the screen " << onScreen.first.toStdString();
        ASSERT_TRUE(inDump.has_value());
        EXPECT_EQ(inDump->wrongColoured, 0) << "in xwd's dump " << inDump->first.toStdString();
        EXPECT_EQ(inDump->wrongTransparent, 0) << "in xwd's dump " << inDump->first.toStdString();
    }

private:
    WindowManager fWindowManager;
};

} // namespace

TEST_F(DragImage, TheStarPictureShowsWithoutAWindowManager)
{
    ASSERT_FALSE(WindowManagerRunning());
    DragAndLook(2);
}

TEST_F(DragImage, TheSystemArrayPictureShowsWithoutAWindowManager)
{
    ASSERT_FALSE(WindowManagerRunning());
    DragAndLook(3);
}

// One openbox serves both pictures.
TEST_F(DragImage, BothPicturesShowUnderOpenbox)
{
    StartOpenbox();
    DragAndLook(2);
    DragAndLook(3);
}
