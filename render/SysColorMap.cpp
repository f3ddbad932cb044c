// SysColorMap.cpp: binding to the system palette.
#include "render/SysColorMap.h"

#include "render/SystemPalette.h"

SysColorMap::SysColorMap()
    : ColorMap(system_colors())
{
}
