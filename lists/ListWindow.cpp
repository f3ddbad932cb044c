// The list window: its pads, count line, check box, list and handle, the set operations a drop
// makes, and the set saved as CSV and read from CSV drops.
#include "lists/ListWindow.h"

#include "core/MessageCodes.h"
#include "lists/CsvDrop.h"
#include "lists/DropPad.h"
#include "lists/HelpLineReport.h"
#include "lists/LongWork.h"
#include "lists/SetCsvSaver.h"
#include "lists/StarDragger.h"
#include "lists/StarListView.h"
#include "platform/qt/MessageDrag.h"
#include "query/SystemSetCsv.h"
#include "widgets/IButton.h"
#include "widgets/InfoView.h"
#include "widgets/WidgetGeometry.h"

#include <QCloseEvent>
#include <QContextMenuEvent>
#include <QDragEnterEvent>
#include <QDropEvent>
#include <QFontMetrics>
#include <QMenu>
#include <QShortcut>
#include <algorithm>
#include <cstdio>
#include <vector>

namespace {

struct PadEntry {
    const char* name;
    float x, y, width, height;
    int32_t picture; // 'Dzon' resource
    uint32_t tag;
    const char* help;
};

constexpr PadEntry kPads[] = {
    { "Plus", 0, 0, 32, 32, 0, kAddTag, "Drop Pad: Add to list" },
    { "Equals", 40, 0, 32, 32, 1, kEqualsTag, "Drop Pad: Copy list" },
    { "Minus", 80, 0, 32, 32, 2, kMinusTag, "Drop Pad: Remove from list" },
    { "NOT", 2, 34, 32, 16, 3, kNotTag, "Drop Pad: Copy and invert list" },
    { "AND", 42, 34, 32, 16, 4, kAndTag, "Drop Pad: Logical AND" },
    { "OR", 82, 34, 32, 16, 5, kOrTag, "Drop Pad: Logical OR" },
    { "XOR", 122, 34, 32, 16, 6, kXorTag, "Drop Pad: Logical XOR" },
};

constexpr float kHiddenHeight = 68; // the frame height while the list is switched off
constexpr float kMinimumHeight = 120, kMaximumHeight = 32000;

const QKeySequence kSaveKey(Qt::CTRL | Qt::Key_S);

} // namespace

ListWindow::ListWindow(BPoint where, float width, float height, const char* title,
    QObject* infoTarget, Universe* universe)
    : universe(universe)
    , systemCount(universe->CountItems())
    , mask(new StarSysMask(systemCount, false, 0))
    , count(0)
    , showList(true)
    , frameWidth(width)
    , savedHeight(height)
    , fInfoTarget(infoTarget)
    , fLongWork(std::make_unique<LongWork>(this))
    , fReport(infoTarget)
{
    setAttribute(Qt::WA_DeleteOnClose);
    setWindowTitle(QString::fromUtf8(title));
    setGeometry(int(where.x), int(where.y), int(frameWidth) + 1, int(height) + 1);
    SetHeightLimits();
    setAcceptDrops(true);

    const int w = int(frameWidth) + 1;
    fMainView = new QWidget(this);
    fMainView->setObjectName("mainview");
    PaintWindowGrey(fMainView);
    fMainView->setGeometry(rect());

    for (const PadEntry& entry : kPads) {
        auto* pad = new DropPad(BPoint(entry.x, entry.y), entry.width, entry.height, entry.name,
            entry.picture, this, fMainView);
        pad->SetTag(kDropTagField, int32_t(entry.tag));
        pad->ISetTarget(infoTarget);
        pad->ISetInfo(entry.help);
    }

    countView = new InfoView(BRect(0, 54, 100, 66), "Count View", "Star Systems: 0", fMainView);
    countView->ISetTarget(infoTarget);
    countView->ISetInfo("Star systems in list");

    showListBox = new ICheckBox(BRect(float(w - 1) - 80, 49, float(w - 1), 63), "Show List CB",
        "Show List", new Message(kShowListChanged), fMainView);
    WidenCountView();
    showListBox->setChecked(true);
    showListBox->SetTarget(this);
    showListBox->ISetTarget(infoTarget);
    showListBox->ISetInfo("List operations are much faster when list is not shown");

    listView = new StarListView(
        BRect(0, 71, float(w - 1), float(this->height() - 1)), "The List", mask, fMainView);
    listView->ISetTarget(infoTarget);
    listView->ISetInfo("Star List: Drag stars to another view  [Ctrl+S]");

    starDragger
        = new StarDragger(BPoint(frameWidth - 42, 10), "Star Dragger", mask, universe, fMainView);
    starDragger->ISetTarget(infoTarget);
    starDragger->ISetInfo("Star List Dragger: Drag to another view  [Ctrl+S]");

    fContextMenu = new QMenu(this);
    fSaveAction = fContextMenu->addAction(QStringLiteral("Save as CSV\u2026"));
    // Shown in the menu; the window's shortcut below is what answers the key.
    fSaveAction->setShortcut(kSaveKey);
    fSaveAction->setShortcutContext(Qt::WidgetShortcut);
    connect(fSaveAction, &QAction::triggered, this, [this] { SaveAsCsv(); });
    auto* saveKey = new QShortcut(kSaveKey, this);
    saveKey->setContext(Qt::WindowShortcut);
    connect(saveKey, &QShortcut::activated, this, [this] { SaveAsCsv(); });
    show();
}

