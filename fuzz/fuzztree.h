#pragma once

#include "fuzz/fuzztext.h"
#include "storage/archive/fattributearchivebase.h"
#include "storage/attribute/fattributes.h"
#include "storage/attribute/fxmlobject.h"
#include "storage/stream/fmemorystream.h"

/// The bytes in a stream.
inline std::string bytesOf(FMemoryStream& stream)
{
    return std::string(stream.getData(), static_cast<size_t>(stream.getSize()));
}

/// Asks for every object of a tree, which makes it, and looks into sub-trees.
inline void touchObjects(FAttributes& tree, int depth = 0)
{
    for (int i = 0; depth < FArchive::kMaxDepth && i < tree.total(); i++)
    {
        const std::string key = tree.entryAt(i)->getKey();
        if (FAttributes* inner = tree.getAttributes(key.c_str()))
            touchObjects(*inner, depth + 1);
        else
            tree.getObject(key.c_str(), nullptr);
        while (FAttributes* queued = tree.unqueueAttributes(key.c_str()))
            touchObjects(*queued, depth + 1);
        while (CmObject* object = tree.unqueueObject(key.c_str(), nullptr))
            object->release();
    }
}

/// Asks for the roots "a" and "b", which makes their objects.
inline void askForRoots(FAttributeArchiveBase& archive)
{
    for (const char* name : {"a", "b"})
    {
        archive.getRoot(name, "FAttributes");
        archive.getGlobalRoot(name, "CmObject");
    }
}
