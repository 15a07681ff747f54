#pragma once

#include "data/packagemanager.h"
#include "ui/detaillist.h"
#include "ui/detailphoto.h"

#include <QObject>

// Where in its list the photo screen is. Steps to photos that are held at once; has the others
// downloaded, while the photo shown stays, and steps to them when they have come.
class DetailWalk : public QObject
{
    Q_OBJECT

public:
    // The call-back gets the package manager's answers and hands them to listArrived().
    explicit DetailWalk(PackageManager::Callback callback, QObject *parent);

    // Takes over a list and steps to that record of it; its first record has this number in the
    // whole list.
    void open(int recordIndex, Package *package, int firstNumber);
    // Nothing for a number outside the list, or the one of the photo shown.
    void goTo(int number);
    void listArrived(const PackageProperty &property, ErrorCode code);

    int number() const { return mNumber; } // of the photo, in the whole list from 1; 0: none
    int recordIndex() const { return mList.recordIndex(mNumber); }
    int total() { return mList.total(); }
    const DetailPhoto &photo() const { return mPhoto; }
    bool isWaiting() const { return mWanted > 0; }
    // The large photo that is likely to be wanted next; "" when that is not known.
    QString nextUrl() const { return mNextUrl; }
    // For the strip: "" for a photo that is not held, or has none.
    QString thumbnailUrl(int number);

signals:
    void moved(); // to another photo
    // The photo is on another page, which begins with this number.
    void pageChanged(int startIndex, bool nextPage);
    void waiting(); // for photos to come
    void ended(bool failed);

private:
    void display(int number, const DetailPhoto &photo);
    void fetch(int number);
    void keepPlace();

    PackageManager::Callback mCallback;
    DetailList mList;
    DetailPhoto mPhoto;
    QString mNextUrl;
    int mNumber = 0;
    int mWanted = 0; // number of the photo that a download is to bring, 0: none
    PackageProperty mRequest;
};
