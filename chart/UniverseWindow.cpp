// The star-map window: its layout, and pausing and reporting as it is shown, hidden, minimised,
// activated and closed.
#include "chart/UniverseWindow.h"

#include "chart/UniverseView.h"
#include "core/MessageCodes.h"
#include "widgets/IToggleButton.h"
#include "widgets/InfoView.h"
#include "widgets/WidgetGeometry.h"

#include <QCloseEvent>
#include <QWindowStateChangeEvent>
#include <algorithm>
#include <thread>

UniverseWindow::UniverseWindow(BPoint where, float width, float height, const char* title,
    QObject* controller, Universe* universe)
{
    setAttribute(Qt::WA_DeleteOnClose);
    setWindowTitle(QString::fromUtf8(title));
    setGeometry(int(where.x), int(where.y), int(width) + 1, int(height) + 1);
    auto* controllerWidget = qobject_cast<QWidget*>(controller);
    controlLooper
        = controllerWidget ? static_cast<QObject*>(controllerWidget->window()) : controller;

    const float w = float(this->width()), h = float(this->height());
    mainView = new QWidget(this);
    mainView->setObjectName("mainview");
    PaintWindowGrey(mainView);
    mainView->setGeometry(0, 0, int(w), int(h));

    systemName = new InfoView(BRect(0, h - 12, w - 13, h - 1), "SystemName", "", mainView);
    systemName->ISetTarget(controller);
    systemName->ISetInfo("Star Information");

    view = new UniverseView(
        BRect(0, 0, w - 1, h - 13), "UniverseView", universe, RenderThreadCount(), mainView);
    view->ISetTarget(controller);
    view->SetStarInfoTarget(systemName);

    toggle = new IToggleButton(BRect(w - 12, h - 12, w - 1, h - 1), "Toggle Button", "", 0,
        new Message(kClipToggle), mainView);
    toggle->ISetTarget(controller);
    toggle->ISetInfo("Toggle Clipping Sphere");
    toggle->SetTarget(view);
    toggle->SetValue(1); // the overlay starts shown

    view->AttachedToWindow();
    show();
}

UniverseWindow::~UniverseWindow()
{
    view->DetachedFromWindow();
}

namespace {
int32_t gRenderThreadCount = 0; // 0: the processor count
}

int32_t UniverseWindow::RenderThreadCount()
{
    const int32_t count = gRenderThreadCount > 0 ? gRenderThreadCount
                                                 : int32_t(std::thread::hardware_concurrency());
    return std::clamp(count, 1, UniverseView::kMaxRenderThreads);
}

void UniverseWindow::SetRenderThreadCount(int32_t count)
{
    gRenderThreadCount = count;
}

void UniverseWindow::resizeEvent(QResizeEvent*)
{
    // The chart takes everything but the 12-pixel strip; the toggle keeps its corner.
    const int w = width(), h = height();
    mainView->setGeometry(0, 0, w, h);
    view->setGeometry(0, 0, w, h - 12);
    systemName->setGeometry(0, h - 12, std::max(0, w - 12), 12);
    toggle->setGeometry(w - 12, h - 12, 12, 12);
}

void UniverseWindow::showEvent(QShowEvent* event)
{
    view->Resume();
    QWidget::showEvent(event);
}

void UniverseWindow::hideEvent(QHideEvent* event)
{
    view->Suspend();
    QWidget::hideEvent(event);
}

void UniverseWindow::changeEvent(QEvent* event)
{
    if (event->type() == QEvent::WindowStateChange) {
        const auto* change = static_cast<QWindowStateChangeEvent*>(event);
        if (isMinimized())
            view->Suspend();
        else
            view->Resume();
        // Zooming the chart brings the controls to the front as well.
        if (isMaximized() && !(change->oldState() & Qt::WindowMaximized)) {
            if (auto* controls = qobject_cast<QWidget*>(controlLooper.data()))
                controls->activateWindow();
        }
    } else if (event->type() == QEvent::ActivationChange && isActiveWindow()) {
        Message activated(kUniverseWindowActivated);
        activated.AddPointer(kUWPointerString, this);
        PostMessage(controlLooper, activated);
    }
    QWidget::changeEvent(event);
}

void UniverseWindow::closeEvent(QCloseEvent* event)
{
    Message closing(kUniverseWindowQuitting);
    closing.AddPointer(kUWPointerString, this);
    PostMessage(controlLooper, closing);
    view->DetachedFromWindow();
    event->accept();
}

void UniverseWindow::MessageReceived(Message*)
{
}
