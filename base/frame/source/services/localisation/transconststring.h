#pragma once

#include "foundation/object/types.h"

/// A borrowed 16-bit text as a key: equal by its characters, never null. *Immutable.*
struct TransConstString
{
    const char16* text = u"";

    bool operator==(const TransConstString& other) const;
};

/// A borrowed language code as a key: the first two letters count. *Immutable.*
struct TransLanguageCode
{
    const char* code = "";

    bool operator==(const TransLanguageCode& other) const;
};

/// A number below `size`.
unsigned hashConstString(const TransConstString& string, unsigned size);
