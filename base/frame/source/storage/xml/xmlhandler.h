#pragma once

#include "containers/sequence/cmstack.h"
#include "foundation/object/fobject.h"
#include "storage/xml/inewxmlhandler.h"

/// Base of handlers: hears everything and does nothing, and keeps a stack of objects for those that build trees.
///
/// The stack holds no references. One thread at a time.
class XmlHandler : public FObject, public INewXmlHandler
{
    DECLARE_TYPE(XmlHandler, FObject)
    FORWARD_FUNKNOWN(FObject)

    int32 queryInterface(const char* interfaceID, void** object) override;

    void startTag(INewXmlParser* parser, const char* name, const char** attributes) override;
    void endTag(INewXmlParser* parser, const char* name) override;
    void charData(INewXmlParser* parser, const char* data, int length) override;
    void comment(INewXmlParser* parser, const char* text) override;

protected:
    void pushData(CmObject* object);
    /// Null from an empty stack.
    CmObject* popData();
    CmObject* peekData();

private:
    CmStack dataStack;
};
