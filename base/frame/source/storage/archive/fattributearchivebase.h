#pragma once

#include "storage/attribute/fattributes.h"

class FStream;
class FXmlLinker;

/// What the archives of attribute trees have in common: the root objects and how they are found again.
///
/// A local root is stored in its place, so nothing can refer to it; a global root is stored as an object that others
/// refer to. Roots keep the order in which they were added. Holds references on roots and stream. One thread at a
/// time.
class FAttributeArchiveBase
{
public:
    FAttributeArchiveBase(FStream* archiveStream, bool isWriting);
    FAttributeArchiveBase(const FAttributeArchiveBase&) = delete;
    FAttributeArchiveBase& operator=(const FAttributeArchiveBase&) = delete;

    void addRoot(const char* name, CmObject* object);
    void addGlobalRoot(const char* name, CmObject* object);
    /// For objects of components; those that aren't CmObjects can't be saved.
    void addRoot(const char* name, FUnknown* object);
    void addGlobalRoot(const char* name, FUnknown* object);
    /// The root of this name as a `className`, borrowed, or null. One that was read is made when first asked for;
    /// as "FAttributes" a local root that was not yet made is its tree.
    CmObject* getRoot(const char* name, const char* className);
    CmObject* getGlobalRoot(const char* name, const char* className);

protected:
    ~FAttributeArchiveBase();

    /// The object behind a root's entry; null where it is no CmObject.
    static CmObject* rootObject(const FAttributeValue& root);

    FStringAttributeArray roots;
    FStringAttributeArray globalRoots;
    IPtr<FStream> stream;
    bool writing;
};
