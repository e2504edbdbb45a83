#include "services/localisation/transconststring.h"

#include "foundation/object/stringhash.h"

#include <cstring>
#include <string_view>

bool TransConstString::operator==(const TransConstString& other) const
{
    return text == other.text || std::u16string_view(text) == std::u16string_view(other.text);
}

bool TransLanguageCode::operator==(const TransLanguageCode& other) const
{
    return strncmp(code, other.code, 2) == 0;
}

unsigned hashConstString(const TransConstString& string, unsigned size)
{
    // By a power of two the hash of texts would see their last two characters only.
    constexpr unsigned kPrime = 1000003;
    return hashString16(string.text, kPrime) % size;
}
