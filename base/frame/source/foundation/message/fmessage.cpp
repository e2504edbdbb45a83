#include "foundation/message/fmessage.h"

#include <cstring>

DEFINE_CLASS(FMessage, CmObject)
DEFINE_INTERFACE_CLASS(IMessage, FMessage)

DEFINE_INTERFACE_ID(IMessage, 0x5E1B7A90, 0x42C34D6F, 0x8B0E91D2, 0x6A5F3C78)
DEFINE_INTERFACE_ID(IMessage2, 0xC07D2E15, 0x8F3B4A92, 0xB46D1E07, 0x59A8F3B1)

FMessage::FMessage(const char* messageType) : type(messageType) {}

bool FMessage::isType(const char* other) const
{
    return other && strcmp(type.text8(), other) == 0;
}

void FMessage::add(const char* id, CmObject* object, bool retain)
{
    attributes.setObjAttribute(id, object, retain ? FAttributeValue::kBorrowed : 0u);
}

CmObject* FMessage::get(const char* id) const
{
    return attributes.getObjAttribute(id);
}

void FMessage::addPointer(const char* id, void* pointer)
{
    attributes.setPointerAttribute(id, pointer);
}

void* FMessage::getPointer(const char* id) const
{
    const FAttributeValue* value = attributes.getAttribute(id);
    return value ? value->getPointer() : nullptr;
}

void FMessage::addString(const char* id, const ConstString& text)
{
    attributes.entry(id).setTString(text, false);
}

ConstString FMessage::getString(const char* id) const
{
    FAttributeValue* value = textValue(id);
    if (!value)
        return ConstString();
    return value->isWide() ? ConstString(value->getString16()) : ConstString(value->getString8());
}

void FMessage::addFloat(const char* id, double value)
{
    attributes.setFloatAttribute(id, value);
}

double FMessage::getFloat(const char* id) const
{
    const FAttributeValue* value = numberValue(id);
    return value ? value->getFloat() : 0;
}

void FMessage::addData(const char* id, int64 value)
{
    attributes.setLongAttribute(id, value);
}

int64 FMessage::getData(const char* id) const
{
    const FAttributeValue* value = numberValue(id);
    return value ? value->getLong() : 0;
}

bool FMessage::contains(const char* id) const
{
    return attributes.contains(id);
}

void FMessage::remove(const char* id)
{
    attributes.removeAttribute(id);
}

FAttributeValue* FMessage::textValue(const char* id) const
{
    FAttributeValue* value = attributes.getAttribute(id);
    return value && value->isString() ? value : nullptr;
}

FAttributeValue* FMessage::numberValue(const char* id) const
{
    FAttributeValue* value = attributes.getAttribute(id);
    return value && value->isNumber() ? value : nullptr;
}

int32 FMessage::queryInterface(const char* interfaceID, void** object)
{
    if (isSameInterface(interfaceID, IMessage::iid))
        return offerInterface<IMessage>(this, object);
    if (isSameInterface(interfaceID, IMessage2::iid))
        return offerInterface<IMessage2>(this, object);
    return CmObject::queryInterface(interfaceID, object);
}

void FMessage::addString8(const char* id, const char* text)
{
    attributes.setStringAttribute(id, text, false);
}

const char* FMessage::getString8(const char* id)
{
    FAttributeValue* value = textValue(id);
    return value ? value->getString8() : nullptr;
}

void FMessage::addString16(const char* id, const char16* text)
{
    attributes.setStringAttribute(id, text, false);
}

const char16* FMessage::getString16(const char* id)
{
    FAttributeValue* value = textValue(id);
    return value ? value->getString16() : nullptr;
}

void FMessage::addUnknown(const char* id, FUnknown* object)
{
    attributes.setUnknownAttribute(id, object, FAttributeValue::kBorrowed);
}

FUnknown* FMessage::getUnknown(const char* id)
{
    const FAttributeValue* value = attributes.getAttribute(id);
    return value ? value->getUnknown() : nullptr;
}

bool FMessage::hasMessageID(const char* messageType)
{
    return isType(messageType);
}

const char* FMessage::getMessageID()
{
    return type.text8();
}

void FMessage::setMessageID(const char* messageType)
{
    type = ConstString(messageType);
}

void FMessage::addInt(const char* id, int64 value)
{
    addData(id, value);
}

int32 FMessage::getInt(const char* id, int64* value)
{
    const FAttributeValue* number = numberValue(id);
    if (!number)
        return -1;
    *value = number->getLong();
    return kResultOk;
}

void FMessage::addFloat1(const char* id, double value)
{
    addFloat(id, value);
}

int32 FMessage::getFloat(const char* id, double* value)
{
    const FAttributeValue* number = numberValue(id);
    if (!number)
        return -1;
    *value = number->getFloat();
    return kResultOk;
}

void FMessage::addTString(const char* id, const ConstString& text)
{
    addString(id, text);
}

int32 FMessage::getTString(const char* id, String& result)
{
    const FAttributeValue* value = textValue(id);
    if (value && value->getString(result))
        return kResultOk;
    result.assign(ConstString());
    return -1;
}

bool FMessage::externalize(FArchive& archive) const
{
    return FString(type).externalize(archive) && attributes.externalize(archive);
}

bool FMessage::internalize(FArchive& archive)
{
    const auto read = adopt(new CmString);
    if (!read->internalize(archive))
        return false;
    readType = read;
    type = ConstString(readType->text8());
    return attributes.internalize(archive);
}
