// What the program starts with: the catalogue found where it is installed, one given on the
// command line, a generated sky, and one clear line for each thing that goes wrong.
#include "app/StartUniverse.h"
#include "app/ThreeDNightdomeApp.h"
#include "catalog/Star.h"
#include "chart/UniverseView.h"
#include "chart/UniverseWindow.h"
#include "platform/ExecutablePath.h"
#include "widgets/InfoView.h"

#include <QDir>
#include <QFile>
#include <QFontMetrics>
#include <QProcess>
#include <QProgressBar>
#include <QProgressDialog>
#include <QTemporaryDir>
#include <QTest>
#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <memory>
#include <set>
#include <unistd.h>

namespace {

namespace fs = std::filesystem;

void Write(const fs::path& path, const std::string& text)
{
    fs::create_directories(path.parent_path());
    std::ofstream(path, std::ios::binary) << text;
}

// n stars, each a system of its own.
std::string Stars(int n)
{
    std::string text;
    for (int i = 0; i < n; i++)
        text += "Star " + std::to_string(i) + "\nG2V 4.8 " + std::to_string(i + 1) + " 0 0\n";
    return text;
}

int64_t CountStars(const Universe& universe)
{
    int64_t stars = 0;
    for (int32_t i = 0; i < universe.CountItems(); i++)
        stars += universe.SystemAt(i)->CountItems();
    return stars;
}

// Whether text fits the control window's help line, in the font the line shows it in.
bool FitsTheHelpLine(const std::string& text)
{
    const QFontMetrics metrics(QApplication::font("QLabel"));
    return metrics.horizontalAdvance(QString::fromStdString(text)) <= kHelpLineWidth;
}

// The catalogue at path started with, its universe owned by the caller.
StartedUniverse StartWith(const fs::path& path)
{
    StartOptions options;
    options.catalogue = path.string();
    return StartUniverse(options);
}

// Watches, while it lives, for progress windows: the label of each one shown, and the values
// their bars are painted with.
class ProgressWatch : public QObject {
public:
    ProgressWatch() { QCoreApplication::instance()->installEventFilter(this); }
    ~ProgressWatch() override { QCoreApplication::instance()->removeEventFilter(this); }

    std::vector<QString> shown;
    std::vector<int> painted;
    int maximum = 0;

protected:
    bool eventFilter(QObject* watched, QEvent* event) override
    {
        if (event->type() == QEvent::Show) {
            if (auto* dialog = qobject_cast<QProgressDialog*>(watched)) {
                shown.push_back(dialog->labelText());
                maximum = dialog->maximum();
            }
        } else if (event->type() == QEvent::Paint) {
            auto* bar = qobject_cast<QProgressBar*>(watched);
            if (bar && qobject_cast<QProgressDialog*>(bar->parentWidget()))
                painted.push_back(bar->value());
        }
        return false;
    }
};

// The user's data folders pointed at folders of the test's own while it runs.
class DataFolders : public ::testing::Test {
protected:
    void SetUp() override
    {
        ASSERT_TRUE(fDir.isValid());
        fHome = fs::path(fDir.filePath("home").toStdString());
        fFirst = fs::path(fDir.filePath("first").toStdString());
        fSecond = fs::path(fDir.filePath("second").toStdString());
        fSavedHome = qgetenv("XDG_DATA_HOME");
        fSavedDirs = qgetenv("XDG_DATA_DIRS");
        qputenv("XDG_DATA_HOME", QByteArray::fromStdString(fHome.string()));
        qputenv(
            "XDG_DATA_DIRS", QByteArray::fromStdString(fFirst.string() + ":" + fSecond.string()));
    }
    void TearDown() override
    {
        qputenv("XDG_DATA_HOME", fSavedHome);
        qputenv("XDG_DATA_DIRS", fSavedDirs);
    }

