#include "storage/xml/xmlhandler.h"

DEFINE_INTERFACE_ID(INewXmlHandler, 0x6E1A47C2, 0x93B04D5F, 0xA81C2E60, 0xD7F53B94)

int32 XmlHandler::queryInterface(const char* interfaceID, void** object)
{
    if (isSameInterface(interfaceID, INewXmlHandler::iid))
        return offerInterface<INewXmlHandler>(this, object);
    return FObject::queryInterface(interfaceID, object);
}

void XmlHandler::startTag(INewXmlParser*, const char*, const char**) {}

void XmlHandler::endTag(INewXmlParser*, const char*) {}

void XmlHandler::charData(INewXmlParser*, const char*, int) {}

void XmlHandler::comment(INewXmlParser*, const char*) {}

void XmlHandler::pushData(CmObject* object)
{
    dataStack.push(object);
}

CmObject* XmlHandler::popData()
{
    return dataStack.pop();
}

CmObject* XmlHandler::peekData()
{
    return dataStack.peek();
}
