#pragma once

#include "data/orvaladata.h"

// What the slide show reads of the list that the home screen holds. Records are looked up anew each
// time: the list may change or go whenever the event loop runs.
namespace sliderecords {

bool hasList();
// Records that are loaded, and records that the feed has in all (0: unknown, all are loaded).
int count();
int total();
// Records of the feed lie behind those that are loaded.
bool isMoreToCome();
// Search results are held block by block, one at a time: the number of the record that begins the
// next block, or after the last one, if the show goes round, the first block. 0: this list stays.
int nextBlock(bool isRound);
// A page of the list is on its way, and the home screen waits for it.
bool isDownloading();

// Null outside the list, and when it is no list of photos.
const OrvalaPhoto *photo(int record);
QString url(int record);
// For people to read: the summary, or the title of a photo without; the day that it was taken.
QString caption(const OrvalaPhoto &photo);
QString date(const OrvalaPhoto &photo);

} // namespace sliderecords
