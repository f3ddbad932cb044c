// The spectral-class panel: its four menus and the class query they fill in.
#include "query/panels/SCQueryView.h"

#include "query/panels/PopUpMenuButton.h"

SCQueryView::SCQueryView(BRect frame, const char* name, Universe* universe, QWidget* parent)
    : StarQueryView(frame, name, "Find by Spectral Class", universe, parent)
    , param { kQueryIs, kAnyStarInSystem, nullptr }
{
    const BRect starModeFrame = FirstMenuFrame(130);
    starMode = AddStarModeMenu(starModeFrame);
    const BRect modeFrame = NextFrame(starModeFrame, 140, 105);
    modeMenu = AddModeMenu(modeFrame);
    const BRect harvardFrame = NextFrame(modeFrame, 110, 25);
    harvardClass = AddPopUpMenu(harvardFrame, "HC MB", "Harvard Class Menu",
        { "W", "O", "B", "A", "F", "G", "K", "M", "R", "N" }, kClassG);
    decimalClass = AddPopUpMenu(NextFrame(harvardFrame, 30, 25), "DC MB", "Decimal Class Menu",
        { "0", "1", "2", "3", "4", "5", "6", "7", "8", "9" });
    InitQuery(universe);
}

void SCQueryView::InitQuery(Universe* universe)
{
    query = new SCQuery(universe);
}

void SCQueryView::SetQueryParams()
{
    spectralClass.SetSpectralClass(
        HarvardClass(harvardClass->MarkedIndex()), double(decimalClass->MarkedIndex()));
    param.mode = modeMenu->MarkedIndex();
    param.starMode = starMode->MarkedIndex();
    param.spectralClass = &spectralClass;
    queryParam = &param;
}

void SCQueryView::SystemDropped(StarSystem* system)
{
    if (system->CountItems() == 0)
        return;
    const SpectralClass& dropped = system->StarAt(0)->spectralClass;
    // A star without a class, or of subclass 10, leaves that menu as it is.
    harvardClass->SetMarked(int(dropped.GetHarvardClass()));
    decimalClass->SetMarked(int(dropped.GetDecimalClass()));
}
