// Building the control window's mouse controls from their table.
#include "controls/MouseControls.h"

#include "controls/SliderControl.h"
#include "controls/TrackballControl.h"

MouseControl* MakeMouseControl(const MouseControlEntry& entry, BRect frame, QWidget* parent)
{
    MouseControl* control = nullptr;
    if (entry.kind == MouseControlClass::Trackball) {
        auto* trackball
            = new TrackballControl(frame, entry.name, entry.resourceID, entry.cursor, parent);
        trackball->InitTrackball(entry.init[0], entry.init[1], entry.init[2], entry.init[3]);
        control = trackball;
    } else {
        auto* slider = new SliderControl(frame, entry.name, entry.resourceID, entry.cursor, parent);
        slider->InitSlider(entry.init[0], entry.init[1], entry.init[2]);
        control = slider;
    }
    control->ISetInfo(entry.help);
    return control;
}
