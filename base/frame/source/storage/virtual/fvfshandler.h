#pragma once

#include "foundation/object/cmobject.h"

class FFileSystem;
class FFileType;
class FPath;

/// Says how files of a type are mounted. Immutable.
class FVfsHandler : public CmObject
{
    DECLARE_COPYABLE(FVfsHandler, CmObject)

    /// Opens the file; null where that fails. The caller gets the reference.
    using Factory = FFileSystem* (*)(FPath* path);

    /// The type must outlive the handler.
    FVfsHandler(const FFileType* itsType, Factory itsFactory) : type(itsType), factory(itsFactory) {}

    const FFileType* getType() const { return type; }
    Factory getFactory() const { return factory; }

private:
    const FFileType* type;
    Factory factory;
};
