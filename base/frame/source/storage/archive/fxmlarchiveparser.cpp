#include "storage/archive/fxmlarchiveparser.h"

#include "storage/archive/archivenumbers.h"
#include "storage/attribute/ffloatlist.h"
#include "storage/attribute/fintlist.h"
#include "storage/attribute/fobjectlist.h"
#include "storage/attribute/fstringlist.h"
#include "storage/attribute/fsublist.h"
#include "storage/stream/fmemorystream.h"
#include "storage/xml/fxmlattribute.h"
#include "storage/xml/xmltext.h"

#include <cstring>
#include <string_view>

/// A tag, the place where it may stand, and what reads it.
struct FXmlArchiveParser::Handler
{
    const char* tag;
    Place place;
    bool (FXmlArchiveParser::*start)(CmContainer& attributes);
};

namespace
{
FString* findValue(const CmContainer& attributes, std::string_view name)
{
    for (int i = 0, count = attributes.total(); i < count; i++)
    {
        auto* attribute = static_cast<FXmlAttribute*>(attributes.at(i));
        if (std::string_view(attribute->name.text8(), attribute->name.length()) == name)
            return &attribute->value;
    }
    return nullptr;
}

const char* findText(const CmContainer& attributes, std::string_view name)
{
    const FString* value = findValue(attributes, name);
    return value ? value->text8() : nullptr;
}

int hexDigit(char c)
{
    if (c >= '0' && c <= '9')
        return c - '0';
    if (c >= 'A' && c <= 'F')
        return c - 'A' + 10;
    return c >= 'a' && c <= 'f' ? c - 'a' + 10 : -1;
}

FAttrList* makeList(const char* type)
{
    if (strcmp(type, "obj") == 0)
        return new FObjectList;
    if (strcmp(type, "list") == 0)
        return new FSubList;
    if (strcmp(type, "int") == 0)
        return new FIntList;
    if (strcmp(type, "float") == 0)
        return new FFloatList;
    return strcmp(type, "string") == 0 ? new FStringList : nullptr;
}
} // namespace

FXmlArchiveParser::FXmlArchiveParser(FStream* source, const char* wantedRootTag,
                                     FStringAttributeArray& localRoots, FStringAttributeArray& otherRoots)
    : FXmlParser(source, true),
      rootTag(wantedRootTag),
      roots(&localRoots),
      globalRoots(&otherRoots)
{
}

FXmlArchiveParser::FXmlArchiveParser(FStream* source, const char* wantedRootTag, FAttributes& tree)
    : FXmlParser(source, true),
      rootTag(wantedRootTag),
      target(&tree)
{
}

FXmlArchiveParser::~FXmlArchiveParser() = default;

bool FXmlArchiveParser::read()
{
    open.assign(1, {Place::kDocument});
    if (!process(nullptr) || !isRootClosed)
        return false;
    linker.link();
    return true;
}

// Tags

const FXmlArchiveParser::Handler* FXmlArchiveParser::findHandler(const char* name)
{
    static constexpr Handler handlers[] = {
        {"int", Place::kTree, &FXmlArchiveParser::startInt},
        {"float", Place::kTree, &FXmlArchiveParser::startFloat},
        {"string", Place::kTree, &FXmlArchiveParser::startString},
        {"member", Place::kTree, &FXmlArchiveParser::startMember},
        {"item", Place::kList, &FXmlArchiveParser::startItem},
        {"list", Place::kTree, &FXmlArchiveParser::startList},
        {"obj", Place::kTree, &FXmlArchiveParser::startObject},
        {"bin", Place::kTree, &FXmlArchiveParser::startBinary},
        {"root", Place::kRootObjects, &FXmlArchiveParser::startRoot},
        {"rootObjects", Place::kRootTag, &FXmlArchiveParser::startRootObjects},
    };
    for (const Handler& handler : handlers)
        if (*handler.tag == *name && strcmp(handler.tag, name) == 0)
            return &handler;
    return nullptr;
}

