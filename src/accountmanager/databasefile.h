#pragma once

#include <QString>

// A new database file is built beside its name and takes its name only when it is complete and on
// the disk, so that a program killed at any moment leaves the whole file or none.
namespace databasefile {

// Where the file of that path is built.
QString buildPath(const QString &path);

// Makes an empty build file that only its owner can read, in place of one left by a killed program;
// false when the folder does not allow it.
bool startBuilding(const QString &path);

// Moves the closed build file to its path; false, with the build file gone, when that failed.
bool publish(const QString &path);

// Removes the build file.
void discard(const QString &path);

} // namespace databasefile
