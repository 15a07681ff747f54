#pragma once

#include <cstdint>
#include <string>
#include <vector>

class Database;
class Session;

// All photos for everybody as one deck of cards. Each day deals it anew: first what has not been
// shown since the last time that all had been, and of a burst one photo before the others. Within a
// day the order stays, whatever is shown and whenever the service starts.
//
// `day` is a date as 2026-05-01.
std::vector<std::int64_t> featuredOrder(Session &session, const std::string &day);

// To be called once a day before the first photo is marked: when all had been shown before the day,
// a new round begins, which leaves the day's order as it is.
void beginFeaturedDay(Database &database, const std::string &day);
void markFeatured(Database &database, const std::vector<std::int64_t> &photoIds,
                  const std::string &day);
