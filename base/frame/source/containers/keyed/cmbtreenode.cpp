#include "containers/keyed/cmbtreenode.h"

#include "foundation/object/cmobject.h"

#include <cstdlib>
#include <new>

CmBTreeNode* CmBTreeNode::make(int order)
{
    // One block: the node, its keys, its children.
    const size_t keyCount = static_cast<size_t>(order);
    const size_t bytes = sizeof(CmBTreeNode) + (2 * keyCount + 1) * sizeof(void*);
    void* block = calloc(1, bytes);
    if (!block)
        return nullptr;
    auto* node = new (block) CmBTreeNode{};
    node->keys = reinterpret_cast<CmObject**>(node + 1);
    node->children = reinterpret_cast<CmBTreeNode**>(node->keys + keyCount);
    return node;
}

void CmBTreeNode::dispose(CmBTreeNode* node)
{
    free(node);
}

int CmBTreeNode::shouldGo(const CmObject* object) const
{
    if (count == 0 || object->compare(keys[0]) < 0)
        return 0;
    int place = count;
    while (place > 1 && object->compare(keys[place - 1]) < 0)
        place--;
    return place;
}

int CmBTreeNode::firstNotBefore(const CmObject* object) const
{
    int low = 0;
    int high = count;
    while (low < high)
    {
        const int middle = (low + high) / 2;
        if (object->compare(keys[middle]) > 0)
            low = middle + 1;
        else
            high = middle;
    }
    return low;
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
