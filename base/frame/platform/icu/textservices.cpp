#include "platform/icu/textservices.h"

#include "foundation/text/charwidth.h"
#include "foundation/text/utf8.h"
#include "platform/icu/codepage.h"

#include <algorithm>
#include <cstdlib>
#include <unicode/uchar.h>
#include <unicode/unorm2.h>
#include <unicode/ustring.h>

namespace
{
template <class Char>
Char* allocate(std::size_t length)
{
    return static_cast<Char*>(std::malloc((length + 1) * sizeof(Char)));
}

/// Terminates, and gives back the room that wasn't needed.
template <class Char>
Char* fit(Char* text, std::size_t capacity, unsigned length)
{
    text[length] = 0;
    if (length == capacity)
        return text;
    auto* fitting = static_cast<Char*>(std::realloc(text, (std::size_t{length} + 1) * sizeof(Char)));
    return fitting ? fitting : text;
}

unsigned decode(const CodePage& page, const char* text, unsigned length, char16* result, char16 loss)
{
    const auto* bytes = reinterpret_cast<const unsigned char*>(text);
    unsigned written = 0;
    for (unsigned i = 0; i < length; ++written)
    {
        const unsigned taken = page.decode(bytes + i, length - i, result[written]);
        if (taken == 0)
            result[written] = loss;
        i += std::max(taken, 1u);
    }
    return written;
}

unsigned encode(const CodePage& page, const char16* text, unsigned length, char* result, char loss)
{
    char* out = result;
    for (unsigned i = 0; i < length; ++i)
    {
        const unsigned written = page.encode(text[i], out);
        if (written == 0)
            *out = loss;
        out += std::max(written, 1u);
    }
    return static_cast<unsigned>(out - result);
}

/// With room for what `capacity` says; null, and the text is gone, where memory ran out.
char* enlarge(char* text, std::size_t capacity)
{
    auto* larger = static_cast<char*>(std::realloc(text, capacity + 1));
    if (!larger)
        std::free(text);
    return larger;
}

/// A text that begins with many characters below 128 gets no more room than these need until another one is met.
char* toUtf8(const char16* text, unsigned length, char loss, unsigned& resultLength)
{
    constexpr unsigned kBeginning = 256;
    const bool seemsAscii = isAsciiText(text, std::min(length, kBeginning));
    std::size_t capacity = seemsAscii ? length : std::size_t{3} * length;
    char* result = allocate<char>(capacity);
    const unsigned start = result && seemsAscii ? encodeAsciiStart(text, length, result) : 0;
    const unsigned rest = length - start;
    if (result && seemsAscii && rest > 0)
    {
        capacity = start + std::size_t{3} * rest;
        result = enlarge(result, capacity);
    }
    if (!result)
        return nullptr;
    resultLength = start + encodeUtf8(text + start, rest, result + start, loss);
    return fit(result, capacity, resultLength);
}

/// What `map` makes of one character, if that is one character.
template <class Map>
char16 mapCharacter(char16 character, Map map)
{
    char16 mapped[8];
    UErrorCode status = U_ZERO_ERROR;
    const int length = map(mapped, 8, &character, 1, "", &status);
    return U_SUCCESS(status) && length == 1 ? mapped[0] : character;
}

const UNormalizer2* findNormalizer(UnicodeNormalization form)
{
    UErrorCode status = U_ZERO_ERROR;
    switch (form)
    {
    case kUnicodeNormC:
        return unorm2_getNFCInstance(&status);
    case kUnicodeNormD:
        return unorm2_getNFDInstance(&status);
    case kUnicodeNormKC:
        return unorm2_getNFKCInstance(&status);
    default:
        return unorm2_getNFKDInstance(&status);
    }
}
} // namespace

ITextServices& ITextServices::instance()
{
    static IcuTextServices services;
    return services;
}

// Encodings

char16* IcuTextServices::toWide(const char* text, unsigned length, unsigned encoding, char16 loss,
                                unsigned& resultLength)
{
    auto* result = allocate<char16>(length);
    if (!result)
        return nullptr;
    resultLength = encoding == kEncodingUtf8 ? decodeUtf8(text, length, result, loss)
                                             : decode(CodePage::get(encoding), text, length, result, loss);
    return fit(result, length, resultLength);
}

char* IcuTextServices::toMultiByte(const char16* text, unsigned length, unsigned encoding, char loss,
                                   unsigned& resultLength)
{
    if (encoding == kEncodingUtf8)
        return toUtf8(text, length, loss, resultLength);
    const std::size_t capacity = isAsciiText(text, length) ? length : std::size_t{2} * length;
    auto* result = allocate<char>(capacity);
    if (!result)
        return nullptr;
    resultLength = encode(CodePage::get(encoding), text, length, result, loss);
    return fit(result, capacity, resultLength);
}

// Unicode

char16 IcuTextServices::toUpper(char16 character)
{
    return mapCharacter(character, u_strToUpper);
}

char16 IcuTextServices::toLower(char16 character)
{
    return mapCharacter(character, u_strToLower);
}

bool IcuTextServices::isAlpha(char16 character)
{
    return u_isalpha(character);
}

bool IcuTextServices::isUpper(char16 character)
{
    return u_isupper(character);
}

bool IcuTextServices::isLower(char16 character)
{
    return u_islower(character);
}

int IcuTextServices::compareIgnoringCase(const char16* a, unsigned lengthA, const char16* b, unsigned lengthB)
{
    UErrorCode status = U_ZERO_ERROR;
    const int difference = u_strCaseCompare(a, static_cast<int>(lengthA), b, static_cast<int>(lengthB),
                                            U_FOLD_CASE_DEFAULT, &status);
    return std::clamp(difference, -1, 1);
}

char16* IcuTextServices::normalize(const char16* text, unsigned length, UnicodeNormalization form,
                                   unsigned& resultLength)
{
    const UNormalizer2* normalizer = findNormalizer(form);
    if (!normalizer)
        return nullptr;
    UErrorCode status = U_ZERO_ERROR;
    const int source = static_cast<int>(length);
    const int needed = unorm2_normalize(normalizer, text, source, nullptr, 0, &status);
    if (U_FAILURE(status) && status != U_BUFFER_OVERFLOW_ERROR)
        return nullptr;
    status = U_ZERO_ERROR;
    auto* result = allocate<char16>(static_cast<std::size_t>(needed));
    if (!result)
        return nullptr;
    unorm2_normalize(normalizer, text, source, result, needed + 1, &status);
    resultLength = static_cast<unsigned>(needed);
    return result;
}

bool IcuTextServices::isNormalized(const char16* text, unsigned length, UnicodeNormalization form)
{
    const UNormalizer2* normalizer = findNormalizer(form);
    UErrorCode status = U_ZERO_ERROR;
    return normalizer && unorm2_isNormalized(normalizer, text, static_cast<int>(length), &status);
}
