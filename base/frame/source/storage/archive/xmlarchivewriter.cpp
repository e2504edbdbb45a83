#include "storage/archive/xmlarchivewriter.h"

#include "containers/value/cmbufferpool.h"
#include "storage/archive/fxmlarchive.h"
#include "storage/attribute/fattrbuffer.h"
#include "storage/attribute/ffloatlist.h"
#include "storage/attribute/fintlist.h"
#include "storage/attribute/fobjectlist.h"
#include "storage/attribute/fstringlist.h"
#include "storage/attribute/fsublist.h"
#include "storage/attribute/fxmlinstance.h"
#include "storage/stream/fstream.h"
#include "storage/xml/fxmlparser.h"
#include "storage/xml/fxmlwriter.h"

#include <array>
#include <charconv>
#include <cstring>

namespace
{
constexpr uint32 kLineSize = 1024;
constexpr uint32 kBytesPerLine = 32;
constexpr int kSignificantDigits = 50;
constexpr std::string_view kIndent = "   ";

/// The characters of 8-bit text that are written as entities.
constexpr std::array<bool, 256> makeEncodedCharacters()
{
    std::array<bool, 256> table{};
    for (unsigned i = 0x80; i < table.size(); i++)
        table[i] = true;
    for (const char c : std::string_view("\"&<>$^`\n\r"))
        table[static_cast<uint8>(c)] = true;
    return table;
}
constexpr std::array<bool, 256> kEncoded = makeEncodedCharacters();

bool isPlain(const char* text)
{
    for (; *text; text++)
        if (kEncoded[static_cast<uint8>(*text)])
            return false;
    return true;
}

/// The length of 16-bit text that stays as it is in UTF-8; -1 for any other.
int plainLength(const char16* text)
{
    int length = 0;
    for (; text[length]; length++)
        if (const char16 c = text[length]; c >= 0x80 || c == '&' || c == '<' || c == '>' || c == '"')
            return -1;
    return length;
}

const char* listType(ArchivedKind kind)
{
    switch (kind)
    {
    case ArchivedKind::kObjectList:
        return "obj";
    case ArchivedKind::kSubList:
        return "list";
    case ArchivedKind::kIntList:
        return "int";
    case ArchivedKind::kFloatList:
        return "float";
    default:
        return "string";
    }
}
} // namespace

XmlArchiveWriter::XmlArchiveWriter(FStream& target)
    : stream(target),
      buffer(gXmlArchiveBuffers().allocateBuffer(kLineSize))
{
    seen.setHashFunction(gHashObject);
    seen.setAutoResize(true);
}

XmlArchiveWriter::~XmlArchiveWriter()
{
    gXmlArchiveBuffers().deleteBuffer(buffer);
}

// The document

bool XmlArchiveWriter::writeRoots(const char* rootTag, const FStringAttributeArray& roots,
                                  const FStringAttributeArray& globalRoots)
{
    beginDocument(rootTag);
    line(1, "<rootObjects>");
    for (int i = 0; i < globalRoots.total(); i++)
        if (!writeGlobalRoot(*globalRoots.entryAt(i)))
            return false;
    for (int i = 0; i < roots.total(); i++)
        if (!writeRoot(*roots.entryAt(i)))
            return false;
    line(1, "</rootObjects>");
    return finishDocument(rootTag);
}

bool XmlArchiveWriter::writeTree(const char* rootTag, const FAttributes& attributes)
{
    beginDocument(rootTag);
    return writeAttributes(attributes, 1) && finishDocument(rootTag);
}

void XmlArchiveWriter::beginDocument(const char* rootTag)
{
    line(0, "<?xml version=\"1.0\" encoding=\"utf-8\"?>");
    append("<");
    append(rootTag);
    endLine(">");
}

bool XmlArchiveWriter::finishDocument(const char* rootTag)
{
    if (!objects.empty())
        endLine({});
    // By index: objects lead to further ones.
    for (size_t i = 0; i < objects.size(); i++)
    {
        const Waiting waiting = objects[i];
        if (!writeObject(waiting))
            return false;
        endLine({});
    }
    append("</");
    append(rootTag);
    endLine(">");
    flush();
    stream.flush();
    return isWhole && stream.verify();
}

bool XmlArchiveWriter::writeGlobalRoot(const FStringIDAttribute& root)
{
    CmObject* object = getSharedObject(getArchivedObject(root));
    if (!object)
        return false;
    enlist(object, root.getKey());
    indent(2);
    append("<root name=\"");
    appendName(root.getKey());
    append("\" ID=\"");
    appendID(getArchiveID(object));
    endLine("\"/>");
    return true;
}

