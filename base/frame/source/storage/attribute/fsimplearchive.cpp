#include "storage/attribute/fsimplearchive.h"

#include "storage/attribute/boundedread.h"
#include "storage/attribute/findex.h"
#include "storage/attribute/fpointer.h"
#include "storage/attribute/storedclasses.h"
#include "storage/stream/fstream.h"

#include <algorithm>

namespace
{
constexpr int32 kClassMarker = -1;
constexpr uint32 kClassBit = 0x80000000;
/// With the top bit set, the next one would read as a marker.
constexpr int kMaxNumber = 0x7FFFFFFE;
} // namespace

FSimpleArchive::FSimpleArchive(FStream* archiveStream, bool writing, IArchiveErrorHook* hook)
    : FArchive(archiveStream, writing, hook)
{
    written.takeElements();
}

FSimpleArchive::~FSimpleArchive() = default;

int16 FSimpleArchive::getVersion(const char* className) const
{
    for (const StoredClass& stored : classes)
        if (stored.name == className)
            return stored.version;
    const MetaClass* meta = findStoredClass(className);
    return meta ? meta->classVersion : int16{0};
}

// Writing

bool FSimpleArchive::writeObject(const CmObject* object, bool shared)
{
    if (!isWriting)
        return false;
    if (!object)
        return stream->writeInt32(0);
    if (std::find(underWay.begin(), underWay.end(), object) != underWay.end())
        return refuseToWrite();
    if (const uint32 number = shared ? numberOf(object) : 0)
        return stream->writeInt32u(number);
    FArchiveDepthScope scope(depth);
    if (scope.isTooDeep() || written.total() >= kMaxNumber || !writeClass(object->getClass()))
        return refuseToWrite();
    if (shared)
        giveNumber(object);
    underWay.push_back(object);
    const bool isWritten = object->externalize(*this);
    underWay.pop_back();
    return isWritten;
}

bool FSimpleArchive::writeClass(MetaClass* meta)
{
    if (const uint32 number = numberOf(meta))
        return stream->writeInt32u(number | kClassBit);
    giveNumber(meta);
    return stream->writeInt32(kClassMarker) && stream->writeStr8(meta->persistentName) &&
           stream->writeInt16(meta->classVersion);
}

uint32 FSimpleArchive::numberOf(const void* address) const
{
    const FPointer key(address);
    const auto* index = static_cast<const FIndex*>(written.lookupObject(&key));
    return index ? index->getNumber() : 0;
}

void FSimpleArchive::giveNumber(const void* address)
{
    written.add(new FPointer(address), new FIndex(static_cast<uint32>(written.total()) + 1));
}

bool FSimpleArchive::refuseToWrite()
{
    setError(kBadObject);
    return false;
}

// Reading

CmObject* FSimpleArchive::readObject(const char* className, bool shared)
{
    int32 tag = 0;
    if (isWriting || !stream->readInt32(tag))
        return refuse();
    if (tag == 0)
        return nullptr;
    if (tag > 0)
        return findRead(static_cast<uint32>(tag), className);
    FArchiveDepthScope scope(depth);
    if (scope.isTooDeep())
        return refuse();
    return readBody(readClass(tag), className, shared);
}

CmObject* FSimpleArchive::findRead(uint32 number, const char* className)
{
    if (number > entries.size() || !entries[number - 1].isWhole || isFull())
        return refuse();
    CmObject* object = entries[number - 1].object;
    if (className && !object->isTypeOf(className, true))
        return refuse();
    references++;
    object->addRef();
    return object;
}

CmObject* FSimpleArchive::readBody(MetaClass* meta, const char* className, bool shared)
{
    IPtr<CmObject> object = createStoredObject(meta, className);
    if (!object || isFull())
        return refuse();
    objects.push_back(object);
    const size_t index = entries.size();
    if (shared)
        entries.push_back({nullptr, object, false});
    if (!object->internalize(*this))
        return refuse();
    if (shared)
        entries[index].isWhole = true;
    return object.take();
}

CmObject* FSimpleArchive::refuse()
{
    setError(kBadObject);
    return nullptr;
}

MetaClass* FSimpleArchive::readClass(int32 tag)
{
    if (tag != kClassMarker)
    {
        const uint32 number = static_cast<uint32>(tag) & ~kClassBit;
        return tag < 0 && number > 0 && number <= entries.size() ? entries[number - 1].meta : nullptr;
    }
    StoredClass record{{}, 0};
    if (!readBoundedStr8(*stream, record.name) || !stream->readInt16(record.version))
        return nullptr;
    MetaClass* meta = findStoredClass(record.name);
    entries.push_back({meta, nullptr, false});
    if (meta)
        classes.push_back(record);
    return meta;
}
