#include "foundation/object/fuid.h"

#include <cstdio>
#include <cstring>

namespace
{
constexpr const char* kPrintFormats[] = {
    "INLINE_UID (0x%08X, 0x%08X, 0x%08X, 0x%08X)",
    "DECLARE_UID (0x%08X, 0x%08X, 0x%08X, 0x%08X)",
    "FUID (0x%08X, 0x%08X, 0x%08X, 0x%08X)",
    "DECLARE_CLASS_IID (Interface, 0x%08X, 0x%08X, 0x%08X, 0x%08X)",
};
constexpr int kInterfaceStyle = 3;
constexpr size_t kPrintLength = 96;

constexpr size_t kStringLength = 32;
constexpr size_t kRegistryStringLength = 38;

// Where the groups of a registry text begin, and how many bytes each holds.
struct RegistryGroup
{
    int offset;
    int bytes;
};
constexpr RegistryGroup kRegistryGroups[] = {{1, 4}, {10, 2}, {15, 2}, {20, 2}, {25, 6}};

bool hasLength(const char* text, size_t length)
{
    return text && strlen(text) == length;
}

char readByte(const char* digits)
{
    const char pair[3] = {digits[0], digits[1], 0};
    unsigned value = 0;
    return sscanf(pair, "%2x", &value) == 1 ? static_cast<char>(value) : '\0';
}

void writeByte(char* out, char byte)
{
    snprintf(out, 3, "%02X", static_cast<unsigned>(static_cast<unsigned char>(byte)));
}
} // namespace

FUID::FUID(const char* bytes)
{
    if (bytes)
        memcpy(data, bytes, sizeof data);
}

FUID& FUID::operator=(const char* bytes)
{
    memcpy(data, bytes, sizeof data);
    return *this;
}

bool FUID::operator==(const FUID& other) const
{
    return memcmp(data, other.data, sizeof data) == 0;
}

bool FUID::operator<(const FUID& other) const
{
    return memcmp(data, other.data, sizeof data) < 0;
}

bool FUID::isValid() const
{
    static constexpr char kNone[16] = {};
    return memcmp(data, kNone, sizeof data) != 0;
}

void FUID::toTUID(char* bytes) const
{
    memcpy(bytes, data, sizeof data);
}

void FUID::from4Int(uint32 word1, uint32 word2, uint32 word3, uint32 word4)
{
    *this = FUID(word1, word2, word3, word4);
}

void FUID::to4Int(uint32& word1, uint32& word2, uint32& word3, uint32& word4) const
{
    word1 = getLong1();
    word2 = getLong2();
    word3 = getLong3();
    word4 = getLong4();
}

void FUID::toString(char* out) const
{
    if (!out)
        return;
    for (int i = 0; i < 16; i++)
        writeByte(out + 2 * i, data[i]);
}

bool FUID::fromString(const char* text)
{
    if (!hasLength(text, kStringLength))
        return false;
    for (int i = 0; i < 16; i++)
        data[i] = readByte(text + 2 * i);
    return true;
}

void FUID::toRegistryString(char* out) const
{
    memcpy(out, "{        -    -    -    -            }", kRegistryStringLength + 1);
    int next = 0;
    for (const RegistryGroup& group : kRegistryGroups)
    {
        char digits[13];
        for (int i = 0; i < group.bytes; i++)
            writeByte(digits + 2 * i, data[next++]);
        memcpy(out + group.offset, digits, static_cast<size_t>(2 * group.bytes));
    }
}

bool FUID::fromRegistryString(const char* text)
{
    if (!hasLength(text, kRegistryStringLength))
        return false;
    int next = 0;
    for (const RegistryGroup& group : kRegistryGroups)
        for (int i = 0; i < group.bytes; i++)
            data[next++] = readByte(text + group.offset + 2 * i);
    return true;
}

void FUID::print(char* out, int style) const
{
    const char* format = kPrintFormats[style >= 0 && style < kInterfaceStyle ? style : kInterfaceStyle];
    char text[kPrintLength];
    snprintf(text, sizeof text, format, getLong1(), getLong2(), getLong3(), getLong4());
    if (out)
        strcpy(out, text);
    else
        puts(text);
}

uint32 FUID::word(int index) const
{
    uint32 result = 0;
    for (int i = 0; i < 4; i++)
        result = (result << 8) | static_cast<unsigned char>(data[4 * index + i]);
    return result;
}
