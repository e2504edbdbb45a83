#pragma once

#include "foundation/object/iattributes.h"
#include "storage/attribute/fattributelist.h"

#include <type_traits>

class ConstString;
class FAttrList;
class String;

/// Tells the numbers that attribute trees take as an integer.
template <class T>
inline constexpr bool kIsAttributeInteger = std::is_integral_v<T> || std::is_enum_v<T>;

/// A tree of named, typed values: the form in which objects store themselves.
///
/// The entries are sorted by key; a set replaces what the key held. A key may hold a queue of values, which is
/// read in order without being used up. Sub-trees and other objects are counted. A read that fails (no such key,
/// or a value of another kind, though numbers convert) gives false, null or 0, leaves its target untouched and
/// makes no entry. A copy has its own entries, sub-trees and queues, and shares other objects. A tree belongs to
/// one thread at a time; it changes threads as a whole, after `stripObjects`.
class FAttributes : public CmObject, public IAttributes
{
    DECLARE_CLASS(FAttributes, CmObject)

    FAttributes();
    FAttributes(const FAttributes& other);
    FAttributes& operator=(const FAttributes& other);
    ~FAttributes() override;

    // Single values. False only where a queued or converted object can't be made. Texts and blocks are copied; with
    // `copy` false they are borrowed and must outlive the tree.
    bool set(const char* key, long long value);
    bool set(const char* key, double value);
    bool set(const char* key, float value) { return set(key, static_cast<double>(value)); }
    template <class Number>
    requires kIsAttributeInteger<Number>
    bool set(const char* key, Number value) { return set(key, static_cast<long long>(value)); }
    bool set(const char* key, const ConstString& text, bool copy = true);
    bool set(const char* key, const char* text, bool copy = true) { return setString8(key, text, copy); }
    bool set(const char* key, const char16* text, bool copy = true) { return setString16(key, text, copy); }
    bool set(const char* key, const FVariant& value) override;
    bool setString(const char* key, const char16* text, bool copy = true)
    {
        return setString16(key, text, copy);
    }
    bool setString8(const char* key, const char* text, bool copy = true);
    bool setString16(const char* key, const char16* text, bool copy = true);
    /// With `takeOver` the tree gets the caller's reference, otherwise it adds its own. Null removes the entry.
    bool setObject(const char* key, CmObject* object, bool takeOver = false);
    /// Stores what `object` stores of itself; false, with no entry, where it can't.
    bool setMember(const char* key, const CmObject& object);
    /// As `setObject`.
    bool setAttributes(const char* key, FAttributes* attributes, bool takeOver = false);
    bool setBinary(const char* key, const void* data, unsigned int size, bool copy = true);
    /// The older name of `setBinary`.
    bool setBinaryData(const char* key, const void* data, uint32 size, bool copy = true) override;

    // Reading. Texts, objects and trees that are given by pointer are borrowed.
    bool get(const char* key, long long& value) const;
    template <class Number>
    requires(std::is_integral_v<Number>) bool get(const char* key, Number& value) const;
    bool get(const char* key, double& value) const;
    bool get(const char* key, float& value) const;
    /// Copies the text at its width.
    bool get(const char* key, String& text) const;
    bool get(const char* key, FVariant& value) const override;
    bool getInt(const char* key, long long& value) const { return get(key, value); }
    long long getInt(const char* key) const;
    bool getFloat(const char* key, double& value) const { return get(key, value); }
    double getFloat(const char* key) const;
    bool getString(const char* key, String& text) const { return get(key, text); }
    /// The pointer holds until the entry is changed or read at another width; null where there is no text.
    const char16* getString(const char* key) const { return getString16(key); }
    const char* getString8(const char* key) const;
    const char16* getString16(const char* key) const;
    /// The object, if it is a `className` (any, where that is null). For a placeholder from a file its object, which
    /// is made when first asked for; null where that failed. Add a reference to keep it beyond the tree.
    CmObject* getObject(const char* key, const char* className) const;
    /// The stored tree of an object that was read from a file and not yet asked for, or a sub-tree.
    FAttributes* getObjectAttributes(const char* key) const;
    FAttributes* getAttributes(const char* key) const;
    /// Lets `object` restore itself from the sub-tree.
    bool getMember(const char* key, CmObject& object) const;
    /// Copies at most `size` bytes of a block.
    bool getBinary(const char* key, void* data, unsigned int size) const;
    bool getBinaryData(const char* key, void* data, uint32 size) const override;
    uint32 getBinarySize(const char* key) const override;

