#pragma once

#include "foundation/text/string.h"

class FArchive;
class FStream;

/// A text that is stored in streams.
///
/// The form: the number of bytes that follow, 4 bytes in the stream's order; then the bytes of a narrow text with
/// its zero, or UTF-8, a zero and the marker EF BB BF of a wide one. An empty text is the number 0 alone.
/// One thread at a time.
class FString : public String
{
public:
    using String::String;
    using String::operator=;
    FString() = default;
    FString(const String& text) : String(text) {}
    FString(String&& text) noexcept : String(static_cast<String&&>(text)) {}

    bool store(FStream& stream) const;
    /// False where the stream ends early, or has more than 50000 bytes for the text, which are then skipped.
    bool load(FStream& stream);
    bool externalize(FArchive& archive) const;
    bool internalize(FArchive& archive);

    /// Write the stored form of a raw text; null is the empty one.
    static bool storeString8(FStream& stream, const char* text, int count = -1);
    static bool storeString16(FStream& stream, const char16* text, int count = -1);
};

/// A text that is a whole path, to tell it from a name. One thread at a time.
class FFullPathString : public FString
{
public:
    using FString::FString;
    using FString::operator=;
};
