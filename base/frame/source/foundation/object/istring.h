#pragma once

#include "foundation/object/funknown.h"

/// A text that crosses a component boundary; its width may change at each call.
class IString : public FUnknown
{
public:
    virtual void setText8(const char* text) = 0;
    virtual void setText16(const char16* text) = 0;
    virtual const char* getText8() = 0;
    virtual const char16* getText16() = 0;
    /// Adopts a `malloc`ed buffer.
    virtual void take(void* text, bool isWide) = 0;
    virtual bool isWideString() const = 0;

    DECLARE_INTERFACE_ID
};

/// The narrow way to hand a text back.
class IStringResult : public FUnknown
{
public:
    virtual void setText(const char* text) = 0;

    DECLARE_INTERFACE_ID
};
