// Working the chart with the mouse: clicks that select, re-centre and zoom, drags of one star or
// of everything shown, and the texts and broadcasts that describe the hovered and selected stars.
#include "chart/UniverseView.h"

#include "catalog/Star.h"
#include "core/Constants.h"
#include "core/MessageCodes.h"
#include "platform/qt/MessageDrag.h"

#include <QCursor>
#include <QMouseEvent>
#include <cmath>
#include <cstdio>
#include <cstring>

namespace {

bool IsOrigin(const StarSystem* system, const SVector& originOffset)
{
    return system->position.x == -originOffset.x && system->position.y == -originOffset.y
        && system->position.z == -originOffset.z;
}

// "n: name ( magnitude class )" of a system's first star.
void AppendSystem(char* text, size_t size, const StarSystem* system)
{
    const Star* first = system->StarAt(0);
    const size_t used = std::strlen(text);
    std::snprintf(text + used, size - used, "%ld: %s ( %.1f %s )", long(system->CountItems()),
        system->GetName(), first ? first->magnitude : 0.0,
        first ? first->GetSpectralClassString() : "");
}

// "A: name ( magnitude class )  B: ..." for every star of a system.
void AppendStars(char* text, size_t size, const StarSystem* system)
{
    for (int32_t j = 0; j < system->CountItems(); j++) {
        const Star* star = system->StarAt(j);
        const size_t used = std::strlen(text);
        std::snprintf(text + used, size - used, "%c: %s ( %.1f %s )  ", char('A' + j),
            star->GetName(), star->magnitude, star->GetSpectralClassString());
    }
}

} // namespace

void UniverseView::mousePressEvent(QMouseEvent* event)
{
    fPressTarget = targetSystem.load();
    fPressPoint = event->position().toPoint();
    fPressed = true;
    // Sampled every 50 ms while the button is held, as the rest of the chart keeps drawing.
    fPressTimer.start();
}

void UniverseView::SamplePress()
{
    const QPoint now = mapFromGlobal(QCursor::pos());
    if (std::abs(now.x() - fPressPoint.x()) <= 4 && std::abs(now.y() - fPressPoint.y()) <= 4)
        return;
    // Out of the drag box: a drag, not a click.
    fPressTimer.stop();
    fPressed = false;
    StartDrag(fPressTarget);
}

void UniverseView::mouseReleaseEvent(QMouseEvent* event)
{
    if (!fPressed)
        return;
    fPressTimer.stop();
    fPressed = false;
    // Let go inside the drag box: a click. Let go outside it before the next sample: neither.
    const QPoint where = event->position().toPoint();
    if (std::abs(where.x() - fPressPoint.x()) <= 4 && std::abs(where.y() - fPressPoint.y()) <= 4)
        ApplyClick(fPressTarget);
}

void UniverseView::StartDrag(int32_t target)
{
    if (target < -1)
        return;
    // One star by its index, or everything shown as the chart's own mask; the receiver reads
    // the mask while it handles the drop.
    Message message(target >= 0 ? kStarMessage : kStarArrayMessage);
    if (target >= 0)
        message.AddInt32(kSystemIndexString, target);
    else
        message.AddPointer(kSystemArrayPtrString, drawMask);
    if (fDragStarter) {
        fDragStarter(message);
        return;
    }
    RBitmap8 image(BRect(0, 0, 31, 31));
    image.LoadFromResource(int32_t(kRaw8Type), target >= 0 ? 2 : 3, 0, 1024);
    DragMessage(this, message, &image, BPoint(1, 1));
}

void UniverseView::ApplyClick(int32_t t)
{
    renderLock->Acquire();
    const int32_t selected = selectedSystem.load();
    const StarSystem* system = universe && t >= 0 ? universe->SystemAt(t) : nullptr;
    if (t == selected && t != -1) {
        // A click on the selection: make it the origin, or zoom in if it already is.
        if (system && IsOrigin(system, originOffset)) {
            zoomToOrigin = true;
        } else if (system) {
            originOffset.Set(-system->position.x, -system->position.y, -system->position.z);
            originSystem = t;
        }
    } else if (t != -1) {
        selectedSystem = t;
    } else if (selected == -1) {
        // Empty space with nothing selected: back to the Sun, everything shown, the Sun selected.
        originOffset.Set(0, 0, 0);
        originSystem = 0;
        userMask->SetAll(true);
        HideGreaterThan(distanceFilter.load());
        selectedSystem = 0;
    } else {
        selectedSystem = -1;
    }
    renderLock->Release();
}

