// Paint.h: drawing helpers of the resource generator, built on RBitmap8's primitives: palette
// look-ups by true colour, coverage-blended discs, rings and thick lines, bevelled button faces.
#pragma once

#include "core/Constants.h"
#include "render/RBitmap8.h"

#include <cstdint>

struct Rgb {
    int r, g, b;
};

// The system palette index nearest to a true colour (through the palette's inverse map).
uint8_t Nearest(Rgb c);
// The true colour shown by a palette index.
Rgb ColorOf(uint8_t index);
// Linear mix: t = 0 gives a, t = 1 gives b.
Rgb Mix(Rgb a, Rgb b, double t);

constexpr uint8_t kClear = 255; // transparent index

// Mixes colour into pixel (x, y) by coverage (0..1). On a transparent pixel the colour is laid
// down solid when the coverage is at least one half, else the pixel stays transparent.
void Blend(RBitmap8& bitmap, int x, int y, Rgb colour, double coverage);
// Coverage-blended shapes; coordinates are pixel centres, so (15.5, 15.5) is the middle of a
// 32 x 32 bitmap.
void Disc(RBitmap8& bitmap, double cx, double cy, double radius, Rgb colour);
void Ring(RBitmap8& bitmap, double cx, double cy, double radius, double thickness, Rgb colour);
void Stroke(
    RBitmap8& bitmap, double x0, double y0, double x1, double y1, double thickness, Rgb colour);
// A stroke ending in an arrow head at (x1, y1).
void Arrow(
    RBitmap8& bitmap, double x0, double y0, double x1, double y1, double thickness, Rgb colour);
// An ellipse outline (axis-aligned), drawn as a chain of short strokes.
void Ellipse(RBitmap8& bitmap, double cx, double cy, double rx, double ry, double thickness,
    Rgb colour, double fromAngle = 0.0, double toAngle = kPI + kPI);
// A four-pointed sparkle with a round core, the program's picture of a star.
void Sparkle(RBitmap8& bitmap, double cx, double cy, double size, Rgb core, Rgb rays);

// Button states, in the order their frames are stored.
enum class Face { Normal, Hover, Pressed };
// Paints a bevelled button face over the whole bitmap: rounded corners left transparent, a dark
// outline (blue when hovered), a light top-left and dark bottom-right edge (swapped when
// pressed). dark selects the night-sky face of the mouse controls.
void ButtonFace(RBitmap8& bitmap, Face face, bool dark);
