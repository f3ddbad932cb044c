// The keys and the wheel of a chart: the arrow keys turn it as the trackball does, + and - and
// the wheel move its camera as the camera-distance control does, Space and Esc stop every turn
// and camera motion, Home makes the Sun the origin again. An event filter on the chart's view,
// owned by the view, which it gives its window's keyboard focus.
//
// A press works as one drag sample of kPressPixels in the key's direction, its response added
// to the velocity (the trackball eases toward a target; a key adds, so that holding it down
// speeds the turn up as a faster drag does). Auto-repeats add the same step again, up to the
// velocity a steady drag of kTopPixels a sample aims for; a faster turn the mouse gave is left as
// it is. The figures of the two controls come from their table, so the keys keep their feel if
// the controls change.
#pragma once

#include <QObject>

class UniverseView;

class ChartKeys : public QObject {
public:
    // A press: one drag sample this long, in pixels.
    static constexpr double kPressPixels = 4.0;
    // Held keys go no faster than a drag of this many pixels a sample.
    static constexpr double kTopPixels = 10.0;
    // What a wheel turns by for one press: one notch, in eighths of a degree.
    static constexpr double kWheelNotch = 120.0;

    // Watches view's keys and wheel and takes its window's focus when that window is active.
    explicit ChartKeys(UniverseView* view);

protected:
    // Takes the keys above and the wheel; everything else goes on to the view.
    bool eventFilter(QObject* watched, QEvent* event) override;

private:
    // As a drag sample of (dx, dy) pixels, previous minus current position, on the trackball.
    void Turn(double dx, double dy, double times);
    // As a vertical drag sample of dy pixels on the camera-distance control.
    void MoveCamera(double dy, double times);
    void Stop();

    UniverseView* fView; // the parent
};
