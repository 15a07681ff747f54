#include "index/featureddeck.h"

#include "index/database.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <tuple>
#include <unordered_set>
#include <utility>

namespace {

constexpr std::int64_t burstSeconds = 3; // from one photo of an album to the next

struct Card
{
    std::int64_t id = 0;
    bool isShown = false;  // in this round, before today
    bool isBehind = false; // another one of its burst comes first
    std::uint64_t place = 0;
};

// The same photo lies elsewhere every day.
std::uint64_t placeOf(std::int64_t photo, std::uint64_t day)
{
    std::uint64_t place = (static_cast<std::uint64_t>(photo) ^ day) * 0x9E3779B97F4A7C15u;
    place = (place ^ (place >> 30)) * 0xBF58476D1CE4E5B9u;
    place = (place ^ (place >> 27)) * 0x94D049BB133111EBu;
    return place ^ (place >> 31);
}

std::uint64_t numberOf(const std::string &day)
{
    std::uint64_t hash = 14695981039346656037u;
    for (const char c : day)
        hash = (hash ^ static_cast<unsigned char>(c)) * 1099511628211u;
    return hash;
}

// Seconds of a time as 2026-05-01T10:00:00, exact within a day and growing from one to the next.
// For telling bursts that is enough, and it costs a tenth of a true reading.
std::int64_t roughSeconds(std::string_view time)
{
    constexpr std::array<std::pair<std::size_t, std::int64_t>, 6> parts = {
        {{0, 12 * 31 * 86'400}, {5, 31 * 86'400}, {8, 86'400}, {11, 3600}, {14, 60}, {17, 1}}};
    std::int64_t seconds = 0;
    for (const auto &[start, unit] : parts) {
        std::int64_t number = 0;
        std::from_chars(time.data() + std::min(start, time.size()),
                        time.data() + std::min(start + (start == 0 ? 4 : 2), time.size()), number);
        seconds += number * unit;
    }
    return seconds;
}

// Of a burst, the card that comes first anyway stays; the others go behind.
void thinBurst(std::vector<Card>::iterator first, std::vector<Card>::iterator last)
{
    const auto isBefore = [](const Card &one, const Card &other) {
        return std::tie(one.isShown, one.place) < std::tie(other.isShown, other.place);
    };
    const auto front = std::min_element(first, last, isBefore);
    for (auto card = first; card != last; ++card)
        card->isBehind = card != front;
}

// Shown in this round, before the day.
std::unordered_set<std::int64_t> shownBefore(Session &session, const std::string &day)
{
    std::unordered_set<std::int64_t> photos;
    Query query(session, "SELECT photo FROM featuredShown WHERE day < ?", day);
    while (query.next())
        photos.insert(query.number(0));
    return photos;
}

std::vector<Card> cards(Session &session, const std::string &day)
{
    const std::unordered_set<std::int64_t> shown = shownBefore(session, day);
    const std::uint64_t dayNumber = numberOf(day);
    std::vector<Card> deck;
    // Read from the index alone, which holds these columns.
    Query query(session, "SELECT p.id, p.album, p.published FROM albums a "
                         "CROSS JOIN photos p ON p.album = a.id "
                         "WHERE NOT a.private AND p.present = 1 AND p.error = '' "
                         "ORDER BY a.id, p.published");
    std::int64_t album = 0, taken = 0;
    std::size_t burst = 0; // where the current one starts
    const auto endBurst = [&] {
        if (burst + 1 < deck.size())
            thinBurst(deck.begin() + static_cast<std::ptrdiff_t>(burst), deck.end());
        burst = deck.size();
    };
    while (query.next()) {
        const std::int64_t id = query.number(0);
        const std::int64_t time = roughSeconds(query.view(2));
        if (query.number(1) != std::exchange(album, query.number(1)) || time - taken > burstSeconds)
            endBurst();
        taken = time;
        deck.push_back({id, shown.count(id) > 0, false, placeOf(id, dayNumber)});
    }
    endBurst();
    return deck;
}

} // namespace

std::vector<std::int64_t> featuredOrder(Session &session, const std::string &day)
{
    std::vector<Card> deck = cards(session, day);
    std::sort(deck.begin(), deck.end(), [](const Card &one, const Card &other) {
        return std::tie(one.isShown, one.isBehind, one.place, one.id) <
               std::tie(other.isShown, other.isBehind, other.place, other.id);
    });
    std::vector<std::int64_t> ids;
    ids.reserve(deck.size());
    for (const Card &card : deck)
        ids.push_back(card.id);
    return ids;
}

void beginFeaturedDay(Database &database, const std::string &day)
{
    Database::Writer writer(database);
    Query(writer,
          "DELETE FROM featuredShown WHERE day < ?1 AND NOT EXISTS "
          "(SELECT 1 FROM photos p JOIN albums a ON a.id = p.album "
          "LEFT JOIN featuredShown s ON s.photo = p.id "
          "WHERE (s.photo IS NULL OR s.day >= ?1) "
          "AND p.present = 1 AND p.error = '' AND NOT a.private)",
          day)
        .run();
    writer.commit();
}

void markFeatured(Database &database, const std::vector<std::int64_t> &photoIds,
                  const std::string &day)
{
    Database::Writer writer(database);
    for (const std::int64_t id : photoIds)
        Query(writer,
              "INSERT OR IGNORE INTO featuredShown (photo, day) "
              "SELECT id, ? FROM photos WHERE id = ?",
              day, id)
            .run();
    writer.commit();
}
