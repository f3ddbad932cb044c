// ColorMap.h: a handle on a color_map, either borrowed (normally the system palette) or owned and
// built by the program.
#pragma once

#include "render/ColorTypes.h"

#include <cstdint>

class ColorMap {
public:
    // Borrows map (not owned); a null map means the system palette.
    explicit ColorMap(const color_map* map = nullptr);
    ~ColorMap();

    ColorMap(const ColorMap&) = delete;
    ColorMap& operator=(const ColorMap&) = delete;

    // Releases any owned map, then allocates a new one (34052 bytes, owned) whose colours have
    // red, green and blue cleared; alpha and the look-up tables are left as malloc gave them.
    // If memory runs out the handle is left with no map at all.
    void NewMap(int32_t id);
    // Releases any owned map, then borrows map (not owned).
    void SetMap(const color_map* map);
    const color_map* GetMap() const { return map; }

    // Owned maps only: colour index of the palette becomes color; indices outside 0..255 are
    // ignored.
    void SetIndex(int32_t index, const rgb_color& color);
    // Owned maps only: ColorTable's ramp, but ramp position i lands in palette entry i + 1 (one
    // slot above SetIndex). Positions that would land past entry 255 are dropped.
    void BuildColorRamp(uint8_t start, int32_t count, rgb_color from, rgb_color to);
    // Index of the palette entry nearest to color by city-block distance over red, green and blue;
    // the lowest index wins a tie. Searches the map in use, which is the owned map when there is
    // one; returns 0 when there is no map.
    uint8_t FindNearestMatch(const rgb_color& color) const;
    // Owned maps only: asks FindNearestMatch for every raw (red, green, blue) with channels 0..31
    // and stores the answer under that colour's 15-bit key. Raw values below 32 have keys whose
    // components are 0..3, so only those 64 cells are written (each last by the channel values
    // 7, 15, 23, 31) and the rest of the inverse map is left alone. Nothing relies on an owned
    // inverse map; the system palette carries its own complete one.
    void InitIndexMap();

protected:
    const color_map* map; // the map in use; not owned unless it is ownMap
    color_map* ownMap; // malloc'd by NewMap; meaningful only while ownsMap
    bool ownsMap;

private:
    void ReleaseOwnMap();
};
