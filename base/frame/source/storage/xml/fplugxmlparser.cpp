#include "storage/xml/fplugxmlparser.h"

#include "storage/stream/fstream.h"
#include "storage/xml/fxmlattribute.h"

DEFINE_INTERFACE_ID(IXmlParserDef, 0x7D20C9E4, 0x1B8A4F36, 0xB2E9075D, 0x4AC6831F)
DEFINE_INTERFACE_ID(IXmlParser, 0xC05B71F8, 0x6E3D4290, 0x8F14AB6C, 0x92D7E035)
DEFINE_INTERFACE_ID(IXmlParser2, 0x39AE64D1, 0xF70C4B85, 0x96528DE3, 0x0BF41A7C)

FPlugXmlParser::FPlugXmlParser() : FXmlParser(nullptr, true) {}

FPlugXmlParser::~FPlugXmlParser() = default;

int32 FPlugXmlParser::queryInterface(const char* interfaceID, void** object)
{
    if (isSameInterface(interfaceID, IXmlParser::iid))
        return offerInterface<IXmlParser>(this, object);
    if (isSameInterface(interfaceID, IXmlParser2::iid))
        return offerInterface<IXmlParser2>(this, object);
    return FObject::queryInterface(interfaceID, object);
}

int32 FPlugXmlParser::initialize(IBStream* source, IXmlParserDef* newDefinition)
{
    if (definition)
        return kXmlAlreadyInitialized;
    FStream* sourceStream = toFStream(source);
    if (!sourceStream)
        return kXmlInvalidStream;
    definition = newDefinition;
    setStream(sourceStream);
    return kResultOk;
}

int32 FPlugXmlParser::process(void* data)
{
    if (!definition)
        return kXmlNotInitialized;
    return FXmlParser::process(data) ? kResultOk : error;
}

int32 FPlugXmlParser::stop(int reason)
{
    if (!definition)
        return kXmlNotInitialized;
    error = reason == 1 ? kErrorUnexpectedTag : kErrorMalformed;
    return kResultOk;
}

int32 FPlugXmlParser::keepSpaces(bool keep)
{
    flags = keep ? flags | kKeepSpaces : flags & ~uint32{kKeepSpaces};
    return kResultOk;
}

int32 FPlugXmlParser::stopAfterMainTag()
{
    flags |= kStopAfterMainTag;
    return kResultOk;
}

int32 FPlugXmlParser::repositionStream()
{
    if (!stream)
        return kXmlNotInitialized;
    const int64 position = getStreamPosition();
    if (stream->seek(position, kSeekStart) != position)
        return kStreamFailed;
    dropBuffer();
    return kResultOk;
}

int32 FPlugXmlParser::getCurrentStartTag(const char** name)
{
    if (!name)
        return kStreamInvalidArgument;
    *name = FXmlParser::getCurrentStartTag();
    return kResultOk;
}

bool FPlugXmlParser::startTag(const char* name, CmContainer& attributes, bool isEmpty, void* data)
{
    const int count = attributes.total();
    if (!definition || count > kMaxAttributes)
        return false;
    const char* names[kMaxAttributes];
    const char* values[kMaxAttributes];
    for (int i = 0; i < count; i++)
    {
        const auto* attribute = static_cast<FXmlAttribute*>(attributes.at(i));
        names[i] = attribute->name.text8();
        values[i] = attribute->value.text8();
    }
    return definition->startTag(name, count, names, values, isEmpty, data);
}

bool FPlugXmlParser::endTag(const char* name, void* data)
{
    return definition && definition->endTag(name, data);
}

void FPlugXmlParser::gotData(void* bytes, unsigned int count, void* data)
{
    if (definition)
        definition->gotData(bytes, count, data);
}

void FPlugXmlParser::gotComment(const char* text, void* data, bool endOfComment)
{
    if (definition)
        definition->gotComment(text, data, endOfComment);
}
