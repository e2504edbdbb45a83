#pragma once

#include "storage/url/furlhandler.h"

class FString;

/// Reads the file that a URL of the protocol "file" names. One thread at a time.
class FUrlFileHandler : public FUrlHandler
{
    DECLARE_TYPE(FUrlFileHandler, FUrlHandler)

    using FUrlHandler::FUrlHandler;
    ~FUrlFileHandler() override;
    CmObject* newCopy() const override { return nullptr; }

    bool open() override;
    bool close() override;

    /// Turns the delimiters of URLs into the platform's.
    static void makePlatfromString(FString& text);
};

FUrlHandler* createUrlFileHandler(FUrl& url);
/// Registers the handler and the converter between URLs and paths; once at start.
void initFUrlFileHandler();
