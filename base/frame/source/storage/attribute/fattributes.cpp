#include "storage/attribute/fattributes.h"

#include "containers/value/cmbuffer.h"
#include "foundation/object/cmdelegatingunknown.h"
#include "foundation/object/fvariant.h"
#include "foundation/text/string.h"
#include "storage/attribute/fattrbuffer.h"
#include "storage/attribute/fcmobjectstripper.h"
#include "storage/attribute/fxmlobject.h"
#include "storage/attribute/ringguard.h"
#include "storage/stream/fmemorystream.h"

#include <algorithm>
#include <cstring>

DEFINE_CLASS(FAttributes, CmObject)

/// The name under which trees have been stored as objects from the first version on.
static MetaClass FAttributesPersistentClass(&FAttributes::__fClass, "Attributes");

FAttributes::FAttributes() = default;

FAttributes::FAttributes(const FAttributes& other)
    : CmObject(other),
      entries(other.entries ? adopt(new FStringAttributeList(*other.entries)) : nullptr)
{
}

FAttributes& FAttributes::operator=(const FAttributes& other)
{
    if (this != &other)
        entries = other.entries ? adopt(new FStringAttributeList(*other.entries)) : nullptr;
    return *this;
}

FAttributes::~FAttributes() = default;

int32 FAttributes::queryInterface(const char* interfaceID, void** object)
{
    if (isSameInterface(interfaceID, IAttributes::iid))
        return offerInterface<IAttributes>(this, object);
    return CmObject::queryInterface(interfaceID, object);
}

// Entries

FStringIDAttribute& FAttributes::entry(const char* key)
{
    if (!entries)
        entries = adopt(new FStringAttributeList);
    return entries->entry(key);
}

FStringIDAttribute* FAttributes::find(const char* key) const
{
    return entries ? entries->getAttribute(key) : nullptr;
}

FStringIDAttribute* FAttributes::findNumber(const char* key) const
{
    FStringIDAttribute* found = find(key);
    return found && found->isNumber() ? found : nullptr;
}

FStringIDAttribute* FAttributes::entryAt(int index) const
{
    return entries ? entries->entryAt(index) : nullptr;
}

bool FAttributes::removeEntryAt(int index)
{
    return entries && entries->removeAt(index);
}

bool FAttributes::containsAttribute(const char* key) const
{
    return find(key) != nullptr;
}

bool FAttributes::removeAttribute(const char* key)
{
    return entries && entries->removeAttribute(key);
}

void FAttributes::removeAll()
{
    entries = nullptr;
}

void FAttributes::stripObjects()
{
    FCmObjectStripper().stripCmObjects(*this);
}

void FAttributes::addAllFrom(const FAttributes& other)
{
    if (this == &other)
        return;
    for (int i = 0; i < other.total(); i++)
    {
        const FStringIDAttribute& source = *other.entryAt(i);
        static_cast<FAttributeValue&>(entry(source.getKey())) = source;
    }
}

void FAttributes::takeAllFrom(FAttributes& other)
{
    if (this == &other)
        return;
    const IPtr<FStringAttributeList> taken = std::move(other.entries);
    if (isEmpty())
        entries = taken;
    else
        for (int i = 0; taken && i < taken->total(); i++)
        {
            taken->entryAt(i)->addRef();
            entries->takeEntry(taken->entryAt(i));
        }
}

// Single values

bool FAttributes::set(const char* key, long long value)
{
    entry(key).setLong(value);
    return true;
}

bool FAttributes::set(const char* key, double value)
{
    entry(key).setFloat(value);
    return true;
}

bool FAttributes::set(const char* key, const ConstString& text, bool copy)
{
    entry(key).setTString(text, !copy);
    return true;
}

bool FAttributes::setString8(const char* key, const char* text, bool copy)
{
    entry(key).setString(text, !copy);
    return true;
}

bool FAttributes::setString16(const char* key, const char16* text, bool copy)
{
    entry(key).setString(text, !copy);
    return true;
}

bool FAttributes::set(const char* key, const FVariant& value)
{
    switch (value.getType())
    {
    case FVariant::kInteger:
        return set(key, static_cast<long long>(value.getInt()));
    case FVariant::kFloat:
        return set(key, value.getFloat());
    case FVariant::kString8:
        return setString8(key, value.getString8());
    case FVariant::kString16:
        return setString16(key, value.getString16());
    case FVariant::kObject:
        return setUnknown(key, value.getObject());
    default:
        return false;
    }
}

bool FAttributes::setUnknown(const char* key, FUnknown* unknown)
{
    if (!unknown)
        return false;
    if (CmObject* object = toCmObject(unknown))
        return setObject(key, object);
    entry(key).setObj(new CmDelegatingUnknown(unknown, nullptr),
                      FAttributeValue::kOwned | FAttributeValue::kUnknown);
    return true;
}

bool FAttributes::setObject(const char* key, CmObject* object, bool takeOver)
{
    if (!object)
    {
        removeAttribute(key);
        return true;
    }
    entry(key).setObj(object, takeOver ? FAttributeValue::kOwned : FAttributeValue::kBorrowed);
    return true;
}

bool FAttributes::setAttributes(const char* key, FAttributes* attributes, bool takeOver)
{
    return setObject(key, attributes, takeOver);
}

bool FAttributes::setMember(const char* key, const CmObject& object)
{
    auto tree = adopt(new FAttributes);
    return object.storeAttributes(*tree) && setObject(key, tree.take(), true);
}

bool FAttributes::setBinary(const char* key, const void* data, unsigned int size, bool copy)
{
    return setObject(key, new FAttrBuffer(data, size, copy), true);
}

bool FAttributes::setBinaryData(const char* key, const void* data, uint32 size, bool copy)
{
    return setBinary(key, data, size, copy);
}

