#pragma once

#include "foundation/object/iptr.h"
#include "storage/attribute/fattributes.h"

// How the archives see the objects that attribute trees hold.

/// The forms in which an object of a tree goes into a file.
enum class ArchivedKind
{
    kNothing,
    kTree,
    kBinary,
    kObjectList,
    kSubList,
    kIntList,
    kFloatList,
    kStringList,
    kObject
};

ArchivedKind getArchivedKind(const CmObject* object);

/// The object of an entry, borrowed; null where it holds none that can be stored.
CmObject* getArchivedObject(const FAttributeValue& value);

/// Whether an entry goes into a file at all: bare pointers and what only a component knows don't.
bool isArchived(const FAttributeValue& value);

/// The one object that stands for all places which refer to the same: a placeholder's object, if it was made, else
/// the placeholder with the stored tree. Null for a reference that leads nowhere. Borrowed.
CmObject* getSharedObject(CmObject* object);

/// The number that stands for the object in the file.
inline uint64 getArchiveID(const CmObject* object)
{
    return reinterpret_cast<uintptr_t>(object);
}

/// Of a result of `getSharedObject`. Borrowed.
const char* getArchivedClass(const CmObject* object);

/// What the object stores of itself, or was stored of it. Null where it can't be stored.
IPtr<FAttributes> getArchivedTree(const CmObject* object);
