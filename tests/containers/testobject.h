#pragma once

#include "containers/sequence/cmcontainer.h"
#include "containers/sequence/cmidlinkedlist.h"
#include "containers/sequence/cmilinkedlist.h"
#include "containers/sequence/cmiterator.h"

#include <memory>
#include <string>

/// An element that is compared by its rank, told apart by its mark, and counts how many of its kind live.
class Item : public CmObject
{
    DECLARE_COPYABLE(Item, CmObject)

    explicit Item(int itsRank = 0, char itsMark = 0) : rank(itsRank), mark(itsMark) { alive++; }
    Item(const Item& other) : CmObject(other), rank(other.rank), mark(other.mark) { alive++; }
    ~Item() override { alive--; }

    bool isEqual(const CmObject* other) const override
    {
        const Item* item = FCast(Item, other);
        return item && rank == item->rank;
    }
    int compare(const CmObject* other) const override
    {
        const Item* item = FCast(Item, other);
        return item ? rank - item->rank : CmObject::compare(other);
    }
    unsigned hash(unsigned size) const override { return static_cast<unsigned>(rank) % size; }

    inline static int alive = 0;

    int rank;
    char mark;
};

/// The same with links of its own.
template <class Link>
class LinkedItem : public Link
{
    DECLARE_COPYABLE(LinkedItem, Link)

    explicit LinkedItem(int itsRank = 0) : rank(itsRank) { Item::alive++; }
    LinkedItem(const LinkedItem& other) : Link(other), rank(other.rank) { Item::alive++; }
    ~LinkedItem() override { Item::alive--; }

    bool isEqual(const CmObject* other) const override
    {
        const LinkedItem* item = FCast(LinkedItem, other);
        return item && rank == item->rank;
    }
    int compare(const CmObject* other) const override
    {
        const LinkedItem* item = FCast(LinkedItem, other);
        return item ? rank - item->rank : CmObject::compare(other);
    }
    unsigned hash(unsigned size) const override { return static_cast<unsigned>(rank) % size; }

    int rank;
};

/// What a container of this class takes.
template <class Container>
struct ElementOf
{
    using Type = Item;
};
template <>
struct ElementOf<CmILinkedList>
{
    using Type = LinkedItem<CmILink>;
};
template <>
struct ElementOf<CmIDLinkedList>
{
    using Type = LinkedItem<CmIDLink>;
};

inline int rankOf(const CmObject* object)
{
    if (const Item* item = FCast(Item, object))
        return item->rank;
    if (const CmIDLink* link = FCast(CmIDLink, object))
        return static_cast<const LinkedItem<CmIDLink>*>(link)->rank;
    if (const CmILink* link = FCast(CmILink, object))
        return static_cast<const LinkedItem<CmILink>*>(link)->rank;
    return -1;
}

inline std::unique_ptr<CmIterator> iterate(const CmContainer& container)
{
    return std::unique_ptr<CmIterator>(container.newIterator());
}

/// The ranks in iteration order: "1 2 3".
inline std::string ranksOf(const CmContainer& container)
{
    std::string result;
    for (auto it = iterate(container); !it->done();)
        result += (result.empty() ? "" : " ") + std::to_string(rankOf(it->next()));
    return result;
}

inline std::string ranksBackwards(const CmContainer& container)
{
    std::string result;
    auto it = iterate(container);
    for (it->last(); !it->done();)
        result += (result.empty() ? "" : " ") + std::to_string(rankOf(it->previous()));
    return result;
}

/// The marks of Items in iteration order.
inline std::string marksOf(const CmContainer& container)
{
    std::string result;
    for (auto it = iterate(container); !it->done();)
        result += static_cast<Item*>(it->next())->mark;
    return result;
}
