// The importer's command under bad conditions: numbers that are not, too little memory,
// signals, outputs that are no plain file or are the input, inputs that are folders or pipes.
// Every failure must give a clear message and a non-zero exit, and leave the catalogue that
// was there as it was, with no temporary file beside it.
#include "ImporterFixture.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <chrono>
#include <csignal>
#include <fcntl.h>
#include <filesystem>
#include <spawn.h>
#include <string>
#include <sys/file.h>
#include <sys/stat.h>
#include <sys/types.h>
#include <sys/wait.h>
#include <thread>
#include <unistd.h>
#include <vector>

namespace fs = std::filesystem;

// Sanitizers reserve terabytes of address space for their shadow memory, which no address-space
// limit leaves room for.
#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
#define ND_SANITIZED 1
#elif defined(__has_feature)
#if __has_feature(address_sanitizer) || __has_feature(thread_sanitizer)
#define ND_SANITIZED 1
#endif
#endif

namespace {

const char kPrevious[] = "Earlier\nG2V 4.83 1 2 3\n";

const char kNearby[] = "name,ra,dec,parallax,mag,spect\n"
                       "Sirius,101.287155,-16.716116,379.21,-1.46,A1V\n"
                       "Procyon,114.825493,5.224993,284.56,0.37,F5IV-V\n";

class ImporterCommandTest : public ImportFolder {
protected:
    // The catalogue an import must leave alone when it fails.
    std::string Previous() const { return Write("stars.dat", kPrevious); }

    // Files beside the catalogue whose names start with name: the catalogue and what an
    // import left behind.
    std::vector<std::string> FilesStartingWith(
        const std::string& name, const fs::path& folder) const
    {
        std::vector<std::string> found;
        for (const auto& entry : fs::directory_iterator(folder)) {
            const std::string file = entry.path().filename().string();
            if (file.rfind(name, 0) == 0)
                found.push_back(file);
        }
        std::sort(found.begin(), found.end());
        return found;
    }

    std::vector<std::string> Temporaries() const
    {
        return FilesStartingWith("stars.dat.importing-", fDir);
    }

    // Starts the importer with the signals it handles at their default (a shell would ignore
    // SIGINT in a background job); what it prints goes to a file in the folder.
    pid_t Start(const std::vector<std::string>& arguments) const
    {
        std::vector<std::string> all = { ND_IMPORTER };
        all.insert(all.end(), arguments.begin(), arguments.end());
        std::vector<char*> argv;
        for (std::string& argument : all)
            argv.push_back(argument.data());
        argv.push_back(nullptr);

        posix_spawnattr_t attributes;
        posix_spawnattr_init(&attributes);
        sigset_t standard;
        sigemptyset(&standard);
        for (int signal : { SIGINT, SIGTERM, SIGHUP })
            sigaddset(&standard, signal);
        sigset_t none;
        sigemptyset(&none);
        posix_spawnattr_setsigdefault(&attributes, &standard);
        posix_spawnattr_setsigmask(&attributes, &none);
        posix_spawnattr_setflags(&attributes, POSIX_SPAWN_SETSIGDEF | POSIX_SPAWN_SETSIGMASK);
        posix_spawn_file_actions_t files;
        posix_spawn_file_actions_init(&files);
        const std::string log = PathOf("importer.log");
        posix_spawn_file_actions_addopen(
            &files, STDOUT_FILENO, log.c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0644);
        posix_spawn_file_actions_adddup2(&files, STDOUT_FILENO, STDERR_FILENO);
        pid_t pid = -1;
        if (posix_spawn(&pid, argv[0], &files, &attributes, argv.data(), environ) != 0)
            pid = -1;
        posix_spawn_file_actions_destroy(&files);
        posix_spawnattr_destroy(&attributes);
        return pid;
    }

    // Waits, polling, until the running import has made its temporary file; false when it
    // ended or the time ran out first.
    bool WaitForTemporary(pid_t pid) const
    {
        const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(120);
        while (std::chrono::steady_clock::now() < deadline) {
            if (!Temporaries().empty())
                return true;
            int status;
            if (waitpid(pid, &status, WNOHANG) == pid)
                return false;
            std::this_thread::sleep_for(std::chrono::milliseconds(1));
        }
        return false;
    }

    // Starts a large synthetic import over the previous catalogue and sends it signal once it
    // is writing; returns how it ended (a wait status).
    int SignalWhileWriting(int signal)
    {
        const pid_t pid = Start({ "--generate=500000", "-q", "-o", PathOf("stars.dat") });
        EXPECT_GT(pid, 0);
        if (pid <= 0)
            return 0;
        const bool writing = WaitForTemporary(pid);
        EXPECT_TRUE(writing) << "the import ended before it was seen writing: "
                             << Read(PathOf("importer.log"));
        kill(pid, signal);
        int status = 0;
        waitpid(pid, &status, 0);
        return status;
    }
};

} // namespace

