#include "storage/resource/ffilearchiveiterator.h"

#include "storage/resource/ffilearchive.h"

FFileArchiveIterator::FFileArchiveIterator(FFileArchive* itsArchive, const FFileArchiveNode* itsFolder,
                                           bool isRecursive)
    : FFileIterator(nullptr),
      archive(itsArchive),
      folder(const_cast<FFileArchiveNode*>(itsFolder)),
      recursive(isRecursive)
{
    FFileArchiveIterator::first();
}

FFileArchiveIterator::~FFileArchiveIterator() = default;

void FFileArchiveIterator::first()
{
    places.assign(1, {folder, 0});
    settle();
}

void FFileArchiveIterator::next()
{
    const FFileArchiveNode* node = currentNode();
    if (!node)
        return;
    places.back().index++;
    if (recursive && node->isFolder())
        places.push_back({node, 0});
    settle();
}

// Leaves the folders that are at their end.
void FFileArchiveIterator::settle()
{
    while (!places.empty() && places.back().index >= places.back().folder->getChildren().size())
        places.pop_back();
}

const FFileArchiveNode* FFileArchiveIterator::currentNode() const
{
    return places.empty() ? nullptr : places.back().folder->getChildren()[places.back().index].get();
}

IPtr<FPath> FFileArchiveIterator::current()
{
    const FFileArchiveNode* node = currentNode();
    if (!node)
        return nullptr;
    IPtr<FPath> path = adopt(new FPath);
    node->getPath(*path);
    return path;
}
