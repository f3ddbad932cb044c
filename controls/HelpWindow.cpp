// The help page and the window that shows it.
#include "controls/HelpWindow.h"

#include <QLabel>
#include <QVBoxLayout>

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
    move(int(where.x), int(where.y));

    auto* page = new QLabel(QString::fromUtf8(kHelpText), this);
    page->setObjectName("Help Text");
    page->setTextFormat(Qt::RichText);
    page->setWordWrap(true);
    page->setTextInteractionFlags(Qt::TextSelectableByMouse);
    page->setFixedWidth(520);
    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(16, 8, 16, 16);
    layout->addWidget(page);
    layout->setSizeConstraint(QLayout::SetFixedSize);
}
