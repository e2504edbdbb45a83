#pragma once

#include "foundation/object/cmobject.h"
#include "foundation/text/fstring.h"

class FUrl;

/// A program on the network that takes messages, known by host and port. Two with the same host and port are equal.
/// Immutable.
class NReceiver : public CmObject
{
    DECLARE_COPYABLE(NReceiver, CmObject)

    NReceiver(const char* receiverHost, uint16 receiverPort) : host(receiverHost), port(receiverPort) {}

    const FString& getHost() const { return host; }
    uint16 getPort() const { return port; }
    /// The URL by which messages are sent to it.
    void getUrl(FUrl& url) const;

    bool isEqual(const CmObject* other) const override;
    unsigned hash(unsigned size) const override;

private:
    FString host;
    uint16 port;
};
