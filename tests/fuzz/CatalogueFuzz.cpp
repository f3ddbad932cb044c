// Fuzzing the program's catalogue reader. The first byte of an input picks the size of the
// reading window, so that records fall across its edges; the rest is the catalogue. Whatever the
// window, the universe read and what the reading reports are those a window holding the whole
// input gives; every name is one line of at most 79 characters, every number finite, and an
// input with a NUL byte reads as no catalogue at all. The input's first line, scanned as a data
// line, reads exactly as the C library reads it.
#include "ImportRoundTrip.h"

#include "catalog/CNumbers.h"
#include "catalog/Star.h"
#include "catalog/Universe.h"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <cstring>
#include <memory>
#include <string>

namespace {

using File = std::unique_ptr<std::FILE, int (*)(std::FILE*)>;

CatalogueReport Read(std::string& text, size_t window, Universe* universe)
{
    File file(fmemopen(text.data(), text.size(), "rb"), &std::fclose);
    FuzzCheck(file != nullptr, "cannot open the input as a file");
    CatalogueReport report;
    ReadCatalogue(file.get(), 1000000, universe, window, &report);
    return report;
}

// Doubles compared as the bits they are, so that NaN read twice counts as the same.
bool Same(double a, double b)
{
    return std::memcmp(&a, &b, sizeof a) == 0;
}

// The input's first line, up to 500 characters, read as a data line by the reader's scanner,
// from a buffer of its own size and from one it may load past the line, must give exactly
// what the C library's sscanf gives.
void CheckDataLineAgainstTheCLibrary(const std::string& text)
{
    const size_t length = std::min(text.find('\n'), std::min<size_t>(text.size(), 500));
    const std::string line = text.substr(0, length);
    struct Fields {
        int count;
        char word[501];
        double values[4];
    };
    Fields reference {}, exact {}, padded {};
    for (Fields* f : { &reference, &exact, &padded }) {
        std::strcpy(f->word, "unset");
        for (double& value : f->values)
            value = -777;
    }
    reference.count = std::sscanf(line.c_str(), "%500s %lf %lf %lf %lf", reference.word,
        &reference.values[0], &reference.values[1], &reference.values[2], &reference.values[3]);
    const auto own = std::make_unique<char[]>(length + 1);
    std::memcpy(own.get(), line.data(), length);
    exact.count = ScanCatalogueData(own.get(), own.get() + length, exact.word, &exact.values[0],
        &exact.values[1], &exact.values[2], &exact.values[3]);
    std::string roomy = line + std::string(16, '7');
    padded.count = ScanCatalogueData(roomy.data(), roomy.data() + length,
        roomy.data() + roomy.size(), padded.word, &padded.values[0], &padded.values[1],
        &padded.values[2], &padded.values[3]);
    for (const Fields* f : { &exact, &padded }) {
        FuzzCheck(f->count == reference.count, "a data line scans a different number of fields");
        FuzzCheck(std::strcmp(f->word, reference.word) == 0, "a data line's class differs");
        for (int i = 0; i < 4; i++)
            FuzzCheck(Same(f->values[i], reference.values[i]), "a data line's number differs");
    }
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    if (size < 2)
        return 0;
    const size_t window = 1 + size_t(data[0]) * 7;
    std::string text(reinterpret_cast<const char*>(data) + 1, size - 1);
    CheckDataLineAgainstTheCLibrary(text);

    Universe small(5000), whole(5000);
    const CatalogueReport smallReport = Read(text, window, &small);
    // A window that holds the whole input reads it as the program's megabyte window does.
    const CatalogueReport wholeReport = Read(text, text.size() + 1, &whole);
    FuzzCheck(smallReport == wholeReport, "the window changes what the reading reports");
    FuzzCheck(!wholeReport.notText || (whole.IsEmpty() && wholeReport.malformed == 0),
        "a text with NUL bytes leaves systems or problems behind");
    FuzzCheck(wholeReport.notText == (std::memchr(text.data(), '\0', text.size()) != nullptr),
        "NUL bytes are missed or imagined");
    FuzzCheck(small.CountItems() == whole.CountItems(), "the window changes the systems read");
    for (int32_t s = 0; s < whole.CountItems(); s++) {
        const StarSystem* a = small.SystemAt(s);
        const StarSystem* b = whole.SystemAt(s);
        FuzzCheck(std::strcmp(a->GetName(), b->GetName()) == 0, "the window changes a name");
        FuzzCheck(Same(a->position.x, b->position.x) && Same(a->position.y, b->position.y)
                && Same(a->position.z, b->position.z),
            "the window changes a position");
        FuzzCheck(std::isfinite(b->position.x) && std::isfinite(b->position.y)
                && std::isfinite(b->position.z),
            "a position is not finite");
        FuzzCheck(a->CountItems() == b->CountItems(), "the window changes a system's stars");
        for (int32_t k = 0; k < b->CountItems(); k++) {
            const Star* p = a->StarAt(k);
            const Star* q = b->StarAt(k);
            FuzzCheck(std::strcmp(p->GetName(), q->GetName()) == 0, "the window changes a name");
            FuzzCheck(std::strcmp(p->GetSpectralClassString(), q->GetSpectralClassString()) == 0,
                "the window changes a spectral class");
            FuzzCheck(Same(p->GetMagnitude(), q->GetMagnitude()), "the window changes a magnitude");
            FuzzCheck(std::isfinite(q->GetMagnitude()), "a magnitude is not finite");
            const size_t length = std::strlen(q->GetName());
            FuzzCheck(length <= 79, "a name is longer than 79 characters");
            FuzzCheck(
                std::memchr(q->GetName(), '\n', length) == nullptr, "a name holds a line feed");
        }
    }
    return 0;
}
