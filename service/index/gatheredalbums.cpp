#include "index/gatheredalbums.h"

#include "base/texts.h"
#include "index/database.h"
#include "index/photorows.h"

#include <algorithm>
#include <array>

namespace {

// A television reads an album whole.
constexpr std::int64_t mostOfList = 500;
constexpr std::int64_t all = 1'000'000'000;

// Which photos an album holds and in which order. The condition's values are the user (?1), the
// bounds `from` and `to` (?2, ?3) and a time before which the photos were taken (?4).
struct Selection
{
    std::string feedId;
    std::string title;
    std::string condition;
    std::string order = "p.published, p.name";
    std::string from = {};
    std::string to = {};
    std::string before = {};
    std::int64_t most = all;
};

// Photos of a user in the shape that the partial indexes cover.
#define OWN_PHOTOS "p.user = ?1 AND p.present = 1 AND p.error = '' "

bool isLeapYear(int year)
{
    return (year % 4 == 0 && year % 100 != 0) || year % 400 == 0;
}

// What was taken on 29 February comes on the 28th in years that have no 29th.
Selection onThisDay(const std::string &day)
{
    const std::string date = day.substr(5);
    const bool isShortFebruary = date == "02-28" && !isLeapYear(std::stoi(day));
    return {nameOf(Gathered::OnThisDay),
            "On this day",
            OWN_PHOTOS "AND substr(p.published, 6, 5) BETWEEN ?2 AND ?3 AND p.published < ?4 ",
            "substr(p.published, 1, 4) DESC, p.published, p.name",
            date,
            isShortFebruary ? "02-29" : date,
            day.substr(0, 4)};
}

Selection recent()
{
    return {nameOf(Gathered::Recent),
            "Recently added",
            OWN_PHOTOS,
            "p.added DESC, p.published DESC",
            {},
            {},
            {},
            mostOfList};
}

// The plus signs keep the search on the few photos with the tag.
Selection liked()
{
    return {nameOf(Gathered::Liked), "Liked",
            "+p.user = ?1 AND +p.present = 1 AND +p.error = '' "
            "AND p.id IN (SELECT photo FROM tags WHERE tag = 'liked' COLLATE NOCASE) "};
}

Selection neverShown()
{
    return {nameOf(Gathered::NeverShown),
            "Never shown",
            OWN_PHOTOS "AND p.shown = 0 ",
            "p.published, p.name",
            {},
            {},
            {},
            mostOfList};
}

// "2012" or "2012-03"; "~" lies behind all that may follow.
Selection period(const std::string &text)
{
    Selection selection{"year-" + text, text, OWN_PHOTOS "AND p.published BETWEEN ?2 AND ?3 "};
    selection.from = text;
    selection.to = text + "~";
    if (const std::size_t dash = text.find('-'); dash != std::string::npos) {
        selection.feedId = "month-" + text;
        selection.title = monthName(std::stoi(text.substr(dash + 1))) + " " + text.substr(0, dash);
    }
    return selection;
}

bool isDigits(const std::string &text, std::size_t start, std::size_t count)
{
    return text.size() >= start + count && parseNumber(text.substr(start, count)).has_value();
}

bool isYear(const std::string &text)
{
    return text.size() == 4 && isDigits(text, 0, 4);
}

bool isMonth(const std::string &text)
{
    if (text.size() != 7 || text[4] != '-' || !isDigits(text, 0, 4) || !isDigits(text, 5, 2))
        return false;
    const int month = std::stoi(text.substr(5));
    return month >= 1 && month <= 12;
}

std::string behind(const std::string &text, const std::string &start)
{
    return text.rfind(start, 0) == 0 ? text.substr(start.size()) : std::string();
}

std::optional<Selection> selectionOf(const Gathering &gathering, Gathered kind)
{
    if (gathering.kinds.count(kind) == 0)
        return std::nullopt;
    switch (kind) {
    case Gathered::OnThisDay:
        return onThisDay(gathering.day);
    case Gathered::Recent:
        return recent();
    case Gathered::Liked:
        return liked();
    case Gathered::NeverShown:
        return neverShown();
    case Gathered::Years:
    case Gathered::Months:
        break;
    }
    return std::nullopt;
}

std::optional<Selection> selectionNamed(const Gathering &gathering, const std::string &feedId)
{
    const std::string year = behind(feedId, "year-"), month = behind(feedId, "month-");
    if (isYear(year) && gathering.kinds.count(Gathered::Years) > 0)
        return period(year);
    if (isMonth(month) && gathering.kinds.count(Gathered::Months) > 0)
        return period(month);
    for (const Gathered kind : gathering.kinds) {
        auto selection = selectionOf(gathering, kind);
        if (selection && selection->feedId == feedId)
            return selection;
    }
    return std::nullopt;
}

AlbumRecord emptyAlbum(const Gathering &gathering, const Selection &selection)
{
    AlbumRecord album;
    album.feedId = selection.feedId;
    album.userId = gathering.userId;
    album.title = selection.title;
    album.isPrivate = true;
    return album;
}

AlbumRecord albumOf(Session &session, const Gathering &gathering, const Selection &selection)
{
    AlbumRecord album = emptyAlbum(gathering, selection);
    // Counting is twice as fast without the limit.
    const std::string photos = selection.most == all ? "photos p WHERE " + selection.condition
                                                     : "(SELECT p.published FROM photos p WHERE " +
                                                           selection.condition + "ORDER BY " +
                                                           selection.order + " LIMIT ?5) ";
    Query count(session, "SELECT count(*), max(published) FROM " + photos + "LIMIT min(1, ?5)",
                gathering.userId, selection.from, selection.to, selection.before, selection.most);
    if (!count.next() || count.number(0) == 0)
        return album;
    album.photoCount = static_cast<int>(count.number(0));
    album.published = count.text(1);
    Query cover(session,
                "SELECT p.id, u.name FROM photos p JOIN users u ON u.id = p.user WHERE " +
                    selection.condition + "ORDER BY " + selection.order + " LIMIT min(1, ?5)",
                gathering.userId, selection.from, selection.to, selection.before, selection.most);
    if (cover.next()) {
        album.cover = cover.number(0);
        album.userName = cover.text(1);
    }
    return album;
}

// The months in which the user took photos, as 2012-03, the newest first. Each is found by one look
// into the index, however many photos lie between them.
std::vector<std::string> monthsOf(Session &session, std::int64_t userId)
{
    std::vector<std::string> months;
    Query query(session,
                "WITH RECURSIVE months (month) AS ("
                "SELECT substr(max(p.published), 1, 7) FROM photos p WHERE " OWN_PHOTOS
                "UNION ALL SELECT (SELECT substr(max(p.published), 1, 7) FROM photos p "
                "WHERE " OWN_PHOTOS "AND p.published < month) FROM months WHERE month IS NOT NULL) "
                "SELECT month FROM months WHERE month IS NOT NULL",
                userId);
    while (query.next())
        months.push_back(query.text(0));
    months.erase(std::remove_if(months.begin(), months.end(),
                                [](const std::string &month) { return !isMonth(month); }),
                 months.end());
    return months;
}

// A year is the sum of its months, which come newest first.
AlbumRecord yearBeginningWith(AlbumRecord month, const Selection &year)
{
    month.feedId = year.feedId;
    month.title = year.title;
    return month;
}

void addMonth(AlbumRecord &year, const AlbumRecord &month)
{
    year.photoCount += month.photoCount;
    year.cover = month.cover;
}

} // namespace

