// Sets leaving the real program and coming back in, across programs, with and without a window
// manager: a CSV file dragged from another program (as from a file manager) onto a list
// window's Equals pad fills the list, and the list's handle dragged onto another program's
// window (as onto a text editor) hands it the list as text/csv and text/plain, the table the
// program would save.
#include "LabelReader.h"
#include "ProgramX11Support.h"

#include "catalog/Universe.h"
#include "query/SystemSetCsv.h"

#include <QProcess>
#include <memory>
#include <string>

namespace {

// Where the windows stand: clear of each other, the control window and the chart.
const QPoint kListPlace(900, 160);
const QPoint kSourcePlace(900, 600);
const QPoint kTargetPlace(1100, 600);

// The systems the file names: three by name (one twice, as its rows per star would), one by
// place alone (Altair's), and a row that matches nothing.
const char* const kFile = "Name,x (pc),y (pc),z (pc)\r\n"
                          "Sirius,,,\r\n"
                          "Vega,1.0,4.9,-5.0\r\n"
                          "\"Far One\",,,\r\n"
                          "Vega,,,\r\n"
                          ",2.54,0.87,-4.31\r\n"
                          "Nobody,99,99,99\r\n";
const char* const kNamed[] = { "Sirius", "Altair", "Vega", "Far One" };

class CsvAcrossPrograms : public Program, public ::testing::WithParamInterface<bool> {
protected:
    bool WithWindowManager() const override { return GetParam(); }

    void TearDown() override
    {
        for (QProcess* peer : { &fSource, &fTarget }) {
            if (peer->state() != QProcess::NotRunning) {
                peer->kill();
                peer->waitForFinished(5000);
            }
        }
        Program::TearDown();
    }

    // Starts the other program in mode with its file, its window at place; the window's id,
    // once it shows, or 0.
    static unsigned long StartPeer(
        QProcess& peer, const char* mode, const QString& file, QPoint place, const char* title)
    {
        peer.setProcessChannelMode(QProcess::ForwardedErrorChannel);
        peer.start(
            ND_CSV_PEER, { mode, file, QString::number(place.x()), QString::number(place.y()) });
        if (!peer.waitForStarted(10000))
            return 0;
        unsigned long window = 0;
        (void)QTest::qWaitFor(
            [&] {
                window = WindowNamed(title);
                return window != 0 && !ClientArea(window).isEmpty();
            },
            10000);
        return window;
    }

    static QByteArray ReadAll(const QString& path)
    {
        QFile file(path);
        return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
    }

    QProcess fSource, fTarget;
};

} // namespace

TEST_P(CsvAcrossPrograms, AFileDroppedInAndTheListDraggedOut)
{
    // The table the program should hand out: the named systems of the catalogue beside it.
    const QString catalogue = fDir.filePath("stars.dat");
    Universe universe(catalogue.toUtf8().constData(), 1000, 20);
    ASSERT_GT(universe.CountItems(), 4);
    StarSysMask named(universe.CountItems(), false, 0);
    for (int32_t i = 0; i < universe.CountItems(); i++) {
        for (const char* name : kNamed) {
            if (std::string(universe.SystemAt(i)->GetName()) == name)
                named.SetStateSafe(i, true);
        }
    }
    ASSERT_EQ(named.CountItems(true), 4);
    const std::string expected = SystemSetCsv::Write(universe, named);

    QStringList counts;
    for (int n = 0; n <= universe.CountItems(); n++)
        counts << QString("Star Systems: %1").arg(n);
    const LabelReader countLine(kCountLine, counts);

    const QString file = fDir.filePath("some stars.csv");
    {
        QFile out(file);
        ASSERT_TRUE(out.open(QIODevice::WriteOnly));
        out.write(kFile);
    }
    const QString received = fDir.filePath("received.csv");

    ASSERT_TRUE(StartedAtTheSun());
    const unsigned long listWindow = Open(9, "Star List");
    ASSERT_NE(listWindow, 0u) << "no list window opened";
    const QPoint list = Move(listWindow, kListPlace);
    ASSERT_EQ(countLine.WaitFor(list, 0), 0);

    // In: the file dragged from the other program onto the Equals pad.
    const unsigned long source = StartPeer(fSource, "source", file, kSourcePlace, "CSV Source");
    ASSERT_NE(source, 0u) << "the other program's source window did not show";
    // The pointer stays over the pad after the drop, then wanders over the window and leaves.
    RunXdotool(DragSteps(ClientArea(source).center(), list + kEqualsPad));
    const int read = countLine.WaitFor(list, 4);
    EXPECT_EQ(read, 4) << "the list's count line (-1 when it shows no number; "
                       << countLine.Difference(list, 4) << " pixels differ)";
    // The control window's help line tells what the drop read, and keeps it while the pointer
    // is over the list window, whose pads, count line and list have help of their own.
    const QStringList helpTexts { "some stars.csv: 4 systems; no match on line 7", "",
        "Drop Pad: Copy list" };
    const LabelReader helpLine(QRect(2, 32, 316, 13), helpTexts, false);
    const QPoint controls = ClientArea(WindowNamed("3D Nightdome")).topLeft();
    EXPECT_EQ(helpLine.WaitFor(controls, 0), 0)
        << helpLine.Difference(controls, 0) << " pixels differ from the report";
    for (const QPoint over :
        { kEqualsPad + QPoint(3, 2), kNotPad, QPoint(40, 60), QPoint(60, 120), kEqualsPad }) {
        RunXdotool({ "mousemove", Number(list.x() + over.x()), Number(list.y() + over.y()), "sleep",
            "0.3" });
        EXPECT_EQ(helpLine.Read(controls), 0)
            << "with the pointer at " << over.x() << ", " << over.y() << " of the list";
    }
    RestThePointer();
    EXPECT_EQ(helpLine.WaitFor(controls, 1), 1) << "the line is cleared";
    RunXdotool(
        { "mousemove", Number(list.x() + kEqualsPad.x()), Number(list.y() + kEqualsPad.y()) });
    EXPECT_EQ(helpLine.WaitFor(controls, 2), 2) << "the pads' help is back";
    RestThePointer();
    ASSERT_TRUE(QTest::qWaitFor(
        [&] { return fSource.readAllStandardOutput().contains("drag ended, copied"); }, 10000))
        << "the other program's drag did not end as a copy";

    // Out: the list's handle dragged onto the other program's window.
    const unsigned long target = StartPeer(fTarget, "target", received, kTargetPlace, "CSV Target");
    ASSERT_NE(target, 0u) << "the other program's target window did not show";
    Drag(list + kStarDragger, ClientArea(target).center());
    ASSERT_TRUE(QTest::qWaitFor([&] { return QFile::exists(received); }, 10000))
        << "nothing was dropped on the other program";
    EXPECT_EQ(ReadAll(received).toStdString(), expected);
    EXPECT_EQ(ReadAll(received + ".txt").toStdString(), expected);

    EXPECT_EQ(fProgram.state(), QProcess::Running);
}

INSTANTIATE_TEST_SUITE_P(Desktop, CsvAcrossPrograms, ::testing::Values(false, true),
    [](const ::testing::TestParamInfo<bool>& info) {
        return info.param ? "UnderOpenbox" : "OnTheBareServer";
    });
