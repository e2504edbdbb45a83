#include "containers/sequence/cmarray.h"
#include "foundation/object/iptr.h"
#include "foundation/text/cmstring.h"
#include "foundation/text/cmtmpstring.h"
#include "services/localisation/utranslator.h"
#include "storage/archive/fxmlarchive.h"
#include "storage/attribute/fattributes.h"
#include "storage/filesystem/fnfilesystem.h"
#include "uploadmanager/descriptionform.h"
#include "uploadmanager/puploadmanagerapplication.h"
#include "uploadmanager/storednames.h"
#include "uploadmanager/trackscanner.h"
#include "uploadmanager/uploadrequest.h"
#include "uploadmanager/uploadtexts.h"
#include "uploadmanager/vlmrapplication.h"
#include "uploadmanager/wiretext.h"

#include <algorithm>
#include <iterator>
#include <new>

// How a description becomes requests: the configuration fills a template, and every track begins as a copy of it.

namespace
{
// The languages that the program's texts come in.
constexpr const char* kLanguages[] = {"de", "es", "fr", "it", "jp", "zh", "us"};

constexpr const char16* kService = u"soundcloud";

const char* findLanguage(const FString& code)
{
    auto found = std::find_if(std::begin(kLanguages), std::end(kLanguages),
                              [&](const char* language) { return code.compare(language) == 0; });
    return found == std::end(kLanguages) ? nullptr : *found;
}

// The code that a description asks for; a later Application overrides an earlier one.
FString readLanguage(FPath* file)
{
    FString code;
    Xml::Document document;
    if (!file || !isDescriptionPath(*file) || loadDescription(document, file) != kDescriptionLoaded)
        return code;
    forEachChildElement(*document.getRootElement(),
                        [&](Xml::Element& element)
                        {
                            if (isElementNamed(element, u"Application") && element.firstElement(u"Language"))
                                code = getFirstChildText(element, u"Language");
                        });
    return code;
}
} // namespace

void PUploadManagerApplication::initializeTranslation(FPath* file)
{
    if (translationEnabled)
        return;
    translationEnabled = true;
    FAttributes stored;
    if (const char* language = findLanguage(readLanguage(file)))
    {
        gTranslator->initialize(language);
        stored.setString8(kLanguageKey, language, true);
        FXmlArchive::saveAttributes(kLanguageFile, kLanguageRoot, stored);
        return;
    }
    if (!FXmlArchive::loadAttributes(kLanguageFile, kLanguageRoot, stored))
    {
        gTranslator->initialize(false);
        return;
    }
    stored.get(kLanguageKey, storedLanguage);
    gTranslator->initialize(storedLanguage.text8());
}

VlmrApplication* PUploadManagerApplication::findProduct(const ConstString& name) const
{
    for (int i = 0; i < applications.total(); i++)
    {
        VlmrApplication* product = static_cast<VlmrApplication*>(applications.at(i));
        if (product->name.compare(name) == 0)
            return product;
    }
    return nullptr;
}

UploadRequest* PUploadManagerApplication::scanUploadManagerConfiguration(Xml::Element* root)
{
    if (!root)
        return nullptr;
    IPtr<UploadRequest> record = adopt(new (std::nothrow) UploadRequest);
    if (!record)
    {
        fatalError(kFatalConfigurationMemory);
        return nullptr;
    }
    IPtr<Xml::Element> configuration;
    forEachChildElement(*root,
                        [&](Xml::Element& element)
                        {
                            if (isElementNamed(element, u"Application"))
                                scanApplication(element, *record);
                            if (!isElementNamed(element, u"Configuration"))
                                return;
                            configuration = &element;
                            scanConfiguration(element);
                        });
    if (!record->application)
    {
        fatalError(kFatalProduct);
        return nullptr;
    }
    if (configuration)
        scanPublisherConfiguration(configuration, record);
    return record.take();
}

void PUploadManagerApplication::scanApplication(Xml::Element& element, UploadRequest& record)
{
    forEachChildElement(element,
                        [&](Xml::Element& child)
                        {
                            if (!isElementNamed(child, u"ProductFamily"))
                                return;
                            if (VlmrApplication* product = findProduct(getElementText(child)))
                                record.application = product;
                        });
}

