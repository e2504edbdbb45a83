#pragma once

#include "foundation/object/iptr.h"
#include "storage/attribute/fxmlinstance.h"
#include "storage/attribute/fxmlreference.h"

#include <map>
#include <vector>

/// Joins references to the objects that they name, once all of a file has been read. One thread at a time.
class FXmlLinker
{
public:
    /// Adds a reference. Of two objects with one number the first is found.
    void addInstance(FXmlInstance* instance);
    /// `holder` is the object in whose tree the reference stands; null where it stands in none. Both are held until
    /// the linker goes.
    void addReference(FXmlReference* reference, FXmlInstance* holder);
    /// An object that stands itself in the tree, without a reference. Borrowed.
    void addRoot(FXmlInstance* instance) { roots.push_back(instance); }
    FXmlInstance* lookup(uint64 id) const;
    /// Gives each reference its target. One to an unknown number stays empty, which is no error.
    void link();

private:
    struct Link
    {
        IPtr<FXmlReference> reference;
        FXmlInstance* holder;
        FXmlInstance* target;
    };
    class Walk;

    std::vector<IPtr<FXmlInstance>> instances;
    /// A tree, since the numbers come from a file, which could choose them to fall into one bucket.
    std::map<uint64, FXmlInstance*> byID;
    std::vector<Link> links;
    std::vector<FXmlInstance*> roots;
};
