#pragma once

#include "containers/sequence/cmarray.h"

/// The object of a preset that stands for several objects at once.
///
/// It holds the objects themselves, or copies of them. A change of an object that it holds itself is a change of the
/// preset: its dependents hear of it. Two are equal whose objects are, pair by pair. Main thread.
class FMultiPreset : public CmObject
{
    DECLARE_CLASS(FMultiPreset, CmObject)

    explicit FMultiPreset(bool holdsCopies = false);
    FMultiPreset(const FMultiPreset& other);
    FMultiPreset& operator=(const FMultiPreset&) = delete;
    ~FMultiPreset() override;

    bool holdsCopies() const { return isCopy; }
    /// Holds a reference, or a copy. False for null, for the preset itself and for what can't be copied.
    bool addObject(CmObject* object);
    unsigned int countObjects() const { return static_cast<unsigned int>(objects.total()); }
    /// Borrowed. Null out of range, and where the object's class is unknown.
    CmObject* getPresetObject(unsigned int index) const;

    using CmObject::update;
    void update(CmObject* changedObject, int message) override;
    /// A change of the preset is done for its objects, too.
    void updateDone(int message) override;
    bool isEqual(const CmObject* other) const override;
    unsigned hash(unsigned size) const override;
    bool storeAttributes(FAttributes& attributes) const override;
    bool restoreAttributes(FAttributes& attributes) override;
    bool internalize(FArchive& archive) override;
    bool externalize(FArchive& archive) const override;

private:
    bool keep(CmObject* object);
    void removeObjects();

    CmArray objects;
    bool isCopy;
    /// The change comes from an object, which says itself when it is done.
    bool isForwarding = false;
};
