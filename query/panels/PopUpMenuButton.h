// A pop-up menu in a field of its own: a button showing the item now marked, whose menu marks
// one item of its list at a time (radio mode). Clicking it, or Space when it has the focus,
// opens the menu; choosing an item marks it and makes it the button's label.
#pragma once

#include <QToolButton>
#include <initializer_list>

class QActionGroup;
class QMenu;

class PopUpMenuButton : public QToolButton {
public:
    // The button is named name and its menu menuName; items in menu order, marked the one
    // marked at start.
    PopUpMenuButton(const char* name, const char* menuName,
        std::initializer_list<const char*> items, int marked, QWidget* parent);

    // The index of the marked item.
    int MarkedIndex() const { return fMarked; }
    // Marks item index and shows it; an index outside the menu changes nothing.
    void SetMarked(int index);
    int CountItems() const;
    QString ItemText(int index) const;

    QMenu* Menu() const { return fMenu; }

protected:
    // Without the style's menu arrow, which leaves a one-letter field no room for its letter:
    // an arrow of its own at the right end instead, smaller where room is short.
    void paintEvent(QPaintEvent* event) override;

private:
    QMenu* fMenu; // a child
    QActionGroup* fGroup; // a child
    int fMarked = 0;
};
