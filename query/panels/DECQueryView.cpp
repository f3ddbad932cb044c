// The declination panel: its menu and fields, and the query they fill in.
#include "query/panels/DECQueryView.h"

#include "catalog/CNumbers.h"
#include "core/Constants.h"
#include "query/panels/PopUpMenuButton.h"
#include "query/panels/TextControl.h"

#include <cmath>

DECQueryView::DECQueryView(BRect frame, const char* name, Universe* universe, QWidget* parent)
    : StarQueryView(frame, name, "Find by Declination", universe, parent)
    , param { kQueryIs, 0 }
{
    const BRect modeFrame = FirstMenuFrame(110);
    modeMenu = AddModeMenu(modeFrame);
    const BRect degreesFrame = NextFrame(modeFrame, 120, 50);
    degrees = AddTextControl(degreesFrame, "Degrees", "°", "0", 10);
    // The minutes' label is a left single quotation mark, as the panel has always shown it.
    minutes = AddTextControl(NextFrame(degreesFrame, 55, 50), "Minutes", "‘", "0", 10);
    InitQuery(universe);
}

void DECQueryView::InitQuery(Universe* universe)
{
    query = new DECQuery(universe);
}

void DECQueryView::SetQueryParams()
{
    const double d = ReadNumber(degrees->Text());
    double m = ReadNumber(minutes->Text());
    // The minutes take the sign of the degrees; "-0" is not below 0, so -0 30 is +30'.
    if (d < 0)
        m = -m;
    param.mode = modeMenu->MarkedIndex();
    param.declination = 2 * kPI * d / 360 + 2 * kPI * m / 21600;
    queryParam = &param;
}

void DECQueryView::SystemDropped(StarSystem* system)
{
    const SVector& p = system->position;
    const double angle = DECQuery::Declination(p.x, p.y, p.z);
    if (std::isnan(angle))
        return;
    double whole;
    const double fraction = std::modf(angle / (2 * kPI) * 360, &whole);
    char text[64];
    FormatDouble(text, sizeof text, "%+.0f", whole);
    degrees->SetText(text);
    FormatDouble(text, sizeof text, "%.1f", std::fabs(fraction * 60));
    minutes->SetText(text);
}
