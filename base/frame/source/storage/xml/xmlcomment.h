#pragma once

#include "storage/xml/xmlnode.h"

namespace Xml
{
/// A comment; its text is the node's name and is written as it stands, so it must not hold "-->". One thread at a
/// time.
class Comment : public Node
{
    DECLARE_TYPE(Comment, Node)

    explicit Comment(const ConstString& text);

protected:
    friend class DocumentParser;

    void print(Buffer& out) const override;
};
} // namespace Xml
