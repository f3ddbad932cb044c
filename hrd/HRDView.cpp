// The H-R diagram's plots: placing stars on it, finding the marker under the mouse, naming it,
// and dragging systems in and out.
#include "hrd/HRDView.h"

#include "catalog/CNumbers.h"
#include "catalog/Star.h"
#include "catalog/StarSystem.h"
#include "core/MessageCodes.h"
#include "platform/qt/BitmapImage.h"
#include "widgets/WidgetGeometry.h"

#include <QDragEnterEvent>
#include <QDropEvent>
#include <QMouseEvent>
#include <QPainter>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <cstring>

namespace {

constexpr int32_t kBackgroundId = 0; // 'Raw8': the empty diagram
constexpr int32_t kSingleSystemImageId = 2; // 'Raw8': the drag image of one system
constexpr int32_t kSystemArrayImageId = 3; // 'Raw8': the drag image of a set
constexpr int32_t kMarkerId = 4; // 'Raw8': the 8 x 8 marker
constexpr int32_t kMarkerSize = 8;
constexpr float kMarkerReach = 3; // a marker is found this far from its centre, either way

// Whether a diagram coordinate converts to an integer pixel: finite, and well inside the range
// of the integers the drawing takes (pixels, however far off the diagram).
bool HasPixel(float coordinate)
{
    return std::isfinite(coordinate) && std::fabs(coordinate) < 1.0e6f;
}

} // namespace

HRDView::HRDView(BPoint where, const char* name, QWidget* parent)
    : TransitView<QWidget>(parent)
    , background(new RBitmap8(BRect(0, 0, kWidth - 1, kHeight - 1)))
    , canvas(new RBitmap8(BRect(0, 0, kWidth - 1, kHeight - 1)))
    , marker(new RBitmap8(BRect(0, 0, kMarkerSize - 1, kMarkerSize - 1)))
    , plots(static_cast<HRPlot*>(std::calloc(kMaxPlots, sizeof(HRPlot))))
    , plotCount(0)
    , plottedSystems(nullptr)
    , plotNameInfo(new IBroadcaster)
    , hoverIndex(-2)
    , systemCount(0)
    , systems(nullptr)
{
    PlaceWidget(this, BRect(where.x, where.y, where.x + kWidth - 1, where.y + kHeight - 1), name);
    setAcceptDrops(true);
    background->LoadFromResource(int32_t(kRaw8Type), kBackgroundId, 0, kWidth * kHeight);
    marker->LoadFromResource(int32_t(kRaw8Type), kMarkerId, 0, kMarkerSize * kMarkerSize);
    RenderHRD();
}

HRDView::~HRDView()
{
    delete background;
    delete canvas;
    delete marker;
    delete plotNameInfo;
    delete plottedSystems;
    std::free(plots);
}

void HRDView::SetPlotNameTarget(QObject* target)
{
    plotNameInfo->ISetTarget(target);
}

float HRDView::AbsMagnitudeToY(double magnitude)
{
    return float((magnitude - -7.0) * 11.2 + 15.0);
}

float HRDView::SpectralClassToX(const SpectralClass* sc)
{
    float v = float(sc->SCToDouble()) - 1.0f;
    if (v == 0.0f)
        v = 0.5f;
    return v * 40.0f + 20.0f;
}

void HRDView::AddPlot(long systemIndex)
{
    if (!systems)
        return;
    const auto* system = static_cast<const StarSystem*>(systems->ItemAt(int32_t(systemIndex)));
    if (!system)
        return;
    for (int32_t i = 0; i < system->CountItems(); i++) {
        Star* star = system->StarAt(i);
        const float x = SpectralClassToX(star->GetSpectralClass());
        const float y = AbsMagnitudeToY(star->GetMagnitude());
        if (x == -1.0f)
            continue;
        plots[plotCount].Set(systemIndex, star, BPoint(x, y));
        // Full: the last slot stays the newest star's.
        if (plotCount < kMaxPlots - 1)
            plotCount++;
        // A magnitude that is no number, or absurdly far off, has no pixel to truncate to: the
        // plot is kept, as one off the diagram is, but there is nothing to draw.
        if (HasPixel(x) && HasPixel(y))
            RenderPlot(long(x), long(y));
    }
}

void HRDView::RenderPlot(long x, long y)
{
    canvas->RenderBitmap(int32_t(x - 3), int32_t(y - 3), marker, kMarkerSize);
}

void HRDView::RenderHRD()
{
    std::memcpy(canvas->Bits(), background->Bits(), size_t(canvas->BitsLength()));
}

HRPlot* HRDView::FindPlot(BPoint where)
{
    for (int32_t i = plotCount - 1; i >= 0; i--) {
        HRPlot& plot = plots[i];
        if (where.x >= plot.x - kMarkerReach && where.x <= plot.x + kMarkerReach
            && where.y >= plot.y - kMarkerReach && where.y <= plot.y + kMarkerReach)
            return &plot;
    }
    return nullptr;
}

