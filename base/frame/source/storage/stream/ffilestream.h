#pragma once

#include "storage/stream/fopenflags.h"
#include "storage/stream/fstream.h"
#include "storage/stream/isizeablestream.h"

#include <cstdint>
#include <cstdio>

class FNPath;

/// A file on disk. Made by the file system's `createFile` and `openFile`, ended by its `closeFile`.
///
/// The stream keeps the first error of the system until it is cleared; what was written is safe only once
/// `close`, or the file system's `closeFile`, has given true. One thread at a time.
class FFileStream : public FStream, public ISizeableStream
{
    DECLARE_TYPE(FFileStream, FStream)
    FORWARD_FUNKNOWN(FStream)

    /// `openFlags` are those of the file system. The stream is closed as yet.
    explicit FFileStream(int openFlags);
    FFileStream(const FFileStream&) = delete;
    FFileStream& operator=(const FFileStream&) = delete;
    /// Closes the file, dropping what `close` would have told.
    ~FFileStream() override;

    /// Null: a file has one stream.
    CmObject* newCopy() const override { return nullptr; }

    /// Borrowed; null until the file system has set it.
    FNPath* getPath() const { return path; }
    /// Adds a reference.
    void setPath(FNPath* newPath);
    int32 getMode() const { return mode; }
    /// Whether the file was opened in a way that can change it.
    bool isWritable() const;
    /// The block size of the disk for unbuffered access, else 0.
    int32 getSeekAlign() const { return seekAlign; }

    // Used by the file system
    /// Takes over an open descriptor. With `fileMode`, that of a standard file, it is used through one with a
    /// buffer of 16384 bytes. False where that fails, with the descriptor closed.
    bool attach(int newDescriptor, const char* fileMode, int32 alignment);
    /// The content is forced to the disk before the file is closed.
    void setSyncOnClose(bool state) { syncOnClose = state; }
    /// Writes what is held back and closes. False where that or any transfer before it failed,
    /// `getFirstError` tells why; true for a closed stream without an error. May be called again.
    bool close();

    // Transfers
    int64 readRaw(void* buffer, int64 count) override;
    int64 writeRaw(const void* buffer, int64 count) override;
    /// A position before the start is refused and isn't kept as an error.
    int64 seek(int64 position, FSeekMode seekMode) override;
    int64 tell() override;
    void rewind() override;
    void flush() override;
    void setReadWriteHook(UProgressHook* newHook, int threshold) override;
    using FStream::seek;
    using FStream::tell;

    // Size
    int32 getStreamSize(int64& size) override;
    /// 0, or 4 where it failed.
    int32 setStreamSize(int64 size) override;
    /// The position of the end; -1 with nothing open.
    int64 getEof();
    bool setEof(int64 position);
    bool eof();

    // Errors
    /// Whether an error is stored.
    bool error() const { return firstError != 0; }
    void clearError();
    /// Stores a number of the system unless one is stored already.
    void setFirstError(int systemError);
    /// The number of the system with `raw`, else that of the file system; 0 is none.
    int getFirstError(bool raw) const;
    void getErrorMessage(FString& result) const;

    /// Whether a file is open.
    bool isValid() const { return file || descriptor >= 0; }
    /// The system's descriptor of the open file, -1 without one.
    int getFileRef() const;

    int32 queryInterface(const char* interfaceID, void** object) override;

private:
    bool isCanceled(int64 count);
    void prepareFor(std::int8_t operation);
    int64 readFile(void* buffer, int64 count);
    int64 writeFile(const void* buffer, int64 count);
    int64 writeDescriptor(const void* buffer, int64 count);
    void preallocate(int64 count);
    int64 seekSystem(int64 position, int origin);
    void keepHookInStep(int64 position, FSeekMode seekMode);
    void finishWriting();
    void noteFileError();

    FNPath* path = nullptr;
    int32 mode;
    int32 firstError = 0;
    int32 seekAlign = 0;
    std::FILE* file = nullptr;
    std::int8_t lastOperation = -1;
    int32 descriptor = -1;
    int64 filePosition = 0;
    int64 preallocatedEnd = 0;
    UProgressHook* hook = nullptr;
    bool syncOnClose = false;
};
