// List windows and CSV: the set saved through Ctrl+S and the context menu, the drag handle's CSV
// for other programs, and CSV files and text dropped on the window and on each pad, with the
// help line's report of rows that matched nothing and of files that could not be read.
#include "query/UniverseBuilder.h"

#include "controls/ControlsOnTwoStars.h"
#include "core/MessageCodes.h"
#include "lists/CsvDrop.h"
#include "lists/DropPad.h"
#include "lists/ListWindow.h"
#include "lists/LongWork.h"
#include "lists/SetCsvSaver.h"
#include "lists/SetMimeData.h"
#include "lists/StarDragger.h"
#include "lists/StarListView.h"
#include "platform/qt/MessageDrag.h"
#include "platform/qt/RecordingHandler.h"
#include "query/SystemSetCsv.h"
#include "query/panels/TextControl.h"
#include "render/SpectralTables.h"
#include "resources/ResourceData.h"
#include "widgets/IButton.h"
#include "widgets/InfoView.h"
#include "widgets/WidgetEvents.h"

#include "PadOperations.h"
#include <QAction>
#include <QApplication>
#include <QContextMenuEvent>
#include <QDragEnterEvent>
#include <QDropEvent>
#include <QFile>
#include <QFileDialog>
#include <QFileInfo>
#include <QLineEdit>
#include <QMenu>
#include <QMimeData>
#include <QProgressDialog>
#include <QPushButton>
#include <QStandardPaths>
#include <QTemporaryDir>
#include <QTest>
#include <QTimer>
#include <QUrl>

#include <chrono>
#include <functional>
#include <future>
#include <gtest/gtest.h>
#include <memory>
#include <random>
#include <string>

namespace {

class ListCsvTest : public ::testing::Test {
protected:
    static void SetUpTestSuite() { InitResources(); }

    void SetUp() override
    {
        ASSERT_TRUE(folder.isValid());
        SetCsvSaver::chooseFile = [this](QWidget*, const QString& suggested) {
            suggestedPaths << suggested;
            return chosenPath;
        };
        SetCsvSaver::showError = [this](QWidget*, const QString& text) { errors << text; };
    }

    void TearDown() override
    {
        SetCsvSaver::chooseFile = nullptr;
        SetCsvSaver::showError = nullptr;
    }

    std::unique_ptr<ListWindow> NewList(Universe* over)
    {
        return std::make_unique<ListWindow>(BPoint(140, 140), 230, 340, "Star List", &help, over);
    }

    static std::vector<int32_t> Members(const StarSysMask& set)
    {
        std::vector<int32_t> members;
        for (int32_t i = 0; i < set.GetSystemCount(); i++) {
            if (set.GetStateSafe(i))
                members.push_back(i);
        }
        return members;
    }

    // Sets the list to exactly indices, as a set dropped on its Equals pad does.
    static void Fill(ListWindow* list, const std::vector<int32_t>& indices)
    {
        StarSysMask set(list->Mask()->GetSystemCount(), false, 0);
        for (const int32_t i : indices)
            set.SetStateSafe(i, true);
        Message message(kStarArrayMessage);
        message.AddPointer(kSystemArrayPtrString, &set);
        list->Pad("Equals")->MessageReceived(&message);
    }

    // Drags data over target and lets it go there, as a drag from another program ending on
    // it does; answers whether target took the drag in.
    static bool Drop(
        QWidget* target, QMimeData* data, Qt::DropActions actions = Qt::CopyAction | Qt::MoveAction)
    {
        const QPoint middle(target->width() / 2, target->height() / 2);
        QDragEnterEvent enter(middle, actions, data, Qt::LeftButton, Qt::NoModifier);
        QCoreApplication::sendEvent(target, &enter);
        if (!enter.isAccepted())
            return false;
        EXPECT_EQ(enter.dropAction(), Qt::CopyAction) << "a file is never moved away";
        QDropEvent drop(QPointF(middle), actions, data, Qt::LeftButton, Qt::NoModifier);
        QCoreApplication::sendEvent(target, &drop);
        EXPECT_TRUE(drop.isAccepted());
        EXPECT_EQ(drop.dropAction(), Qt::CopyAction);
        return true;
    }

    static bool DropFile(QWidget* target, const QString& path)
    {
        QMimeData data;
        data.setUrls({ QUrl::fromLocalFile(path) });
        return Drop(target, &data);
    }

    static bool DropCsvText(QWidget* target, const QByteArray& text)
    {
        QMimeData data;
        data.setData(QStringLiteral("text/csv"), text);
        return Drop(target, &data);
    }

