// The five mouse controls of the control window, in their order left to right: what each one is,
// where its pictures come from, its cursor, its settings and its help text.
#pragma once

#include "controls/MouseControl.h"

#include <array>
#include <cstdint>

enum class MouseControlClass { Trackball, Slider };

struct MouseControlEntry {
    const char* name; // the view's name
    MouseControlClass kind;
    int32_t resourceID; // 'McPc' resource of its pictures
    Qt::CursorShape cursor;
    // Trackball: InitTrackball(scaleX, scaleY, easeX, easeY). Slider: InitSlider(base, minimum,
    // maximum); the fourth figure is unused.
    double init[4];
    const char* help;
};

// Indices into kMouseControls.
enum MouseControlIndex : int32_t {
    kTrackBallControl = 0,
    kCameraZControl = 1,
    kStellarBrightnessControl = 2,
    kStellarContrastControl = 3,
    kClippingSphereControl = 4,
    kMouseControlCount = 5,
};

// The resource numbers do not follow the order of the controls; the brightness help text is
// spelt as the program has always shown it. A control that a chart's keys stand in for names
// them after its help, in brackets (see ChartKeys).
inline constexpr std::array<MouseControlEntry, kMouseControlCount> kMouseControls { {
    { "Track Ball", MouseControlClass::Trackball, 1, Qt::SizeAllCursor, { 0.02, 0.02, 0.25, 0.25 },
        "Virtual Trackball: Rotate nightdome  [arrows]" },
    // Vertical only: nothing linked to its horizontal axis ever changes.
    { "Camera Z", MouseControlClass::Trackball, 2, Qt::SizeVerCursor, { 0.0, -0.3, 0.0, 0.25 },
        "Camera Distance: Zoom in and out  [+ -, wheel]" },
    { "Stellar Brightness", MouseControlClass::Slider, 3, Qt::SizeHorCursor, { 1.03, 0.1, 5e12, 0 },
        "Stellar Brightness: Change absoulue luminosity" },
    { "Stellar Contrast", MouseControlClass::Slider, 5, Qt::SizeHorCursor, { 1.02, 0.1, 8.0, 0 },
        "Stellar Contrast: Change relative luminosity" },
    { "Clipping Sphere", MouseControlClass::Slider, 4, Qt::SizeHorCursor, { 1.02, 0.5, 10000.0, 0 },
        "Clipping Sphere: Hide stars beyond radius R" },
} };

// The controls stand side by side, this many pixels from one left edge to the next.
inline constexpr float kMouseControlSpacing = 32.0f;

// Builds the control entry describes at frame (inclusive, in parent's coordinates), initialised,
// unlinked and carrying its help text. Owned by parent, or by the caller when parent is null.
// The result is a TrackballControl or a SliderControl, as entry.kind says.
MouseControl* MakeMouseControl(const MouseControlEntry& entry, BRect frame, QWidget* parent);
