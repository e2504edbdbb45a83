#pragma once

#include "containers/typed/tarray.h"
#include "storage/xml/xmlattribute.h"
#include "storage/xml/xmlnode.h"
#include "storage/xml/xmlsourcetext.h"

namespace Xml
{
/// A tag with its attributes and what stands between its start and its end.
///
/// Children and attributes are counted: adding one takes a further reference, removing one gives it back. The
/// parent is a plain pointer, kept right by the parent itself. Nothing here recurses, so a tree may be deeper than
/// the stack allows. One thread at a time.
class Element : public Node
{
    DECLARE_TYPE(Element, Node)

    /// `parent` is where the element is going to stand; only the parent's `addChild` makes it a child.
    explicit Element(const ConstString& name, Node* parent = nullptr);
    Element(const Element&) = delete;
    ~Element() override;

    bool isNamed(const char16* text) const;
    /// Null at the root.
    Node* getParent() const { return parent; }

    // Children
    /// False for null, for an attribute, for a node that stands in an element already, and for what would make the
    /// element its own descendant.
    bool addChild(Node* child);
    /// `index` counts from 0; the count of children appends. False beyond it, and where `addChild` gives it.
    bool insertChildAt(Node* child, int index);
    /// False where `child` doesn't stand here.
    bool removeChild(Node* child);
    bool removeChildAt(int index);
    /// Borrowed; null where there is none.
    Node* firstChild() const { return first; }
    Node* lastChild() const { return last; }
    Node* childAt(int index) const;
    int countChildren() const { return childCount; }
    /// The first child that is an element and, unless `elementName` is null, has this name. Borrowed.
    Element* firstElement(const char16* elementName = nullptr) const;

    // Attributes
    /// False for null. Names are not tested for being unique.
    bool addAttribute(Attribute* attribute);
    /// False where the element hasn't this very attribute.
    bool removeAttribute(Attribute* attribute);
    /// The first with this name, case respected; null where there is none. Borrowed.
    Attribute* getAttribute(const char16* attributeName) const;
    Attribute* attributeAt(int index) const;
    int countAttributes() const;

    /// Appends the text of the children that are text and more than white space: the pieces in their order, the
    /// whole trimmed and in 16 bits. True if there is any. A text that was cut at a line end comes back without it.
    bool getStringData(String& text) const;
    /// Lays the children out, each element and comment on a line of its own with `depth` + 1 tabs and so on inward;
    /// white space that stood between them goes, text stays where it is.
    void reformat(int depth);

    bool write(IBStream* stream) const override;
    Element* asElement() override { return this; }

protected:
    void print(Buffer& out) const override;
    void widen() const override;

private:
    friend class DocumentParser;

    /// Without a name.
    Element() : attributes(0, 4) {}
    /// Takes the start tag as the parser gave it; gives its size in bytes.
    size_t setSource(const char* tag, const char** tagAttributes);
    const TArray<IPtr<Attribute>>& attributeList() const;
    void printSource(Buffer& out) const;
    void printPlainSource(Buffer& out) const;
    bool canAdopt(Node* child) const;
    void linkBefore(Node* child, Node* place);
    void unlink(Node* child);
    void insertLayout(Node* place, int tabs);
    void reformatChildren(int depth);
    void printStart(Buffer& out) const;
    void printEnd(Buffer& out) const;
    bool printTree(Buffer& out, IBStream* stream) const;
    void takeChildrenOf(Element& other);
    void dropChildren();

    Node* parent = nullptr;
    Node* first = nullptr;
    Node* last = nullptr;
    int childCount = 0;
    /// Empty, as the name is, while `source` isn't.
    mutable TArray<IPtr<Attribute>> attributes;
    mutable SourceText source;
};
} // namespace Xml
