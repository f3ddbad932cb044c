// The right-ascension panel: its menu and fields, and the query they fill in.
#include "query/panels/RAQueryView.h"

#include "catalog/CNumbers.h"
#include "core/Constants.h"
#include "query/panels/PopUpMenuButton.h"
#include "query/panels/TextControl.h"

#include <cmath>

RAQueryView::RAQueryView(BRect frame, const char* name, Universe* universe, QWidget* parent)
    : StarQueryView(frame, name, "Find by Right Ascension", universe, parent)
    , param { kQueryIs, 0 }
{
    const BRect modeFrame = FirstMenuFrame(110);
    modeMenu = AddModeMenu(modeFrame);
    const BRect hoursFrame = NextFrame(modeFrame, 120, 50);
    hours = AddTextControl(hoursFrame, "Hours", "h", "0", 10);
    minutes = AddTextControl(NextFrame(hoursFrame, 55, 50), "Minutes", "m", "0", 10);
    InitQuery(universe);
}

void RAQueryView::InitQuery(Universe* universe)
{
    query = new RAQuery(universe);
}

void RAQueryView::SetQueryParams()
{
    const double h = ReadNumber(hours->Text());
    const double m = ReadNumber(minutes->Text());
    param.mode = modeMenu->MarkedIndex();
    // 24 hours or 1,440 minutes of time make the full circle.
    param.rightAscension = 2 * kPI * h / 24 + 2 * kPI * m / 1440;
    queryParam = &param;
}

void RAQueryView::SystemDropped(StarSystem* system)
{
    const double angle = RAQuery::RightAscension(system->position.x, system->position.z);
    double whole;
    const double fraction = std::modf(angle / (2 * kPI) * 24, &whole);
    char text[64];
    FormatDouble(text, sizeof text, "%.0f", whole);
    hours->SetText(text);
    FormatDouble(text, sizeof text, "%.1f", fraction * 60);
    minutes->SetText(text);
}
