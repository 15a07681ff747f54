#pragma once

// Where photos stand in their list and in the strip of neighbours: plain functions. Numbers count
// the photos of the whole list from 1.
namespace detailpaging {

// Number of the first photo on the page that holds this one. Search results are cut into blocks,
// and each block into pages of its own.
int pageStart(int packageType, int number);

// Number of the first photo in a strip of so many places: the photo shown stands in the middle,
// except near the ends of the list, where the strip stays full.
int stripStart(int number, int total, int places);

// How many places a strip of this width (pixels) has: an odd number, so that there is a middle.
int stripPlaces(int width, int cellWidth, int gap);

} // namespace detailpaging
