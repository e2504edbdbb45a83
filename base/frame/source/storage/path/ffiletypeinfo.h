#pragma once

#include "foundation/object/types.h"

/// The plain record in which a file type crosses a component boundary. A value.
struct FFileTypeInfo
{
    static constexpr int kTextSize = 64;

    /// Texts longer than 63 bytes are cut; null counts as empty.
    void set(int newMacType, const char* newExtension, const char* newName);

    int macType = 0;
    char extension[kTextSize] = {};
    char name[kTextSize] = {};
};
