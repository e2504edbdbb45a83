#include "storage/archive/binarchivereader.h"

#include "foundation/text/fstring.h"
#include "storage/attribute/boundedread.h"
#include "storage/attribute/ffloatlist.h"
#include "storage/attribute/fintlist.h"
#include "storage/attribute/fobjectlist.h"
#include "storage/attribute/fstringlist.h"
#include "storage/attribute/fsublist.h"
#include "storage/stream/fmemorystream.h"

#include <algorithm>
#include <cstring>

namespace
{
constexpr uint32 kBlockSize = 16384;

bool isMark(const char* bytes)
{
    return memcmp(bytes, kUtf8Mark, kUtf8MarkSize) == 0;
}

/// Puts a new, empty object into an entry; what follows in the stream fills it.
template <class Class>
Class& makeObject(FAttributeValue& value)
{
    auto* made = new Class;
    value.setObj(made, FAttributeValue::kOwned);
    return *made;
}
} // namespace

BinArchiveReader::BinArchiveReader(FStream& source, Buffer& readAhead, Buffer& room)
    : stream(source),
      block(readAhead),
      text(room),
      canReadAhead(source.tell() >= 0)
{
    block.setSize(kBlockSize);
    block.flush();
    text.setSize(kMaxBinaryText + 1);
}

bool BinArchiveReader::finish()
{
    linker.link();
    return available() == 0 || stream.seek(-int64{available()}, kSeekCurrent) >= 0;
}

// Roots and objects

bool BinArchiveReader::readRoots(FStringAttributeArray& roots, FStringAttributeArray& globalRoots)
{
    int32 count = 0;
    if (!readCount(count))
        return false;
    for (int32 i = 0; i < count; i++)
        if (!readGlobalRoot(globalRoots))
            return false;
    if (!readCount(count))
        return false;
    for (int32 i = 0; i < count; i++)
        if (!readRoot(roots))
            return false;
    return true;
}

bool BinArchiveReader::readGlobalRoot(FStringAttributeArray& globalRoots)
{
    uint64 id = 0;
    if (!readKey() || !readNumber(id))
        return false;
    const IPtr<FXmlReference> reference = makeReference(id, nullptr);
    globalRoots.setObjAttribute(key.c_str(), reference, FAttributeValue::kBorrowed);
    uint64 storedID = 0;
    return linker.lookup(id) || (readInstance(storedID) && storedID == id);
}

bool BinArchiveReader::readRoot(FStringAttributeArray& roots)
{
    if (!readKey())
        return false;
    auto tree = adopt(new FAttributes);
    roots.setObjAttribute(key.c_str(), new FXmlInstance(0, nullptr, tree), FAttributeValue::kOwned);
    return readAttributes(*tree, nullptr);
}

bool BinArchiveReader::readInstance(uint64& id)
{
    std::string className;
    if (!readClassName(className) || !readNumber(id))
        return false;
    auto tree = adopt(new FAttributes);
    auto instance = adopt(new FXmlInstance(id, className.c_str(), tree));
    linker.addInstance(instance);
    return readAttributes(*tree, instance);
}

IPtr<FXmlReference> BinArchiveReader::makeReference(uint64 id, FXmlInstance* holder)
{
    auto reference = adopt(new FXmlReference(id));
    linker.addReference(reference, holder);
    return reference;
}

/// Null where the stream has no such thing.
IPtr<FXmlReference> BinArchiveReader::readReference(BinaryKind kind, FXmlInstance* holder)
{
    uint64 id = 0;
    const bool isRead = kind == BinaryKind::kFirstObject ? readInstance(id)
                                                         : kind == BinaryKind::kSeenObject && readNumber(id);
    return isRead ? makeReference(id, holder) : nullptr;
}

// Trees. What is being read hangs in its tree from the start, so that a failure leaves what came before it.

bool BinArchiveReader::readAttributes(FAttributes& attributes, FXmlInstance* holder)
{
    if (nesting >= FArchive::kMaxDepth)
        return false;
    nesting++;
    const bool isRead = readEntries(attributes, holder);
    nesting--;
    return isRead;
}

