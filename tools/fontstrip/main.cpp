// fontstrip: rasterises the OCR-A TrueType font into the program's 8-bit glyph strip, 94 cells of
// 7 x 14 pixels for the characters 32..125 side by side (672 x 14 bytes, ink 255, background 0).
// The strip is committed beside the resources; the build uses that file, not this tool, because
// rasterisers differ between Qt and FreeType versions.
//
// Usage: fontstrip <OCRA.ttf> <output.raw> [pixel size, 12] [ink threshold, 128]
// The committed strip was made with the defaults (Qt 6.4, full hinting).
#include <QFont>
#include <QGuiApplication>
#include <QImage>
#include <QPainter>
#include <QPainterPath>
#include <QRawFont>

#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <vector>

namespace {

constexpr int kCellWidth = 7;
constexpr int kCellHeight = 14;
constexpr int kFirstChar = 32;
constexpr int kLastChar = 125;
constexpr int kStripWidth = 672; // 96 cells; the last two stay empty
// Row of the cell the font's baseline sits on; descenders use the rows below it.
constexpr int kBaselineRow = 10;
// Ink threshold on the antialiased coverage (0..255).
int kThreshold = 128;

int Fail(const char* what, const char* detail)
{
    std::fprintf(stderr, "fontstrip: %s: %s\n", what, detail);
    return 1;
}

} // namespace

int main(int argc, char** argv)
{
    if (argc < 3)
        return Fail("usage", "fontstrip <font.ttf> <output.raw> [pixel size] [threshold]");
    qputenv("QT_QPA_PLATFORM", "offscreen");
    QGuiApplication app(argc, argv);

    const double pixelSize = argc > 3 ? std::atof(argv[3]) : 12.0;
    if (argc > 4)
        kThreshold = std::atoi(argv[4]);
    QRawFont font(QString::fromLocal8Bit(argv[1]), pixelSize, QFont::PreferFullHinting);
    if (!font.isValid())
        return Fail(argv[1], "not a usable TrueType font");

    std::vector<unsigned char> strip(kStripWidth * kCellHeight, 0);
    int errors = 0;
    for (int c = kFirstChar; c <= kLastChar; ++c) {
        // Draw into a canvas three cells wide and tall so ink outside the cell can be seen.
        QImage canvas(kCellWidth * 3, kCellHeight * 3, QImage::Format_Grayscale8);
        canvas.fill(0);
        {
            QPainter painter(&canvas);
            painter.setRenderHint(QPainter::Antialiasing, true);
            const QList<quint32> glyphs = font.glyphIndexesForString(QString(QChar(c)));
            if (glyphs.isEmpty())
                continue;
            const QPainterPath path = font.pathForGlyph(glyphs.first());
            const double advance = font.averageCharWidth();
            // Centre the advance in the cell; the baseline goes to kBaselineRow of the middle cell.
            const double dx = kCellWidth + std::floor((kCellWidth - advance) / 2.0 + 0.5);
            const double dy = kCellHeight + kBaselineRow + 1;
            painter.translate(dx, dy);
            painter.fillPath(path, Qt::white);
        }
        const int column = (c - kFirstChar) * kCellWidth;
        for (int y = 0; y < canvas.height(); ++y) {
            const uchar* row = canvas.constScanLine(y);
            for (int x = 0; x < canvas.width(); ++x) {
                if (row[x] < kThreshold)
                    continue;
                const int cx = x - kCellWidth, cy = y - kCellHeight;
                if (cx < 0 || cx >= kCellWidth || cy < 0 || cy >= kCellHeight) {
                    std::fprintf(stderr,
                        "fontstrip: glyph '%c' (%d) has ink outside its cell at (%d, %d)\n", c, c,
                        cx, cy);
                    ++errors;
                    continue;
                }
                strip[cy * kStripWidth + column + cx] = 255;
            }
        }
    }
    if (errors)
        return Fail(argv[2], "not written: glyphs do not fit their cells (try a smaller size)");

    const std::string tmp = std::string(argv[2]) + ".tmp";
    {
        std::ofstream out(tmp, std::ios::binary);
        out.write(reinterpret_cast<const char*>(strip.data()), std::streamsize(strip.size()));
        if (!out)
            return Fail(tmp.c_str(), "cannot write");
    }
    if (std::rename(tmp.c_str(), argv[2]) != 0)
        return Fail(argv[2], "cannot replace");
    return 0;
}
