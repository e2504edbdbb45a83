#pragma once

#include "foundation/object/iptr.h"
#include "foundation/text/fstring.h"
#include "storage/attribute/fattributes.h"
#include "storage/attribute/fxmlobject.h"

#include <vector>

class FXmlReference;

/// The stored form of one object: its class and tree, until it is asked for and made. One thread at a time.
class FXmlInstance : public FXmlObject
{
    DECLARE_CLASS(FXmlInstance, FXmlObject)

    FXmlInstance() = default;
    /// Null for `storedClass` is the empty name: the class is then that which is asked for. Holds references.
    FXmlInstance(uint64 objectID, const char* storedClass, FAttributes* storedAttributes);
    /// The copy has a tree of its own and shares the object.
    FXmlInstance(const FXmlInstance& other);
    FXmlInstance& operator=(const FXmlInstance&) = delete;
    ~FXmlInstance() override;

    FXmlInstance* getInstance() override { return this; }
    /// Makes the object from class and tree when first called, and releases the tree. What can't be made is null,
    /// and is not tried again. Objects that refer to one another in a circle meet the one that is being made. Null,
    /// and the tree stays, where more than FArchive::kMaxDepth objects are being made one inside the other.
    CmObject* makeObject(const char* wantedClass);
    /// Null until the object was made. Borrowed.
    CmObject* getMadeObject() const { return object; }
    FAttributes* getStoredAttributes() const { return attributes; }
    const char* getClassName() const { return className.text8(); }
    const char* getName() const { return name.text8(); }
    void setName(const char* text) { name.assign(text); }
    /// Whether objects that this one refers to may come to hold what refers to it. Whoever keeps this stored form of
    /// an object then, and is held by such an object, is never released. Known once the file is linked.
    bool leadsBack() const { return isInCircle; }

private:
    friend class FXmlLinker;
    friend class FXmlReference;

    IPtr<CmObject> object;
    IPtr<FAttributes> attributes;
    FString className;
    /// The name under which the object was stored, if it had one.
    FString name;
    /// References that don't count, to be emptied when this goes.
    std::vector<FXmlReference*> uncounted;
    bool isInCircle = false;
};
