#include "index/revisions.h"

#include "index/database.h"

namespace {

std::string nameOf(Revision what)
{
    return what == Revision::Photos ? "photos" : "users";
}

} // namespace

std::int64_t revision(Session &session, Revision what)
{
    Query query(session, "SELECT value FROM revisions WHERE name = ?", nameOf(what));
    return query.next() ? query.number(0) : 0;
}

void raiseRevision(Session &session, Revision what)
{
    Query(session, "UPDATE revisions SET value = value + 1 WHERE name = ?", nameOf(what)).run();
}
