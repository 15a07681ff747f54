#pragma once

#include <nlohmann/json_fwd.hpp>

#include <string>

class Database;

// Brings in users, comments and tags from elsewhere. Importing the same again changes nothing. What
// belongs to a photo that is not in the index waits until a scan has found it. A user who has a
// password keeps it.
//
//   {"users": [{"mail", "name", "photos", "password"}],
//    "comments": [{"photo": "relative/path.jpg", "author": mail, "text", "published"}],
//    "tags": [{"photo", "author", "tag"}]}
struct ImportResult
{
    int users = 0;
    int comments = 0; // new ones
    int tags = 0;
    int waiting = 0; // for photos that are not in the index
};

// Turns the document's paths into absolute ones, taken from the folder when they are relative.
void resolvePaths(nlohmann::json &document, const std::string &folder);

// False and the reason in `error` when the document is not of this shape; then nothing is written.
bool importDocument(Database &database, const nlohmann::json &document, ImportResult *result,
                    std::string *error);

// Gives waiting comments and tags to photos that have come since; the number still waiting.
int applyImports(Database &database);
