#include "storage/archive/binarchivewriter.h"

#include "foundation/text/fstring.h"
#include "storage/attribute/fattrbuffer.h"
#include "storage/attribute/ffloatlist.h"
#include "storage/attribute/fintlist.h"
#include "storage/attribute/fobjectlist.h"
#include "storage/attribute/fstringlist.h"
#include "storage/attribute/fsublist.h"
#include "storage/attribute/fxmlobject.h"
#include "storage/stream/fstream.h"

#include <algorithm>
#include <cstring>
#include <limits>

namespace
{
constexpr uint32 kBlockSize = 16384;

int countArchived(const FAttributes& attributes)
{
    int count = 0;
    for (int i = 0; i < attributes.total(); i++)
        count += isArchived(*attributes.entryAt(i));
    return count;
}

/// The kind under which an entry is stored: of an unknown it is its object that is.
uint16 getStoredKind(const FAttributeValue& value)
{
    const unsigned kind = value.getKind();
    return static_cast<uint16>(kind == FAttributeValue::kUnknown ? kind | FAttributeValue::kObject : kind);
}

/// The length of 16-bit text that has only ASCII characters; -1 for any other.
int asciiLength(const char16* text)
{
    int length = 0;
    for (; text[length]; length++)
        if (text[length] >= 0x80)
            return -1;
    return length;
}
} // namespace

BinArchiveWriter::BinArchiveWriter(FStream& target, Buffer& collected, Buffer& room)
    : stream(target),
      block(collected),
      text(room)
{
    isWhole = block.setSize(kBlockSize);
    block.flush();
    seen.setHashFunction(gHashObject);
    seen.setAutoResize(true);
    seen.retainElements();
}

// Roots and objects

bool BinArchiveWriter::writeRoots(const FStringAttributeArray& roots,
                                  const FStringAttributeArray& globalRoots)
{
    writeNumber<int32>(globalRoots.total());
    for (int i = 0; i < globalRoots.total(); i++)
        if (!writeGlobalRoot(*globalRoots.entryAt(i)))
            return false;
    writeNumber<int32>(roots.total());
    for (int i = 0; i < roots.total(); i++)
        if (!writeRoot(*roots.entryAt(i)))
            return false;
    return isWhole;
}

bool BinArchiveWriter::writeGlobalRoot(const FStringIDAttribute& root)
{
    CmObject* object = getSharedObject(getArchivedObject(root));
    if (!object)
        return false;
    writeText8(root.getKey());
    writeNumber<uint64>(getArchiveID(object));
    return seen.containsAbs(object) || writeObject(object);
}

bool BinArchiveWriter::writeRoot(const FStringIDAttribute& root)
{
    const CmObject* object = getSharedObject(getArchivedObject(root));
    const IPtr<FAttributes> tree = object ? getArchivedTree(object) : nullptr;
    if (!tree)
        return false;
    writeText8(root.getKey());
    return writeAttributes(*tree);
}

bool BinArchiveWriter::writeTree(const FAttributes& attributes)
{
    return writeAttributes(attributes);
}

bool BinArchiveWriter::writeObject(CmObject* object)
{
    const IPtr<FAttributes> tree = getArchivedTree(object);
    if (!tree)
        return false;
    seen.add(object);
    const char* className = getArchivedClass(object);
    const auto size = static_cast<uint32>(strlen(className)) + 1;
    writeNumber<int32>(static_cast<int32>(size));
    writeBytes(className, size);
    writeNumber<uint64>(getArchiveID(object));
    return writeAttributes(*tree);
}

bool BinArchiveWriter::writeReference(CmObject* object)
{
    CmObject* target = getSharedObject(object);
    if (target && !seen.containsAbs(target))
    {
        writeKind(BinaryKind::kFirstObject);
        return writeObject(target);
    }
    writeKind(BinaryKind::kSeenObject);
    writeNumber<uint64>(getArchiveID(target));
    return true;
}

// Trees

bool BinArchiveWriter::writeAttributes(const FAttributes& attributes)
{
    if (nesting >= FArchive::kMaxDepth)
        return false;
    nesting++;
    writeNumber<int32>(countArchived(attributes));
    for (int i = 0, count = attributes.total(); i < count && isWhole; i++)
        if (!writeEntry(*attributes.entryAt(i)))
            return false;
    nesting--;
    return isWhole;
}

bool BinArchiveWriter::writeEntry(FStringIDAttribute& entry)
{
    if (!isArchived(entry))
        return true;
    writeText8(entry.getKey());
    const unsigned type = entry.getType();
    writeNumber<uint16>(getStoredKind(entry));
    if (type & FAttributeValue::kInteger)
        writeNumber<int64>(entry.getLong());
    else if (type & FAttributeValue::kFloat)
        writeNumber<double>(entry.getFloat());
    else if (!(type & FAttributeValue::kString))
        return writeObjectEntry(getArchivedObject(entry));
    else if (entry.isWide())
        writeText16(entry.getString16());
    else
        writeText8(entry.getString8());
    return true;
}

