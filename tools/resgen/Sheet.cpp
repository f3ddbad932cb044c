// Sheet.cpp: lays the resources out at real size in one RBitmap8, labelled with the program's
// font, then scales it 4x into a PNG with Qt (pixel-exact, nearest neighbour).
#include "Sheet.h"

#include "Paint.h"
#include "render/SystemPalette.h"

#include <QImage>

#include <algorithm>
#include <cstring>
#include <filesystem>

namespace {

constexpr int kSheetWidth = 700;
constexpr int kSheetHeight = 690;
constexpr int kZoom = 4;

// Copies one w x h frame to (x, y), leaving transparent (255) pixels out.
void Place(RBitmap8& sheet, int x, int y, const uint8_t* frame, int w, int h, bool intensity)
{
    for (int j = 0; j < h; ++j) {
        for (int i = 0; i < w; ++i) {
            const uint8_t v = frame[j * w + i];
            if (intensity)
                sheet.RenderPoint(x + i, y + j, uint8_t(v >> 3)); // grey ramp 0..31
            else if (v != kClear)
                sheet.RenderPoint(x + i, y + j, v);
        }
    }
}

void Label(RBitmap8& sheet, int x, int y, const std::string& text)
{
    int32_t cx = x, cy = y;
    sheet.RenderString(x, cx, cy, text.c_str(), Nearest({ 0, 0, 0 }));
}

const Resource* Find(const std::vector<Resource>& all, const char* type, int id)
{
    for (const Resource& r : all) {
        if (r.type == type && r.id == id)
            return &r;
    }
    return nullptr;
}

// One resource: its frames side by side, on light grey and, when asked, again on dark.
int Row(RBitmap8& sheet, const Resource& r, int x, int y, bool alsoDark, bool intensity = false)
{
    const int frameBytes = r.width * r.height;
    int cx = x;
    const uint8_t dark = Nearest({ 0, 0, 30 });
    for (int pass = 0; pass < (alsoDark ? 2 : 1); ++pass) {
        for (int f = 0; f < r.frames; ++f) {
            if (pass == 1)
                for (int j = 0; j < r.height + 4; ++j)
                    sheet.RenderHLine(cx - 2, y - 2 + j, r.width + 4, dark);
            Place(sheet, cx, y, r.bytes.data() + f * frameBytes, r.width, r.height, intensity);
            cx += r.width + 6;
        }
        cx += 6;
    }
    return cx;
}

} // namespace

bool WriteContactSheet(
    const std::vector<Resource>& all, RBMFont8& font, const std::string& path, std::string* reason)
{
    RBitmap8 sheet(BRect(0.0f, 0.0f, kSheetWidth - 1.0f, kSheetHeight - 1.0f));
    sheet.SetBMFont(&font);
    sheet.EraseMap(Nearest({ 220, 220, 220 }));

    int y = 16;
    Label(sheet, 8, y, "Raw8 0: H-R diagram 300x295");
    Label(sheet, 330, y, "Raw8 5: star3 glow 64x64");
    Row(sheet, *Find(all, "Raw8", 0), 8, y + 6, false);
    Row(sheet, *Find(all, "Raw8", 5), 330, y + 6, false, true);
    Label(sheet, 330, y + 96, "Raw8 2, 3: drag images");
    Row(sheet, *Find(all, "Raw8", 3), Row(sheet, *Find(all, "Raw8", 2), 330, y + 104, true),
        y + 104, true);
    Label(sheet, 330, y + 168, "Raw8 4: marker 8x8");
    Row(sheet, *Find(all, "Raw8", 4), 330, y + 176, true);
    Label(sheet, 330, y + 210, "TGcL 0: on, off");
    Row(sheet, *Find(all, "TGcL", 0), 330, y + 218, true);
    Label(sheet, 330, y + 252, "IPCL 4: clear button");
    Row(sheet, *Find(all, "IPCL", 4), 330, y + 260, true);

    y = 340;
    Label(sheet, 8, y, "McPc 1-5: normal, hover, pressed");
    int x = 8;
    for (int id = 1; id <= 5; ++id) {
        x = Row(sheet, *Find(all, "McPc", id), x, y + 8, false);
        if (id == 3) {
            x = 8;
            y += 44;
        }
    }
    y += 60;
    Label(sheet, 8, y, "IPCL 0-3, 5: normal, hover, pressed");
    x = 8;
    const int buttons[] = { 0, 1, 2, 3, 5 };
    for (int i = 0; i < 5; ++i) {
        x = Row(sheet, *Find(all, "IPCL", buttons[i]), x, y + 8, false);
        if (i == 2) {
            x = 8;
            y += 44;
        }
    }
    y += 60;
    Label(sheet, 8, y, "Dzon 0-6: normal, highlighted");
    x = 8;
    for (int id = 0; id <= 6; ++id) {
        x = Row(sheet, *Find(all, "Dzon", id), x, y + 8, false);
        if (id == 2) {
            x = 8;
            y += 44;
        }
    }
    y += 44;
    Label(sheet, 8, y, "FONT 0: OCR-A 7x14, characters 32..125");
    const Resource& strip = *Find(all, "FONT", 0);
    const uint8_t white = Nearest({ 255, 255, 255 });
    for (int j = 0; j < 22 + strip.height; ++j)
        sheet.RenderHLine(6, y + 4 + j, strip.width + 4, Nearest({ 0, 0, 30 }));
    for (int j = 0; j < strip.height; ++j) {
        for (int i = 0; i < strip.width; ++i) {
            if (strip.bytes[j * strip.width + i] == 255)
                sheet.RenderPoint(8 + i, y + 6 + j, white);
        }
    }
    int32_t tx = 8, ty = y + 38;
    sheet.RenderString(8, tx, ty, "Sirius A  -1.46  A1V  8.6 ly  {x: 2.64, y: -0.5}  #42 <find>?",
        Nearest({ 255, 255, 152 }));

    QImage image(
        sheet.Bits(), sheet.Width(), sheet.Height(), sheet.BytesPerRow(), QImage::Format_Indexed8);
    QList<QRgb> colours;
    for (const rgb_color& c : system_colors()->color_list)
        colours.push_back(qRgb(c.red, c.green, c.blue));
    image.setColorTable(colours);
    const QImage zoomed = image.scaled(image.width() * kZoom, image.height() * kZoom,
        Qt::IgnoreAspectRatio, Qt::FastTransformation);
    const std::string tmp = path + ".tmp.png";
    if (!zoomed.save(QString::fromStdString(tmp), "PNG")) {
        *reason = "cannot write the PNG";
        return false;
    }
    std::error_code error;
    std::filesystem::rename(tmp, path, error);
    if (error) {
        *reason = error.message();
        return false;
    }
    return true;
}
