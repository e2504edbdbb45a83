#include "foundation/text/fbase64.h"

#include "foundation/text/fstring.h"

#include <cstdlib>
#include <cstring>

namespace
{
constexpr char kAlphabet[] = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";

/// The six bits that a character stands for; -1 for one outside the alphabet.
int valueOf(char character)
{
    const void* place = std::memchr(kAlphabet, character, sizeof(kAlphabet) - 1);
    return place ? static_cast<int>(static_cast<const char*>(place) - kAlphabet) : -1;
}

/// The text in 8 bits; the original stays as it is until the work has succeeded.
bool makeNarrow(const String& text, String& narrow)
{
    narrow = text;
    return narrow.toMultiByte();
}

bool hasGoodPadding(const ConstString& text)
{
    const int first = text.findNext(0, '=');
    if (first < 0)
        return true;
    const auto padding = text.length() - static_cast<unsigned>(first);
    return padding == 1 || (padding == 2 && text.testChar8(text.length() - 1, '='));
}

/// Writes the bytes and a terminator; `out` has room for three quarters of the text and one byte.
bool decodeTo(char* out, const char* in)
{
    unsigned bits = 0;
    unsigned bitCount = 0;
    for (; *in != 0 && *in != '='; ++in)
    {
        const int value = valueOf(*in);
        if (value < 0)
            return false;
        bits = bits << 6 | static_cast<unsigned>(value);
        bitCount += 6;
        if (bitCount < 8)
            continue;
        bitCount -= 8;
        *out = static_cast<char>(bits >> bitCount & 255);
        if (!ConstString::isCharAscii(*out++))
            return false;
    }
    *out = 0;
    return true;
}
} // namespace

bool FBase64::encode(FString& text)
{
    String source;
    if (text.isEmpty() || !makeNarrow(text, source) || !source.isAsciiString())
        return false;
    const unsigned length = source.length();
    FString result;
    if (result.assign('=', static_cast<int>((length + 2) / 3 * 4)).isEmpty())
        return false;

    const char* in = source.text8();
    unsigned out = 0;
    for (unsigned i = 0; i < length; i += 3)
    {
        unsigned bits = 0;
        for (unsigned k = 0; k < 3; ++k)
            bits = bits << 8 | (i + k < length ? static_cast<unsigned char>(in[i + k]) : 0u);
        const unsigned used = length - i < 3 ? length - i + 1 : 4;
        for (unsigned k = 0; k < used; ++k)
            result.setChar8(out + k, kAlphabet[bits >> (18 - 6 * k) & 63]);
        out += 4;
    }
    text.take(result);
    return true;
}

bool FBase64::decode(FString& text)
{
    String source;
    if (!makeNarrow(text, source) || source.length() % 4 != 0 || !hasGoodPadding(source))
        return false;

    auto* result = static_cast<char*>(std::malloc(source.length() + 1));
    const bool isGood = result && decodeTo(result, source.text8());
    if (isGood)
        text.take(result, false);
    else
        std::free(result);
    return isGood;
}
