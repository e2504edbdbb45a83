#pragma once

#include "foundation/text/fstring.h"
#include "storage/xml/xmldocument.h"
#include "storage/xml/xmlelement.h"

class FPath;

// The outer form of an export description, the file by which a host hands tracks over, and small steps through XML
// elements. Main thread, but for the steps, which the upload thread takes through replies.

enum DescriptionResult
{
    kDescriptionLoaded,
    /// The file could not be opened.
    kDescriptionUnreadable,
    /// It is no XML, or not of this form or version.
    kDescriptionForeign
};

/// Whether the path names a description: only the extension "xml", case respected, does.
bool isDescriptionPath(const FPath& path);

/// Reads the file and checks its root and version.
DescriptionResult loadDescription(Xml::Document& document, FPath* path);

/// The text of `element`; empty where it has none.
FString getElementText(Xml::Element& element);

/// The text of the first child element of this name; empty where there is none.
FString getFirstChildText(Xml::Element& parent, const char16* name);

/// The value of an attribute; empty where it is missing.
FString getAttributeText(Xml::Element& element, const char16* name);

bool isElementNamed(const Xml::Element& element, const char16* name);

/// Calls `visit` with every child that is an element, in order.
template <class Visitor>
void forEachChildElement(Xml::Element& parent, Visitor&& visit)
{
    for (Xml::Element* child = parent.firstElement(); child; child = child->nextElement())
        visit(*child);
}
