// SystemPalette.h: the one process-wide 8-bit palette with its inverse and inversion maps.
#pragma once

#include "render/ColorTypes.h"

// The system palette, built on first use (thread-safe) and never freed; not owned by the caller.
// Entry 255 is the transparent entry (alpha 0) and is never the answer of its look-up tables.
const color_map* system_colors();
