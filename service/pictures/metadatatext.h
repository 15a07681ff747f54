#pragma once

#include <string>

// Text from a photo file as clean UTF-8: what is not UTF-8 is read as the Western European code
// page that old programs wrote. Control characters and blanks at the ends go, line ends become
// "\n", and over-long text is cut between two characters.
std::string cleanMetadataText(std::string text);

// The date and time of a photo, given as "2026:05:01 10:00:00" or in ISO form with or without a
// time, fraction and zone, as 2026-05-01T10:00:00 (the zone is dropped, the clock kept). Empty if
// it is no date.
std::string isoPhotoTime(const std::string &text);
