#include "network/http/httpproxy.h"

#include "services/defaults/fdefaultpool.h"

namespace
{
constexpr const char* kGroup = "HttpHandlerDefaults";
constexpr int32 kLargestPort = 65535;

int32 numberOf(const char* key)
{
    int32 number = 0;
    gDefaultPool->getLong(kGroup, key, number);
    return number;
}

FString textOf(const char* key)
{
    FString text;
    gDefaultPool->getTString(kGroup, key, text);
    return text;
}
} // namespace

HttpProxy HttpProxy::fromDefaults()
{
    HttpProxy proxy;
    if (!gDefaultPool || numberOf("Use Proxy") == 0)
        return proxy;
    proxy.host = textOf("Proxy Host");
    const int32 number = numberOf("Proxy Port");
    proxy.port = number > 0 && number <= kLargestPort ? static_cast<uint16>(number) : uint16{0};
    proxy.authenticate = numberOf("Use Proxy Authentication") != 0;
    proxy.user = textOf("Proxy User");
    proxy.password = textOf("Proxy Passwd");
    return proxy;
}