    // Whether a catalogue beside this test or in the prefix the program was built for would
    // come before the data folders.
    static bool InstalledCatalogueInTheWay()
    {
        const std::vector<fs::path> candidates = CatalogueCandidates();
        for (const fs::path& candidate : candidates) {
            const std::string text = candidate.string();
            if (text.find("/first/") != std::string::npos
                || text.find("/home/") != std::string::npos)
                continue;
            if (fs::exists(candidate))
                return true;
        }
        return false;
    }

    QTemporaryDir fDir;
    fs::path fHome, fFirst, fSecond;
    QByteArray fSavedHome, fSavedDirs;
};

} // namespace

TEST_F(DataFolders, CandidatesRunFromBesideTheProgramToTheSystemsDataFolders)
{
    const std::vector<fs::path> candidates = CatalogueCandidates();
    const auto at = [&](const fs::path& path) {
        return std::find(candidates.begin(), candidates.end(), path) - candidates.begin();
    };
    const auto n = std::ptrdiff_t(candidates.size());
    const std::ptrdiff_t beside = at(ExecutableDirectory() / "stars.dat");
    const std::ptrdiff_t home = at(fHome / "nightdome" / "stars.dat");
    const std::ptrdiff_t first = at(fFirst / "nightdome" / "stars.dat");
    const std::ptrdiff_t second = at(fSecond / "nightdome" / "stars.dat");
    ASSERT_LT(beside, n);
    ASSERT_LT(home, n);
    ASSERT_LT(first, n);
    ASSERT_LT(second, n);
    EXPECT_EQ(beside, 0);
    EXPECT_EQ(home, 1);
    EXPECT_LT(first, second);
    // The installation's own folders stand between the user's and the system's.
    int installed = 0;
    for (std::ptrdiff_t i = home + 1; i < first; i++) {
        EXPECT_EQ(candidates[size_t(i)].parent_path().filename(), "nightdome");
        EXPECT_EQ(candidates[size_t(i)].parent_path().parent_path().filename(), "share");
        installed++;
    }
    EXPECT_GE(installed, 1);
    EXPECT_EQ(std::set<fs::path>(candidates.begin(), candidates.end()).size(), candidates.size());
}

TEST_F(DataFolders, TheUsersDataFolderComesBeforeTheSystems)
{
    if (InstalledCatalogueInTheWay())
        GTEST_SKIP() << "a catalogue is installed where the program was built to look first";
    Write(fHome / "nightdome" / "stars.dat", Stars(3));
    Write(fSecond / "nightdome" / "stars.dat", Stars(5));
    StartedUniverse started = StartUniverse(StartOptions());
    std::unique_ptr<Universe> universe(started.universe);
    EXPECT_EQ(started.catalogue, fHome / "nightdome" / "stars.dat");
    EXPECT_EQ(universe->CountItems(), 3);
    EXPECT_TRUE(started.report.empty()) << started.report;
    EXPECT_TRUE(started.helpLine.empty());

    fs::remove(fHome / "nightdome" / "stars.dat");
    started = StartUniverse(StartOptions());
    universe.reset(started.universe);
    EXPECT_EQ(started.catalogue, fSecond / "nightdome" / "stars.dat");
    EXPECT_EQ(universe->CountItems(), 5);
}

TEST_F(DataFolders, NoCatalogueAnywhereStartsAnEmptySkyAndSaysWhereItLooked)
{
    if (InstalledCatalogueInTheWay())
        GTEST_SKIP() << "a catalogue is installed where the program was built to look";
    const StartedUniverse started = StartUniverse(StartOptions());
    std::unique_ptr<Universe> universe(started.universe);
    ASSERT_NE(universe, nullptr);
    EXPECT_TRUE(universe->IsEmpty());
    EXPECT_EQ(
        started.report.rfind("nightdome: no star catalogue found (looked for stars.dat in ", 0), 0u)
        << started.report;
    EXPECT_NE(started.report.find((fFirst / "nightdome").string()), std::string::npos);
    EXPECT_NE(started.report.find("starting with an empty sky"), std::string::npos);
    EXPECT_EQ(std::count(started.report.begin(), started.report.end(), '\n'), 1);
    EXPECT_EQ(started.helpLine, "No star catalogue found: the sky is empty");
}

