#include "index/database.h"

#include "index/photosearch.h"
#include "index/schema.h"

#include <fcntl.h>
#include <sqlite3.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>

namespace {

constexpr int busyMilliseconds = 15'000; // another process may write for as long as a batch takes
constexpr std::size_t keptReaders = 32;

// Whoever may read the file could take over the family's tokens.
bool makePrivate(const std::string &file)
{
    const int descriptor = ::open(file.c_str(), O_RDWR | O_CREAT | O_CLOEXEC, 0600);
    if (descriptor < 0)
        return false;
    ::close(descriptor);
    return true;
}

const char *adviceFor(const SQLite::Exception &exception)
{
    switch (exception.getErrorCode()) {
    case SQLITE_FULL:
    case SQLITE_IOERR: // as when the files beside the index find no room
        return "; there has to be room on its disk";
    case SQLITE_READONLY:
    case SQLITE_CANTOPEN:
        return "; this user has to be allowed to write it and its folder";
    case SQLITE_NOTADB:
    case SQLITE_CORRUPT:
        return "; put back a copy, or move it away to begin with an empty index";
    default:
        return "";
    }
}

} // namespace

Session::Session(const std::string &file, bool readOnly)
    : mDatabase(file,
                (readOnly ? SQLite::OPEN_READONLY : SQLite::OPEN_READWRITE) | SQLite::OPEN_NOMUTEX,
                busyMilliseconds)
{
    if (!readOnly) {
        mDatabase.exec("PRAGMA journal_mode = WAL; PRAGMA foreign_keys = ON;");
        addSearchFunctions(mDatabase);
    }
    // A batch of the scan touches pages all over the index.
    mDatabase.exec(readOnly ? "PRAGMA cache_size = -4096" : "PRAGMA cache_size = -32768");
    mDatabase.exec("PRAGMA mmap_size = 268435456;");
}

SQLite::Statement &Session::statement(std::string_view sql)
{
    auto &slot = mStatements[std::string(sql)];
    if (!slot)
        slot = std::make_unique<SQLite::Statement>(mDatabase, std::string(sql));
    return *slot;
}

Database::Database(const std::string &file)
    : mFile(file)
    , mWriter(file, false)
{
}

std::unique_ptr<Database> Database::open(const std::string &file, std::string *error)
{
    if (!makePrivate(file)) {
        *error = "cannot write " + file + ": " + std::strerror(errno);
        return nullptr;
    }
    try {
        std::unique_ptr<Database> database(new Database(file));
        Writer writer(*database);
        if (!upgradeSchema(writer, error))
            return nullptr;
        writer.commit();
        return database;
    } catch (const SQLite::Exception &exception) {
        *error = file + ": " + exception.what() + adviceFor(exception);
        return nullptr;
    }
}

Database::Reader Database::read()
{
    std::unique_ptr<Session> session;
    {
        const std::lock_guard<std::mutex> lock(mReadersMutex);
        if (!mReaders.empty()) {
            session = std::move(mReaders.back());
            mReaders.pop_back();
        }
    }
    if (!session)
        session = std::make_unique<Session>(mFile, true);
    return Reader(*this, std::move(session));
}

void Database::giveBack(std::unique_ptr<Session> session)
{
    const std::lock_guard<std::mutex> lock(mReadersMutex);
    if (mReaders.size() < keptReaders)
        mReaders.push_back(std::move(session));
}

Database::Writer::Writer(Database &owner)
    : mLock(owner.mWriterMutex)
    , mSession(owner.mWriter)
    , mTransaction(mSession.database(), SQLite::TransactionBehavior::IMMEDIATE)
{
}
