#include "containers/keyed/cmdictionary.h"
#include "containers/sequence/cmarray.h"
#include "foundation/object/iptr.h"
#include "foundation/text/cmstring.h"
#include "foundation/text/cmtmpstring.h"
#include "foundation/text/fbase64.h"
#include "storage/archive/fxmlarchive.h"
#include "storage/attribute/fattributes.h"
#include "storage/path/fnpath.h"
#include "storage/url/furl.h"
#include "uploadmanager/cleartoken.h"
#include "uploadmanager/deprecatedcurl.h"
#include "uploadmanager/productlist.h"
#include "uploadmanager/puploadmanagerapplication.h"
#include "uploadmanager/serviceconfiguration.h"
#include "uploadmanager/sharedbrowser.h"
#include "uploadmanager/storednames.h"
#include "uploadmanager/storedpath.h"
#include "uploadmanager/transfer.h"
#include "uploadmanager/uploadtexts.h"
#include "uploadmanager/vlmrapplication.h"
#include "uploadmanager/vlmrprotocol.h"
#include "uploadmanager/wiretext.h"

#include <utility>

// The login round trip: the token check, the browser, and the redirect that brings the token back.

namespace
{
// The service sends a handful. Each pair is compared with all before it, so that a page that sends the user here must not
// choose their number.
constexpr int kMaxPairs = 1000;

// A query pair and the fragment behind it come apart at "#", and go to the end. What stands right behind a split one
// is not looked at: the service sends one fragment at most.
void splitFragments(CmArray& parts)
{
    CmArray whole(0, 10);
    whole.retainElements();
    for (int i = 0; i < parts.total(); i++)
    {
        CmArray pieces(0, 10);
        CmString* part = static_cast<CmString*>(parts.at(i));
        if (CmString::split(*part, pieces, u"#", false, true) != 2)
        {
            whole.add(part);
            continue;
        }
        parts.takeAllFrom(&pieces, true);
        if (++i < parts.total())
            whole.add(parts.at(i));
    }
    parts.removeAll();
    parts.takeAllFrom(&whole, true);
}

bool addPair(CmString& part, CmDictionary& result)
{
    CmArray pieces(0, 10);
    if (CmString::split(part, pieces, u"=", false, true) != 2)
        return false;
    IPtr<CmString> key = static_cast<CmString*>(pieces.at(0));
    IPtr<CmString> value = static_cast<CmString*>(pieces.at(1));
    if (!result.add(key.get(), value.get()))
        return false;
    // The dictionary took over these references.
    static_cast<void>(key.take());
    static_cast<void>(value.take());
    return true;
}

CmString* lookupText(CmDictionary& dictionary, const char16* key)
{
    CmTmpString name(key);
    return FCast(CmString, dictionary.lookupObject(&name));
}

bool isUsableToken(FString& token)
{
    return ClearToken(token).isUsable();
}

bool contains(const ConstString& text, const ConstString& word)
{
    return text.findNext(0, word) >= 0;
}
} // namespace

bool PUploadManagerApplication::isValidAccessToken(FString& token)
{
    if (!isUsableToken(token) || !checkInitializeCurl())
        return false;
    CURL* curl = curl_easy_init();
    if (!curl)
    {
        fatalError(kFatalCurlTokenCheck);
        return false;
    }
    FString url = makeApiUrl("/me?oauth_token=");
    {
        ClearToken clear(token);
        url.append(clear.text8());
    }
    CallbackData data;
    data.app = this;
    checkCurlError(curl_easy_setopt(curl, CURLOPT_URL, url.text8()), data);
    setReplyCallback(curl, data);
    setVerification(curl, data);
    noteSocket(curl, data);
    checkCurlError(curl_easy_setopt(curl, CURLOPT_NOPROGRESS, 0L), data);
    checkCurlError(setProgressFunction(curl, stopSilentTransfer), data);
    checkCurlError(curl_easy_setopt(curl, CURLOPT_PROGRESSDATA, &data), data);
    performTransfer(curl, data);
    curl_easy_cleanup(curl);
    return data.error.isEmpty();
}

bool PUploadManagerApplication::checkNeedLogin(VlmrApplication* application)
{
    bool mustAsk = requireLogin && !loginDone && !uploadThread;
    if (isValidAccessToken(application->accessToken) && !mustAsk)
        return false;

    FString url = makeWebUrl("/connect?response_type=code_and_token&client_id=");
    url.append(application->clientId);
    url.append("&redirect_uri=");
    url.append(kVlmrScheme);
    url.append("://");
    url.append(application->schemeWord);
    url.append(kRedirectPath);
    if (!openInSharedBrowser(url.text16()))
        fatalError(strCouldNotOpenLoginScreen.text());
    return true;
}

