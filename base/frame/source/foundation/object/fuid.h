#pragma once

#include "foundation/object/types.h"

/// Sixteen raw bytes of an identifier, as a constant of an interface holds them.
struct FUIDBytes
{
    char data[16];
};

/// The bytes of four words, most significant byte first on every platform.
constexpr FUIDBytes fuidBytes(uint32 word1, uint32 word2, uint32 word3, uint32 word4)
{
    const uint32 words[4] = {word1, word2, word3, word4};
    FUIDBytes bytes{};
    for (int i = 0; i < 16; i++)
        bytes.data[i] = static_cast<char>(static_cast<uint8>(words[i / 4] >> (24 - 8 * (i % 4))));
    return bytes;
}

/// A 16-byte identifier of a class or an interface, with its text forms.
///
/// | form                 | text of 00112233 44556677 8899AABB CCDDEEFF                                    |
/// |----------------------|--------------------------------------------------------------------------------|
/// | `toString`           | 00112233445566778899AABBCCDDEEFF                                               |
/// | `toRegistryString`   | {00112233-4455-6677-8899-AABBCCDDEEFF}                                         |
/// | `print`, style 0     | INLINE_UID (0x00112233, 0x44556677, 0x8899AABB, 0xCCDDEEFF)                    |
///
/// A value; one thread at a time.
class FUID
{
public:
    constexpr FUID() = default;
    constexpr explicit FUID(const FUIDBytes& bytes)
    {
        for (int i = 0; i < 16; i++)
            data[i] = bytes.data[i];
    }
    constexpr FUID(uint32 word1, uint32 word2, uint32 word3, uint32 word4)
        : FUID(fuidBytes(word1, word2, word3, word4))
    {
    }
    /// Copies 16 raw bytes; a null pointer gives the invalid identifier.
    explicit FUID(const char* bytes);
    constexpr FUID(const FUID& other) = default;
    constexpr virtual ~FUID() = default;

    FUID& operator=(const FUID& other) = default;
    /// Copies 16 raw bytes.
    FUID& operator=(const char* bytes);
    bool operator==(const FUID& other) const;
    bool operator<(const FUID& other) const;

    /// The raw bytes, as the operations on interface identifiers take them.
    constexpr operator const char*() const { return data; }

    /// Whether any byte is set.
    bool isValid() const;
    /// Takes a new random identifier (version 4) from the kernel; false where that fails.
    bool generate();
    void toTUID(char* bytes) const;

    void from4Int(uint32 word1, uint32 word2, uint32 word3, uint32 word4);
    void to4Int(uint32& word1, uint32& word2, uint32& word3, uint32& word4) const;
    uint32 getLong1() const { return word(0); }
    uint32 getLong2() const { return word(1); }
    uint32 getLong3() const { return word(2); }
    uint32 getLong4() const { return word(3); }

    /// Writes 32 upper-case digits and a terminator, so `out` holds 33 bytes; null does nothing.
    void toString(char* out) const;
    /// Reads 32 digits; any other length is refused.
    bool fromString(const char* text);
    /// Writes 38 characters and a terminator.
    void toRegistryString(char* out) const;
    /// Reads the digits at their fixed places of a text of 38 characters; braces and hyphens are not looked at.
    bool fromRegistryString(const char* text);
    /// Writes the four words in the given style to `out`, or as a line to standard output where `out` is null.
    void print(char* out, int style) const;

protected:
    char data[16] = {};

private:
    uint32 word(int index) const;
};
