// BitmapImage.h: showing render bitmaps with Qt. The bitmap's pixel memory is wrapped, not
// converted: a QImage in Format_Indexed8 over the same bytes with the system palette as its
// colour table, so painting a frame costs no per-pixel work of ours.
#pragma once

#include <QImage>
#include <QList>
#include <QPixmap>
#include <QRegion>

class RBitmap8;

// The system palette as a Qt colour table, built once; entry 255 is fully transparent.
const QList<QRgb>& SystemColorTable();

// A QImage sharing bitmap's pixels (not owned, not copied): valid while the bitmap lives, and
// showing whatever the bitmap holds when it is painted.
QImage ImageOf(RBitmap8& bitmap);

// A drag image: a pixmap copy of bitmap with index 255 transparent.
QPixmap DragPixmap(RBitmap8& bitmap);

// The pixels of bitmap that are not index 255, in bitmap coordinates: the outline a window
// without an alpha channel is cut to so that it shows only the picture.
QRegion OpaqueRegion(const RBitmap8& bitmap);
