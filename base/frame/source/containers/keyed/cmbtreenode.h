#pragma once

class CmObject;

/// A node of a CmBTree: its keys in order, and between them the children. Unused places are null; a leaf has null
/// in `children[0]`. Between operations at least one place for a key is free.
struct CmBTreeNode
{
    /// An empty node with places for `order` keys; null without memory.
    static CmBTreeNode* make(int order);
    static void dispose(CmBTreeNode* node);

    bool isLeaf() const { return !children[0]; }
    /// The child in whose range `object` falls, behind equal keys.
    int shouldGo(const CmObject* object) const;
    /// The first key that doesn't sort before `object`, and whether it sorts with it; `count` where all do.
    int firstNotBefore(const CmObject* object, bool& isEqual) const;
    /// The index in the parent, which the node must have.
    int indexInParent() const;
    /// Inserts a key with the child to its right, which may be null.
    void insert(int index, CmObject* key, CmBTreeNode* right);
    /// Takes out a key with the child to its right.
    void removeKey(int index);
    /// Takes out the first key with the child to its left.
    void removeFront();
    /// Inserts a key with the child to its left in front of all.
    void insertFront(CmObject* key, CmBTreeNode* left);
    void append(CmObject* key, CmBTreeNode* right) { insert(count, key, right); }
    void setChild(int index, CmBTreeNode* child);

    int count;
    CmBTreeNode* parent;
    CmObject** keys;
    CmBTreeNode** children;
};
