#pragma once

#include "foundation/object/cmobject.h"
#include "foundation/object/iptr.h"
#include "foundation/text/fstring.h"
#include "storage/path/fnpath.h"

#include <vector>

class FConsole;

/// A file or folder of an archive. A node owns its children, which stand in the order of `compare`: by the numbers of
/// the characters of their names.
///
/// While nobody changes the tree, any thread may read it.
class FFileArchiveNode : public CmObject
{
    DECLARE_ABSTRACT_CLASS(FFileArchiveNode, CmObject)

    using Children = std::vector<IPtr<FFileArchiveNode>>;

    FFileArchiveNode() = default;
    /// A copy has no parent, no children and no reference.
    FFileArchiveNode(const FFileArchiveNode& other) : CmObject(other) {}
    FFileArchiveNode& operator=(const FFileArchiveNode&) = delete;
    ~FFileArchiveNode() override;

    virtual bool isFolder() const = 0;
    /// From the start of the archive's file, in bytes.
    virtual int64 getDataOffset() const = 0;
    /// As it is stored.
    virtual int64 getDataSize() const = 0;
    /// As it is read.
    virtual int64 getFileSize() const { return getDataSize(); }
    /// Wide; empty for the root.
    virtual const FString& getName() const = 0;

    int compare(const CmObject* other) const override;

    // The tree
    /// Borrowed; null for the root.
    FFileArchiveNode* getParent() const { return parent; }
    const Children& getChildren() const { return children; }
    /// The first child of that name, borrowed; null where there is none.
    FFileArchiveNode* getChild(const ConstString& wideName) const;
    /// The same, if it is a folder.
    FFileArchiveNode* getSubFolder(const ConstString& wideName) const;
    /// Adds a reference to `child` and puts it in its place, behind others of its name.
    void addChild(FFileArchiveNode* child);
    /// The same for many: the order is wrong until `sortChildren`.
    void appendChild(FFileArchiveNode* child);
    void sortChildren();
    static void sort(Children& nodes);

    // The file outside
    /// A file that stands for the node's own content; null for none. Borrowed.
    FNPath* getReference() const { return reference; }
    /// Keeps a copy.
    void setReference(const FNPath* path);

    // Questions
    /// The number of files below, with `foldersToo` of folders too; the bytes of the files go to `bytes`, which may
    /// be null. A file is none below itself.
    int64 countFiles(bool recursive, bool foldersToo, uint64* bytes) const;
    /// `path` becomes the node's inside the archive, from "/" on.
    void getPath(FPath& path) const;
    /// One line for the node and each below it, two blanks deeper each level.
    void dump(FConsole* console, int level) const;

private:
    FFileArchiveNode* parent = nullptr;
    Children children;
    IPtr<FNPath> reference;
};
