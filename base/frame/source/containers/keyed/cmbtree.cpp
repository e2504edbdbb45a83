#include "containers/keyed/cmbtree.h"

#include <algorithm>
#include <utility>

DEFINE_CLASS(CmBTree, CmContainer)

namespace
{
constexpr int kSmallestOrder = 3;

CmBTreeNode* outermostLeaf(CmBTreeNode* node, bool last)
{
    while (node && !node->isLeaf())
        node = node->children[last ? node->count : 0];
    return node;
}

// Spare nodes hang together by their parent.
CmBTreeNode* takeSpare(CmBTreeNode*& spares)
{
    CmBTreeNode* node = spares;
    spares = std::exchange(node->parent, nullptr);
    return node;
}

void disposeSpares(CmBTreeNode* spares)
{
    while (spares)
        CmBTreeNode::dispose(takeSpare(spares));
}
} // namespace

CmBTree::CmBTree(int order) : _order(std::max(order, kSmallestOrder)) {}

CmBTree::CmBTree(const CmBTree& other) : CmContainer(other), _order(other._order)
{
    CmContainer::copy(other);
}

CmBTree::~CmBTree()
{
    CmBTree::removeAll();
}

// Insertion

bool CmBTree::add(CmObject* object)
{
    if (!object)
        return false;
    int place = 0;
    CmBTreeNode* leaf = leafFor(object, place);
    CmBTreeNode* spares = nullptr;
    if (!makeSpareNodes(leaf, spares))
        return false;
    insertUpwards(leaf, place, object, spares);
    testRemember(object);
    _size++;
    return true;
}

// The leaf and the place in it where `object` goes; null in an empty tree.
CmBTreeNode* CmBTree::leafFor(const CmObject* object, int& place) const
{
    CmBTreeNode* node = _root;
    while (node)
    {
        place = node->shouldGo(object);
        if (node->isLeaf())
            break;
        node = node->children[place];
    }
    return node;
}

// All nodes that the insertion will need, so that it can't fail half-way: one for each full node on the way up, and
// one for a new root.
bool CmBTree::makeSpareNodes(const CmBTreeNode* leaf, CmBTreeNode*& spares) const
{
    const CmBTreeNode* node = leaf;
    int needed = 0;
    for (; node && isFull(node); node = node->parent)
        needed++;
    if (!node)
        needed++;
    for (; needed > 0; needed--)
    {
        CmBTreeNode* spare = CmBTreeNode::make(_order);
        if (!spare)
        {
            disposeSpares(spares);
            return false;
        }
        spare->parent = spares;
        spares = spare;
    }
    return true;
}

void CmBTree::insertUpwards(CmBTreeNode* leaf, int place, CmObject* object, CmBTreeNode* spares)
{
    CmObject* key = object;
    CmBTreeNode* left = nullptr;
    CmBTreeNode* right = nullptr;
    for (CmBTreeNode* node = leaf; node; node = node->parent)
    {
        // A separator belongs where the node stood that it was split from. Its rank alone would also allow a place
        // behind equal keys further on, which would change their order.
        node->insert(left ? left->indexInParent() : place, key, right);
        if (node->count < _order)
            return;
        left = node;
        right = takeSpare(spares);
        key = split(left, right);
    }
    _root = takeSpare(spares);
    _root->setChild(0, left);
    _root->append(key, right);
}

// Moves what is behind the middle key into `right` and gives that key.
CmObject* CmBTree::split(CmBTreeNode* node, CmBTreeNode* right) const
{
    const int middle = node->count / 2;
    right->parent = node->parent;
    right->setChild(0, std::exchange(node->children[middle + 1], nullptr));
    for (int i = middle + 1; i < node->count; i++)
        right->append(std::exchange(node->keys[i], nullptr), std::exchange(node->children[i + 1], nullptr));
    node->count = middle;
    return std::exchange(node->keys[middle], nullptr);
}

// Removal

