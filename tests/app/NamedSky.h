// A small sky whose stars go by other names too, and the names file that gives them: for the
// tests of the names file the program reads beside its catalogue.
#pragma once

#include <cstdint>
#include <string>

// The Sun; alpha Centauri A and B, one system; Proxima; Barnard's Star; a faint star known
// only by its Gaia designation: six stars in five systems, at their places around the Sun.
inline constexpr char kNamedSky[] = "The Sun\nG2V 4.83 0 0 0\n"
                                    "Rigil Kentaurus\nG2V 4.38 -0.5 -1.1 -0.9\n"
                                    "Toliman\nK1V 5.71 -0.5 -1.1 -0.9\n"
                                    "Proxima Centauri\nM5.5Ve 15.5 -0.47 -1.1 -0.9\n"
                                    "Barnard's Star\nM4Ve 13.2 -0.01 0.16 -1.8\n"
                                    "Gaia DR3 2509780430229120256\nM5V 14 1 1 1\n";
inline constexpr int32_t kNamedSkyAlpha = 1, kNamedSkyProxima = 2, kNamedSkyBarnard = 3;

// The other names of the stars of kNamedSky, by the stars' places in it.
inline constexpr char kOtherNames[]
    = "1\talf Cen A\tAlpha Centauri A\tHIP 71683\tHD 128620\tGJ 559 A\n"
      "2\talf Cen B\tHIP 71681\tHD 128621\tGJ 559 B\n"
      "3\tGJ 551\tHIP 70890\tGaia DR3 5853498713190525696\n"
      "4\tGJ 699\tHIP 87937\tGaia DR3 4472832130942575872\n";

// The first two lines of a names file for a catalogue of so many stars and bytes, kNamedSky's
// unless told otherwise.
inline std::string NamesHeader(uint64_t stars = 6, uint64_t bytes = sizeof kNamedSky - 1)
{
    return "nightdome names 1\n" + std::to_string(stars) + " " + std::to_string(bytes) + "\n";
}
