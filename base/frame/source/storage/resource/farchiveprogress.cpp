#include "storage/resource/farchiveprogress.h"

#include <algorithm>
#include <limits>

FArchiveProgress::FArchiveProgress(UProgressHook* hook, int64 totalBytes) : outer(hook)
{
    if (!outer)
        return;
    int64 compression = 1;
    while (totalBytes / compression > std::numeric_limits<int32>::max())
        compression *= 10;
    outer->setValueCompression(compression);
    outer->setMaximum(totalBytes / compression);
    outer->setValue(0);
}

UProgressHook* FArchiveProgress::nextFile(const ConstString& name)
{
    begin = done;
    setText(name.text16());
    return this;
}

void FArchiveProgress::setValue(int64 bytes)
{
    // A file that gets no smaller by compression is copied again.
    done = std::max(done, begin + bytes);
    if (outer)
        outer->setValue(done / outer->getValueCompression());
}

void FArchiveProgress::setText(const char16* text)
{
    if (outer)
        outer->setText(text);
}
