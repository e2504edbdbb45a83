#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string>

/// Takes texts out of a fuzzer's bytes: each ends at a zero unit or with the bytes.
class FuzzText
{
public:
    FuzzText(const uint8_t* bytes, size_t count) : next(bytes), left(count) {}

    uint8_t takeByte()
    {
        if (left == 0)
            return 0;
        left--;
        return *next++;
    }

    bool isEmpty() const { return left == 0; }

    /// A 16-bit text of at most `limit` characters; bytes stand for characters, FF for two further bytes of one.
    std::u16string takeText(size_t limit)
    {
        std::u16string text;
        while (left > 0 && text.size() < limit)
        {
            unsigned character = takeByte();
            if (character == 0)
                break;
            if (character == 0xFF)
                character = takeByte() * 256u + takeByte();
            if (character != 0)
                text += static_cast<char16_t>(character);
        }
        return text;
    }

private:
    const uint8_t* next;
    size_t left;
};

/// Ends the process where a promise doesn't hold.
inline void require(bool holds)
{
    if (!holds)
        __builtin_trap();
}
