#pragma once

#include "containers/value/buffer.h"
#include "storage/archive/fattributearchivebase.h"

class FArchive;
class FFileType;

/// Attribute trees and objects as bytes, in the stream's byte order. No mark tells the form, so who reads must know
/// what was written.
///
/// Objects stand where they are first referred to; reading, they are placeholders as in the XML archive. Reading
/// trusts no number of the stream. One thread at a time.
class FBinArchive : public FAttributeArchiveBase
{
public:
    /// The owning archive may be null; it hears of errors. Borrowed.
    FBinArchive(FStream* archiveStream, bool isWriting, FArchive* owningArchive = nullptr);

    // False at the first failure.
    bool save();
    bool load();
    bool saveAttributes(const FAttributes& attributes);
    bool loadAttributes(FAttributes& attributes);

    /// "bin", the type of files of this archive and of the older one.
    static const FFileType& fileType();

private:
    /// Lets the owner hear of a failure.
    bool tell(bool success);

    FArchive* owner;
    /// What goes to or comes from the stream next.
    Buffer block;
    /// Room for one text.
    Buffer text;
};
