#pragma once

#include "foundation/object/funknown.h"

class FUrl;
class IBStream;

/// A URL, as it crosses a component boundary.
class IUrl : public FUnknown
{
public:
    virtual void setUrl(const char16* text) = 0;
    /// Opens it for reading; `stream` gets a reference for the caller, or null with a result that isn't 0.
    virtual int32 openStream(IBStream** stream) = 0;

    DECLARE_INTERFACE_ID
};

/// A stream that a handler of URLs opened, and that is closed through it.
class IUrlStream : public FUnknown
{
public:
    /// Borrowed.
    virtual FUrl* getUrl() = 0;

    DECLARE_INTERFACE_ID
};