TEST(StartUniverse, AGivenCatalogueIsReadWhereverItLies)
{
    QTemporaryDir dir;
    const fs::path path = fs::path(dir.filePath("my stars.dat").toStdString());
    Write(path, Stars(4));
    StartOptions options;
    options.catalogue = path.string();
    const StartedUniverse started = StartUniverse(options);
    std::unique_ptr<Universe> universe(started.universe);
    EXPECT_EQ(universe->CountItems(), 4);
    EXPECT_EQ(started.catalogue, path);
    EXPECT_TRUE(started.report.empty());
    EXPECT_TRUE(started.helpLine.empty());
}

TEST(StartUniverse, ACatalogueThatCannotBeReadIsNamedWithTheReason)
{
    QTemporaryDir dir;
    const std::string missing = dir.filePath("nowhere.dat").toStdString();
    StartOptions options;
    options.catalogue = missing;
    StartedUniverse started = StartUniverse(options);
    std::unique_ptr<Universe> universe(started.universe);
    EXPECT_TRUE(universe->IsEmpty());
    EXPECT_TRUE(started.catalogue.empty());
    EXPECT_EQ(started.report,
        "nightdome: cannot read the star catalogue '" + missing
            + "': No such file or directory; starting with an empty sky\n");
    EXPECT_EQ(started.helpLine, "Cannot read nowhere.dat: No such file or directory");

    options.catalogue = dir.path().toStdString();
    started = StartUniverse(options);
    universe.reset(started.universe);
    EXPECT_TRUE(universe->IsEmpty());
    EXPECT_EQ(started.report,
        "nightdome: cannot read the star catalogue '" + options.catalogue
            + "': it is a folder; starting with an empty sky\n");

    if (geteuid() != 0) { // root reads whatever the permissions say
        const fs::path locked = fs::path(dir.filePath("locked.dat").toStdString());
        Write(locked, Stars(2));
        fs::permissions(locked, fs::perms::none);
        options.catalogue = locked.string();
        started = StartUniverse(options);
        universe.reset(started.universe);
        EXPECT_TRUE(universe->IsEmpty());
        EXPECT_NE(started.report.find("': Permission denied; starting"), std::string::npos)
            << started.report;
    }
}

TEST(StartUniverse, AnEmptyCatalogueIsSaidToHoldNoStars)
{
    QTemporaryDir dir;
    const fs::path path = fs::path(dir.filePath("empty.dat").toStdString());
    Write(path, "");
    StartOptions options;
    options.catalogue = path.string();
    const StartedUniverse started = StartUniverse(options);
    std::unique_ptr<Universe> universe(started.universe);
    EXPECT_TRUE(universe->IsEmpty());
    EXPECT_EQ(started.report,
        "nightdome: the star catalogue '" + path.string()
            + "' holds no stars; starting with an empty sky\n");
    EXPECT_EQ(started.helpLine, "empty.dat holds no stars: the sky is empty");
}

TEST(StartUniverse, ACatalogueBeyondTheLimitIsReadUpToItAndSaysSo)
{
    QTemporaryDir dir;
    const fs::path path = fs::path(dir.filePath("big.dat").toStdString());
    Write(path, Stars(5));
    StartOptions options;
    options.catalogue = path.string();
    StartedUniverse started = StartUniverse(options, 3);
    std::unique_ptr<Universe> universe(started.universe);
    EXPECT_EQ(CountStars(*universe), 3);
    EXPECT_STREQ(universe->SystemAt(2)->GetName(), "Star 2");
    EXPECT_EQ(started.report,
        "nightdome: the star catalogue '" + path.string()
            + "' holds more than 3 stars, the most the program holds; only the first 3 were "
              "read\n");
    EXPECT_EQ(started.helpLine, "Read only the first 3 stars of big.dat");

    // Exactly at the limit nothing is left over, and nothing is said.
    started = StartUniverse(options, 5);
    universe.reset(started.universe);
    EXPECT_EQ(CountStars(*universe), 5);
    EXPECT_TRUE(started.report.empty());
    EXPECT_TRUE(started.helpLine.empty());
}

