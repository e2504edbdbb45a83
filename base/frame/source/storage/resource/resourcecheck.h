#pragma once

#include "storage/resource/boundedtexts.h"

#include <vector>

class FFileArchiveNode;
class FResourceArchive;
class FStream;

/// Looks for all that is wrong in an open resource file: reads each file to its end, and holds the places of the
/// files against each other. What is stored as it is has no check sum, so a changed byte in it isn't found. One thread
/// at a time.
class ResourceCheck
{
public:
    explicit ResourceCheck(FResourceArchive& checked) : archive(checked) {}

    /// True where nothing is wrong.
    bool run();
    /// One sentence each.
    const BoundedTexts& getProblems() const { return problems; }
    int64 getFileCount() const { return files; }
    int64 getByteCount() const { return bytes; }

private:
    struct Extent
    {
        int64 begin;
        int64 end;
        const FFileArchiveNode* node;
    };

    void checkFolder(const FFileArchiveNode& folder);
    void checkName(const FFileArchiveNode& node, const FFileArchiveNode* before);
    void checkContent(const FFileArchiveNode& node);
    /// How many bytes come before the end; -1 where the data is damaged.
    static int64 lengthOf(FStream& content);
    void checkExtents();
    void report(const char16* format, const FFileArchiveNode& node);

    FResourceArchive& archive;
    BoundedTexts problems;
    std::vector<Extent> extents;
    int64 files = 0;
    int64 bytes = 0;
};
