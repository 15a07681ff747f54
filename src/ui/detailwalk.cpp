#include "ui/detailwalk.h"

#include "ui/detailpaging.h"

#include <algorithm>

DetailWalk::DetailWalk(PackageManager::Callback callback, QObject *parent)
    : QObject(parent)
    , mCallback(callback)
{
}

void DetailWalk::open(int recordIndex, Package *package, int firstNumber)
{
    mList.open(package, firstNumber);
    mNumber = 0; // whatever page it is on, the owner knows
    const int number = mList.number(recordIndex);
    if (const OrvalaPhoto *record = mList.photo(number))
        display(number, DetailPhoto::of(*record));
    else
        fetch(number);
}

void DetailWalk::goTo(int number)
{
    if (number < 1 || number > mList.total() || number == mNumber)
        return;
    if (const OrvalaPhoto *record = mList.photo(number))
        display(number, DetailPhoto::of(*record));
    else
        fetch(number);
}

void DetailWalk::display(int number, const DetailPhoto &photo)
{
    const int before = mNumber;
    mNumber = number;
    mWanted = 0;
    mPhoto = photo;
    const OrvalaPhoto *next = mList.photo(number >= before ? number + 1 : number - 1);
    mNextUrl = next ? next->imageUrl() : QString();
    emit moved();
    const int page = detailpaging::pageStart(mList.type(), number);
    mList.prepareFollowing(number);
    if (before > 0 && page != detailpaging::pageStart(mList.type(), before))
        emit pageChanged(page, number > before);
}

void DetailWalk::fetch(int number)
{
    mWanted = number;
    mRequest = mList.requestFor(number);
    emit waiting();
    if (!PackageManager::downloadPage(mRequest, mCallback))
        listArrived(mRequest, NET_FAILED);
}

void DetailWalk::listArrived(const PackageProperty &property, ErrorCode code)
{
    if (mWanted == 0 || property != mRequest)
        return;
    const bool isNew = code == NET_SUCCESS && mList.take(property);
    if (isNew)
        keepPlace();
    const int wanted = std::min(mWanted, mList.total());
    if (isNew && wanted > 0 && !mList.photo(wanted)) {
        fetch(wanted); // another page nearer
        return;
    }
    mWanted = 0;
    emit ended(code != NET_SUCCESS || (!isNew && mNumber == 0));
    if (isNew)
        goTo(wanted);
}

// A list fetched anew may have lost or gained photos before this one.
void DetailWalk::keepPlace()
{
    const int moved = mNumber > 0 ? mList.find(mPhoto) - mNumber : 0;
    if (mNumber > 0 && mNumber + moved > 0) {
        mNumber += moved;
        mWanted += moved;
    }
}

QString DetailWalk::thumbnailUrl(int number)
{
    const OrvalaPhoto *record = mList.photo(number);
    return record ? record->thumbnailUrl() : QString();
}
