// The panel that finds systems by their distance from a reference system, or from the origin.
// A system dropped on it becomes the reference.
#pragma once

#include "query/DistanceQuery.h"
#include "query/panels/StarQueryView.h"

class InfoView;

class DistQueryView : public StarQueryView {
public:
    DistQueryView(BRect frame, const char* name, Universe* universe, QWidget* parent);

    // Measures from the system at index of the universe, or from the origin for a negative
    // index (or one past the universe's systems); the label says which.
    void SetReferenceSystem(int32_t index);
    int32_t ReferenceSystem() const { return referenceIndex; }
    // The reference label joins the panel's help target as well.
    void ISetTarget(QObject* target) override;

    DistanceQueryParam param;
    PopUpMenuButton* modeMenu; // "Mode Menu"
    TextControl* distance; // "Distance"
    InfoView* referenceLabel; // "Ref Sys"
    int32_t referenceIndex;

protected:
    void SetQueryParams() override;
    void InitQuery(Universe* universe) override;
    // The system becomes the reference; the distance typed stays.
    void SystemDropped(StarSystem* system) override;
    void resizeEvent(QResizeEvent* event) override;
};
