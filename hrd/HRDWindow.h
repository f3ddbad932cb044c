// The H-R diagram's window: the diagram, the line that names the star under the mouse, and a
// button that clears the diagram.
#pragma once

#include "platform/BPoint.h"

#include <QWidget>

class HRDView;
class InfoView;
class IPictureButton;

class HRDWindow : public QWidget {
public:
    // A window of 300 x 308 pixels with its top-left at where, its help going to infoTarget (a
    // handler). It shows itself; the diagram stays empty until a universe is sent to its view.
    HRDWindow(BPoint where, const char* title, QObject* infoTarget);

    // Plots whatever the chart whose view is chartView selects from now on.
    void FollowSelection(QObject* chartView);

    HRDView* View() const { return fView; }
    InfoView* PlotName() const { return fPlotName; }
    IPictureButton* ClearButton() const { return fClearButton; }

private:
    HRDView* fView;
    InfoView* fPlotName;
    IPictureButton* fClearButton;
};
