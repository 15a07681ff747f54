#pragma once

#include <QSize>
#include <QString>

class QFont;

// The text broken into lines (by line feeds of its own) so that a label without word wrap shows it
// inside the box; words wider than the box are broken too, and what does not fit ends in an
// ellipsis. Costs no more for a text of 10,000 characters than for a screenful.
QString fitText(const QString &text, const QFont &font, const QSize &box);

// One line for a button: elided to the width, and with ampersands that are no mnemonics.
QString buttonText(const QString &text, const QFont &font, int width);
