// Rows of a Southern Stars table written by a test: the header of the tables the program
// ships, and rows with the columns the importer reads.
#pragma once

#include <string>

inline const char* const kSouthernHeader
    = "Type,RA,Dec,pmRA,pmDec,V,B,Dist,RV,SpType,Comp,Delta,Sep,PA,Year,T,a,e,i,w,n,"
      "P,Vtype,Vmin,Vmax,Vper,Vepoch,IDs,Names,\n";

// A row with the columns the reader uses, Comp (the pair of a double star) among them; the
// others empty.
inline std::string SouthernComponentRow(const std::string& comp, const std::string& ra,
    const std::string& dec, const std::string& v, const std::string& b, const std::string& dist,
    const std::string& type, const std::string& ids, const std::string& names)
{
    return "SS," + ra + "," + dec + ",,," + v + "," + b + "," + dist + ",," + type + "," + comp
        + ",,,,,,,,,,,,,,,,," + ids + "," + names + ",\n";
}

// A row of a star that is no part of a double star.
inline std::string SouthernRow(const std::string& ra, const std::string& dec, const std::string& v,
    const std::string& b, const std::string& dist, const std::string& type, const std::string& ids,
    const std::string& names)
{
    return SouthernComponentRow("", ra, dec, v, b, dist, type, ids, names);
}
