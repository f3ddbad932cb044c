// One marker of the H-R diagram: the star it stands for, the system that star belongs to, and
// where the marker's centre is in the diagram.
#pragma once

#include "platform/BPoint.h"

class Star;

struct HRPlot {
    HRPlot() = default;
    HRPlot(long systemIndex, Star* star, BPoint where) { Set(systemIndex, star, where); }

    void Set(long index, Star* plotted, BPoint where)
    {
        systemIndex = index;
        star = plotted;
        x = where.x;
        y = where.y;
    }

    long systemIndex = -1; // in the universe list
    Star* star = nullptr; // not owned
    float x = 0, y = 0; // the marker's centre, in view coordinates
};
