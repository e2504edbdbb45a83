#include "foundation/text/conststringtable.h"

#include <cstdlib>
#include <cstring>

namespace
{
char16 widenBySign(char character)
{
    return static_cast<char16>(static_cast<signed char>(character));
}

char16* makeCopy(const char* literal)
{
    const std::size_t size = std::strlen(literal) + 1;
    auto* copy = static_cast<char16*>(std::malloc(size * sizeof(char16)));
    for (std::size_t i = 0; copy && i < size; ++i)
        copy[i] = widenBySign(literal[i]);
    return copy;
}
} // namespace

ConstStringTable& ConstStringTable::instance()
{
    static ConstStringTable table;
    return table;
}

ConstStringTable::~ConstStringTable()
{
    for (const auto& entry : stringMap)
        std::free(entry.second);
}

const char16* ConstStringTable::getString(const char* literal)
{
    if (!literal)
        return nullptr;
    const auto place = stringMap.lower_bound(literal);
    if (place != stringMap.end() && place->first == literal)
        return place->second;
    return stringMap.emplace_hint(place, literal, makeCopy(literal))->second;
}

char16 ConstStringTable::getString(char character)
{
    return charMap.emplace(character, widenBySign(character)).first->second;
}
