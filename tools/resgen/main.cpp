// resgen: draws every image resource of the program with the program's own raster primitives and
// font, deterministically, and writes each as <type>_<id>.raw (frames back to back) into an output
// folder, together with a copy of the font strip. The build embeds that folder's files.
// With --sheet it also writes a PNG contact sheet of every resource at 4x zoom. With --icons it
// writes the program's desktop icons instead, as nightdome-<size>.png.
//
// Usage: resgen <font strip .raw> <output folder> [--sheet <file.png>]
//        resgen --icons <output folder>
#include "AppIcon.h"
#include "Images.h"
#include "Sheet.h"

#include "core/MessageCodes.h"
#include "platform/Resources.h"

#include <cstdio>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <vector>

namespace {

int Fail(const std::string& file, const std::string& reason)
{
    std::fprintf(stderr, "resgen: %s: %s\n", file.c_str(), reason.c_str());
    return 1;
}

// Writes through a temporary file so no half-written resource is ever left behind.
bool WriteFile(const std::filesystem::path& path, const std::vector<uint8_t>& bytes)
{
    const std::filesystem::path tmp = path.string() + ".tmp";
    {
        std::ofstream out(tmp, std::ios::binary);
        out.write(reinterpret_cast<const char*>(bytes.data()), std::streamsize(bytes.size()));
        if (!out)
            return false;
    }
    std::error_code error;
    std::filesystem::rename(tmp, path, error);
    return !error;
}

} // namespace

int main(int argc, char** argv)
{
    if (argc == 3 && std::string(argv[1]) == "--icons") {
        std::string reason;
        if (!WriteAppIcons(argv[2], &reason))
            return Fail(argv[2], reason);
        return 0;
    }
    if (argc != 3 && !(argc == 5 && std::string(argv[3]) == "--sheet"))
        return Fail("usage", "resgen <font strip .raw> <output folder> [--sheet <file.png>]");
    const std::string stripPath = argv[1];
    const std::filesystem::path outDir = argv[2];

    // The font comes from the committed strip, never from the resources being made.
    std::ifstream in(stripPath, std::ios::binary);
    static std::vector<uint8_t> strip(
        (std::istreambuf_iterator<char>(in)), std::istreambuf_iterator<char>());
    constexpr size_t kStripBytes = size_t(kSystemFontStripWidth) * kSystemFontCharHeight;
    if (!in.good() && !in.eof())
        return Fail(stripPath, "cannot read");
    if (strip.size() != kStripBytes)
        return Fail(stripPath,
            "is " + std::to_string(strip.size()) + " bytes, not " + std::to_string(kStripBytes));
    RegisterResource(kFontType, kSystemFontId, strip.data(), strip.size());
    RBMFont8 font(int32_t(kFontType), kSystemFontId, kSystemFontStripWidth, kSystemFontCharHeight,
        kSystemFontCharWidth, kSystemFontFirstChar, kSystemFontLastChar);

    std::vector<Resource> resources = DrawImages(font);
    resources.push_back({ "FONT", 0, kSystemFontStripWidth, kSystemFontCharHeight, 1,
        "\"OCR-A 10pt 672x14e7\" font strip", strip });

    std::error_code error;
    std::filesystem::create_directories(outDir, error);
    if (error)
        return Fail(outDir.string(), error.message());
    for (const Resource& r : resources) {
        if (r.bytes.size() != size_t(r.width) * r.height * r.frames)
            return Fail(r.type + " " + std::to_string(r.id), "has the wrong size");
        const std::filesystem::path path = outDir / (r.type + "_" + std::to_string(r.id) + ".raw");
        if (!WriteFile(path, r.bytes))
            return Fail(path.string(), "cannot write");
    }
    if (argc == 5) {
        std::string reason;
        if (!WriteContactSheet(resources, font, argv[4], &reason))
            return Fail(argv[4], reason);
    }
    return 0;
}
