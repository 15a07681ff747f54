#pragma once

#include "data/package.h"
#include "network/errorcode.h"

#include <QByteArray>
#include <QString>

// Turns a feed's text into records. A text that is no feed gives a package without records: only
// the package type can fail (NET_REJECTED), or the memory (NET_OUT_OF_MEMORY).

// On success *out is a new package that the caller owns; on failure *out is left alone.
ErrorCode createPackage(const PackageProperty &property, const QString &feedText, Package **out);
ErrorCode createPackage(const PackageProperty &property, const QByteArray &utf8, Package **out);

// Adds the records of a further page to the package: behind the others for featured photos, in
// their place for a further search page. Other types stay as they are, with success.
ErrorCode appendPackage(const PackageProperty &property, const QString &feedText,
                        Package **package);
ErrorCode appendPackage(const PackageProperty &property, const QByteArray &utf8, Package **package);
