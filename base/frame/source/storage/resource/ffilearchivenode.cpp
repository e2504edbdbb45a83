#include "storage/resource/ffilearchivenode.h"

#include "storage/path/fnpath.h"
#include "storage/resource/fconsole.h"
#include "storage/virtual/innerpath.h"

#include <algorithm>

DEFINE_ABSTRACT_CLASS(FFileArchiveNode, CmObject)

namespace
{
using NodePtr = IPtr<FFileArchiveNode>;

bool isBefore(const NodePtr& left, const NodePtr& right)
{
    return left->compare(right) < 0;
}
} // namespace

FFileArchiveNode::~FFileArchiveNode()
{
    // Whoever keeps a child beyond its folder must not be led to it.
    for (const NodePtr& child : children)
        child->parent = nullptr;
}

int FFileArchiveNode::compare(const CmObject* other) const
{
    const auto* node = FCast(FFileArchiveNode, other);
    return node ? getName().compare(node->getName()) : -1;
}

// The tree

FFileArchiveNode* FFileArchiveNode::getChild(const ConstString& wideName) const
{
    const auto place =
        std::lower_bound(children.begin(), children.end(), wideName,
                         [](const NodePtr& child, const ConstString& wanted)
                         { return static_cast<const ConstString&>(child->getName()).compare(wanted) < 0; });
    return place != children.end() && (*place)->getName() == wideName ? place->get() : nullptr;
}

FFileArchiveNode* FFileArchiveNode::getSubFolder(const ConstString& wideName) const
{
    FFileArchiveNode* child = getChild(wideName);
    return child && child->isFolder() ? child : nullptr;
}

void FFileArchiveNode::addChild(FFileArchiveNode* child)
{
    const NodePtr held(child);
    child->parent = this;
    children.insert(std::upper_bound(children.begin(), children.end(), held, isBefore), held);
}

void FFileArchiveNode::appendChild(FFileArchiveNode* child)
{
    child->parent = this;
    children.push_back(child);
}

void FFileArchiveNode::sortChildren()
{
    sort(children);
}

void FFileArchiveNode::sort(Children& nodes)
{
    std::stable_sort(nodes.begin(), nodes.end(), isBefore);
}

void FFileArchiveNode::setReference(const FNPath* path)
{
    reference = path ? adopt(new FNPath(*path)) : nullptr;
}

// Questions

int64 FFileArchiveNode::countFiles(bool recursive, bool foldersToo, uint64* bytes) const
{
    int64 count = 0;
    uint64 total = 0;
    for (const NodePtr& child : children)
    {
        if (!child->isFolder())
            total += static_cast<uint64>(child->getFileSize());
        if (foldersToo || !child->isFolder())
            count++;
        uint64 below = 0;
        if (recursive)
            count += child->countFiles(true, foldersToo, &below);
        total += below;
    }
    if (bytes)
        *bytes = total;
    return count;
}

void FFileArchiveNode::getPath(FPath& path) const
{
    std::vector<const FFileArchiveNode*> way;
    for (const FFileArchiveNode* node = this; node->parent; node = node->parent)
        way.push_back(node);
    std::u16string text;
    for (auto node = way.rbegin(); node != way.rend(); ++node)
        text.append(1, PATH_DELIMITER).append((*node)->getName().text16());
    path.fromString(way.empty() ? u"/" : text.c_str(), isFolder() ? FPath::kFolder : FPath::kFile);
}

void FFileArchiveNode::dump(FConsole* console, int level) const
{
    FString line;
    const FString name(parent ? getName() : FString(u"root"));
    if (isFolder())
        line.printf(u"<%s>", name.text16());
    else
        line.printf(u"\"%s\" size = %lld Bytes, offset = %lld", name.text16(),
                    static_cast<long long>(getDataSize()), static_cast<long long>(getDataOffset()));
    FString indented;
    indented.assign(u' ', 2 * level);
    indented.append(line);
    console->printLine(indented);
    for (const NodePtr& child : children)
        child->dump(console, level + 1);
}
