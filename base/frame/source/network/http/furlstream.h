#pragma once

#include "network/socket/nstream.h"
#include "storage/url/iurl.h"

/// The connection by which the handler of a URL reads. One thread at a time, but for `cancel`.
class FUrlStream : public NStream, public IUrlStream
{
    DECLARE_TYPE(FUrlStream, NStream)
    FORWARD_FUNKNOWN(NStream)

    FUrlStream() = default;
    ~FUrlStream() override = default;
    int32 queryInterface(const char* interfaceID, void** object) override;

    /// The URL is borrowed; its handler takes it away when it lets go of the stream.
    void setUrl(FUrl* streamUrl) { url = streamUrl; }
    FUrl* getUrl() override { return url; }

private:
    FUrl* url = nullptr;
};
