#include "storage/xml/xmlsourcetext.h"

#include "foundation/object/blockpool.h"
#include "foundation/text/charwidth.h"

#include <new>

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
} // namespace

SourceText::SourceText(const SourceText& other)
{
    if (other.block)
        set(other.first(), other.second());
}

size_t SourceText::sizeFor(size_t firstLength, size_t secondLength)
{
    const size_t used = sizeof(Block) + firstLength + 1 + secondLength + 1;
    return (used + sizeof(uint64) - 1) / sizeof(uint64) * sizeof(uint64);
}

bool SourceText::set(std::string_view first, std::string_view second)
{
    drop();
    const size_t size = sizeFor(first.size(), second.size());
    void* memory = second.size() > kMaxTextLength ? nullptr : BlockPool::take(size);
    if (!memory)
        return false;
    block = new (memory)
        Block{static_cast<uint32>(first.size()), static_cast<uint32>(second.size()) & kMaxTextLength, 0, 0};
    char* const text = block->text();
    char* const end = static_cast<char*>(memory) + size;
    memset(end - sizeof(uint64), 0, sizeof(uint64));
    memcpy(text, first.data(), first.size());
    text[first.size()] = 0;
    memcpy(text + first.size() + 1, second.data(), second.size());

    uint64 all = 0;
    bool isPlain = true;
    for (const char* place = text; place < end; place += sizeof(uint64))
    {
        uint64 bytes = 0;
        memcpy(&bytes, place, sizeof(bytes));
        all |= bytes;
        isPlain = isPlain && !hasMarkup(bytes);
    }
    block->isAscii = (all & kAboveAscii<char>) == 0;
    block->isPlain = isPlain;
    return true;
}

void SourceText::drop()
{
    if (block)
        BlockPool::giveBack(block, sizeFor(block->firstLength, block->secondLength));
    block = nullptr;
}
} // namespace Xml