bool CmBTree::remove(CmObject* object)
{
    CmObject* removed = takeEqual(object);
    testDelete(removed);
    return removed != nullptr;
}

CmObject* CmBTree::takeEqual(const CmObject* object)
{
    int index = 0;
    CmBTreeNode* node = nodeSearch(_root, object, index);
    return node ? detach(node, index) : nullptr;
}

bool CmBTree::remove(const CmIterator& position)
{
    if (!position.walksOver(this) || position.done())
        return false;
    const auto& cursor = static_cast<const CmBTreeIterator&>(position);

    // The removal may move any element. The one that follows is found again by its rank and by how many of its
    // equals stand before it.
    CmBTreeIterator following(cursor);
    following.advance();
    const CmObject* object = following.current();
    int equalsBefore = 0;
    if (object)
    {
        CmBTreeIterator equal(*this);
        equal.seek(object);
        for (; equal.node != following.node || equal.index != following.index; equal.advance())
            if (equal.node != cursor.node || equal.index != cursor.index)
                equalsBefore++;
    }

    CmObject* removed = detach(cursor.node, cursor.index);
    cursor.seek(object);
    while (equalsBefore-- > 0)
        cursor.advance();
    testDelete(removed);
    return true;
}

bool CmBTree::removeAt(int index)
{
    if (index < 0)
        return false;
    CmBTreeIterator position(*this);
    position += index;
    if (position.done())
        return false;
    testDelete(detach(position.node, position.index));
    return true;
}

void CmBTree::removeAll()
{
    CmBTreeNode* root = std::exchange(_root, nullptr);
    _size = 0;
    removeNodes(root);
}

void CmBTree::removeNodes(CmBTreeNode* node)
{
    if (!node)
        return;
    for (int i = 0; i <= node->count; i++)
        removeNodes(node->children[i]);
    for (int i = 0; i < node->count; i++)
        testDelete(node->keys[i]);
    CmBTreeNode::dispose(node);
}

int CmBTree::minimum() const
{
    return _order % 2 == 0 ? _order / 2 - 1 : (_order - 1) / 2;
}

// Takes an element out of the tree and gives it; its reference is then the caller's.
CmObject* CmBTree::detach(CmBTreeNode* node, int index)
{
    CmObject* object = node->keys[index];
    _size--;
    CmBTreeNode* leaf = node;
    if (node->isLeaf())
        node->removeKey(index);
    else
    {
        leaf = outermostLeaf(node->children[index + 1], false);
        node->keys[index] = leaf->keys[0];
        leaf->removeKey(0);
    }
    repair(leaf);
    return object;
}

void CmBTree::repair(CmBTreeNode* node)
{
    while (node != _root && node->count < minimum())
    {
        CmBTreeNode* parent = node->parent;
        const int index = node->indexInParent();
        if (index < parent->count ? !joinWithRight(node, index) : !joinWithLeft(node, index))
            return;
        node = parent;
    }
    dropEmptyRoot();
}

// Borrows a key from the right sibling, or takes all of them in. Whether the sibling is gone.
bool CmBTree::joinWithRight(CmBTreeNode* node, int index)
{
    CmBTreeNode* parent = node->parent;
    CmBTreeNode* sibling = parent->children[index + 1];
    node->append(parent->keys[index], sibling->children[0]);
    if (sibling->count > minimum())
    {
        parent->keys[index] = sibling->keys[0];
        sibling->removeFront();
        return false;
    }
    for (int i = 0; i < sibling->count; i++)
        node->append(sibling->keys[i], sibling->children[i + 1]);
    CmBTreeNode::dispose(sibling);
    parent->removeKey(index);
    return true;
}

