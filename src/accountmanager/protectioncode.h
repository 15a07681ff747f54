#pragma once

#include <QString>

// Protection codes (the PINs of accounts).
namespace protectioncode {

// What the sign-in through New stores an account with: a code that nobody has chosen.
inline const QString kDefault = QStringLiteral("7305");

// Whether the screens let users give accounts a code of their own, and ask for it. Otherwise every
// stored account signs in by being chosen.
bool isOffered();

} // namespace protectioncode
