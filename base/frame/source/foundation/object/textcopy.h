#pragma once

#include <cstdlib>
#include <cstring>
#include <string>

/// A copy of a terminated text, which the caller frees by `free`; null for null, and where memory ran out.
template <class Character>
const Character* copyOfText(const Character* text)
{
    if (!text)
        return nullptr;
    const size_t bytes = (std::char_traits<Character>::length(text) + 1) * sizeof(Character);
    void* copy = malloc(bytes);
    return copy ? static_cast<const Character*>(memcpy(copy, text, bytes)) : nullptr;
}
