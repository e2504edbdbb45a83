#pragma once

#include "foundation/text/fstring.h"

/// The proxy that the user's settings name for all requests of HTTP.
struct HttpProxy
{
    /// The settings as they are now, by default none. They are read without a lock and for each request of a run, so
    /// nobody may change settings while a handler opens.
    static HttpProxy fromDefaults();

    bool isUsed() const { return !host.isEmpty(); }

    /// Empty where requests go straight to their hosts.
    FString host;
    /// 0 where the setting is no port; nobody listens there.
    uint16 port = 0;
    /// Whether the credentials go out before the proxy asks for them.
    bool authenticate = false;
    FString user;
    FString password;
};
