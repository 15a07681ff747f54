#include "index/featureddeck.h"

#include "base/texts.h"
#include "index/database.h"

#include <algorithm>
#include <tuple>

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
std::uint64_t placeOf(const std::string &key, const std::string &day)
{
    std::uint64_t hash = 14695981039346656037u;
    for (const std::string *text : {&day, &key}) {
        for (const char c : *text)
            hash = (hash ^ static_cast<unsigned char>(c)) * 1099511628211u;
    }
    return hash ^ (hash >> 29);
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

std::vector<Card> cards(Session &session, const std::string &day)
{
    std::vector<Card> deck;
    Query query(session,
                "SELECT p.id, p.album, p.published, p.key, s.day IS NOT NULL AND s.day < ? "
                "FROM photos p JOIN albums a ON a.id = p.album "
                "LEFT JOIN featuredShown s ON s.photo = p.id "
                "WHERE p.present = 1 AND p.error = '' AND NOT a.private "
                "ORDER BY p.album, p.published",
                day);
    std::int64_t album = 0, taken = 0;
    std::size_t burst = 0; // where the current one starts
    while (query.next()) {
        const std::int64_t time = parseTime(query.text(2)).value_or(0);
        if (query.number(1) != album || time - taken > burstSeconds) {
            if (burst < deck.size())
                thinBurst(deck.begin() + static_cast<std::ptrdiff_t>(burst), deck.end());
            burst = deck.size();
        }
        album = query.number(1);
        taken = time;
        deck.push_back({query.number(0), query.number(4) != 0, false, placeOf(query.text(3), day)});
    }
    if (burst < deck.size())
        thinBurst(deck.begin() + static_cast<std::ptrdiff_t>(burst), deck.end());
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

void markFeatured(Database &database, const std::vector<std::int64_t> &photoIds,
                  const std::string &day)
{
    Database::Writer writer(database);
    // When all had been shown before today a new round begins, which leaves today's order as it is.
    Query(writer,
          "DELETE FROM featuredShown WHERE day < ?1 AND NOT EXISTS "
          "(SELECT 1 FROM photos p JOIN albums a ON a.id = p.album "
          "LEFT JOIN featuredShown s ON s.photo = p.id "
          "WHERE (s.photo IS NULL OR s.day >= ?1) "
          "AND p.present = 1 AND p.error = '' AND NOT a.private)",
          day)
        .run();
    for (const std::int64_t id : photoIds)
        Query(writer,
              "INSERT OR IGNORE INTO featuredShown (photo, day) "
              "SELECT id, ? FROM photos WHERE id = ?",
              day, id)
            .run();
    writer.commit();
}
