#include "network/http/furlstream.h"

int32 FUrlStream::queryInterface(const char* interfaceID, void** object)
{
    if (isSameInterface(interfaceID, IUrlStream::iid))
        return offerInterface<IUrlStream>(this, object);
    return NStream::queryInterface(interfaceID, object);
}
