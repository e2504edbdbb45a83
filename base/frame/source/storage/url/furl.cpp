#include "storage/url/furl.h"

#include "containers/sequence/cmlinkedlist.h"
#include "foundation/object/iptr.h"
#include "storage/path/filenametext.h"
#include "storage/path/fnpath.h"
#include "storage/stream/fstream.h"
#include "storage/url/furlhandler.h"
#include "storage/url/urlmetahandler.h"
#include "storage/url/urlpathconverter.h"

#include <cstdio>
#include <cstring>

DEFINE_CLASS(FUrl, FPath)
DEFINE_INTERFACE_ID(IUrl, 0x5E8D0C27, 0xA1B44F39, 0x96E3D250, 0x7F1C8B64)
DEFINE_INTERFACE_ID(IUrlStream, 0xC92B7714, 0x3ED84A60, 0xB5F10E8C, 0x64A7D92F)

namespace
{
constexpr const char* kFileProtocol = "file";
constexpr char16 kProtocolEnd[] = u"://";
constexpr unsigned kProtocolEndLength = 3;

// Owns the handlers' records; never freed, as URLs are opened until the last moment of the process.
CmLinkedList* registeredHandlers = nullptr;

CmLinkedList& allHandlers()
{
    if (!registeredHandlers)
    {
        registeredHandlers = new CmLinkedList;
        registeredHandlers->takeElements();
    }
    return *registeredHandlers;
}

UrlMetaHandler* handlerAt(int index)
{
    return static_cast<UrlMetaHandler*>(allHandlers().at(index));
}

bool isPlain(char c)
{
    return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9') ||
           (c != 0 && strchr("-./&+=?_~", c));
}

// A character that is no digit counts as 0.
unsigned digitOf(char c)
{
    if (c >= '0' && c <= '9')
        return static_cast<unsigned>(c - '0');
    if (c >= 'a' && c <= 'f')
        return static_cast<unsigned>(c - 'a' + 10);
    if (c >= 'A' && c <= 'F')
        return static_cast<unsigned>(c - 'A' + 10);
    return 0;
}

// Cuts `text` at the first `delimiter`; `rest` takes what stands behind it. False where there is none.
bool splitAt(FString& text, char16 delimiter, FString& rest)
{
    const int place = text.findNext(0, delimiter);
    if (place < 0)
        return false;
    rest.assign(u"");
    text.extract(rest, static_cast<unsigned>(place) + 1);
    text.remove(static_cast<unsigned>(place));
    return true;
}

bool scanPort(const FString& text, int16& port)
{
    int64 number = 0;
    if (!text.scanInt64(number, 0, false) || number < 0 || number > 65535)
        return false;
    port = static_cast<int16>(number);
    return true;
}

bool endsInSlash(const FString& text)
{
    return !text.isEmpty() && text.testChar16(text.length() - 1, kUnixDelimiter);
}
} // namespace

FUrl::FUrl(const char* newProtocol, const char* newHost, const char16* newFile)
{
    protocol.assign(newProtocol);
    host.assign(newHost);
    file.assign(newFile ? newFile : u"");
    guessDefaultPort();
    updatePath();
}

FUrl::FUrl(const char* newProtocol, const char* newHost, int16 newPort, const char16* newFile,
           const char16* newUser, const char16* newPassword)
{
    set(newProtocol, newHost, static_cast<uint16>(newPort), newFile);
    user.assign(newUser ? newUser : u"");
    password.assign(newPassword ? newPassword : u"");
}

FUrl::FUrl(const char16* url)
{
    FUrl::setUrl(url);
}

FUrl::FUrl(const FUrl& other) : FPath(other)
{
    takeUrl(other);
}

FUrl& FUrl::operator=(const FUrl& other)
{
    FPath::operator=(other);
    if (this != &other)
        takeUrl(other);
    return *this;
}

FUrl::~FUrl()
{
    dropHandler();
}

void FUrl::takeUrl(const FUrl& other)
{
    dropHandler();
    protocol = other.protocol;
    host = other.host;
    port = other.port;
    file = other.file;
    user = other.user;
    password = other.password;
}

