#pragma once

#include "containers/match/fstringmatchitem.h"
#include "containers/typed/tarray.h"
#include "foundation/object/isortableptr.h"

/// Matches in the order of their distances; those of one distance in the order in which they came.
/// One thread at a time.
class FStringMatchList : public FObject,
                         public IStringMatchResultList,
                         public TOrderedArray<ISortablePtr<FStringMatchItem, compareByMatchingDistance>>
{
    DECLARE_TYPE(FStringMatchList, FObject)
    FORWARD_FUNKNOWN(FObject)

    FStringMatchList();

    int countItems() override { return total(); }
    IObjectDescription* getObjectDescription(int index) override;
    const StringMatchInfos* getMatchInfos(int index) override;
    /// Adds a reference. False for null.
    bool addItem(IObjectDescription* description, const StringMatchInfos& infos);

    int32 queryInterface(const char* interfaceID, void** object) override;
};
