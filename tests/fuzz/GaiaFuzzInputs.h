// The fixed half of the Gaia harnesses' inputs: labels for fuzzed star files, and a star file
// for fuzzed labels, small numbers throughout so that fuzzed bytes meet them often.
#pragma once

#include "tests/tools/GaiaFiles.h"
#include "tools/importer/GaiaCatalogue.h"

#include <string>

// A type line, names, designations and cross-identifications for Hipparcos numbers 1 to 4
// and Gaia ids 1 and 2.
inline GaiaLabels GaiaFuzzLabels()
{
    GaiaLabels labels;
    ReadGaiaSpectralTypes("\nA0mA1Va\nK2III\nDA2\nG8III+G1III\nsdM1V\n", labels);
    ReadGaiaIauNames(" 1|_(\"Sirius\") 2\n 4|_(\"Proxima Centauri \") 2\n", "names", labels);
    ReadGaiaDesignations("1|\xCE\xB1_CMa\n1|9_CMa\n2|\xCE\xB1\x31_Cen\n2|61_Cyg\n3|p_Eri\n"
                         "3|R_And\n4|\xCE\xB1_Cen_C\n1|\xCF\x89\x32_Sco\n",
        "designations", labels);
    ReadGaiaCrossIds(GaiaCrossIdBytes({ { 1, 1, 151881, 48915, 2491 }, { 1, 0, 0, 48916, 0 },
                         { 2, 0, 0, 128620, 5459 }, { 3, 2, 0, 7, 0 } }),
        "cross-ids", labels);
    return labels;
}

// Stars that meet every kind of label: Hipparcos numbers 1 to 4 with components 0 to 2, Gaia
// ids 1 and 2, spectral type lines 0 to 6.
inline std::string GaiaFuzzStarFile()
{
    GaiaTestFile file;
    for (uint32_t hip = 0; hip <= 4; hip++) {
        for (int component = 0; component <= 2; component++) {
            GaiaTestStar star;
            star.ra = hip * 50.0 + component;
            star.dec = component * 20.0 - 20;
            star.hip = hip;
            star.component = component;
            star.sourceId = hip % 3;
            star.spectralLine = static_cast<uint16_t>(hip + component);
            star.zone = static_cast<int>(hip);
            file.stars.push_back(star);
        }
    }
    return file.Bytes();
}
