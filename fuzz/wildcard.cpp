#include "containers/match/cmregularexpression.h"
#include "fuzz/fuzztext.h"

#include <algorithm>

namespace
{
constexpr size_t kTryAllWays = 12;

/// The meaning of a pattern, spelled out; takes time that doubles with each star.
bool matchesSlowly(const char16* pattern, const char16* text)
{
    if (*pattern == 0)
        return *text == 0;
    if (*pattern == u'?' || *pattern == u'*')
    {
        if (matchesSlowly(pattern + 1, text))
            return true;
        return *text != 0 && matchesSlowly(*pattern == u'*' ? pattern : pattern + 1, text + 1);
    }
    if (*pattern == u'\\' && pattern[1] != 0)
        pattern++;
    return *pattern == *text && matchesSlowly(pattern + 1, text + 1);
}
} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    FuzzText input(data, size);
    const bool respectsCase = input.takeByte() % 2 == 0;
    const std::u16string pattern = input.takeText(2000);
    const std::u16string text = input.takeText(2000);
    CmRegularExpression expression(pattern.c_str(), respectsCase);
    const bool matches = expression.match(text.c_str());
    const bool isSmall = std::max(pattern.size(), text.size()) <= kTryAllWays;
    if (respectsCase && isSmall && CmRegularExpression::isValidExpression(pattern.c_str()))
        require(matches == matchesSlowly(pattern.c_str(), text.c_str()));
    for (int i = 0; i < 4; i++)
        expression.tryString(text.c_str(), i);
    return 0;
}
