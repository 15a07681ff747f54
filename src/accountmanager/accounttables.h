#pragma once

#include <array>

// The tables of a new account file, in the order of their creation. Only orvala1 is read and
// written here: the others belong to the file's layout, which other programs of the device share.
namespace accounttables {

inline constexpr std::array<const char *, 9> statements = {
    "CREATE TABLE IF NOT EXISTS [accounts] ( [user] VARCHAR(10) UNIQUE NULL, "
    "[password] VARCHAR(4), [sibling1] VARCHAR(5) default false, "
    "[sibling2] VARCHAR(5) default false, [orvala] VARCHAR(5) default false, "
    "[sibling3] VARCHAR(5) default false, PRIMARY KEY([user]) )",

    "CREATE TABLE IF NOT EXISTS [sibling1] ( [localuser] VARCHAR(10) UNIQUE NULL, "
    "[token] VARCHAR(100), [secret] VARCHAR(100), [userid] VARCHAR(30), "
    "[login] VARCHAR(5) default false, PRIMARY KEY([localuser]) )",

    "CREATE TABLE IF NOT EXISTS [sibling2] ( [localuser] VARCHAR(10) UNIQUE NULL, "
    "[token] VARCHAR(100), [secret] VARCHAR(100), [userid] VARCHAR(30), "
    "[login] VARCHAR(5) default false, PRIMARY KEY([localuser]) )",

    "CREATE TABLE IF NOT EXISTS [orvala] ( [localuser] VARCHAR(10) UNIQUE NULL, "
    "[name] VARCHAR(30), [token] VARCHAR(100), [refresh] VARCHAR(100), "
    "[login] VARCHAR(5) default false, PRIMARY KEY([localuser]) )",

    "CREATE TABLE IF NOT EXISTS [sibling3] ( [localuser] VARCHAR(10) UNIQUE NULL, "
    "[token] VARCHAR(100), [secret] VARCHAR(100), [userid] VARCHAR(30), "
    "[login] VARCHAR(5) default false, PRIMARY KEY([localuser]) )",

    "CREATE TABLE IF NOT EXISTS [sibling11] ( [usermail] VARCHAR(100) UNIQUE NULL, "
    "[token] VARCHAR(100), [secret] VARCHAR(100), [userid] VARCHAR(30), "
    "[login] VARCHAR(5) default false, PRIMARY KEY([usermail]) )",

    "CREATE TABLE IF NOT EXISTS [sibling21] ( [usermail] VARCHAR(100) UNIQUE NULL, "
    "[token] VARCHAR(100), [secret] VARCHAR(100), [userid] VARCHAR(30), "
    "[login] VARCHAR(5) default false, PRIMARY KEY([usermail]) )",

    "CREATE TABLE IF NOT EXISTS [orvala1] ( [usermail] VARCHAR(100) UNIQUE NULL, "
    "[password] VARCHAR(4), [name] VARCHAR(30), [token] VARCHAR(100), [refresh] VARCHAR(100), "
    "[login] VARCHAR(5) default false, PRIMARY KEY([usermail]) )",

    "CREATE TABLE IF NOT EXISTS [sibling31] ( [usermail] VARCHAR(100) UNIQUE NULL, "
    "[token] VARCHAR(100), [secret] VARCHAR(100), [userid] VARCHAR(30), "
    "[login] VARCHAR(5) default false, PRIMARY KEY([usermail]) )",
};

} // namespace accounttables
