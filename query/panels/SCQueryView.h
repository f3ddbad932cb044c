// The panel that finds systems by spectral class: a Harvard letter and a decimal subclass,
// compared on the numeric scale of classes, for any, the first or the first two stars.
#pragma once

#include "catalog/SpectralClass.h"
#include "query/SCQuery.h"
#include "query/panels/StarQueryView.h"

class SCQueryView : public StarQueryView {
public:
    SCQueryView(BRect frame, const char* name, Universe* universe, QWidget* parent);

    SCQueryParam param;
    SpectralClass spectralClass; // what param points at
    PopUpMenuButton* starMode; // "Star Mode"
    PopUpMenuButton* modeMenu; // "Mode Menu"
    PopUpMenuButton* harvardClass; // "Harvard Class Menu": W O B A F G K M R N
    PopUpMenuButton* decimalClass; // "Decimal Class Menu": 0 to 9

protected:
    void SetQueryParams() override;
    void InitQuery(Universe* universe) override;
    // Marks the first star's letter and its subclass, cut to a whole number.
    void SystemDropped(StarSystem* system) override;
};
