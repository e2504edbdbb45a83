#include "fuzz/fuzztext.h"
#include "storage/stream/fmemorystream.h"
#include "storage/url/furl.h"

// URLs taken apart, put together and changed as paths; their characters coded and decoded.

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    constexpr int kMaxSteps = 100;
    FuzzText input(data, size);
    const int type = input.takeByte() % 4;
    const std::u16string text = input.takeText(size);
    const std::u16string child = input.takeText(size);
    FUrl url(text.c_str());
    FString whole;
    url.getUrl(whole);
    whole.toWideString();
    FUrl again(whole.text16());
    require(again.getHost() == url.getHost() || !url.getHost().isEmpty());
    again.setUrl(child.c_str());
    require(url == url && url.isEqual(&url) && (!(url == again) || url.hash(101) == again.hash(101)));

    FString coded(text.c_str());
    FUrl::urlEncode(coded);
    require(coded.isAsciiString() && coded.length() >= text.size());
    FString decoded(text.c_str());
    FUrl::urlDecode(decoded);
    require(decoded.length() <= 3 * text.size());

    url.descend(child.c_str(), type);
    for (int i = 0; i < kMaxSteps && url.ascend(); i++)
    {
    }
    url.updateExtension(true);
    return 0;
}
