#pragma once

#include "storage/xml/xmlnode.h"

namespace Xml
{
/// One attribute of an element: a name and a value, both in 16 bits and without entities. One thread at a time.
class Attribute : public Node
{
    DECLARE_TYPE(Attribute, Node)

    Attribute() = default;
    Attribute(const ConstString& name, const ConstString& value);

    const FString& getValue() const { return value; }
    void setValue(const ConstString& text);

protected:
    friend class Element;

    void print(Buffer& out) const override;

    FString value;
};
} // namespace Xml
