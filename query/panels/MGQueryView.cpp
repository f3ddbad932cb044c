// The magnitude panel: its menus and field, and the magnitude query they fill in.
#include "query/panels/MGQueryView.h"

#include "catalog/CNumbers.h"
#include "query/panels/PopUpMenuButton.h"
#include "query/panels/TextControl.h"

MGQueryView::MGQueryView(BRect frame, const char* name, Universe* universe, QWidget* parent)
    : StarQueryView(frame, name, "Find by Absolute Magnitude", universe, parent)
    , param { kQueryIs, kAnyStarInSystem, 0 }
{
    const BRect starModeFrame = FirstMenuFrame(130);
    starMode = AddStarModeMenu(starModeFrame);
    const BRect modeFrame = NextFrame(starModeFrame, 140, 105);
    modeMenu = AddModeMenu(modeFrame);
    magnitude = AddTextControl(NextFrame(modeFrame, 120, 40), "Magnitude", "", "4.7", 0);
    InitQuery(universe);
}

void MGQueryView::InitQuery(Universe* universe)
{
    query = new MGQuery(universe);
}

void MGQueryView::SetQueryParams()
{
    param.mode = modeMenu->MarkedIndex();
    param.starMode = starMode->MarkedIndex();
    param.magnitude = ReadNumber(magnitude->Text());
    queryParam = &param;
}

void MGQueryView::SystemDropped(StarSystem* system)
{
    if (system->CountItems() == 0)
        return;
    char text[64];
    FormatDouble(text, sizeof text, "%.1f", system->StarAt(0)->GetMagnitude());
    magnitude->SetText(text);
}
