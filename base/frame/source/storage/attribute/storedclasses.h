#pragma once

#include "foundation/object/iptr.h"
#include "storage/attribute/farchive.h"

#include <string>

class CmObject;
class MetaClass;

// How archives come from a stored class to an object.

/// The class that was stored under this name; null where nobody knows it.
MetaClass* findStoredClass(const std::string& name);

/// Makes an object of the class to be read; null where there is no class, it can't be made, or it is no `className`,
/// which may be null.
IPtr<CmObject> createStoredObject(const MetaClass* meta, const char* className);

/// Counts how deep objects hold one another while one is written or read.
struct FArchiveDepthScope
{
    explicit FArchiveDepthScope(int& counter) : depth(counter) { depth++; }
    ~FArchiveDepthScope() { depth--; }
    FArchiveDepthScope(const FArchiveDepthScope&) = delete;
    FArchiveDepthScope& operator=(const FArchiveDepthScope&) = delete;
    bool isTooDeep() const { return depth > FArchive::kMaxDepth; }

    int& depth;
};
