#pragma once

#include "foundation/object/fobject.h"
#include "storage/xml/fxmlparser.h"
#include "storage/xml/ixmlparser.h"

/// The older parser behind interfaces, for plug-ins: what it reads goes to a definition object.
///
/// One thread at a time.
class FPlugXmlParser : public FObject, public IXmlParser2, protected FXmlParser
{
    DECLARE_TYPE(FPlugXmlParser, FObject)
    FORWARD_FUNKNOWN(FObject)

    FPlugXmlParser();
    ~FPlugXmlParser() override;

    int32 queryInterface(const char* interfaceID, void** object) override;

    int32 initialize(IBStream* source, IXmlParserDef* definition) override;
    int32 process(void* data) override;
    int32 stop(int reason) override;
    int32 keepSpaces(bool keep) override;
    int32 stopAfterMainTag() override;
    int32 repositionStream() override;
    int32 getCurrentStartTag(const char** name) override;

    /// What a plug-in can be told of at once; a tag with more is an error.
    static constexpr int kMaxAttributes = 50;

protected:
    bool startTag(const char* name, CmContainer& attributes, bool isEmpty, void* data) override;
    bool endTag(const char* name, void* data) override;
    void gotData(void* bytes, unsigned int count, void* data) override;
    void gotComment(const char* text, void* data, bool endOfComment) override;

private:
    IPtr<IXmlParserDef> definition;
};
