#pragma once

#include "storage/xml/xmlnode.h"
#include "storage/xml/xmlsourcetext.h"

namespace Xml
{
/// One attribute of an element: a name and a value, both in 16 bits and without entities. One thread at a time.
class Attribute : public Node
{
    DECLARE_TYPE(Attribute, Node)

    Attribute() = default;
    Attribute(const ConstString& name, const ConstString& value);

    const FString& getValue() const
    {
        if (value.isEmpty())
            widen();
        return value;
    }
    void setValue(const ConstString& text);
    bool isNamed(const char16* text) const;

protected:
    friend class DocumentParser;
    friend class Element;

    void print(Buffer& out) const override;
    void widen() const override;

    mutable FString value;

private:
    /// Takes the texts as the parser gave them.
    void setSource(std::string_view sourceName, std::string_view sourceValue);

    void printPlain(Buffer& out) const;
    void printText(Buffer& out, std::string_view ascii, const FString& text) const;

    mutable SourceText source;
};
} // namespace Xml
