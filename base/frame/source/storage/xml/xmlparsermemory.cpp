#include "storage/xml/xmlparsermemory.h"

#include <cstdlib>

namespace
{
thread_local XmlParserMemory* current = nullptr;
} // namespace

/// In front of each block.
struct alignas(std::max_align_t) XmlParserMemory::Head
{
    XmlParserMemory* owner;
    size_t size;
};

XmlParserMemory::Scope::Scope(XmlParserMemory& memory) : former(current)
{
    current = &memory;
}

XmlParserMemory::Scope::~Scope()
{
    current = former;
}

void* XmlParserMemory::allocate(size_t size)
{
    if (!current || size > current->left)
        return nullptr;
    auto* head = static_cast<Head*>(malloc(sizeof(Head) + size));
    if (!head)
        return nullptr;
    *head = {current, size};
    current->left -= size;
    return head + 1;
}

void* XmlParserMemory::resize(void* block, size_t size)
{
    if (!block)
        return allocate(size);
    auto* head = static_cast<Head*>(block) - 1;
    XmlParserMemory& owner = *head->owner;
    const size_t oldSize = head->size;
    if (size > oldSize && size - oldSize > owner.left)
        return nullptr;
    head = static_cast<Head*>(realloc(head, sizeof(Head) + size));
    if (!head)
        return nullptr;
    head->size = size;
    owner.left += oldSize;
    owner.left -= size;
    return head + 1;
}

void XmlParserMemory::release(void* block)
{
    if (!block)
        return;
    auto* head = static_cast<Head*>(block) - 1;
    head->owner->left += head->size;
    free(head);
}
