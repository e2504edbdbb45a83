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
    void addRead(std::vector<IPtr<Entry>>& read);
    /// The place of the first entry that doesn't sort before `key`.
    int placeOf(Key key) const;
    bool isAt(int place, Key key) const
    {
        return place < Container::total() && entryAt(place)->compareKey(key) == 0;
    }
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
    const Key wanted = usableKey(key);
    if constexpr (isOrdered)
    {
        const int place = placeOf(wanted);
        return isAt(place, wanted) ? place : -1;
    }
    for (int i = 0, count = Container::total(); i < count; i++)
        if (entryAt(i)->compareKey(wanted) == 0)
            return i;
    return -1;
}

template <class Entry, class Key, class Container>
int FAttributeList<Entry, Key, Container>::placeOf(Key key) const
{
    int first = 0;
    int end = Container::total();
    // Who fills a list in the order of its keys is answered by the first comparison.
    if (end > 0 && entryAt(end - 1)->compareKey(key) < 0)
        return end;
    while (first < end)
    {
        const int middle = first + (end - first) / 2;
        if (entryAt(middle)->compareKey(key) < 0)
            first = middle + 1;
        else
            end = middle;
    }
    return first;
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
    const Key wanted = usableKey(key);
    int place = Container::total();
    if constexpr (isOrdered)
        place = placeOf(wanted);
    else if (const int found = find(wanted); found >= 0)
        place = found;
    if (isAt(place, wanted))
        return *entryAt(place);
    auto* added = new Entry(wanted);
    if (Container::makeRoom())
        Container::insert(place, added);
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
