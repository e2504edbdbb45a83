#include "storage/url/furlfilehandler.h"

#include "storage/filesystem/fnfilesystem.h"
#include "storage/path/fnpath.h"
#include "storage/stream/fstream.h"
#include "storage/url/furl.h"

FUrlFileHandler::~FUrlFileHandler()
{
    FUrlFileHandler::close();
}

bool FUrlFileHandler::open()
{
    close();
    FString text(url.getFile());
    FUrl::urlDecode(text);
    makePlatfromString(text);
    FNPath path(text.text16(), FPath::kFile);
    if (!gFileSystem)
        return false;
    stream = gFileSystem->openFile(&path, kFileShare, nullptr);
    if (!stream)
        return false;
    length = gFileSystem->getFileSize(&path);
    return true;
}

bool FUrlFileHandler::close()
{
    FStream* closing = stream;
    stream = nullptr;
    length = 0;
    return closing && gFileSystem && gFileSystem->closeFile(closing);
}

void FUrlFileHandler::makePlatfromString(FString& text)
{
    const char16 set[] = {kUnixDelimiter, 0};
    text.toWideString();
    text.replaceChars16(set, PATH_DELIMITER);
}

FUrlHandler* createUrlFileHandler(FUrl& url)
{
    return new FUrlFileHandler(url);
}

void initFUrlFileHandler()
{
    FUrl::registerHandler(FString("file"), 0, createUrlFileHandler);
    FUrl::registerObjectFilter();
}