void FUrl::dropHandler()
{
    if (handler)
        handler->release();
    handler = nullptr;
}

int32 FUrl::queryInterface(const char* interfaceID, void** object)
{
    if (isSameInterface(interfaceID, IUrl::iid))
        return offerInterface<IUrl>(this, object);
    return FPath::queryInterface(interfaceID, object);
}

bool FUrl::isFileProtocol() const
{
    return protocol == ConstString(kFileProtocol);
}

// Text

void FUrl::set(const char* newProtocol, const char* newHost, uint16 newPort, const char16* newFile)
{
    dropHandler();
    protocol.assign(newProtocol);
    host.assign(newHost);
    port = static_cast<int16>(newPort);
    file.assign(newFile ? newFile : u"");
    user.assign(u"");
    password.assign(u"");
    updatePath();
}

void FUrl::setUrl(const char16* text)
{
    FString rest(text);
    rest.trim();
    const int place = rest.findNext(0, kProtocolEnd);
    if (place >= 0)
    {
        protocol.assign(u"");
        rest.extract(protocol, 0, place);
        rest.remove(0, place + static_cast<int>(kProtocolEndLength));
    }
    // What an earlier URL had must not go to another host.
    for (FString* part : {&host, &file, &user, &password})
        part->assign(u"");
    if (isFileProtocol())
        file = rest;
    else
        parseHost(rest);
    updatePath();
}

// Takes "user:password@host:port/file" apart.
void FUrl::parseHost(FString& text)
{
    splitAt(text, kUnixDelimiter, file);
    FString behind;
    if (splitAt(text, u'@', behind))
    {
        // Credentials without a password are dropped.
        if (splitAt(text, u':', password))
            user = text;
        text = behind;
    }
    FString portText;
    if (!splitAt(text, u':', portText) || !scanPort(portText, port))
        guessDefaultPort();
    host = text;
}

bool FUrl::getUrl(FString& result) const
{
    FString text(protocol);
    text.append(kProtocolEnd);
    if (!isFileProtocol())
    {
        appendHost(text);
        if (!file.isEmpty() || !host.isEmpty())
            text.append(kUnixDelimiter);
    }
    text.append(file);
    result.take(text);
    return !result.isEmpty();
}

void FUrl::appendHost(FString& text) const
{
    text.append(host);
    if (port == 0)
        return;
    // Ports reach to 65535, beyond what the member holds with its sign.
    FString portText;
    portText.printf(":%d", static_cast<int>(static_cast<uint16>(port)));
    text.append(portText);
}

void FUrl::setFile(const char16* text, bool encode)
{
    file.assign(text ? text : u"");
    if (encode)
        urlEncode(file);
    updatePath();
}

void FUrl::urlEncode(FString& text)
{
    std::string encoded;
    for (const char c : FileNameText::toBytes(text))
    {
        char escaped[4] = {c};
        if (!isPlain(c))
            snprintf(escaped, sizeof(escaped), "%%%0x", static_cast<unsigned>(static_cast<unsigned char>(c)));
        encoded += escaped;
    }
    text.fromUTF8(encoded.c_str());
    text.trim();
}

void FUrl::urlDecode(FString& text)
{
    const std::string encoded = FileNameText::toBytes(text);
    std::string decoded;
    for (size_t i = 0; i < encoded.size(); i++)
    {
        if (encoded[i] != '%' || i + 2 >= encoded.size())
        {
            decoded += encoded[i];
            continue;
        }
        decoded += static_cast<char>(
            static_cast<unsigned char>(digitOf(encoded[i + 1]) * 16 + digitOf(encoded[i + 2])));
        i += 2;
    }
    FileNameText::fromBytes(decoded.c_str(), text);
}

// Parts

void FUrl::guessDefaultPort()
{
    for (int i = 0; i < allHandlers().total(); i++)
        if (handlerAt(i)->protocol == protocol)
        {
            port = static_cast<int16>(handlerAt(i)->defaultPort);
            return;
        }
}

