#include "foundation/text/conststring.h"
#include "foundation/text/string.h"

#include <cctype>
#include <cstdio>
#include <cstring>

namespace
{
/// A number in any form begins with one of these.
constexpr const char* kBeginnings = "+-.0123456789abcdefABCDEFinIN";

/// Whether a number stands at `text`. The standard function measures all that follows at each call, so it gets to
/// see a window only, which keeps a scan of a long text without numbers linear.
template <class T>
bool scanAt(const char* text, const char* format, T& value)
{
    constexpr std::size_t kWindow = 128;
    char window[kWindow + 1];
    while (std::isspace(static_cast<unsigned char>(*text)))
        ++text;
    if (!std::strchr(kBeginnings, *text))
        return false;
    const void* end = std::memchr(text, 0, kWindow);
    const auto length = end ? static_cast<std::size_t>(static_cast<const char*>(end) - text) : kWindow;
    std::memcpy(window, text, length);
    window[length] = 0;
    if (std::sscanf(window, format, &value) != 1)
        return false;
    return text[length] == 0 || std::sscanf(text, format, &value) == 1;
}

template <class T>
bool scanNarrow(const char* text, const char* format, T& value, bool scanToEnd)
{
    do
    {
        if (scanAt(text, format, value))
            return true;
        while (std::isspace(static_cast<unsigned char>(*text)))
            ++text;
    } while (scanToEnd && *text != 0 && *++text != 0);
    return false;
}

template <class T>
bool scanNumber(const ConstString& text, const char* format, T& value, unsigned offset, bool scanToEnd)
{
    if (offset >= text.length())
        return false;
    T number{};
    const ConstString rest(text, static_cast<int>(offset));
    const String narrow(rest.isWideString() ? rest : ConstString());
    if (!scanNarrow(rest.isWideString() ? narrow.text8() : rest.text8(), format, number, scanToEnd))
        return false;
    value = number;
    return true;
}
} // namespace

bool ConstString::scanInt32(int32& value, unsigned offset, bool scanToEnd) const
{
    int64 number = 0;
    if (!scanInt64(number, offset, scanToEnd))
        return false;
    value = static_cast<int32>(number);
    return true;
}

bool ConstString::scanInt64(int64& value, unsigned offset, bool scanToEnd) const
{
    long long number = 0;
    if (!scanNumber(*this, "%lld", number, offset, scanToEnd))
        return false;
    value = number;
    return true;
}

bool ConstString::scanUInt32(uint32& value, unsigned offset, bool scanToEnd) const
{
    uint64 number = 0;
    if (!scanUInt64(number, offset, scanToEnd))
        return false;
    value = static_cast<uint32>(number);
    return true;
}

bool ConstString::scanUInt64(uint64& value, unsigned offset, bool scanToEnd) const
{
    unsigned long long number = 0;
    if (!scanNumber(*this, "%llu", number, offset, scanToEnd))
        return false;
    value = number;
    return true;
}

bool ConstString::scanHex(uint8& value, unsigned offset, bool scanToEnd) const
{
    unsigned number = 0;
    if (!scanNumber(*this, "%x", number, offset, scanToEnd))
        return false;
    value = static_cast<uint8>(number);
    return true;
}

bool ConstString::scanFloat(double& value, unsigned offset, bool scanToEnd) const
{
    if (offset >= len)
        return false;
    String copy{ConstString(*this, static_cast<int>(offset))};
    if (!copy.toMultiByte())
        return false;
    const int comma = copy.findNext(0, ',');
    if (comma >= 0)
        copy.setChar8(static_cast<unsigned>(comma), '.');
    return scanNumber(copy, "%lf", value, 0, scanToEnd);
}
