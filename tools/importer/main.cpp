// nightdome-import: writes the program's star catalogue from a published one.
#include "tools/importer/Importer.h"

#include <charconv>
#include <cstdint>
#include <cstdio>
#include <cstring>
#include <iostream>
#include <new>
#include <string>

namespace {

// The most stars --generate makes. An import needs some 270 bytes a star at its peak, so this
// is about 27 GB: past what a benchmark needs and about what a large desktop has.
constexpr int64_t kMaxGenerated = 100000000;

bool Value(const std::string& arg, const char* option, std::string* value)
{
    const size_t n = std::strlen(option);
    if (arg.compare(0, n, option) == 0 && arg.size() > n && arg[n] == '=') {
        *value = arg.substr(n + 1);
        return true;
    }
    return false;
}

// A whole number of decimal digits only, all of text, within the range of T.
template <typename T> bool WholeNumber(const std::string& text, T* value)
{
    if (text.empty() || text.find_first_not_of("0123456789") != std::string::npos)
        return false;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), *value);
    return error == std::errc() && end == text.data() + text.size();
}

int Usage(const std::string& problem)
{
    std::cerr << "nightdome-import: " << problem << "\n(see nightdome-import --help)\n";
    return 2;
}

} // namespace

int main(int argc, char** argv)
{
    ImportOptions options;
    bool quiet = false;
    std::string value;
    for (int i = 1; i < argc; i++) {
        const std::string arg = argv[i];
        if (arg == "-h" || arg == "--help") {
            std::cout << ImporterHelp();
            return 0;
        } else if (arg == "-q" || arg == "--quiet") {
            quiet = true;
        } else if (arg == "-o" || arg == "--output") {
            if (++i == argc)
                return Usage(arg + " needs a file name");
            options.output = argv[i];
        } else if (Value(arg, "--output", &value)) {
            options.output = value;
        } else if (Value(arg, "--format", &value)) {
            if (value == "kstars")
                options.format = InputFormat::KStars;
            else if (value == "hyg")
                options.format = InputFormat::Hyg;
            else if (value == "csv")
                options.format = InputFormat::Csv;
            else if (value == "southern")
                options.format = InputFormat::SouthernStars;
            else if (value == "gaia")
                options.format = InputFormat::Gaia;
            else
                return Usage("unknown format '" + value + "' (kstars, hyg, csv, southern or gaia)");
        } else if (Value(arg, "--add", &value)) {
            if (value.empty())
                return Usage("--add needs a file name");
            options.add.push_back(value);
        } else if (Value(arg, "--annotate", &value)) {
            if (value.empty())
                return Usage("--annotate needs a file name");
            options.annotate.push_back(value);
        } else if (Value(arg, "--generate", &value)) {
            if (!WholeNumber(value, &options.generate) || options.generate < 1
                || options.generate > kMaxGenerated)
                return Usage(
                    "--generate needs a star count from 1 to 100,000,000, not '" + value + "'");
        } else if (Value(arg, "--seed", &value)) {
            if (!WholeNumber(value, &options.seed))
                return Usage("--seed needs a whole number from 0 to " + std::to_string(UINT64_MAX)
                    + ", not '" + value + "'");
        } else if (!arg.empty() && arg[0] == '-') {
            return Usage("unknown option " + arg);
        } else if (options.input.empty()) {
            options.input = arg;
        } else {
            return Usage("only one input catalogue, please");
        }
    }
    if (options.generate < 0 && options.input.empty())
        return Usage("no input catalogue given");

    try {
        const ImportResult result = RunImport(options);
        if (!quiet)
            std::cout << DescribeImport(result) << "Catalogue written to " << options.output
                      << "\n";
    } catch (const ImportError& error) {
        std::cerr << "nightdome-import: " << error.what() << "\n";
        std::cerr << "nightdome-import: " << options.output << " was not changed.\n";
        return 1;
    } catch (const std::bad_alloc&) {
        // Outside the import, which reports its own shortage with the star count.
        std::cerr << "nightdome-import: not enough memory\n";
        return 1;
    }
    return 0;
}
