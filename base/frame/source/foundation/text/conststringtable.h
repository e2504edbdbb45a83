#pragma once

#include "foundation/object/types.h"

#include <map>

/// 16-bit forms of 8-bit literals, made once and kept until the end of the process.
///
/// Texts are found by the address of the literal, never by its characters: two equal literals at different
/// addresses have an entry each, and what is given must live forever. A byte above 127 is widened by its sign
/// (0xFF gives 0xFFFF): the table is meant for ASCII. It works during static start-up. One thread at a time: other
/// threads ask only for literals that were entered already.
class ConstStringTable
{
public:
    static ConstStringTable& instance();

    ConstStringTable(const ConstStringTable&) = delete;
    ConstStringTable& operator=(const ConstStringTable&) = delete;

    /// The 16-bit copy of `literal`; the same pointer for the same pointer. Null gives null.
    const char16* getString(const char* literal);
    char16 getString(char character);

private:
    ConstStringTable() = default;
    ~ConstStringTable();

    std::map<const char*, char16*> stringMap;
    std::map<char, char16> charMap;
};

/// The empty text that stands in for every missing one.
inline const char16* const kEmptyString16 = ConstStringTable::instance().getString("");
