// The least work a frame of the chart must do: every system's position transformed and
// projected, culled against the draw mask, the camera plane and the frame, and one pixel added
// for each system on screen. No glows, no picking, no colour tables, no overlay, one thread.
// Frames are measured against it: their ratio to it holds where milliseconds move with the
// machine and the minute.
#pragma once

#include "chart/UniverseView.h"

#include <cstdint>

// Runs the kernel over the view's data in its current transform into pixels (the view's
// frame, pitch bytes a row); returns how many systems were on screen.
int64_t LimitKernel(const UniverseView::StarPassData& data, const SMatrix& transform,
    double focalLength, const BRect& frame, uint8_t* pixels, int32_t pitch);
