#include "storage/archive/archivenumbers.h"

#include <charconv>
#include <cstdlib>
#include <cstring>

bool parseArchiveInteger(const char* text, long long& value)
{
    if (!text)
        return false;
    const char* textEnd = text + strlen(text);
    const auto result = std::from_chars(text, textEnd, value);
    if (result.ec == std::errc() && result.ptr == textEnd)
        return true;
    // Blanks, signs and numbers out of range, and what stands behind a number.
    char* end = nullptr;
    value = strtoll(text, &end, 10);
    return end != text;
}

bool parseArchiveFloat(const char* text, double& value)
{
    if (!text)
        return false;
    const char* textEnd = text + strlen(text);
    const auto result = std::from_chars(text, textEnd, value);
    if (result.ec == std::errc() && result.ptr == textEnd)
        return true;
    // Signs, hexadecimal digits, numbers out of range and what else the standard library reads.
    char* end = nullptr;
    value = strtod(text, &end);
    return end != text;
}

bool parseArchiveID(const char* text, uint64& id)
{
    if (!text)
        return false;
    const char* end = text + strlen(text);
    const auto result = std::from_chars(text, end, id);
    return result.ec == std::errc() && result.ptr == end;
}
