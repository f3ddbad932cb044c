// The Hertzsprung-Russell diagram: stars by spectral class (left to right, hot to cool) and
// absolute magnitude (top to bottom, bright to faint), each a small marker on an empty diagram
// drawn once, beforehand. Systems come by drag and drop or from a chart's selection; hovering
// a marker names its star on the plot-name line; a press drags the marker's system out, or
// every set dropped so far when there is no marker under the mouse. Such a drag let go over the
// diagram itself (a click) adds nothing.
#pragma once

#include "catalog/SpectralClass.h"
#include "hrd/HRPlot.h"
#include "platform/BList.h"
#include "platform/BPoint.h"
#include "platform/qt/MessageDrag.h"
#include "platform/qt/Messaging.h"
#include "platform/qt/TransitView.h"
#include "query/StarSysMask.h"
#include "render/RBitmap8.h"
#include "widgets/IBroadcaster.h"

#include <QWidget>
#include <cstdint>

class HRDView : public TransitView<QWidget>, public BHandler, public IBroadcaster {
public:
    // Plots kept at most; once full, each further star takes the last slot.
    static constexpr int32_t kMaxPlots = 5000;
    static constexpr int32_t kWidth = 300, kHeight = 295;

    // A 300 x 295 view with its top-left at where, showing the empty diagram.
    HRDView(BPoint where, const char* name, QWidget* parent = nullptr);
    ~HRDView() override;

    // Where the names of hovered stars go: a handler, normally an InfoView.
    void SetPlotNameTarget(QObject* target);

    // The diagram's scales: magnitude -7 at y = 15, 11.2 pixels a magnitude downward; 40
    // pixels a Harvard class from O at x = 20, its subclass moving within it, with class O0
    // itself half a class in.
    static float AbsMagnitudeToY(double magnitude);
    static float SpectralClassToX(const SpectralClass* sc);

    // Plots every member star of system systemIndex, when there is a universe.
    void AddPlot(long systemIndex);
    // Blits the marker centred on (x, y) into the canvas.
    void RenderPlot(long x, long y);
    // Copies the empty diagram into the canvas.
    void RenderHRD();
    // The marker under where: of overlapping ones the one plotted last; null for none.
    HRPlot* FindPlot(BPoint where);

    // 'SIBc', 'StaR' and 'SAry' plot, 'HrCl' clears, 'UPtr' brings the universe.
    void MessageReceived(Message* message) override;

    // Tests catch what a press would drag instead of running the drag.
    void SetDragStarter(DragStarter starter) { fDragStarter = std::move(starter); }

    const RBitmap8* Canvas() const { return canvas; }
    const RBitmap8* Background() const { return background; }
    const HRPlot* Plots() const { return plots; }
    int32_t PlotCount() const { return plotCount; }
    const StarSysMask* PlottedSystems() const { return plottedSystems; }
    int32_t HoverIndex() const { return hoverIndex; }
    const IBroadcaster* PlotNameInfo() const { return plotNameInfo; }

protected:
    void MouseMoved(QPoint where, Transit transit) override;
    bool PassesTransitsOn() const override { return false; }
    void mousePressEvent(QMouseEvent* event) override;
    void paintEvent(QPaintEvent* event) override;
    void dragEnterEvent(QDragEnterEvent* event) override;
    void dragMoveEvent(QDragMoveEvent* event) override;
    void dropEvent(QDropEvent* event) override;

private:
    // Shows the canvas now.
    void DrawCanvas();
    // Makes text the view's help and puts it on the help line, unless it is the help already.
    void SetHelp(const char* text);

    RBitmap8* background; // the empty diagram; owned
    RBitmap8* canvas; // the diagram with the markers, what is shown; owned
    RBitmap8* marker; // 8 x 8, 255 transparent; owned
    HRPlot* plots; // kMaxPlots of them; owned
    int32_t plotCount;
    StarSysMask* plottedSystems; // the sets dropped since the last clear; owned, null until
                                 // the universe arrives
    IBroadcaster* plotNameInfo; // posts to the plot-name line; owned
    int32_t hoverIndex; // the system of the marker last hovered, -1 none, -2 the mouse left
    int32_t systemCount;
    BList* systems; // the universe's systems; not owned
    DragStarter fDragStarter;
};
