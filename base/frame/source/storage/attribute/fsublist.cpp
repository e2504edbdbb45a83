#include "storage/attribute/fsublist.h"

#include "foundation/object/fvariant.h"

DEFINE_CLASS(FSubList, FAttrList)

FSubList::FSubList(const FSubList& other) : FAttrList(other)
{
    for (const auto& tree : other.trees)
        trees.push_back(adopt(new FAttributes(*tree)));
}

void FSubList::queue(FAttributes* attributes, bool takeOver)
{
    trees.push_back(takeOver ? adopt(attributes) : IPtr<FAttributes>(attributes));
}

FAttributes* FSubList::unqueue()
{
    const int index = advance();
    return index < 0 ? nullptr : at(index);
}

bool FSubList::unqueueVariant(FVariant& value)
{
    FAttributes* tree = unqueue();
    if (!tree)
        return false;
    value.setObject(static_cast<CmObject*>(tree));
    return true;
}

bool FSubList::externalize(FArchive& archive) const
{
    if (!archive.writeCount(total()))
        return false;
    for (const auto& tree : trees)
        if (!tree->externalize(archive))
            return false;
    return true;
}

bool FSubList::internalize(FArchive& archive)
{
    trees.clear();
    reset();
    int count = 0;
    if (!archive.readCount(count))
        return false;
    for (int i = 0; i < count; i++)
    {
        auto tree = adopt(new FAttributes);
        if (!tree->internalize(archive))
            return false;
        trees.push_back(tree);
    }
    return true;
}
