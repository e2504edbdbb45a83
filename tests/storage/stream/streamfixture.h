#pragma once

#include "containers/value/cmbuffer.h"
#include "storage/stream/fmemorystream.h"
#include "storage/stream/uprogresshook.h"

#include <string>

/// What a memory stream holds.
inline std::string bytesOf(const FMemoryStream& stream)
{
    return std::string(stream.getData() ? stream.getData() : "", static_cast<size_t>(stream.getSize()));
}

/// A rewound stream of these bytes.
inline FMemoryStream streamOf(const std::string& bytes)
{
    FMemoryStream stream;
    stream.writeRaw(bytes.data(), static_cast<int64>(bytes.size()));
    stream.rewind();
    return stream;
}

/// Reads up to `count` bytes; a failure gives "-1".
inline std::string readFrom(FStream& stream, int64 count)
{
    std::string bytes(static_cast<size_t>(count), '?');
    const int64 got = stream.readRaw(bytes.data(), count);
    return got < 0 ? "-1" : bytes.substr(0, static_cast<size_t>(got));
}

inline int64 writeTo(FStream& stream, const std::string& bytes)
{
    return stream.writeRaw(bytes.data(), static_cast<int64>(bytes.size()));
}

/// A memory stream that counts transfers and can be told to fail them.
class CountingStream : public FMemoryStream
{
    DECLARE_COPYABLE(CountingStream, FMemoryStream)

    int64 readRaw(void* target, int64 count) override
    {
        reads++;
        return failsReading ? -1 : FMemoryStream::readRaw(target, count);
    }
    int64 writeRaw(const void* source, int64 count) override
    {
        writes++;
        return failsWriting ? -1 : FMemoryStream::writeRaw(source, count);
    }
    void flush() override { flushes++; }

    int reads = 0;
    int writes = 0;
    int flushes = 0;
    bool failsReading = false;
    bool failsWriting = false;
};

struct TestHook : UProgressHook
{
    bool wasCanceled() override { return value >= cancelAt; }
    void setMaximum(int64) override {}
    void setValue(int64 newValue) override
    {
        value = newValue;
        changes++;
    }
    int64 getValue() const override { return value; }
    void setText(const char16*) override {}

    int64 value = 0;
    int64 cancelAt = INT64_MAX;
    int changes = 0;
};
