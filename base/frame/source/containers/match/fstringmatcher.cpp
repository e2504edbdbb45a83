#include "containers/match/fstringmatcher.h"

#include "containers/typed/cmtarray2d.h"

#include <algorithm>
#include <string>

DEFINE_INTERFACE_ID(IObjectDescription, 0x6F1D8A42, 0x2B934C70, 0xA85E13D9, 0x74C0E6BB)
DEFINE_INTERFACE_ID(IObjectDescriptionList, 0xC92E40B7, 0x5D1F4A68, 0x9307BE24, 0x1A86F35C)
DEFINE_INTERFACE_ID(IStringMatchResultList, 0x38B75D0E, 0xE6424F91, 0x8CD12A7F, 0x50934BE8)
DEFINE_INTERFACE_ID(IStringMatcher, 0xA15C93F6, 0x07BE4D25, 0xB4683CE1, 0xD92F7A04)

namespace
{
/// Entry (i, j): how many changes lead from the first i characters of one text to the first j of the other.
using Distances = CmTArray2D<int32>;

int32 getMinValue(int32 a, int32 b, int32 c)
{
    return std::min(a, std::min(b, c));
}

/// A similar candidate differs in at most a third of the search text, and may always differ in one character.
int32 distanceLimit(unsigned patternLength)
{
    return std::max(1, static_cast<int32>(patternLength / 3));
}

std::u16string folded(const ConstString& text)
{
    std::u16string result(text.text16(), text.length());
    for (char16& character : result)
        character = ConstString::toLower(character);
    return result;
}

Distances measure(const std::u16string& from, const std::u16string& to)
{
    Distances table(static_cast<unsigned>(from.size()) + 1, static_cast<unsigned>(to.size()) + 1);
    for (unsigned i = 0; i < table.countRows(); i++)
        table.at(i, 0) = static_cast<int32>(i);
    for (unsigned j = 0; j < table.countColumns(); j++)
        table.at(0, j) = static_cast<int32>(j);
    for (unsigned i = 1; i < table.countRows(); i++)
        for (unsigned j = 1; j < table.countColumns(); j++)
        {
            const int32 change = from[i - 1] == to[j - 1] ? 0 : 1;
            table.at(i, j) =
                getMinValue(table.at(i - 1, j) + 1, table.at(i, j - 1) + 1, table.at(i - 1, j - 1) + change);
        }
    return table;
}

/// Goes the way back through the table and notes the characters of `to` that stayed as they were.
void markAligned(const Distances& table, const std::u16string& from, const std::u16string& to,
                 BitSet& aligned)
{
    auto i = static_cast<unsigned>(from.size());
    auto j = static_cast<unsigned>(to.size());
    while (i > 0 && j > 0)
    {
        const int32 distance = table.at(i, j);
        const bool isSame = from[i - 1] == to[j - 1];
        if (isSame)
            aligned.setBit(j - 1);
        // Where there is a choice, a changed character comes last: the others may leave more as they were.
        if (!isSame && distance == table.at(i - 1, j) + 1)
            i--;
        else if (!isSame && distance == table.at(i, j - 1) + 1)
            j--;
        else
            i--, j--;
    }
}

void fill(StringMatchInfos* infos, StringMatchInfos::Kind kind, int32 distance, unsigned candidateLength)
{
    if (!infos)
        return;
    infos->kind = kind;
    infos->distance = distance;
    infos->matchedCharacters = BitSet(candidateLength);
}
} // namespace

FStringMatcher::FStringMatcher(const ConstString& searchText) : pattern(searchText)
{
    pattern.toWideString();
}

bool FStringMatcher::isMatch(const char16* candidate, StringMatchInfos* infos)
{
    const ConstString text(candidate);
    if (text.isEmpty())
        return false;
    if (text.compare(pattern, kCaseInsensitive) == 0)
    {
        fill(infos, StringMatchInfos::kWhole, 0, text.length());
        if (infos)
            infos->matchedCharacters.setAll();
        return true;
    }
    const int place = pattern.isEmpty() ? 0 : text.findNext(0, pattern, kCaseInsensitive);
    if (place < 0)
        return isPartialMatch(text, infos);
    fill(infos, StringMatchInfos::kPart, 0, text.length());
    for (unsigned i = 0; infos && i < pattern.length(); i++)
        infos->matchedCharacters.setBit(static_cast<unsigned>(place) + i);
    return true;
}

bool FStringMatcher::isPartialMatch(const ConstString& candidate, StringMatchInfos* infos) const
{
    const int32 limit = distanceLimit(pattern.length());
    const int32 surplus = static_cast<int32>(candidate.length()) - static_cast<int32>(pattern.length());
    // So many characters at least have to be put in or left out.
    if (std::abs(surplus) > limit || pattern.length() > kMaxSimilarLength)
        return false;
    const std::u16string from = folded(pattern);
    const std::u16string to = folded(candidate);
    const Distances table = measure(from, to);
    const int32 distance = table.at(pattern.length(), candidate.length());
    if (distance > limit)
        return false;
    fill(infos, StringMatchInfos::kSimilar, distance, candidate.length());
    if (infos)
        markAligned(table, from, to, infos->matchedCharacters);
    return true;
}

FStringMatchList* FStringMatcher::filterCandidates(IObjectDescriptionList* candidates)
{
    auto* matches = new FStringMatchList;
    const int count = candidates ? candidates->countItems() : 0;
    for (int i = 0; i < count; i++)
    {
        StringMatchInfos infos;
        IObjectDescription* candidate = candidates->getObjectDescription(i);
        if (candidate && isMatch(candidate->getDescription(), &infos))
            matches->addItem(candidate, infos);
    }
    return matches;
}

int32 FStringMatcher::queryInterface(const char* interfaceID, void** object)
{
    if (isSameInterface(interfaceID, IStringMatcher::iid))
        return offerInterface<IStringMatcher>(this, object);
    return FObject::queryInterface(interfaceID, object);
}
