#include "containers/keyed/cmbtreenode.h"

#include "foundation/object/blockpool.h"
#include "foundation/object/cmobject.h"
#include "foundation/object/prefetch.h"

#include <algorithm>
#include <cstring>
#include <new>

namespace
{
// One block: the node, its keys, its children.
size_t blockSize(size_t order)
{
    return sizeof(CmBTreeNode) + (2 * order + 1) * sizeof(void*);
}
} // namespace

CmBTreeNode* CmBTreeNode::make(int order)
{
    const size_t keyCount = static_cast<size_t>(order);
    void* block = BlockPool::take(blockSize(keyCount));
    if (!block)
        return nullptr;
    memset(block, 0, blockSize(keyCount));
    auto* node = new (block) CmBTreeNode{};
    node->keys = reinterpret_cast<CmObject**>(node + 1);
    node->children = reinterpret_cast<CmBTreeNode**>(node->keys + keyCount);
    return node;
}

void CmBTreeNode::dispose(CmBTreeNode* node)
{
    const auto* keysEnd = reinterpret_cast<CmObject**>(node->children);
    BlockPool::giveBack(node, blockSize(static_cast<size_t>(keysEnd - node->keys)));
}

// Both searches go from key to key. That asks for more comparisons than halving, but the processor guesses their
// outcome right more often, and meanwhile the next key and the child that may follow come from memory.

int CmBTreeNode::shouldGo(const CmObject* object) const
{
    int place = count;
    while (place > 0)
    {
        prefetch(children[place]);
        prefetch(keys[std::max(place - 2, 0)]);
        if (object->compare(keys[place - 1]) >= 0)
            break;
        place--;
    }
    return place;
}

int CmBTreeNode::firstNotBefore(const CmObject* object, bool& isEqual) const
{
    for (int i = 0; i < count; i++)
    {
        prefetch(children[i]);
        // The place behind the last key is there, and null.
        prefetch(keys[i + 1]);
        const int order = object->compare(keys[i]);
        if (order <= 0)
        {
            isEqual = order == 0;
            return i;
        }
    }
    return count;
}

int CmBTreeNode::indexInParent() const
{
    int index = 0;
    while (parent->children[index] != this)
        index++;
    return index;
}

void CmBTreeNode::insert(int index, CmObject* key, CmBTreeNode* right)
{
    for (int i = count; i > index; i--)
    {
        keys[i] = keys[i - 1];
        children[i + 1] = children[i];
    }
    keys[index] = key;
    setChild(index + 1, right);
    count++;
}

void CmBTreeNode::removeKey(int index)
{
    count--;
    for (int i = index; i < count; i++)
    {
        keys[i] = keys[i + 1];
        children[i + 1] = children[i + 2];
    }
    keys[count] = nullptr;
    children[count + 1] = nullptr;
}

void CmBTreeNode::removeFront()
{
    children[0] = children[1];
    removeKey(0);
}

void CmBTreeNode::insertFront(CmObject* key, CmBTreeNode* left)
{
    insert(0, key, children[0]);
    setChild(0, left);
}

void CmBTreeNode::setChild(int index, CmBTreeNode* child)
{
    children[index] = child;
    if (child)
        child->parent = this;
}
