#pragma once

#include "foundation/object/funknown.h"

/// A list of named values that crosses a component boundary. Results: `kResultOk`, or 1 where there is no such value.
///
/// What is read is borrowed and holds until the value is changed.
class IAttributeList : public FUnknown
{
public:
    virtual int32 setIntAttribute(const char* key, int64 value) = 0;
    virtual int32 getIntAttribute(const char* key, int64* value) = 0;
    virtual int32 setFloatAttribute(const char* key, double value) = 0;
    virtual int32 getFloatAttribute(const char* key, double* value) = 0;
    virtual int32 setStringAttribute(const char* key, const char16* text) = 0;
    virtual int32 getStringAttribute(const char* key, const char16** text) = 0;
    /// Copies the block.
    virtual int32 setBinaryAttribute(const char* key, const void* data, uint32 size) = 0;
    virtual int32 getBinaryAttribute(const char* key, const void** data, uint32* size) = 0;
    /// Adds a reference.
    virtual int32 setObjectAttribute(const char* key, FUnknown* object) = 0;
    virtual int32 getObjectAttribute(const char* key, FUnknown** object) = 0;
    virtual int32 removeAttribute(const char* key) = 0;
    /// Sets each value in `target` too.
    virtual int32 addAllTo(IAttributeList* target) = 0;

    DECLARE_INTERFACE_ID
};