bool FXmlArchiveParser::startTag(const char* name, CmContainer& attributes, bool isEmpty, void*)
{
    opened = {Place::kValue};
    const Place place = open.back().place;
    if (place == Place::kDocument)
    {
        if (isRootClosed || rootTag != name || !startRootTag(attributes))
            return false;
    }
    else
    {
        const Handler* handler = findHandler(name);
        // Objects and, in a document of one tree, values stand right in the root tag.
        const bool isInPlace = handler && (handler->place == place ||
                                           (place == Place::kRootTag && handler->place == Place::kTree));
        if (!isInPlace || !(this->*handler->start)(attributes))
            return false;
    }
    open.push_back(opened);
    if (opened.tree)
        nesting++;
    if (isEmpty)
        close();
    return error == kNoError;
}

bool FXmlArchiveParser::endTag(const char*, void*)
{
    const bool isComplete = pendingDigit < 0;
    close();
    return isComplete;
}

void FXmlArchiveParser::close()
{
    if (open.back().tree)
        nesting--;
    if (open.back().block)
        open.back().block->rewind();
    if (open.back().place == Place::kRootTag)
        isRootClosed = true;
    pendingDigit = -1;
    open.pop_back();
}

/// What follows goes into a tree. False where trees would be nested too deep.
bool FXmlArchiveParser::openTree(FAttributes* tree, FXmlInstance* holder)
{
    opened.place = Place::kTree;
    opened.tree = tree;
    opened.holder = holder;
    return nesting < FArchive::kMaxDepth;
}

bool FXmlArchiveParser::startRootTag(CmContainer&)
{
    opened.place = Place::kRootTag;
    opened.tree = target;
    return true;
}

bool FXmlArchiveParser::startRootObjects(CmContainer&)
{
    opened.place = Place::kRootObjects;
    return roots != nullptr;
}

bool FXmlArchiveParser::startRoot(CmContainer& attributes)
{
    const char* name = findText(attributes, "name");
    if (!name)
        return false;
    if (const char* idText = findText(attributes, "ID"))
    {
        uint64 id = 0;
        if (!parseArchiveID(idText, id))
            return false;
        globalRoots->setObjAttribute(name, makeReference(id, nullptr), FAttributeValue::kOwned);
        return true;
    }
    auto tree = adopt(new FAttributes);
    roots->setObjAttribute(name, new FXmlInstance(0, nullptr, tree), FAttributeValue::kOwned);
    return openTree(tree, nullptr);
}

bool FXmlArchiveParser::startMember(CmContainer& attributes)
{
    FAttributes* tree = open.back().tree;
    const char* name = findText(attributes, "name");
    if (!tree || !name)
        return false;
    auto* member = new FAttributes;
    tree->setAttributes(name, member, true);
    return openTree(member, open.back().holder);
}

// Values

bool FXmlArchiveParser::startInt(CmContainer& attributes)
{
    FAttributes* tree = open.back().tree;
    const char* name = findText(attributes, "name");
    long long value = 0;
    return tree && name && parseArchiveInteger(findText(attributes, "value"), value) &&
           tree->set(name, value);
}

bool FXmlArchiveParser::startFloat(CmContainer& attributes)
{
    FAttributes* tree = open.back().tree;
    const char* name = findText(attributes, "name");
    double value = 0;
    return tree && name && parseArchiveFloat(findText(attributes, "value"), value) && tree->set(name, value);
}

bool FXmlArchiveParser::startString(CmContainer& attributes)
{
    FAttributes* tree = open.back().tree;
    const char* name = findText(attributes, "name");
    FString* value = findValue(attributes, "value");
    if (!tree || !name || !value)
        return false;
    // Copied, not taken: the parser fills the same text again for the next tag.
    const char* wide = findText(attributes, "wide");
    String text;
    if (wide && strcmp(wide, "true") == 0)
        Xml::assignUtf8(text, value->text8(), value->length());
    else
        text = *value;
    tree->entry(name).takeString(text);
    return true;
}

