// The distance panel: its menu, field and reference label, and the query they fill in.
#include "query/panels/DistQueryView.h"

#include "query/panels/PopUpMenuButton.h"
#include "query/panels/TextControl.h"
#include "widgets/InfoView.h"

#include <algorithm>
#include <string>

DistQueryView::DistQueryView(BRect frame, const char* name, Universe* universe, QWidget* parent)
    : StarQueryView(frame, name, "Find by Distance", universe, parent)
    , param { kQueryIs, 0, 0 }
    , referenceIndex(0)
{
    const BRect modeFrame = FirstMenuFrame(110);
    modeMenu = AddModeMenu(modeFrame);
    const BRect distanceFrame = NextFrame(modeFrame, 120, 40);
    distance = AddTextControl(distanceFrame, "Distance", "", "10", 0);
    const float labelLeft = distanceFrame.left + 45;
    const float middle = ControlsMiddle();
    referenceLabel = new InfoView(
        BRect(labelLeft, middle - 8, std::max(labelLeft, float(width() - 1) - 52), middle + 8),
        "Ref Sys", "", this);
    referenceLabel->ISetInfo("Drop system here to set reference system");
    InitQuery(universe);
    // A new panel measures from the universe's first system.
    SetReferenceSystem(0);
}

void DistQueryView::InitQuery(Universe* universe)
{
    query = new DistanceQuery(universe);
}

void DistQueryView::SetReferenceSystem(int32_t index)
{
    referenceIndex = index;
    const StarSystem* system
        = index >= 0 && index < universe->CountItems() ? universe->SystemAt(index) : nullptr;
    const std::string text
        = system ? std::string("parsecs from ") + system->GetName() : "parsecs from origin";
    referenceLabel->setText(QString::fromUtf8(text.c_str()));
}

void DistQueryView::ISetTarget(QObject* target)
{
    StarQueryView::ISetTarget(target);
    referenceLabel->ISetTarget(target);
}

void DistQueryView::SetQueryParams()
{
    param.mode = modeMenu->MarkedIndex();
    param.referenceIndex = referenceIndex;
    param.distance = ReadNumber(distance->Text());
    queryParam = &param;
}

void DistQueryView::SystemDropped(StarSystem* system)
{
    SetReferenceSystem(universe->IndexOf(system));
}

void DistQueryView::resizeEvent(QResizeEvent* event)
{
    StarQueryView::resizeEvent(event);
    // The label reaches to 52 short of the right edge, clear of the handle.
    const QRect label = referenceLabel->geometry();
    referenceLabel->resize(std::max(1, width() - 52 - label.left()), label.height());
}