TEST_F(ImporterCommandTest, StarCountsAndSeedsAreWholeNumbers)
{
    const std::string previous = Previous();
    std::string output;
    // A count taken for a number would make the import run; one taken for 100,000,001 would
    // take 27 GB first. Into a folder, an import that ran would be refused before it
    // generated anything (exit 1).
    fs::create_directories(fDir / "folder");
    for (const char* count :
        { "5x", "-5", "0", "100000001", "99999999999999999999", "", "+5", " 5", "0x10" }) {
        const std::string out = std::string(count) == "100000001" ? PathOf("folder") : previous;
        EXPECT_EQ(Run(std::string("--generate='") + count + "' -o " + out, &output), 2) << count;
        EXPECT_NE(output.find(std::string("--generate needs a star count from 1 to "
                                          "100,000,000, not '")
                      + count + "'"),
            std::string::npos)
            << output;
    }
    for (const char* seed : { "7x", "-1", "18446744073709551616", "" }) {
        EXPECT_EQ(Run(std::string("--generate=5 --seed='") + seed + "' -o " + previous, &output), 2)
            << seed;
        EXPECT_NE(output.find(std::string("--seed needs a whole number from 0 to "
                                          "18446744073709551615, not '")
                      + seed + "'"),
            std::string::npos)
            << output;
    }
    EXPECT_EQ(Read(previous), kPrevious);

    EXPECT_EQ(Run("--generate=5 --seed=18446744073709551615 -q -o " + previous, &output), 0)
        << output;
    EXPECT_EQ(Read(previous).rfind("The Sun\n", 0), 0u);
}

TEST_F(ImporterCommandTest, TooLittleMemoryIsReported)
{
#ifdef ND_SANITIZED
    GTEST_SKIP() << "a sanitizer's shadow memory does not fit under an address-space limit";
#else
    const std::string previous = Previous();
    std::string output;
    // 200 MB of address space: the importer itself needs some 20, five million stars more
    // than 500.
    EXPECT_EQ(RunShell("ulimit -v 200000; exec " + std::string(ND_IMPORTER)
                      + " --generate=5000000 -o " + previous,
                  &output),
        1);
    EXPECT_NE(output.find("synthetic catalogue, seed 1: not enough memory for 5,000,000 stars"),
        std::string::npos)
        << output;
    EXPECT_NE(output.find(previous + " was not changed"), std::string::npos) << output;
    EXPECT_EQ(Read(previous), kPrevious);

    // Reading: 400,000 stars take more than 40 MB once read.
    std::string rows = "name,ra,dec,parallax,mag\n";
    for (int i = 0; i < 400000; i++)
        rows += "S" + std::to_string(i) + "," + std::to_string(i % 360) + ".5,"
            + std::to_string(i % 170 - 85) + ".25,100,5\n";
    const std::string big = Write("big.csv", rows);
    EXPECT_EQ(RunShell("ulimit -v 40000; exec " + std::string(ND_IMPORTER) + " " + big + " -o "
                      + previous,
                  &output),
        1);
    EXPECT_NE(output.find(big + ": not enough memory for "), std::string::npos) << output;
    EXPECT_EQ(Read(previous), kPrevious);
    EXPECT_TRUE(Temporaries().empty());
#endif
}

TEST_F(ImporterCommandTest, InterruptedImportRemovesItsTemporaryFile)
{
    const std::string previous = Previous();
    for (int signal : { SIGINT, SIGTERM, SIGHUP }) {
        const int status = SignalWhileWriting(signal);
        EXPECT_TRUE(WIFSIGNALED(status) && WTERMSIG(status) == signal)
            << "signal " << signal << ", wait status " << status;
        EXPECT_TRUE(Temporaries().empty()) << Temporaries().front();
        EXPECT_EQ(Read(previous), kPrevious);
    }
}

TEST_F(ImporterCommandTest, KilledImportsLeftoverIsRemovedByTheNextImport)
{
    const std::string previous = Previous();
    const int status = SignalWhileWriting(SIGKILL);
    EXPECT_TRUE(WIFSIGNALED(status) && WTERMSIG(status) == SIGKILL) << status;
    EXPECT_EQ(Temporaries().size(), 1u);
    EXPECT_EQ(Read(previous), kPrevious);

    std::string output;
    ASSERT_EQ(Run("--generate=10 -o " + previous, &output), 0) << output;
    EXPECT_NE(output.find("Removed 1 temporary file left beside the catalogue by killed imports"),
        std::string::npos)
        << output;
    EXPECT_TRUE(Temporaries().empty());
    EXPECT_EQ(Read(previous).rfind("The Sun\n", 0), 0u);
}

