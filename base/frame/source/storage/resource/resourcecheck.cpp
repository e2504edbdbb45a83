#include "storage/resource/resourcecheck.h"

#include "storage/resource/archivename.h"
#include "storage/resource/fresourcearchive.h"
#include "storage/stream/fstream.h"
#include "storage/virtual/innerpath.h"

#include <algorithm>

bool ResourceCheck::run()
{
    if (!archive.getRoot())
        problems.add(u"the file can't be opened");
    else
        checkFolder(*archive.getRoot());
    if (archive.getDamage() > 0)
        problems.add(u"the table of files is damaged, and some are missing");
    checkExtents();
    return problems.getCount() == 0;
}

void ResourceCheck::report(const char16* format, const FFileArchiveNode& node)
{
    if (problems.isFull())
    {
        problems.omit();
        return;
    }
    FPath path;
    node.getPath(path);
    FString problem;
    problem.printf(format, InnerPath::textOf(path).text16());
    problems.add(problem);
}

void ResourceCheck::checkFolder(const FFileArchiveNode& folder)
{
    const FFileArchiveNode* before = nullptr;
    for (const IPtr<FFileArchiveNode>& child : folder.getChildren())
    {
        checkName(*child, before);
        before = child;
        if (child->isFolder())
            checkFolder(*child);
        else
            checkContent(*child);
    }
}

void ResourceCheck::checkName(const FFileArchiveNode& node, const FFileArchiveNode* before)
{
    if (!ArchiveName::isSafe(node.getName()))
        report(u"%s: a name that no folder can hold", node);
    if (before && before->compare(&node) == 0)
        report(u"%s: the name is there twice", node);
}

void ResourceCheck::checkContent(const FFileArchiveNode& node)
{
    files++;
    if (node.getDataSize() > 0)
        extents.push_back({node.getDataOffset(), node.getDataOffset() + node.getDataSize(), &node});
    const IPtr<FStream> content = adopt(archive.openNode(&node));
    const int64 length = content ? lengthOf(*content) : -1;
    if (length < 0)
        report(u"%s: the content is damaged", node);
    else if (length != node.getFileSize())
        report(u"%s: the content isn't as long as the table says", node);
    bytes += std::max<int64>(length, 0);
}

int64 ResourceCheck::lengthOf(FStream& content)
{
    constexpr int64 kPiece = 65536;
    std::vector<char> piece(kPiece);
    for (int64 length = 0;;)
    {
        const int64 got = content.readRaw(piece.data(), kPiece);
        if (got <= 0)
            return got < 0 ? -1 : length;
        length += got;
    }
}

void ResourceCheck::checkExtents()
{
    const auto isBefore = [](const Extent& left, const Extent& right) { return left.begin < right.begin; };
    std::sort(extents.begin(), extents.end(), isBefore);
    for (std::size_t i = 1; i < extents.size(); i++)
        if (extents[i].begin < extents[i - 1].end)
            report(u"%s: the content overlaps another file's", *extents[i].node);
}
