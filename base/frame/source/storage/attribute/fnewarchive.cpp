#include "storage/attribute/fnewarchive.h"

#include "storage/attribute/boundedread.h"
#include "storage/attribute/storedclasses.h"
#include "storage/stream/fstream.h"

#include <algorithm>

namespace
{
constexpr int32 kClassMarker = -1;
constexpr int32 kBaseClassMarker = -2;
constexpr uint32 kClassBit = 0x80000000;
/// Above this a position with the top bit set would read as a marker.
constexpr uint32 kMaxPosition = 0x7FFFFFFD;
constexpr int kWrittenBuckets = 1000;
} // namespace

FNewArchive::FNewArchive(FStream* archiveStream, bool writing, IArchiveErrorHook* hook)
    : FArchive(archiveStream, writing, hook),
      start(archiveStream->tell())
{
    if (writing)
        written.reserve(kWrittenBuckets);
}

FNewArchive::~FNewArchive() = default;

uint32 FNewArchive::position() const
{
    const int64 now = stream->tell() - start;
    return now < 0 || now > kMaxPosition ? kMaxPosition + 1 : static_cast<uint32>(now);
}

int16 FNewArchive::getVersion(const char* className) const
{
    for (const StoredClass& stored : classes)
        if (stored.name == className)
            return stored.version;
    const MetaClass* meta = findStoredClass(className);
    return meta ? meta->classVersion : int16{0};
}

// Writing

bool FNewArchive::writeObject(const CmObject* object, bool shared)
{
    if (!isWriting)
        return false;
    if (!object)
        return stream->writeInt32(0);
    if (const uint32 id = shared ? getObjectID(object) : 0)
        return stream->writeInt32(static_cast<int32>(id));
    FArchiveDepthScope scope(depth);
    if (scope.isTooDeep() || !writeClass(object->getClass()) || position() > kMaxPosition)
    {
        setError(kBadObject);
        return false;
    }
    if (shared)
        storeObjectID(object);
    return writeBody(object);
}

bool FNewArchive::writeBody(const CmObject* object)
{
    const int64 lengthPosition = stream->tell();
    if (!stream->writeInt32(0))
        return false;
    const int64 bodyStart = stream->tell();
    if (!object->externalize(*this))
        return false;
    const int64 end = stream->tell();
    return stream->seek(lengthPosition, kSeekStart) == lengthPosition &&
           stream->writeInt32(static_cast<int32>(end - bodyStart)) && stream->seek(end, kSeekStart) == end;
}

bool FNewArchive::writeClass(MetaClass* meta)
{
    if (const auto found = written.find(meta); found != written.end())
        return stream->writeInt32u(found->second | kClassBit);
    for (MetaClass* base = meta->baseClass; base; base = base->baseClass)
        if (!written.count(base) && !writeClassRecord(kBaseClassMarker, base))
            return false;
    return writeClassRecord(kClassMarker, meta);
}

bool FNewArchive::writeClassRecord(int32 marker, MetaClass* meta)
{
    storeMetaClass(meta);
    return stream->writeInt32(marker) && stream->writeStr8(meta->persistentName) &&
           stream->writeInt16(meta->classVersion);
}

void FNewArchive::storeMetaClass(MetaClass* meta)
{
    written[meta] = position();
}

uint32 FNewArchive::getObjectID(const CmObject* object) const
{
    const auto found = written.find(object);
    return found == written.end() ? 0 : found->second;
}

void FNewArchive::storeObjectID(const CmObject* object)
{
    written[object] = position();
}

// Reading

CmObject* FNewArchive::readObject(const char* className, bool shared)
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

CmObject* FNewArchive::findRead(uint32 objectPosition, const char* className)
{
    const auto isBefore = [](const StoredObject& stored, uint32 wanted) { return stored.position < wanted; };
    const auto found = std::lower_bound(objects.begin(), objects.end(), objectPosition, isBefore);
    if (found == objects.end() || found->position != objectPosition || !found->object)
        return refuse();
    if (className && !found->object->isTypeOf(className, true))
        return refuse();
    found->object->addRef();
    return found->object;
}

CmObject* FNewArchive::readBody(MetaClass* meta, const char* className, bool shared)
{
    const uint32 id = position();
    int32 length = 0;
    if (!stream->readInt32(length) || length < 0)
        return refuse();
    const int64 bodyStart = stream->tell();
    IPtr<CmObject> object = createStoredObject(meta, className);
    if (!object)
    {
        stream->seek(bodyStart + length, kSeekStart);
        return refuse();
    }
    const size_t index = objects.size();
    if (shared)
        objects.push_back({id, object});
    if (internalizeBody(*object, bodyStart, length))
        return object.take();
    if (shared)
        objects[index].object = nullptr;
    return refuse();
}

bool FNewArchive::internalizeBody(CmObject& object, int64 bodyStart, int32 length)
{
    const bool isRead = object.internalize(*this);
    const int64 end = bodyStart + length;
    // A body that reads beyond its length, which a damaged file may say, could make the reading go in circles.
    if (stream->tell() > end)
        return false;
    return stream->seek(end, kSeekStart) == end && isRead;
}

CmObject* FNewArchive::refuse()
{
    setError(kBadObject);
    return nullptr;
}

MetaClass* FNewArchive::readClass(int32 tag)
{
    if (tag != kClassMarker && tag != kBaseClassMarker)
        return restoreMetaClass(static_cast<uint32>(tag) & ~kClassBit);

    const size_t first = classes.size();
    for (int32 marker = tag; readClassRecord(marker);)
    {
        if (marker == kClassMarker)
            return resolveClasses(first);
        if (!stream->readInt32(marker))
            break;
    }
    classes.resize(first);
    return nullptr;
}

bool FNewArchive::readClassRecord(int32 marker)
{
    if (marker != kClassMarker && marker != kBaseClassMarker)
        return false;
    StoredClass record{position() - static_cast<uint32>(sizeof(marker)), nullptr, {}, 0};
    if (!readBoundedStr8(*stream, record.name) || !stream->readInt16(record.version))
        return false;
    classes.push_back(record);
    return true;
}

/// Finds the classes of the records from `first` on: base classes, nearest first, then the class itself. One that
/// is unknown is replaced by its nearest base that is known.
MetaClass* FNewArchive::resolveClasses(size_t first)
{
    MetaClass* known = nullptr;
    for (size_t i = classes.size() - 1; i-- > first;)
    {
        if (MetaClass* meta = findStoredClass(classes[i].name))
            known = meta;
        classes[i].meta = known;
    }
    StoredClass& stored = classes.back();
    stored.meta = findStoredClass(stored.name);
    if (!stored.meta)
        stored.meta = known;
    return stored.meta;
}

MetaClass* FNewArchive::restoreMetaClass(uint32 recordPosition)
{
    const auto isBefore = [](const StoredClass& stored, uint32 wanted) { return stored.position < wanted; };
    const auto found = std::lower_bound(classes.begin(), classes.end(), recordPosition, isBefore);
    return found == classes.end() || found->position != recordPosition ? nullptr : found->meta;
}
