// Sheet.h: the contact sheet, every resource frame by frame at 4x zoom on the window background,
// transparent images also on the chart's dark background.
#pragma once

#include "Images.h"

#include <string>
#include <vector>

bool WriteContactSheet(const std::vector<Resource>& resources, RBMFont8& font,
    const std::string& path, std::string* reason);
