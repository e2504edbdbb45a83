#include "storage/xml/xmlelementdata.h"

#include "storage/xml/fxmlwriter.h"
#include "storage/xml/xmltext.h"

#include <cstring>

namespace Xml
{
ElementData::ElementData(const void* bytes, int length)
{
    setData(bytes, length);
}

bool ElementData::setData(const void* bytes, int length)
{
    data.flush();
    source.drop();
    if (!bytes || length < 0 || !data.setSize(static_cast<uint32>(length) + 1))
        return false;
    memcpy(data.ptr(), bytes, static_cast<size_t>(length));
    data.ptr()[length] = 0;
    return data.setFillSize(static_cast<uint32>(length));
}

const char* ElementData::getData() const
{
    if (!source.isEmpty())
        return source.begin();
    return getLength() > 0 ? data.str8() : "";
}

int ElementData::getLength() const
{
    return static_cast<int>(source.isEmpty() ? data.getFillSize() : source.text().size());
}

bool ElementData::isFormatData() const
{
    return isXmlSpace(getData(), static_cast<size_t>(getLength()));
}

void ElementData::print(Buffer& out) const
{
    if (!source.isEmpty() && source.isPlain())
        out.put(source.begin(), static_cast<uint32>(source.text().size()));
    else
        FXmlWriter::encodeString(out, getData(), true);
}
} // namespace Xml
