#include "containers/match/fstringmatchlist.h"

namespace
{
constexpr int kDoubling = -1;
}

int compareByMatchingDistance(const FStringMatchItem* left, const FStringMatchItem* right)
{
    const int32 leftDistance = left->getMatchInfos().distance;
    const int32 rightDistance = right->getMatchInfos().distance;
    return leftDistance < rightDistance ? -1 : leftDistance > rightDistance;
}

FStringMatchList::FStringMatchList() : TOrderedArray(0, kDoubling) {}

IObjectDescription* FStringMatchList::getObjectDescription(int index)
{
    const FStringMatchItem* item = at(index);
    return item ? item->getObjectDescription() : nullptr;
}

const StringMatchInfos* FStringMatchList::getMatchInfos(int index)
{
    const FStringMatchItem* item = at(index);
    return item ? &item->getMatchInfos() : nullptr;
}

bool FStringMatchList::addItem(IObjectDescription* description, const StringMatchInfos& infos)
{
    return description && add(adopt(new FStringMatchItem(description, infos)));
}

int32 FStringMatchList::queryInterface(const char* interfaceID, void** object)
{
    if (isSameInterface(interfaceID, IStringMatchResultList::iid))
        return offerInterface<IStringMatchResultList>(this, object);
    return FObject::queryInterface(interfaceID, object);
}
