#include "foundation/object/iptr.h"
#include "storage/stream/fmemorystream.h"
#include "storage/xml/xmldocument.h"
#include "storage/xml/xmlelement.h"
#include "uploadmanager/descriptionform.h"
#include "uploadmanager/puploadmanagerapplication.h"
#include "uploadmanager/sharedbrowser.h"
#include "uploadmanager/transfer.h"
#include "uploadmanager/uploadrequest.h"
#include "uploadmanager/uploadtexts.h"
#include "uploadmanager/wiretext.h"

#include <atomic>

// What the service answers, and what becomes of it.

namespace
{
// The edit page of the first uploaded track only is opened, once in the life of the process.
std::atomic<bool> openMetaDataUrl{true};

void addError(CallbackData& data, const char16* text)
{
    if (data.request)
        data.app->addUploadError(text);
    else
        data.app->addGeneralError(text);
}

void addAnswer(CallbackData& data, Xml::Element& element)
{
    addError(data, getElementText(element).text16());
}

void announceError(CallbackData& data)
{
    FString text;
    if (data.request)
        text.printf(strUploadFailedForFile.text(), getPathText(&data.request->path).text16());
    else
        text.assign(strSoundCloudCommunicationError.text());
    addError(data, text.text16());
    addError(data, strSoundCloudStatuscode.text());
    data.error.assign("error");
}

void takeErrors(CallbackData& data, Xml::Element& root)
{
    announceError(data);
    if (isElementNamed(root, u"error"))
    {
        addAnswer(data, root);
        return;
    }
    forEachChildElement(root,
                        [&](Xml::Element& child)
                        {
                            if (isElementNamed(child, u"error"))
                                addAnswer(data, child);
                        });
}

bool openEditPage(Xml::Element& track)
{
    FString link = getFirstChildText(track, u"permalink-url");
    if (link.isEmpty())
        return false;
    link.append(u"/edit");
    return openInSharedBrowser(link.text16());
}

void takeTrack(CallbackData& data, Xml::Element& track)
{
    if (!data.request || !data.app || data.app->isGuiMode() || !openMetaDataUrl)
        return;
    FString warning;
    warning.printf(strCouldNotOpenEditPage.text(), getPathText(&data.request->path).text16());
    if (openEditPage(track))
    {
        openMetaDataUrl = false;
        return;
    }
    data.app->addGeneralError(warning.text16());
    data.app->addGeneralError(strCheckMetaDataOnline.text());
}

void takeReply(CallbackData& data, FMemoryStream& stream)
{
    Xml::Document document;
    Xml::Element* root = document.load(&stream) ? document.getRootElement() : nullptr;
    if (!root)
        data.error.assign("error");
    else if (isElementNamed(*root, u"error") || isElementNamed(*root, u"errors"))
        takeErrors(data, *root);
    else if (isElementNamed(*root, u"track"))
        takeTrack(data, *root);
}
} // namespace

size_t libcurl_write_callback(char* buffer, size_t size, size_t count, void* data)
{
    size_t length = size * count;
    FMemoryStream stream(buffer, static_cast<int>(length));
    if (data)
        takeReply(*static_cast<CallbackData*>(data), stream);
    return length;
}