bool FXmlArchiveParser::startBinary(CmContainer& attributes)
{
    FAttributes* tree = open.back().tree;
    const char* name = findText(attributes, "name");
    if (!tree || !name)
        return false;
    opened.place = Place::kBinary;
    opened.block = new FMemoryStream;
    return tree->setObject(name, opened.block, true);
}

void FXmlArchiveParser::gotData(void* bytes, unsigned int count, void*)
{
    FMemoryStream* block = open.back().block;
    if (!block)
        return;
    const auto* text = static_cast<const char*>(bytes);
    for (unsigned int i = 0; i < count; i++)
    {
        if (text[i] == '\t' || text[i] == '\r' || text[i] == '\n' || text[i] == ' ')
            continue;
        const int digit = hexDigit(text[i]);
        if (digit < 0)
        {
            error = kErrorMalformed;
            return;
        }
        if (pendingDigit < 0)
        {
            pendingDigit = digit;
            continue;
        }
        block->writeUChar8(static_cast<uint8>(pendingDigit * 16 + digit));
        pendingDigit = -1;
    }
}

// Objects

bool FXmlArchiveParser::startObject(CmContainer& attributes)
{
    if (const char* className = findText(attributes, "class"))
        return open.back().place == Place::kRootTag && startInstance(attributes, className);
    return open.back().tree && startReference(attributes);
}

bool FXmlArchiveParser::startInstance(CmContainer& attributes, const char* className)
{
    uint64 id = 0;
    if (!parseArchiveID(findText(attributes, "ID"), id))
        return false;
    auto tree = adopt(new FAttributes);
    auto instance = adopt(new FXmlInstance(id, className, tree));
    if (const char* name = findText(attributes, "name"))
        instance->setName(name);
    linker.addInstance(instance);
    return openTree(tree, instance);
}

bool FXmlArchiveParser::startReference(CmContainer& attributes)
{
    const char* name = findText(attributes, "name");
    uint64 id = 0;
    if (!name || !parseArchiveID(findText(attributes, "ID"), id))
        return false;
    return open.back().tree->setObject(name, makeReference(id, open.back().holder), true);
}

FXmlReference* FXmlArchiveParser::makeReference(uint64 id, FXmlInstance* holder)
{
    auto* reference = new FXmlReference(id);
    linker.addReference(reference, holder);
    return reference;
}

// Lists

bool FXmlArchiveParser::startList(CmContainer& attributes)
{
    FAttributes* tree = open.back().tree;
    const char* name = findText(attributes, "name");
    const char* type = findText(attributes, "type");
    if (!tree || !name || !type)
        return false;
    opened.place = Place::kList;
    opened.holder = open.back().holder;
    opened.list = makeList(type);
    return opened.list && tree->setObject(name, opened.list, true);
}

bool FXmlArchiveParser::startItem(CmContainer& attributes)
{
    FAttrList& list = *open.back().list;
    auto* trees = FCast(FSubList, &list);
    if (!trees)
        return addItem(list, attributes);
    auto* tree = new FAttributes;
    trees->queue(tree, true);
    return openTree(tree, open.back().holder);
}

bool FXmlArchiveParser::addItem(FAttrList& list, CmContainer& attributes)
{
    FString* value = findValue(attributes, "value");
    if (!value)
        return false;
    const char* text = value->text8();
    long long integer = 0;
    double number = 0;
    uint64 id = 0;
    if (auto* integers = FCast(FIntList, &list); integers && parseArchiveInteger(text, integer))
        integers->queue(integer);
    else if (auto* numbers = FCast(FFloatList, &list); numbers && parseArchiveFloat(text, number))
        numbers->queue(number);
    else if (auto* objects = FCast(FObjectList, &list); objects && parseArchiveID(text, id))
        objects->queue(makeReference(id, open.back().holder), true);
    else if (auto* texts = FCast(FStringList, &list))
    {
        value->toWideString(kEncodingUtf8);
        texts->queue(value->text16(), true, true);
    }
    else
        return false;
    return true;
}
