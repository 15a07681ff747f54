#pragma once

#include <openssl/ssl.h>

#include <memory>
#include <string>

struct FreeSslContext
{
    void operator()(SSL_CTX *context) const { SSL_CTX_free(context); }
};
using SslContext = std::unique_ptr<SSL_CTX, FreeSslContext>;

// What the server shows to clients, from files in PEM form; null and the reason in `error` when
// they cannot be used.
SslContext makeSslContext(const std::string &certificateFile, const std::string &keyFile,
                          std::string *error);

// Makes a self-signed certificate with its key in one file that only the owner may read, unless the
// file is there already.
bool ensureSelfSignedCertificate(const std::string &file, std::string *error);
