// The pop-up menu field: its radio-mode menu and its face.
#include "query/panels/PopUpMenuButton.h"

#include <QActionGroup>
#include <QMenu>
#include <QStyleOptionToolButton>
#include <QStylePainter>

namespace {

// The arrow that tells the field for a menu: smaller in a field too narrow for the full one.
constexpr int kArrowSize = 7, kSmallArrowSize = 5;
constexpr int kMargin = 6, kSmallMargin = 3; // between the arrow and the frame

} // namespace

PopUpMenuButton::PopUpMenuButton(const char* name, const char* menuName,
    std::initializer_list<const char*> items, int marked, QWidget* parent)
    : QToolButton(parent)
    , fMenu(new QMenu(this))
    , fGroup(new QActionGroup(this))
{
    setObjectName(QString::fromUtf8(name));
    fMenu->setObjectName(QString::fromUtf8(menuName));
    fGroup->setExclusive(true);
    for (const char* item : items) {
        QAction* action = fMenu->addAction(QString::fromUtf8(item));
        action->setCheckable(true);
        fGroup->addAction(action);
    }
    connect(fGroup, &QActionGroup::triggered, this,
        [this](QAction* action) { SetMarked(int(fMenu->actions().indexOf(action))); });
    setMenu(fMenu);
    setPopupMode(QToolButton::InstantPopup);
    setToolButtonStyle(Qt::ToolButtonTextOnly);
    setFocusPolicy(Qt::StrongFocus);
    SetMarked(marked);
}

void PopUpMenuButton::SetMarked(int index)
{
    const QList<QAction*> actions = fMenu->actions();
    if (index < 0 || index >= actions.size())
        return;
    fMarked = index;
    actions[index]->setChecked(true);
    setText(actions[index]->text());
}

int PopUpMenuButton::CountItems() const
{
    return int(fMenu->actions().size());
}

QString PopUpMenuButton::ItemText(int index) const
{
    const QList<QAction*> actions = fMenu->actions();
    return index >= 0 && index < actions.size() ? actions[index]->text() : QString();
}

void PopUpMenuButton::paintEvent(QPaintEvent*)
{
    QStylePainter painter(this);
    QStyleOptionToolButton option;
    initStyleOption(&option);
    option.features &= ~(QStyleOptionToolButton::HasMenu | QStyleOptionToolButton::MenuButtonPopup);
    const bool roomy
        = fontMetrics().horizontalAdvance(text()) + 3 * kMargin + kArrowSize + 4 <= width();
    const int arrowSize = roomy ? kArrowSize : kSmallArrowSize;
    const int margin = roomy ? kMargin : kSmallMargin;
    // The label centred in what the arrow leaves.
    option.rect.setRight(option.rect.right() - arrowSize - (roomy ? 0 : margin));
    // The frame over the whole field, the label in what the arrow leaves.
    QStyleOptionToolButton frame = option;
    frame.rect = rect();
    frame.text.clear();
    painter.drawComplexControl(QStyle::CC_ToolButton, frame);
    option.subControls = QStyle::SC_None;
    painter.drawControl(QStyle::CE_ToolButtonLabel, option);
    QStyleOption indicator;
    indicator.initFrom(this);
    indicator.rect
        = QRect(width() - arrowSize - margin, (height() - arrowSize) / 2, arrowSize, arrowSize);
    painter.drawPrimitive(QStyle::PE_IndicatorArrowDown, indicator);
}
