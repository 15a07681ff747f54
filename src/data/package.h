#pragma once

#include "data/orvaladata.h"
#include "data/packageproperty.h"

#include <QList>
#include <QObject>

// One downloaded list: its request, its records in feed order and the feed's total count. Owned by
// the package manager's cache; owns its records. It is an object so that a QPointer can tell
// whether the cache still has it.
class Package : public QObject
{
public:
    Package() = default;
    ~Package() override
    {
        qDeleteAll(mDataList);
        qDeleteAll(mRetiredDataList);
    }

    // The record, or null outside the list or when this list holds records of another kind.
    template <typename Record>
    const Record *record(int index) const
    {
        if (index < 0 || index >= mDataList.size() || !Record::isRecordOf(mProperty.mType))
            return nullptr;
        return static_cast<const Record *>(mDataList.at(index));
    }
    int count() const { return mDataList.size(); }

    // Empties the list. The records live on until the next time or the package's end, for whoever
    // shows them when the page that replaces them arrives.
    void retireRecords()
    {
        qDeleteAll(mRetiredDataList);
        mRetiredDataList.clear();
        mRetiredDataList.swap(mDataList);
    }

    PackageProperty mProperty;
    QList<OrvalaData *> mDataList;
    int mTotalCount = 0; // of the whole feed, for featured photos and searches
    bool mIsFeed = true; // false: the text that came last was something else, without records

private:
    QList<OrvalaData *> mRetiredDataList;
};
