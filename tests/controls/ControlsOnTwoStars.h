// The control window over a catalogue of two systems (the Sun and Sirius) beside the test
// program, and the windows its buttons open.
#pragma once

#include "catalog/TempCatalogue.h"
#include "controls/ControlWindow.h"
#include "platform/qt/Messaging.h"
#include "render/SpectralTables.h"
#include "resources/ResourceData.h"

#include <QTest>

class ControlsOnTwoStars {
public:
    ControlsOnTwoStars()
        : fResources((InitResources(), true))
        , fCatalogue("The Sun\nG2V 4.83 0 0 0\nSirius\nA0 1.45 -0.49 -0.76 2.48\n")
        , controls(BPoint(90, 60), "3D Nightdome")
    {
    }

    // Clicks the button named button and answers the window it opened, the newest of the other
    // windows, once what it posted (the universe, to the new window's view) has arrived; null
    // when there is no such button or window, or the window is not a Window.
    template <class Window> Window* Open(const char* button)
    {
        auto* widget = controls.findChild<QWidget*>(button);
        if (!widget)
            return nullptr;
        QTest::mouseClick(widget, Qt::LeftButton, Qt::NoModifier, QPoint(16, 16));
        DeliverPostedMessages(); // the button's command, which posts to the new window
        DeliverPostedMessages();
        const QList<QWidget*> open = controls.OtherWindows();
        return open.isEmpty() ? nullptr : dynamic_cast<Window*>(open.back());
    }

private:
    bool fResources;
    ScopedSpectralTables fTables;
    CatalogueBesideProgram fCatalogue;

public:
    ControlWindow controls;
};
