#include "http/certificate.h"

#include <openssl/pem.h>
#include <openssl/rand.h>
#include <openssl/x509v3.h>

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <cstring>

namespace {

template <auto function>
struct Freeing
{
    template <typename Type>
    void operator()(Type *object) const
    {
        function(object);
    }
};
using Key = std::unique_ptr<EVP_PKEY, Freeing<EVP_PKEY_free>>;
using Certificate = std::unique_ptr<X509, Freeing<X509_free>>;
using Extension = std::unique_ptr<X509_EXTENSION, Freeing<X509_EXTENSION_free>>;
using File = std::unique_ptr<std::FILE, Freeing<std::fclose>>;

constexpr long lifetimeSeconds = 10L * 365 * 24 * 3600;

std::string hostName()
{
    char name[256] = "";
    gethostname(name, sizeof name - 1);
    return name;
}

void addExtension(X509 *certificate, int id, const std::string &value)
{
    X509V3_CTX context;
    X509V3_set_ctx_nodb(&context);
    X509V3_set_ctx(&context, certificate, certificate, nullptr, nullptr, 0);
    const Extension extension(X509V3_EXT_conf_nid(nullptr, &context, id, value.c_str()));
    if (extension)
        X509_add_ext(certificate, extension.get(), -1);
}

void setName(X509 *certificate, const std::string &name)
{
    X509_NAME *subject = X509_get_subject_name(certificate);
    X509_NAME_add_entry_by_txt(subject, "CN", MBSTRING_UTF8,
                               reinterpret_cast<const unsigned char *>(name.c_str()), -1, -1, 0);
    X509_set_issuer_name(certificate, subject);
}

void setSerialNumber(X509 *certificate)
{
    unsigned char bytes[8];
    RAND_bytes(bytes, sizeof bytes);
    long number = 0;
    for (const unsigned char byte : bytes)
        number = (number << 7) | (byte & 0x7F);
    ASN1_INTEGER_set(X509_get_serialNumber(certificate), number);
}

Certificate signedCertificate(EVP_PKEY *key)
{
    Certificate certificate(X509_new());
    X509_set_version(certificate.get(), 2);
    setSerialNumber(certificate.get());
    X509_gmtime_adj(X509_getm_notBefore(certificate.get()), -24L * 3600);
    X509_gmtime_adj(X509_getm_notAfter(certificate.get()), lifetimeSeconds);
    X509_set_pubkey(certificate.get(), key);
    setName(certificate.get(), "Orvala album service");
    std::string names = "DNS:localhost,IP:127.0.0.1";
    if (const std::string host = hostName(); !host.empty() && host != "localhost")
        names += ",DNS:" + host;
    addExtension(certificate.get(), NID_subject_alt_name, names);
    if (X509_sign(certificate.get(), key, EVP_sha256()) == 0)
        return nullptr;
    return certificate;
}

bool writePem(const std::string &file, EVP_PKEY *key, X509 *certificate)
{
    const int descriptor = ::open(file.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0600);
    if (descriptor < 0)
        return false;
    const File stream(::fdopen(descriptor, "w"));
    return PEM_write_PKCS8PrivateKey(stream.get(), key, nullptr, nullptr, 0, nullptr, nullptr) ==
               1 &&
           PEM_write_X509(stream.get(), certificate) == 1 && std::fflush(stream.get()) == 0 &&
           ::fsync(descriptor) == 0;
}

} // namespace

SslContext makeSslContext(const std::string &certificateFile, const std::string &keyFile,
                          std::string *error)
{
    SslContext context(SSL_CTX_new(TLS_server_method()));
    SSL_CTX_set_min_proto_version(context.get(), TLS1_2_VERSION);
    SSL_CTX_set_mode(context.get(), SSL_MODE_ENABLE_PARTIAL_WRITE |
                                        SSL_MODE_ACCEPT_MOVING_WRITE_BUFFER |
                                        SSL_MODE_RELEASE_BUFFERS);
    SSL_CTX_set_options(context.get(), SSL_OP_NO_RENEGOTIATION | SSL_OP_IGNORE_UNEXPECTED_EOF);
    if (SSL_CTX_use_certificate_chain_file(context.get(), certificateFile.c_str()) != 1) {
        *error = "no certificate can be read from " + certificateFile;
        return nullptr;
    }
    if (SSL_CTX_use_PrivateKey_file(context.get(), keyFile.c_str(), SSL_FILETYPE_PEM) != 1 ||
        SSL_CTX_check_private_key(context.get()) != 1) {
        *error = "no key that belongs to the certificate can be read from " + keyFile;
        return nullptr;
    }
    return context;
}

bool ensureSelfSignedCertificate(const std::string &file, std::string *error)
{
    if (::access(file.c_str(), F_OK) == 0)
        return true;
    const Key key(EVP_EC_gen("P-256"));
    const Certificate certificate = key ? signedCertificate(key.get()) : nullptr;
    const std::string unfinished = file + ".new";
    if (certificate && writePem(unfinished, key.get(), certificate.get()) &&
        std::rename(unfinished.c_str(), file.c_str()) == 0)
        return true;
    *error = "cannot make the certificate " + file + ": " + std::strerror(errno);
    return false;
}
