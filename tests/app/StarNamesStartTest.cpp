// The names file beside the catalogue the program starts with: its names found by the name
// panel, the stars still shown by their own names, and one clear line for each thing wrong
// with it while the program starts all the same.
#include "NamedSky.h"

#include "ViewMessages.h"
#include "app/StartUniverse.h"
#include "catalog/Star.h"
#include "info/StarIView.h"
#include "info/StarInfoScreen.h"
#include "lists/ListWindow.h"
#include "lists/StarListView.h"
#include "query/panels/NameQueryView.h"
#include "query/panels/PanelFixture.h"
#include "query/panels/PopUpMenuButton.h"
#include "query/panels/TextControl.h"

#include <QFontMetrics>
#include <QLineEdit>
#include <QMenu>
#include <QProcess>
#include <QTemporaryDir>
#include <QTest>
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <memory>

namespace {

namespace fs = std::filesystem;

constexpr int32_t kAlpha = kNamedSkyAlpha, kProxima = kNamedSkyProxima, kBarnard = kNamedSkyBarnard;

void Write(const fs::path& path, const std::string& text)
{
    std::ofstream(path, std::ios::binary) << text;
}

// Chooses item index of menu as a user would: through the menu's own action.
void Choose(PopUpMenuButton* menu, int index)
{
    menu->Menu()->actions()[index]->trigger();
}

// The text field emptied and text typed into it, key by key.
void Type(TextControl* field, const char* text)
{
    field->TextView()->selectAll();
    QTest::keyClick(field->TextView(), Qt::Key_Delete);
    QTest::keyClicks(field->TextView(), text);
}

class StarNamesStart : public ::testing::Test {
protected:
    static void SetUpTestSuite() { InitResources(); }

    void SetUp() override
    {
        ASSERT_TRUE(fDir.isValid());
        fCatalogue = fs::path(fDir.filePath("sky.dat").toStdString());
        fNames = fs::path(fDir.filePath("sky.names").toStdString());
        Write(fCatalogue, kNamedSky);
    }

    // The program's start on the catalogue, its universe kept by the test.
    StartedUniverse Start()
    {
        StartOptions options;
        options.catalogue = fCatalogue.string();
        StartedUniverse started = StartUniverse(options);
        fUniverse.reset(started.universe);
        return started;
    }

    std::string Quoted(const fs::path& path) const { return "'" + path.string() + "'"; }

    QTemporaryDir fDir;
    fs::path fCatalogue, fNames;
    std::unique_ptr<Universe> fUniverse;
};

} // namespace

TEST_F(StarNamesStart, TheNamePanelFindsASystemByEveryNameOfItsStars)
{
    Write(fNames, NamesHeader() + kOtherNames);
    const StartedUniverse started = Start();
    EXPECT_EQ(started.report, "");
    EXPECT_EQ(started.helpLine, "");
    ASSERT_EQ(fUniverse->CountItems(), 5);

    NameQueryView panel(BRect(10, 10, 370, 60), "Name Query", fUniverse.get(), nullptr);
    struct Search {
        int mode;
        const char* text;
        int32_t system;
    };
    const Search searches[] = {
        { kNameStartsWith, "alf Cen", kAlpha },
        { kNameIs, "alf cen b", kAlpha },
        { kNameIs, "Alpha Centauri A", kAlpha },
        { kNameIs, "HIP 71683", kAlpha },
        { kNameIs, "HD 128620", kAlpha },
        { kNameIs, "GJ 551", kProxima },
        { kNameIs, "Gaia DR3 5853498713190525696", kProxima },
        { kNameContains, "5853498713190525696", kProxima },
        { kNameStartsWith, "gj 69", kBarnard },
        { kNameIs, "Rigil Kentaurus", kAlpha }, // the shown names as before
        { kNameIs, "Toliman", kAlpha },
    };
    for (const Search& s : searches) {
        Choose(panel.queryType, s.mode);
        Type(panel.starName, s.text);
        ASSERT_STREQ(panel.starName->Text(), s.text);
        const std::optional<CaughtDrag> drag = PressHandle(&panel);
        ASSERT_TRUE(drag.has_value()) << s.text;
        EXPECT_EQ(drag->message.what, kStarMessage) << s.text;
        EXPECT_EQ(drag->message.FindInt32(kSystemIndexString), s.system) << s.text;
    }
    // "Gaia DR3" starts a name of Proxima, of Barnard's Star and of the last star's own name.
    Choose(panel.queryType, kNameStartsWith);
    Type(panel.starName, "gaia dr3 ");
    const std::optional<CaughtDrag> several = PressHandle(&panel);
    ASSERT_TRUE(several.has_value());
    EXPECT_EQ(several->message.what, kStarArrayMessage);
    EXPECT_EQ(panel.GetSelectedItems(), 3);
    // A name no star has.
    Choose(panel.queryType, kNameIs);
    Type(panel.starName, "HIP 71");
    EXPECT_FALSE(PressHandle(&panel).has_value());
}

