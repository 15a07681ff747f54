#pragma once

class QWidget;

// Fills the widget with the picture behind the sign-in screens, stretched to the widget's size, and
// makes its texts white. Call it whenever the size has changed.
void setScreenBackground(QWidget *widget);
