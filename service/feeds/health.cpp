#include "feeds/health.h"

#include "index/database.h"

#include <nlohmann/json.hpp>

void addHealthRoute(Router &router, Database &database)
{
    router.add("GET", "health", [&database](const Router::Call &, httplib::Response &response) {
        response.set_header("Cache-Control", "no-store");
        try {
            auto reader = database.read();
            Query query(reader, "SELECT coalesce(sum(photoCount), 0) FROM albums");
            const nlohmann::json body = {{"status", "ok"},
                                         {"photos", query.next() ? query.number(0) : 0}};
            response.set_content(body.dump(), "application/json; charset=UTF-8");
        } catch (const SQLite::Exception &) {
            answerError(response, 503, "the index cannot be read");
        }
    });
}
