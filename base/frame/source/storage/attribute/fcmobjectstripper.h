#pragma once

#include "containers/keyed/cmhashtable.h"
#include "storage/attribute/fxmllinker.h"

#include <unordered_set>
#include <vector>

class FAttributeValue;
class FObjectList;

/// Makes attribute trees free of live objects, so that they can be stored or sent without them.
///
/// Each object in the tree gives place to a placeholder with what the object stores of itself, which is stripped in
/// turn; at its further places, and inside what objects store, it gives place to references. So do placeholders whose
/// objects were made; the others stay, with their trees stripped. Objects that can't store themselves are dropped.
/// One thread at a time; for one tree.
class FCmObjectStripper
{
public:
    void stripCmObjects(FAttributes& attributes);
    /// Strips one tree with its sub-trees and queues. `seen` holds the placeholders of the objects met so far; what
    /// their trees hold is stripped by `stripCmObjects`.
    void stripAttributes(FAttributes& attributes, CmHashTable& seen);
    /// The placeholder that takes the object's place, with a reference for the caller; null where it is dropped.
    [[nodiscard]] FXmlObject* stripObject(CmObject* object, CmHashTable& seen);

private:
    bool stripValue(FAttributeValue& value, CmHashTable& seen);
    void stripList(FObjectList& list, CmHashTable& seen);
    void stripStored(CmObject* object);

    FXmlLinker linker;
    FXmlInstance* holder = nullptr;
    std::vector<IPtr<FXmlInstance>> waiting;
    /// The placeholders that are or were waiting.
    std::unordered_set<const FXmlInstance*> met;
    /// Keeps the objects, and with them their addresses, until all are stripped.
    std::vector<IPtr<CmObject>> stripped;
};
