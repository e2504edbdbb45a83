#include "containers/match/cmtokens.h"
#include "fuzz/fuzztext.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    FuzzText input(data, size);
    const std::u16string delimiters[] = {input.takeText(20), input.takeText(20)};
    const std::u16string text = input.takeText(size);
    CmTokens tokens(text.c_str());
    for (size_t i = 0;; i++)
    {
        const std::u16string& set = delimiters[i % 2];
        const int before = tokens.getIndex();
        const std::u16string token = tokens.next(set.c_str());
        const auto end = static_cast<size_t>(tokens.getIndex());
        require(end <= text.size() && token.find_first_of(set) == token.npos);
        require(tokens.getLastDelimiter() == (end < text.size() ? text[end] : 0));
        if (end == text.size())
            break;
        require(text.compare(end - token.size(), token.size(), token) == 0);
        require(tokens.getIndex() > before);
    }
    require(*tokens.next(nullptr) == 0);
    tokens.reset();
    const std::u16string first = CmTokens(tokens).next(delimiters[0].c_str());
    require(first == tokens.next(delimiters[0].c_str()));
    return 0;
}
