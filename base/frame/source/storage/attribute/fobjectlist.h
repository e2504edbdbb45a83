#pragma once

#include "foundation/object/iptr.h"
#include "storage/attribute/fattrlist.h"

#include <vector>

/// A queue of objects, each with a reference of the queue's. A copy shares them. One thread at a time.
class FObjectList : public FAttrList
{
    DECLARE_CLASS(FObjectList, FAttrList)

    /// With `takeOver` gets the caller's reference.
    void queue(CmObject* object, bool takeOver);
    /// The next object, borrowed; null at the end. A placeholder is given as such.
    CmObject* unqueue();
    /// Borrowed.
    CmObject* at(int index) const { return objects[static_cast<unsigned>(index)]; }
    void replaceAt(int index, CmObject* object) { objects[static_cast<unsigned>(index)] = object; }
    void removeAt(int index) { objects.erase(objects.begin() + index); }

    int total() const override { return static_cast<int>(objects.size()); }
    bool unqueueVariant(FVariant& value) override;
    bool externalize(FArchive& archive) const override;
    bool internalize(FArchive& archive) override;

private:
    std::vector<IPtr<CmObject>> objects;
};
