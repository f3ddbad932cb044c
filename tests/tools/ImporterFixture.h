// A test's own folder for importer runs, and the importer's command run from a test.
#pragma once

#include <gtest/gtest.h>

#include <array>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <memory>
#include <string>
#include <sys/wait.h>
#include <unistd.h>

// A folder of its own for each test, removed at the end.
class ImportFolder : public ::testing::Test {
protected:
    void SetUp() override
    {
        const auto* info = ::testing::UnitTest::GetInstance()->current_test_info();
        fDir = std::filesystem::temp_directory_path()
            / ("nightdome-import-" + std::to_string(getpid()) + "-" + info->name());
        std::filesystem::create_directories(fDir);
    }
    void TearDown() override { std::filesystem::remove_all(fDir); }

    std::string PathOf(const std::string& name) const { return (fDir / name).string(); }

    std::string Write(const std::string& name, const std::string& text) const
    {
        std::ofstream(PathOf(name), std::ios::binary) << text;
        return PathOf(name);
    }

    // The whole content of a file, byte for byte; empty when it cannot be read.
    static std::string Read(const std::string& path)
    {
        std::ifstream in(path, std::ios::binary);
        return std::string(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
    }

    // Runs the command; returns its exit status and puts what it printed into output.
    int Run(const std::string& arguments, std::string* output) const
    {
        return RunShell(std::string(ND_IMPORTER) + " " + arguments, output);
    }

    // Runs a shell command line (for pipes, redirections and limits around the command);
    // returns its exit status and puts what it printed into output.
    static int RunShell(const std::string& commandLine, std::string* output)
    {
        const std::string command = "{ " + commandLine + "; } 2>&1";
        std::unique_ptr<FILE, int (*)(FILE*)> pipe(popen(command.c_str(), "r"), pclose);
        std::array<char, 4096> buffer;
        output->clear();
        size_t got;
        while ((got = fread(buffer.data(), 1, buffer.size(), pipe.get())) > 0)
            output->append(buffer.data(), got);
        const int status = pclose(pipe.release());
        return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    }

    std::filesystem::path fDir;
};
