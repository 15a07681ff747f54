#pragma once

#include <string>

// Randomness and comparisons for what must not be guessed. initialiseSecrets() comes first.
bool initialiseSecrets();

// A text of the given number of random bytes, in the alphabet of URLs.
std::string randomText(std::size_t bytes);

// 64 hexadecimal digits that tell texts apart but do not give them back: what is kept of a token.
std::string fingerprint(const std::string &secret);

// Takes the same time wherever the texts differ.
bool equalSecrets(const std::string &one, const std::string &other);

// The Argon2id hash of a password, with its salt and its cost; and whether a password has this
// hash. One at a time in the whole program, since each takes 64 MiB.
std::string passwordHash(const std::string &password);
bool passwordFits(const std::string &hash, const std::string &password);
