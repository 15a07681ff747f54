#pragma once

#include <QString>

// A corner of the screen for one of the texts over the photos.
enum class SlideCorner { None, TopLeft, TopRight, BottomLeft, BottomRight };

// What the slide show does beyond its plain behaviour: group "SlideShow" of the configuration.
// Every key that is missing leaves its part off.
struct SlideOptions
{
    int fade = 0;             // "Fade": milliseconds from one photo to the next while playing
    int motion = 0;           // "Motion": percent by which a photo slowly grows while playing
    bool blurredFill = false; // "BlurredFill": beside a photo that leaves room, itself out of focus
    SlideCorner caption = SlideCorner::None; // "Caption", "Date", "Clock": their corners
    SlideCorner date = SlideCorner::None;
    SlideCorner clock = SlideCorner::None;
    int marksSeconds = 0; // "MarksSeconds": arrows and indicators hide when no key came for so long
    int ahead = 1;        // "Ahead": photos fetched before their time
    bool sharpen = false; // "Sharpen": the photo replaces its thumbnail when it comes
    bool waitForPhoto = false;   // "WaitForPhoto": a photo stays until the next has come, for up to
                                 // a second turn
    bool loop = false;           // "Loop": after the last photo the first one follows
    bool wholeList = false;      // "WholeList": the feed's last pages are loaded as well
    bool skipUnreadable = false; // "SkipUnreadable": a photo that has failed takes no turn
    bool returnToPhoto = false;  // "ReturnToPhoto": who leaves finds the photo shown last selected,
                                 // in whatever order it came
    bool keysWhileLoading = false; // "KeysWhileLoading": keys answer while a page is on its way

    // As the configuration has it; values outside their range are moved into it.
    static SlideOptions configured();
};
