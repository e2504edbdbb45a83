#pragma once

#include "foundation/object/types.h"

#include <string_view>

namespace Xml
{
/// The text of a node, or the two of an attribute, as the parser gave them: 8 bits a character, in one block of the
/// pool.
///
/// Most nodes of a document are never asked for their texts, at most they are written out again. So these stay as they
/// came, and whoever asks gets them widened then. One thread at a time.
class SourceText
{
public:
    SourceText() = default;
    SourceText(const SourceText& other);
    SourceText& operator=(const SourceText&) = delete;
    ~SourceText() { drop(); }

    /// Copies the texts; false, with nothing held, where there is no memory.
    bool set(std::string_view first, std::string_view second = "");
    void drop();

    bool isEmpty() const { return !block; }
    /// Terminated; "" where nothing is held.
    std::string_view first() const
    {
        return block ? std::string_view(block->text(), block->firstLength) : std::string_view("");
    }
    std::string_view second() const
    {
        return block ? std::string_view(block->text() + block->firstLength + 1, block->secondLength)
                     : std::string_view("");
    }
    /// Whether no character is above 127.
    bool isAscii() const { return !block || block->isAscii; }
    /// Whether no character has to be written by name.
    bool isPlain() const { return !block || block->isPlain; }

private:
    /// The texts follow, each with its terminator, and then zeros up to a multiple of eight bytes.
    struct Block
    {
        const char* text() const { return reinterpret_cast<const char*>(this + 1); }
        char* text() { return reinterpret_cast<char*>(this + 1); }

        uint32 firstLength;
        uint32 secondLength : 30;
        uint32 isAscii : 1;
        uint32 isPlain : 1;
    };

    static size_t sizeFor(size_t firstLength, size_t secondLength);

    Block* block = nullptr;
};
} // namespace Xml