    static QByteArray ReadFile(const QString& path)
    {
        QFile file(path);
        EXPECT_TRUE(file.open(QIODevice::ReadOnly)) << path.toStdString();
        return file.readAll();
    }

    QString WriteFile(const QString& name, const QByteArray& bytes)
    {
        const QString path = folder.filePath(name);
        QFile file(path);
        EXPECT_TRUE(file.open(QIODevice::WriteOnly));
        file.write(bytes);
        return path;
    }

    // The help texts the list posted, in order.
    std::vector<std::string> HelpTexts()
    {
        DeliverPostedMessages();
        std::vector<std::string> texts;
        for (const Message& m : help.received) {
            if (m.what == kInfoMessage)
                texts.emplace_back(m.FindString(kInfoStringField));
        }
        return texts;
    }

    QTemporaryDir folder;
    QString chosenPath;
    QStringList suggestedPaths;
    QStringList errors;
    RecordingHandler help;
};

// A universe of count systems named "HIP n", one in six a pair with a "B" star, spread
// over a cube 400 parsecs wide.
std::unique_ptr<Universe> NamedUniverse(int32_t count)
{
    auto universe = std::make_unique<Universe>(1000);
    std::mt19937 random(5);
    std::uniform_real_distribution<double> place(-200, 200);
    for (int32_t i = 0; i < count; i++) {
        const std::string name = "HIP " + std::to_string(100000 + i);
        const std::string companion = name + " B";
        const double x = place(random), y = place(random), z = place(random);
        if (i % 6 == 0)
            AddTestSystem(*universe, x, y, z,
                { { name.c_str(), "K1V", 6.25 }, { companion.c_str(), "M5V", 13.5 } });
        else
            AddTestSystem(*universe, x, y, z, { { name.c_str(), "G2V", 4.75 + i % 7 } });
    }
    return universe;
}

TEST_F(ListCsvTest, ThousandSystemsSavedWithCtrlSAndDroppedBackOnAFreshList)
{
    const auto universe = NamedUniverse(20000);
    auto source = NewList(universe.get());
    std::vector<int32_t> picked;
    std::mt19937 random(3);
    StarSysMask chosen(universe->CountItems(), false, 0);
    while (chosen.CountItems(true) < 1000)
        chosen.SetStateSafe(int32_t(random() % 20000), true);
    picked = Members(chosen);
    Fill(source.get(), picked);
    ASSERT_EQ(source->Count(), 1000);

    // Saved through the window's key, to a name without ".csv".
    chosenPath = folder.filePath(QStringLiteral("thousand"));
    source->activateWindow();
    ASSERT_TRUE(QTest::qWaitForWindowActive(source.get()));
    QTest::keyClick(source->listView, Qt::Key_S, Qt::ControlModifier);
    ASSERT_EQ(suggestedPaths.size(), 1);
    EXPECT_TRUE(suggestedPaths[0].endsWith(QStringLiteral("/stars.csv")));
    const QString saved = chosenPath + QStringLiteral(".csv");
    ASSERT_TRUE(QFile::exists(saved));
    EXPECT_TRUE(errors.isEmpty());
    const QByteArray bytes = ReadFile(saved);
    EXPECT_EQ(bytes.toStdString(), SystemSetCsv::Write(*universe, chosen));
    EXPECT_TRUE(bytes.startsWith(QByteArray(SystemSetCsv::kHeader.data()) + "\r\n"));

    // Dropped as a file on a fresh list's Plus pad: the same set.
    auto target = NewList(universe.get());
    ASSERT_TRUE(DropFile(target->Pad("Plus"), saved));
    EXPECT_EQ(Members(*target->Mask()), picked);
    EXPECT_EQ(target->Count(), 1000);
    EXPECT_EQ(target->listView->Model()->rowCount(), 1000);
    const int64_t rows = std::count(bytes.begin(), bytes.end(), '\n') - 1;
    // The pairs' companions have rows of their own: between 1,000 and 2,000 rows.
    ASSERT_GT(rows, 1000);
    ASSERT_LT(rows, 2000);
    EXPECT_EQ(target->CsvReport().toStdString(),
        "thousand.csv: 1,000 systems from 1," + std::to_string(rows).substr(1) + " rows");
}

TEST_F(ListCsvTest, NamesWithCommasAndQuotesReadBackCharacterForCharacter)
{
    Universe universe(20);
    const char* names[] = { "Smith, J.", "The \"Eye\"", "\"Quoted\"", ",", "\"", "a\"\",\"b",
        "Zeta, \"Z\" Ceti", "Plain" };
    for (int i = 0; i < 8; i++)
        AddTestSystem(universe, i, -i, 2 * i, { { names[i], "F5V", 3.5 } });
    AddTestSystem(universe, 50, 50, 50, { { "Outside", "A0", 1 } });
    auto source = NewList(&universe);
    Fill(source.get(), { 0, 1, 2, 3, 4, 5, 6, 7 });
    chosenPath = folder.filePath(QStringLiteral("names.csv"));
    ASSERT_TRUE(source->SaveAsCsv());

    auto target = NewList(&universe);
    ASSERT_TRUE(DropFile(target.get(), chosenPath));
    ASSERT_EQ(target->listView->Model()->rowCount(), 8);
    for (int i = 0; i < 8; i++) {
        const QString shown = target->listView->Model()
                                  ->data(target->listView->Model()->index(i), Qt::DisplayRole)
                                  .toString();
        EXPECT_EQ(shown.toStdString(), names[i]);
    }
}

TEST_F(ListCsvTest, ContextMenuSavesTheList)
{
    Universe universe(20);
    for (int i = 0; i < 5; i++)
        AddTestSystem(universe, i + 1, 0, 0, { { ("S" + std::to_string(i)).c_str(), "G2V", 4.8 } });
    auto list = NewList(&universe);
    Fill(list.get(), { 1, 3 });

    // A right click on the list (it passes the event on) opens the window's menu.
    QWidget* viewport = list->listView->viewport();
    QContextMenuEvent click(
        QContextMenuEvent::Mouse, QPoint(10, 10), viewport->mapToGlobal(QPoint(10, 10)));
    QCoreApplication::sendEvent(viewport, &click);
    ASSERT_TRUE(list->ContextMenu()->isVisible());
    ASSERT_EQ(list->ContextMenu()->actions().size(), 1);
    QAction* save = list->ContextMenu()->actions().at(0);
    EXPECT_EQ(save, list->SaveAction());
    EXPECT_EQ(save->text(), QStringLiteral("Save as CSV\u2026"));
    EXPECT_EQ(save->shortcut(), QKeySequence(Qt::CTRL | Qt::Key_S));
    list->ContextMenu()->hide();

    chosenPath = folder.filePath(QStringLiteral("menu.CSV"));
    save->trigger();
    EXPECT_EQ(ReadFile(chosenPath).toStdString(),
        std::string(SystemSetCsv::kHeader)
            + "\r\nS1,G2V,4.8,2.000000,0.000000,0.000000,2,0,0"
              "\r\nS3,G2V,4.8,4.000000,0.000000,0.000000,4,0,0\r\n");

    // A right click elsewhere in the window too.
    QContextMenuEvent elsewhere(
        QContextMenuEvent::Mouse, QPoint(5, 60), list->mapToGlobal(QPoint(5, 60)));
    QCoreApplication::sendEvent(list->countView, &elsewhere);
    EXPECT_TRUE(list->ContextMenu()->isVisible());
    list->ContextMenu()->hide();

    // Cancelling the dialog writes nothing.
    chosenPath.clear();
    EXPECT_FALSE(list->SaveAsCsv());
    EXPECT_TRUE(errors.isEmpty());
}

TEST_F(ListCsvTest, SaveFailureIsReportedAndLeavesNothingBehind)
{
    Universe universe(20);
    AddTestSystem(universe, 1, 2, 3, { { "Only", "G2V", 4.8 } });
    auto list = NewList(&universe);
    Fill(list.get(), { 0 });
    chosenPath = folder.filePath(QStringLiteral("no such folder/stars.csv"));
    EXPECT_FALSE(list->SaveAsCsv());
    ASSERT_EQ(errors.size(), 1);
    EXPECT_TRUE(errors[0].startsWith(QStringLiteral("Could not write ") + chosenPath + ": "))
        << errors[0].toStdString();
    EXPECT_GT(errors[0].size(), (QStringLiteral("Could not write ") + chosenPath + ": ").size());
    EXPECT_FALSE(QFile::exists(chosenPath));
}

TEST_F(ListCsvTest, TheSaveDialogOpensInTheDocumentsFolder)
{
    // A user whose documents folder has not been made yet.
    QTemporaryDir home;
    ASSERT_TRUE(home.isValid());
    const QByteArray oldHome = qgetenv("HOME"), oldConfig = qgetenv("XDG_CONFIG_HOME");
    qputenv("HOME", home.path().toUtf8());
    qputenv("XDG_CONFIG_HOME", home.filePath(QStringLiteral(".config")).toUtf8());
    const QString documents = QStandardPaths::writableLocation(QStandardPaths::DocumentsLocation);
    ASSERT_EQ(documents, home.filePath(QStringLiteral("Documents")));
    ASSERT_FALSE(QFileInfo::exists(documents));

    Universe universe(20);
    AddTestSystem(universe, 1, 2, 3, { { "Only", "G2V", 4.8 } });
    auto list = NewList(&universe);
    Fill(list.get(), { 0 });
    // The real dialog: once it is up, where it stands is noted and it is cancelled.
    SetCsvSaver::chooseFile = SetCsvSaver::AskForFile;
    QString shownFolder, shownFile;
    int ticks = 0;
    QTimer watch;
    watch.setInterval(10);
    QObject::connect(&watch, &QTimer::timeout, [&] {
        QWidget* modal = QApplication::activeModalWidget();
        if (auto* dialog = qobject_cast<QFileDialog*>(modal)) {
            shownFolder = dialog->directory().absolutePath();
            shownFile = dialog->selectedFiles().value(0);
            dialog->reject();
        } else if (modal && ++ticks > 1000) {
            modal->close();
        }
    });
    watch.start();
    EXPECT_FALSE(list->SaveAsCsv());
    watch.stop();
    qputenv("HOME", oldHome);
    if (oldConfig.isNull())
        qunsetenv("XDG_CONFIG_HOME");
    else
        qputenv("XDG_CONFIG_HOME", oldConfig);

    EXPECT_EQ(shownFolder.toStdString(), documents.toStdString());
    EXPECT_EQ(shownFile.toStdString(), (documents + "/stars.csv").toStdString());
    EXPECT_TRUE(errors.isEmpty());
}

TEST_F(ListCsvTest, HelpNamesTheKey)
{
    Universe universe(20);
    auto list = NewList(&universe);
    EXPECT_STREQ(list->listView->IGetInfo(), "Star List: Drag stars to another view  [Ctrl+S]");
    EXPECT_STREQ(
        list->starDragger->IGetInfo(), "Star List Dragger: Drag to another view  [Ctrl+S]");
}

TEST_F(ListCsvTest, DraggerCarriesTheCsvAsWellAsTheMessage)
{
    const auto universe = NamedUniverse(300);
    auto list = NewList(universe.get());
    Fill(list.get(), { 0, 7, 12, 299 });
    chosenPath = folder.filePath(QStringLiteral("dragged.csv"));
    ASSERT_TRUE(list->SaveAsCsv());
    const QByteArray file = ReadFile(chosenPath);

    const std::unique_ptr<SetMimeData> data = list->starDragger->DragData();
    EXPECT_TRUE(data->formats().contains(QStringLiteral("text/csv")));
    EXPECT_TRUE(data->formats().contains(QStringLiteral("text/plain")));
    EXPECT_TRUE(data->formats().contains(QString::fromLatin1(kMessageMimeType)));
    EXPECT_EQ(data->data(QStringLiteral("text/csv")), file);
    EXPECT_EQ(data->data(QStringLiteral("text/plain")), file);
    EXPECT_TRUE(data->hasText());
    EXPECT_EQ(data->text(), QString::fromUtf8(file));
    // Our own views still find the message first.
    const Message* message = DraggedMessage(data.get());
    ASSERT_NE(message, nullptr);
    EXPECT_EQ(message->what, kStarArrayMessage);
    EXPECT_EQ(message->FindPointer(kSystemArrayPtrString), list->Mask());

    // Pressing the handle still drags the message.
    std::optional<CaughtDrag> caught;
    list->starDragger->SetDragStarter(CatchDrag(caught));
    QTest::mousePress(list->starDragger, Qt::LeftButton, Qt::NoModifier, QPoint(5, 5));
    ASSERT_TRUE(caught.has_value());
    EXPECT_EQ(caught->message.what, kStarArrayMessage);

    // A list of one system drags that system, and a row per star: system 12 is a pair.
    Fill(list.get(), { 12 });
    const std::unique_ptr<SetMimeData> one = list->starDragger->DragData();
    EXPECT_EQ(DraggedMessage(one.get())->what, kStarMessage);
    EXPECT_EQ(DraggedMessage(one.get())->FindInt32(kSystemIndexString), 12);
    EXPECT_EQ(one->data(QStringLiteral("text/csv")).count('\n'), 3);
}

TEST_F(ListCsvTest, DroppedCsvOnEachPad)
{
    Universe universe(50);
    for (int i = 0; i < 20; i++)
        AddTestSystem(universe, i + 1, 0, 0, { { ("S" + std::to_string(i)).c_str(), "G2V", 4.8 } });
    const std::vector<PadOperation> cases = PadOperationsOnOneTwoThree();
    // S4 by name, S3 by position only.
    const QByteArray csv = "Name,x,y,z\r\nS4,5,0,0\r\n,4,0,0\r\n";
    for (const auto& c : cases) {
        auto list = NewList(&universe);
        Fill(list.get(), { 1, 2, 3 });
        QWidget* target = c.pad ? static_cast<QWidget*>(list->Pad(c.pad)) : list.get();
        ASSERT_TRUE(DropCsvText(target, csv)) << (c.pad ? c.pad : "window");
        EXPECT_EQ(Members(*list->Mask()), c.expected) << (c.pad ? c.pad : "window");
        EXPECT_EQ(list->Count(), int32_t(c.expected.size()));
        EXPECT_EQ(list->CsvReport(), QStringLiteral("Dropped CSV: 2 systems from 2 rows"));
        if (c.pad) {
            EXPECT_FALSE(list->Pad(c.pad)->IsHighlighted());
        }
    }
}

TEST_F(ListCsvTest, CsvAsPlainTextAndNotCsvRefused)
{
    Universe universe(20);
    for (int i = 0; i < 5; i++)
        AddTestSystem(universe, i + 1, 0, 0, { { ("S" + std::to_string(i)).c_str(), "G2V", 4.8 } });
    auto list = NewList(&universe);
    {
        QMimeData data;
        data.setText(QStringLiteral("star name\nS2\nS0\n"));
        ASSERT_TRUE(Drop(list->Pad("Equals"), &data));
        EXPECT_EQ(Members(*list->Mask()), (std::vector<int32_t> { 0, 2 }));
    }
    // Text that is not a table, and data of no kind the list knows, are refused everywhere.
    for (QWidget* target : { static_cast<QWidget*>(list->Pad("Plus")),
             static_cast<QWidget*>(list->Pad("XOR")), static_cast<QWidget*>(list.get()) }) {
        QMimeData text;
        text.setText(QStringLiteral("Sirius, Procyon"));
        EXPECT_FALSE(Drop(target, &text));
        QMimeData image;
        image.setData(QStringLiteral("image/png"), QByteArray("\x89PNG", 4));
        EXPECT_FALSE(Drop(target, &image));
        QMimeData web;
        web.setUrls({ QUrl(QStringLiteral("https://example.org/stars.csv")) });
        EXPECT_FALSE(Drop(target, &web));
    }
    EXPECT_EQ(Members(*list->Mask()), (std::vector<int32_t> { 0, 2 }));
    // A drag that may only be moved is not taken: the file would go.
    QMimeData moveOnly;
    moveOnly.setData(QStringLiteral("text/csv"), "Name\r\nS1\r\n");
    EXPECT_FALSE(Drop(list->Pad("Plus"), &moveOnly, Qt::MoveAction));
}

TEST_F(ListCsvTest, UnmatchedRowsAreReportedInTheHelpLine)
{
    Universe universe(20);
    for (int i = 0; i < 5; i++)
        AddTestSystem(universe, i + 1, 0, 0, { { ("S" + std::to_string(i)).c_str(), "G2V", 4.8 } });
    auto list = NewList(&universe);
    const QString path = WriteFile(QStringLiteral("some.csv"),
        "Name\r\nS1\r\nNobody\r\nS2\r\n\"Multi\r\nline\"\r\nS3\r\nGhost\r\n");
    ASSERT_TRUE(DropFile(list->Pad("Plus"), path));
    EXPECT_EQ(Members(*list->Mask()), (std::vector<int32_t> { 1, 2, 3 }));
    const std::string report = "some.csv: 3 systems; no match on lines 3, 5, 8";
    EXPECT_EQ(list->CsvReport().toStdString(), report);
    const auto texts = HelpTexts();
    ASSERT_FALSE(texts.empty());
    EXPECT_EQ(texts.back(), report);
}

TEST_F(ListCsvTest, UnreadableOrMalformedFilesChangeNothing)
{
    Universe universe(20);
    for (int i = 0; i < 5; i++)
        AddTestSystem(universe, i + 1, 0, 0, { { ("S" + std::to_string(i)).c_str(), "G2V", 4.8 } });
    auto list = NewList(&universe);
    Fill(list.get(), { 4 });

    ASSERT_TRUE(DropFile(list->Pad("Equals"), folder.filePath(QStringLiteral("missing.csv"))));
    EXPECT_EQ(list->CsvReport(), QStringLiteral("missing.csv: No such file or directory"));
    EXPECT_EQ(Members(*list->Mask()), (std::vector<int32_t> { 4 }));
    EXPECT_EQ(HelpTexts().back(), "missing.csv: No such file or directory");

    const QString bad = WriteFile(QStringLiteral("bad.csv"), "Name\r\nS1\r\n\"S2\r\n");
    ASSERT_TRUE(DropFile(list->Pad("Equals"), bad));
    EXPECT_EQ(list->CsvReport(), QStringLiteral("bad.csv, line 3: a quoted field is never closed"));
    EXPECT_EQ(Members(*list->Mask()), (std::vector<int32_t> { 4 }));

    const QString noHeader = WriteFile(QStringLiteral("numbers.csv"), "1,2\r\n3,4\r\n");
    ASSERT_TRUE(DropFile(list.get(), noHeader));
    EXPECT_EQ(list->CsvReport(), QStringLiteral("numbers.csv, line 1: no Name or x, y, z column"));
    EXPECT_EQ(Members(*list->Mask()), (std::vector<int32_t> { 4 }));

    ASSERT_TRUE(DropFile(list->Pad("Plus"), folder.path()));
    EXPECT_TRUE(list->CsvReport().endsWith(QStringLiteral(": a folder, not a CSV file")));
    EXPECT_EQ(Members(*list->Mask()), (std::vector<int32_t> { 4 }));
    EXPECT_EQ(list->Count(), 1);

    // Two files, one of them bad: neither is used.
    const QString good = WriteFile(QStringLiteral("good.csv"), "Name\r\nS0\r\n");
    QMimeData both;
    both.setUrls({ QUrl::fromLocalFile(good), QUrl::fromLocalFile(bad) });
    ASSERT_TRUE(Drop(list->Pad("Plus"), &both));
    EXPECT_EQ(Members(*list->Mask()), (std::vector<int32_t> { 4 }));
    // Two good ones make one set.
    const QString other = WriteFile(QStringLiteral("other.csv"), "Name\r\nS1\r\n");
    QMimeData two;
    two.setUrls({ QUrl::fromLocalFile(good), QUrl::fromLocalFile(other) });
    ASSERT_TRUE(Drop(list->Pad("Equals"), &two));
    EXPECT_EQ(Members(*list->Mask()), (std::vector<int32_t> { 0, 1 }));
    EXPECT_EQ(list->CsvReport(), QStringLiteral("2 CSV files: 2 systems from 2 rows"));
}

TEST_F(ListCsvTest, TheReportStaysOnTheHelpLineUntilThePointerLeaves)
{
    ControlsOnTwoStars program;
    auto* list = program.Open<ListWindow>("New List Window Button");
    ASSERT_NE(list, nullptr);
    InfoView* line = program.controls.GetInfoView();
    DropPad* plus = list->Pad("Plus");
    Enter(plus);
    DeliverPostedMessages();
    ASSERT_EQ(line->text().toStdString(), "Drop Pad: Add to list");

    ASSERT_TRUE(DropCsvText(plus, "Name\r\nSirius\r\nNobody\r\nThe Sun\r\n"));
    DeliverPostedMessages();
    const QString report = QStringLiteral("Dropped CSV: 2 systems; no match on line 3");
    EXPECT_EQ(list->CsvReport().toStdString(), report.toStdString());
    EXPECT_EQ(line->text().toStdString(), report.toStdString());
    // The drag over, the pointer is over the pad again, then moves on over the window.
    for (QWidget* over : std::initializer_list<QWidget*> { plus, list->Pad("Minus"),
             list->countView, list->showListBox, list->listView, list->starDragger }) {
        Enter(over);
        MoveMouse(over, QPoint(3, 3));
        Leave(over);
        DeliverPostedMessages();
        EXPECT_EQ(line->text().toStdString(), report.toStdString())
            << over->objectName().toStdString();
    }
    // Out of the window: the line clears, and the window's help is back when the pointer is.
    Leave(list);
    DeliverPostedMessages();
    EXPECT_EQ(line->text().toStdString(), "");
    Enter(list->Pad("XOR"));
    DeliverPostedMessages();
    EXPECT_EQ(line->text().toStdString(), "Drop Pad: Logical XOR");
}

TEST_F(ListCsvTest, EveryHelpTextOfTheListFitsTheHelpLine)
{
    ControlsOnTwoStars program;
    auto* list = program.Open<ListWindow>("New List Window Button");
    ASSERT_NE(list, nullptr);
    InfoView* line = program.controls.GetInfoView();
    const QFontMetrics metrics(line->font());
    // The check box's help keeps its long-standing wording, which our font makes a few pixels
    // wider than the line; it is not measured here.
    std::vector<IBroadcaster*> widgets { list->countView, list->listView, list->starDragger };
    for (const char* pad : { "Plus", "Equals", "Minus", "NOT", "AND", "OR", "XOR" })
        widgets.push_back(list->Pad(pad));
    for (IBroadcaster* widget : widgets) {
        ASSERT_TRUE(widget->IBroadcastInfo());
        DeliverPostedMessages();
        ASSERT_EQ(line->text().toStdString(), widget->IGetInfo());
        EXPECT_LE(metrics.horizontalAdvance(line->text()), line->width()) << widget->IGetInfo();
    }

    // Reports of CSV drops, with long names and many rows that match nothing: the counts stay,
    // the line numbers and the middle of the name give way.
    QByteArray many = "Name\r\nSirius\r\n";
    for (int i = 0; i < 40; i++)
        many += "Nobody " + QByteArray::number(i) + "\r\n";
    struct Case {
        QString name;
        QByteArray text;
        QString start, end;
    };
    const Case cases[] = {
        { "stars.csv", many, "stars.csv: 1 system; 40 rows unmatched (3, 4, ", "" },
        { "the nearest stars to the sun within twenty parsecs, as found on a tuesday.csv", many,
            "the near", ": 1 system; 40 rows unmatched" },
        // The reader's own reasons are short enough to be read whole.
        { "numbers.csv", "1,2\r\n3,4\r\n", "numbers.csv, line 1: ", "no Name or x, y, z column" },
        { "quoted.csv", "Name\r\n\"Sirius\"A\r\n",
            "quoted.csv, line 2: ", "text after a closing quote" },
        { "wide.csv", "Name\r\n" + QByteArray(1000, ','),
            "wide.csv, line 2: ", "over 1000 fields in a row" },
        { "open.csv", "Name\r\n\"Sirius\r\n",
            "open.csv, line 2: ", "a quoted field is never closed" },
        { "long.csv", "Name\r\n" + QByteArray(70000, 'a'),
            "long.csv, line 2: ", "a field longer than 64 KiB" },
        { "missing.csv", "", "missing.csv: No such file or directory", "" },
    };
    for (const Case& c : cases) {
        const QString path = c.text.isEmpty() ? folder.filePath(c.name) : WriteFile(c.name, c.text);
        Leave(list);
        ASSERT_TRUE(DropFile(list->Pad("Plus"), path));
        DeliverPostedMessages();
        EXPECT_EQ(line->text().toStdString(), list->CsvReport().toStdString());
        EXPECT_LE(metrics.horizontalAdvance(line->text()), line->width())
            << line->text().toStdString();
        EXPECT_TRUE(line->text().startsWith(c.start)) << line->text().toStdString();
        EXPECT_TRUE(line->text().endsWith(c.end)) << line->text().toStdString();
    }
    EXPECT_EQ(list->Count(), 1);
}

// Holds the list's long work on its thread until the progress dialog it shows has been seen
// (and, with cancel, its Cancel button clicked), the way a drop or a save that takes seconds
// goes for the user.
class HeldWork {
public:
    // meanwhile: what the user does while the dialog is up, before the work goes on.
    explicit HeldWork(QWidget* window, bool cancel, std::function<void()> meanwhile = nullptr)
    {
        LongWork::showAfter = 0;
        std::shared_future<void> released = fRelease.get_future().share();
        LongWork::beforeWork = [released] {
            // Bounded: a dialog that never comes fails the test instead of hanging it.
            released.wait_for(std::chrono::seconds(20));
        };
        fWatch.setInterval(10);
        QObject::connect(&fWatch, &QTimer::timeout, [this, window, cancel, meanwhile] {
            auto* dialog = window->findChild<QProgressDialog*>();
            if (fReleased || !dialog || !dialog->isVisible()) {
                fTicksWithoutDialog += !fReleased;
                return;
            }
            // The window's thread is still serving events while the work runs.
            if (++fTicksShown < 3)
                return;
            label = dialog->labelText();
            if (meanwhile)
                meanwhile();
            if (cancel) {
                auto* button = dialog->findChild<QPushButton*>();
                if (button)
                    QTest::mouseClick(button, Qt::LeftButton);
            }
            fReleased = true;
            fRelease.set_value();
        });
        fWatch.start();
    }

