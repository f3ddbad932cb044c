// The chart view's construction, its Qt events and the messages it takes.
#include "chart/UniverseView.h"

#include "chart/FrameLog.h"
#include "core/MessageCodes.h"
#include "platform/qt/MessageDrag.h"
#include "widgets/WidgetGeometry.h"

#include <QDragEnterEvent>
#include <QGuiApplication>
#include <QPainter>
#include <algorithm>
#include <unordered_map>

UniverseView::UniverseView(
    BRect viewFrame, const char* name, Universe* universe, int32_t threadCount, QWidget* parent)
    : TransitView<QWidget>(parent)
    , starSprite(new RBitmap8(BRect(0, 0, 63, 63)))
    , font(new RBMFont8(int32_t(kFontType), kSystemFontId, kSystemFontStripWidth,
          kSystemFontCharHeight, kSystemFontCharWidth, kSystemFontFirstChar, kSystemFontLastChar))
    , universe(universe)
    , subscribers(20)
    , threadCount(std::clamp(threadCount, 1, kMaxRenderThreads))
    , renderLock(new Benaphore(1, "render benaphore"))
{
    PlaceWidget(this, viewFrame, name);
    setAcceptDrops(true);
    starSprite->LoadFromResource(int32_t(kRaw8Type), 5, 0, 4096);

    const int32_t count = universe ? universe->CountItems() : 0;
    lumCache.assign(size_t(count), 0.0);
    fPositionX.resize(size_t(count));
    fPositionY.resize(size_t(count));
    fPositionZ.resize(size_t(count));
    fTableOf.resize(size_t(count));
    std::unordered_map<const ColorTable*, uint8_t> places;
    for (int32_t i = 0; i < count; i++) {
        const StarSystem* system = universe->SystemAt(i);
        fPositionX[size_t(i)] = system->position.x;
        fPositionY[size_t(i)] = system->position.y;
        fPositionZ[size_t(i)] = system->position.z;
        // Generated systems have no table of their own: they are drawn with the G ramp.
        const ColorTable* table
            = system->colorTable ? system->colorTable : SpectralTableFor(kClassG);
        if (!fWideTables.empty()) {
            fWideTables[size_t(i)] = table;
            continue;
        }
        const auto [place, added] = places.try_emplace(table, uint8_t(fTableList.size()));
        if (added && fTableList.size() == 256) {
            // One table too many for a byte: every system gets its pointer.
            fWideTables.resize(size_t(count));
            for (int32_t j = 0; j < i; j++)
                fWideTables[size_t(j)] = fTableList[fTableOf[size_t(j)]];
            fWideTables[size_t(i)] = table;
            fTableOf = {};
            continue;
        }
        if (added)
            fTableList.push_back(table);
        fTableOf[size_t(i)] = place->second;
    }
    for (const ColorTable* table : fTableList)
        fSpreads.push_back(table ? RBitmap8::SpreadTable(table) : std::array<uint32_t, 256> {});
    for (int32_t size = 0; size <= 64; size++)
        fGlowSamples.push_back(RBitmap8::ScaledSamples(starSprite, size));
    userMask = new StarSysMask(count, true, 0);
    distanceMask = new StarSysMask(count, true, 0);
    drawMask = new StarSysMask(count, true, 0);
    RebuildPassLum();

    pitch.InitXRotation(-0.52);
    yaw.InitIdentity();
    cameraPosition.Set(0, 0, 0);
    originOffset.Set(0, 0, 0);
    originTranslation.InitTranslation(0, 0, 0);
    zoomTranslation.InitTranslation(0, 0, cameraDistance);
    transform = originTranslation;
    transform *= yaw;
    transform *= pitch;
    transform *= zoomTranslation;
    fViewWidth = width();
    fViewHeight = height();

    fPressTimer.setInterval(50);
    connect(&fPressTimer, &QTimer::timeout, this, [this] { SamplePress(); });
}

UniverseView::~UniverseView()
{
    DetachedFromWindow();
    renderLock->Acquire();
    StopWorkers();
    renderLock->Release();
    delete renderLock;
    delete offscreen;
    delete starSprite;
    delete font;
    delete userMask;
    delete distanceMask;
    delete drawMask;
    for (int32_t i = 0; i < subscribers.CountItems(); i++)
        delete static_cast<SISubscriber*>(subscribers.ItemAtFast(i));
}