    // Queues. The first value makes the queue, in its kind; a key that holds another kind of queue begins anew.
    bool queueInt(const char* key, long long value);
    bool queueFloat(const char* key, double value);
    bool queueString(const char* key, const char16* text, bool copy = true);
    /// Queued texts are in 16 bits.
    bool queueString8(const char* key, const char* text, bool copy = true);
    bool queueString16(const char* key, const char16* text, bool copy = true);
    /// `takeOver` as in `setObject`. Null is refused.
    bool queueObject(const char* key, CmObject* object, bool takeOver = false);
    /// Queues what `object` stores of itself; with `strip` free of live objects.
    bool queueMember(const char* key, const CmObject& object, bool strip = false);
    /// Adds a reference of its own.
    bool queueAttributes(const char* key, FAttributes* attributes);
    bool queue(const char* key, const FVariant& value) override;
    // Each reads the next value; false or null at the end, until the queue is reset.
    bool unqueueInt(const char* key, long long& value) const;
    bool unqueueFloat(const char* key, double& value) const;
    bool unqueueString(const char* key, String& text) const;
    const char16* unqueueString(const char* key) const;
    /// The caller gets a reference, so that a container may own what it adds. Objects that can't be made, or are no
    /// `className`, are passed over.
    [[nodiscard]] CmObject* unqueueObject(const char* key, const char* className) const;
    /// Borrowed.
    FAttributes* unqueueAttributes(const char* key) const;
    /// Lets `object` restore itself from the next tree; false also where it can't.
    bool unqueueMember(const char* key, CmObject& object) const;
    bool unqueue(const char* key, FVariant& value) const override;
    /// 0 where there is no queue.
    int countQueueItems(const char* key) const { return getQueueItemCount(key); }
    int getQueueItemCount(const char* key) const override;
    /// The stored tree of the queue's next item, which stays the next one; null where it has none.
    FAttributes* lookupQueueObjectAttributes(const char* key) const;
    /// The next read gives the first value again.
    bool resetQueue(const char* key) const override;
    bool resetList(const char* key) const { return resetQueue(key); }
    bool resetAllQueues() const override;
    bool resetAllLists() const { return resetAllQueues(); }

    // The whole tree
    int total() const { return entries ? entries->total() : 0; }
    bool isEmpty() const { return total() == 0; }
    /// In the order of the keys; borrowed, null where out of range.
    FStringIDAttribute* entryAt(int index) const;
    bool removeEntryAt(int index);
    /// The entry of this key, which is made where there is none.
    FStringIDAttribute& entry(const char* key);
    bool containsAttribute(const char* key) const;
    bool removeAttribute(const char* key);
    void removeAll();
    /// Replaces live objects by what they store of themselves.
    void stripObjects();
    /// `path` is keys with dots between them: all but the last lead through sub-trees. A key that has a dot itself
    /// is found where it is the whole rest of the path.
    bool extractValue(const char* path, FVariant& value) const;
    FAttributes* extractAttributes(const char* path) const;
    /// Copies a list of a component into the tree; a numeric key becomes its digits.
    void loadAttributes(const FStringAttributeList& list) { loadList(list); }
    void loadAttributes(const FStringAttributeArray& list) { loadList(list); }
    void loadAttributes(const FIntAttributeList& list);
    /// Copies the tree's numbers and texts into a list by key, and all else into a sub-tree under
    /// "Additional Attributes" or, in a list of numeric keys, `kAdditionalAttributes`.
    void saveAttributes(FStringAttributeList& list) const { saveList(list); }
    void saveAttributes(FStringAttributeArray& list) const { saveList(list); }
    void saveAttributes(FIntAttributeList& list) const;
    static constexpr unsigned int kAdditionalAttributes = 0xFFFFFFFF;
    /// Copies each entry, replacing what the key held.
    void addAllFrom(const FAttributes& other);
    /// Moves each entry here, replacing what the key held; the other tree is empty afterwards.
    void takeAllFrom(FAttributes& other);

    int32 queryInterface(const char* interfaceID, void** object) override;
    bool externalize(FArchive& archive) const override;
    bool internalize(FArchive& archive) override;
    bool storeAttributes(FAttributes& attributes) const override;
    bool restoreAttributes(FAttributes& attributes) override;
    FORWARD_FUNKNOWN(CmObject)

private:
    FStringIDAttribute* find(const char* key) const;
    FStringIDAttribute* findNumber(const char* key) const;
    template <class List>
    List* queueOf(const char* key, const char* className) const;
    template <class List>
    List& makeQueue(const char* key, const char* className);
    template <class List>
    void loadList(const List& list);
    template <class List>
    void saveList(List& list) const;
    FAttrList* findQueue(const char* key) const;
    void loadEntry(const char* key, bool isAdditional, const FAttributeValue& value);
    bool setUnknown(const char* key, FUnknown* unknown);
    bool queueUnknown(const char* key, FUnknown* unknown);
    bool getBlock(const char* key, const void*& data, uint32& size) const;

    IPtr<FStringAttributeList> entries;
};

template <class Number>
requires(std::is_integral_v<Number>) bool FAttributes::get(const char* key, Number& value) const
{
    long long wide = 0;
    if (!get(key, wide))
        return false;
    value = static_cast<Number>(wide);
    return true;
}
