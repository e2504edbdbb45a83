#pragma once

#include "foundation/object/cmobject.h"

class FAttributes;
class FXmlInstance;

/// Stands for an object that was read from an archive, until somebody asks for it.
///
/// Placeholders are equal, ordered and hashed by their `id`, the object's number within its file.
/// One thread at a time.
class FXmlObject : public CmObject
{
    DECLARE_ABSTRACT_CLASS(FXmlObject, CmObject)

    explicit FXmlObject(uint64 objectID = 0) : id(objectID) {}

    uint64 getID() const { return id; }
    /// The instance behind this placeholder, borrowed; null where there is none.
    virtual FXmlInstance* getInstance() = 0;
    /// The object, borrowed, if it is a `className` (any, where that is null); made when first asked for.
    CmObject* getObject(const char* className);
    /// The stored tree, borrowed; null once the object was made.
    FAttributes* getAttributes();

    bool isEqual(const CmObject* other) const override;
    int compare(const CmObject* other) const override;
    unsigned hash(unsigned size) const override;

protected:
    uint64 id;
};

/// The hash of tables of objects and placeholders: the `id` of a placeholder, or the address of any other object,
/// modulo the size.
unsigned gHashObject(const CmObject* object, unsigned size);

/// The number that stands for the object in a table: as in `gHashObject`.
uint64 getObjectNumber(const CmObject* object);

/// The object, or that behind a placeholder, if it is a `className` (any, where that is null); else null. Borrowed.
CmObject* resolveObject(CmObject* object, const char* className);

/// The object that a component gave, where it was wrapped; otherwise as `resolveObject`.
FUnknown* resolveUnknown(CmObject* object);
