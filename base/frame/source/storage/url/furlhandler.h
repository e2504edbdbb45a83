#pragma once

#include "foundation/object/cmobject.h"

class FStream;
class FUrl;

/// Transfers what a URL names. One per protocol is derived and registered with FUrl.
///
/// The URL owns its handler, which therefore borrows the URL: it must not outlive it. One thread at a time,
/// but for `cancel`.
class FUrlHandler : public CmObject
{
    DECLARE_ABSTRACT_CLASS(FUrlHandler, CmObject)

    explicit FUrlHandler(FUrl& handledUrl);
    FUrlHandler(const FUrlHandler&) = delete;
    FUrlHandler& operator=(const FUrlHandler&) = delete;
    ~FUrlHandler() override;

    virtual bool open() = 0;
    virtual bool close() = 0;
    virtual void cancel() {}
    /// Borrowed; null while nothing is open.
    virtual FStream* getStream() { return stream; }
    /// In bytes.
    virtual int64 getLength() { return length; }

    FUrl& getUrl() const { return url; }

protected:
    FUrl& url;
    FStream* stream = nullptr;
    int64 length = 0;
};
