// SysColorMap.h: a ColorMap bound to the system palette, as held by every render bitmap and
// terminal view.
#pragma once

#include "render/ColorMap.h"

class SysColorMap : public ColorMap {
public:
    // Borrows system_colors(); never owns a map of its own.
    SysColorMap();
};
