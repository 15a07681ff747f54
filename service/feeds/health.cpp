#include "feeds/health.h"

#include "index/database.h"

#include <nlohmann/json.hpp>

#include <filesystem>

namespace {

constexpr std::uintmax_t leastBytes = 16u << 20;

bool hasRoom(const std::string &folder)
{
    std::error_code error;
    const auto space = std::filesystem::space(folder, error);
    return error || space.available >= leastBytes;
}

} // namespace

void addHealthRoute(Router &router, Database &database, const std::string &dataFolder)
{
    const auto answer = [&database, dataFolder](const Router::Call &, httplib::Response &response) {
        response.set_header("Cache-Control", "no-store");
        if (!hasRoom(dataFolder))
            return answerError(response, 503, "the disk of the data folder is nearly full");
        try {
            auto reader = database.read();
            Query query(reader, "SELECT coalesce(sum(photoCount), 0) FROM albums");
            const nlohmann::json body = {{"status", "ok"},
                                         {"photos", query.next() ? query.number(0) : 0}};
            response.set_content(body.dump(), "application/json; charset=UTF-8");
        } catch (const SQLite::Exception &) {
            answerError(response, 503, "the index cannot be read");
        }
    };
    router.add("GET", "health", answer);
}