TEST(StartUniverse, AFileHoldingNulBytesIsNoCatalogue)
{
    // A program, as given with --catalogue /bin/ls: this test program itself.
    const fs::path program = QCoreApplication::applicationFilePath().toStdString();
    StartedUniverse started = StartWith(program);
    std::unique_ptr<Universe> universe(started.universe);
    EXPECT_TRUE(universe->IsEmpty());
    EXPECT_TRUE(started.catalogue.empty());
    EXPECT_EQ(started.report,
        "nightdome: '" + program.string()
            + "' holds NUL bytes, which no text does: it is not a star catalogue; starting with "
              "an empty sky\n");
    EXPECT_EQ(started.helpLine,
        program.filename().string() + " is not a star catalogue: the sky is empty");

    // Two gigabytes of zero bytes (a sparse file): refused at once, not read as phantom stars.
    QTemporaryDir dir;
    const fs::path zeros = fs::path(dir.filePath("zeros.dat").toStdString());
    Write(zeros, "");
    fs::resize_file(zeros, uintmax_t(2) << 30);
    started = StartWith(zeros);
    universe.reset(started.universe);
    EXPECT_TRUE(universe->IsEmpty());
    EXPECT_EQ(started.helpLine, "zeros.dat is not a star catalogue: the sky is empty");
    EXPECT_NE(started.report.find("it is not a star catalogue"), std::string::npos);
}

TEST(StartUniverse, ANameLongerThanALineIsToldWithItsLineAndTheRecordsItSpoils)
{
    QTemporaryDir dir;
    const fs::path path = fs::path(dir.filePath("stars.dat").toStdString());
    // Eight good records (lines 1 to 16), a name of 5,000 characters on line 17, 3 records more.
    Write(path, Stars(8) + std::string(5000, 'N') + "\nG2V 4.8 9 0 0\n" + Stars(3));
    const StartedUniverse started = StartWith(path);
    std::unique_ptr<Universe> universe(started.universe);
    // Read as ever; the file is still the catalogue.
    EXPECT_EQ(started.catalogue, path);
    EXPECT_EQ(universe->SystemAt(7)->GetName(), std::string("Star 7"));
    // The long line gives five records, the shifted pairing spoils the four after it.
    EXPECT_EQ(started.report,
        "nightdome: '" + path.string()
            + "', line 17: a name longer than 500 characters; 9 records malformed\n");
    EXPECT_EQ(started.helpLine, "stars.dat, line 17: name too long; 9 bad records");
    EXPECT_TRUE(FitsTheHelpLine(started.helpLine));
}

TEST(StartUniverse, NumbersNotFiniteAndFarOutOfRangeAreTold)
{
    QTemporaryDir dir;
    const fs::path path = fs::path(dir.filePath("odd.dat").toStdString());
    Write(path,
        Stars(2) + "Nan\nG2V nan 1 2 3\nInf\nK0 1 inf 5 6\nHuge\nM0 2 7 1e400 0\n"
            + "Far\nG2V 4 1e308 0 0\n" + Stars(1));
    const StartedUniverse started = StartWith(path);
    std::unique_ptr<Universe> universe(started.universe);
    EXPECT_EQ(universe->CountItems(), 7);
    EXPECT_EQ(universe->SystemAt(2)->StarAt(0)->magnitude, 0);
    EXPECT_EQ(started.report,
        "nightdome: '" + path.string()
            + "', line 6: a number that is not finite (nan, inf or too large), read as 0; 3 "
              "records with such numbers\n"
              "nightdome: '"
            + path.string()
            + "', line 12: a position beyond a million parsecs or a magnitude beyond 100, kept "
              "as read; 1 record so far out\n");
    EXPECT_EQ(started.helpLine, "odd.dat, line 6: not finite, read as 0; 3 records");
    EXPECT_TRUE(FitsTheHelpLine(started.helpLine));

    const fs::path far = fs::path(dir.filePath("far.dat").toStdString());
    Write(far, Stars(1) + "Far\nG2V 4 1e308 0 0\n");
    const StartedUniverse farStarted = StartWith(far);
    std::unique_ptr<Universe> farUniverse(farStarted.universe);
    EXPECT_EQ(farUniverse->SystemAt(1)->position.x, 1e308);
    EXPECT_EQ(farStarted.helpLine, "far.dat, line 4: far out of range; 1 record");
}

