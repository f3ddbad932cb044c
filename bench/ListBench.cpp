// The list window over a universe of a million systems with named stars; one core. Every set
// reaches a pad the way a drag ending on it does: a drag-enter event, then a drop event, both
// carrying the message as the drag's payload, so the pad stamps it with its operation and hands
// it to the window, which combines it with its set, counts the set and, while the list is shown,
// lists the set's systems again.
//
// BM_Drop/<list>/<pad>: the whole universe dropped on each pad of a list that holds 100,000
// systems. "hidden": the list switched off, so the set operation and the count; "shown": up to
// the list's model having been reset with the set's systems; "painted": on until Qt has laid
// the rows out and painted the list once. Before each iteration, with the clock stopped, the
// list is given the same 100,000 systems again on its Equals pad and Qt catches up with all
// that drop left it to do, so each iteration starts from the one state and does the same work.
//
// BM_List100k/<list>: those 100,000 systems dropped on Equals of an empty list, shown or
// painted as above.
//
// BM_CsvDrop/<when>/<set>: a CSV file of a set (the 100,000 systems, about 112,000 rows; or
// the whole universe, about 1,125,000 rows) dropped as a file on Equals of a shown list, up to
// the list having been painted. "first": a new window, so the universe's name and position
// index is built too; "again": a window that has read a drop before.
#include "bench/MillionSystems.h"
#include "bench/WidgetBenchMain.h"
#include "core/MessageCodes.h"
#include "lists/DropPad.h"
#include "lists/ListWindow.h"
#include "lists/StarListView.h"
#include "query/SystemSetCsv.h"
#include "widgets/IButton.h"

#include <QFile>
#include <QMimeData>
#include <QTemporaryDir>
#include <QUrl>
#include <memory>
#include <random>
#include <string>

namespace {

constexpr const char* kPads[] = { "Plus", "Equals", "Minus", "NOT", "AND", "OR", "XOR" };

// No system at all.
const StarSysMask& Nothing()
{
    static const StarSysMask nothing(MillionSystems().CountItems(), false, 0);
    return nothing;
}

// Every system of the universe.
const StarSysMask& AllSystems()
{
    static const StarSysMask all(MillionSystems().CountItems(), true, 0);
    return all;
}

// 100,000 systems picked at random, as a search by class or magnitude finds them all over the
// universe: what a list holds before each drop of BM_Drop, and what BM_List100k drops.
const StarSysMask& SearchResult()
{
    static const std::unique_ptr<StarSysMask> set = [] {
        const int32_t systems = MillionSystems().CountItems();
        auto found = std::make_unique<StarSysMask>(systems, false, 0);
        std::mt19937 random(11);
        for (int32_t picked = 0; picked < 100000;) {
            const auto index = int32_t(random() % uint32_t(systems));
            if (!found->GetStateSafe(index)) {
                found->SetStateSafe(index, true);
                picked++;
            }
        }
        return found;
    }();
    return *set;
}

Message SetMessage(const StarSysMask& set)
{
    Message message(kStarArrayMessage);
    message.AddPointer(kSystemArrayPtrString, const_cast<StarSysMask*>(&set));
    return message;
}

// Counts the paint events a widget gets.
class PaintCounter : public QObject {
public:
    explicit PaintCounter(QWidget* widget) { widget->installEventFilter(this); }
    int paints = 0;

protected:
    bool eventFilter(QObject*, QEvent* event) override
    {
        paints += event->type() == QEvent::Paint;
        return false;
    }
};

// A list window as a user opens it, its list shown or switched off, and Qt done with it.
struct ListUnderTest {
    explicit ListUnderTest(bool shown)
        : list(std::make_unique<ListWindow>(
            BPoint(140, 140), 230, 340, "Star List", nullptr, &MillionSystems()))
        , listPaints(list->listView->viewport())
    {
        if (!shown) {
            list->showListBox->setChecked(false);
            DeliverPostedMessages();
        }
        Settle();
    }

    // Lets Qt run until it has done all a drop left it to do. A shown list lays its rows out
    // on a timer, and the window's next update paints them: Qt goes on until the list has
    // been painted. False when it never is.
    bool Settle()
    {
        if (!list->ShowsList()) {
            QCoreApplication::processEvents();
            return true;
        }
        const int before = listPaints.paints;
        for (int round = 0; round < 100 && listPaints.paints == before; round++)
            QCoreApplication::processEvents();
        return listPaints.paints != before;
    }

