#pragma once

#include "foundation/object/cmobject.h"
#include "storage/attribute/farchive.h"

#include <string>
#include <unordered_map>
#include <vector>

/// The older archive's file form, little-endian. Positions count from where the archive starts in its stream.
///
/// | what              | form                                                                          |
/// |-------------------|-------------------------------------------------------------------------------|
/// | object            | 0 for null; or the position of one written before; or class, length, body    |
/// | class             | position of its record with the top bit set; or a new record                 |
/// | new class record  | -2, name, version for each base class not yet written, nearest first;        |
/// |                   | then -1, name, version                                                        |
///
/// An object's position is that of its length, so it is never 0. The length is written behind the body's end, so
/// writing needs a stream that seeks. One thread at a time.
class FNewArchive : public FArchive
{
public:
    FNewArchive(FStream* archiveStream, bool writing, IArchiveErrorHook* hook = nullptr);
    ~FNewArchive() override;

    CmObject* readObject(const char* className, bool shared) override;
    bool writeObject(const CmObject* object, bool shared) override;
    int16 getVersion(const char* className) const override;

    /// Reads a class, whose first number is `tag`. Null where neither it nor a base class in its record is known;
    /// the stream then stands behind the record.
    MetaClass* readClass(int32 tag);
    bool writeClass(MetaClass* meta);
    /// Remembers that the class's record is written here.
    void storeMetaClass(MetaClass* meta);
    /// The class whose record was read there; null where none was, or none is known.
    MetaClass* restoreMetaClass(uint32 recordPosition);
    /// Where the object was written; 0 where it wasn't. An object that was must outlive the archive, for an address
    /// that is used again would pass for it.
    uint32 getObjectID(const CmObject* object) const;
    /// Remembers that the object is written here.
    void storeObjectID(const CmObject* object);

    // Files of the user folder, by name without folder and extension. Defined beside the other archives' files.
    /// Writes `object` by its `externalize`; on failure there is no such file.
    static bool storeObject(const char16* name, const CmObject* object);
    /// Reads from the user folder or, failing that, from the application's.
    static bool restoreObject(const char16* name, CmObject* object);
    static bool objectArchiveExists(const char16* name);
    static bool removeObjectArchive(const char16* name);
    static bool renameObjectArchive(const char16* oldName, const char16* newName);

private:
    struct StoredClass
    {
        uint32 position;
        MetaClass* meta;
        std::string name;
        int16 version;
    };
    struct StoredObject
    {
        uint32 position;
        IPtr<CmObject> object;
    };

    uint32 position() const;
    bool writeClassRecord(int32 marker, MetaClass* meta);
    bool readClassRecord(int32 marker);
    MetaClass* resolveClasses(size_t first);
    bool writeBody(const CmObject* object);
    CmObject* readBody(MetaClass* meta, const char* className, bool shared);
    bool internalizeBody(CmObject& object, int64 bodyStart, int32 length);
    CmObject* findRead(uint32 objectPosition, const char* className);
    CmObject* refuse();

    int64 start;
    int depth = 0;
    // Writing: what was written, at which position.
    std::unordered_map<const void*, uint32> written;
    // Reading: in rising order of positions.
    std::vector<StoredObject> objects;
    std::vector<StoredClass> classes;
};
