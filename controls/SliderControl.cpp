// The exponential slider's response to a drag sample.
#include "controls/SliderControl.h"

#include <cmath>

SliderControl::SliderControl(
    BRect frame, const char* name, int32_t resourceID, Qt::CursorShape cursor, QWidget* parent)
    : MouseControl(frame, name, resourceID, cursor, parent)
{
}

void SliderControl::InitSlider(double newBase, double newMinimum, double newMaximum)
{
    base = newBase;
    minimum = newMinimum;
    maximum = newMaximum;
    link = nullptr;
}

void SliderControl::Calculate(double dx, double)
{
    if (!link || base == 0.0 || dx == 0.0)
        return;
    // One load and one store: a render frame sees either the old value or the new one.
    double value = std::pow(base, dx) * link->load(std::memory_order_relaxed);
    // The maximum is applied first, so a range with minimum above maximum ends at the minimum.
    if (value > maximum)
        value = maximum;
    if (value < minimum)
        value = minimum;
    link->store(value, std::memory_order_relaxed);
}