const GatheredKinds &allGatheredKinds()
{
    static const GatheredKinds kinds = {Gathered::OnThisDay,  Gathered::Recent, Gathered::Liked,
                                        Gathered::NeverShown, Gathered::Years,  Gathered::Months};
    return kinds;
}

std::string nameOf(Gathered kind)
{
    static const std::array<const char *, 6> names = {"on-this-day", "recent", "liked",
                                                      "never-shown", "years",  "months"};
    return names[static_cast<std::size_t>(kind)];
}

std::vector<AlbumRecord> gatheredAlbums(Session &session, const Gathering &gathering)
{
    std::vector<AlbumRecord> albums;
    for (const Gathered kind : gathering.kinds) {
        if (const auto selection = selectionOf(gathering, kind))
            albums.push_back(albumOf(session, gathering, *selection));
    }
    albums.erase(std::remove_if(albums.begin(), albums.end(),
                                [](const AlbumRecord &album) { return album.photoCount == 0; }),
                 albums.end());
    return albums;
}

std::vector<AlbumRecord> periodAlbums(Session &session, const Gathering &gathering)
{
    const bool withYears = gathering.kinds.count(Gathered::Years) > 0;
    const bool withMonths = gathering.kinds.count(Gathered::Months) > 0;
    std::vector<AlbumRecord> albums;
    if (!withYears && !withMonths)
        return albums;
    std::string lastYear;
    std::size_t yearAt = 0;
    for (const std::string &text : monthsOf(session, gathering.userId)) {
        const AlbumRecord month = albumOf(session, gathering, period(text));
        const std::string year = text.substr(0, 4);
        if (withYears && year == lastYear)
            addMonth(albums[yearAt], month);
        if (withYears && year != lastYear) {
            yearAt = albums.size();
            albums.push_back(yearBeginningWith(month, period(year)));
        }
        if (withMonths)
            albums.push_back(month);
        lastYear = year;
    }
    return albums;
}

std::optional<AlbumRecord> gatheredAlbum(Session &session, const Gathering &gathering,
                                         const std::string &feedId)
{
    const auto selection = selectionNamed(gathering, feedId);
    if (!selection)
        return std::nullopt;
    return albumOf(session, gathering, *selection);
}

std::vector<PhotoRecord> gatheredPhotos(Session &session, const Gathering &gathering,
                                        const std::string &feedId, const Page &page)
{
    std::vector<PhotoRecord> photos;
    const auto selection = selectionNamed(gathering, feedId);
    const std::int64_t left = selection ? selection->most - (page.start - 1) : 0;
    if (left <= 0)
        return photos;
    Query query(session,
                PHOTO_COLUMNS "WHERE " + selection->condition + "ORDER BY " + selection->order +
                    " LIMIT ?5 OFFSET ?6",
                gathering.userId, selection->from, selection->to, selection->before,
                std::min(page.count, left), page.start - 1);
    while (query.next())
        photos.push_back(photoAt(query));
    return photos;
}
