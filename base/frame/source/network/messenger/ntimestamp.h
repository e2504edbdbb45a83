#pragma once

#include "foundation/object/cmobject.h"

/// A moment on the clock of one host, in microseconds. Moments of different hosts can't be compared. A value.
class NTimeStamp : public CmObject
{
    DECLARE_CLASS(NTimeStamp, CmObject)

    explicit NTimeStamp(int64 time = 0) : microseconds(time) {}

    int64 getMicroseconds() const { return microseconds; }

    bool externalize(FArchive& archive) const override;
    bool internalize(FArchive& archive) override;
    bool storeAttributes(FAttributes& attributes) const override;
    bool restoreAttributes(FAttributes& attributes) override;

private:
    int64 microseconds;
};
