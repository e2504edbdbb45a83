#include "storage/xml/fxmlattribute.h"

DEFINE_CLASS(FXmlAttribute, CmObject)

FXmlAttribute::FXmlAttribute(const ConstString& attributeName, const ConstString& text)
    : name(attributeName),
      value(text)
{
}
