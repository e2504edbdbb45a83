#include "services/localisation/uresource.h"

UResource::Lookup UResource::lookup = nullptr;

UResource::UResource(int type, const char* name)
{
    if (lookup)
        data = lookup(type, name, size);
    if (!data)
        size = 0;
}

void UResource::setLookup(Lookup function)
{
    lookup = function;
}