TEST_F(StarNamesStart, ASystemFoundByAnotherNameIsListedByItsOwn)
{
    Write(fNames, NamesHeader() + kOtherNames);
    Start();
    NameQueryView panel(BRect(10, 10, 370, 60), "Name Query", fUniverse.get(), nullptr);
    Choose(panel.queryType, kNameStartsWith);
    Type(panel.starName, "HIP 7");
    const std::optional<CaughtDrag> drag = PressHandle(&panel);
    ASSERT_TRUE(drag.has_value());
    ASSERT_EQ(drag->message.what, kStarArrayMessage);

    RecordingHandler help;
    ListWindow list(BPoint(140, 140), 230, 340, "Star List", &help, fUniverse.get());
    MessageMimeData data(drag->message);
    const QPoint middle(list.width() / 2, list.height() / 2);
    QDragEnterEvent enter(middle, Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(&list, &enter);
    ASSERT_TRUE(enter.isAccepted());
    QDropEvent drop(QPointF(middle), Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(&list, &drop);
    ASSERT_EQ(list.listView->model()->rowCount(), 2);
    EXPECT_EQ(list.listView->model()->index(0, 0).data().toString(), "Rigil Kentaurus");
    EXPECT_EQ(list.listView->model()->index(1, 0).data().toString(), "Proxima Centauri");
    EXPECT_STREQ(fUniverse->SystemAt(kAlpha)->StarAt(1)->GetName(), "Toliman");
}

TEST_F(StarNamesStart, ASystemFoundByAnotherNameShowsItsStarsOwnNamesInTheStarInformation)
{
    Write(fNames, NamesHeader() + kOtherNames);
    Start();
    NameQueryView panel(BRect(10, 10, 370, 60), "Name Query", fUniverse.get(), nullptr);
    Type(panel.starName, "HIP 71681"); // alpha Centauri B's number
    const std::optional<CaughtDrag> drag = PressHandle(&panel);
    ASSERT_TRUE(drag.has_value());
    ASSERT_EQ(drag->message.what, kStarMessage);

    StarIView view(BPoint(0, 0), "Star Info View");
    HandUniverse(view, fUniverse.get());
    MessageMimeData data(drag->message);
    const QPoint lower(100, StarIView::kHalfBoundary + 20);
    QDragEnterEvent enter(lower, Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(&view, &enter);
    ASSERT_TRUE(enter.isAccepted());
    QDropEvent drop(QPointF(lower), Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(&view, &drop);
    TypeAll(view);
    EXPECT_EQ(view.Index1(), kAlpha);
    EXPECT_EQ(ScreenText(view, 2, 4, 23), "Rigil Kentaurus");
    EXPECT_EQ(ScreenText(view, 3, 4, 23), "Toliman");
}

TEST_F(StarNamesStart, NoNamesFileIsNothingToTell)
{
    const StartedUniverse started = Start();
    EXPECT_EQ(started.report, "");
    EXPECT_EQ(started.helpLine, "");
    EXPECT_EQ(fUniverse->CountItems(), 5);
    EXPECT_TRUE(fUniverse->otherNames.Empty());
}

TEST_F(StarNamesStart, AStaleNamesFileIsToldAndLeftAside)
{
    Write(fNames, NamesHeader(7) + kOtherNames);
    StartedUniverse started = Start();
    EXPECT_EQ(started.report,
        "nightdome: " + Quoted(fNames) + " is stale: it is for a catalogue of 7 stars and "
            + std::to_string(sizeof kNamedSky - 1) + " bytes, " + Quoted(fCatalogue)
            + " holds 6 stars in " + std::to_string(sizeof kNamedSky - 1)
            + " bytes; the stars keep only their own names\n");
    EXPECT_EQ(started.helpLine, "sky.names is stale: names not used");
    EXPECT_EQ(fUniverse->CountItems(), 5);
    EXPECT_TRUE(fUniverse->otherNames.Empty());

    // The catalogue changed since the names were written.
    Write(fNames, NamesHeader() + kOtherNames);
    Write(fCatalogue, std::string(kNamedSky) + "Star 7\nG2V 5 9 9 9\n");
    started = Start();
    EXPECT_NE(started.report.find(" is stale: it is for a catalogue of 6 stars"), std::string::npos)
        << started.report;
    EXPECT_EQ(fUniverse->CountItems(), 6);
    EXPECT_TRUE(fUniverse->otherNames.Empty());
}

TEST_F(StarNamesStart, BadLinesAndNamesAreToldAndTheGoodOnesUsed)
{
    Write(fNames,
        NamesHeader() + "1\talf Cen A\n2\tHIP 71681\t\n2\tagain\nx\ty\n3\tGJ 551\t"
            + std::string(80, 'N') + "\n");
    const StartedUniverse started = Start();
    EXPECT_EQ(started.report,
        "nightdome: " + Quoted(fNames)
            + ", line 5: a star index not after the one of the line before; 2 lines passed over\n"
            + "nightdome: " + Quoted(fNames)
            + ", line 4: a name empty, longer than 79 characters or not printable ASCII; 2 names "
              "passed over\n");
    EXPECT_EQ(started.helpLine, "sky.names, line 5: out of order; 2 lines bad");
    EXPECT_EQ(fUniverse->otherNames.Count(), 3);

    NameQueryView panel(BRect(10, 10, 370, 60), "Name Query", fUniverse.get(), nullptr);
    Type(panel.starName, "gj 551");
    const std::optional<CaughtDrag> drag = PressHandle(&panel);
    ASSERT_TRUE(drag.has_value());
    EXPECT_EQ(drag->message.FindInt32(kSystemIndexString), kProxima);
}

TEST_F(StarNamesStart, ANamesFileThatCannotBeReadOrIsNoneIsTold)
{
    fs::create_directory(fNames);
    StartedUniverse started = Start();
    EXPECT_EQ(started.report,
        "nightdome: cannot read the star names " + Quoted(fNames)
            + ": it is a folder; the stars keep only their own names\n");
    EXPECT_EQ(started.helpLine, "Cannot read sky.names: it is a folder");
    EXPECT_EQ(fUniverse->CountItems(), 5);
    fs::remove(fNames);

    Write(fNames, std::string("1\tHIP 71683\n"));
    started = Start();
    EXPECT_EQ(started.report,
        "nightdome: " + Quoted(fNames)
            + " is not a star names file (its first line is not 'nightdome names 1' with the "
              "catalogue's star count and size below it); the stars keep only their own names\n");
    EXPECT_EQ(started.helpLine, "sky.names is not a star names file");
    EXPECT_EQ(fUniverse->CountItems(), 5);
    EXPECT_TRUE(fUniverse->otherNames.Empty());

    // The catalogue's own problems keep the help line.
    Write(fCatalogue, std::string(kNamedSky) + "Short\nG2V 4\n");
    started = Start();
    EXPECT_NE(started.report.find("not a star names file"), std::string::npos);
    EXPECT_EQ(started.helpLine, "sky.dat, line 14: fields missing; 1 bad record");
}

TEST_F(StarNamesStart, EveryHelpLineFits)
{
    const QFontMetrics metrics(QApplication::font("QLabel"));
    const fs::path longer = fs::path(fDir.filePath(QString(120, 'n') + ".dat").toStdString());
    fs::path longNames = longer;
    longNames.replace_extension(".names");
    Write(longer, kNamedSky);
    fCatalogue = longer;
    for (const std::string& text : { NamesHeader(9) + kOtherNames, NamesHeader() + "x\tA\n",
             NamesHeader() + "1\t\n", std::string("nothing\n") }) {
        Write(longNames, text);
        const StartedUniverse started = Start();
        ASSERT_FALSE(started.helpLine.empty()) << text;
        EXPECT_LE(
            metrics.horizontalAdvance(QString::fromStdString(started.helpLine)), kHelpLineWidth)
            << started.helpLine;
    }
}

// The real program started with --catalogue on a catalogue whose names file is stale: one line
// on standard error, and the program comes up all the same.
TEST_F(StarNamesStart, TheProgramToldOfAStaleNamesFileStartsAllTheSame)
{
    Write(fNames, NamesHeader(5) + kOtherNames);
    QProcess program;
    QProcessEnvironment offscreen = QProcessEnvironment::systemEnvironment();
    offscreen.insert("QT_QPA_PLATFORM", "offscreen");
    program.setProcessEnvironment(offscreen);
    program.start(ND_PROGRAM, { "--catalogue=" + QString::fromStdString(fCatalogue.string()) });
    ASSERT_TRUE(program.waitForStarted(10000));
    const QByteArray expected = QByteArray::fromStdString("nightdome: " + Quoted(fNames)
        + " is stale: it is for a catalogue of 5 stars and " + std::to_string(sizeof kNamedSky - 1)
        + " bytes");
    QByteArray error;
    const bool said = QTest::qWaitFor(
        [&] {
            error += program.readAllStandardError();
            return error.contains(expected) && error.endsWith('\n');
        },
        30000);
    EXPECT_TRUE(said) << error.toStdString();
    EXPECT_EQ(error.count("nightdome:"), 1) << error.toStdString();
    EXPECT_EQ(program.state(), QProcess::Running);
    program.kill();
    program.waitForFinished(10000);
}