bool BinArchiveReader::readEntries(FAttributes& attributes, FXmlInstance* holder)
{
    int32 count = 0;
    if (!readCount(count))
        return false;
    for (int32 i = 0; i < count; i++)
        if (!readEntry(attributes, holder))
            return false;
    return true;
}

bool BinArchiveReader::readEntry(FAttributes& attributes, FXmlInstance* holder)
{
    uint16 type = 0;
    if (!readKey() || !readNumber(type))
        return false;
    int64 integer = 0;
    double number = 0;
    switch (type)
    {
    case FAttributeValue::kInteger:
        return readNumber(integer) && attributes.set(key.c_str(), static_cast<long long>(integer));
    case FAttributeValue::kFloat:
        return readNumber(number) && attributes.set(key.c_str(), number);
    case FAttributeValue::kString:
    case FAttributeValue::kString | FAttributeValue::kWide:
        return readText(attributes.entry(key.c_str()), type);
    case FAttributeValue::kObject:
    case FAttributeValue::kObject | FAttributeValue::kUnknown:
        return readObjectEntry(attributes.entry(key.c_str()), type, holder);
    default:
        return false;
    }
}

bool BinArchiveReader::readText(FAttributeValue& value, unsigned type)
{
    uint32 length = 0;
    bool isUtf8 = false;
    if (!readStored(length, isUtf8))
        return false;
    // An empty text is stored without its width.
    if (!isUtf8 && !(length == 0 && type & FAttributeValue::kWide))
    {
        value.setString8(text.ptr());
        return true;
    }
    FString wide;
    wide.fromUTF8(text.ptr());
    value.takeString(wide);
    return true;
}

bool BinArchiveReader::readObjectEntry(FAttributeValue& value, unsigned type, FXmlInstance* holder)
{
    uint16 kind = 0;
    if (!readNumber(kind))
        return false;
    switch (static_cast<BinaryKind>(kind))
    {
    case BinaryKind::kTree:
        return readAttributes(makeObject<FAttributes>(value), holder);
    case BinaryKind::kBlock:
        return readBlock(value);
    case BinaryKind::kIntList:
        return readNumbers<FIntList, int64, long long>(value);
    case BinaryKind::kFloatList:
        return readNumbers<FFloatList, double, double>(value);
    case BinaryKind::kStringList:
        return readStrings(value);
    case BinaryKind::kSubList:
        return readTrees(value, holder);
    case BinaryKind::kObjectList:
        return readObjects(value, holder);
    default:
        break;
    }
    const IPtr<FXmlReference> reference = readReference(static_cast<BinaryKind>(kind), holder);
    value.setObj(reference, FAttributeValue::kBorrowed | (type & FAttributeValue::kUnknown));
    return reference.get() != nullptr;
}

bool BinArchiveReader::readBlock(FAttributeValue& value)
{
    auto& result = makeObject<FMemoryStream>(value);
    int32 size = 0;
    if (!readCount(size))
        return false;
    while (size > 0)
    {
        if (available() == 0 && !refill(static_cast<uint32>(size)))
            return false;
        const uint32 piece = std::min(available(), static_cast<uint32>(size));
        if (result.writeRaw(block.ptr() + used, piece) != int64{piece})
            return false;
        used += piece;
        size -= static_cast<int32>(piece);
    }
    result.rewind();
    return true;
}

// Queues

template <class List, class Stored, class Value>
bool BinArchiveReader::readNumbers(FAttributeValue& value)
{
    auto& list = makeObject<List>(value);
    int32 count = 0;
    if (!readCount(count))
        return false;
    for (int32 i = 0; i < count; i++)
    {
        Stored number = 0;
        if (!readNumber(number))
            return false;
        list.queue(static_cast<Value>(number));
    }
    return true;
}

