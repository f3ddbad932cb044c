// ColorMap.cpp: borrowing and owning palette handles, colour ramps and nearest-colour search.
#include "render/ColorMap.h"

#include "render/ColorTable.h"
#include "render/SystemPalette.h"

#include <cstdlib>

ColorMap::ColorMap(const color_map* borrowed)
    : map(borrowed != nullptr ? borrowed : system_colors())
    , ownMap(nullptr)
    , ownsMap(false)
{
}

ColorMap::~ColorMap()
{
    ReleaseOwnMap();
}

void ColorMap::ReleaseOwnMap()
{
    if (ownsMap)
        std::free(ownMap);
    ownMap = nullptr;
    ownsMap = false;
}

void ColorMap::NewMap(int32_t id)
{
    ReleaseOwnMap();
    auto* fresh = static_cast<color_map*>(std::malloc(sizeof(color_map)));
    if (fresh == nullptr) {
        map = nullptr;
        return;
    }
    for (rgb_color& entry : fresh->color_list) {
        entry.red = 0;
        entry.green = 0;
        entry.blue = 0;
    }
    fresh->id = id;
    ownMap = fresh;
    map = fresh;
    ownsMap = true;
}

void ColorMap::SetMap(const color_map* newMap)
{
    ReleaseOwnMap();
    map = newMap;
}

void ColorMap::SetIndex(int32_t index, const rgb_color& color)
{
    if (!ownsMap || index < 0 || index > 255)
        return;
    ownMap->color_list[index] = color;
}

void ColorMap::BuildColorRamp(uint8_t start, int32_t count, rgb_color from, rgb_color to)
{
    if (!ownsMap)
        return;
    // Shifting the base pointer by one entry puts ramp position i at color_list[i + 1]; the
    // 255 remaining entries bound the ramp.
    ColorTable::FillRamp(ownMap->color_list + 1, 255, start, count, from, to);
}

uint8_t ColorMap::FindNearestMatch(const rgb_color& color) const
{
    if (map == nullptr)
        return 0;
    int best = 50000;
    int bestIndex = 0;
    for (int i = 0; i < 256; ++i) {
        const rgb_color& entry = map->color_list[i];
        const int distance = std::abs(color.red - entry.red) + std::abs(color.green - entry.green)
            + std::abs(color.blue - entry.blue);
        if (distance < best) {
            best = distance;
            bestIndex = i;
        }
    }
    return static_cast<uint8_t>(bestIndex);
}

void ColorMap::InitIndexMap()
{
    if (!ownsMap)
        return;
    for (uint8_t red = 0; red < 32; ++red)
        for (uint8_t green = 0; green < 32; ++green)
            for (uint8_t blue = 0; blue < 32; ++blue)
                ownMap->index_map[IndexOf15(red, green, blue)]
                    = FindNearestMatch(rgb_color { red, green, blue, 0 });
}
