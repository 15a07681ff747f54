#pragma once

#include <QPixmap>

class QWidget;

// The picture behind all screens, stretched to that many pixels. Its shades lie closer together
// than those of a screen: each pixel takes one of the two nearest, so that no steps are seen.
QPixmap screenBackground(const QSize &pixels);

// Fills the widget with that picture, of as many pixels as the layout has, and makes its texts
// white. Call it whenever the size has changed.
void setScreenBackground(QWidget *widget);
