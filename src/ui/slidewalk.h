#pragma once

#include "ui/playorder.h"
#include "ui/slideoptions.h"

#include <QStringList>

#include <functional>

class OrvalaPhoto;

// Where in its list the slide show is: the order of the records, the position in that order, and
// what lies ahead of it. Reads the list that the home screen holds now (sliderecords.h); shows
// nothing and asks for nothing.
class SlideWalk
{
public:
    SlideWalk(const SlideOptions &options, playorder::RandomSource random);

    // Starts with the record of that index, which becomes the position, in the mode's order.
    void start(int index, int mode);
    // Forgets the order: the next turn's position is the first of another list.
    void restart();
    void setMode(int mode); // orders all records anew

    int position() const { return mIndex; }
    const PlayArray &playArray() const { return mPlayArray; }

    // Lets the records join that have come since, in the mode's order if refreshMode is not 0, and
    // drops those that have gone.
    void renew(int refreshMode);

    void step(int places) { mIndex += places; } // out of the list as well: clamp() puts it right
    // On to the next turn, past the photos that are to be skipped; into the next round if the show
    // goes round.
    void advance(const std::function<bool(const QString &url)> &isSkipped);
    // Moves the position into the list; false when it was behind its end.
    bool clamp();

    bool isFirst() const { return mIndex <= 0; }
    bool isLast() const; // of the records that are loaded
    // The end of the loaded records comes near, and there are more.
    bool isPageWanted() const;

    const OrvalaPhoto *photo() const; // null without
    QString url(int ahead) const;     // of the photo so many turns on; "" for none
    QStringList urlsAhead() const;    // of those to have ready, the next one first

private:
    SlideOptions mOptions;
    PlayArray mPlayArray;
    int mMode = 0;
    int mIndex = 0; // position in the play array
};
