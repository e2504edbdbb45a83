#pragma once

#include "storage/attribute/fxmlobject.h"

#include <cstddef>

/// A place where the file refers to an object by number.
///
/// The target is counted; not so where that would close a circle, for then nobody could ever release the objects of
/// the circle: such a reference empties itself when its target goes. One thread at a time.
class FXmlReference : public FXmlObject
{
    DECLARE_CLASS(FXmlReference, FXmlObject)

    FXmlReference() = default;
    explicit FXmlReference(uint64 objectID) : FXmlObject(objectID) {}
    /// The copy counts its target.
    FXmlReference(const FXmlReference& other);
    FXmlReference& operator=(const FXmlReference&) = delete;
    ~FXmlReference() override;

    FXmlInstance* getInstance() override;
    /// Borrowed; null where the number belongs to no object of the file.
    FXmlObject* getTarget() const { return target; }
    void setTarget(FXmlInstance* instance, bool counted);
    /// False where the reference leads back to the object in whose tree it stands.
    bool countsTarget() const { return isCounted; }

private:
    friend class FXmlInstance;

    void drop();

    FXmlObject* target = nullptr;
    bool isCounted = false;
    /// Where the target notes this one, if it isn't counted.
    size_t place = 0;
};