// A temporary file another import holds locked is still being written; files that only look
// alike are the user's.
TEST_F(ImporterCommandTest, OnlyUnlockedTemporaryFilesAreLeftovers)
{
    const std::string previous = Previous();
    const std::string running = Write("stars.dat.importing-AbC123", "The Sun\n");
    const int fd = open(running.c_str(), O_RDONLY);
    ASSERT_GE(fd, 0);
    ASSERT_EQ(flock(fd, LOCK_EX), 0);
    Write("stars.dat.importing-XyZ789", "The Sun\nG2V");
    Write("stars.dat.backup", kPrevious);
    Write("stars.dat.importing-12345", "");
    Write("stars.dat.importing-1234567", "");

    std::string output;
    EXPECT_EQ(Run("--generate=10 -q -o " + previous, &output), 0) << output;
    close(fd);
    EXPECT_EQ(FilesStartingWith("stars.dat.", fDir),
        (std::vector<std::string> { "stars.dat.backup", "stars.dat.importing-12345",
            "stars.dat.importing-1234567", "stars.dat.importing-AbC123" }));
}

TEST_F(ImporterCommandTest, SymbolicLinkIsWrittenThrough)
{
    fs::create_directories(fDir / "data");
    const std::string target = Write("data/real.dat", kPrevious);
    fs::create_symlink("data/real.dat", fDir / "stars.dat");
    std::string output;
    ASSERT_EQ(Run("--generate=10 -q -o " + PathOf("stars.dat"), &output), 0) << output;
    EXPECT_TRUE(fs::is_symlink(fDir / "stars.dat"));
    EXPECT_EQ(fs::read_symlink(fDir / "stars.dat"), "data/real.dat");
    EXPECT_EQ(Read(target).rfind("The Sun\n", 0), 0u);
    EXPECT_EQ(
        FilesStartingWith("real.dat", fDir / "data"), std::vector<std::string> { "real.dat" });

    // A link to a file not there yet makes it.
    fs::create_symlink("data/new.dat", fDir / "new.dat");
    ASSERT_EQ(Run("--generate=10 -q -o " + PathOf("new.dat"), &output), 0) << output;
    EXPECT_TRUE(fs::is_symlink(fDir / "new.dat"));
    EXPECT_EQ(Read(PathOf("data/new.dat")), Read(target));
}

TEST_F(ImporterCommandTest, OutputThatIsNoRegularFileIsRefused)
{
    const std::string input = Write("nearby.csv", kNearby);
    std::string output;

    fs::create_directories(fDir / "folder");
    EXPECT_EQ(Run(input + " -o " + PathOf("folder"), &output), 1);
    EXPECT_NE(
        output.find(PathOf("folder") + ": is a directory, not a regular file"), std::string::npos)
        << output;
    EXPECT_TRUE(fs::is_directory(fDir / "folder"));

    ASSERT_EQ(mkfifo(PathOf("pipe").c_str(), 0644), 0);
    EXPECT_EQ(Run(input + " -o " + PathOf("pipe"), &output), 1);
    EXPECT_NE(
        output.find(PathOf("pipe") + ": is a named pipe, not a regular file"), std::string::npos)
        << output;
    EXPECT_TRUE(fs::is_fifo(fDir / "pipe"));

    // A character device, reached through a link so that nothing can replace the device.
    fs::create_symlink("/dev/null", fDir / "null.dat");
    EXPECT_EQ(Run(input + " -o " + PathOf("null.dat"), &output), 1);
    EXPECT_NE(output.find(PathOf("null.dat")
                  + ": leads to /dev/null, which is a character device, not a "
                    "regular file"),
        std::string::npos)
        << output;
    EXPECT_TRUE(fs::is_symlink(fDir / "null.dat"));
    EXPECT_TRUE(fs::is_character_file("/dev/null"));
    EXPECT_EQ(FilesStartingWith("folder.", fDir), std::vector<std::string> {});
    EXPECT_EQ(FilesStartingWith("pipe.", fDir), std::vector<std::string> {});
}

TEST_F(ImporterCommandTest, ReplacedCatalogueKeepsItsPermissions)
{
    const std::string input = Write("nearby.csv", kNearby);
    std::string output;
    for (mode_t mode : { 0444, 0640, 0600 }) {
        const std::string previous = Previous();
        ASSERT_EQ(chmod(previous.c_str(), mode), 0);
        ASSERT_EQ(Run(input + " -q -o " + previous, &output), 0) << output;
        struct stat st;
        ASSERT_EQ(stat(previous.c_str(), &st), 0);
        EXPECT_EQ(st.st_mode & 07777, mode);
        EXPECT_EQ(Read(previous).rfind("The Sun\n", 0), 0u);
        fs::remove(previous);
    }
    ASSERT_EQ(Run(input + " -q -o " + PathOf("new.dat"), &output), 0) << output;
    struct stat st;
    ASSERT_EQ(stat(PathOf("new.dat").c_str(), &st), 0);
    EXPECT_EQ(st.st_mode & 07777, 0644u);
}

