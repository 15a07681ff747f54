#pragma once

#include <QPixmap>
#include <QSize>
#include <QString>

// A picture of ":/res/" for a label, made for the screen's pixels: QPixmap itself always loads the
// smallest file. The sizes are those of the layout; an empty one stands for the size that the
// picture was drawn for. The result is kept in Qt's pixmap cache; a null pixmap means that there is
// no such picture. Style sheets take the plain name and need none of this.
QPixmap loadPicture(const QString &path, const QSize &size = QSize());
