#include "storage/archive/fattributearchivebase.h"

#include "storage/attribute/fxmlinstance.h"
#include "storage/stream/fstream.h"

namespace
{
CmObject* findRoot(const FStringAttributeArray& list, const char* name, const char* className)
{
    CmObject* root = list.getObjAttribute(name);
    const auto* instance = FCast(FXmlInstance, root);
    FAttributes* tree = instance ? instance->getStoredAttributes() : nullptr;
    if (tree && *instance->getClassName() == 0 && className && tree->isTypeOf(className, false))
        return tree;
    return resolveObject(root, className);
}
} // namespace

FAttributeArchiveBase::FAttributeArchiveBase(FStream* archiveStream, bool isWriting)
    : stream(archiveStream),
      writing(isWriting)
{
}

FAttributeArchiveBase::~FAttributeArchiveBase() = default;

void FAttributeArchiveBase::addRoot(const char* name, CmObject* object)
{
    roots.setObjAttribute(name, object, FAttributeValue::kBorrowed);
}

void FAttributeArchiveBase::addGlobalRoot(const char* name, CmObject* object)
{
    globalRoots.setObjAttribute(name, object, FAttributeValue::kBorrowed);
}

void FAttributeArchiveBase::addRoot(const char* name, FUnknown* object)
{
    roots.setUnknownAttribute(name, object, FAttributeValue::kBorrowed);
}

void FAttributeArchiveBase::addGlobalRoot(const char* name, FUnknown* object)
{
    globalRoots.setUnknownAttribute(name, object, FAttributeValue::kBorrowed);
}

CmObject* FAttributeArchiveBase::getRoot(const char* name, const char* className)
{
    return findRoot(roots, name, className);
}

CmObject* FAttributeArchiveBase::getGlobalRoot(const char* name, const char* className)
{
    return findRoot(globalRoots, name, className);
}
