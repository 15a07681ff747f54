#pragma once

#include "index/records.h"

#include <set>
#include <vector>

class Session;

// Albums that the service gathers from all folders of one user, private ones too; they are that
// user's alone. Their ids are words, those of folder albums are numbers: "on-this-day", "recent",
// "liked", "never-shown", "year-2012" and "month-2012-03". An album without photos is in no list,
// but can be asked for: its last photo may have left it a moment ago. Files that cannot be read are
// in none.
enum class Gathered { OnThisDay, Recent, Liked, NeverShown, Years, Months };
using GatheredKinds = std::set<Gathered>;

const GatheredKinds &allGatheredKinds();
// "on-this-day", "recent", "liked", "never-shown", "years", "months".
std::string nameOf(Gathered kind);

struct Gathering
{
    std::int64_t userId = 0;
    std::string day; // today, as 2026-05-01
    GatheredKinds kinds = allGatheredKinds();
};

// Those that there is one of at most, in the order of the enumeration.
std::vector<AlbumRecord> gatheredAlbums(Session &session, const Gathering &gathering);
// One for each year and month, the newest year first, each followed by its months.
std::vector<AlbumRecord> periodAlbums(Session &session, const Gathering &gathering);

// Nothing if there is no such id.
std::optional<AlbumRecord> gatheredAlbum(Session &session, const Gathering &gathering,
                                         const std::string &feedId);
std::vector<PhotoRecord> gatheredPhotos(Session &session, const Gathering &gathering,
                                        const std::string &feedId, const Page &page);