bool BinArchiveReader::readStrings(FAttributeValue& value)
{
    auto& list = makeObject<FStringList>(value);
    int32 count = 0;
    if (!readCount(count))
        return false;
    for (int32 i = 0; i < count; i++)
    {
        uint32 length = 0;
        bool isUtf8 = false;
        if (!readStored(length, isUtf8))
            return false;
        FString wide;
        if (isUtf8 && wide.fromUTF8(text.ptr()))
            list.queue(wide.text16(), true, true);
        else
            list.queue(text.ptr(), false, true);
    }
    return true;
}

bool BinArchiveReader::readTrees(FAttributeValue& value, FXmlInstance* holder)
{
    auto& list = makeObject<FSubList>(value);
    int32 count = 0;
    if (!readCount(count))
        return false;
    for (int32 i = 0; i < count; i++)
    {
        auto tree = adopt(new FAttributes);
        list.queue(tree, false);
        if (!readAttributes(*tree, holder))
            return false;
    }
    return true;
}

bool BinArchiveReader::readObjects(FAttributeValue& value, FXmlInstance* holder)
{
    auto& list = makeObject<FObjectList>(value);
    int32 count = 0;
    if (!readCount(count))
        return false;
    for (int32 i = 0; i < count; i++)
    {
        uint16 kind = 0;
        if (!readNumber(kind))
            return false;
        const IPtr<FXmlReference> reference = readReference(static_cast<BinaryKind>(kind), holder);
        if (!reference)
            return false;
        list.queue(reference, false);
    }
    return true;
}

// Values

/// Reads a text in the form of FString::store into the room for texts, terminated.
bool BinArchiveReader::readStored(uint32& length, bool& isUtf8)
{
    int32 size = 0;
    if (!readNumber(size) || size > kMaxBinaryText)
        return false;
    char* bytes = text.ptr();
    const uint32 count = size > 0 ? static_cast<uint32>(size) : 0;
    if (!readBytes(bytes, count))
        return false;
    bytes[count] = 0;
    isUtf8 = count > kUtf8MarkSize && (isMark(bytes + count - kUtf8MarkSize) || isMark(bytes));
    if (isUtf8)
    {
        const bool isMarkFirst = !isMark(bytes + count - kUtf8MarkSize);
        if (isMarkFirst)
            memmove(bytes, bytes + kUtf8MarkSize, count - kUtf8MarkSize);
        bytes[count - kUtf8MarkSize - 1] = 0;
    }
    length = static_cast<uint32>(strlen(bytes));
    return true;
}

bool BinArchiveReader::readKey()
{
    uint32 length = 0;
    bool isUtf8 = false;
    if (!readStored(length, isUtf8))
        return false;
    key.assign(text.ptr(), length);
    return true;
}

bool BinArchiveReader::readClassName(std::string& name)
{
    char bytes[kMaxStoredName + 1];
    int32 size = 0;
    if (!readNumber(size) || size < 1 || size > kMaxStoredName + 1)
        return false;
    if (!readBytes(bytes, static_cast<uint32>(size)) || bytes[size - 1] != 0)
        return false;
    name = bytes;
    return true;
}

bool BinArchiveReader::readCount(int32& count)
{
    return readNumber(count) && count >= 0;
}

template <class T>
bool BinArchiveReader::readNumber(T& value)
{
    char bytes[sizeof(T)];
    if (!readBytes(bytes, sizeof(T)))
        return false;
    if (stream.getByteOrder() != 0)
        std::reverse(bytes, bytes + sizeof(T));
    memcpy(&value, bytes, sizeof(T));
    return true;
}

bool BinArchiveReader::readBytes(void* data, uint32 size)
{
    auto* target = static_cast<char*>(data);
    while (size > 0)
    {
        if (available() == 0 && !refill(size))
            return false;
        const uint32 piece = std::min(available(), size);
        memcpy(target, block.ptr() + used, piece);
        target += piece;
        used += piece;
        size -= piece;
    }
    return true;
}

bool BinArchiveReader::refill(uint32 wanted)
{
    used = 0;
    block.flush();
    const int64 size = canReadAhead ? kBlockSize : std::min(wanted, kBlockSize);
    const int64 count = stream.readRaw(block.ptr(), size);
    return count > 0 && block.setFillSize(static_cast<uint32>(count));
}
