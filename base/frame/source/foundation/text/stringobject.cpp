#include "foundation/text/stringobject.h"

int32 StringObject::queryInterface(const char* interfaceID, void** object)
{
    if (isSameInterface(interfaceID, IString::iid))
        return offerInterface<IString>(this, object);
    if (isSameInterface(interfaceID, IStringResult::iid))
        return offerInterface<IStringResult>(this, object);
    return FObject::queryInterface(interfaceID, object);
}
