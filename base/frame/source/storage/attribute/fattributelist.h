#pragma once

#include "containers/sequence/cmarray.h"
#include "containers/sequence/cmorderedarray.h"
#include "foundation/object/iptr.h"
#include "storage/attribute/farchive.h"
#include "storage/attribute/fintidattribute.h"
#include "storage/attribute/fstringidattribute.h"

#include <algorithm>
#include <numeric>
#include <type_traits>
#include <vector>

/// Values by key: a container that owns its entries, which are `Entry` objects.
///
/// In a CmOrderedArray the entries stay sorted by key and are found by bisection; in a CmArray they stay in the
/// order in which they came and are found by scanning. A set on a key that is there replaces the value in place.
/// Null for a text key is the empty one. One thread at a time.
template <class Entry, class Key, class Container>
class FAttributeList : public Container
{
public:
    FAttributeList() : Container(0, -1) { this->_ownsObjects = 1; }

    void setLongAttribute(Key key, long long integer) { entry(key).setLong(integer); }
    void setFloatAttribute(Key key, double number) { entry(key).setFloat(number); }
    /// With `borrow` the text must outlive the entry.
    void setStringAttribute(Key key, const char16* text, bool borrow) { entry(key).setString(text, borrow); }
    void setStringAttribute(Key key, const char* text, bool borrow) { entry(key).setString(text, borrow); }
    /// `flags` as in FAttributeValue::setObj.
    void setObjAttribute(Key key, CmObject* object, unsigned flags) { entry(key).setObj(object, flags); }
    void setUnknownAttribute(Key key, FUnknown* unknown, unsigned flags)
    {
        entry(key).setUnknown(unknown, flags);
    }
    void setPointerAttribute(Key key, void* pointer) { entry(key).setPointer(pointer); }

    using Container::contains;
    bool contains(Key key) const { return getAttribute(key) != nullptr; }
    /// The entry of this key, borrowed, or null.
    Entry* getAttribute(Key key) const;
    /// The object of this key, borrowed; null where there is none.
    CmObject* getObjAttribute(Key key) const;
    /// The entry of this key, which is made where there is none.
    Entry& entry(Key key);
    Entry* entryAt(int index) const { return static_cast<Entry*>(Container::at(index)); }
    bool removeAttribute(Key key);
    /// Puts an entry in the place of the one with its key. The list takes over the caller's reference.
    void takeEntry(Entry* newEntry);

    /// The number of entries, 32 bits, then each entry.
    bool externalize(FArchive& archive) const override;
    bool internalize(FArchive& archive) override;
    CmObject* newCopy() const override { return new FAttributeList(*this); }

private:
    static constexpr bool isOrdered = std::is_base_of_v<CmOrderedArray, Container>;

    static Key usableKey(Key key);
    int find(Key key) const;
    int findSorted(Key key) const;
    void addRead(std::vector<IPtr<Entry>>& read);
};

using FStringAttributeList = FAttributeList<FStringIDAttribute, const char*, CmOrderedArray>;
using FStringAttributeArray = FAttributeList<FStringIDAttribute, const char*, CmArray>;
using FIntAttributeList = FAttributeList<FIntIDAttribute, unsigned int, CmOrderedArray>;

template <class Entry, class Key, class Container>
Key FAttributeList<Entry, Key, Container>::usableKey(Key key)
{
    if constexpr (std::is_pointer_v<Key>)
        return key ? key : "";
    else
        return key;
}

template <class Entry, class Key, class Container>
int FAttributeList<Entry, Key, Container>::find(Key key) const
{
    if constexpr (isOrdered)
        return findSorted(usableKey(key));
    for (int i = 0, count = Container::total(); i < count; i++)
        if (entryAt(i)->compareKey(usableKey(key)) == 0)
            return i;
    return -1;
}

template <class Entry, class Key, class Container>
int FAttributeList<Entry, Key, Container>::findSorted(Key key) const
{
    int first = 0;
    int last = Container::total() - 1;
    // Who fills a list in the order of its keys is answered by the first comparison.
    if (last >= 0 && entryAt(last)->compareKey(key) < 0)
        return -1;
    while (first <= last)
    {
        const int middle = first + (last - first) / 2;
        const int order = entryAt(middle)->compareKey(key);
        if (order == 0)
            return middle;
        if (order < 0)
            first = middle + 1;
        else
            last = middle - 1;
    }
    return -1;
}

template <class Entry, class Key, class Container>
Entry* FAttributeList<Entry, Key, Container>::getAttribute(Key key) const
{
    const int index = find(key);
    return index < 0 ? nullptr : entryAt(index);
}

template <class Entry, class Key, class Container>
CmObject* FAttributeList<Entry, Key, Container>::getObjAttribute(Key key) const
{
    const Entry* found = getAttribute(key);
    return found ? found->getObj() : nullptr;
}

template <class Entry, class Key, class Container>
Entry& FAttributeList<Entry, Key, Container>::entry(Key key)
{
    if (Entry* found = getAttribute(key))
        return *found;
    auto* added = new Entry(usableKey(key));
    Container::add(added);
    return *added;
}

template <class Entry, class Key, class Container>
bool FAttributeList<Entry, Key, Container>::removeAttribute(Key key)
{
    const int index = find(key);
    return index >= 0 && Container::removeAt(index);
}

template <class Entry, class Key, class Container>
void FAttributeList<Entry, Key, Container>::takeEntry(Entry* newEntry)
{
    removeAttribute(newEntry->getKey());
    Container::add(newEntry);
}

template <class Entry, class Key, class Container>
bool FAttributeList<Entry, Key, Container>::externalize(FArchive& archive) const
{
    bool isStored = archive.writeCount(Container::total());
    for (int i = 0, count = Container::total(); i < count && isStored; i++)
        isStored = entryAt(i)->externalize(archive);
    return isStored;
}

template <class Entry, class Key, class Container>
bool FAttributeList<Entry, Key, Container>::internalize(FArchive& archive)
{
    Container::removeAll();
    int count = 0;
    if (!archive.readCount(count))
        return false;
    std::vector<IPtr<Entry>> read;
    bool isRead = true;
    for (int i = 0; i < count && isRead; i++)
    {
        auto entry = adopt(new Entry);
        isRead = entry->internalize(archive);
        if (isRead)
            read.push_back(entry);
    }
    addRead(read);
    return isRead;
}

/// Of entries with one key the last one stays. Sorts instead of searching for each, since nothing vouches for their
/// number and order.
template <class Entry, class Key, class Container>
void FAttributeList<Entry, Key, Container>::addRead(std::vector<IPtr<Entry>>& read)
{
    std::vector<size_t> byKey(read.size());
    std::iota(byKey.begin(), byKey.end(), size_t{0});
    std::stable_sort(byKey.begin(), byKey.end(),
                     [&read](size_t a, size_t b) { return read[a]->compareKey(read[b]->getKey()) < 0; });
    for (size_t i = 0; i + 1 < byKey.size(); i++)
        if (read[byKey[i]]->compareKey(read[byKey[i + 1]]->getKey()) == 0)
            read[byKey[i]] = nullptr;
    for (size_t i = 0; i < read.size(); i++)
        if (auto& entry = read[isOrdered ? byKey[i] : i])
            Container::add(entry.take());
}
