#include "containers/sequence/cmcontainer.h"
#include "fuzz/fuzztext.h"
#include "storage/stream/fmemorystream.h"
#include "storage/xml/fxmlattribute.h"
#include "storage/xml/fxmlparser.h"

#include <vector>

// The older XML parser: handlers are told of tags that nest, and of the same whether it reads ahead or byte by byte.

namespace
{
class Listener : public FXmlParser
{
public:
    Listener(FStream* source, bool bufferIt, uint8_t habits) : FXmlParser(source, bufferIt), habit(habits) {}

    bool startTag(const char* name, CmContainer& attributes, bool isEmpty, void* data) override
    {
        const std::string tag = name;
        heard += "<" + tag;
        for (int i = 0; i < attributes.total(); i++)
            hear(*static_cast<FXmlAttribute*>(attributes.at(i)));
        if (isEmpty)
            return true;
        open.push_back(tag);
        require(getCurrentStartTag() == open.back());
        if (habit == 1 && attributes.total() == 1)
        {
            open.pop_back();
            return skip();
        }
        return habit != 2 || open.size() > 50 || process(data);
    }
    bool endTag(const char* name, void*) override
    {
        require(!open.empty() && open.back() == name);
        open.pop_back();
        heard += '>';
        return true;
    }
    void gotData(void* bytes, unsigned int count, void*) override
    {
        require(count <= kMaxToken);
        heard.append(static_cast<const char*>(bytes), count);
        heard += count == 0 ? "\x1" : "";
    }
    void gotComment(const char* text, void*, bool endOfComment) override
    {
        heard += text;
        heard += endOfComment ? "\x2" : "";
    }

    std::string heard;

private:
    void hear(const FXmlAttribute& attribute)
    {
        require(attribute.value.length() <= static_cast<unsigned>(kMaxAttributeValue));
        heard += attribute.name.text8();
        const FString& value = attribute.value;
        heard.append(static_cast<const char*>(value.text()), value.length() * (value.isWideString() ? 2 : 1));
    }

    uint8_t habit;
    std::vector<std::string> open;
};

struct Result
{
    std::string heard;
    int error;
    int line;
    int64 position;
};

Result parse(const uint8_t* data, size_t size, uint8_t flags, bool bufferIt, uint8_t habit)
{
    FMemoryStream stream(const_cast<uint8_t*>(data), static_cast<int64>(size));
    Listener parser(&stream, bufferIt, habit);
    parser.setFlags(flags);
    const bool isDone = parser.process(nullptr);
    require(isDone == (parser.getError() == FXmlParser::kNoError));
    require(parser.getStreamPosition() >= 0 && parser.getStreamPosition() <= static_cast<int64>(size));
    return {parser.heard, parser.getError(), parser.getLine(), parser.getStreamPosition()};
}
} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    if (size < 2)
        return 0;
    const uint8_t flags = data[0] & 0x7F;
    const uint8_t habit = data[1] % 3;
    const Result ahead = parse(data + 2, size - 2, flags, true, habit);
    const Result bytewise = parse(data + 2, size - 2, flags, false, habit);
    require(ahead.heard == bytewise.heard && ahead.error == bytewise.error);
    require(ahead.line == bytewise.line && ahead.position == bytewise.position);
    return 0;
}