void HRDView::MessageReceived(Message* message)
{
    switch (message->what) {
    case kStarInfoBroadcast: {
        const int32_t index = message->FindInt32(kSISelectionIndexString);
        if (index < 0)
            return;
        AddPlot(index);
        DrawCanvas();
        break;
    }
    case kStarMessage: {
        const int32_t index = message->FindInt32(kSystemIndexString);
        if (index < 0)
            return;
        AddPlot(index);
        DrawCanvas();
        break;
    }
    case kStarArrayMessage: {
        const auto* dropped
            = static_cast<const StarSysMask*>(message->FindPointer(kSystemArrayPtrString));
        if (!dropped)
            return;
        for (int32_t i = 0; i < dropped->GetSystemCount(); i++) {
            if (dropped->GetStateSafe(i))
                AddPlot(i);
        }
        // A set over another universe cannot be kept with ours.
        if (plottedSystems && dropped->GetSystemCount() == plottedSystems->GetSystemCount())
            *plottedSystems |= *dropped;
        DrawCanvas();
        break;
    }
    case kHRDClear:
        if (plottedSystems)
            plottedSystems->SetAll(false);
        plotCount = 0;
        RenderHRD();
        DrawCanvas();
        break;
    case kUniversePointer:
        delete plottedSystems;
        systems = static_cast<BList*>(message->FindPointer(kUniversePtrString));
        systemCount = systems ? systems->CountItems() : 0;
        plottedSystems = new StarSysMask(systemCount, false, 0);
        plotCount = 0;
        break;
    default:
        break;
    }
}

void HRDView::MouseMoved(QPoint where, Transit transit)
{
    switch (transit) {
    case B_INSIDE_VIEW: {
        const HRPlot* plot = FindPlot(BPoint(float(where.x()), float(where.y())));
        const int32_t hovered = plot ? int32_t(plot->systemIndex) : -1;
        if (hovered == hoverIndex)
            return;
        hoverIndex = hovered;
        if (!plot) {
            plotNameInfo->IClearInfo();
            SetHelp(plotCount == 0 ? "Drag & drop stars from other views here"
                                   : "Click to drag & drop all stars");
            return;
        }
        const SpectralClass* sc = plot->star->GetSpectralClass();
        char text[256];
        FormatCLocale(text, sizeof text, "%s ( %.1f %c%1.1f )", plot->star->GetName(),
            plot->star->GetMagnitude(), sc->GetHCCharacter(), sc->GetDecimalClass());
        plotNameInfo->ISetInfo(text);
        plotNameInfo->IBroadcastInfo();
        SetHelp("Click to drag & drop star");
        break;
    }
    case B_EXITED_VIEW:
        hoverIndex = -2;
        IClearInfo();
        break;
    case B_ENTERED_VIEW:
        IBroadcastInfo();
        break;
    default:
        break;
    }
}

void HRDView::SetHelp(const char* text)
{
    // The help line shows what the mouse is over now: on the first entry the view's text is not
    // yet chosen when the entry broadcasts it, so each change is broadcast as it is made.
    if (std::strcmp(IGetInfo(), text) == 0)
        return;
    ISetInfo(text);
    IBroadcastInfo();
}

void HRDView::mousePressEvent(QMouseEvent* event)
{
    const QPoint where = event->position().toPoint();
    RBitmap8 image(BRect(0, 0, 31, 31));
    if (const HRPlot* plot = FindPlot(BPoint(float(where.x()), float(where.y())))) {
        Message message(kStarMessage);
        message.AddInt32(kSystemIndexString, int32_t(plot->systemIndex));
        image.LoadFromResource(int32_t(kRaw8Type), kSingleSystemImageId, 0, 1024);
        StartMessageDrag(fDragStarter, this, message, &image, BPoint(1, 1));
        return;
    }
    Message message(kStarArrayMessage);
    message.AddPointer(kSystemArrayPtrString, plottedSystems);
    image.LoadFromResource(int32_t(kRaw8Type), kSystemArrayImageId, 0, 1024);
    StartMessageDrag(fDragStarter, this, message, &image, BPoint(1, 1));
}

void HRDView::DrawCanvas()
{
    repaint();
}

void HRDView::paintEvent(QPaintEvent*)
{
    QPainter painter(this);
    painter.drawImage(QPoint(0, 0), ImageOf(*canvas));
}

void HRDView::dragEnterEvent(QDragEnterEvent* event)
{
    dragMoveEvent(event);
}

void HRDView::dragMoveEvent(QDragMoveEvent* event)
{
    // What was dragged out of this view is not taken back: a click would otherwise drop the
    // view's own contents on it again.
    if (DroppedOnItsSource(event, this))
        event->ignore();
    else
        AcceptMessageDrag(event);
}

void HRDView::dropEvent(QDropEvent* event)
{
    if (DroppedOnItsSource(event, this)) {
        event->ignore();
        return;
    }
    Message message;
    if (TakeDroppedMessage(event, this, &message))
        MessageReceived(&message);
}
