#pragma once

#include "foundation/object/funknown.h"

class ConstString;
class String;

/// A named message that carries values by name.
///
/// Texts are copied; objects are held by reference. What a getter returns belongs to the message. One thread at a
/// time.
class IMessage : public FUnknown
{
public:
    virtual void addString8(const char* id, const char* text) = 0;
    /// Null where there is no such text; so with the other getters that give a pointer.
    virtual const char* getString8(const char* id) = 0;
    virtual void addString16(const char* id, const char16* text) = 0;
    virtual const char16* getString16(const char* id) = 0;
    virtual void addUnknown(const char* id, FUnknown* object) = 0;
    virtual FUnknown* getUnknown(const char* id) = 0;
    virtual bool hasMessageID(const char* type) = 0;
    virtual const char* getMessageID() = 0;
    /// The text must outlive the message: it is not copied.
    virtual void setMessageID(const char* type) = 0;
    virtual void addInt(const char* id, int64 value) = 0;
    /// 0, or -1 without a number of this name; `value` is then left as it is. So with `getFloat`.
    virtual int32 getInt(const char* id, int64* value) = 0;
    virtual void addFloat1(const char* id, double value) = 0;
    virtual int32 getFloat(const char* id, double* value) = 0;

    DECLARE_INTERFACE_ID
};

/// Adds texts of either width. One thread at a time.
class IMessage2 : public IMessage
{
public:
    virtual void addTString(const char* id, const ConstString& text) = 0;
    /// 0, or -1 and an empty `result` without a text of this name.
    virtual int32 getTString(const char* id, String& result) = 0;

    DECLARE_INTERFACE_ID
};