bool BinArchiveWriter::writeObjectEntry(CmObject* object)
{
    switch (const ArchivedKind kind = getArchivedKind(object))
    {
    case ArchivedKind::kTree:
        writeKind(BinaryKind::kTree);
        return writeAttributes(*FCast(FAttributes, object));
    case ArchivedKind::kBinary:
        writeBlock(object);
        return true;
    case ArchivedKind::kObjectList:
        return writeObjects(object);
    case ArchivedKind::kSubList:
        return writeTrees(object);
    case ArchivedKind::kStringList:
        writeStrings(object);
        return true;
    case ArchivedKind::kIntList:
    case ArchivedKind::kFloatList:
        writeNumbers(object, kind);
        return true;
    default:
        return writeReference(object);
    }
}

void BinArchiveWriter::writeBlock(const CmObject* object)
{
    const void* data = nullptr;
    uint32 size = 0;
    getBinaryBlock(object, data, size);
    isWhole = isWhole && size <= static_cast<uint32>(std::numeric_limits<int32>::max());
    writeKind(BinaryKind::kBlock);
    writeNumber<int32>(static_cast<int32>(size));
    writeBytes(data, size);
}

bool BinArchiveWriter::writeObjects(const CmObject* list)
{
    const auto* objects = static_cast<const FObjectList*>(list);
    writeKind(BinaryKind::kObjectList);
    writeNumber<int32>(objects->total());
    for (int i = 0; i < objects->total(); i++)
        if (!writeReference(objects->at(i)))
            return false;
    return true;
}

bool BinArchiveWriter::writeTrees(const CmObject* list)
{
    const auto* trees = static_cast<const FSubList*>(list);
    writeKind(BinaryKind::kSubList);
    writeNumber<int32>(trees->total());
    for (int i = 0; i < trees->total(); i++)
        if (!writeAttributes(*trees->at(i)))
            return false;
    return true;
}

void BinArchiveWriter::writeNumbers(const CmObject* list, ArchivedKind kind)
{
    const bool isInteger = kind == ArchivedKind::kIntList;
    const int count = static_cast<const FAttrList*>(list)->total();
    writeKind(isInteger ? BinaryKind::kIntList : BinaryKind::kFloatList);
    writeNumber<int32>(count);
    for (int i = 0; i < count; i++)
        if (isInteger)
            writeNumber<int64>(static_cast<const FIntList*>(list)->at(i));
        else
            writeNumber<double>(static_cast<const FFloatList*>(list)->at(i));
}

void BinArchiveWriter::writeStrings(const CmObject* list)
{
    const auto* texts = static_cast<const FStringList*>(list);
    writeKind(BinaryKind::kStringList);
    writeNumber<int32>(texts->total());
    for (int i = 0; i < texts->total(); i++)
        writeText16(texts->at(i));
}

// Values. Texts have the form of FString::store.

void BinArchiveWriter::writeKind(BinaryKind kind)
{
    writeNumber<uint16>(static_cast<uint16>(kind));
}

void BinArchiveWriter::writeText8(const char* stored)
{
    writeStored(stored, stored ? static_cast<uint32>(strlen(stored)) : 0, false);
}

void BinArchiveWriter::writeText16(const char16* stored)
{
    const int length = stored ? asciiLength(stored) : 0;
    if (length >= 0 && text.grow(static_cast<uint32>(length)))
    {
        for (int i = 0; i < length; i++)
            text.ptr()[i] = static_cast<char>(stored[i]);
        return writeStored(text.ptr(), static_cast<uint32>(length), true);
    }
    FString converted(stored);
    isWhole = converted.toMultiByte(kEncodingUtf8) && isWhole;
    writeStored(converted.text8(), converted.length(), true);
}

void BinArchiveWriter::writeStored(const char* stored, uint32 length, bool isUtf8)
{
    if (length == 0)
        return writeNumber<int32>(0);
    const uint32 size = length + 1 + (isUtf8 ? kUtf8MarkSize : 0);
    isWhole = isWhole && size <= kMaxBinaryText;
    writeNumber<int32>(static_cast<int32>(size));
    writeBytes(stored, length);
    writeBytes("", 1);
    if (isUtf8)
        writeBytes(kUtf8Mark, kUtf8MarkSize);
}

template <class T>
void BinArchiveWriter::writeNumber(T value)
{
    char bytes[sizeof(T)];
    memcpy(bytes, &value, sizeof(T));
    if (stream.getByteOrder() != 0)
        std::reverse(bytes, bytes + sizeof(T));
    writeBytes(bytes, sizeof(T));
}

void BinArchiveWriter::writeBytes(const void* data, uint32 size)
{
    if (size > block.getFree())
        flush();
    if (size > block.getFree())
    {
        isWhole = isWhole && stream.writeRaw(data, size) == int64{size};
        return;
    }
    if (size > 0)
        block.put(data, size);
}

void BinArchiveWriter::flush()
{
    isWhole = isWhole && stream.writeRaw(block.ptr(), block.getFillSize()) == int64{block.getFillSize()};
    block.flush();
}

bool BinArchiveWriter::finish()
{
    flush();
    stream.flush();
    return isWhole && stream.verify();
}
