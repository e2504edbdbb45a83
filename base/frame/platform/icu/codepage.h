#pragma once

#include "foundation/object/types.h"

#include <array>
#include <vector>

struct UConverter;

/// The two tables of an encoding of one or two bytes whose bytes below 128 are ASCII.
///
/// ICU's converter is asked once for each character, when the encoding is first used; so nothing depends on its
/// habits in the middle of a text (it drops characters that show nothing, and the Japanese one swaps three control
/// bytes). Immutable, so thread-safe.
class CodePage
{
public:
    /// The code page behind a number of encodings.h; plain ASCII for any other than the four with a table.
    static const CodePage& get(unsigned encoding);

    /// `converterName` is ICU's; null gives ASCII, as does a converter that can't be had.
    CodePage(const char* converterName, bool hasDoubleBytes);

    /// Takes the character at `text`, of which `rest` bytes are left: gives the number of bytes; 0 where there is
    /// none.
    unsigned decode(const unsigned char* text, unsigned rest, char16& character) const;

    /// Writes 1 or 2 bytes and gives their number; 0 where the encoding doesn't have the character.
    unsigned encode(char16 character, char* bytes) const;

private:
    struct Entry
    {
        char16 character;
        uint16 bytes;
    };

    void addSingles(UConverter* converter);
    void addDoubles(UConverter* converter);
    void addEntry(UConverter* converter, char16 character);

    /// By the byte less 128; 0 for none.
    std::array<char16, 128> singles{};
    /// By the first byte less 128 and the second one; 0 for none, empty without double bytes.
    std::vector<char16> doubles;
    /// By character.
    std::vector<Entry> entries;
};
