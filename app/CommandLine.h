// The program's command line: what it was asked to start with, or what it printed instead.
#pragma once

#include <QStringList>
#include <cstdint>
#include <string>

// Render threads a chart may be given on the command line.
inline constexpr int32_t kMaxThreadsOption = 8;
// Systems --generate may ask for: as many as the universe holds.
inline constexpr int32_t kMaxGeneratedSystems = 1000000;

struct StartOptions {
    std::string catalogue; // --catalogue: a file in the stars.dat format; empty for the default
    int32_t generate = -1; // --generate: that many random systems instead of a catalogue; -1 none
    int32_t threads = 0; // --threads: render threads per chart; 0 for one per processor
};

struct ParsedCommandLine {
    bool start = false; // false: exit at once with exitStatus
    int exitStatus = 0; // 0 after --help or --version, 2 after a mistake
    std::string output; // for standard output (help, version)
    std::string error; // for standard error (what was wrong)
    StartOptions options;
};

// Reads arguments (the program's name first). Needs no application object, so --help and
// --version work without a display. Qt's own -platform and -display are let through for the
// application object.
ParsedCommandLine ParseCommandLine(const QStringList& arguments);

// The version the program reports.
const char* ProgramVersion();

// The sky the build made the default catalogue from, for instance "Hipparcos (kstars-data)".
const char* ProgramSky();
