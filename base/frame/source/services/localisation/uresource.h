#pragma once

#include "foundation/object/types.h"

/// A block of data that is built into the program, known by its kind and name. Immutable.
class UResource
{
public:
    enum Type
    {
        kText = 3
    };

    /// Finds the block; where there is none, the resource is empty.
    UResource(int type, const char* name);

    const char* getData() const { return data; }
    int64 getSize() const { return size; }

    /// Gives the address and the size of a block, or null.
    using Lookup = const char* (*)(int type, const char* name, int64& size);
    /// How blocks are found; null means that none is built in.
    static void setLookup(Lookup function);

private:
    const char* data = nullptr;
    int64 size = 0;

    static Lookup lookup;
};
