#pragma once

#include "foundation/text/fstring.h"

#include <vector>

/// What is to be told of a file that may be made by an enemy. Each entry of a small table can have a path of half a
/// million characters, so only the first million of them are kept; what comes later is counted. One thread at a time.
class BoundedTexts
{
public:
    static constexpr uint64 kMaxCharacters = 1000000;

    void add(const FString& text)
    {
        count++;
        characters += text.length();
        if (characters <= kMaxCharacters)
            texts.push_back(text);
    }
    /// Whether no other text will be kept. Whoever finds that, saves making it, and calls `omit`.
    bool isFull() const { return characters >= kMaxCharacters; }
    void omit() { count++; }
    void clear() { *this = BoundedTexts(); }

    /// Of all that were added.
    int64 getCount() const { return count; }
    /// Those that were kept, the first ones.
    const std::vector<FString>& getTexts() const { return texts; }
    int64 getOmitted() const { return count - static_cast<int64>(texts.size()); }

private:
    std::vector<FString> texts;
    uint64 characters = 0;
    int64 count = 0;
};
