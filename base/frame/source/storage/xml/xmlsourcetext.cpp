#include "storage/xml/xmlsourcetext.h"

#include "foundation/object/blockpool.h"
#include "foundation/object/wordat.h"
#include "foundation/text/charwidth.h"

#include <cstddef>

namespace Xml
{
namespace
{
constexpr uint64 kEach = 0x0101010101010101;

/// Whether one of eight bytes is 0.
bool hasZero(uint64 bytes)
{
    return ((bytes - kEach) & ~bytes & 0x80 * kEach) != 0;
}

/// Whether one of eight bytes is a character that is written by name. '"' and '&', and '<' and '>', differ in one bit.
bool hasMarkup(uint64 bytes)
{
    return hasZero((bytes & 0xFB * kEach) ^ '"' * kEach) || hasZero((bytes & 0xFD * kEach) ^ '<' * kEach);
}

char* putText(char* to, std::string_view text)
{
    memcpy(to, text.data(), text.size());
    to[text.size()] = 0;
    return to + text.size() + 1;
}
} // namespace

SourceText::SourceText(const SourceText& other)
{
    if (!other.block || !make(other.size(), other.countAttributes()))
        return;
    memcpy(block->text(), other.begin(), other.size());
    judge();
}

bool SourceText::set(std::string_view text)
{
    if (!make(text.size() + 1, 0))
        return false;
    putText(block->text(), text);
    judge();
    return true;
}

bool SourceText::set(const char* tag, const char** attributes)
{
    size_t size = strlen(tag) + 1;
    size_t count = 0;
    for (; attributes[count]; count++)
        size += strlen(attributes[count]) + 1;
    if (!make(size, count / 2))
        return false;
    char* to = putText(block->text(), tag);
    for (size_t i = 0; i < count; i++)
        to = putText(to, attributes[i]);
    judge();
    return true;
}

size_t SourceText::bytesFor(size_t size)
{
    return sizeof(Block) + (size + sizeof(uint64) - 1) / sizeof(uint64) * sizeof(uint64);
}

bool SourceText::make(size_t size, size_t attributes)
{
    drop();
    const size_t bytes = bytesFor(size);
    auto* memory = size > kMaxTextLength ? nullptr : static_cast<char*>(BlockPool::take(bytes));
    if (!memory)
        return false;
    memset(memory + bytes - sizeof(uint64), 0, sizeof(uint64));
    block =
        new (memory) Block{static_cast<uint32>(size), static_cast<uint32>(attributes) & kMaxTextLength, 0, 0};
    return true;
}

/// Looks at eight bytes together.
void SourceText::judge()
{
    uint64 all = 0;
    bool isPlain = true;
    const char* const limit = reinterpret_cast<const char*>(block) + bytesFor(block->size);
    for (const char* place = block->text(); place < limit; place += sizeof(uint64))
    {
        const uint64 bytes = wordAt(place);
        all |= bytes;
        isPlain = isPlain && !hasMarkup(bytes);
    }
    block->isAscii = (all & kAboveAscii<char>) == 0;
    block->isPlain = isPlain;
}

bool SourceText::isPlain(std::string_view text) const
{
    const char* const limit = reinterpret_cast<const char*>(block) + bytesFor(block->size);
    const char* const textEnd = text.data() + text.size();
    for (const char* place = text.data(); place < textEnd; place += sizeof(uint64))
        if (limit - place < static_cast<std::ptrdiff_t>(sizeof(uint64)) || hasMarkup(wordAt(place)))
            return false;
    return true;
}

void SourceText::drop()
{
    if (block)
        BlockPool::giveBack(block, bytesFor(block->size));
    block = nullptr;
}
} // namespace Xml
