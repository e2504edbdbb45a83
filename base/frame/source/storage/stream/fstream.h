#pragma once

#include "foundation/object/cmobject.h"
#include "storage/stream/ffiletype.h"
#include "storage/stream/fstreamer.h"
#include "storage/stream/ibstream.h"

class CmBuffer;
class UProgressHook;

/// Base of all streams: an object, a typed reader and writer, and the interface that components see.
///
/// A concrete stream gives the four raw operations, `newCopy` and `rewind`. Filters wrap another stream and hold
/// a reference to it. Nothing throws: a shortfall shows in counts and bools. One thread at a time.
class FStream : public CmObject, public FStreamer, public virtual IBStream
{
    DECLARE_ABSTRACT_CLASS(FStream, CmObject)
    FORWARD_FUNKNOWN(CmObject)

    FStream() : FStreamer(0) {}

    virtual void rewind() = 0;
    /// Writes what is held back.
    virtual void flush() {}
    /// False once the stream has lost data.
    virtual bool verify() { return true; }
    /// Copies `count` bytes from the other stream into this one. Single reads and writes aren't looked at: bytes
    /// that the other stream doesn't have are written as zeros.
    virtual bool read(FStream& from, uint32 count);
    /// Writes the whole stream to the other one; false at the first write that falls short.
    virtual bool copyTo(FStream& to);
    /// Lets a hook follow the transfers and cancel them; null for none. The hook is borrowed.
    virtual void setReadWriteHook([[maybe_unused]] UProgressHook* hook, [[maybe_unused]] int threshold) {}

    int32 read(void* buffer, int count, int* numRead) override;
    int32 write(void* buffer, int count, int* numWritten) override;
    int32 seek(int64 pos, int mode, int64* result) override;
    int32 tell(int64* pos) override;
    using FStreamer::seek;
    using FStreamer::tell;

    int32 queryInterface(const char* interfaceID, void** object) override;

    // Whole streams

    /// As `read`, from this stream to the other.
    bool write(FStream& to, uint32 count);
    bool copyFrom(FStream& from);
    bool isStreamEqual(FStream& other);

    // Text

    /// Reads the next line into `line`, terminated; the terminator doesn't count as filled. Every run of carriage
    /// returns and line feeds is one line end. With `trim`, tabs and blanks around the line are left out. False at
    /// the end of the stream.
    ///
    /// Beware: behind a last line without a line end, the stream is sought to -1. A file refuses that and stays at
    /// its end, and a memory stream then stands before its start; but a filter that moves positions inside its
    /// bounds begins anew.
    bool readLine(CmBuffer& line, bool trim);
    /// The characters as raw bytes in the host's order. Gives the number of bytes written.
    int64 writeString16(const char16* text, bool withTerminator);

    // What the content is

    const FFileType& getFileType() const { return fileType; }
    void setFileType(const FFileType& type) { fileType = type; }

protected:
    FFileType fileType;
};

/// The FStream behind an interface, borrowed; null where there is none.
FStream* toFStream(FUnknown* unknown);
