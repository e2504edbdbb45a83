#pragma once

#include "foundation/object/types.h"

#include <string_view>

namespace Xml
{
/// What a node is in a document, as the parser gave it: the text of character data, or the texts of a start tag, in
/// 8 bits a character and one block of the pool.
///
/// Most nodes of a document are never asked for their texts and attributes, at most they are written out again. So
/// these stay as they came until someone asks. One thread at a time.
class SourceText
{
public:
    SourceText() = default;
    SourceText(const SourceText& other);
    SourceText& operator=(const SourceText&) = delete;
    ~SourceText() { drop(); }

    // False, with nothing held, where there is no memory.
    bool set(std::string_view text);
    /// `attributes` alternates names and values up to a null.
    bool set(const char* tag, const char** attributes);
    void drop();

    bool isEmpty() const { return !block; }
    /// The texts one behind the other, each with its terminator. There must be some.
    const char* begin() const { return block->text(); }
    const char* end() const { return begin() + size(); }
    uint32 size() const { return block->size; }
    /// Character data.
    std::string_view text() const { return {begin(), size() - 1}; }
    /// How many attributes the start tag has.
    uint32 countAttributes() const { return block->attributes; }
    /// Whether no character is above 127.
    bool isAscii() const { return block->isAscii; }
    /// Whether no character has to be written by name.
    bool isPlain() const { return block->isPlain; }
    /// The same for one of the texts. At times false where only a character behind it has to.
    bool isPlain(std::string_view text) const;

private:
    /// The texts follow, and then zeros up to a multiple of eight bytes.
    struct Block
    {
        const char* text() const { return reinterpret_cast<const char*>(this + 1); }
        char* text() { return reinterpret_cast<char*>(this + 1); }

        uint32 size;
        uint32 attributes : 30;
        uint32 isAscii : 1;
        uint32 isPlain : 1;
    };

    static size_t bytesFor(size_t size);
    bool make(size_t size, size_t attributes);
    void judge();

    Block* block = nullptr;
};
} // namespace Xml
