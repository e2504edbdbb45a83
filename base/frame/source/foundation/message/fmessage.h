#pragma once

#include "containers/sequence/cmarray.h"
#include "foundation/message/imessage.h"
#include "foundation/object/cmobject.h"
#include "foundation/object/iptr.h"
#include "foundation/text/cmstring.h"
#include "storage/attribute/fattributelist.h"
#include "storage/attribute/fstringidattribute.h"

/// A typed message with values by name: the one carrier of news between threads.
///
/// The type is a text that outlives the message, as a literal does; only a view of it is kept, but for a type that
/// was read from an archive. Texts and objects are held by the message. One thread at a time; posting hands a message
/// over.
class FMessage : public CmObject, public IMessage2
{
    DECLARE_CLASS(FMessage, CmObject)

    explicit FMessage(const char* messageType = nullptr);

    bool isType(const char* other) const;

    /// With `retain` the message holds a reference, otherwise the object must outlive it.
    void add(const char* id, CmObject* object, bool retain);
    /// The object of this name, borrowed, or null.
    CmObject* get(const char* id) const;
    void addPointer(const char* id, void* pointer);
    void* getPointer(const char* id) const;
    void addString(const char* id, const ConstString& text);
    /// A view that lasts as long as the value; empty where there is no such text.
    ConstString getString(const char* id) const;
    void addFloat(const char* id, double value);
    /// 0 where there is no such number; so with `getData`.
    double getFloat(const char* id) const;
    void addData(const char* id, int64 value);
    int64 getData(const char* id) const;
    bool contains(const char* id) const;
    void remove(const char* id);

    int32 queryInterface(const char* interfaceID, void** object) override;
    FORWARD_FUNKNOWN(CmObject)

    void addString8(const char* id, const char* text) override;
    const char* getString8(const char* id) override;
    void addString16(const char* id, const char16* text) override;
    const char16* getString16(const char* id) override;
    void addUnknown(const char* id, FUnknown* object) override;
    FUnknown* getUnknown(const char* id) override;
    bool hasMessageID(const char* messageType) override;
    const char* getMessageID() override;
    void setMessageID(const char* messageType) override;
    void addInt(const char* id, int64 value) override;
    int32 getInt(const char* id, int64* value) override;
    void addFloat1(const char* id, double value) override;
    int32 getFloat(const char* id, double* value) override;
    void addTString(const char* id, const ConstString& text) override;
    int32 getTString(const char* id, String& result) override;

    /// The type as a text, then the values in their order. False where a value is one that makes no sense elsewhere, as
    /// a bare pointer.
    bool externalize(FArchive& archive) const override;
    bool internalize(FArchive& archive) override;

private:
    FAttributeValue* textValue(const char* id) const;
    FAttributeValue* numberValue(const char* id) const;

    ConstString type;
    // A type that was read; copies share it.
    IPtr<CmString> readType;
    FAttributeList<FStringIDAttribute, const char*, CmArray> attributes;
};
