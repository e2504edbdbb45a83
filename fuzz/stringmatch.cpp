#include "containers/match/fstringmatcher.h"
#include "fuzz/fuzztext.h"

#include <algorithm>

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    FuzzText input(data, size);
    const std::u16string pattern = input.takeText(200);
    const std::u16string candidate = input.takeText(400);
    FStringMatcher matcher(pattern.c_str());
    StringMatchInfos infos;
    if (!matcher.isMatch(candidate.c_str(), &infos))
        return 0;
    const auto patternLength = static_cast<int>(pattern.size());
    const auto length = static_cast<int>(candidate.size());
    const auto matched = static_cast<int>(infos.matchedCharacters.countSetBits());
    require(infos.matchedCharacters.getSize() == candidate.size());
    if (infos.kind != StringMatchInfos::kSimilar)
    {
        require(infos.distance == 0 &&
                matched == (infos.kind == StringMatchInfos::kWhole ? length : patternLength));
        return 0;
    }
    require(infos.distance >= 1 && infos.distance <= std::max(1, patternLength / 3));
    // Every other character of either text costs a change, and one change serves one of each at most.
    require(matched + infos.distance >= std::max(patternLength, length));
    return 0;
}
