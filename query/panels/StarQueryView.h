// A query panel of the find window: a framed box whose controls fill in the parameters of one
// query, and a drag handle at its right edge. Pressing the handle runs the query over the whole
// universe; whatever matched is dragged away as one system ('StaR') or a set ('SAry'). A single
// system dropped on the panel fills its controls from that system, unless it comes from the
// panel's own handle.
#pragma once

#include "catalog/Universe.h"
#include "platform/BRect.h"
#include "platform/qt/Messaging.h"
#include "platform/qt/TransitView.h"
#include "query/StarSysMask.h"
#include "query/StarSysQuery.h"
#include "render/RBitmap8.h"
#include "widgets/IBroadcaster.h"

#include <QGroupBox>
#include <initializer_list>
#include <memory>

class PopUpMenuButton;
class QueryDragger;
class TextControl;

class StarQueryView : public TransitView<QGroupBox>, public BHandler, public IBroadcaster {
public:
    // A panel of frame's size titled title over universe (not owned); its result starts empty.
    StarQueryView(
        BRect frame, const char* name, const char* title, Universe* universe, QWidget* parent);
    ~StarQueryView() override;

    // Reads the controls into the parameter record and runs the query: the number of systems
    // that matched, whose set is now the panel's mask.
    int32_t PerformQuery();
    // What a drag of the last result carries: 'StaR' with "Star Index" for exactly one system,
    // 'SAry' with "System Array Pointer" (the panel's own mask) otherwise. The caller owns it.
    Message* GetDragMessage();
    // A new 32 x 32 drag image, the single-system picture for exactly one system and the set
    // picture otherwise; rect is set to its bounds. The panel keeps it until the next drag.
    RBitmap8* GetDragBitmap(BRect* rect);

    // Sets the help target of the panel and of its handle.
    void ISetTarget(QObject* target) override;

    int32_t GetSelectedItems() const { return selectedItems; }
    void SetMask(StarSysMask* source) { *mask = *source; }
    void GetMask(StarSysMask* target) const { *target = *mask; }
    bool IsSystemSelected(int32_t index) const { return mask->GetStateSafe(index); }
    int32_t FindFirstSystem() const; // the lowest index in the result, -1 for none
    int32_t FindLastSystem() const; // the highest, -1 for none

    QueryDragger* Dragger() const { return dragger; }
    StarSysQuery* Query() const { return query; }
    const void* QueryParam() const { return queryParam; }

    // A 'StaR' message with an index of the universe fills the controls from that system;
    // anything else is left alone.
    void MessageReceived(Message* message) override;

protected:
    // Reads the controls into the panel's parameter record and points queryParam at it.
    virtual void SetQueryParams() = 0;
    // Makes the panel's query over universe; each panel calls it from its constructor.
    virtual void InitQuery(Universe* universe) = 0;
    // Fills the controls from a system dropped on the panel; by default nothing happens.
    virtual void SystemDropped(StarSystem* system);
    // Makes the handle, 38 pixels in from the right edge and centred on the controls' row.
    virtual void InitQueryDragger();

    void MouseMoved(QPoint where, Transit transit) override;
    bool PassesTransitsOn() const override { return false; }
    void resizeEvent(QResizeEvent* event) override;
    void dragEnterEvent(QDragEnterEvent* event) override;
    void dragMoveEvent(QDragMoveEvent* event) override;
    void dropEvent(QDropEvent* event) override;

    // The controls stand in a row, each placed by moving the previous one's frame to the right,
    // and each is as high as its style wants, centred on the middle of the room under the
    // title. The first menu starts the row.
    BRect FirstMenuFrame(float width) const;
    // The frame moved dx to the right, width wide.
    static BRect NextFrame(BRect previous, float dx, float width);
    PopUpMenuButton* AddPopUpMenu(BRect frame, const char* barName, const char* menuName,
        std::initializer_list<const char*> items, int marked = 0);
    // The comparison menu "Mode Menu" in its bar "mode MB", and the star-mode menu "Star Mode"
    // in "star mode MB"; their first item marked.
    PopUpMenuButton* AddModeMenu(BRect frame);
    PopUpMenuButton* AddStarModeMenu(BRect frame);
    TextControl* AddTextControl(
        BRect frame, const char* name, const char* label, const char* text, float divider);
    // A number typed into a field, read as strtod reads it in the "C" locale: what does not
    // start with a number reads as 0.
    static double ReadNumber(const char* text);
    // The vertical middle of the room under the title, in panel coordinates.
    float ControlsMiddle() const;

    QueryDragger* dragger; // a child
    StarSysMask* mask; // the last result; owned
    StarSysQuery* query; // owned; made by InitQuery
    void* queryParam; // the panel's parameter record, once SetQueryParams has run
    Universe* universe; // not owned
    int32_t selectedItems; // systems in the last result
    std::unique_ptr<RBitmap8> singleDragBitmap; // the image of the last one-system drag
    std::unique_ptr<RBitmap8> multiDragBitmap; // the image of the last drag of a set
};
