#include "uploadmanager/descriptionform.h"

#include "storage/filesystem/fnfilesystem.h"
#include "storage/path/fpath.h"
#include "storage/stream/fopenflags.h"
#include "storage/stream/fstream.h"

namespace
{
constexpr double kLowestVersion = 1.0;

// A version that is absent or unreadable counts as the first.
double readVersion(Xml::Element& root)
{
    double version = 1.0;
    getAttributeText(root, u"version").scanFloat(version);
    return version;
}

bool isDescription(Xml::Element* root)
{
    return root && isElementNamed(*root, u"AudioExportDescription") && readVersion(*root) >= kLowestVersion;
}
} // namespace

bool isDescriptionPath(const FPath& path)
{
    FString extension;
    return path.getExtension(extension) && extension.compare(u"xml") == 0;
}

DescriptionResult loadDescription(Xml::Document& document, FPath* path)
{
    FStream* stream = gFileSystem->openFile(path, kFileRead | kFileShare, nullptr);
    if (!stream)
        return kDescriptionUnreadable;
    bool isLoaded = document.load(stream);
    gFileSystem->closeFile(stream);
    return isLoaded && isDescription(document.getRootElement()) ? kDescriptionLoaded : kDescriptionForeign;
}

FString getElementText(Xml::Element& element)
{
    FString text;
    element.getStringData(text);
    return text;
}

FString getFirstChildText(Xml::Element& parent, const char16* name)
{
    Xml::Element* child = parent.firstElement(name);
    return child ? getElementText(*child) : FString();
}

FString getAttributeText(Xml::Element& element, const char16* name)
{
    Xml::Attribute* attribute = element.getAttribute(name);
    return attribute ? FString(attribute->getValue()) : FString();
}

bool isElementNamed(const Xml::Element& element, const char16* name)
{
    return element.getName().compare(name) == 0;
}
