#include "storage/attribute/fintlist.h"

#include "foundation/object/fvariant.h"
#include "storage/attribute/farchive.h"
#include "storage/stream/fstream.h"

DEFINE_CLASS(FIntList, FAttrList)

bool FIntList::unqueue(long long& value)
{
    const int index = advance();
    if (index < 0)
        return false;
    value = at(index);
    return true;
}

bool FIntList::unqueueVariant(FVariant& value)
{
    const int index = advance();
    if (index < 0)
        return false;
    value.setInt(at(index));
    return true;
}

bool FIntList::externalize(FArchive& archive) const
{
    if (!archive.writeCount(total()))
        return false;
    for (const long long value : values)
        if (!archive.getStream().writeInt64(value))
            return false;
    return true;
}

bool FIntList::internalize(FArchive& archive)
{
    values.clear();
    reset();
    int count = 0;
    if (!archive.readCount(count))
        return false;
    for (int i = 0; i < count; i++)
    {
        int64 value = 0;
        if (!archive.getStream().readInt64(value))
            return false;
        values.push_back(value);
    }
    return true;
}
