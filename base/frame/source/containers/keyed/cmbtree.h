#pragma once

#include "containers/keyed/cmbtreenode.h"
#include "containers/sequence/cmcontainer.h"
#include "containers/sequence/cmiterator.h"

/// A balanced tree of objects in the order of `compare`, which alone decides what is equal here.
///
/// Equal elements are allowed and stand in the order of insertion. A node holds up to order - 1 of them and is searched
/// key by key, so that a small order serves best.
/// One thread at a time.
class CmBTree : public CmContainer
{
    DECLARE_CLASS(CmBTree, CmContainer)

    /// Measured as best for texts and numbers, few and many; such nodes still fit the pool of small blocks.
    static constexpr int kDefaultOrder = 12;

    /// An order below 3 becomes 3.
    explicit CmBTree(int order = kDefaultOrder);
    CmBTree(const CmBTree& other);
    CmBTree& operator=(const CmBTree& other) { return assign(*this, other); }
    ~CmBTree() override;

    bool add(CmObject* object) override;
    /// Removes the first equal element.
    bool remove(CmObject* object) override;
    bool remove(const CmIterator& position) override;
    bool removeAt(int index) override;
    void removeAll() override;
    CmObject* lookup(const CmObject* object) const override;
    bool contains(const CmObject* object) const override { return lookupNode(object) != nullptr; }
    bool containsAbs(const CmObject* object) const override { return lookupAbs(object) != nullptr; }
    int occurrences(const CmObject* object) const override;
    CmIterator* newIterator() const override;

    /// This very object where it is stored, else null.
    CmObject* lookupAbs(const CmObject* object) const;
    /// Levels of nodes; 0 for an empty tree.
    int height() const;
    /// The node of the first equal element, borrowed until the tree changes; null where there is none.
    CmBTreeNode* lookupNode(const CmObject* object) const;
    int getOrder() const { return _order; }

    /// As `lookupNode`, below `root`, and the place in the node.
    CmBTreeNode* nodeSearch(CmBTreeNode* root, const CmObject* object, int& index) const;

protected:
    /// Adds what has no equal here.
    bool addUnique(CmObject* object) { return !lookupNode(object) && CmBTree::add(object); }
    /// Takes out the first equal element and gives it, with its reference; null where there is none.
    CmObject* takeEqual(const CmObject* object);

private:
    friend class CmBTreeIterator;

    int minimum() const;
    bool isFull(const CmBTreeNode* node) const { return node->count == _order - 1; }
    CmBTreeNode* leafFor(const CmObject* object, int& place) const;
    bool makeSpareNodes(const CmBTreeNode* leaf, CmBTreeNode*& spares) const;
    void insertUpwards(CmBTreeNode* leaf, int place, CmObject* object, CmBTreeNode* spares);
    CmObject* split(CmBTreeNode* node, CmBTreeNode* right) const;
    CmObject* detach(CmBTreeNode* node, int index);
    void repair(CmBTreeNode* node);
    bool joinWithRight(CmBTreeNode* node, int index);
    bool joinWithLeft(CmBTreeNode* node, int index);
    void dropEmptyRoot();
    void removeNodes(CmBTreeNode* node);

    int32 _order;
    CmBTreeNode* _root = nullptr;
};

/// Walks over a CmBTree in order. One thread at a time.
class CmBTreeIterator final : public CmIterator
{
public:
    explicit CmBTreeIterator(const CmBTree& walked);

    using CmIterator::next;
    using CmIterator::previous;
    bool done() const override { return !node; }
    CmObject* next() override
    {
        CmObject* left = current();
        if (node)
            advance();
        return left;
    }
    CmObject* previous() override;
    CmObject* current() const override { return node ? node->keys[index] : nullptr; }
    CmObject* first() override;
    CmObject* last() override;

private:
    friend class CmBTree;

    void seek(const CmObject* object) const;
    void advance() const
    {
        index++;
        if (index >= node->count || !node->isLeaf())
            leaveNode();
    }
    void leaveNode() const;
    void retreat();

    const CmBTree& tree;
    // Set anew by a removal, through an iterator that is const to its holder.
    mutable CmBTreeNode* node = nullptr;
    mutable int index = 0;
};
