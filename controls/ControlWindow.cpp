// The control window: its strip of controls and buttons, the charts it opens and links to, and
// the end of the program.
#include "controls/ControlWindow.h"

#include "chart/UniverseView.h"
#include "chart/UniverseWindow.h"
#include "controls/ChartKeys.h"
#include "controls/MouseControls.h"
#include "controls/ProgramKeys.h"
#include "controls/SliderControl.h"
#include "controls/TrackballControl.h"
#include "core/MessageCodes.h"
#include "hrd/HRDWindow.h"
#include "info/StarInfoWindow.h"
#include "lists/ListWindow.h"
#include "query/panels/FindWindow.h"
#include "widgets/IPictureButton.h"
#include "widgets/InfoView.h"

#include <QCloseEvent>

namespace {

struct ButtonEntry {
    const char* name;
    int32_t picture; // 'IPCL' resource
    uint32_t command;
    const char* help;
};

// Left to right after the mouse controls. "Hertzprung" is spelt as the program always has.
constexpr ButtonEntry kButtons[] = {
    { "New Nightdome Button", 0, kNewUniverseWindow, "New Nightdome  [Ctrl+N]" },
    { "Show Info Window Button", 1, kNewStarInfoWindow, "New Star Info window" },
    { "Show H-R Window Button", 2, kNewHRDWindow, "New Hertzprung-Russell Diagram window" },
    { "Show Find Window Button", 3, kNewFindWindow, "Find Star" },
    { "New List Window Button", 5, kNewListWindow, "New Star List window" },
};

} // namespace

ControlWindow::ControlWindow(BPoint where, const char* title, QObject* application, Universe* given)
    : universe(given ? given : new Universe("stars.dat", 1000000, 5000))
    , fApplication(application)
{
    // A small tool window of fixed size that stays above the charts.
    setWindowFlags(Qt::Tool | Qt::WindowStaysOnTopHint);
    setWindowTitle(QString::fromUtf8(title));
    setGeometry(int(where.x), int(where.y), 320, 45);
    setFixedSize(320, 45);

    auto* mainView = new QWidget(this);
    mainView->setObjectName("main view");
    mainView->setGeometry(0, 0, 320, 45);
    infoView = new InfoView(BRect(2, 32, 317, 44), "Info View", "", mainView);
    infoView->ISetInfo("Context sensitive help");
    infoView->ISetTarget(infoView);

    BRect frame(0, 0, 31, 31);
    MouseControl* controls[kMouseControlCount];
    for (int32_t i = 0; i < kMouseControlCount; i++) {
        controls[i] = MakeMouseControl(kMouseControls[size_t(i)], frame, mainView);
        controls[i]->ISetTarget(infoView);
        frame = BRect(frame.left + 32, frame.top, frame.right + 32, frame.bottom);
    }
    trackball = static_cast<TrackballControl*>(controls[kTrackBallControl]);
    cameraZ = static_cast<TrackballControl*>(controls[kCameraZControl]);
    brightnessSlider = static_cast<SliderControl*>(controls[kStellarBrightnessControl]);
    contrastSlider = static_cast<SliderControl*>(controls[kStellarContrastControl]);
    clippingSlider = static_cast<SliderControl*>(controls[kClippingSphereControl]);

    for (const ButtonEntry& entry : kButtons) {
        auto* button = new IPictureButton(
            frame, entry.name, "", entry.picture, new Message(entry.command), mainView);
        button->SetTarget(this);
        button->ISetTarget(infoView);
        button->ISetInfo(entry.help);
        frame = BRect(frame.left + 32, frame.top, frame.right + 32, frame.bottom);
    }

    new ProgramKeys(this); // the keys of every window; a child
    LinkControls(OpenUniverseWindow());
    show();
}

ControlWindow::~ControlWindow()
{
    // The charts go first: they draw the universe until their threads have stopped. Every
    // chart is told to stop before the first is waited for, so that the frames still being
    // drawn finish side by side rather than one after another.
    for (const QPointer<UniverseWindow>& window : universeWindows) {
        if (window)
            window->View()->StopRendering();
    }
    for (const QPointer<UniverseWindow>& window : universeWindows)
        delete window.data();
    for (const QPointer<QWidget>& window : fOtherWindows)
        delete window.data();
    delete universe;
}

