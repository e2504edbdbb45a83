#include "storage/attribute/ffloatlist.h"

#include "foundation/object/fvariant.h"
#include "storage/attribute/farchive.h"
#include "storage/stream/fstream.h"

DEFINE_CLASS(FFloatList, FAttrList)

bool FFloatList::unqueue(double& value)
{
    const int index = advance();
    if (index < 0)
        return false;
    value = at(index);
    return true;
}

bool FFloatList::unqueueVariant(FVariant& value)
{
    const int index = advance();
    if (index < 0)
        return false;
    value.setFloat(at(index));
    return true;
}

bool FFloatList::externalize(FArchive& archive) const
{
    if (!archive.writeCount(total()))
        return false;
    for (const double value : values)
        if (!archive.getStream().writeDouble(value))
            return false;
    return true;
}

bool FFloatList::internalize(FArchive& archive)
{
    values.clear();
    reset();
    int count = 0;
    if (!archive.readCount(count))
        return false;
    for (int i = 0; i < count; i++)
    {
        double value = 0;
        if (!archive.getStream().readDouble(value))
            return false;
        values.push_back(value);
    }
    return true;
}
