#include "storage/xml/xmlnumber.h"

#include "containers/value/buffer.h"

#include <charconv>

namespace
{
/// More than the digits of any 64-bit number, and of fifty significant ones with sign, zeros, point and exponent.
constexpr int kNumberSize = 128;
constexpr int kSignificantDigits = 50;

template <class... Arguments>
void append(Buffer& out, Arguments... arguments)
{
    char text[kNumberSize];
    const std::to_chars_result result = std::to_chars(text, text + sizeof(text), arguments...);
    out.put(text, static_cast<uint32>(result.ptr - text));
}
} // namespace

namespace Xml
{
void appendInt(Buffer& out, int64 value)
{
    append(out, value);
}

void appendUInt(Buffer& out, uint64 value)
{
    append(out, value);
}

void appendFloat(Buffer& out, double value)
{
    append(out, value, std::chars_format::general, kSignificantDigits);
}
} // namespace Xml
