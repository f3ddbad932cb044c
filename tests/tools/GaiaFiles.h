// Star files and cross-identification files of the Gaia DR3 and Hipparcos binary catalogue,
// made by tests from the numbers they want the importer to read: a header, the zone counts and
// 48-byte little-endian records, each field in the file's own units.
#pragma once

#include "tools/importer/GaiaCatalogue.h"

#include <array>
#include <cmath>
#include <cstdint>
#include <cstring>
#include <optional>
#include <string>
#include <vector>

// One star as a record holds it.
struct GaiaTestStar {
    uint64_t sourceId = 0;
    // The direction at the file's epoch, degrees; rawDirection, when set, is written instead.
    double ra = 0, dec = 0;
    std::optional<std::array<int32_t, 3>> rawDirection;
    // Proper motion in microarcseconds a year: toward the east (along the right ascension,
    // already multiplied by the cosine of the declination) and toward the north.
    double motionEast = 0, motionNorth = 0;
    std::optional<std::array<int32_t, 3>> rawMotion; // written instead, when set
    int16_t bv = 650; // millimagnitudes
    int16_t v = 5000; // millimagnitudes
    uint16_t parallax = 5000; // 0.02 mas: 100 mas
    uint16_t parallaxError = 10; // 0.01 mas
    int16_t radialVelocity = 0; // 0.1 km/s
    uint16_t spectralLine = 0;
    uint8_t objectType = 0;
    uint32_t hip = 0;
    int component = 0; // 0: none, 1: A, 2: B...
    int zone = 0; // which zone of the file holds it
};

// A whole star file: its header, its stars by zone, and the counts, which tests may set to
// disagree with the stars.
struct GaiaTestFile {
    uint32_t magic = kGaiaMagic;
    int32_t dataType = 0;
    int32_t major = 0;
    int32_t minor = 10;
    int32_t level = 0;
    int32_t brightest = -2000; // millimagnitudes
    float epoch = 2457389.0f; // J2016.0
    std::vector<GaiaTestStar> stars;
    std::optional<std::vector<int32_t>> counts; // written instead of the stars' counts

    static size_t Zones(int32_t level) { return 20 * (size_t { 1 } << (2 * level)) + 1; }

    // The byte offset of the first record.
    size_t FirstRecord() const { return 28 + 4 * Zones(level); }

    std::string Bytes() const
    {
        std::string out;
        Put(out, magic);
        Put(out, dataType);
        Put(out, major);
        Put(out, minor);
        Put(out, level);
        Put(out, brightest);
        uint32_t epochBits;
        std::memcpy(&epochBits, &epoch, sizeof epochBits);
        Put(out, epochBits);
        // Counts set by the test may go with a level no table could be made for.
        const size_t zones = counts ? counts->size() : Zones(level);
        std::vector<int32_t> perZone(zones, 0);
        for (const GaiaTestStar& star : stars)
            perZone.at(static_cast<size_t>(star.zone))++;
        for (int32_t count : counts ? *counts : perZone)
            Put(out, count);
        for (size_t zone = 0; zone < zones; zone++) {
            for (const GaiaTestStar& star : stars) {
                if (static_cast<size_t>(star.zone) == zone)
                    PutStar(out, star);
            }
        }
        return out;
    }

    template <typename T> static void Put(std::string& out, T value)
    {
        using Unsigned = std::make_unsigned_t<T>;
        const auto bits = static_cast<Unsigned>(value);
        for (size_t i = 0; i < sizeof(T); i++)
            out += static_cast<char>((bits >> (8 * i)) & 0xff);
    }

    static void PutStar(std::string& out, const GaiaTestStar& star)
    {
        constexpr double kDegree = 3.14159265358979323846 / 180;
        const double a = star.ra * kDegree, d = star.dec * kDegree;
        const double direction[3]
            = { std::cos(d) * std::cos(a), std::cos(d) * std::sin(a), std::sin(d) };
        // The unit vectors toward the east and the north at the star.
        const double east[3] = { -std::sin(a), std::cos(a), 0 };
        const double north[3]
            = { -std::sin(d) * std::cos(a), -std::sin(d) * std::sin(a), std::cos(d) };
        Put(out, star.sourceId);
        for (int k = 0; k < 3; k++) {
            Put(out,
                star.rawDirection ? (*star.rawDirection)[static_cast<size_t>(k)]
                                  : static_cast<int32_t>(std::lround(direction[k] * 2e9)));
        }
        for (int k = 0; k < 3; k++) {
            Put(out,
                star.rawMotion ? (*star.rawMotion)[static_cast<size_t>(k)]
                               : static_cast<int32_t>(std::lround(
                                   star.motionEast * east[k] + star.motionNorth * north[k])));
        }
        Put(out, star.bv);
        Put(out, star.v);
        Put(out, star.parallax);
        Put(out, star.parallaxError);
        Put(out, star.radialVelocity);
        Put(out, star.spectralLine);
        Put(out, star.objectType);
        const uint32_t hipAndComponent = star.hip * 32 + static_cast<uint32_t>(star.component);
        for (int i = 0; i < 3; i++)
            out += static_cast<char>((hipAndComponent >> (8 * i)) & 0xff);
    }
};

// One record of cross-id.cat.
struct GaiaTestCrossId {
    uint64_t id = 0; // Hipparcos number or Gaia id
    uint8_t component = 0;
    uint32_t sao = 0, hd = 0, hr = 0;
};

inline std::string GaiaCrossIdBytes(const std::vector<GaiaTestCrossId>& records)
{
    std::string out;
    for (const GaiaTestCrossId& r : records) {
        GaiaTestFile::Put(out, r.id);
        GaiaTestFile::Put(out, r.component);
        GaiaTestFile::Put(out, r.sao);
        GaiaTestFile::Put(out, r.hd);
        GaiaTestFile::Put(out, r.hr);
    }
    return out;
}
