// The panel that finds systems by the absolute magnitude of any, the first or the first two
// of their stars.
#pragma once

#include "query/MGQuery.h"
#include "query/panels/StarQueryView.h"

class MGQueryView : public StarQueryView {
public:
    MGQueryView(BRect frame, const char* name, Universe* universe, QWidget* parent);

    MGQueryParam param;
    PopUpMenuButton* starMode; // "Star Mode"
    PopUpMenuButton* modeMenu; // "Mode Menu"
    TextControl* magnitude; // "Magnitude"

protected:
    void SetQueryParams() override;
    void InitQuery(Universe* universe) override;
    // Takes the first star's absolute magnitude, to a tenth.
    void SystemDropped(StarSystem* system) override;
};
