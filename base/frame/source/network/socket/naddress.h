#pragma once

#include "foundation/object/types.h"

class String;

/// An IPv4 address: four bytes in the order in which they are written and sent.
///
/// The operations of the sockets that take a `void*` for an address mean a block of these four bytes. A value.
struct NAddress
{
    static constexpr int kSize = 4;

    /// Reads "a.b.c.d" with numbers from 0 to 255 and nothing around them; false, and 0.0.0.0, for all else.
    [[nodiscard]] bool fromText(const char* text);
    /// "a.b.c.d".
    void toText(String& result) const;

    bool isLoopback() const { return bytes[0] == 127; }
    /// 0.0.0.0, which stands for every address of this host where it is bound to, and else for none.
    bool isAny() const { return *this == NAddress{}; }
    bool operator==(const NAddress& other) const = default;

    uint8 bytes[kSize] = {};
};

inline constexpr NAddress kLoopbackAddress{{127, 0, 0, 1}};