TEST(StartUniverse, EveryHelpLineFitsWithLongFileNamesShortenedInTheirMiddle)
{
    QTemporaryDir dir;
    const std::string longName
        = "the southern sky survey of every star within two hundred parsecs, second edition.dat";
    const fs::path path = fs::path(dir.filePath(QString::fromStdString(longName)).toStdString());
    StartOptions options;
    options.catalogue = path.string();
    const auto check = [&](const std::string& text, int32_t maxStars, const std::string& start,
                           const std::string& end) {
        Write(path, text);
        const StartedUniverse started = StartUniverse(options, maxStars);
        std::unique_ptr<Universe> universe(started.universe);
        EXPECT_TRUE(FitsTheHelpLine(started.helpLine)) << started.helpLine;
        EXPECT_EQ(started.helpLine.rfind(start, 0), 0u) << started.helpLine;
        ASSERT_GE(started.helpLine.size(), end.size());
        EXPECT_EQ(started.helpLine.substr(started.helpLine.size() - end.size()), end)
            << started.helpLine;
        // The name is shortened in its middle, its both ends kept.
        EXPECT_NE(started.helpLine.find("\u2026"), std::string::npos) << started.helpLine;
        EXPECT_NE(started.report.find(longName), std::string::npos) << started.report;
    };
    check(Stars(5), 3, "Read only the first 3 stars of the", "dition.dat");
    check(Stars(5) + "\x7f" + std::string(1, '\0'), 1000000, "the",
        " is not a star catalogue: the sky is empty");
    check("", 1000000, "the", " holds no stars: the sky is empty");
    check(Stars(2) + std::string(1300, 'x') + "\n" + Stars(2), 1000000, "the",
        ", line 5: name too long; 4 bad records");
    const StartedUniverse folder = StartWith(fs::path(dir.path().toStdString()));
    std::unique_ptr<Universe> none(folder.universe);
    EXPECT_TRUE(FitsTheHelpLine(folder.helpLine)) << folder.helpLine;
}

TEST(StartUniverse, ABigCatalogueIsReadUnderAProgressWindow)
{
    QTemporaryDir dir;
    const fs::path path = fs::path(dir.filePath("big stars.dat").toStdString());
    {
        // Records of about 100 bytes, past the size that takes half a second to read.
        std::ofstream out(path, std::ios::binary);
        const std::string name(79, 'n');
        for (int i = 0; uint64_t(out.tellp()) < kProgressCatalogueBytes + 1000; i++)
            out << name << '\n' << "K5V 7.25 " << i << ".125 -" << i << ".5 0.0625\n";
    }
    ProgressWatch watch;
    StartedUniverse started = StartWith(path);
    std::unique_ptr<Universe> universe(started.universe);
    EXPECT_GT(universe->CountItems(), 140000);
    EXPECT_TRUE(started.helpLine.empty()) << started.helpLine;
    ASSERT_EQ(watch.shown.size(), 1u);
    EXPECT_EQ(watch.shown[0].toStdString(), "Reading the star catalogue big stars.dat");
    // Painted as the reading went, sixteen windows of a megabyte, up to the end.
    ASSERT_GE(watch.painted.size(), 8u);
    EXPECT_TRUE(std::is_sorted(watch.painted.begin(), watch.painted.end()));
    EXPECT_EQ(watch.painted.back(), watch.maximum);
    // Gone once the universe is there.
    for (QWidget* widget : QApplication::topLevelWidgets())
        EXPECT_FALSE(qobject_cast<QProgressDialog*>(widget) && widget->isVisible());

    // A small catalogue shows none.
    ProgressWatch quiet;
    const fs::path small = fs::path(dir.filePath("small.dat").toStdString());
    Write(small, Stars(1000));
    started = StartWith(small);
    universe.reset(started.universe);
    EXPECT_EQ(universe->CountItems(), 1000);
    EXPECT_TRUE(quiet.shown.empty());
}

