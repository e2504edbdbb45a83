#pragma once

#include "tools/service/behaviour.h"
#include "tools/service/receivedrequest.h"

#include <functional>
#include <memory>

#include <httplib.h>
#include <openssl/evp.h>

/// Reads one multipart form as it comes in: keeps its texts, counts and digests its files, and misbehaves in the
/// middle of it where that is planned.
///
/// *one thread at a time*
class BodyReader
{
public:
    /// `onStall` returns once the request may go on; `onDisconnect` cuts the connection, by a reset where it is true.
    BodyReader(const Behaviour& planned, std::function<void()> onStall,
               std::function<void(bool)> onDisconnect);

    /// True if the form came whole and the connection still stands.
    bool read(const httplib::ContentReader& reader);

    /// The fields so far, in their order.
    std::vector<ReceivedField> takeFields();

private:
    struct DigestRelease
    {
        void operator()(EVP_MD_CTX* context) const { EVP_MD_CTX_free(context); }
    };

    bool beginField(const httplib::MultipartFormData& part);
    bool addBytes(const char* bytes, std::size_t size);
    void finishField();
    bool misbehave();

    Behaviour behaviour;
    std::function<void()> stall;
    std::function<void(bool)> disconnect;
    std::vector<ReceivedField> fields;
    std::unique_ptr<EVP_MD_CTX, DigestRelease> digest{EVP_MD_CTX_new()};
    std::int64_t total = 0;
    bool misbehaved = false;
};
