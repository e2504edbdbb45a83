#include "tools/service/certificates.h"

#include <cstdlib>

#include <openssl/ec.h>
#include <openssl/pem.h>
#include <openssl/rand.h>
#include <openssl/x509v3.h>

namespace
{

constexpr long kDay = 24 * 60 * 60;
constexpr const char* kThisHost = "DNS:localhost,IP:127.0.0.1";

KeyHolder makeKey()
{
    return KeyHolder(EVP_EC_gen("P-256"));
}

void setRandomSerial(X509* certificate)
{
    unsigned char bytes[8];
    RAND_bytes(bytes, sizeof bytes);
    std::uint64_t serial = 0;
    for (const unsigned char byte : bytes)
        serial = (serial << 8) | byte;
    ASN1_INTEGER_set_uint64(X509_get_serialNumber(certificate), serial >> 1);
}

void setName(X509_NAME* name, const char* text)
{
    X509_NAME_add_entry_by_txt(name, "CN", MBSTRING_UTF8, reinterpret_cast<const unsigned char*>(text), -1,
                               -1, 0);
}

void addExtension(X509* certificate, X509* issuer, int identifier, const char* value)
{
    X509V3_CTX context;
    X509V3_set_ctx(&context, issuer, certificate, nullptr, nullptr, 0);
    X509_EXTENSION* extension = X509V3_EXT_conf_nid(nullptr, &context, identifier, value);
    X509_add_ext(certificate, extension, -1);
    X509_EXTENSION_free(extension);
}

/// A certificate with everything but its extensions and signature. Times are seconds from now.
CertificateHolder makeBare(EVP_PKEY* key, const char* name, long firstSecond, long lastSecond)
{
    CertificateHolder result(X509_new());
    X509_set_version(result.get(), X509_VERSION_3);
    setRandomSerial(result.get());
    X509_gmtime_adj(X509_getm_notBefore(result.get()), firstSecond);
    X509_gmtime_adj(X509_getm_notAfter(result.get()), lastSecond);
    X509_set_pubkey(result.get(), key);
    setName(X509_get_subject_name(result.get()), name);
    return result;
}

} // namespace

CertificateAuthority::CertificateAuthority(const char* name) : key(makeKey())
{
    certificate = makeBare(key.get(), name, -kDay, 2 * kDay);
    X509* own = certificate.get();
    X509_set_issuer_name(own, X509_get_subject_name(own));
    addExtension(own, own, NID_basic_constraints, "critical,CA:TRUE");
    addExtension(own, own, NID_key_usage, "critical,keyCertSign,cRLSign");
    addExtension(own, own, NID_subject_key_identifier, "hash");
    if (!X509_sign(own, key.get(), EVP_sha256()))
        std::abort(); // a machine without working OpenSSL can test nothing
}

std::string CertificateAuthority::pem() const
{
    BIO* memory = BIO_new(BIO_s_mem());
    PEM_write_bio_X509(memory, certificate.get());
    char* bytes = nullptr;
    const long size = BIO_get_mem_data(memory, &bytes);
    std::string result(bytes, static_cast<std::size_t>(size));
    BIO_free(memory);
    return result;
}

ServerIdentity CertificateAuthority::issue() const
{
    return issue(kThisHost, -kDay, kDay);
}

ServerIdentity CertificateAuthority::issueForOtherHost() const
{
    return issue("DNS:elsewhere.example", -kDay, kDay);
}

ServerIdentity CertificateAuthority::issueExpired() const
{
    return issue(kThisHost, -2 * kDay, -kDay);
}

ServerIdentity CertificateAuthority::issue(const char* alternativeNames, long firstSecond,
                                           long lastSecond) const
{
    ServerIdentity result;
    result.key = makeKey();
    result.certificate = makeBare(result.key.get(), "Stand-in service", firstSecond, lastSecond);
    X509* server = result.certificate.get();
    X509_set_issuer_name(server, X509_get_subject_name(certificate.get()));
    addExtension(server, certificate.get(), NID_basic_constraints, "critical,CA:FALSE");
    addExtension(server, certificate.get(), NID_ext_key_usage, "serverAuth");
    addExtension(server, certificate.get(), NID_subject_alt_name, alternativeNames);
    if (!X509_sign(server, key.get(), EVP_sha256()))
        std::abort();
    return result;
}
