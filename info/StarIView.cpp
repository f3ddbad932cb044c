// The star information terminal: filling its two slots, typing what changed, dragging systems out
// and the help line for the half under the mouse.
#include "info/StarIView.h"

#include "catalog/CNumbers.h"
#include "catalog/Star.h"
#include "catalog/StarSystem.h"
#include "catalog/Universe.h"
#include "core/CCoord.h"
#include "core/Constants.h"
#include "core/MessageCodes.h"
#include "render/AsciiText.h"
#include "render/RBitmap8.h"
#include "widgets/WidgetGeometry.h"

#include <QDragEnterEvent>
#include <QDropEvent>
#include <QMouseEvent>
#include <algorithm>
#include <cmath>
#include <string>

namespace {

constexpr int32_t kSingleSystemImageId = 2; // 'Raw8': the 32 x 32 drag image of one system

// Where things go on the screen (rows and columns of the terminal).
constexpr uint8_t kStar1FirstRow = 2;
constexpr uint8_t kDistanceRow = 6;
constexpr uint8_t kStar2FirstRow = 10;
constexpr uint8_t kNameCol = 4;
constexpr uint8_t kDistanceCol = 12;
constexpr uint8_t kClassCol = 28;
constexpr uint8_t kLuminosityCol = 40;
constexpr uint8_t kMembersShown = 3; // rows of a block; more members are counted, not listed
constexpr int32_t kNameLength = 23; // characters of a name's field, from kNameCol

// Types text at (row, col), at most maxLength characters of it.
void PrintAt(HWTerminal& terminal, int32_t row, uint8_t col, const char* text, int32_t maxLength)
{
    terminal.HWTMoveTo(uint8_t(row), col);
    terminal.HWTPrintString(text, maxLength);
}

// Types the name of member i of system at row of its block. The font has ASCII only, so the
// name is spelled in ASCII. A system of more members than the block has rows lists the first
// ones and ends the last row's name with how many more there are ("Wolf 630 B  +2"), the name
// shortened so that the count fits in the field.
void PrintName(HWTerminal& terminal, int32_t row, const StarSystem* system, int32_t i)
{
    std::string name = AsciiTransliteration(system->StarAt(i)->GetName());
    const int32_t more = system->CountItems() - kMembersShown;
    if (i == kMembersShown - 1 && more > 0) {
        const std::string mark = "  +" + std::to_string(more);
        name.resize(std::min(name.size(), size_t(kNameLength) - mark.size()));
        name += mark;
    }
    PrintAt(terminal, row, kNameCol, name.c_str(), kNameLength);
}

// How many members of system have a row.
int32_t MembersShown(const StarSystem* system)
{
    return std::min<int32_t>(system->CountItems(), kMembersShown);
}

} // namespace

int32_t StarIView::sLastHalf = 0;

StarIView::StarIView(BPoint where, const char* name, QWidget* parent)
    : TransitView<HWTerminal>(
        BRect(where.x, where.y, where.x + kWidth, where.y + kHeight), name, kCols, kRows, parent)
    , count(0)
    , systems(nullptr)
    , font(new RBMFont8(int32_t(kFontType), kSystemFontId, kSystemFontStripWidth,
          kSystemFontCharHeight, kSystemFontCharWidth, kSystemFontFirstChar, kSystemFontLastChar))
    , system1(nullptr)
    , system2(nullptr)
    , lastShown1(nullptr)
    , index1(-1)
    , index2(-1)
{
    setAcceptDrops(true);
    SetBMFont(font);
}

StarIView::~StarIView()
{
    // The thread renders with the font and calls back into this class.
    DetachedFromWindow();
    delete font;
}

void StarIView::InitTerminal()
{
    HWTPurgeBuffer();
    HWTClearTerminal();
    SetColorDecayRate(60);
    SetFollowLength(16);
    HWTCPS(60);
    // Tab stops every four columns put the column titles at 28 and 40.
    HWTPrintString("STAR 1\t\t\t\t\t\tSPECTRAL\tVISUAL\n", -1);
    HWTPrintString("NAME\t\t\t\t\t\tCLASS\t\tLUMINOSITY\n", -1);
    HWTPrintString(" A:\n B:\n C:\n\n", -1);
    HWTPrintString("  DISTANCE: \n\n", -1);
    HWTPrintString("STAR 2\t\t\t\t\t\tSPECTRAL\tR ASCENSION\n", -1);
    HWTPrintString("NAME\t\t\t\t\t\tCLASS\t\tDECLINATION\n", -1);
    HWTPrintString(" A:\n B:\n C:", -1);
}

void StarIView::PrintStarInfo(SIInfoType slot, long index)
{
    // Without a universe, or past its end, there is no system to show.
    auto* system = systems ? static_cast<StarSystem*>(systems->ItemAt(int32_t(index))) : nullptr;
    if (!system)
        return;
    // A first system goes to slot 1 whatever half it was dropped on.
    if (slot == kSIStar1 || index1 == -1) {
        index1 = int32_t(index);
        system1 = system;
    } else {
        index2 = int32_t(index);
        system2 = system;
    }
    // One system cannot be compared with itself.
    if (system1 == system2) {
        system2 = nullptr;
        index2 = -1;
    }

    if (!lastShown1 || lastShown1 != system1)
        PrintStar1Block();

    if (!system2) {
        HWTClearRow(kDistanceRow, kDistanceCol);
        for (uint8_t i = 0; i < kMembersShown; i++)
            HWTClearRow(uint8_t(kStar2FirstRow + i), kNameCol);
    } else {
        PrintStar2Block();
    }
    lastShown1 = system1;
}