QList<QWidget*> ControlWindow::OtherWindows() const
{
    QList<QWidget*> open;
    for (const QPointer<QWidget>& window : fOtherWindows) {
        if (window)
            open.append(window.data());
    }
    return open;
}

UniverseWindow* ControlWindow::OpenUniverseWindow()
{
    auto* window = new UniverseWindow(BPoint(90, 140), 328, 340, "Nightdome", infoView, universe);
    new ChartKeys(window->View()); // the chart's own keys; the view owns them
    universeWindows.append(window);
    return window;
}

void ControlWindow::KeepOtherWindow(QWidget* window, const char* universeView)
{
    fOtherWindows.removeAll(nullptr);
    fOtherWindows.append(window);
    if (!universeView)
        return;
    Message universePointer(kUniversePointer);
    universePointer.AddPointer(kUniversePtrString, universe);
    PostMessageToView(window, universeView, universePointer);
}

void ControlWindow::LinkControls(UniverseWindow* window)
{
    UniverseView* view = window ? window->findChild<UniverseView*>("UniverseView") : nullptr;
    fLinked = view ? window : nullptr;
    if (!view) {
        trackball->LinkTrackball(nullptr, nullptr);
        cameraZ->LinkTrackball(nullptr, nullptr);
        brightnessSlider->LinkSlider(nullptr);
        contrastSlider->LinkSlider(nullptr);
        clippingSlider->LinkSlider(nullptr);
        return;
    }
    trackball->LinkTrackball(view->GetRadialVelocityX(), view->GetRadialVelocityY());
    cameraZ->LinkTrackball(nullptr, view->GetCameraVelocityZ());
    brightnessSlider->LinkSlider(view->GetLumFactor());
    contrastSlider->LinkSlider(view->GetStellarContrast());
    clippingSlider->LinkSlider(view->GetDistanceFilter());
}

void ControlWindow::MessageReceived(Message* message)
{
    switch (message->what) {
    case kNewUniverseWindow: {
        UniverseWindow* window = OpenUniverseWindow();
        // H-R diagrams follow the selection of every chart, new ones too.
        for (QWidget* other : OtherWindows()) {
            if (auto* diagram = dynamic_cast<HRDWindow*>(other))
                diagram->FollowSelection(window->findChild<UniverseView*>("UniverseView"));
        }
        // Controls that drive nothing (the last chart closed) take the new chart at once rather
        // than waiting for it to be activated, which a bare X server never does.
        if (!fLinked)
            LinkControls(window);
        break;
    }
    case kNewFindWindow:
        KeepOtherWindow(
            new FindWindow(BPoint(170, 140), 394, 370, "Find Star", infoView, universe));
        break;
    case kNewStarInfoWindow:
        KeepOtherWindow(
            new StarInfoWindow(BPoint(120, 150), "Star Info", infoView), "Star Info View");
        break;
    case kNewHRDWindow: {
        auto* diagram = new HRDWindow(BPoint(150, 150), "H-R Diagram", infoView);
        KeepOtherWindow(diagram, "HRView");
        for (const QPointer<UniverseWindow>& window : universeWindows) {
            if (window)
                diagram->FollowSelection(window->findChild<UniverseView*>("UniverseView"));
        }
        break;
    }
    case kNewListWindow:
        KeepOtherWindow(
            new ListWindow(BPoint(140, 140), 230, 340, "Star List", infoView, universe));
        break;
    case kUniverseWindowActivated: {
        // Only a chart of ours: the pointer is checked against the list before it is used.
        auto* window = static_cast<UniverseWindow*>(message->FindPointer(kUWPointerString));
        if (window && universeWindows.contains(window))
            LinkControls(window);
        break;
    }
    case kUniverseWindowQuitting: {
        auto* window = static_cast<UniverseWindow*>(message->FindPointer(kUWPointerString));
        universeWindows.removeIf(
            [window](const QPointer<UniverseWindow>& w) { return !w || w == window; });
        // Never left pointing into a closed chart: on to the newest one still open, or nowhere.
        if (fLinked == window || !fLinked)
            LinkControls(universeWindows.isEmpty() ? nullptr : universeWindows.last().data());
        break;
    }
    default:
        break;
    }
}

void ControlWindow::closeEvent(QCloseEvent* event)
{
    PostMessage(fApplication, Message(B_QUIT_REQUESTED));
    event->accept();
}
