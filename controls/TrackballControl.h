// A mouse control that eases two values of the star-map view toward the drag velocity: each
// sample moves a value a fixed fraction of the way toward that sample's drag distance times a
// scale, so the values follow the drag speed, decay toward zero while the pointer is held still,
// and keep their last value when the button is released.
#pragma once

#include "controls/MouseControl.h"

#include <atomic>

class TrackballControl : public MouseControl {
public:
    TrackballControl(BRect frame, const char* name, int32_t resourceID, Qt::CursorShape cursor,
        QWidget* parent = nullptr);

    // scaleX and scaleY: target per pixel of drag; easeX and easeY: the fraction of the way to
    // the target covered per sample. Unlinks both values.
    void InitTrackball(double scaleX, double scaleY, double easeX, double easeY);
    // x follows horizontal drags, y vertical ones. Both live in the star-map view, whose render
    // threads read them without a lock; not owned. Null unlinks that axis.
    void LinkTrackball(std::atomic<double>* x, std::atomic<double>* y)
    {
        linkX = x;
        linkY = y;
    }

    // For each linked axis: value += ease * (delta * scale - value).
    void Calculate(double dx, double dy) override;

    std::atomic<double>* LinkX() const { return linkX; }
    std::atomic<double>* LinkY() const { return linkY; }
    double ScaleX() const { return scaleX; }
    double ScaleY() const { return scaleY; }
    double EaseX() const { return easeX; }
    double EaseY() const { return easeY; }

private:
    std::atomic<double>* linkX = nullptr; // not owned
    std::atomic<double>* linkY = nullptr; // not owned
    double scaleX = 0.0;
    double scaleY = 0.0;
    double easeX = 0.0;
    double easeY = 0.0;
};
