// The panel that finds systems by right ascension, typed in hours and minutes of time.
#pragma once

#include "query/RAQuery.h"
#include "query/panels/StarQueryView.h"

class RAQueryView : public StarQueryView {
public:
    RAQueryView(BRect frame, const char* name, Universe* universe, QWidget* parent);

    RAQueryParam param;
    PopUpMenuButton* modeMenu; // "Mode Menu"
    TextControl* hours; // "Hours"
    TextControl* minutes; // "Minutes"

protected:
    void SetQueryParams() override;
    void InitQuery(Universe* universe) override;
    // Writes the system's right ascension: whole hours, and minutes to a tenth.
    void SystemDropped(StarSystem* system) override;
};
