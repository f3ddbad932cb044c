// A mouse control that scales one value of the star-map view exponentially with horizontal
// drags, within a range: each pixel to the left multiplies it by base, each pixel to the right
// divides it by base.
#pragma once

#include "controls/MouseControl.h"

#include <atomic>

class SliderControl : public MouseControl {
public:
    SliderControl(BRect frame, const char* name, int32_t resourceID, Qt::CursorShape cursor,
        QWidget* parent = nullptr);

    // Sets the growth per pixel and the range, and unlinks.
    void InitSlider(double base, double minimum, double maximum);
    // value lives in the star-map view, whose render threads read it without a lock; not owned.
    // Null unlinks.
    void LinkSlider(std::atomic<double>* value) { link = value; }

    // Only dx counts. Nothing happens without a link, with base 0, or for dx 0; otherwise the
    // value becomes base^dx times itself, held within [minimum, maximum].
    void Calculate(double dx, double dy) override;

    std::atomic<double>* Link() const { return link; }
    double Base() const { return base; }
    double Minimum() const { return minimum; }
    double Maximum() const { return maximum; }

private:
    std::atomic<double>* link = nullptr; // not owned
    double base = 0.0; // growth factor per pixel of leftward drag
    double minimum = 0.0;
    double maximum = 0.0;
};