void StarIView::PrintStar1Block()
{
    for (uint8_t i = 0; i < kMembersShown; i++)
        HWTClearRow(uint8_t(kStar1FirstRow + i), kNameCol);
    char text[128];
    for (int32_t i = 0; i < MembersShown(system1); i++) {
        const Star* star = system1->StarAt(i);
        const int32_t row = kStar1FirstRow + i;
        PrintName(*this, row, system1, i);
        FormatCLocale(
            text, sizeof text, "%.1f %s", star->GetMagnitude(), star->GetSpectralClassString());
        PrintAt(*this, row, kClassCol, text, 10);
        FormatCLocale(text, sizeof text, "%f", SolarLuminosity(star->GetMagnitude()));
        PrintAt(*this, row, kLuminosityCol, text, 10);
    }
}

void StarIView::PrintStar2Block()
{
    // From system 2 back to system 1, as CCoord takes it: the direction system 1 sees system 2
    // in. Parsecs.
    const SVector v(system1->position.x - system2->position.x,
        system1->position.y - system2->position.y, system1->position.z - system2->position.z);
    const double d = v.Magnitude();
    const CCoord c(v);

    char text[128];
    HWTClearRow(kDistanceRow, kDistanceCol);
    FormatCLocale(
        text, sizeof text, "%.2f parsecs ( %.2f light-years )", d, d * kLightYearsPerParsec);
    PrintAt(*this, kDistanceRow, kDistanceCol, text, 35);

    for (uint8_t i = 0; i < kMembersShown; i++)
        HWTClearRow(uint8_t(kStar2FirstRow + i), kNameCol);
    for (int32_t i = 0; i < MembersShown(system2); i++) {
        const Star* star = system2->StarAt(i);
        const int32_t row = kStar2FirstRow + i;
        PrintName(*this, row, system2, i);
        // Apparent magnitude at distance d from the absolute one (the magnitude at 10 pc).
        const double apparent = (star->GetMagnitude() - 5) - 5 * std::log10(1 / d);
        FormatCLocale(text, sizeof text, "%.1f %s", apparent, star->GetSpectralClassString());
        PrintAt(*this, row, kClassCol, text, 10);
    }

    FormatCLocale(text, sizeof text, "%.0fh", c.raHours);
    PrintAt(*this, kStar2FirstRow, 41, text, 3);
    FormatCLocale(text, sizeof text, "%.1fm", c.raMinutes);
    PrintAt(*this, kStar2FirstRow, 45, text, 5);
    FormatCLocale(text, sizeof text, "%+.0fd", c.decDegrees);
    PrintAt(*this, kStar2FirstRow + 1, 40, text, 4);
    FormatCLocale(text, sizeof text, "%.1f'", c.decMinutes);
    PrintAt(*this, kStar2FirstRow + 1, 45, text, 5);
}

void StarIView::MessageReceived(Message* message)
{
    switch (message->what) {
    case kUniversePointer:
        systems = static_cast<Universe*>(message->FindPointer(kUniversePtrString));
        count = systems ? systems->CountItems() : 0;
        InitTerminal();
        break;
    case kStarMessage: {
        const int32_t index = message->FindInt32(kSystemIndexString);
        if (index < 0)
            return;
        SIInfoType slot = kSIStar1;
        if (message->WasDropped()) {
            const BPoint drop = message->DropPoint();
            const QPoint where
                = mapFromGlobal(QPoint(int(std::floor(drop.x)), int(std::floor(drop.y))));
            if (where.y() >= kHalfBoundary)
                slot = kSIStar2;
        }
        PrintStarInfo(slot, index);
        break;
    }
    case kStarInfoBroadcast:
        // The chart's selection is heard but not followed: only drops fill the slots.
        (void)message->FindInt32(kSISelectionIndexString);
        break;
    case kStarArrayMessage:
        // A set has no one system to show.
        break;
    default:
        break;
    }
}

void StarIView::MouseMoved(QPoint where, Transit transit)
{
    switch (transit) {
    case B_ENTERED_VIEW:
        IBroadcastInfo();
        break;
    case B_INSIDE_VIEW: {
        const int32_t half = where.y() >= kHalfBoundary ? 2 : 1;
        if (half == sLastHalf)
            return;
        sLastHalf = half;
        ISetInfo(half == 2 ? "Star 2: Drop star here" : "Star 1: Drop star here");
        IBroadcastInfo();
        break;
    }
    case B_EXITED_VIEW:
        IClearInfo();
        break;
    default:
        break;
    }
}

void StarIView::mousePressEvent(QMouseEvent* event)
{
    const QPoint where = event->position().toPoint();
    const int32_t index = where.y() >= kHalfBoundary && index2 != -1 ? index2 : index1;
    if (index == -1)
        return;
    Message message(kStarMessage);
    message.AddInt32(kSystemIndexString, index);
    RBitmap8 image(BRect(0, 0, 31, 31));
    image.LoadFromResource(int32_t(kRaw8Type), kSingleSystemImageId, 0, 1024);
    StartMessageDrag(fDragStarter, this, message, &image, BPoint(16, 16));
}

void StarIView::dragEnterEvent(QDragEnterEvent* event)
{
    dragMoveEvent(event);
}

void StarIView::dragMoveEvent(QDragMoveEvent* event)
{
    // What was dragged out of this view is not taken back: a click would otherwise drop the
    // view's own contents on it again.
    if (DroppedOnItsSource(event, this))
        event->ignore();
    else
        AcceptMessageDrag(event);
}

void StarIView::dropEvent(QDropEvent* event)
{
    if (DroppedOnItsSource(event, this)) {
        event->ignore();
        return;
    }
    Message message;
    if (TakeDroppedMessage(event, this, &message))
        MessageReceived(&message);
}