void UniverseView::ReturnOriginToSun()
{
    // The positions never change: the search needs no lock, only the origin does.
    int32_t sun = -1;
    for (size_t i = 0; i < fPositionX.size() && sun < 0; i++) {
        if (fPositionX[i] == 0 && fPositionY[i] == 0 && fPositionZ[i] == 0)
            sun = int32_t(i);
    }
    renderLock->Acquire();
    originOffset.Set(0, 0, 0);
    originSystem = sun >= 0 ? sun : 0;
    renderLock->Release();
}

int32_t UniverseView::OriginSystem()
{
    renderLock->Acquire();
    const int32_t origin = originSystem;
    renderLock->Release();
    return origin;
}

int32_t UniverseView::FindSystem(BPoint where)
{
    renderLock->Acquire();
    int32_t found = -1;
    double depth = 1e50;
    const int32_t count
        = universe ? std::min(universe->CountItems(), drawMask->GetSystemCount()) : 0;
    for (int32_t i = 0; i < count; i++) {
        if (!drawMask->states[i])
            continue;
        const ScreenPoint s = Project(universe->SystemAt(i)->position);
        if (s.z > 0 && s.x - 3 <= where.x && where.x <= s.x + 4 && s.y - 3 <= where.y
            && where.y <= s.y + 4 && s.z < depth) {
            depth = s.z;
            found = i;
        }
    }
    renderLock->Release();
    return found;
}

void UniverseView::SetDataString(int32_t selection, int32_t target)
{
    char data[256] = {};
    const char* help = "";
    const StarSystem* s = universe && selection >= 0 ? universe->SystemAt(selection) : nullptr;
    const StarSystem* t = universe && target >= 0 ? universe->SystemAt(target) : nullptr;
    if (!s && !t) {
        const bool atSun = originOffset.x == 0 && originOffset.y == 0 && originOffset.z == 0;
        help = atSun ? "Click to drag all visible stars to another view"
                     : "Click to return Origin to the sun  [Home]";
    } else if (!s) {
        AppendSystem(data, sizeof data, t);
        help = "Click star to make Selection or drag to another view";
    } else if (!t) {
        AppendStars(data, sizeof data, s);
        help = "Click to deslect star";
    } else if (selection != target) {
        // t as seen from s: its apparent magnitude from there, and how far apart they are.
        const SVector& a = s->position;
        const SVector& b = t->position;
        const double d = SVector(a.x - b.x, a.y - b.y, a.z - b.z).Magnitude();
        const Star* first = t->StarAt(0);
        const double absolute = first ? first->magnitude : 0.0;
        std::snprintf(data, sizeof data,
            "%s --> %ld: %s ( %.1f %s )  ::  %.2f parsecs ( %.2f light-years )", s->GetName(),
            long(t->CountItems()), t->GetName(), absolute - 5 + 5 * std::log10(d),
            first ? first->GetSpectralClassString() : "", d, d * kLightYearsPerParsec);
        help = "Click star to change Selection";
    } else {
        AppendStars(data, sizeof data, s);
        if (IsOrigin(s, originOffset))
            help = cameraDistance > 0.05 ? "Click star to zoom" : "Rotate to view constellations";
        else
            help = "Click star to change Origin";
    }
    ISetInfo(help);
    IBroadcastInfo();
    starInfo.ISetInfo(data);
    starInfo.IBroadcastInfo();
}

void UniverseView::BroadcastSI(int32_t selection, int32_t target)
{
    for (int32_t i = 0; i < subscribers.CountItems(); i++) {
        const auto* subscriber = static_cast<const SISubscriber*>(subscribers.ItemAtFast(i));
        const int32_t flags = subscriber->flags;
        if (!((flags & kSITargetChanged && target != lastTarget)
                || (flags & kSISelectionChanged && selection != lastSelection)))
            continue;
        Message message(kStarInfoBroadcast);
        if (flags & kSIWithTarget)
            message.AddInt32(kSITargetIndexString, target);
        if (flags & kSIWithSelection)
            message.AddInt32(kSISelectionIndexString, selection);
        if (flags & kSIWithUniverse)
            message.AddPointer(kSIUniversePointerString, universe);
        // The subscriber may be deleted on the interface thread at any moment: only its guarded
        // pointer travels, and it is looked at where the message is delivered.
        PostMessage(subscriber->handler, message);
    }
}

void UniverseView::UpdateData(int32_t selection, int32_t target)
{
    if (!mouseInside || (selection == lastSelection && target == lastTarget))
        return;
    BroadcastSI(selection, target);
    SetDataString(selection, target);
    lastSelection = selection;
    lastTarget = target;
}
