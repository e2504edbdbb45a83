#include "network/http/httpreplyhead.h"

#include "storage/path/filenametext.h"
#include "storage/stream/fstream.h"

#include <algorithm>
#include <climits>
#include <cstdlib>

namespace
{
constexpr const char* kProxyField = "Proxy-Authenticate:";
constexpr size_t kLengthIndex = 16;
constexpr size_t kLocationIndex = 9;
constexpr size_t kProxySchemeIndex = 20;
constexpr size_t kSchemeIndex = 18;
} // namespace

HttpReplyHead::End HttpReplyHead::read()
{
    while (readLine())
    {
        if (line.empty())
            return End::kBlankLine;
        End end{};
        if (isFirst)
            takeStatus();
        else if (isFieldOfInterest(end))
            return end;
        isFirst = false;
    }
    return failed ? End::kFailed : End::kCut;
}

// False where the stream ends first; a line without an end is none.
bool HttpReplyHead::readLine()
{
    line.clear();
    char c = 0;
    while (!failed && c != '\n')
    {
        if (stream.readRaw(&c, 1) != 1)
        {
            failed = !stream.verify();
            return false;
        }
        line += c;
        failed = lines.size() + line.size() > kLongest;
    }
    if (failed)
        return false;
    lines += line;
    line.pop_back();
    if (!line.empty() && line.back() == '\r')
        line.pop_back();
    return true;
}

bool HttpReplyHead::isFieldOfInterest(End& end)
{
    if (startsWith('C'))
    {
        takeLength();
        return false;
    }
    if (startsWith('L') && isRedirection())
    {
        end = End::kLocation;
        return true;
    }
    if (status == 407 && line.find(kProxyField) != std::string::npos)
    {
        end = End::kProxyAuthenticate;
        return namesBasicAt(kProxySchemeIndex);
    }
    end = End::kAuthenticate;
    return startsWith('W') && status == 401 && namesBasicAt(kSchemeIndex);
}

void HttpReplyHead::takeStatus()
{
    const size_t blank = line.find(' ');
    if (blank == std::string::npos)
        return;
    const long number = strtol(line.c_str() + blank, nullptr, 10);
    status = static_cast<int>(std::clamp(number, 0L, static_cast<long>(INT_MAX)));
}

void HttpReplyHead::takeLength()
{
    const long long number =
        line.size() > kLengthIndex ? strtoll(line.c_str() + kLengthIndex, nullptr, 10) : 0;
    length = std::max(number, 0LL);
}

FString HttpReplyHead::getLocation() const
{
    FString location;
    if (line.size() > kLocationIndex)
        FileNameText::fromBytes(line.c_str() + kLocationIndex, location);
    return location;
}

FString HttpReplyHead::getLines() const
{
    FString text;
    FileNameText::fromBytes(lines.c_str(), text);
    return text;
}
