#pragma once

#include "storage/path/fpath.h"
#include "storage/url/iurl.h"

class FNPath;
class FUrlHandler;
class UrlMetaHandler;

/// A location written as protocol, host, port and file; usable wherever a path is.
///
/// | text                       | user | password | host | port | file      | name    |
/// |----------------------------|------|----------|------|------|-----------|---------|
/// | http://a:b@h:8080/x/y.txt  | a    | b        | h    | 8080 | x/y.txt   | y.txt   |
/// | http://h                   |      |          | h    | 80   |           |         |
/// | file:///a/b                |      |          |      | 0    | /a/b      | b       |
///
/// The parts of the path follow those of the URL. The handlers are registered during start-up, which isn't
/// locked. One thread at a time.
class FUrl : public FPath, public IUrl
{
    DECLARE_CLASS(FUrl, FPath)
    FORWARD_FUNKNOWN(FPath)

    using HandlerFactory = FUrlHandler* (*)(FUrl& url);

    FUrl() = default;
    FUrl(const char* newProtocol, const char* newHost, const char16* newFile);
    FUrl(const char* newProtocol, const char* newHost, int16 newPort, const char16* newFile,
         const char16* newUser, const char16* newPassword);
    explicit FUrl(const char16* url);
    /// The copy makes its own handler.
    FUrl(const FUrl& other);
    FUrl& operator=(const FUrl& other);
    ~FUrl() override;

    // Text
    void set(const char* newProtocol, const char* newHost, uint16 newPort, const char16* newFile);
    /// Replaces all but what the text doesn't tell: without "://" the protocol stays, and without a port that
    /// of a protocol that nobody handles. The handler stays too, which may be the one that follows a redirection.
    void setUrl(const char16* text) override;
    /// Without user and password. True when the result isn't empty.
    bool getUrl(FString& result) const;
    /// Replaces the file, as a text of a URL or with `encode` as a plain one.
    void setFile(const char16* text, bool encode);
    /// Works on bytes in UTF-8: all but letters, digits and -./&+=?_~ become a "%" with lower-case digits, of
    /// which a byte below 16 has but one.
    static void urlEncode(FString& text);
    /// A digit that is none counts as 0; "+" stays.
    static void urlDecode(FString& text);

    // Parts
    const FString& getProtocol() const { return protocol; }
    const FString& getHost() const { return host; }
    int16 getPort() const { return port; }
    const FString& getFile() const { return file; }
    const FString& getUser() const { return user; }
    const FString& getPassword() const { return password; }
    /// Takes the port of the first handler of the protocol; stays where there is none.
    void guessDefaultPort();
    /// Brings the parts of the path in step with those of the URL.
    void updatePath();

    // As a path
    bool fromString(const char16* text, int newType) override;
    bool getFullPath(FString& result) const override;
    void setName(const char16* text) override;
    bool updateExtension(bool replace) override;
    bool descend(const char16* childName, int childType) override;
    bool ascend() override;
    bool isRootDir() const override;
    using FPath::getFullPath;
    using FPath::newCopy;

    // Transfer
    /// Makes the handler of the protocol if there is none yet, in the place of one of an earlier protocol; false
    /// where nobody handles it.
    bool makeHandler();
    /// Owned by the URL; null until `makeHandler`.
    FUrlHandler* getHandler() const { return handler; }
    int32 openStream(IBStream** stream) override;
    static void registerHandler(const FString& handlerProtocol, uint16 defaultPort, HandlerFactory factory);
    /// Enters the converter between URLs and paths with those who convert objects.
    static void registerObjectFilter();

    bool storeAttributes(FAttributes& attributes) const override;
    bool restoreAttributes(FAttributes& attributes) override;
    bool internalize(FArchive& archive) override;
    bool externalize(FArchive& archive) const override;
    bool operator==(const FUrl& other) const;
    bool isEqual(const CmObject* other) const override;
    unsigned hash(unsigned size) const override;
    int32 queryInterface(const char* interfaceID, void** object) override;

private:
    bool isFileProtocol() const;
    void parseHost(FString& text);
    void appendHost(FString& text) const;
    void dropHandler();
    void takeUrl(const FUrl& other);

    FUrlHandler* handler = nullptr;
    FString protocol;
    FString host;
    int16 port = 0;
    FString file;
    FString user;
    FString password;
    FString handledProtocol;
};
