#pragma once

#include "foundation/object/fobject.h"
#include "foundation/object/iptr.h"
#include "foundation/text/fstring.h"

class Buffer;
class IBStream;

namespace Xml
{
class Element;
class ElementData;

/// What a document tree is made of: a counted object with a name, which knows how to write itself.
///
/// The links to its neighbours belong to the `Element` whose child it is, so a node stands in one element at a
/// time. One thread at a time.
class Node : public FObject
{
    DECLARE_TYPE(Node, FObject)

    Node() = default;
    explicit Node(const ConstString& name);
    /// A copy stands in no element.
    Node(const Node& other);
    Node& operator=(const Node&) = delete;

    const FString& getName() const
    {
        if (name.isEmpty())
            widen();
        return name;
    }
    void setName(const ConstString& text);

    /// Appends the node's text to the stream, in UTF-8. False at the first piece that the stream doesn't take.
    virtual bool write(IBStream* stream) const;

    /// The node as an element or as text, without the cost of a type test by name; null where it is none.
    virtual Element* asElement() { return nullptr; }
    virtual ElementData* asData() { return nullptr; }

    /// The neighbours among the children of one element, borrowed; null at the ends.
    Node* nextSibling() const { return next; }
    Node* previousSibling() const { return previous; }
    /// The next sibling that is an element and, unless `elementName` is null, has this name. Borrowed.
    Element* nextElement(const char16* elementName = nullptr) const;

protected:
    friend class Element;

    /// Appends the node's text to `out`.
    virtual void print(Buffer& out) const = 0;
    /// Gives the members their texts, where these are still as the parser gave them.
    virtual void widen() const {}
    /// Writes and empties the buffer.
    static bool writeBuffer(Buffer& out, IBStream& stream);
    static Element* findElement(Node* from, const char16* elementName);

private:
    /// Whether the node stands in an element.
    bool linked = false;

protected:
    /// Empty while the node has it as the parser gave it; `getName` sees to that.
    mutable FString name;

private:
    Node* next = nullptr;
    Node* previous = nullptr;
};
} // namespace Xml
