#pragma once

#include "containers/sequence/cmcontainer.h"
#include "containers/sequence/cmiterator.h"

template <class Node>
class CmNodeListIterator;

/// How a list handles its nodes, which have a `next`; each kind of node has its own.
///
///     static Node* make(CmObject* object);                   // to be linked; null where the object can't be
///     static void dispose(Node* node);                       // was unlinked
///     static CmObject* objectOf(Node* node);
///     static void setPrevious(Node* node, Node* previous);
///     static Node* before(const Node* node, Node* first);    // null for the first one
template <class Node>
struct CmNodeRules;

/// What the four lists of objects share. It stands between CmContainer and them, and is no class of the object model.
/// One thread at a time.
template <class Node>
class CmNodeList : public CmContainer
{
public:
    bool add(CmObject* object) override { return append(object); }
    /// Removes the first equal element.
    bool remove(CmObject* object) override;
    bool remove(const CmIterator& position) override;
    bool removeAt(int index) override;
    void removeAll() override;
    CmObject* at(int index) const override { return objectOf(nodeAt(index)); }
    CmObject* lookup(const CmObject* object) const override { return objectOf(nodeEqualTo(object)); }
    bool contains(const CmObject* object) const override { return nodeEqualTo(object) != nullptr; }
    bool containsAbs(const CmObject* object) const override { return nodeOf(object) != nullptr; }
    int occurrences(const CmObject* object) const override;
    int getIndex(const CmObject* object) const override;
    CmIterator* newIterator() const override;

    bool append(CmObject* object) { return link(object, _last); }
    bool prepend(CmObject* object) { return link(object, nullptr); }
    /// The place is that of a very element or of a cursor; false where it isn't here.
    bool insertBefore(const CmObject* place, CmObject* object);
    bool insertBefore(const CmIterator& place, CmObject* object);
    bool insertAfter(const CmObject* place, CmObject* object);
    bool insertAfter(const CmIterator& place, CmObject* object);
    bool insertAt(int index, CmObject* object);
    bool replaceAt(int index, CmObject* object);
    /// Inserts in front of the first element which compares greater.
    bool addSorted(CmObject* object);
    int index(const CmObject* object) const { return getIndex(object); }
    CmObject* first() const { return objectOf(_first); }
    CmObject* last() const { return objectOf(_last); }
    /// Hand the element with its reference to the caller; null in an empty list.
    CmObject* removeFirst();
    CmObject* removeLast();
    /// Removes this very object.
    bool removeAbs(CmObject* object);
    /// Adds the pointers, never copies.
    bool addAllFromAbs(const CmContainer& other);

protected:
    friend class CmNodeListIterator<Node>;

    CmNodeList() = default;
    CmNodeList(const CmNodeList& other) : CmContainer(other) {}
    ~CmNodeList() override { CmNodeList::removeAll(); }

    /// Links behind `predecessor`, or in front of all where it is null.
    bool link(CmObject* object, Node* predecessor);
    /// Takes a node out and gives its object, whose reference is then the caller's.
    CmObject* unlink(Node* predecessor, Node* node);
    /// Adds what has no equal here.
    bool addUnique(CmObject* object) { return !nodeEqualTo(object) && append(object); }
    /// Takes out the first equal element and gives it, with its reference; null where there is none.
    CmObject* takeEqual(const CmObject* object);
    /// The first one; null where there is none.
    Node* nodeEqualTo(const CmObject* object) const;
    Node* nodeOf(const CmObject* object) const;
    Node* nodeAt(int index) const;
    Node* before(const Node* node) const { return CmNodeRules<Node>::before(node, _first); }
    static CmObject* objectOf(Node* node) { return node ? CmNodeRules<Node>::objectOf(node) : nullptr; }
    /// The node under a cursor over this list, else null.
    Node* nodeUnder(const CmIterator& position) const;

    Node* _first = nullptr;
    Node* _last = nullptr;
};

/// Walks over a list of objects. One thread at a time.
template <class Node>
class CmNodeListIterator : public CmIterator
{
public:
    explicit CmNodeListIterator(const CmNodeList<Node>& walked)
        : CmIterator(&walked),
          list(walked),
          node(walked._first)
    {
    }

    using CmIterator::next;
    using CmIterator::previous;
    bool done() const override { return !node; }
    CmObject* next() override { return move(node ? node->next : nullptr); }
    CmObject* previous() override { return move(node ? list.before(node) : nullptr); }
    CmObject* current() const override { return list.objectOf(node); }
    CmObject* first() override { return list.objectOf(node = list._first); }
    CmObject* last() override { return list.objectOf(node = list._last); }

private:
    friend class CmNodeList<Node>;

    CmObject* move(Node* target)
    {
        CmObject* left = current();
        node = target;
        return left;
    }

    const CmNodeList<Node>& list;
    // Moved on by a removal, through an iterator that is const to its holder.
    mutable Node* node;
};
