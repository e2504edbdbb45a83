#pragma once

#include "foundation/object/iptr.h"
#include "storage/stream/fstream.h"

/// A stream of a component as one of the framework. One thread at a time.
class IStreamProxy : public FStream
{
    DECLARE_TYPE(IStreamProxy, FStream)

    /// Adds a reference.
    explicit IStreamProxy(IBStream* plainStream) : plain(plainStream) {}
    IStreamProxy(const IStreamProxy&) = delete;
    IStreamProxy& operator=(const IStreamProxy&) = delete;
    /// Null: the other stream is one.
    CmObject* newCopy() const override { return nullptr; }

    IBStream* getPlainStream() const { return plain; }

    /// 0 at the end and where it fails; the interface doesn't tell them apart.
    int64 readRaw(void* buffer, int64 count) override;
    int64 writeRaw(const void* buffer, int64 count) override;
    int64 seek(int64 position, FSeekMode mode) override;
    int64 tell() override;
    void rewind() override { seek(0, kSeekStart); }
    using FStream::seek;
    using FStream::tell;

protected:
    IPtr<IBStream> plain;
};
