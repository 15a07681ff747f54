#pragma once

#include <QByteArray>
#include <QtGlobal>

// What a picture's bytes claim, looked at before a decoder believes it.

// Name of the picture format that the data begins like, or null for formats that are not taken.
const char *pictureFormat(const QByteArray &data);

// The PNG without its texts, which nobody reads and which may unpack to a multiple of the picture's
// size. Null when a chunk claims more bytes than there are left.
QByteArray withoutTextChunks(const QByteArray &png);

// Memory that the decoder needs beside the decoded picture: a JPEG in several scans is held as
// coefficients until its last one. -1 for one that cannot be decoded or has an absurd number of
// scans.
qint64 jpegWorkBytes(const QByteArray &jpeg);