bool PUploadManagerApplication::parseUrl(FPath* url, CmDictionary& result)
{
    FString text = getPathText(url);
    if (text.isEmpty())
        return false;
    FUrl::urlDecode(text);
    int question = text.findNext(0, u'?');
    if (question < 0)
        return true;
    String query;
    if (!text.extract(query, static_cast<unsigned>(question) + 1, -1))
        return false;

    if (query.countOccurences(u'&') + query.countOccurences(u'#') >= kMaxPairs)
        return false;

    CmArray parts(0, 10);
    CmString::split(query, parts, u"&", false, true);
    splitFragments(parts);
    for (int i = 0; i < parts.total(); i++)
        if (!addPair(*static_cast<CmString*>(parts.at(i)), result))
            return false;
    return true;
}

bool PUploadManagerApplication::checkScLoginData(FPath* url, CmDictionary& dictionary)
{
    FString text = getPathText(url);
    CmString* token = lookupText(dictionary, u"access_token");
    if (text.isEmpty() || !token)
        return false;
    for (int i = 0; i < applications.total(); i++)
    {
        VlmrApplication* product = static_cast<VlmrApplication*>(applications.at(i));
        if (!contains(text, product->schemeWord))
            continue;
        FString encoded(*token);
        if (!FBase64::encode(encoded))
            return false;
        ClearToken::replace(product->accessToken, encoded);
        storeToken(product->name, encoded);
        return true;
    }
    return false;
}

// Other products' tokens in the file stay; a damaged file is begun anew.
void PUploadManagerApplication::storeToken(const FString& productName, const FString& token)
{
    FAttributes tokens;
    bool isUnreadable = false;
    FXmlArchive::loadAttributes(kTokenFile, kTokenRoot, tokens, &isUnreadable);
    tokens.set(FString(productName).text8(), token, true);
    saveTokens(tokens, isUnreadable);
}

// A file that could not be read may hold more than these tokens, and is left alone. Where nothing is saved, the old file
// stays whole: a login holds for this run all the same; a logout has not happened.
void PUploadManagerApplication::saveTokens(const FAttributes& tokens, bool isUnreadable)
{
    if (isUnreadable || !FXmlArchive::saveAttributes(kTokenFile, kTokenRoot, tokens))
        tokenFileFailed = true;
}

void PUploadManagerApplication::addTokenFileWarning()
{
    if (!std::exchange(tokenFileFailed, false))
        return;
    FString text;
    text.printf(strInternalError.text(), kFatalCache);
    addWarning(text.text16());
}

bool PUploadManagerApplication::checkScError(CmDictionary& dictionary)
{
    CmString* error = lookupText(dictionary, u"error");
    if (!error)
        return false;
    initializeTranslation(nullptr);
    FString text(strSoundCloudStatuscode.text());
    text.append(u"\n");
    text.append(*error);
    if (CmString* description = lookupText(dictionary, u"error_description"))
    {
        text.append(u"\n");
        text.append(*description);
    }
    text.replace(u"+", u" ", true);
    fatalError(text.text16());
    return true;
}

bool PUploadManagerApplication::handleRedirect(FPath* url)
{
    // The start had its reason: it is not the one that is told "directly".
    fileReceived = true;
    CmDictionary values;
    values.setOwnership(CmContainer::kTaken);
    if (!parseUrl(url, values))
        fatalRedirectError(kFatalRedirectUrl);
    FString text = getPathText(url);
    if (contains(text, u"logout"))
    {
        logOut(text);
        quitAtIdle = true;
        return true;
    }
    if (!checkScLoginData(url, values))
    {
        if (!checkScError(values))
            fatalRedirectError(kFatalRedirectWithoutData);
        return true;
    }
    if (loginDone)
        return true;
    loginDone = true;
    return openWaitingDescription();
}

// No description may have told the language yet; the last one's is remembered.
void PUploadManagerApplication::fatalRedirectError(int code)
{
    initializeTranslation(nullptr);
    fatalError(code);
}

void PUploadManagerApplication::logOut(const FString& url)
{
    FAttributes tokens;
    bool isUnreadable = false;
    if (!FXmlArchive::loadAttributes(kTokenFile, kTokenRoot, tokens, &isUnreadable) && !isUnreadable)
        return;
    FString name(kDefaultLogoutProduct);
    for (int i = 0; i < applications.total(); i++)
    {
        VlmrApplication* product = static_cast<VlmrApplication*>(applications.at(i));
        if (!contains(url, product->name))
            continue;
        name = product->name;
        break;
    }
    tokens.setString8(name.text8(), "", true);
    saveTokens(tokens, isUnreadable);
}

bool PUploadManagerApplication::openWaitingDescription()
{
    FAttributes cache;
    if (!FXmlArchive::loadAttributes(kCacheFile, kCacheRoot, cache))
    {
        quitAtIdle = true;
        return true;
    }
    IPtr<FNPath> path = restorePath(cache, kCacheKey);
    return openFile(path, nullptr);
}
