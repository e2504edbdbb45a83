#pragma once

#include "services/presets/fpreset.h"
#include "storage/path/fnpath.h"

/// A preset in a file of its own, which is read when the object is first asked for. Its name is that of the file,
/// without the extension. Main thread.
class FFilePreset : public FPreset
{
    DECLARE_COPYABLE(FFilePreset, FPreset)

    explicit FFilePreset(const FNPath& file);
    FFilePreset(const FNPath& file, CmObject* itsObject, uint32 itsFlags);

    /// Reads the file, unless that was done or tried.
    void read();
    /// Drops the object; it is read again when it is asked for.
    void unuse();
    /// Writes the file anew. False, with all as it was, where that fails.
    bool resetRenamed();
    // The file. False where that fails.
    bool write();
    bool remove();
    /// Gives the file another name. False, with all as it was, where that is taken.
    bool rename(const char16* text);

    bool storeAttributes(FAttributes& attributes) const override;
    /// The name stays; where the stored one differs, the preset was renamed.
    bool restoreAttributes(FAttributes& attributes) override;

private:
    void takeName();

    FNPath path;
    bool isRead = false;
};
