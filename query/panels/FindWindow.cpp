// The find window: its column of panels and the scroll bar beside it.
#include "query/panels/FindWindow.h"

#include "query/panels/DECQueryView.h"
#include "query/panels/DistQueryView.h"
#include "query/panels/MGQueryView.h"
#include "query/panels/NameQueryView.h"
#include "query/panels/RAQueryView.h"
#include "query/panels/SCQueryView.h"
#include "widgets/WidgetGeometry.h"

#include <QScrollBar>
#include <algorithm>

namespace {

constexpr int kScrollBarWidth = 14;

} // namespace

FindWindow::FindWindow(BPoint where, float width, float height, const char* title,
    QObject* infoTarget, Universe* universe)
    : contentHeight(height)
{
    setAttribute(Qt::WA_DeleteOnClose);
    setWindowTitle(QString::fromUtf8(title));
    const int w = int(width) + 1, h = int(height) + 1;
    setGeometry(int(where.x), int(where.y), w, h);
    // The width stays; the height goes from 70 to what the window was made with.
    setMinimumSize(w, 70 + 1);
    setMaximumSize(w, h);

    fScroller = new QWidget(this);
    fScroller->setObjectName("Find Scroller");
    fScroller->setGeometry(0, 0, w, h);
    fClip = new QWidget(fScroller);
    fClip->setGeometry(0, 0, w - kScrollBarWidth, h);
    fMainView = new QWidget(fClip);
    fMainView->setObjectName("mainview");
    PaintWindowGrey(fMainView);
    fMainView->setGeometry(0, 0, w - kScrollBarWidth, h);

    scrollBar = new QScrollBar(Qt::Vertical, fScroller);
    scrollBar->setGeometry(w - kScrollBarWidth, 0, kScrollBarWidth, h);
    scrollBar->setRange(0, 0);
    scrollBar->setSingleStep(10);
    scrollBar->setPageStep(h);
    // A click beside the thumb moves 60 pixels; the page step only sizes the thumb.
    connect(scrollBar, &QAbstractSlider::actionTriggered, this, [this](int action) {
        const int value = scrollBar->value();
        if (action == QAbstractSlider::SliderPageStepAdd)
            scrollBar->setSliderPosition(std::min(value + 60, scrollBar->maximum()));
        else if (action == QAbstractSlider::SliderPageStepSub)
            scrollBar->setSliderPosition(std::max(value - 60, 0));
    });
    connect(scrollBar, &QScrollBar::valueChanged, this, [this](int value) { ScrollTo(value); });

    // The panels, 50 high and 60 apart, from (10, 10) to 10 short of the column's right edge.
    const float right = float(w - kScrollBarWidth - 1) - 10;
    BRect frame(10, 10, right, 60);
    const auto next = [&frame] {
        const BRect now = frame;
        frame = BRect(frame.left, frame.top + 60, frame.right, frame.bottom + 60);
        return now;
    };
    // The four middle panels share one view name, as they always have.
    nameQuery = new NameQueryView(next(), "Name Query", universe, fMainView);
    scQuery = new SCQueryView(next(), "SC Query", universe, fMainView);
    mgQuery = new MGQueryView(next(), "SC Query", universe, fMainView);
    raQuery = new RAQueryView(next(), "SC Query", universe, fMainView);
    decQuery = new DECQueryView(next(), "SC Query", universe, fMainView);
    distQuery = new DistQueryView(next(), "Dist Query", universe, fMainView);
    for (StarQueryView* panel : std::initializer_list<StarQueryView*> {
             nameQuery, scQuery, mgQuery, raQuery, decQuery, distQuery })
        panel->ISetTarget(infoTarget);
    show();
}

void FindWindow::FrameResized(float, float newHeight)
{
    const float whole = 30 + contentHeight;
    scrollBar->setRange(0, std::max(0, int(whole - newHeight)));
    // The thumb's share of the bar is newHeight / whole: Qt sizes it as page / (range + page).
    scrollBar->setPageStep(std::max(1, int(std::min(newHeight, whole))));
}

void FindWindow::MessageReceived(Message*)
{
}

void FindWindow::resizeEvent(QResizeEvent*)
{
    const int w = width(), h = height();
    fScroller->setGeometry(0, 0, w, h);
    fClip->setGeometry(0, 0, w - kScrollBarWidth, h);
    scrollBar->setGeometry(w - kScrollBarWidth, 0, kScrollBarWidth, h);
    // Showing the window at the size it was made with is not a resize; anything after that is.
    fResized = fResized || h != int(contentHeight) + 1;
    if (fResized)
        FrameResized(float(w - 1), float(h - 1));
    fMainView->resize(w - kScrollBarWidth, std::max(h, int(30 + contentHeight) + 1));
    ScrollTo(scrollBar->value());
}

void FindWindow::ScrollTo(int value)
{
    fMainView->move(0, -value);
}