void PUploadManagerApplication::scanConfiguration(Xml::Element& element)
{
    forEachChildElement(element,
                        [&](Xml::Element& child)
                        {
                            bool isTrue = getElementText(child).compare(u"true") == 0;
                            if (isElementNamed(child, u"RequireLogin"))
                                requireLogin = isTrue;
                            else if (isElementNamed(child, u"GuiMode"))
                                setGuiMode(isTrue);
                        });
}

bool PUploadManagerApplication::scanPublisherConfiguration(Xml::Element* element, UploadRequest* request)
{
    if (!element || !request)
        return false;
    forEachChildElement(*element,
                        [&](Xml::Element& child)
                        {
                            FString value = getElementText(child);
                            // A bad word here is silently false, other than with its neighbours.
                            if (isElementNamed(child, u"Commentable"))
                                request->commentable = value.compare(u"true") == 0;
                            else if (isElementNamed(child, u"Sharing"))
                                scanSharing(*request, value);
                            else if (isElementNamed(child, u"Streamable"))
                                scanSwitch(*request, u"Streamable", value, request->streamable);
                            else if (isElementNamed(child, u"Downloadable"))
                                scanSwitch(*request, u"Downloadable", value, request->downloadable);
                            else if (isElementNamed(child, u"Publishers"))
                                scanPublishers(*request, child);
                        });
    return true;
}

bool PUploadManagerApplication::checkAudioFile(UploadRequest& request)
{
    if (gFileSystem->fileExists(&request.path))
        return true;
    FString text;
    text.printf(strFileWasNotFound.text(), getPathText(&request.path).text16());
    addGeneralError(text.text16());
    return false;
}

void PUploadManagerApplication::scanSharing(UploadRequest& request, const FString& value)
{
    if (value.compare(u"private") == 0 || value.compare(u"public") == 0)
        request.sharing = value;
    else
        addParameterWarning(&request, FString(u"Sharing"), request.sharing.text16());
}

void PUploadManagerApplication::scanSwitch(UploadRequest& request, const char16* name, const FString& value,
                                           bool& target)
{
    if (value.compare(u"true") == 0)
        target = true;
    else if (value.compare(u"false") == 0)
        target = false;
    else
        addParameterWarning(&request, FString(name), target ? u"true" : u"false");
}

void PUploadManagerApplication::scanPublishers(UploadRequest& request, Xml::Element& element)
{
    FString child(u"Publisher");
    FString attribute(u"name");
    scanElements(element, child, request.publishers, &attribute);
}

bool PUploadManagerApplication::scanElements(Xml::Element& parent, FString& elementName, CmContainer& target,
                                             FString* attributeName)
{
    forEachChildElement(parent,
                        [&](Xml::Element& child)
                        {
                            if (!isElementNamed(child, elementName.text16()))
                                return;
                            FString value = attributeName ? getAttributeText(child, attributeName->text16())
                                                          : getElementText(child);
                            if (!value.isEmpty())
                                target.add(adopt(new CmString(value)));
                        });
    return true;
}

UploadRequest* PUploadManagerApplication::scanUploadRequest(Xml::Element* track, UploadRequest& configuration)
{
    IPtr<UploadRequest> copy = adopt(static_cast<UploadRequest*>(configuration.newCopy()));
    if (!track || !copy)
        return nullptr;
    TrackScanner scanner(*this, *copy);
    forEachChildElement(*track, [&](Xml::Element& element) { scanner.scan(element); });
    if (!checkAudioFile(*copy))
        return nullptr;
    if (copy->title.isEmpty())
        copy->path.getNameWithoutExtension(copy->title, false);
    scanner.applyReleaseDate();
    if (!scanPublisherConfiguration(track, copy))
        return nullptr;
    CmTmpString service(kService);
    if (!copy->publishers.contains(&service))
    {
        fatalError(kFatalPublisher);
        return nullptr;
    }
    return copy.take();
}
