// AppIcon.h: the program's icon for the desktop (menus, task bars, the window's title bar): a
// night dome of deep blue with the Sun, a hot blue star and a red dwarf, drawn in true colour
// with anti-aliased edges at any size, unlike the 8-bit images the program draws with.
#pragma once

#include <cstdint>
#include <filesystem>
#include <string>
#include <vector>

// The sizes the desktop's icon themes ask for, in pixels.
inline constexpr int kAppIconSizes[] = { 16, 32, 48, 64, 128, 256 };

// size x size pixels, rows top to bottom, each 0xAARRGGBB with straight (not premultiplied)
// alpha.
std::vector<uint32_t> DrawAppIcon(int size);

// Writes <folder>/nightdome-<size>.png for every size; false, with the reason, on failure.
bool WriteAppIcons(const std::filesystem::path& folder, std::string* reason);
