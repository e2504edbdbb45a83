#pragma once

/// Takes URLs that the desktop hands to this process. Main thread.
class IURLSchemeHandler
{
public:
    /// `url` as the desktop gave it, byte for byte; valid during the call.
    virtual void openURL(const char* url) = 0;

protected:
    ~IURLSchemeHandler() = default;
};

/// Who takes the URLs of which scheme. *Main thread*.
namespace URLScheme
{
/// `scheme` comes without its colon and is not copied, `handler` is borrowed; null takes the scheme out again. Case
/// does not count.
void setHandler(const char* scheme, IURLSchemeHandler* handler);

/// The handler of the scheme that `text` begins with; null where there is none, so that it is a path.
IURLSchemeHandler* findHandler(const char* text);
} // namespace URLScheme
