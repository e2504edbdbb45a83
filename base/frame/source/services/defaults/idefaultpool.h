#pragma once

#include "foundation/object/funknown.h"

class ConstString;
class String;

/// User settings for components: values by group and key.
///
/// Setting makes the group; reading gives false or null where there is no such group or key. Texts and objects that
/// are read are borrowed and hold until the value is changed. Main thread.
class IDefaultPool : public FUnknown
{
public:
    virtual bool setLong(const char* group, const char* key, int32 value) = 0;
    virtual bool getLong(const char* group, const char* key, int32& value) const = 0;
    virtual bool setLongLong(const char* group, const char* key, int64 value) = 0;
    virtual bool getLongLong(const char* group, const char* key, int64& value) const = 0;
    virtual bool setDouble(const char* group, const char* key, double value) = 0;
    virtual bool getDouble(const char* group, const char* key, double& value) const = 0;
    virtual bool setString8(const char* group, const char* key, const char* text) = 0;
    virtual const char* getString8(const char* group, const char* key) const = 0;
    virtual bool setString16(const char* group, const char* key, const char16* text) = 0;
    virtual const char16* getString16(const char* group, const char* key) const = 0;

    DECLARE_INTERFACE_ID
};

/// Texts of either width.
class IDefaultPool2 : public IDefaultPool
{
public:
    virtual bool setTString(const char* group, const char* key, const ConstString& text) = 0;
    virtual bool getTString(const char* group, const char* key, String& text) const = 0;

    DECLARE_INTERFACE_ID
};

/// Objects. The pool adds a reference of its own.
class IDefaultPool3 : public IDefaultPool2
{
public:
    virtual bool setObject(const char* group, const char* key, FUnknown* object) = 0;
    virtual FUnknown* getObject(const char* group, const char* key) const = 0;

    DECLARE_INTERFACE_ID
};
