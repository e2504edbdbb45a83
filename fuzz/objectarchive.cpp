#include "foundation/object/cmobject.h"
#include "foundation/object/iptr.h"
#include "fuzz/driver/options.h"
#include "fuzz/fuzztree.h"
#include "storage/attribute/fnewarchive.h"
#include "storage/attribute/fsimplearchive.h"

#include <vector>

// The older archives: objects of any class that the program has, read, copied and written again.

namespace
{
using Objects = std::vector<IPtr<CmObject>>;

template <class Archive>
Objects read(const uint8_t* data, size_t size)
{
    FMemoryStream stream(const_cast<uint8_t*>(data), static_cast<int64>(size));
    Archive archive(&stream, false);
    Objects objects;
    while (stream.tell() < stream.getSize())
    {
        const int64 before = stream.tell();
        if (CmObject* object = archive.readObject(nullptr, true))
            objects.push_back(adopt(object));
        require(stream.tell() >= before);
        if (stream.tell() == before || archive.getLastError() != 0)
            break;
    }
    return objects;
}

template <class Archive>
void writeAgain(const Objects& objects)
{
    FMemoryStream stream;
    Archive archive(&stream, true);
    for (const IPtr<CmObject>& object : objects)
        if (!archive.writeObject(object, true))
            return;
    read<Archive>(reinterpret_cast<const uint8_t*>(stream.getData()), static_cast<size_t>(stream.getSize()));
}
} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    if (size == 0)
        return 0;
    const LeaksAllowed allowed(data, size);
    const bool isSimple = data[0] % 2 == 1;
    const Objects objects =
        isSimple ? read<FSimpleArchive>(data + 1, size - 1) : read<FNewArchive>(data + 1, size - 1);
    for (const IPtr<CmObject>& object : objects)
    {
        FAttributes tree;
        object->storeAttributes(tree);
        object->hash(7);
        object->isEqual(object);
        const auto copy = adopt(object->newCopy());
        object->isEqual(copy);
        object->compare(copy);
    }
    isSimple ? writeAgain<FSimpleArchive>(objects) : writeAgain<FNewArchive>(objects);
    return 0;
}
