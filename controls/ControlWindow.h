// The program's home: a strip of five mouse controls and five picture buttons over a help
// line. It owns the universe, opens the chart windows and every other window, drives the chart
// that was activated last, and ends the program when it closes.
#pragma once

#include "catalog/Universe.h"
#include "chart/UniverseWindow.h"
#include "platform/BPoint.h"
#include "platform/qt/Messaging.h"

#include <QList>
#include <QPointer>
#include <QWidget>

class InfoView;
class SliderControl;
class TrackballControl;

class ControlWindow : public QWidget, public BHandler {
public:
    // Takes universe (owned) or, when there is none, reads "stars.dat" beside the program; opens
    // the first chart and shows itself. The application, a handler, hears B_QUIT_REQUESTED when
    // this window closes.
    ControlWindow(BPoint where, const char* title, QObject* application = nullptr,
        Universe* universe = nullptr);
    // Closes the charts and other windows still open, then frees the universe.
    ~ControlWindow() override;

    // Links the five controls to the chart of window, or unlinks them for null.
    void LinkControls(UniverseWindow* window);
    void MessageReceived(Message* message) override;

    Universe* GetUniverse() const { return universe; }
    InfoView* GetInfoView() const { return infoView; }
    // The open chart windows, in order of opening.
    const QList<QPointer<UniverseWindow>>& UniverseWindows() const { return universeWindows; }
    UniverseWindow* LinkedWindow() const { return fLinked; }
    // The other windows opened from here and still open (find, list, H-R diagram and star
    // information windows), oldest first.
    QList<QWidget*> OtherWindows() const;

    TrackballControl* trackball;
    TrackballControl* cameraZ;
    SliderControl* contrastSlider;
    SliderControl* brightnessSlider;
    SliderControl* clippingSlider;

protected:
    void closeEvent(QCloseEvent* event) override;

private:
    UniverseWindow* OpenUniverseWindow();
    // Keeps window among the other windows and, when universeView names a view of it, posts
    // the universe to that view.
    void KeepOtherWindow(QWidget* window, const char* universeView = nullptr);

    Universe* universe; // owned
    // Not owned: each chart closes and deletes itself, and tells this window so; a closed one
    // reads as null until that message has arrived.
    QList<QPointer<UniverseWindow>> universeWindows;
    InfoView* infoView; // a child
    QPointer<UniverseWindow> fLinked; // the chart the controls act on
    QPointer<QObject> fApplication; // not owned
    // Windows on the universe besides the charts: each deletes itself when closed; those still
    // open go before the universe does.
    QList<QPointer<QWidget>> fOtherWindows;
};
