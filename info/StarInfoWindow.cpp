// The star information window's frame and its one view.
#include "info/StarInfoWindow.h"

#include "info/StarIView.h"

namespace {

// The frame (where.x, where.y, where.x + 363, where.y + 184), edges inclusive. The view's own
// frame reaches one further each way, so its last column and row of pixels lie outside the
// window; the terminal's text ends well before them.
constexpr int kWidth = 364, kHeight = 185;

} // namespace

StarInfoWindow::StarInfoWindow(BPoint where, const char* title, QObject* infoTarget)
{
    setAttribute(Qt::WA_DeleteOnClose);
    setWindowTitle(QString::fromUtf8(title));
    // Flags first: changing them later would place the window anew.
    setWindowFlag(Qt::WindowMaximizeButtonHint, false);
    setGeometry(int(where.x), int(where.y), kWidth, kHeight);
    setFixedSize(kWidth, kHeight);

    fView = new StarIView(BPoint(0, 0), "Star Info View", this);
    fView->ISetTarget(infoTarget);
    fView->ISetInfo("Drop star here");
    show();
}