TEST(StartUniverse, GenerateMakesThatManySystems)
{
    StartOptions options;
    options.generate = 1234;
    options.catalogue = "/nowhere/ignored.dat";
    const StartedUniverse started = StartUniverse(options);
    std::unique_ptr<Universe> universe(started.universe);
    EXPECT_EQ(universe->CountItems(), 1234);
    EXPECT_TRUE(started.report.empty());
    EXPECT_TRUE(started.catalogue.empty());
}

// The whole program object: the limit of a million stars said on the help line at start and on
// standard error, and the render threads asked for.
TEST(ThreeDNightdomeAppStart, AMillionAndOneStarsAreReadToTheLimitAndSaidOnTheHelpLine)
{
    QTemporaryDir dir;
    const fs::path path = fs::path(dir.filePath("huge.dat").toStdString());
    {
        std::ofstream out(path, std::ios::binary);
        for (int i = 0; i <= kUniverseMaxStars; i++)
            out << "S\nM5V 12 " << (i / 1000) << ' ' << (i % 1000) << " 1\n";
    }
    StartOptions options;
    options.catalogue = path.string();
    options.threads = 3;
    int argc = 1;
    char name[] = "nightdome";
    char* argv[] = { name, nullptr };
    testing::internal::CaptureStderr();
    ProgressWatch watch;
    auto* application = new ThreeDNightdomeApp(argc, argv, options);
    // Read under a progress window, which is gone once the program's windows are up.
    ASSERT_EQ(watch.shown.size(), 1u);
    EXPECT_EQ(watch.shown[0].toStdString(), "Reading the star catalogue huge.dat");
    EXPECT_FALSE(watch.painted.empty());
    const std::string error = testing::internal::GetCapturedStderr();
    ControlWindow* controls = application->GetControlWindow();
    EXPECT_EQ(CountStars(*controls->GetUniverse()), kUniverseMaxStars);
    const InfoView* line = controls->GetInfoView();
    EXPECT_EQ(line->text(), "Read only the first 1000000 stars of huge.dat");
    EXPECT_LE(QFontMetrics(line->font()).horizontalAdvance(line->text()), line->width());
    EXPECT_EQ(line->width(), kHelpLineWidth);
    EXPECT_NE(error.find("holds more than 1000000 stars"), std::string::npos) << error;
    ASSERT_EQ(controls->UniverseWindows().size(), 1);
    EXPECT_EQ(controls->UniverseWindows().first()->View()->threadCount, 3);
    delete application;
    UniverseWindow::SetRenderThreadCount(0);
}