void ListWindow::closeEvent(QCloseEvent* event)
{
    // Closed in the middle of a long drop or save, the window would go from under it.
    if (fLongWork->Busy())
        event->ignore();
    else
        QWidget::closeEvent(event);
}

ListWindow::~ListWindow()
{
    // The list reads the mask while it goes.
    delete fMainView;
    delete mask;
}

DropPad* ListWindow::Pad(const char* name) const
{
    return fMainView->findChild<DropPad*>(QString::fromUtf8(name));
}

void ListWindow::SetHeightLimits()
{
    const int w = int(frameWidth) + 1;
    if (showList) {
        setMinimumSize(w, int(kMinimumHeight) + 1);
        setMaximumSize(w, int(kMaximumHeight) + 1);
    } else {
        setFixedSize(w, int(kHiddenHeight) + 1);
    }
}

void ListWindow::MessageReceived(Message* message)
{
    // While a long drop is read the window still runs its events; nothing else may change
    // the set meanwhile, though the list may be switched off and on.
    if (fLongWork->Busy() && message->what != kShowListChanged)
        return;
    const bool tagged = message->HasInt32(kDropTagField);
    const auto tag = uint32_t(message->FindInt32(kDropTagField));
    switch (message->what) {
    case kStarArrayMessage: {
        const auto* set
            = static_cast<const StarSysMask*>(message->FindPointer(kSystemArrayPtrString));
        if (!set)
            return;
        DropSet(set, tagged, tag);
        break;
    }
    case kStarMessage: {
        const int32_t index = message->FindInt32(kSystemIndexString);
        if (index < 0)
            return;
        DropSystem(index, tagged, tag);
        break;
    }
    case kCsvDropMessage: {
        const auto* data = static_cast<const QMimeData*>(message->FindPointer(kCsvDataField));
        if (!data || !DropCsv(data, tagged, tag))
            return;
        break;
    }
    case kShowListChanged:
        showList = showListBox->isChecked();
        if (!showList) {
            savedHeight = float(height() - 1);
            SetHeightLimits();
            resize(int(frameWidth) + 1, int(kHiddenHeight) + 1);
        } else {
            SetHeightLimits();
            resize(int(frameWidth) + 1, int(savedHeight) + 1);
            BuildList();
        }
        return;
    default:
        return;
    }
    ShowCount();
    BuildList();
}

void ListWindow::WidenCountView()
{
    // 100 pixels hold "Star Systems: " and two digits of our font: the count line reaches as far
    // as a count of seven digits needs (a million systems), never under the check box.
    countView->ensurePolished();
    const QFontMetrics metrics(countView->font());
    int digit = 0;
    for (char c = '0'; c <= '9'; c++)
        digit = std::max(digit, metrics.horizontalAdvance(QChar(c)));
    const int needed = metrics.horizontalAdvance(QStringLiteral("Star Systems: ")) + 7 * digit
        + 2 * countView->margin() + 1;
    const int room = showListBox->geometry().left();
    countView->resize(std::clamp(needed, countView->width(), std::max(room, countView->width())),
        countView->height());
}

void ListWindow::ShowCount()
{
    count = mask->CountItems(true);
    char text[64];
    std::snprintf(text, sizeof text, "Star Systems: %ld", long(count));
    countView->setText(QString::fromUtf8(text));
}

void ListWindow::leaveEvent(QEvent* event)
{
    QWidget::leaveEvent(event);
    fReport.Release();
}

std::vector<IBroadcaster*> ListWindow::Broadcasters() const
{
    std::vector<IBroadcaster*> all { countView, showListBox, listView, starDragger };
    for (const PadEntry& entry : kPads)
        all.push_back(Pad(entry.name));
    return all;
}

