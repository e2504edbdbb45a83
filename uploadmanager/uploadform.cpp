#include "uploadmanager/uploadform.h"

#include "foundation/text/cmstring.h"
#include "storage/filesystem/fnfilesystem.h"
#include "uploadmanager/cleartoken.h"
#include "uploadmanager/deprecatedcurl.h"
#include "uploadmanager/puploadmanagerapplication.h"
#include "uploadmanager/uploadrequest.h"
#include "uploadmanager/uploadtexts.h"
#include "uploadmanager/vlmrapplication.h"
#include "uploadmanager/wiretext.h"

#include <cstring>

namespace
{
constexpr const char* kTokenField = "oauth_token";
// A token is shown nowhere.
constexpr const char* kHiddenValue = "...";
constexpr const char16* kNoUrl = u"://";
constexpr char16 kQuote = u'"';

// Each keyword in double quotes, but one that holds such itself, and a blank behind each.
FString makeTagList(const CmArray& keywords)
{
    FString result;
    for (int i = 0; i < keywords.total(); i++)
    {
        const CmString& keyword = *static_cast<const CmString*>(keywords.at(i));
        bool isQuoted = keyword.findNext(0, kQuote) < 0;
        if (isQuoted)
            result.append(u"\"");
        result.append(keyword);
        result.append(isQuoted ? u"\" " : u" ");
    }
    return result;
}
} // namespace

void vlmr_curl_formadd2(curl_httppost** first, curl_httppost** last, CURLformoption option1, const char* name,
                        CURLformoption option2, const char* value, CallbackData& data)
{
    int code = addFormField(first, last, option1, name, option2, value);
    if (code == kFormFieldAdded)
        return;
    FString shownName(name);
    FString shownValue;
    shownValue.fromUTF8(strcmp(name, kTokenField) == 0 ? kHiddenValue : value);
    FString text;
    text.printf(strCouldNotSetMetaDataForFile.text(), shownName.text16(), shownValue.text16(),
                getPathText(&data.request->path).text16());
    data.app->addUploadError(text.text16());
    text.printf(strSoundCloudErrorCode.text(), code);
    data.app->addUploadError(text.text16());
}

UploadForm::UploadForm(CallbackData& data, VlmrApplication* application) : callbackData(data)
{
    addAsset();
    addToken(application);
    addArtwork();
    addDescription();
    addReleaseDate();
    addLinks();
    addFlags();
    addTags();
}

UploadForm::~UploadForm()
{
    freeForm(first);
}

void UploadForm::addAsset()
{
    addFile("track[asset_data]", callbackData.request->path);
}

void UploadForm::addToken(VlmrApplication* application)
{
    if (!application)
        return;
    ClearToken token(application->accessToken);
    vlmr_curl_formadd2(&first, &last, kFormName, kTokenField, kFormContents, token.text8(), callbackData);
}

void UploadForm::addArtwork()
{
    FNPath& artwork = callbackData.request->artworkPath;
    if (ConstString(artwork.getName()).isEmpty())
        return;
    if (gFileSystem->fileExists(&artwork) && !toWirePath(artwork).isEmpty())
    {
        addFile("track[artwork_data]", artwork);
        return;
    }
    FString text;
    text.printf(strImageFileCouldNotBeUploaded.text(), getPathText(&artwork).text16());
    callbackData.app->addGeneralError(text.text16());
}

void UploadForm::addDescription()
{
    UploadRequest& request = *callbackData.request;
    addText("track[title]", request.title.isEmpty() ? ConstString("title") : request.title);
    addTextIfAny("track[description]", request.description);
    if (request.tempo > 0.0)
        addNumber("track[bpm]", request.tempo);
    addTextIfAny("track[key_signature]", request.rootKey);
    addTextIfAny("track[genre]", request.genre);
    addTextIfAny("track[track_type]", request.trackType);
    addTextIfAny("track[isrc]", request.isrc);
    addTextIfAny("track[label_name]", request.labelName);
    addTextIfAny("track[release]", request.labelCode);
}

void UploadForm::addReleaseDate()
{
    const CmDate& date = callbackData.request->releaseDate;
    if (!date.isValid())
        return;
    addNumber("track[release_year]", date.year());
    addNumber("track[release_month]", date.month());
    addNumber("track[release_day]", date.dayOfMonth());
}

void UploadForm::addLinks()
{
    UploadRequest& request = *callbackData.request;
    addTextIfAny("track[license]", request.license);
    addUrl("track[purchase_url]", request.purchaseUrl);
    addUrl("track[video_url]", request.videoUrl);
    addTextIfAny("track[sharing]", request.sharing);
}

void UploadForm::addFlags()
{
    addFlag("track[commentable]", callbackData.request->commentable);
    addFlag("track[streamable]", callbackData.request->streamable);
    addFlag("track[downloadable]", callbackData.request->downloadable);
}

void UploadForm::addTags()
{
    addTextIfAny("track[tag_list]", makeTagList(callbackData.request->keywords));
}

void UploadForm::addFile(const char* name, const FNPath& path)
{
    vlmr_curl_formadd2(&first, &last, kFormName, name, kFormFile, toWirePath(path).text8(), callbackData);
}

void UploadForm::addText(const char* name, const ConstString& text)
{
    vlmr_curl_formadd2(&first, &last, kFormName, name, kFormContents, toWireText(text).text8(), callbackData);
}

void UploadForm::addTextIfAny(const char* name, const ConstString& text)
{
    if (!text.isEmpty())
        addText(name, text);
}

void UploadForm::addUrl(const char* name, const FUrl& url)
{
    FString text;
    url.getUrl(text);
    if (text.compare(kNoUrl) != 0)
        addText(name, text);
}

// Numbers go out with a fraction, also those of the date: 2012.0.
void UploadForm::addNumber(const char* name, double number)
{
    FString text;
    text.printFloat(number);
    addText(name, text);
}

void UploadForm::addFlag(const char* name, bool value)
{
    addText(name, value ? "true" : "false");
}