// The whole program object started on flawed catalogues: what standard error and the control
// window's help line say, and that the line holds it.
TEST(ThreeDNightdomeAppStart, FlawsOfTheCatalogueAreSaidOnStandardErrorAndTheHelpLine)
{
    QTemporaryDir dir;
    const fs::path longName = fs::path(dir.filePath("stars.dat").toStdString());
    Write(longName, Stars(8) + std::string(5000, 'N') + "\nG2V 4.8 9 0 0\n" + Stars(3));
    const fs::path program = QCoreApplication::applicationFilePath().toStdString();
    struct Case {
        fs::path catalogue;
        std::string error;
        std::string helpLine;
        bool empty;
    };
    const Case cases[] = {
        { longName,
            "nightdome: '" + longName.string()
                + "', line 17: a name longer than 500 characters; 9 records malformed\n",
            "stars.dat, line 17: name too long; 9 bad records", false },
        { program,
            "nightdome: '" + program.string()
                + "' holds NUL bytes, which no text does: it is not a star catalogue; starting "
                  "with an empty sky\n",
            program.filename().string() + " is not a star catalogue: the sky is empty", true },
    };
    for (const Case& c : cases) {
        StartOptions options;
        options.catalogue = c.catalogue.string();
        options.threads = 1;
        int argc = 1;
        char name[] = "nightdome";
        char* argv[] = { name, nullptr };
        testing::internal::CaptureStderr();
        auto* application = new ThreeDNightdomeApp(argc, argv, options);
        const std::string error = testing::internal::GetCapturedStderr();
        ControlWindow* controls = application->GetControlWindow();
        EXPECT_NE(error.find(c.error), std::string::npos) << error;
        const InfoView* line = controls->GetInfoView();
        EXPECT_EQ(line->text().toStdString(), c.helpLine);
        EXPECT_LE(QFontMetrics(line->font()).horizontalAdvance(line->text()), line->width());
        EXPECT_EQ(controls->GetUniverse()->IsEmpty(), c.empty);
        delete application;
        UniverseWindow::SetRenderThreadCount(0);
    }
}

// The real program: --help needs no display, a mistake exits with 2, and a catalogue that
// cannot be read is one line on standard error while the program comes up with an empty sky.
TEST(ProgramCommandLine, TheProgramAnswersFromTheCommandLine)
{
    QProcess help;
    QProcessEnvironment bare = QProcessEnvironment::systemEnvironment();
    bare.remove("DISPLAY");
    bare.remove("WAYLAND_DISPLAY");
    bare.remove("QT_QPA_PLATFORM");
    help.setProcessEnvironment(bare);
    help.start(ND_PROGRAM, { "--help" });
    ASSERT_TRUE(help.waitForFinished(30000));
    EXPECT_EQ(help.exitCode(), 0);
    EXPECT_TRUE(help.readAllStandardOutput().startsWith("Usage: nightdome [options]"));

    QProcess wrong;
    wrong.setProcessEnvironment(bare);
    wrong.start(ND_PROGRAM, { "--threads", "9" });
    ASSERT_TRUE(wrong.waitForFinished(30000));
    EXPECT_EQ(wrong.exitStatus(), QProcess::NormalExit);
    EXPECT_EQ(wrong.exitCode(), 2);
    EXPECT_EQ(wrong.readAllStandardError(),
        "nightdome: --threads takes a number from 1 to 8, not '9'\n"
        "Try 'nightdome --help' for more information.\n");

    QProcess missing;
    QProcessEnvironment offscreen = QProcessEnvironment::systemEnvironment();
    offscreen.insert("QT_QPA_PLATFORM", "offscreen");
    missing.setProcessEnvironment(offscreen);
    missing.start(ND_PROGRAM, { "--catalogue", "/nonexistent/stars.dat" });
    ASSERT_TRUE(missing.waitForStarted(10000));
    // Qt may have its own warnings to give first.
    const QByteArray expected
        = "nightdome: cannot read the star catalogue '/nonexistent/stars.dat': No such file or "
          "directory; starting with an empty sky\n";
    QByteArray error;
    const bool said = QTest::qWaitFor(
        [&] {
            error += missing.readAllStandardError();
            return error.contains(expected);
        },
        30000);
    EXPECT_TRUE(said) << error.toStdString();
    EXPECT_EQ(error.count("nightdome:"), 1) << error.toStdString();
    // Still running: the empty sky is up.
    EXPECT_EQ(missing.state(), QProcess::Running);
    missing.kill();
    missing.waitForFinished(10000);
}
