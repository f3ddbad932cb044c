// Images.h: every image resource of the program, drawn by the generator. Each function returns
// the resource's bytes: frames back to back, each frame raw rows of palette indices.
#pragma once

#include "render/RBMFont8.h"

#include <cstdint>
#include <string>
#include <vector>

struct Resource {
    std::string type; // four-character type code
    int32_t id;
    int32_t width, height, frames;
    std::string name; // what it shows, for the contact sheet and docs
    std::vector<uint8_t> bytes;
};

// All resources except the font strip, drawn with font for the texts.
std::vector<Resource> DrawImages(RBMFont8& font);
