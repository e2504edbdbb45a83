#include "foundation/text/fstring.h"
#include "network/http/tlssession.h"
#include "storage/path/filenametext.h"

#include <openssl/err.h>
#include <openssl/ssl.h>
#include <openssl/x509v3.h>

#include <string>

namespace
{
struct Release
{
    void operator()(SSL_CTX* context) const { SSL_CTX_free(context); }
    void operator()(SSL* connection) const { SSL_free(connection); }
};
using ContextHolder = std::unique_ptr<SSL_CTX, Release>;
using ConnectionHolder = std::unique_ptr<SSL, Release>;

// What the library calls for encrypted bytes; the transport waits, so nothing is ever to be tried again.

TlsTransport& transportOf(BIO* bio)
{
    return *static_cast<TlsTransport*>(BIO_get_data(bio));
}

int receive(BIO* bio, char* data, int size)
{
    return transportOf(bio).receive(data, size);
}

int send(BIO* bio, const char* data, int size)
{
    return transportOf(bio).send(data, size);
}

long control(BIO*, int command, long, void*)
{
    return command == BIO_CTRL_FLUSH ? 1 : 0;
}

BIO_METHOD* makeMethod()
{
    BIO_METHOD* method = BIO_meth_new(BIO_get_new_index() | BIO_TYPE_SOURCE_SINK, "stream");
    if (!method)
        return nullptr;
    BIO_meth_set_read(method, receive);
    BIO_meth_set_write(method, send);
    BIO_meth_set_ctrl(method, control);
    return method;
}

bool attach(SSL* connection, TlsTransport& transport)
{
    // Lives as long as the process.
    static BIO_METHOD* const method = makeMethod();
    BIO* bio = method ? BIO_new(method) : nullptr;
    if (!bio)
        return false;
    BIO_set_data(bio, &transport);
    BIO_set_init(bio, 1);
    SSL_set_bio(connection, bio, bio);
    return true;
}

ContextHolder makeContext(const std::string& certificateFile)
{
    ContextHolder context(SSL_CTX_new(TLS_client_method()));
    if (!context || SSL_CTX_set_min_proto_version(context.get(), TLS1_2_VERSION) != 1 ||
        SSL_CTX_load_verify_file(context.get(), certificateFile.c_str()) != 1)
        return nullptr;
    SSL_CTX_set_verify(context.get(), SSL_VERIFY_PEER, nullptr);
    SSL_CTX_set_options(context.get(), SSL_OP_NO_RENEGOTIATION);
    return context;
}

// A host that is an address is looked for among the addresses of the certificate, and isn't announced by name.
bool expectHost(SSL* connection, const std::string& host)
{
    X509_VERIFY_PARAM* expected = SSL_get0_param(connection);
    if (X509_VERIFY_PARAM_set1_ip_asc(expected, host.c_str()) == 1)
        return true;
    X509_VERIFY_PARAM_set_hostflags(expected, X509_CHECK_FLAG_NO_PARTIAL_WILDCARDS);
    return X509_VERIFY_PARAM_set1_host(expected, host.c_str(), host.size()) == 1 &&
           SSL_set_tlsext_host_name(connection, host.c_str()) == 1;
}

class OpensslSession final : public TlsSession
{
public:
    explicit OpensslSession(ConnectionHolder&& startedConnection) : connection(std::move(startedConnection))
    {
    }

    int read(char* data, int size) override
    {
        ERR_clear_error();
        const int count = SSL_read(connection.get(), data, size);
        if (count > 0)
            return count;
        return settle(SSL_get_error(connection.get(), count) == SSL_ERROR_ZERO_RETURN ? 0 : -1);
    }

    int write(const char* data, int size) override
    {
        ERR_clear_error();
        const int count = SSL_write(connection.get(), data, size);
        return count > 0 ? count : settle(-1);
    }

    // After a failure the protocol forbids any further word.
    void end() override
    {
        if (!failed)
            SSL_shutdown(connection.get());
        ERR_clear_error();
    }

private:
    int settle(int result)
    {
        failed = failed || result < 0;
        return result;
    }

    ConnectionHolder connection;
    bool failed = false;
};
} // namespace

bool TlsSession::isAvailable()
{
    return OPENSSL_init_ssl(0, nullptr) == 1 && OSSL_LIB_CTX_get0_global_default();
}

std::unique_ptr<TlsSession> TlsSession::start(TlsTransport& transport, const FString& host,
                                              const FString& certificateFile)
{
    ERR_clear_error();
    const std::string hostName = FileNameText::toBytes(host);
    const ContextHolder context = makeContext(FileNameText::toBytes(certificateFile));
    ConnectionHolder connection(context ? SSL_new(context.get()) : nullptr);
    const bool isTrusted = connection && !hostName.empty() && expectHost(connection.get(), hostName) &&
                           attach(connection.get(), transport) && SSL_connect(connection.get()) == 1;
    ERR_clear_error();
    if (!isTrusted)
        return nullptr;
    return std::make_unique<OpensslSession>(std::move(connection));
}