    std::unique_ptr<ListWindow> list;
    PaintCounter listPaints;
};

// One benchmark: dropped on pad of a list that holds before, shown or not; with painted, on
// until the list has been painted.
struct Case {
    bool shown;
    bool painted;
    const char* pad;
    const StarSysMask& (*before)();
    const StarSysMask& (*dropped)();
};

void BM_Drop(benchmark::State& state, const Case& c)
{
    ListUnderTest under(c.shown);
    ListWindow& list = *under.list;
    DropPad* equals = list.Pad("Equals");
    DropPad* target = list.Pad(c.pad);
    const Message before = SetMessage(c.before());
    const Message message = SetMessage(c.dropped());
    bool painted = true;
    for (auto _ : state) {
        state.PauseTiming();
        DropMessage(equals, before);
        under.Settle();
        state.ResumeTiming();
        DropMessage(target, message);
        if (c.painted)
            painted = under.Settle() && painted;
    }
    const int rows = list.listView->Model()->rowCount();
    state.counters["systems"] = list.systemCount;
    state.counters["set"] = list.Count();
    state.counters["rows"] = rows;
    if (list.Count() != list.Mask()->CountItems(true) || (c.shown && rows != list.Count()))
        state.SkipWithError("the list does not show its set");
    if (!painted)
        state.SkipWithError("the list was not painted");
}

// The set written as a CSV file once, kept for the rest of the run.
QString CsvFile(const StarSysMask& set, const char* name)
{
    static QTemporaryDir folder;
    const QString path = folder.filePath(QString::fromLatin1(name));
    if (!QFile::exists(path)) {
        QFile file(path);
        const std::string text = SystemSetCsv::Write(MillionSystems(), set);
        if (!file.open(QIODevice::WriteOnly)
            || file.write(text.data(), qint64(text.size())) != qint64(text.size()))
            return QString();
    }
    return path;
}

// Drops the file on target as a file manager's drag ending there does.
void DropFile(QWidget* target, const QString& path)
{
    QMimeData data;
    data.setUrls({ QUrl::fromLocalFile(path) });
    const QPoint middle(target->width() / 2, target->height() / 2);
    QDragEnterEvent enter(middle, Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(target, &enter);
    QDropEvent drop(QPointF(middle), Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(target, &drop);
}

void BM_CsvDrop(benchmark::State& state, bool first, const StarSysMask& (*dropped)())
{
    const QString path = CsvFile(dropped(), dropped == AllSystems ? "all.csv" : "found.csv");
    if (path.isEmpty()) {
        state.SkipWithError("the CSV file could not be written");
        return;
    }
    auto under = std::make_unique<ListUnderTest>(true);
    if (!first) {
        DropFile(under->list->Pad("Equals"), path);
        under->Settle();
    }
    bool painted = true;
    for (auto _ : state) {
        state.PauseTiming();
        if (first) {
            under.reset();
            under = std::make_unique<ListUnderTest>(true);
        } else {
            DropMessage(under->list->Pad("Equals"), SetMessage(Nothing()));
            under->Settle();
        }
        state.ResumeTiming();
        DropFile(under->list->Pad("Equals"), path);
        painted = under->Settle() && painted;
    }
    state.counters["set"] = under->list->Count();
    if (under->list->Count() != dropped().CountItems(true))
        state.SkipWithError("the list does not hold the set dropped");
    if (!painted)
        state.SkipWithError("the list was not painted");
}

// Qt's warning that the offscreen platform has no window manager to pass a fixed window size
// to, given for every list switched off, is left out of the report.
QtMessageHandler qtMessageHandler = nullptr;

void QuietMessageHandler(QtMsgType type, const QMessageLogContext& context, const QString& text)
{
    if (!text.contains(QLatin1String("propagateSizeHints")))
        qtMessageHandler(type, context, text);
}

} // namespace

int main(int argc, char** argv)
{
    qtMessageHandler = qInstallMessageHandler(QuietMessageHandler);
    return RunWidgetBenchmarks(argc, argv, [] {
        const auto add = [](const std::string& name, const Case& c) {
            benchmark::RegisterBenchmark(name.c_str(), BM_Drop, c)->Unit(benchmark::kMillisecond);
        };
        for (const char* until : { "hidden", "shown", "painted" }) {
            for (const char* pad : kPads) {
                add(std::string("BM_Drop/") + until + "/" + pad,
                    { until[0] != 'h', until[0] == 'p', pad, SearchResult, AllSystems });
            }
        }
        for (const char* until : { "shown", "painted" })
            add(std::string("BM_List100k/") + until,
                { true, until[0] == 'p', "Equals", Nothing, SearchResult });
        struct Dropped {
            const char* name;
            const StarSysMask& (*set)();
        };
        for (const bool first : { true, false }) {
            for (const Dropped& d :
                { Dropped { "100k", SearchResult }, Dropped { "all", AllSystems } }) {
                benchmark::RegisterBenchmark(
                    (std::string("BM_CsvDrop/") + (first ? "first/" : "again/") + d.name).c_str(),
                    BM_CsvDrop, first, d.set)
                    ->Unit(benchmark::kMillisecond);
            }
        }
    });
}
