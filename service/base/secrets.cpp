#include "base/secrets.h"

#include <sodium.h>

#include <array>
#include <mutex>
#include <new>
#include <vector>

namespace {

std::mutex hashing;

} // namespace

bool initialiseSecrets()
{
    return sodium_init() >= 0;
}

std::string randomText(std::size_t bytes)
{
    std::vector<unsigned char> random(bytes);
    randombytes_buf(random.data(), random.size());
    const int variant = sodium_base64_VARIANT_URLSAFE_NO_PADDING;
    std::string text(sodium_base64_encoded_len(bytes, variant), '\0');
    sodium_bin2base64(text.data(), text.size(), random.data(), random.size(), variant);
    text.pop_back(); // the closing zero
    return text;
}

std::string fingerprint(const std::string &secret)
{
    std::array<unsigned char, crypto_hash_sha256_BYTES> hash;
    crypto_hash_sha256(hash.data(), reinterpret_cast<const unsigned char *>(secret.data()),
                       secret.size());
    std::string text(hash.size() * 2 + 1, '\0');
    sodium_bin2hex(text.data(), text.size(), hash.data(), hash.size());
    text.pop_back(); // the closing zero
    return text;
}

bool equalSecrets(const std::string &one, const std::string &other)
{
    const std::string first = fingerprint(one), second = fingerprint(other);
    return sodium_memcmp(first.data(), second.data(), first.size()) == 0;
}

std::string passwordHash(const std::string &password)
{
    const std::lock_guard<std::mutex> lock(hashing);
    std::array<char, crypto_pwhash_STRBYTES> hash;
    if (crypto_pwhash_str(hash.data(), password.data(), password.size(),
                          crypto_pwhash_OPSLIMIT_INTERACTIVE,
                          crypto_pwhash_MEMLIMIT_INTERACTIVE) != 0)
        throw std::bad_alloc(); // there is no other way to fail
    return hash.data();
}

bool passwordFits(const std::string &hash, const std::string &password)
{
    const std::lock_guard<std::mutex> lock(hashing);
    return crypto_pwhash_str_verify(hash.c_str(), password.data(), password.size()) == 0;
}
