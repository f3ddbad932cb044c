// A catalogue file written by a test and removed when the test ends.
#pragma once

#include "platform/ExecutablePath.h"

#include <filesystem>
#include <fstream>
#include <string>
#include <unistd.h>

class TempCatalogue {
public:
    explicit TempCatalogue(const std::string& text,
        std::filesystem::path directory = std::filesystem::temp_directory_path())
        : fPath(directory
            / ("nightdome-test-" + std::to_string(getpid()) + "-" + std::to_string(sCounter++)
                + ".dat"))
    {
        std::ofstream out(fPath, std::ios::binary);
        out << text;
    }
    ~TempCatalogue() { std::filesystem::remove(fPath); }
    TempCatalogue(const TempCatalogue&) = delete;
    TempCatalogue& operator=(const TempCatalogue&) = delete;

    const std::filesystem::path& Path() const { return fPath; }
    std::string PathString() const { return fPath.string(); }

private:
    static inline int sCounter = 0;
    std::filesystem::path fPath;
};

// "stars.dat" beside the test program, as the program has it beside itself; removed when the
// object goes.
class CatalogueBesideProgram {
public:
    explicit CatalogueBesideProgram(const std::string& text)
    {
        std::ofstream out(Path(), std::ios::binary);
        out << text;
    }
    ~CatalogueBesideProgram() { std::filesystem::remove(Path()); }
    CatalogueBesideProgram(const CatalogueBesideProgram&) = delete;
    CatalogueBesideProgram& operator=(const CatalogueBesideProgram&) = delete;

    static std::filesystem::path Path() { return ExecutableDirectory() / "stars.dat"; }
};
