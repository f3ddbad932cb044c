// A list window: one set of star systems, changed by dropping sets and single systems on its
// seven drop pads (add, copy, remove, copy inverted, AND, OR, XOR) or anywhere else in it (add).
// It shows the set's size, lists the systems by name unless the list is switched off, and
// offers the set, or the systems selected in the list, to every other view. Sets also leave as
// CSV (saved from its context menu or Ctrl+S, or dragged from its handle to another program)
// and come in as CSV files or text dropped on it.
#pragma once

#include "catalog/Universe.h"
#include "lists/HelpLineReport.h"
#include "platform/BPoint.h"
#include "platform/qt/Messaging.h"
#include "query/StarSysMask.h"
#include "query/SystemMatcher.h"

#include <QPointer>
#include <QString>
#include <QWidget>
#include <memory>
#include <vector>

class DropPad;
class IBroadcaster;
class LongWork;
class ICheckBox;
class InfoView;
class QAction;
class QMenu;
class QMimeData;
class StarDragger;
class StarListView;

class ListWindow : public QWidget, public BHandler {
public:
    // A window whose frame reaches from where to where + (width, height) (so width + 1 by
    // height + 1 pixels), its help going to infoTarget, over universe (not owned). It shows
    // itself.
    ListWindow(BPoint where, float width, float height, const char* title, QObject* infoTarget,
        Universe* universe);
    ~ListWindow() override;

    // Set operations for 'SAry', 'StaR' and 'CSVd' (by the "drop tag" a pad stamped, or adding
    // when there is none) and the "Show List" check box.
    void MessageReceived(Message* message) override;
    // Refills the list from the set, while the list is shown.
    void BuildList();

    StarSysMask* Mask() const { return mask; }
    int32_t Count() const { return count; }
    bool ShowsList() const { return showList; }
    DropPad* Pad(const char* name) const;

    // Asks where (SetCsvSaver's dialog) and saves the set there as CSV; false when cancelled or
    // when it could not be written (the user has been told why).
    bool SaveAsCsv();
    // The right-click menu, with "Save as CSV…" (also Ctrl+S anywhere in the window).
    QMenu* ContextMenu() const { return fContextMenu; }
    QAction* SaveAction() const { return fSaveAction; }
    // What the last CSV drop did, as shown in the help line.
    const QString& CsvReport() const { return fReport.Text(); }

    Universe* universe; // not owned
    int32_t systemCount; // the universe's, when the window was made
    StarSysMask* mask; // the list's set; owned
    InfoView* countView; // "Star Systems: n"
    int32_t count; // the set's size as last shown
    StarListView* listView;
    ICheckBox* showListBox;
    bool showList;
    float frameWidth; // the window's frame width, fixed (width() is Qt's, in pixels)
    float savedHeight; // the frame height to return to when the list is shown again
    StarDragger* starDragger;

protected:
    void resizeEvent(QResizeEvent* event) override;
    void dragEnterEvent(QDragEnterEvent* event) override;
    void dragMoveEvent(QDragMoveEvent* event) override;
    void dropEvent(QDropEvent* event) override;
    void contextMenuEvent(QContextMenuEvent* event) override;
    void leaveEvent(QEvent* event) override;
    void closeEvent(QCloseEvent* event) override;

private:
    void DropSet(const StarSysMask* set, bool tagged, uint32_t tag);
    void DropSystem(int32_t index, bool tagged, uint32_t tag);
    // Reads the CSV data carries into a set and drops that; on failure changes nothing. Either
    // way the help line says what happened. False when nothing was read.
    bool DropCsv(const QMimeData* data, bool tagged, uint32_t tag);
    void ShowCount();
    // The widgets that post help, to be kept quiet while a report stands on the help line.
    std::vector<IBroadcaster*> Broadcasters() const;
    // Makes the count line wide enough for every count up to a million in the window's font.
    void WidenCountView();
    // Fixes the height (list hidden) or lets it go from 120 up (list shown).
    void SetHeightLimits();

    QWidget* fMainView; // "mainview", a child
    QPointer<QObject> fInfoTarget; // the help line
    QMenu* fContextMenu; // a child
    QAction* fSaveAction; // the menu's
    std::shared_ptr<const SystemMatcher> fMatcher; // taken at the first CSV drop, then kept
    bool fCsvDrag = false; // the drag over the window offers CSV rather than a message
    std::unique_ptr<LongWork> fLongWork; // large drops and saves
    HelpLineReport fReport; // what the last CSV drop did
};
