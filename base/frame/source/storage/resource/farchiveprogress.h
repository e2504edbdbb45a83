#pragma once

#include "foundation/text/conststring.h"
#include "storage/stream/uprogresshook.h"

/// One progress over many files: counts their bytes on from file to file. One thread at a time.
///
/// The value compression of the hook becomes the smallest power of 10 with which the total fits in 31 bits, since whoever
/// shows it may have no more.
class FArchiveProgress : public UProgressHook
{
public:
    /// `hook` may be null and is borrowed.
    FArchiveProgress(UProgressHook* hook, int64 totalBytes);

    /// What copies the next file may tell this hook of its own bytes, from 0.
    UProgressHook* nextFile(const ConstString& name);

    bool wasCanceled() override { return outer && outer->wasCanceled(); }
    void setMaximum(int64) override {}
    void setValue(int64 bytes) override;
    int64 getValue() const override { return done - begin; }
    void setText(const char16* text) override;

private:
    UProgressHook* outer;
    /// Where the present file begins in the total.
    int64 begin = 0;
    int64 done = 0;
};
