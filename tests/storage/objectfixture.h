#pragma once

#include "foundation/object/iptr.h"
#include "foundation/text/fstring.h"
#include "storage/attribute/farchive.h"
#include "storage/attribute/fattributes.h"
#include "storage/stream/fmemorystream.h"

#include <string>

/// An object that stores a number, a text and another object, both ways, and counts how many of its kind live.
class StoredNode : public CmObject
{
    DECLARE_CLASS(StoredNode, CmObject)

    explicit StoredNode(int itsNumber = 0, CmObject* itsNext = nullptr) : number(itsNumber), next(itsNext)
    {
        alive++;
    }
    StoredNode(const StoredNode& other) : CmObject(other), number(other.number), next(other.next) { alive++; }
    ~StoredNode() override { alive--; }

    bool storeAttributes(FAttributes& attributes) const override
    {
        attributes.set("Number", number);
        attributes.setObject("Next", next);
        return !refusesToStore;
    }
    bool restoreAttributes(FAttributes& attributes) override
    {
        // Damaged bytes can name the node itself; such a ring would never be released.
        CmObject* stored = attributes.getObject("Next", "StoredNode");
        next = stored != this ? stored : nullptr;
        return attributes.get("Number", number);
    }
    bool externalize(FArchive& archive) const override
    {
        return !refusesToStore && archive.getStream().writeInt32(number) && archive.writeObject(next, shares);
    }
    bool internalize(FArchive& archive) override
    {
        if (!archive.getStream().readInt32(number))
            return false;
        next = IPtr<CmObject>::adopt(archive.readObject("StoredNode", shares));
        return archive.getErrors().empty();
    }

    StoredNode* nextNode() const { return FCast(StoredNode, next.get()); }

    inline static int alive = 0;
    inline static bool shares = true;
    bool refusesToStore = false;
    int number;
    IPtr<CmObject> next;
};

inline MetaClass StoredNode::__fClass("StoredNode", &StoredNode::__fCreate, nullptr, &CmObject::__fClass, 3);
inline FUnknown* StoredNode::__fCreate()
{
    return static_cast<CmObject*>(new StoredNode);
}

/// What a memory stream holds.
inline std::string contentOf(const FMemoryStream& stream)
{
    return std::string(stream.getData() ? stream.getData() : "", static_cast<size_t>(stream.getSize()));
}

inline IPtr<FMemoryStream> streamOf(const std::string& bytes)
{
    auto stream = adopt(new FMemoryStream);
    stream->writeRaw(bytes.data(), static_cast<int64>(bytes.size()));
    stream->rewind();
    return stream;
}

/// Bytes as hexadecimal pairs with blanks, so that a failed comparison can be read.
inline std::string hex(const std::string& bytes)
{
    std::string text;
    for (const char byte : bytes)
    {
        char pair[4];
        snprintf(pair, sizeof(pair), "%02X ", static_cast<unsigned>(static_cast<uint8>(byte)));
        text += pair;
    }
    return text;
}

/// A memory stream that takes so many bytes and no more, like a full disk.
class FullStream : public FMemoryStream
{
    DECLARE_COPYABLE(FullStream, FMemoryStream)

    explicit FullStream(int64 room) : left(room) {}

    int64 writeRaw(const void* source, int64 count) override
    {
        if (count > left)
            return -1;
        left -= count;
        return FMemoryStream::writeRaw(source, count);
    }

private:
    int64 left;
};
