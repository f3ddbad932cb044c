// The catalogue the tests of the real program write beside it, read back the way the program's
// reader groups it: consecutive records at one position make a system. The tests work out from
// it what the program's windows should show.
#pragma once

#include <QByteArray>
#include <QFile>
#include <QList>
#include <QString>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <string>
#include <vector>

// The Sun and stars from 3 to 20 pc; distances are measured from the first system.
inline const char* const kSmallCatalogue = "The Sun\nG2V 4.83 0 0 0\n"
                                           "Sirius\nA0 1.45 -0.494 -0.759 2.477\n"
                                           "Procyon\nF5 2.68 -1.365 0.320 3.228\n"
                                           "Altair\nA7 2.22 2.54 0.87 -4.31\n"
                                           "Vega\nA0 0.58 1.0 4.9 -5.0\n"
                                           "Fomalhaut\nA3 1.74 7.1 -3.7 -1.1\n"
                                           "Pollux\nK0 1.08 -5.0 3.4 7.9\n"
                                           "Arcturus\nK2 -0.3 -8.8 3.7 -5.9\n"
                                           "Capella\nG8 -0.5 2.0 8.5 10.0\n"
                                           "Far One\nB5 -1.0 15.0 -5.0 8.0\n";

// The Harvard letters, each at its place on the class scale (W0 = 0, O0 = 1, ... N9 = 9.9).
constexpr const char* kHarvardLetters = "WOBAFGKMRN";

// A class such as "G2V" on that scale; -1 for text that does not start with a known letter.
inline double ClassValue(const char* text)
{
    const char* letter = text[0] ? std::strchr(kHarvardLetters, text[0]) : nullptr;
    if (!letter)
        return -1;
    return double(letter - kHarvardLetters) + 0.1 * std::atof(text + 1);
}

struct CatalogueStar {
    std::string name;
    std::string type; // as the catalogue spells it: "G2V"
    double classValue = -1; // on the scale above
    double magnitude = 0; // absolute
};

struct CatalogueSystem {
    std::string name; // its first star's
    double x = 0, y = 0, z = 0; // parsecs
    std::vector<CatalogueStar> stars;

    double DistanceFrom(const CatalogueSystem& other) const
    {
        return std::hypot(x - other.x, y - other.y, z - other.z);
    }
};

// The systems of the catalogue at path, in its order; none when it cannot be read.
inline std::vector<CatalogueSystem> ReadCatalogue(const QString& path)
{
    std::vector<CatalogueSystem> systems;
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly))
        return systems;
    const QList<QByteArray> lines = file.readAll().split('\n');
    for (qsizetype i = 0; i + 1 < lines.size(); i += 2) {
        char type[64] = "";
        double magnitude = 0, x = 0, y = 0, z = 0;
        if (std::sscanf(
                lines[i + 1].constData(), "%63s %lf %lf %lf %lf", type, &magnitude, &x, &y, &z)
            != 5)
            break;
        if (systems.empty() || systems.back().x != x || systems.back().y != y
            || systems.back().z != z)
            systems.push_back({ lines[i].toStdString(), x, y, z, {} });
        systems.back().stars.push_back(
            { lines[i].toStdString(), type, ClassValue(type), magnitude });
    }
    return systems;
}
