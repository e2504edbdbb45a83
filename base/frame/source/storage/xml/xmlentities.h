#pragma once

#include "foundation/object/types.h"

/// One named entity: the character, its name, and whether the character is written by name. Immutable.
struct FXmlEntity8
{
    uint8 character;
    const char* name;
    bool encode;
};

/// The same with 16-bit texts. Immutable.
struct FXmlEntity16
{
    char16 character;
    const char16* name;
    bool encode;
};

inline constexpr int kEntityCount8 = 130;
inline constexpr int kEntityCountUtf8 = 5;

/// The same names in the same order; a character of 0 means that the name is known and stays undecoded.
extern const FXmlEntity8 gEntityTable8Mac[kEntityCount8];
extern const FXmlEntity8 gEntityTable8Win[kEntityCount8];
/// The five that text in UTF-8 and in 16 bits needs. The latter is filled during static start-up.
extern const FXmlEntity8 gUTF8EntityTable8[kEntityCountUtf8];
extern FXmlEntity16 gEntityTable16[kEntityCountUtf8];

/// The byte that an entity reference stands for, given what is between '&' and ';': "lt", "#65", "#x41". Only the
/// low 8 bits of a number count. 0 where the name is unknown or the number is none.
uint8 decodeXmlEntity(const char* name, int length, bool windowsTable);