// Borrows a key from the left sibling, or gives it all of its own. Whether the node is gone.
bool CmBTree::joinWithLeft(CmBTreeNode* node, int index)
{
    CmBTreeNode* parent = node->parent;
    CmBTreeNode* sibling = parent->children[index - 1];
    if (sibling->count > minimum())
    {
        node->insertFront(parent->keys[index - 1], sibling->children[sibling->count]);
        parent->keys[index - 1] = sibling->keys[sibling->count - 1];
        sibling->removeKey(sibling->count - 1);
        return false;
    }
    sibling->append(parent->keys[index - 1], node->children[0]);
    for (int i = 0; i < node->count; i++)
        sibling->append(node->keys[i], node->children[i + 1]);
    CmBTreeNode::dispose(node);
    parent->removeKey(index - 1);
    return true;
}

void CmBTree::dropEmptyRoot()
{
    if (_root->count > 0)
        return;
    CmBTreeNode* emptied = std::exchange(_root, _root->children[0]);
    if (_root)
        _root->parent = nullptr;
    CmBTreeNode::dispose(emptied);
}

// Search

CmBTreeNode* CmBTree::nodeSearch(CmBTreeNode* root, const CmObject* object, int& index) const
{
    CmBTreeNode* found = nullptr;
    CmBTreeNode* node = object ? root : nullptr;
    while (node)
    {
        bool isEqual = false;
        const int place = node->firstNotBefore(object, isEqual);
        // Equal elements may stand further to the left, below this one.
        if (isEqual)
        {
            found = node;
            index = place;
        }
        node = node->children[place];
    }
    return found;
}

CmBTreeNode* CmBTree::lookupNode(const CmObject* object) const
{
    int index = 0;
    return nodeSearch(_root, object, index);
}

CmObject* CmBTree::lookup(const CmObject* object) const
{
    int index = 0;
    const CmBTreeNode* node = nodeSearch(_root, object, index);
    return node ? node->keys[index] : nullptr;
}

CmObject* CmBTree::lookupAbs(const CmObject* object) const
{
    if (!object)
        return nullptr;
    CmBTreeIterator it(*this);
    for (it.seek(object); !it.done() && object->compare(it.current()) == 0; it.advance())
        if (it.current() == object)
            return it.current();
    return nullptr;
}

int CmBTree::occurrences(const CmObject* object) const
{
    int count = 0;
    if (!object)
        return count;
    CmBTreeIterator it(*this);
    for (it.seek(object); !it.done() && object->compare(it.current()) == 0; it.advance())
        count++;
    return count;
}

int CmBTree::height() const
{
    int levels = 0;
    for (const CmBTreeNode* node = _root; node; node = node->children[0])
        levels++;
    return levels;
}

CmIterator* CmBTree::newIterator() const
{
    return new CmBTreeIterator(*this);
}

// Iteration

CmBTreeIterator::CmBTreeIterator(const CmBTree& walked)
    : CmIterator(&walked),
      tree(walked),
      node(outermostLeaf(walked._root, false))
{
}

CmObject* CmBTreeIterator::previous()
{
    CmObject* left = current();
    if (node)
        retreat();
    return left;
}

CmObject* CmBTreeIterator::first()
{
    node = outermostLeaf(tree._root, false);
    index = 0;
    return current();
}

CmObject* CmBTreeIterator::last()
{
    node = outermostLeaf(tree._root, true);
    index = node ? node->count - 1 : 0;
    return current();
}

void CmBTreeIterator::seek(const CmObject* object) const
{
    node = tree.nodeSearch(tree._root, object, index);
}

// Beyond a leaf's last key, or from an inner node's key into the child behind it.
void CmBTreeIterator::leaveNode() const
{
    if (!node->isLeaf())
    {
        node = outermostLeaf(node->children[index], false);
        index = 0;
    }
    while (node && index >= node->count)
    {
        index = node->parent ? node->indexInParent() : 0;
        node = node->parent;
    }
}

void CmBTreeIterator::retreat()
{
    if (node->isLeaf())
        index--;
    else
    {
        node = outermostLeaf(node->children[index], true);
        index = node->count - 1;
    }
    while (node && index < 0)
    {
        index = node->parent ? node->indexInParent() - 1 : 0;
        node = node->parent;
    }
}
