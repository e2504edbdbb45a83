#pragma once

#include "storage/xml/xmlelement.h"

namespace Xml
{
/// A document tree in memory, with its file form. One thread at a time.
class Document
{
public:
    /// Takes a reference of its own; null makes a document without root.
    explicit Document(Node* root = nullptr);

    /// Borrowed; null before a load and after one that failed. A loaded root is an `Element`.
    Node* getRoot() const { return root; }
    /// The root as an element; null where it is none. Borrowed.
    Element* getRootElement() const;
    void setRoot(Node* node);

    /// Replaces the root by the document that begins at the stream's position; the stream may go on behind it.
    /// False, with no root, for null, for a text that isn't well-formed, and for a tree beyond `kMaxTreeBytes`.
    bool load(IBStream* stream);
    /// Writes the tree in UTF-8 with byte order mark and declaration; with `reformat` it is laid out first, which
    /// changes the tree. False without root and where the stream fails.
    bool save(IBStream* stream, bool reformat);

    /// What the nodes and texts of a loaded tree may take, so that no input can take all memory.
    static constexpr int64 kMaxTreeBytes = int64{512} << 20;

private:
    IPtr<Node> root;
};
} // namespace Xml