void FUrl::updatePath()
{
    path = protocol;
    path.append(kProtocolEnd);
    if (!isFileProtocol())
        appendHost(path);
    path.toWideString();
    name = file;
    name.toWideString();
    type = kFolder;
    if (name.isEmpty())
        return;
    if (endsInSlash(name))
        name.remove(name.length() - 1);
    else
        type = kFile;
    const int last = name.findPrev(-1, kUnixDelimiter);
    if (last < 0)
        return;
    path.append(kUnixDelimiter).append(name, last);
    name.remove(0, last + 1);
}

// As a path

// A URL tells by itself whether it is that of a folder.
bool FUrl::fromString(const char16* text, int)
{
    setUrl(text);
    return !file.isEmpty() || !host.isEmpty();
}

bool FUrl::getFullPath(FString& result) const
{
    return getUrl(result);
}

void FUrl::setName(const char16* text)
{
    const bool isFolderText = endsInSlash(file);
    if (isFolderText)
        file.remove(file.length() - 1);
    file.remove(static_cast<unsigned>(file.findPrev(-1, kUnixDelimiter) + 1));
    file.append(text ? text : u"");
    if (isFolderText)
        file.append(kUnixDelimiter);
    updatePath();
}

bool FUrl::updateExtension(bool replace)
{
    if (!FPath::updateExtension(replace))
        return false;
    // So far only the path's part has it.
    const FString extended(name);
    setName(extended.text16());
    return true;
}

bool FUrl::descend(const char16* childName, int childType)
{
    if (!file.isEmpty() && !endsInSlash(file))
        file.append(kUnixDelimiter);
    file.append(childName ? childName : u"");
    if (childType == kFolder || childType == kBundle)
        file.append(kUnixDelimiter);
    updatePath();
    return true;
}

bool FUrl::ascend()
{
    if (file.isEmpty())
        return false;
    FString folder(file);
    if (endsInSlash(folder))
        folder.remove(folder.length() - 1);
    // The root of a disk has nothing above it.
    if (folder.isEmpty())
        return false;
    folder.remove(static_cast<unsigned>(folder.findPrev(-1, kUnixDelimiter) + 1));
    file.take(folder);
    updatePath();
    return true;
}

bool FUrl::isRootDir() const
{
    if (!isFileProtocol())
        return file.isEmpty();
    const FNPath native(file.text16(), kFile);
    return native.isRoot(native.getPathName().text16());
}

// Transfer

void FUrl::registerHandler(const FString& handlerProtocol, uint16 defaultPort, HandlerFactory factory)
{
    if (factory)
        allHandlers().add(new UrlMetaHandler(handlerProtocol, defaultPort, factory));
}

bool FUrl::makeHandler()
{
    if (handler && handledProtocol == protocol)
        return true;
    dropHandler();
    handledProtocol = protocol;
    for (int i = 0; !handler && i < allHandlers().total(); i++)
        if (handlerAt(i)->protocol == protocol)
            handler = handlerAt(i)->factory(*this);
    return handler != nullptr;
}

int32 FUrl::openStream(IBStream** stream)
{
    if (!stream)
        return kStreamInvalidArgument;
    *stream = nullptr;
    if (!makeHandler() || !handler->open() || !handler->getStream())
        return kStreamFailed;
    *stream = handler->getStream();
    (*stream)->addRef();
    return kResultOk;
}

void FUrl::registerObjectFilter()
{
    IObjectConverter::add(UrlPathConverter::instance());
}

// Comparison

bool FUrl::operator==(const FUrl& other) const
{
    return protocol == other.protocol && host == other.host && port == other.port && file == other.file &&
           user == other.user && password == other.password;
}

bool FUrl::isEqual(const CmObject* other) const
{
    const FUrl* otherUrl = FCast(FUrl, other);
    return otherUrl && *this == *otherUrl;
}

// Equal URLs have equal parts of the path.
unsigned FUrl::hash(unsigned size) const
{
    return FPath::hash(size);
}
