// The display fields of celestial coordinates as the program prints them: whole hours with
// "%.0f", minutes of time with "%.1f", whole degrees with "%+.0f" and arc-minutes with "%.1f".
#pragma once

#include "core/CCoord.h"

// A copy of a CCoord's four display fields in which nothing that prints as zero carries a minus
// sign: a direction on an axis gives -0 from the arctangent ("-0h -0.0m"), and a value just
// below zero such as -0.04 minutes would print as "-0.0". A non-zero shown value keeps its sign.
//
// The declination's sign belongs to the whole angle, degrees and minutes together. Half a
// degree south reads "-0d 30.0'": the minus on the zero degrees is the only place that sign can
// stand, since the minutes are never negative. When the whole angle shows as zero the sign
// goes with it and the degrees read "+0" ("+0d 0.0'"), as an exact zero prints.
struct ShownCoord {
    explicit ShownCoord(const CCoord& c);

    double raHours;
    double raMinutes;
    double decDegrees;
    double decMinutes;
};