void UniverseView::RebuildDrawMask()
{
    *drawMask = *userMask;
    *drawMask &= *distanceMask;
    RebuildPassLum();
}

void UniverseView::MouseMoved(QPoint where, Transit transit)
{
    switch (transit) {
    case B_ENTERED_VIEW:
    case B_INSIDE_VIEW:
        mousePointX.store(float(where.x()), std::memory_order_relaxed);
        mousePointY.store(float(where.y()), std::memory_order_relaxed);
        mouseInside = true;
        break;
    case B_EXITED_VIEW:
        // Forces a fresh broadcast when the pointer comes back.
        lastSelection = -2;
        lastTarget = -2;
        IClearInfo();
        mouseInside = false;
        break;
    default:
        break;
    }
}

void UniverseView::paintEvent(QPaintEvent*)
{
    // Being drawn means being seen, unless the window is minimised (some platforms still
    // paint those).
    if (!window()->isMinimized())
        Resume();
    QPainter painter(this);
    if (fFrames.Paint(painter))
        FrameLog::Note("paint", this);
}

void UniverseView::resizeEvent(QResizeEvent*)
{
    fViewWidth = width();
    fViewHeight = height();
    frameResized = true;
}

void UniverseView::dragEnterEvent(QDragEnterEvent* event)
{
    AcceptMessageDrag(event);
}

void UniverseView::dragMoveEvent(QDragMoveEvent* event)
{
    AcceptMessageDrag(event);
}

void UniverseView::dropEvent(QDropEvent* event)
{
    Message message;
    if (TakeDroppedMessage(event, this, &message))
        MessageReceived(&message);
}

void UniverseView::MessageReceived(Message* message)
{
    switch (message->what) {
    case kClipToggle:
        showClipSphere = !showClipSphere;
        break;
    case kStarArrayMessage: {
        const auto* mask
            = static_cast<const StarSysMask*>(message->FindPointer(kSystemArrayPtrString));
        if (!mask)
            break;
        renderLock->Acquire();
        *userMask = *mask;
        RebuildDrawMask();
        renderLock->Release();
        break;
    }
    case kStarInfoSubscribe: {
        auto* handler = static_cast<QObject*>(message->FindPointer(kSIHandlerPtrString));
        auto* widget = qobject_cast<QWidget*>(handler);
        QObject* looper = widget ? static_cast<QObject*>(widget->window()) : handler;
        renderLock->Acquire();
        // Subscribers closed since are forgotten here, so that the list does not grow with
        // every window that once subscribed.
        for (int32_t i = subscribers.CountItems() - 1; i >= 0; i--) {
            auto* subscriber = static_cast<SISubscriber*>(subscribers.ItemAtFast(i));
            if (!subscriber->handler) {
                subscribers.RemoveItem(i);
                delete subscriber;
            }
        }
        subscribers.AddItem(new SISubscriber(looper, handler, message->FindInt32(kSIFlagsString)));
        renderLock->Release();
        break;
    }
    case kStarInfoUnsubscribe: {
        const auto* handler = static_cast<QObject*>(message->FindPointer(kSIHandlerPtrString));
        renderLock->Acquire();
        for (int32_t i = 0; i < subscribers.CountItems(); i++) {
            auto* subscriber = static_cast<SISubscriber*>(subscribers.ItemAtFast(i));
            if (subscriber->handler == handler) {
                subscribers.RemoveItem(i);
                delete subscriber;
                break;
            }
        }
        renderLock->Release();
        break;
    }
    case kStarMessage: {
        const int32_t index = message->FindInt32(kSystemIndexString);
        selectedSystem = index;
        if (index == -1)
            break;
        renderLock->Acquire();
        userMask->SetStateSafe(index, true);
        RebuildDrawMask();
        const StarSystem* system = universe ? universe->SystemAt(index) : nullptr;
        if (system && !(QGuiApplication::keyboardModifiers() & Qt::ControlModifier)) {
            originOffset.Set(-system->position.x, -system->position.y, -system->position.z);
            originSystem = index;
        }
        renderLock->Release();
        break;
    }
    default:
        break;
    }
}
