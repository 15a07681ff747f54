#pragma once

#include "data/package.h"

#include <QPointer>

struct DetailPhoto;

// The list of photos that the photo screen walks through. The package manager owns it and may drop
// or replace it at any time, so no record is held here: each look-up starts from what is cached
// now. Numbers count the photos of the whole list from 1, whichever part of it is held.
class DetailList
{
public:
    // Takes over a list; firstNumber is the number of its first record, which only blocks of
    // further search results do not begin with 1.
    void open(Package *package, int firstNumber);

    // The record, or null while it is not held. Valid until the event loop runs again.
    const OrvalaPhoto *photo(int number);
    int total(); // photos of the whole list, as far as is known
    int type() const { return mProperty.mType; }
    int number(int recordIndex) const { return mFirstNumber + recordIndex; }
    int recordIndex(int number) const { return number - mFirstNumber; }
    // Number of the same photo in the list as it is held now, 0 when it is not there.
    int find(const DetailPhoto &photo);

    // What to download so that the photo is held, or nearer: featured photos come page by page.
    PackageProperty requestFor(int number);
    // That download has ended well. False when it brought nothing new.
    bool take(const PackageProperty &arrived);
    // Has the page behind the one of this photo fetched ahead, where the list comes in pages.
    void prepareFollowing(int number);

private:
    Package *package();
    Package *cachedPackage() const;
    int heldEnd();

    PackageProperty mProperty;
    QPointer<Package> mPackage;
    int mFirstNumber = 1;
    int mTotal = 0;
    QPointer<Package> mPackageAtRequest;
    int mEndAtRequest = 0;
    int mEnd = 0; // where the list ended before its total was reached; 0: nowhere yet
};
