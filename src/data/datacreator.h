#pragma once

#include "data/orvaladata.h"

// Factory of one kind of record. The factories are stateless and live for the whole process.
class DataCreator
{
public:
    // The factory for a package type, or null for types that have none.
    static const DataCreator *forType(int packageType);

    // A new record from one entry of a feed; the caller owns it.
    virtual OrvalaData *createData(const JsonObject &entry) const = 0;

protected:
    ~DataCreator() = default;
};

template <typename Record>
class RecordCreator final : public DataCreator
{
public:
    OrvalaData *createData(const JsonObject &entry) const override { return new Record(entry); }
};

using OrvalaPhotoCreator = RecordCreator<OrvalaPhoto>;
using AlbumCreator = RecordCreator<Album>;
using CommentCreator = RecordCreator<Comment>;
using TagCreator = RecordCreator<PhotoTagList>;
using FavoritePeopleCreator = RecordCreator<FavoritePeople>;
