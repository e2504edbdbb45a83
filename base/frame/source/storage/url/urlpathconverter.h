#pragma once

#include "foundation/object/cmobject.h"

/// Makes an object of one class from one of another; found through the class factory.
class IObjectConverter
{
public:
    virtual ~IObjectConverter() = default;
    virtual bool canConvert(FUnknown* object, const char* className) = 0;
    /// A new object for the caller; null where it can't be converted.
    virtual FUnknown* convert(FUnknown* object, const char* className) = 0;

    /// Enters a converter, once; not owned. During start-up, which isn't locked.
    static void add(IObjectConverter* converter);
    /// Asks all converters in turn.
    static FUnknown* convertObject(FUnknown* object, const char* className);
};

/// Converts between FNPath and FUrl. One thread at a time.
class UrlPathConverter : public CmObject, public IObjectConverter
{
    DECLARE_CLASS(UrlPathConverter, CmObject)

    /// Lives as long as the process.
    static UrlPathConverter* instance();

    bool canConvert(FUnknown* object, const char* className) override;
    FUnknown* convert(FUnknown* object, const char* className) override;
};
