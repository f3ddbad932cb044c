// FrameHandOver.cpp: the three frame buffers, the paint requests and the palette conversion.
#include "platform/qt/FrameHandOver.h"

#include "platform/qt/BitmapImage.h"
#include "platform/qt/ThreadMailbox.h"
#include "render/RBitmap8.h"

#include <QPainter>
#include <QWidget>
#include <algorithm>
#include <cstring>
#include <mutex>
#include <unordered_map>

namespace {

// The hand-overs alive, by number. A paint request posted by a render thread names its hand-over
// by number only: it runs after the view may have gone, and a number is all a request can carry
// without allocating.
struct LiveHandOvers {
    std::mutex lock;
    std::unordered_map<uint64_t, FrameHandOver*> byId;
};

LiveHandOvers& Live()
{
    // Never destroyed: a request may still be delivered while static objects are torn down.
    static auto* live = new LiveHandOvers();
    return *live;
}

std::atomic<uint64_t> gNextId { 1 };

// One row of palette indices to colours. Four pixels a step, read as one word: the look-ups are
// what costs, and they are independent of each other.
void ConvertRow(const uint8_t* from, QRgb* to, int32_t width, const QRgb* palette)
{
    int32_t x = 0;
    for (; x + 4 <= width; x += 4) {
        uint32_t four;
        std::memcpy(&four, from + x, sizeof four);
        to[x] = palette[four & 0xff];
        to[x + 1] = palette[(four >> 8) & 0xff];
        to[x + 2] = palette[(four >> 16) & 0xff];
        to[x + 3] = palette[four >> 24];
    }
    for (; x < width; x++)
        to[x] = palette[from[x]];
}

} // namespace

FrameHandOver::FrameHandOver(QWidget* view)
    : fView(view)
    , fId(gNextId++)
{
    {
        std::lock_guard lock(Live().lock);
        Live().byId[fId] = this;
    }
    fRetry.setSingleShot(true);
    fRetry.setInterval(1);
    QObject::connect(&fRetry, &QTimer::timeout, [this] {
        if (fView)
            fView->update();
    });
}

FrameHandOver::~FrameHandOver()
{
    std::lock_guard lock(Live().lock);
    Live().byId.erase(fId);
}

bool FrameHandOver::HandOver(
    const RBitmap8& frame, const QList<QRgb>* palette, std::chrono::milliseconds timeout)
{
    // The copy goes into the buffer this thread owns, without the lock.
    Frame& into = *fWriting;
    const size_t length = size_t(frame.BitsLength());
    if (into.pixels.size() != length)
        into.pixels.resize(length);
    std::memcpy(into.pixels.data(), frame.Bits(), length);
    into.width = frame.Width();
    into.height = frame.Height();
    into.pitch = frame.BytesPerRow();
    const QList<QRgb>& colours = palette ? *palette : SystemColorTable();
    const size_t count = std::min(size_t(colours.size()), into.palette.size());
    std::copy_n(colours.constData(), count, into.palette.begin());
    into.serial = ++fSerial;

    if (!fLock.try_lock_for(timeout))
        return false;
    std::swap(fWriting, fReady);
    fFresh = true;
    fLock.unlock();
    fHandedOver++;

    if (fView && !fPaintRequested.exchange(true))
        ThreadMailbox::Instance().Post([id = fId] { PaintRequested(id); });
    return true;
}

void FrameHandOver::PaintRequested(uint64_t id)
{
    std::lock_guard lock(Live().lock);
    const auto found = Live().byId.find(id);
    if (found == Live().byId.end())
        return;
    FrameHandOver* handOver = found->second;
    // Cleared first: a frame handed over from now on asks for a paint of its own.
    handOver->fPaintRequested = false;
    handOver->fView->update();
}

bool FrameHandOver::TakeNewest()
{
    std::unique_lock lock(fLock, std::try_to_lock);
    if (!lock.owns_lock())
        return false;
    if (fFresh) {
        std::swap(fReady, fPainting);
        fFresh = false;
    }
    return true;
}

const QImage& FrameHandOver::NewestImage()
{
    if (!TakeNewest()) {
        // Shown soon after instead: the lock is held for a swap, or by a reader of FrontImage.
        if (!fRetry.isActive())
            fRetry.start();
    }
    const Frame& frame = *fPainting;
    if (frame.serial == fShownSerial)
        return fShown;
    if (fShown.width() != frame.width || fShown.height() != frame.height)
        fShown = QImage(frame.width, frame.height, QImage::Format_RGB32);
    // Painted as opaque colour: a transparent entry shows its colour like any other.
    std::array<QRgb, 256> opaque;
    for (size_t i = 0; i < opaque.size(); i++)
        opaque[i] = frame.palette[i] | 0xff000000u;
    // The palette look-up is done here, on the interface thread: handed an indexed image, Qt
    // converts large ones on worker threads of its own.
    for (int32_t y = 0; y < frame.height; y++) {
        ConvertRow(frame.pixels.data() + size_t(y) * size_t(frame.pitch),
            reinterpret_cast<QRgb*>(fShown.scanLine(y)), frame.width, opaque.data());
    }
    fShownSerial = frame.serial;
    return fShown;
}

bool FrameHandOver::Paint(QPainter& painter)
{
    const QImage& image = NewestImage();
    if (image.isNull())
        return false;
    painter.drawImage(QPoint(0, 0), image);
    return true;
}

QImage FrameHandOver::FrontImage() const
{
    std::lock_guard lock(fLock);
    return FrontImageUnderLock();
}

QImage FrameHandOver::FrontImageUnderLock() const
{
    const Frame& frame = fFresh ? *fReady : *fPainting;
    if (frame.serial == 0)
        return {};
    QImage image(
        frame.pixels.data(), frame.width, frame.height, frame.pitch, QImage::Format_Indexed8);
    image.setColorTable(QList<QRgb>(frame.palette.begin(), frame.palette.end()));
    return image.copy();
}
