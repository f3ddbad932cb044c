// The help page and the window that shows it.
#include "controls/HelpWindow.h"

#include <QGuiApplication>
#include <QLabel>
#include <QScreen>
#include <QScrollArea>
#include <QScrollBar>
#include <QVBoxLayout>
#include <algorithm>

namespace {

// Two columns: the gesture or key, then what it does. The arrows and the minus sign are
// written as entities so that the source stays plain ASCII.
constexpr char kHelpText[] = R"(
<style>
  h3 { margin-top: 10px; margin-bottom: 4px; }
  td { padding: 1px 10px 1px 0; vertical-align: top; }
  td.k { white-space: nowrap; font-weight: bold; }
</style>
<h3>Mouse</h3>
<table>
<tr><td class="k" width="130">Trackball</td>
  <td>Drag to turn the chart; it keeps turning once let go. The first control of the
  control window.</td></tr>
<tr><td class="k" width="130">Camera distance</td><td>Drag up to move in, down to move out.</td></tr>
<tr><td class="k" width="130">Sliders</td>
  <td>Brightness, contrast, clipping sphere: drag left for more, right for less.</td></tr>
<tr><td class="k" width="130">Chart: hover</td><td>Names the star under the pointer on the strip.</td></tr>
<tr><td class="k" width="130">Chart: click</td>
  <td>A star selects it; the selection becomes the origin; the origin is zoomed in to.
  Empty space deselects, or with nothing selected brings back the Sun and every star.</td></tr>
<tr><td class="k" width="130">Chart: drag</td>
  <td>A star, or from empty space every star shown, to another window.</td></tr>
<tr><td class="k" width="130">Chart: drop</td>
  <td>A star is selected and made the origin (Ctrl held: the origin stays); a set is shown
  alone.</td></tr>
<tr><td class="k" width="130">Chart: corner box</td>
  <td>Click to show or hide the clipping cube.</td></tr>
<tr><td class="k" width="130">Find</td>
  <td>Drag a panel's handle to another window for the stars it finds; drop stars on a
  panel to copy them to it.</td></tr>
<tr><td class="k" width="130">Star list</td>
  <td>Drop stars, CSV files or CSV text on its pads (add, copy, remove, NOT, AND, OR, XOR)
  or anywhere else (add); drag its handle, or stars from the list, to another window, or the
  handle to another program as CSV; right-click to save the list as CSV.</td></tr>
<tr><td class="k" width="130">H-R diagram</td>
  <td>Drop stars on it, or select them on a chart; hover a marker to name its star; drag a
  marker, or from empty space every star, to another window.</td></tr>
<tr><td class="k" width="130">Star info</td>
  <td>Drop a star on the upper or the lower half; drag a star shown to another window.</td></tr>
</table>
<h3>Keys in a chart</h3>
<table>
<tr><td class="k" width="130">&larr; &rarr; &uarr; &darr;</td>
  <td>Turn as the trackball dragged that way; hold to turn faster.</td></tr>
<tr><td class="k" width="130">+ &minus;, wheel</td><td>Move in and out, as the camera distance.</td></tr>
<tr><td class="k" width="130">Space, Esc</td><td>Stop turning and moving.</td></tr>
<tr><td class="k" width="130">Home</td><td>Make the Sun the origin again.</td></tr>
</table>
<h3>Keys in every window</h3>
<table>
<tr><td class="k" width="130">Ctrl+N</td><td>New chart.</td></tr>
<tr><td class="k" width="130">Ctrl+W</td><td>Close the window (the control window: quit).</td></tr>
<tr><td class="k" width="130">Ctrl+Q</td><td>Quit.</td></tr>
<tr><td class="k" width="130">Ctrl+S</td><td>In a star list: save it as CSV.</td></tr>
<tr><td class="k" width="130">F1</td><td>This help.</td></tr>
</table>
)";

} // namespace

HelpWindow::HelpWindow(BPoint where)
{
    setAttribute(Qt::WA_DeleteOnClose);
    setWindowTitle("Nightdome Help");

    auto* page = new QLabel(QString::fromUtf8(kHelpText));
    page->setObjectName("Help Text");
    page->setTextFormat(Qt::RichText);
    page->setWordWrap(true);
    page->setTextInteractionFlags(Qt::TextSelectableByMouse);
    // 520 pixels of text between the margins.
    page->setContentsMargins(16, 8, 16, 16);
    page->setFixedWidth(520 + 32);
    page->setFixedHeight(page->heightForWidth(page->width()));

    // The page scrolls, so that the window can be smaller than the page on a small screen or at
    // a large scale factor.
    auto* scroller = new QScrollArea(this);
    scroller->setObjectName("Help Scroller");
    scroller->setFrameShape(QFrame::NoFrame);
    scroller->setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
    scroller->setWidget(page);
    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->addWidget(scroller);

    FitToScreen(QPoint(int(where.x), int(where.y)));
}

void HelpWindow::FitToScreen(QPoint where)
{
    QScreen* screen = QGuiApplication::screenAt(where);
    if (!screen)
        screen = QGuiApplication::primaryScreen();
    QWidget* page = findChild<QLabel*>("Help Text");
    auto* scroller = findChild<QScrollArea*>("Help Scroller");
    const int barWidth = scroller->verticalScrollBar()->sizeHint().width();
    // The whole page, with room for the scroll bar in case it is needed after all.
    QSize wanted(page->width() + barWidth, page->height());
    if (!screen) {
        resize(wanted);
        move(where);
        return;
    }
    // The window manager's frame takes some of the screen too; an unshown window does not know
    // its frame yet, so leave room for a title bar and borders of common size.
    const QRect available = screen->availableGeometry();
    constexpr int kFrameWidth = 8, kFrameHeight = 40;
    const QSize room(available.width() - kFrameWidth, available.height() - kFrameHeight);
    const QSize size = wanted.boundedTo(room);
    resize(size);
    // Kept inside the free area, the right and bottom edges first.
    const int x = std::min(where.x(), available.right() + 1 - size.width() - kFrameWidth);
    const int y = std::min(where.y(), available.bottom() + 1 - size.height() - kFrameHeight);
    move(std::max(x, available.left()), std::max(y, available.top()));
}
