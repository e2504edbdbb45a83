#include "foundation/object/stringhash.h"

namespace
{
uint32 widened(char character)
{
    return static_cast<uint32>(static_cast<int32>(static_cast<signed char>(character)));
}

uint32 widened(char16 character)
{
    return character;
}

template <class Character>
unsigned hashText(const Character* text, unsigned size)
{
    uint32 hash = 0;
    if (text && size > 0)
        for (; *text; text++)
            hash = ((hash << 6) + widened(*text)) % size;
    return hash;
}
} // namespace

unsigned hashString8(const char* text, unsigned size)
{
    return hashText(text, size);
}

unsigned hashString16(const char16* text, unsigned size)
{
    return hashText(text, size);
}