bool XmlArchiveWriter::writeRoot(const FStringIDAttribute& root)
{
    const CmObject* object = getSharedObject(getArchivedObject(root));
    const IPtr<FAttributes> tree = object ? getArchivedTree(object) : nullptr;
    if (!tree)
        return false;
    indent(2);
    append("<root name=\"");
    appendName(root.getKey());
    endLine("\">");
    if (!writeAttributes(*tree, 3))
        return false;
    line(2, "</root>");
    return true;
}

/// Has an object written, once.
void XmlArchiveWriter::enlist(CmObject* object, const char* name)
{
    if (!object || seen.containsAbs(object))
        return;
    seen.add(object);
    objects.push_back({object, name});
}

bool XmlArchiveWriter::writeObject(const Waiting& waiting)
{
    const IPtr<FAttributes> tree = getArchivedTree(waiting.object);
    if (!tree)
        return false;
    const auto* instance = FCast(FXmlInstance, waiting.object.get());
    const char* name = waiting.name || !instance ? waiting.name : instance->getName();
    indent(1);
    append("<obj class=\"");
    appendName(getArchivedClass(waiting.object));
    append("\" ");
    if (name && *name)
    {
        append("name=\"");
        appendName(name);
        append("\" ");
    }
    append("ID=\"");
    appendID(getArchiveID(waiting.object));
    endLine("\">");
    if (!writeAttributes(*tree, 2))
        return false;
    line(1, "</obj>");
    return true;
}

// Trees

bool XmlArchiveWriter::writeAttributes(const FAttributes& attributes, int depth)
{
    if (nesting >= FArchive::kMaxDepth)
        return false;
    nesting++;
    for (int i = 0, count = attributes.total(); i < count && isWhole; i++)
        if (!writeEntry(*attributes.entryAt(i), depth))
            return false;
    nesting--;
    return isWhole;
}

bool XmlArchiveWriter::writeEntry(FStringIDAttribute& entry, int depth)
{
    if (!isArchived(entry))
        return true;
    const unsigned type = entry.getType();
    if (!(type & (FAttributeValue::kInteger | FAttributeValue::kFloat | FAttributeValue::kString)))
        return writeObjectEntry(entry.getKey(), getArchivedObject(entry), depth);

    indent(depth);
    append(type & FAttributeValue::kInteger ? "<int name=\""
           : type & FAttributeValue::kFloat ? "<float name=\""
                                            : "<string name=\"");
    appendName(entry.getKey());
    append("\" value=\"");
    if (type & FAttributeValue::kInteger)
        appendInteger(entry.getLong());
    else if (type & FAttributeValue::kFloat)
        appendFloat(entry.getFloat());
    else
        writeString(entry);
    endLine("\"/>");
    return true;
}

void XmlArchiveWriter::writeString(FStringIDAttribute& entry)
{
    if (!entry.isWide())
        return appendText8(entry.getString8());
    appendText16(entry.getString16());
    append("\" wide=\"true");
}

bool XmlArchiveWriter::writeObjectEntry(const char* name, CmObject* object, int depth)
{
    switch (const ArchivedKind kind = getArchivedKind(object))
    {
    case ArchivedKind::kTree:
        return writeMember(name, *FCast(FAttributes, object), depth);
    case ArchivedKind::kBinary:
        writeBinary(name, object, depth);
        return true;
    case ArchivedKind::kObject:
        indent(depth);
        append("<obj name=\"");
        appendName(name);
        append("\" ID=\"");
        writeReference(object);
        endLine("\"/>");
        return true;
    default:
        return writeList(name, object, kind, depth);
    }
}

bool XmlArchiveWriter::writeMember(const char* name, const FAttributes& attributes, int depth)
{
    indent(depth);
    append("<member name=\"");
    appendName(name);
    endLine("\">");
    if (!writeAttributes(attributes, depth + 1))
        return false;
    line(depth, "</member>");
    return true;
}

void XmlArchiveWriter::writeBinary(const char* name, const CmObject* object, int depth)
{
    indent(depth);
    append("<bin name=\"");
    appendName(name);
    endLine("\">");
    const void* block = nullptr;
    uint32 size = 0;
    getBinaryBlock(object, block, size);
    const auto* bytes = static_cast<const uint8*>(block);
    for (uint32 i = 0; i < size; i++)
    {
        static constexpr char digits[] = "0123456789ABCDEF";
        if (i % kBytesPerLine == 0)
            for (int level = 0; level < depth; level++)
                append("\t");
        const char pair[] = {digits[bytes[i] >> 4], digits[bytes[i] & 15]};
        append({pair, sizeof(pair)});
        if (i % kBytesPerLine == kBytesPerLine - 1 || i == size - 1)
            endLine({});
    }
    line(depth, "</bin>");
}