// A catalogue the importer reads, given as the output too: the source would be lost.
TEST_F(ImporterCommandTest, CatalogueIsNotImportedOntoItself)
{
    const std::string source = Write("nearby.csv", kNearby);
    fs::create_symlink("nearby.csv", fDir / "link.csv");
    fs::create_hard_link(source, fDir / "hard.csv");
    std::string output;
    for (const auto& [input, out] : std::vector<std::pair<std::string, std::string>> {
             { source, source }, { PathOf("link.csv"), source }, { source, PathOf("link.csv") },
             { PathOf("hard.csv"), source } }) {
        EXPECT_EQ(Run(input + " -o " + out, &output), 1);
        EXPECT_NE(output.find(input + ": is the output " + out + " too"), std::string::npos)
            << output;
        EXPECT_EQ(Read(source), kNearby);
    }
    EXPECT_EQ(Run("--format=csv /dev/stdin -o " + source + " < " + source, &output), 1);
    EXPECT_NE(output.find("/dev/stdin: is the output " + source + " too"), std::string::npos)
        << output;
    EXPECT_EQ(Read(source), kNearby);
    EXPECT_EQ(FilesStartingWith("nearby.csv.", fDir), std::vector<std::string> {});
}

TEST_F(ImporterCommandTest, NoStarToWriteIsAnError)
{
    const std::string previous = Previous();
    const std::string input = Write("unmeasured.csv",
        "name,ra,dec,parallax,mag\nA,10.0,10.0,,9.0\nB,11.0,10.0,,9.0\nC,12.0,10.0,,9.0\n");
    std::string output;
    EXPECT_EQ(Run(input + " -o " + previous, &output), 1);
    EXPECT_NE(output.find(input
                  + ": no star to write: all 3 stars read were skipped (3 without a usable "
                    "parallax)"),
        std::string::npos)
        << output;
    EXPECT_NE(output.find(previous + " was not changed"), std::string::npos) << output;
    EXPECT_EQ(Read(previous), kPrevious);
}

TEST_F(ImporterCommandTest, DirectoryInputIsNamedSo)
{
    const std::string previous = Previous();
    fs::create_directories(fDir / "folder");
    std::string output;
    EXPECT_EQ(Run(PathOf("folder") + " -o " + previous, &output), 1);
    EXPECT_NE(output.find(PathOf("folder") + ": is a directory"), std::string::npos) << output;
    EXPECT_EQ(Read(previous), kPrevious);
}

TEST_F(ImporterCommandTest, PipesAreReadLikeFiles)
{
    const std::string input = Write("nearby.csv", kNearby);
    std::string output;
    ASSERT_EQ(Run(input + " -q -o " + PathOf("from-file.dat"), &output), 0) << output;
    const std::string expected = Read(PathOf("from-file.dat"));
    ASSERT_EQ(expected.rfind("The Sun\n", 0), 0u);

    ASSERT_EQ(RunShell("cat " + input + " | " + ND_IMPORTER + " /dev/stdin -o "
                      + PathOf("from-stdin.dat"),
                  &output),
        0)
        << output;
    EXPECT_NE(output.find("Read 2 stars from /dev/stdin (plain CSV)"), std::string::npos) << output;
    EXPECT_EQ(Read(PathOf("from-stdin.dat")), expected);

    ASSERT_EQ(mkfifo(PathOf("fifo").c_str(), 0644), 0);
    ASSERT_EQ(RunShell("cat " + input + " > " + PathOf("fifo") + " & " + ND_IMPORTER + " "
                      + PathOf("fifo") + " -q -o " + PathOf("from-fifo.dat")
                      + "; status=$?; wait; exit $status",
                  &output),
        0)
        << output;
    EXPECT_EQ(Read(PathOf("from-fifo.dat")), expected);

    // A last line without its line feed reaches the reader as it was.
    const std::string unterminated = kNearby;
    ASSERT_EQ(RunShell("printf '%s' '" + unterminated.substr(0, unterminated.size() - 1) + "' | "
                      + ND_IMPORTER + " /dev/stdin -q -o " + PathOf("unterminated.dat"),
                  &output),
        0)
        << output;
    EXPECT_EQ(Read(PathOf("unterminated.dat")), expected);
}
