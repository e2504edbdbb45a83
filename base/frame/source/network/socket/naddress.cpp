#include "network/socket/naddress.h"

#include "foundation/text/string.h"

namespace
{
/// Reads a number of one to three digits from 0 to 255 and moves on behind it.
bool readByte(const char*& text, uint8& result)
{
    int value = 0;
    int digits = 0;
    for (; *text >= '0' && *text <= '9' && digits < 3; text++, digits++)
        value = value * 10 + (*text - '0');
    result = static_cast<uint8>(value);
    return digits > 0 && value <= 255;
}
} // namespace

bool NAddress::fromText(const char* text)
{
    *this = NAddress();
    NAddress read;
    for (int i = 0; text && i < kSize; i++)
    {
        if (i > 0 && *text++ != '.')
            return false;
        if (!readByte(text, read.bytes[i]))
            return false;
    }
    if (!text || *text != 0)
        return false;
    *this = read;
    return true;
}

void NAddress::toText(String& result) const
{
    result.printf("%u.%u.%u.%u", unsigned{bytes[0]}, unsigned{bytes[1]}, unsigned{bytes[2]},
                  unsigned{bytes[3]});
}
