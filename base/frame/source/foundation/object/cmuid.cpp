#include "foundation/object/cmuid.h"

DEFINE_CLASS(CmUID, CmObject)

namespace
{
constexpr int kByteCount = 16;
constexpr int kBitCount = 8 * kByteCount;
constexpr int kGroupBits = 5;
constexpr int kShortLength = 26;
constexpr int kLetterOffset = 55;

int digitValue(char character)
{
    if (character >= '0' && character <= '9')
        return character - '0';
    if (character >= 'A' && character <= 'F')
        return character - 'A' + 10;
    if (character >= 'a' && character <= 'f')
        return character - 'a' + 10;
    return 0;
}

char shortCharacter(int group)
{
    return static_cast<char>(group < 10 ? '0' + group : kLetterOffset + group);
}

int shortValue(char character)
{
    return character - (character < 'A' ? '0' : kLetterOffset);
}
} // namespace

void CmUID::toLongString(char* out) const
{
    FUID::toString(out);
}

bool CmUID::fromLongString(const char* text)
{
    for (int i = 0; text && i < kByteCount && text[2 * i]; i++)
    {
        const int high = digitValue(text[2 * i]);
        const int low = digitValue(text[2 * i + 1]);
        data[i] = static_cast<char>(16 * high + low);
        if (!text[2 * i + 1])
            break;
    }
    return true;
}

int CmUID::toShortString(char* out) const
{
    for (int group = 0; group < kShortLength; group++)
    {
        int value = 0;
        for (int i = 0; i < kGroupBits; i++)
        {
            const int bit = kGroupBits * group + i;
            if (bit < kBitCount && ((static_cast<unsigned char>(data[bit / 8]) >> (bit % 8)) & 1))
                value |= 1 << i;
        }
        out[group] = shortCharacter(value);
    }
    out[kShortLength] = 0;
    return kShortLength;
}

bool CmUID::fromShortString(const char* text)
{
    unsigned char bytes[kByteCount] = {};
    for (int bit = 0; bit < kBitCount && text[bit / kGroupBits]; bit++)
        if ((shortValue(text[bit / kGroupBits]) >> (bit % kGroupBits)) & 1)
            bytes[bit / 8] = static_cast<unsigned char>(bytes[bit / 8] | (1 << (bit % 8)));
    for (int i = 0; i < kByteCount; i++)
        data[i] = static_cast<char>(bytes[i]);
    return true;
}

bool CmUID::isEqual(const CmObject* other) const
{
    const CmUID* uid = FCast(CmUID, other);
    return uid && *this == *uid;
}

int CmUID::compare(const CmObject* other) const
{
    const CmUID* uid = FCast(CmUID, other);
    if (!uid)
        return CmObject::compare(other);
    if (*this == *uid)
        return 0;
    return static_cast<const FUID&>(*this) < *uid ? -1 : 1;
}

unsigned CmUID::hash(unsigned size) const
{
    return (getLong1() + getLong2() + getLong3() + getLong4()) % size;
}