// Lists

bool XmlArchiveWriter::writeList(const char* name, const CmObject* object, ArchivedKind kind, int depth)
{
    indent(depth);
    append("<list name=\"");
    appendName(name);
    append("\" type=\"");
    append(listType(kind));
    endLine("\">");
    if (!writeItems(object, kind, depth + 1))
        return false;
    line(depth, "</list>");
    return true;
}

bool XmlArchiveWriter::writeItems(const CmObject* object, ArchivedKind kind, int depth)
{
    if (kind == ArchivedKind::kSubList)
        return writeTrees(object, depth);
    const int count = static_cast<const FAttrList*>(object)->total();
    for (int i = 0; i < count && isWhole; i++)
    {
        indent(depth);
        append("<item value=\"");
        if (kind == ArchivedKind::kObjectList)
            writeReference(static_cast<const FObjectList*>(object)->at(i));
        else if (kind == ArchivedKind::kIntList)
            appendInteger(static_cast<const FIntList*>(object)->at(i));
        else if (kind == ArchivedKind::kFloatList)
            appendFloat(static_cast<const FFloatList*>(object)->at(i));
        else
            appendText16(static_cast<const FStringList*>(object)->at(i));
        endLine("\"/>");
    }
    return isWhole;
}

bool XmlArchiveWriter::writeTrees(const CmObject* list, int depth)
{
    const auto* trees = static_cast<const FSubList*>(list);
    for (int i = 0; i < trees->total(); i++)
    {
        line(depth, "<item>");
        if (!writeAttributes(*trees->at(i), depth + 1))
            return false;
        line(depth, "</item>");
    }
    return true;
}

void XmlArchiveWriter::writeReference(CmObject* object)
{
    CmObject* target = getSharedObject(object);
    appendID(getArchiveID(target));
    enlist(target, nullptr);
}

// Text

void XmlArchiveWriter::indent(int depth)
{
    for (int i = 0; i < depth; i++)
        append(kIndent);
}

void XmlArchiveWriter::append(std::string_view text)
{
    if (text.size() > kLineSize - filled)
        flush();
    if (text.size() > kLineSize)
    {
        const auto size = static_cast<int64>(text.size());
        isWhole = isWhole && stream.writeRaw(text.data(), size) == size;
        return;
    }
    if (!text.empty())
        memcpy(buffer->ptr() + filled, text.data(), text.size());
    filled += static_cast<uint32>(text.size());
}

void XmlArchiveWriter::flush()
{
    isWhole = isWhole && stream.writeRaw(buffer->ptr(), filled) == int64{filled};
    filled = 0;
}

void XmlArchiveWriter::endLine(std::string_view text)
{
    append(text);
    append("\r");
}

void XmlArchiveWriter::line(int depth, std::string_view text)
{
    indent(depth);
    endLine(text);
}

void XmlArchiveWriter::appendName(const char* text)
{
    appendText8(text);
}

void XmlArchiveWriter::appendText8(const char* text)
{
    encoded.flush();
    if (!text || !isPlain(text))
        FXmlWriter::encodeString(encoded, text ? text : "", false);
    else if (const size_t length = strlen(text); length <= FXmlParser::kMaxAttributeValue)
        return append({text, length});
    else
        isWhole = false;
    appendEncoded(encoded);
}

void XmlArchiveWriter::appendText16(const char16* text)
{
    encoded.flush();
    const int length = text ? plainLength(text) : 0;
    if (length >= 0 && encoded.grow(static_cast<uint32>(length)))
    {
        for (int i = 0; i < length; i++)
            encoded.ptr()[i] = static_cast<char>(text[i]);
        encoded.setFillSize(static_cast<uint32>(length));
    }
    else
        FXmlWriter::encodeString(encoded, text);
    appendEncoded(encoded);
}

void XmlArchiveWriter::appendEncoded(const Buffer& text)
{
    isWhole = isWhole && text.getFillSize() <= FXmlParser::kMaxAttributeValue;
    append({text.str8(), text.getFillSize()});
}

void XmlArchiveWriter::appendInteger(long long value)
{
    char text[24];
    append({text, static_cast<size_t>(std::to_chars(text, std::end(text), value).ptr - text)});
}

void XmlArchiveWriter::appendID(uint64 id)
{
    char text[24];
    append({text, static_cast<size_t>(std::to_chars(text, std::end(text), id).ptr - text)});
}

void XmlArchiveWriter::appendFloat(double value)
{
    char text[kLineSize];
    const auto end =
        std::to_chars(text, std::end(text), value, std::chars_format::general, kSignificantDigits).ptr;
    append({text, static_cast<size_t>(end - text)});
}
