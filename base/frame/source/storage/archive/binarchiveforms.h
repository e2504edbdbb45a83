#pragma once

#include "foundation/object/types.h"

// Numbers of the binary archive's form.

/// What stands for an object entry, before its body.
enum class BinaryKind : uint16
{
    kIntList = 2,
    kFloatList = 3,
    kStringList = 4,
    kSubList = 5,
    kTree = 6,
    kBlock = 7,
    kFirstObject = 20,
    kSeenObject = 21,
    kObjectList = 201
};

/// The bytes of a stored text, terminator and mark included, that are read; more are refused.
inline constexpr int kMaxBinaryText = 50000;

/// Stands behind the terminator of a text in UTF-8.
inline constexpr char kUtf8Mark[] = {'\xEF', '\xBB', '\xBF'};
inline constexpr int kUtf8MarkSize = sizeof(kUtf8Mark);
