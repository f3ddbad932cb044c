// The star information terminal: two star systems dropped on its halves ("Star 1" above, "Star 2"
// below) are typed out with their members' classes and magnitudes, the first system's
// luminosities, the distance between the two and how the second looks from the first: apparent
// magnitudes, right ascension and declination. A system shown can be dragged out again; let go
// over this view itself, it changes nothing. A block lists three members of a system and counts
// the rest.
#pragma once

#include "info/HWTerminal.h"
#include "platform/BList.h"
#include "platform/BPoint.h"
#include "platform/qt/MessageDrag.h"
#include "platform/qt/Messaging.h"
#include "platform/qt/TransitView.h"
#include "render/RBMFont8.h"
#include "widgets/IBroadcaster.h"

#include <QWidget>
#include <cstdint>

class StarSystem;

// The slot a system goes into: 0 the upper "Star 1" block, 1 the lower "Star 2" block.
enum SIInfoType : int32_t {
    kSIStar1 = 0,
    kSIStar2 = 1,
};

class StarIView : public TransitView<HWTerminal>, public BHandler, public IBroadcaster {
public:
    static constexpr int32_t kCols = 52, kRows = 13;
    // The frame's extent from its origin; edges inclusive, so the widget is one pixel more.
    static constexpr float kWidth = 364, kHeight = 185;
    // View y of the boundary: from here down is the "Star 2" half.
    static constexpr int32_t kHalfBoundary = 92;

    // The terminal over (where.x, where.y, where.x + 364, where.y + 185), both slots empty and
    // the screen blank until the universe arrives.
    StarIView(BPoint where, const char* name, QWidget* parent = nullptr);
    // Stops the terminal thread before the font it draws with goes.
    ~StarIView() override;

    // Purges what is still to be typed, clears the screen and types the headers, at 60
    // characters a second with a trail of 16 steps fading at 60 steps a second.
    void InitTerminal();

    // Puts system index of the universe into slot (a first system always goes to slot 1,
    // whatever slot it was meant for) and types what changed.
    void PrintStarInfo(SIInfoType slot, long index);

    // 'UPtr' brings the universe and resets the screen, 'StaR' fills the slot of the half it was
    // dropped on; 'SIBc' and 'SAry' are not followed.
    void MessageReceived(Message* message) override;

    // Tests catch what a press would drag instead of running the drag.
    void SetDragStarter(DragStarter starter) { fDragStarter = std::move(starter); }

    // The half the last move inside any star information view was over: 1 or 2, 0 before the
    // first. One value for all of them.
    static int32_t RememberedHalf() { return sLastHalf; }

    int32_t Count() const { return count; }
    const BList* Systems() const { return systems; }
    const StarSystem* System1() const { return system1; }
    const StarSystem* System2() const { return system2; }
    const StarSystem* LastShown1() const { return lastShown1; }
    int32_t Index1() const { return index1; }
    int32_t Index2() const { return index2; }

protected:
    void MouseMoved(QPoint where, Transit transit) override;
    bool PassesTransitsOn() const override { return false; }
    void mousePressEvent(QMouseEvent* event) override;
    void dragEnterEvent(QDragEnterEvent* event) override;
    void dragMoveEvent(QDragMoveEvent* event) override;
    void dropEvent(QDropEvent* event) override;

private:
    // Types the members of system1 with their classes, magnitudes and luminosities.
    void PrintStar1Block();
    // Types the distance, the members of system2 as seen from system1, and its direction.
    void PrintStar2Block();

    int32_t count; // systems in the universe
    BList* systems; // the universe's systems; not owned, null until 'UPtr'
    RBMFont8* font; // owned
    StarSystem* system1; // in the "Star 1" slot, or null
    StarSystem* system2; // in the "Star 2" slot, or null
    StarSystem* lastShown1; // whose members the Star 1 block shows, or null
    int32_t index1; // of system1 in systems, -1 when empty
    int32_t index2; // of system2, -1 when empty
    DragStarter fDragStarter;

    // The half under the mouse at the last move; shared by every view, 0 for neither.
    static int32_t sLastHalf;
};