bool ListWindow::DropCsv(const QMimeData* data, bool tagged, uint32_t tag)
{
    auto tables = std::make_shared<std::vector<CsvDrop::Table>>();
    QString label, error;
    if (!CsvDrop::Take(data, tables.get(), &label, &error)) {
        fReport.Show(label, error, QString(), Broadcasters());
        return false;
    }
    label = tables->size() == 1 ? tables->front().label
                                : QStringLiteral("%1 CSV files").arg(tables->size());
    // Matching a few hundred thousand rows, and indexing the universe before the first drop,
    // takes seconds: it is done on a thread of its own, into a set of its own, and the list
    // changes only once all of it has been read.
    struct Reading {
        explicit Reading(int32_t systems)
            : found(systems, false, 0)
        {
        }
        std::shared_ptr<const SystemMatcher> matcher;
        StarSysMask found;
        SystemSetCsvResult total;
        QString failed; // the table that could not be read, with why in total.error
    };
    auto reading = std::make_shared<Reading>(systemCount);
    reading->matcher = fMatcher;
    const Universe* sky = universe;
    const bool read
        = fLongWork->Run(QStringLiteral("Reading %1\u2026").arg(label), [reading, tables, sky] {
              if (!reading->matcher)
                  reading->matcher = SystemMatcher::Shared(sky);
              // Several files make one set; they are all read before the list changes.
              StarSysMask one(reading->found.GetSystemCount(), false, 0);
              SystemSetCsvResult& total = reading->total;
              total.ok = true;
              for (const CsvDrop::Table& table : *tables) {
                  const SystemSetCsvResult result = SystemSetCsv::Read(
                      std::string_view(table.text.constData(), size_t(table.text.size())),
                      *reading->matcher, &one);
                  if (!result.ok) {
                      total = result;
                      reading->failed = table.label;
                      return;
                  }
                  reading->found += one;
                  total.rows += result.rows;
                  total.matchedRows += result.matchedRows;
                  total.unmatchedLines.insert(total.unmatchedLines.end(),
                      result.unmatchedLines.begin(), result.unmatchedLines.end());
              }
              total.systems = reading->found.CountItems(true);
          });
    if (!read) {
        fReport.Show(
            label, QStringLiteral(": cancelled, the list is unchanged"), QString(), Broadcasters());
        return false;
    }
    fMatcher = reading->matcher;
    if (!reading->total.ok) {
        fReport.Show(reading->failed,
            QStringLiteral(", ") + QString::fromStdString(reading->total.error), QString(),
            Broadcasters());
        return false;
    }
    DropSet(&reading->found, tagged, tag);
    fReport.ShowRead(label, reading->total, Broadcasters());
    return true;
}

bool ListWindow::SaveAsCsv()
{
    return !fLongWork->Busy() && SetCsvSaver::Save(this, *universe, *mask, fLongWork.get());
}

void ListWindow::contextMenuEvent(QContextMenuEvent* event)
{
    fContextMenu->popup(event->globalPos());
    event->accept();
}

void ListWindow::DropSet(const StarSysMask* set, bool tagged, uint32_t tag)
{
    if (!tagged) {
        *mask += *set;
        return;
    }
    switch (tag) {
    case kAddTag:
        *mask += *set;
        break;
    case kEqualsTag:
        *mask = *set;
        break;
    case kMinusTag:
        *mask -= *set;
        break;
    case kNotTag:
        *mask = *set;
        ~*mask;
        break;
    case kAndTag:
        *mask &= *set;
        break;
    case kOrTag:
        *mask |= *set;
        break;
    case kXorTag:
        *mask ^= *set;
        break;
    default:
        break;
    }
}

void ListWindow::DropSystem(int32_t index, bool tagged, uint32_t tag)
{
    // One system follows rules of its own: NOT flips it alone, AND leaves the list be.
    const bool old = mask->GetStateSafe(index);
    if (!tagged) {
        mask->SetStateSafe(index, true);
        return;
    }
    switch (tag) {
    case kAddTag:
    case kOrTag:
        mask->SetStateSafe(index, true);
        break;
    case kEqualsTag:
        mask->SetAll(false);
        mask->SetStateSafe(index, true);
        break;
    case kMinusTag:
        mask->SetStateSafe(index, false);
        break;
    case kNotTag:
    case kXorTag:
        mask->SetStateSafe(index, !old);
        break;
    default:
        break;
    }
}

void ListWindow::BuildList()
{
    if (!showList)
        return;
    std::vector<int32_t> indices;
    for (int32_t i = 0; i < systemCount; i++) {
        if (mask->GetStateSafe(i) && universe->SystemAt(i))
            indices.push_back(i);
    }
    listView->Model()->SetSystems(universe, std::move(indices));
}

void ListWindow::resizeEvent(QResizeEvent*)
{
    fMainView->setGeometry(rect());
    listView->setGeometry(0, 71, width(), std::max(0, height() - 71));
}

void ListWindow::dragEnterEvent(QDragEnterEvent* event)
{
    // Whether the drag is CSV is settled here, once: telling plain text from a table reads it.
    fCsvDrag = !DraggedMessage(event->mimeData()) && CsvDrop::Offers(event->mimeData());
    dragMoveEvent(event);
}

void ListWindow::dragMoveEvent(QDragMoveEvent* event)
{
    if (fCsvDrag)
        CsvDrop::AcceptCopy(event);
    else
        AcceptMessageDrag(event);
}

void ListWindow::dropEvent(QDropEvent* event)
{
    CsvDrop::Deliver(event, this, this);
}
