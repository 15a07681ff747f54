#pragma once

#include <QByteArray>
#include <QPixmap>

// Decodes a picture from the network; null when it is none, is broken, or asks for too much: more
// than 64 megapixels, or more memory than 300 MB on the way. Of a moving picture the first frame is
// taken. A photo at least twice as large as the screen is decoded at the size at which it fills the
// screen, which is faster, and no label shows more.
QPixmap readPicture(const QByteArray &data);
