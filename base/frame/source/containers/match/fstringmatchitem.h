#pragma once

#include "containers/match/istringmatcher.h"
#include "foundation/object/fobject.h"
#include "foundation/object/iptr.h"

/// A candidate that was found, and how. Holds a reference on its description. One thread at a time.
class FStringMatchItem : public FObject
{
    DECLARE_TYPE(FStringMatchItem, FObject)

    FStringMatchItem(IObjectDescription* candidate, const StringMatchInfos& itsInfos)
        : description(candidate),
          infos(itsInfos)
    {
    }

    IObjectDescription* getObjectDescription() const { return description; }
    const StringMatchInfos& getMatchInfos() const { return infos; }

private:
    IPtr<IObjectDescription> description;
    StringMatchInfos infos;
};

/// Less than, equal to or more than 0, as the left one's distance is to the right one's.
int compareByMatchingDistance(const FStringMatchItem* left, const FStringMatchItem* right);
