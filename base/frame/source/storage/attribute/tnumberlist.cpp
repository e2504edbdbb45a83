#include "storage/attribute/tnumberlist.h"

#include "foundation/object/fvariant.h"
#include "storage/attribute/farchive.h"
#include "storage/stream/fstream.h"

namespace
{
void setNumber(FVariant& variant, long long value)
{
    variant.setInt(value);
}
void setNumber(FVariant& variant, double value)
{
    variant.setFloat(value);
}

bool writeNumber(FStream& stream, long long value)
{
    return stream.writeInt64(value);
}
bool writeNumber(FStream& stream, double value)
{
    return stream.writeDouble(value);
}

bool readNumber(FStream& stream, long long& value)
{
    int64 number = 0;
    const bool isRead = stream.readInt64(number);
    value = number;
    return isRead;
}
bool readNumber(FStream& stream, double& value)
{
    return stream.readDouble(value);
}
} // namespace

template <class T>
bool TNumberList<T>::unqueue(T& value)
{
    const int index = advance();
    if (index < 0)
        return false;
    value = at(index);
    return true;
}

template <class T>
bool TNumberList<T>::unqueueVariant(FVariant& value)
{
    T number{};
    if (!unqueue(number))
        return false;
    setNumber(value, number);
    return true;
}

template <class T>
bool TNumberList<T>::externalize(FArchive& archive) const
{
    if (!archive.writeCount(total()))
        return false;
    for (const T value : values)
        if (!writeNumber(archive.getStream(), value))
            return false;
    return true;
}

template <class T>
bool TNumberList<T>::internalize(FArchive& archive)
{
    values.clear();
    reset();
    int count = 0;
    if (!archive.readCount(count))
        return false;
    for (int i = 0; i < count; i++)
    {
        T value{};
        if (!readNumber(archive.getStream(), value))
            return false;
        queue(value);
    }
    return true;
}

template class TNumberList<long long>;
template class TNumberList<double>;
