#pragma once

#include "foundation/object/cmobject.h"

class CmHashAssociation;

/// A key with its object, as the dictionaries hold it. Equality, order and hash look at the key alone.
///
/// It owns neither: the container that holds it does the releasing. Only what it was restored with from a file lives
/// as long as it stands here. A copy shares both. One thread at a time.
class CmAssociation : public CmObject
{
    DECLARE_CLASS(CmAssociation, CmObject)

    CmAssociation() = default;
    explicit CmAssociation(CmObject* itsKey, CmObject* itsObject = nullptr) : key(itsKey), object(itsObject)
    {
    }
    CmAssociation(const CmAssociation& other);
    CmAssociation& operator=(const CmAssociation& other);
    ~CmAssociation() override
    {
        if (isKeyHeld || isObjectHeld)
            clear();
    }

    CmObject* getKey() const { return key; }
    CmObject* getObject() const { return object; }
    void setKey(CmObject* newKey);
    void setObject(CmObject* newObject);
    /// Gives the references on what was restored to the caller, who is going to release key and object.
    void handOver() { isKeyHeld = isObjectHeld = false; }

    /// False without a key, as for anything but an association.
    bool isEqual(const CmObject* other) const override;
    /// -1 without a key, as for anything but an association.
    int compare(const CmObject* other) const override;
    unsigned hash(unsigned size) const override;
    bool internalize(FArchive& archive) override;
    bool externalize(FArchive& archive) const override;
    bool storeAttributes(FAttributes& attributes) const override;
    bool restoreAttributes(FAttributes& attributes) override;

    /// This association where it brings its node in a hash table's chain along; null where it doesn't.
    virtual CmHashAssociation* withNode() { return nullptr; }

private:
    /// Takes over the references on a whole pair; half a pair is given back, and the result is false.
    bool restorePair(CmObject* restoredKey, CmObject* restoredObject);
    void clear();

    // Both lie in the room that the count leaves: a pair then needs half a line of a cache.
    bool isKeyHeld = false;
    bool isObjectHeld = false;

    CmObject* key = nullptr;
    CmObject* object = nullptr;
};
