#pragma once

#include <memory>
#include <string>

#include <openssl/evp.h>
#include <openssl/x509.h>

struct OpensslRelease
{
    void operator()(EVP_PKEY* key) const { EVP_PKEY_free(key); }
    void operator()(X509* certificate) const { X509_free(certificate); }
};

using KeyHolder = std::unique_ptr<EVP_PKEY, OpensslRelease>;
using CertificateHolder = std::unique_ptr<X509, OpensslRelease>;

/// A server's certificate and the key that belongs to it.
struct ServerIdentity
{
    CertificateHolder certificate;
    KeyHolder key;
};

/// A certificate authority that lives as long as this object; it trusts nobody and nobody trusts it until its
/// certificate is given to them.
///
/// *immutable*
class CertificateAuthority
{
public:
    explicit CertificateAuthority(const char* name = "Stand-in authority");

    /// The authority's certificate in PEM form.
    std::string pem() const;

    /// A certificate for 127.0.0.1 and "localhost".
    ServerIdentity issue() const;

    /// One that is valid but belongs to another host.
    ServerIdentity issueForOtherHost() const;

    /// One for this host that ended yesterday.
    ServerIdentity issueExpired() const;

private:
    ServerIdentity issue(const char* alternativeNames, long firstSecond, long lastSecond) const;

    KeyHolder key;
    CertificateHolder certificate;
};
