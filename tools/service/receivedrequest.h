#pragma once

#include <cstdint>
#include <string>
#include <vector>

/// One field of a form, in the order in which it came.
struct ReceivedField
{
    std::string name;
    /// Empty for a file, whose bytes are counted and digested but not kept.
    std::string text;
    bool isFile = false;
    std::string fileName;
    std::string contentType;
    std::uint64_t size = 0;
    /// 64 lower-case hexadecimal digits; for files only.
    std::string sha256;
};

/// One request as the stand-in service got it. A plain value, copied out to whoever asks.
struct ReceivedRequest
{
    int number = 0;
    std::string method;
    /// Path and query as they stood in the request.
    std::string target;
    /// The word of the behaviour that it met.
    std::string behaviour;
    std::vector<ReceivedField> fields;
    /// The body came whole.
    bool complete = false;
    /// 0 while there is no answer, and where the connection was closed instead.
    int status = 0;

    /// The path without the query.
    std::string path() const;

    /// The field of this name, or null.
    const ReceivedField* field(const std::string& name) const;
};

/// A request as lines for people: a heading, and one line a field.
std::string toText(const ReceivedRequest& request);
