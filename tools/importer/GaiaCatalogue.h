// The binary star catalogue built from Gaia DR3 and Hipparcos that Debian's stellarium-data
// package carries (usr/share/stellarium/stars/hip_gaia3/), and the files of names, types and
// cross-identifications beside it.
//
// A star file, all numbers little-endian:
//   header, 28 bytes: uint32 magic 0x835F040A, int32 data type (0), int32 major version (0),
//     int32 minor version, int32 zone level L, int32 the brightest magnitude of the file in
//     millimagnitudes, float32 the epoch as a Julian date (2457389.0, J2016.0);
//   20 * 4^L + 1 int32 star counts, one per zone of the sky;
//   then the stars of every zone, 48 bytes each:
//     int64 Gaia DR3 source id (0 for a star only Hipparcos measured);
//     int32 x, y, z: the unit direction at the file's epoch times 2e9, equatorial frame of
//       J2000 (x toward right ascension 0 h, y toward 6 h, z toward the north pole);
//     int32 x, y, z: the proper motion, the change of that direction in microarcseconds a year;
//     int16 B-V and int16 V in millimagnitudes;
//     uint16 parallax in units of 0.02 mas; uint16 its error in units of 0.01 mas;
//     int16 radial velocity in 0.1 km/s;
//     uint16 line of the star's spectral type in the types file (0: none);
//     uint8 object type;
//     24 bits: the Hipparcos number times 32 plus the star's component (0: none, 1: A, 2: B...).
// Checked against known stars: Sirius 379.2 mas, V -1.46, HIP 32349 A, type A0mA1Va; Proxima
// Centauri 768.06 mas; Barnard's Star 546.98 mas, proper motion -801.6 and +10362.4 mas a year.
#pragma once

#include "tools/importer/ImportStar.h"

#include <cstdint>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

inline constexpr uint32_t kGaiaMagic = 0x835F040A;
inline constexpr int kGaiaHeaderBytes = 28;
inline constexpr int kGaiaRecordBytes = 48;
// Zone levels of the files that exist go up to 8 or so; beyond 12 the count table alone would
// pass a gigabyte.
inline constexpr int kGaiaMaxLevel = 12;
// A star's parallax must be at least this many times its error.
inline constexpr double kGaiaParallaxSigmas = 5;

// Whether the bytes start like a star file of this catalogue.
bool IsGaiaStarFile(std::string_view bytes);

// What the files beside the star files say about the stars, each part empty when its file is
// missing.
struct GaiaLabels {
    std::vector<std::string> spectralTypes; // by line of the types file; line 0 is empty
    std::unordered_map<uint32_t, std::string> iauNames; // Hipparcos number -> IAU name
    // Hipparcos number or Gaia id -> its Bayer and Flamsteed designations, each as
    // WrittenOutDesignation reads them ("alpha1 Cen", "61 Cyg B", "R And").
    std::unordered_multimap<uint64_t, std::string> designations;
    struct CrossId {
        uint32_t hd = 0, hr = 0;
    };
    // (Hipparcos number or Gaia id) * 32 + component -> the star's HD and HR numbers.
    std::unordered_map<uint64_t, CrossId> crossIds;
};

// Readers of the label files, each throwing ImportError with file and place on bad input.
// The types file: one type a line.
void ReadGaiaSpectralTypes(std::string_view text, GaiaLabels& labels);
// common_star_names.fab: lines "  32349|_("Sirius") 2", '#' comments.
void ReadGaiaIauNames(std::string_view text, const std::string& file, GaiaLabels& labels);
// name.fab: lines "  32349|α_CMa", the number a Hipparcos number or a Gaia id, '#' comments.
void ReadGaiaDesignations(std::string_view text, const std::string& file, GaiaLabels& labels);
// cross-id.cat: 21-byte records, uint64 Hipparcos number or Gaia id, uint8 component, uint32
// SAO, HD and HR numbers.
void ReadGaiaCrossIds(std::string_view bytes, const std::string& file, GaiaLabels& labels);

// Reads the stars of one star file: those with a parallax of at least kGaiaParallaxSigmas
// times its error, placed at their J2000 position, named and with their other names.
// Throws ImportError naming file, the byte offset and the reason for a file that does not fit
// the format.
void ReadGaiaStars(std::string_view bytes, const std::string& file, const GaiaLabels& labels,
    std::vector<ImportStar>& stars, ImportReport& report);

// Reads a folder holding the catalogue's star files ("stars_<digit>_*.cat", every one, in order
// of name) and the label files beside them (stars_hip_sp_*.cat, common_star_names.fab,
// name.fab, cross-id.cat, each optional), or a single star file with the label files of its
// folder.
void ReadGaiaCatalogue(
    const std::string& path, std::vector<ImportStar>& stars, ImportReport& report);

// "Gaia DR3 2509780430229120256".
std::string GaiaDesignation(uint64_t sourceId);
