#pragma once

#include "foundation/text/fstring.h"

#include <string>

class FStream;

/// The head of a reply of HTTP, read line by line from its stream. One thread at a time.
///
/// Beware: three of the four fields are known by their first letter alone, where their time has come. Every line with
/// a "C" counts as the length, and one without a number at index 16 sets it back to 0: behind "Connection: close" no
/// length is left. In a redirection every line with an "L" is the location, and where the server wants to know the
/// user, every line with a "W" tells how.
///
/// | line                              | counts when the status is | what is taken            |
/// |-----------------------------------|---------------------------|--------------------------|
/// | C...                              | any                       | the number from index 16 |
/// | L...                              | 301, 302, 307             | the text from index 9    |
/// | ...Proxy-Authenticate:...         | 407                       | "B" at index 20          |
/// | W...                              | 401                       | "B" at index 18          |
class HttpReplyHead
{
public:
    /// Where reading stopped; the stream stands behind that line.
    enum class End
    {
        kBlankLine,
        kLocation,
        kProxyAuthenticate,
        kAuthenticate,
        /// The stream ended first.
        kCut,
        /// The stream failed, or the head is longer than any that is meant well.
        kFailed
    };

    static constexpr size_t kLongest = 256 * 1024;

    /// The stream is borrowed.
    explicit HttpReplyHead(FStream& replyStream) : stream(replyStream) {}

    /// Reads on to the next end. After one of the fields the head can be read further.
    End read();

    /// 0 where no first line tells it.
    int getStatus() const { return status; }
    bool isError() const { return status >= 400 && status <= 599; }
    /// In bytes, never negative; 0 where no line tells it.
    int64 getLength() const { return length; }
    /// What the reply redirects to, after `kLocation`.
    FString getLocation() const;
    /// All whole lines so far, with their ends.
    FString getLines() const;

private:
    bool readLine();
    bool isRedirection() const { return status == 301 || status == 302 || status == 307; }
    bool startsWith(char c) const { return !line.empty() && line[0] == c; }
    bool namesBasicAt(size_t index) const { return line.size() > index && line[index] == 'B'; }
    bool isFieldOfInterest(End& end);
    void takeStatus();
    void takeLength();

    FStream& stream;
    // The line at hand, without its end.
    std::string line;
    std::string lines;
    bool isFirst = true;
    bool failed = false;
    int status = 0;
    int64 length = 0;
};