    ~HeldWork()
    {
        if (!fReleased)
            fRelease.set_value();
        LongWork::beforeWork = nullptr;
        LongWork::showAfter = 500;
    }

    bool Shown() const { return fTicksShown >= 3; }
    QString label; // what the dialog said

private:
    std::promise<void> fRelease;
    QTimer fWatch;
    bool fReleased = false;
    int fTicksShown = 0, fTicksWithoutDialog = 0;
};

TEST_F(ListCsvTest, ALongDropShowsProgressAndCancelLeavesTheList)
{
    const auto universe = NamedUniverse(3000);
    auto list = NewList(universe.get());
    Fill(list.get(), { 1, 2 });
    auto source = NewList(universe.get());
    Fill(source.get(), { 5, 50, 500, 2999 });
    chosenPath = folder.filePath(QStringLiteral("four.csv"));
    ASSERT_TRUE(source->SaveAsCsv());
    {
        HeldWork held(list.get(), true);
        ASSERT_TRUE(DropFile(list->Pad("Equals"), chosenPath));
        EXPECT_TRUE(held.Shown());
        EXPECT_EQ(held.label.toStdString(), "Reading four.csv\u2026");
    }
    EXPECT_EQ(Members(*list->Mask()), (std::vector<int32_t> { 1, 2 }));
    EXPECT_EQ(list->Count(), 2);
    EXPECT_EQ(list->listView->Model()->rowCount(), 2);
    EXPECT_EQ(list->CsvReport().toStdString(), "four.csv: cancelled, the list is unchanged");
    EXPECT_EQ(list->findChild<QProgressDialog*>(), nullptr) << "the dialog is gone";
    {
        HeldWork held(list.get(), false);
        ASSERT_TRUE(DropFile(list->Pad("Equals"), chosenPath));
        EXPECT_TRUE(held.Shown());
    }
    EXPECT_EQ(Members(*list->Mask()), (std::vector<int32_t> { 5, 50, 500, 2999 }));
    EXPECT_EQ(list->CsvReport().toStdString(), "four.csv: 4 systems from 4 rows");

    // Meanwhile the set stays as it is, but the list may still be switched off.
    {
        auto* dropped = new StarSysMask(universe->CountItems(), false, 0);
        const std::unique_ptr<StarSysMask> owned(dropped);
        dropped->SetStateSafe(9, true);
        HeldWork held(list.get(), false, [&] {
            Message message(kStarArrayMessage);
            message.AddPointer(kSystemArrayPtrString, dropped);
            list->Pad("Plus")->MessageReceived(&message);
            list->showListBox->click();
            DeliverPostedMessages();
        });
        ASSERT_TRUE(DropFile(list->Pad("Minus"), chosenPath));
        EXPECT_TRUE(held.Shown());
    }
    EXPECT_EQ(list->Count(), 0);
    EXPECT_FALSE(list->ShowsList());
    EXPECT_FALSE(list->showListBox->isChecked());
}

TEST_F(ListCsvTest, ALongSaveShowsProgressAndCancelLeavesNoFile)
{
    const auto universe = NamedUniverse(3000);
    auto list = NewList(universe.get());
    Fill(list.get(), { 7, 70, 700 });
    chosenPath = folder.filePath(QStringLiteral("three.csv"));
    {
        HeldWork held(list.get(), true);
        EXPECT_FALSE(list->SaveAsCsv());
        EXPECT_TRUE(held.Shown());
        EXPECT_EQ(held.label.toStdString(), "Writing three.csv\u2026");
    }
    EXPECT_FALSE(QFile::exists(chosenPath));
    EXPECT_TRUE(errors.isEmpty());
    {
        HeldWork held(list.get(), false);
        EXPECT_TRUE(list->SaveAsCsv());
        EXPECT_TRUE(held.Shown());
    }
    StarSysMask three(universe->CountItems(), false, 0);
    for (const int32_t i : { 7, 70, 700 })
        three.SetStateSafe(i, true);
    EXPECT_EQ(ReadFile(chosenPath).toStdString(), SystemSetCsv::Write(*universe, three));
}

TEST_F(ListCsvTest, TextFieldsTakeTextButNotTheListsTable)
{
    Universe universe(20);
    AddTestSystem(universe, 1, 0, 0, { { "S0", "G2V", 4.8 } });
    auto list = NewList(&universe);
    Fill(list.get(), { 0 });
    QWidget window;
    auto* control = new TextControl(BRect(0, 0, 199, 19), "Name", "Name", "", 50, &window);
    window.show();
    QLineEdit* field = control->TextView();
    const QPoint middle(field->width() / 2, field->height() / 2);
    auto entered = [&](QMimeData* data) {
        QDragEnterEvent enter(middle, Qt::CopyAction, data, Qt::LeftButton, Qt::NoModifier);
        QCoreApplication::sendEvent(field, &enter);
        return enter.isAccepted();
    };
    // The list's handle offers its table as text, but the field is no place for the list.
    const std::unique_ptr<SetMimeData> dragged = list->starDragger->DragData();
    ASSERT_TRUE(dragged->hasText());
    EXPECT_FALSE(entered(dragged.get()));
    // Text from another program still goes in.
    QMimeData text;
    text.setText(QStringLiteral("Sirius"));
    EXPECT_TRUE(entered(&text));
}

} // namespace
