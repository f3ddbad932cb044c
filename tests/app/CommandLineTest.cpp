// The command line: every option, good and bad, and what the program then starts with.
#include "app/CommandLine.h"

#include <cstdint>
#include <fstream>
#include <gtest/gtest.h>
#include <string>

namespace {

ParsedCommandLine Parse(QStringList arguments)
{
    arguments.prepend("nightdome");
    return ParseCommandLine(arguments);
}

// A mistake: no start, status 2, one line naming what was wrong, then where to read more.
void ExpectMistake(const QStringList& arguments, const std::string& saying)
{
    const ParsedCommandLine parsed = Parse(arguments);
    EXPECT_FALSE(parsed.start) << arguments.join(' ').toStdString();
    EXPECT_EQ(parsed.exitStatus, 2) << arguments.join(' ').toStdString();
    EXPECT_TRUE(parsed.output.empty());
    EXPECT_EQ(parsed.error.rfind("nightdome: ", 0), 0u) << parsed.error;
    EXPECT_NE(parsed.error.find(saying), std::string::npos) << parsed.error;
    EXPECT_NE(
        parsed.error.find("\nTry 'nightdome --help' for more information.\n"), std::string::npos)
        << parsed.error;
}

} // namespace

TEST(CommandLine, NothingStartsWithTheDefaults)
{
    const ParsedCommandLine parsed = Parse({});
    EXPECT_TRUE(parsed.start);
    EXPECT_TRUE(parsed.output.empty());
    EXPECT_TRUE(parsed.error.empty());
    EXPECT_TRUE(parsed.options.catalogue.empty());
    EXPECT_EQ(parsed.options.generate, -1);
    EXPECT_EQ(parsed.options.threads, 0);
}

TEST(CommandLine, HelpListsEveryOptionAndExitsWell)
{
    for (const char* help : { "--help", "-h" }) {
        const ParsedCommandLine parsed = Parse({ help });
        EXPECT_FALSE(parsed.start);
        EXPECT_EQ(parsed.exitStatus, 0);
        EXPECT_TRUE(parsed.error.empty());
        EXPECT_EQ(parsed.output.rfind("Usage: nightdome [options]", 0), 0u) << parsed.output;
        for (const char* option : { "--catalogue <FILE>", "--generate <N>", "--threads <N>",
                 "--help", "--version", "XDG_DATA_DIRS", "ESA/Gaia/DPAC", "CC BY-SA 3.0 IGO",
                 "stellarium-data", "kstars-data", "Southern Stars Group" })
            EXPECT_NE(parsed.output.find(option), std::string::npos) << option;
        // Qt's own options are let through but not advertised.
        EXPECT_EQ(parsed.output.find("platform"), std::string::npos);
    }
}

TEST(CommandLine, VersionPrintsTheVersion)
{
    for (const char* version : { "--version", "-v" }) {
        const ParsedCommandLine parsed = Parse({ version });
        EXPECT_FALSE(parsed.start);
        EXPECT_EQ(parsed.exitStatus, 0);
        EXPECT_EQ(parsed.output,
            std::string("nightdome ") + ProgramVersion() + "\nSky: " + ProgramSky() + "\n");
    }
    EXPECT_STREQ(ProgramVersion(), ND_VERSION);
}

// The sky --version names is the one the build put beside the program: the Gaia sky comes with
// its companion names file and far more systems than the Hipparcos one could hold.
TEST(CommandLine, VersionNamesTheSkyTheBuildMade)
{
    const std::string sky = ProgramSky();
    EXPECT_EQ(sky, ND_SKY);
    const std::string output = Parse({ "--version" }).output;
    EXPECT_NE(output.find("\nSky: " + sky + "\n"), std::string::npos) << output;

    std::ifstream catalogue(ND_APP_DIR "/stars.dat");
    if (!catalogue) {
        EXPECT_EQ(sky.rfind("none (", 0), 0u) << sky;
        return;
    }
    std::string line;
    int64_t lines = 0;
    while (std::getline(catalogue, line))
        lines++;
    const int64_t stars = lines / 2;
    const bool names = std::ifstream(ND_APP_DIR "/stars.names").good();
    if (sky.rfind("Gaia DR3 and Hipparcos (stellarium-data ", 0) == 0) {
        EXPECT_NE(sky.find(") with the 10-parsec census"), std::string::npos) << sky;
        EXPECT_GT(stars, 500000);
        EXPECT_TRUE(names);
    } else {
        EXPECT_EQ(sky, "Hipparcos (kstars-data)");
        EXPECT_GT(stars, 100000);
        EXPECT_LT(stars, 130000);
    }
}

TEST(CommandLine, CatalogueTakesAnyFileName)
{
    for (const QStringList& arguments : { QStringList { "--catalogue", "my stars.dat" },
             QStringList { "--catalogue=my stars.dat" }, QStringList { "-c", "my stars.dat" } }) {
        const ParsedCommandLine parsed = Parse(arguments);
        EXPECT_TRUE(parsed.start);
        EXPECT_EQ(parsed.options.catalogue, "my stars.dat");
    }
    ExpectMistake({ "--catalogue" }, "Missing value after '--catalogue'");
    ExpectMistake({ "--catalogue=" }, "--catalogue needs a file name");
}

TEST(CommandLine, GenerateTakesACountUpToAMillion)
{
    EXPECT_EQ(Parse({ "--generate", "1" }).options.generate, 1);
    EXPECT_EQ(Parse({ "--generate=1000000" }).options.generate, 1000000);
    EXPECT_EQ(Parse({ "-g", " 250 " }).options.generate, 250);
    for (const char* bad : { "0", "-3", "1000001", "many", "12x", "", "1e3", "99999999999" })
        ExpectMistake({ QString("--generate=") + bad }, "--generate takes a number of systems");
}

TEST(CommandLine, ThreadsTakeOneToEight)
{
    for (int n = 1; n <= 8; n++)
        EXPECT_EQ(Parse({ "--threads", QString::number(n) }).options.threads, n);
    for (const char* bad : { "0", "9", "-1", "two", "" })
        ExpectMistake({ QString("--threads=") + bad }, "--threads takes a number from 1 to 8");
}

TEST(CommandLine, OptionsCombine)
{
    const ParsedCommandLine parsed = Parse({ "--generate", "5000", "--threads", "3" });
    EXPECT_TRUE(parsed.start);
    EXPECT_EQ(parsed.options.generate, 5000);
    EXPECT_EQ(parsed.options.threads, 3);
    ExpectMistake({ "--catalogue", "a.dat", "--generate", "10" }, "cannot be used together");
}

TEST(CommandLine, UnknownOptionsAndStrayArgumentsAreMistakes)
{
    ExpectMistake({ "--bogus" }, "Unknown option 'bogus'");
    ExpectMistake({ "-x" }, "Unknown option 'x'");
    ExpectMistake({ "stars.dat" }, "unexpected argument 'stars.dat'");
}

TEST(CommandLine, QtsOwnOptionsPassThrough)
{
    const ParsedCommandLine parsed = Parse({ "-platform", "offscreen", "--threads", "2" });
    EXPECT_TRUE(parsed.start) << parsed.error;
    EXPECT_EQ(parsed.options.threads, 2);
}
