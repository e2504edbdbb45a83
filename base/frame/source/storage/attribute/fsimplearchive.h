#pragma once

#include "containers/keyed/cmbtreedictionary.h"
#include "storage/attribute/farchive.h"

#include <cstdint>
#include <string>
#include <vector>

/// An archive for streams that can't seek, as a connection: it knows objects by numbers instead of positions.
///
/// | what             | form                                                    |
/// |------------------|---------------------------------------------------------|
/// | object           | 0 for null; or the number of one before; or class, body |
/// | class            | number of one before with the top bit set; or a new one |
/// | new class        | -1, name, version                                       |
///
/// Classes and shared objects have one row of numbers, from 1, in the order in which they are written. A body has no
/// length: one that isn't understood can't be skipped, and ends the reading. Objects that hold themselves, be it
/// through others, are refused, since nobody would ever free them. Little-endian. *One thread at a time*.
class FSimpleArchive : public FArchive
{
public:
    FSimpleArchive(FStream* archiveStream, bool writing, IArchiveErrorHook* hook = nullptr);
    ~FSimpleArchive() override;

    CmObject* readObject(const char* className, bool shared) override;
    bool writeObject(const CmObject* object, bool shared) override;
    int16 getVersion(const char* className) const override;

    /// Reads a class, whose first number is `tag`; null where nobody knows it.
    MetaClass* readClass(int32 tag);
    bool writeClass(MetaClass* meta);

    /// While reading, a further object or reference to one is an error: references are short, and a list of millions
    /// of them may take its time. Without a limit at first.
    void setObjectLimit(int limit) { objectLimit = static_cast<size_t>(limit); }
    /// All objects that were read, or whose reading failed, in the order in which they began.
    const std::vector<IPtr<CmObject>>& getObjects() const { return objects; }

private:
    /// What a number stands for, while reading.
    struct Entry
    {
        MetaClass* meta;
        CmObject* object;
        bool isWhole;
    };
    struct StoredClass
    {
        std::string name;
        int16 version;
    };

    CmObject* readBody(MetaClass* meta, const char* className, bool shared);
    CmObject* findRead(uint32 number, const char* className);
    CmObject* refuse();
    bool refuseToWrite();
    /// 0 for what has none yet.
    uint32 numberOf(const void* address) const;
    void giveNumber(const void* address);
    bool isFull() const { return objects.size() + references >= objectLimit; }

    int depth = 0;
    // Writing: the numbers given, and the objects whose body is under way.
    /// FPointer to FIndex.
    CmBTreeDictionary written;
    std::vector<const CmObject*> underWay;
    // Reading: number 1 comes first.
    std::vector<Entry> entries;
    std::vector<IPtr<CmObject>> objects;
    std::vector<StoredClass> classes;
    size_t references = 0;
    size_t objectLimit = SIZE_MAX;
};