// Reading

bool FAttributes::get(const char* key, long long& value) const
{
    const FAttributeValue* found = findNumber(key);
    if (!found)
        return false;
    value = found->getLong();
    return true;
}

bool FAttributes::get(const char* key, double& value) const
{
    const FAttributeValue* found = findNumber(key);
    if (!found)
        return false;
    value = found->getFloat();
    return true;
}

bool FAttributes::get(const char* key, float& value) const
{
    double wide = 0;
    if (!get(key, wide))
        return false;
    value = static_cast<float>(wide);
    return true;
}

bool FAttributes::get(const char* key, String& text) const
{
    const FAttributeValue* found = find(key);
    return found && found->getString(text);
}

bool FAttributes::get(const char* key, FVariant& value) const
{
    FAttributeValue* found = find(key);
    if (!found)
        return false;
    if (found->getType() & FAttributeValue::kInteger)
        value.setInt(found->getLong());
    else if (found->isNumber())
        value.setFloat(found->getFloat());
    else if (found->getType() & FAttributeValue::kString && found->isWide())
        value.setString16(found->getString16());
    else if (found->getType() & FAttributeValue::kString)
        value.setString8(found->getString8());
    else if (FUnknown* unknown = found->getObj() ? resolveUnknown(found->getObj()) : found->getUnknown())
        value.setObject(unknown);
    else
        return false;
    return true;
}

long long FAttributes::getInt(const char* key) const
{
    long long value = 0;
    get(key, value);
    return value;
}

double FAttributes::getFloat(const char* key) const
{
    double value = 0;
    get(key, value);
    return value;
}

const char* FAttributes::getString8(const char* key) const
{
    FAttributeValue* found = find(key);
    return found ? found->getString8() : nullptr;
}

const char16* FAttributes::getString16(const char* key) const
{
    FAttributeValue* found = find(key);
    return found ? found->getString16() : nullptr;
}

CmObject* FAttributes::getObject(const char* key, const char* className) const
{
    const FAttributeValue* found = find(key);
    return found ? resolveObject(found->getObj(), className) : nullptr;
}

FAttributes* FAttributes::getAttributes(const char* key) const
{
    const FAttributeValue* found = find(key);
    return found ? FCast(FAttributes, found->getObj()) : nullptr;
}

FAttributes* FAttributes::getObjectAttributes(const char* key) const
{
    const FAttributeValue* found = find(key);
    if (auto* placeholder = found ? FCast(FXmlObject, found->getObj()) : nullptr)
        return placeholder->getAttributes();
    return getAttributes(key);
}

bool FAttributes::getMember(const char* key, CmObject& object) const
{
    FAttributes* tree = getAttributes(key);
    return tree && object.restoreAttributes(*tree);
}

bool FAttributes::getBlock(const char* key, const void*& data, uint32& size) const
{
    const FAttributeValue* found = find(key);
    return found && getBinaryBlock(found->getObj(), data, size);
}

bool FAttributes::getBinary(const char* key, void* data, unsigned int size) const
{
    const void* block = nullptr;
    uint32 blockSize = 0;
    if (!getBlock(key, block, blockSize))
        return false;
    if (blockSize > 0 && size > 0)
        memcpy(data, block, std::min<size_t>(size, blockSize));
    return true;
}

bool FAttributes::getBinaryData(const char* key, void* data, uint32 size) const
{
    return getBinary(key, data, size);
}

uint32 FAttributes::getBinarySize(const char* key) const
{
    const void* block = nullptr;
    uint32 size = 0;
    return getBlock(key, block, size) ? size : 0;
}

bool getBinaryBlock(const CmObject* object, const void*& data, uint32& size)
{
    if (const auto* block = FCast(FAttrBuffer, object))
    {
        data = block->getData();
        size = block->getSize();
    }
    else if (const auto* buffer = FCast(CmBuffer, object))
    {
        data = buffer->ptr();
        size = buffer->getFillSize();
    }
    else if (const auto* stream = FCast(FMemoryStream, object))
    {
        data = stream->getData();
        size = static_cast<uint32>(stream->getSize());
    }
    else
        return false;
    return true;
}

// Paths

bool FAttributes::extractValue(const char* path, FVariant& value) const
{
    if (!path)
        return false;
    if (containsAttribute(path))
        return get(path, value);
    const char* dot = strchr(path, '.');
    const FAttributes* tree = dot ? getAttributes(std::string(path, dot).c_str()) : nullptr;
    return tree && tree->extractValue(dot + 1, value);
}

FAttributes* FAttributes::extractAttributes(const char* path) const
{
    if (!path)
        return nullptr;
    if (FAttributes* tree = getAttributes(path))
        return tree;
    const char* dot = strchr(path, '.');
    const FAttributes* tree = dot ? getAttributes(std::string(path, dot).c_str()) : nullptr;
    return tree ? tree->extractAttributes(dot + 1) : nullptr;
}

// Storage of the tree itself

bool FAttributes::externalize(FArchive& archive) const
{
    return entries ? entries->externalize(archive) : archive.writeCount(0);
}

bool FAttributes::internalize(FArchive& archive)
{
    entries = adopt(new FStringAttributeList);
    const RingGuard guard(*this);
    const bool isRead = entries->internalize(archive);
    if (!guard.isRing())
        return isRead;
    entries = nullptr;
    return false;
}

bool FAttributes::storeAttributes(FAttributes& attributes) const
{
    attributes.addAllFrom(*this);
    return true;
}

bool FAttributes::restoreAttributes(FAttributes& attributes)
{
    if (this == &attributes)
        return true;
    removeAll();
    addAllFrom(attributes);
    return true;
}
