#pragma once

#include "foundation/object/iptr.h"
#include "network/socket/nstream.h"
#include "storage/url/furlhandler.h"

/// The protocol of URLs that messages are sent to.
inline constexpr char kNetMessageProtocol[] = "vlmr-message";

/// Connects to a program that takes messages. One thread at a time, but for `cancel`.
class NUrlMsgHandler : public FUrlHandler
{
    DECLARE_TYPE(NUrlMsgHandler, FUrlHandler)

    explicit NUrlMsgHandler(FUrl& handledUrl);
    ~NUrlMsgHandler() override;
    CmObject* newCopy() const override { return nullptr; }

    bool open() override;
    bool close() override;
    void cancel() override;

private:
    IPtr<NStream> connection;
};

FUrlHandler* createUrlMsgHandler(FUrl& url);
/// Registers the handler, once. *Main thread*.
void initNUrlMsgHandler();
