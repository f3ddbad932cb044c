// The panel that finds systems by declination, typed in degrees and minutes of arc.
#pragma once

#include "query/DECQuery.h"
#include "query/panels/StarQueryView.h"

class DECQueryView : public StarQueryView {
public:
    DECQueryView(BRect frame, const char* name, Universe* universe, QWidget* parent);

    DECQueryParam param;
    PopUpMenuButton* modeMenu; // "Mode Menu"
    TextControl* degrees; // "Degrees"
    TextControl* minutes; // "Minutes"

protected:
    void SetQueryParams() override;
    void InitQuery(Universe* universe) override;
    // Writes the system's declination: signed whole degrees, and minutes to a tenth, never
    // negative. A system at the origin has no direction and leaves the fields alone.
    void SystemDropped(StarSystem* system) override;
};
