#pragma once

#include <QSize>

// The scale of the whole interface. Screens are laid out for 1280 x 720; on a larger one the
// configuration's "Layout/Scale" makes Qt draw the same layout with more pixels, so that a size in
// the code is always a size of that layout. Without the key nothing is touched.
//
//   prepareScale();             text sizes no longer depend on what the screen says of itself
//   QApplication application;
//   applyScale();               before the screen's size is read and the first widget is made
//
// Two steps, because "auto" needs the screen, and attributes hold only when set before it is there.

// Sets the application attributes that a scaled interface needs: a point is 96/72 of a pixel of the
// layout whatever the screen's size in inches, and icons take their sharpest file.
void prepareScale();

// Scales every screen by the configured factor and records it (SystemConfig::scale()). Costs
// microseconds; the platform plug-in in use does not matter.
void applyScale();

// The factor for a setting: the number itself, or for 0 ("auto") the largest factor at which a
// screen of this size still holds the layout. Never outside 0.25 to 8; 1 for a screen without size.
qreal scaleFor(qreal setting, const QSize &screen);
