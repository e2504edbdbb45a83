#pragma once

#include "storage/archive/fattributearchivebase.h"

class CmBufferPool;
class FFileType;
class FNPath;

/// The line buffers of the XML archives. Thread-safe.
CmBufferPool& gXmlArchiveBuffers();

/// Attribute trees and objects as XML text, in a stream or in a file of the user folder.
///
/// Objects that trees refer to are written once, behind the trees; on reading they are placeholders until somebody
/// asks for them. Reading fails on anything that the archive itself wouldn't write, and then leaves what it had read
/// so far; the operations by name then leave their target as it was. One thread at a time.
class FXmlArchive : public FAttributeArchiveBase
{
public:
    FXmlArchive(FStream* archiveStream, bool isWriting) : FAttributeArchiveBase(archiveStream, isWriting) {}

    // In the stream. False at the first failure.
    bool save(const char* rootTag);
    /// `windowsEntities` decodes named characters by the Windows table.
    bool load(const char* rootTag, const char* unused = nullptr, bool windowsEntities = false);
    bool saveAttributes(const char* rootTag, const FAttributes& attributes);
    bool loadAttributes(const char* rootTag, FAttributes& attributes);

    // In the user folder, by name without folder and extension. Reading falls back on the application folder.
    /// The earlier file stays whole until the new one is complete.
    static bool saveAttributes(const char16* name, const char* rootTag, const FAttributes& attributes);
    /// Reading takes in `isUnreadable`, which may be null, whether there is a file in the user folder of which the system
    /// refuses to give the content. What it holds is unknown then, and it must not be replaced; a damaged one may.
    static bool loadAttributes(const char16* name, const char* rootTag, FAttributes& attributes,
                               bool* isUnreadable = nullptr);
    /// With `askUser` asks before an existing file is replaced; false where the answer isn't to replace it.
    static bool storeObject(const char16* name, const char* rootTag, CmObject* object, bool askUser);
    static bool restoreObject(const char16* name, const char* rootTag, CmObject* object,
                              bool* isUnreadable = nullptr);
    static bool restoreObject(FStream* stream, const char* rootTag, CmObject* object);
    static bool objectArchiveExists(const char16* name);
    static bool removeObjectArchive(const char16* name);
    static bool renameObjectArchive(const char16* oldName, const char16* newName);
    /// Copies the file to its backup, beside it.
    static bool backupObjectArchive(const char16* name);
    /// Puts the backup in the file's place. False, with the file as it was, where there is no backup.
    static bool restoreObjectArchive(const char16* name);
    /// The caller gets a reference; null where there is no such file.
    static FStream* openUserFile(const char16* name);
    /// Begins a new version, under a name of its own until it is complete. An existing file keeps its name and gets
    /// a twin: `oldPath`, the caller's to release, is null where there was none. Every stream, once released, is
    /// followed by `finishXmlArchiveWrite`. Null on failure, with the existing file as it was.
    static FStream* createUserFile(const char16* name, bool askUser, FNPath*& oldPath);
    /// Puts the new version in the place of the earlier one or, without `success`, removes it; the twin goes. Takes
    /// over the reference on `oldPath`. Whether the new version is in place.
    static bool finishXmlArchiveWrite(bool success, const char16* name, FNPath* oldPath);

    /// "xml"
    static const FFileType& fileTypeNormal();
    /// "xml.backup"
    static const FFileType& fileTypeBackup();
};
