#pragma once

#include <SQLiteCpp/SQLiteCpp.h>

#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

// The index file: users, albums, photos, comments, tags and tokens in one SQLite database. Readers
// never wait for the one writer. What goes wrong inside SQLite arrives as SQLite::Exception; it is
// caught where a request or a command ends.

// One connection with its prepared statements; used by one thread at a time.
class Session
{
public:
    Session(const std::string &file, bool readOnly);
    SQLite::Database &database() { return mDatabase; }
    SQLite::Statement &statement(std::string_view sql);

private:
    SQLite::Database mDatabase;
    std::unordered_map<std::string, std::unique_ptr<SQLite::Statement>> mStatements;
};

// One run of a prepared statement, which is free for the next run when the query ends. The same
// text must not run twice at once in one session.
class Query
{
public:
    template <typename... Values>
    Query(Session &session, std::string_view sql, const Values &...values)
        : mStatement(session.statement(sql))
    {
        int index = 0;
        (bind(++index, values), ...);
    }
    ~Query() { mStatement.tryReset(); }
    Query(const Query &) = delete;
    Query &operator=(const Query &) = delete;

    bool next() { return mStatement.executeStep(); }
    // Runs to the end; the number of rows that were changed.
    int run() { return mStatement.exec(); }

    std::string text(int column) const { return mStatement.getColumn(column).getString(); }
    // Valid until the next row.
    std::string_view view(int column) const
    {
        const SQLite::Column value = mStatement.getColumn(column);
        const char *const start = value.getText();
        return {start, static_cast<std::size_t>(value.getBytes())};
    }
    std::int64_t number(int column) const { return mStatement.getColumn(column).getInt64(); }
    double real(int column) const { return mStatement.getColumn(column).getDouble(); }
    bool isNull(int column) const { return mStatement.isColumnNull(column); }

private:
    template <typename Value>
    void bind(int index, const Value &value)
    {
        mStatement.bind(index, value);
    }
    void bind(int index, const std::optional<double> &value)
    {
        value ? mStatement.bind(index, *value) : mStatement.bind(index);
    }

    SQLite::Statement &mStatement;
};

class Database
{
public:
    // A session on loan; it goes back when the loan ends.
    class Reader
    {
    public:
        Reader(Database &owner, std::unique_ptr<Session> session)
            : mOwner(owner)
            , mSession(std::move(session))
        {
        }
        ~Reader() { mOwner.giveBack(std::move(mSession)); }
        Reader(const Reader &) = delete;
        Reader &operator=(const Reader &) = delete;
        operator Session &() { return *mSession; }

    private:
        Database &mOwner;
        std::unique_ptr<Session> mSession;
    };

    // The writing session with a transaction: everything or, without commit(), nothing.
    class Writer
    {
    public:
        explicit Writer(Database &owner);
        operator Session &() { return mSession; }
        std::int64_t lastId() { return mSession.database().getLastInsertRowid(); }
        void commit() { mTransaction.commit(); }

    private:
        std::unique_lock<std::mutex> mLock;
        Session &mSession;
        SQLite::Transaction mTransaction;
    };

    // Opens the file, makes it when missing and brings its schema up to date; null and the reason
    // in `error` when that cannot be done.
    static std::unique_ptr<Database> open(const std::string &file, std::string *error);

    Reader read();

private:
    explicit Database(const std::string &file);
    void giveBack(std::unique_ptr<Session> session);

    const std::string mFile;
    std::mutex mWriterMutex;
    Session mWriter;
    std::mutex mReadersMutex;
    std::vector<std::unique_ptr<Session>> mReaders;
};
