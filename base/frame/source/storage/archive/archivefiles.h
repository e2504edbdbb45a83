#pragma once

#include "storage/path/fnpath.h"

class FFileType;
class FStream;

// The files of the archives in the standard folders, by name without folder and extension.

/// A file of that type in a standard folder; a name may hold dots. The user folder is made where it is missing.
FNPath getArchivePath(const char16* name, int standardFolder, const FFileType& type);

bool archiveFileExists(const char16* name, const FFileType& type);
bool removeArchiveFile(const char16* name, const FFileType& type);
bool renameArchiveFile(const char16* oldName, const char16* newName, const FFileType& type);

/// From the user folder or, failing that, from the application's. The caller gets the stream; null where there is no
/// such file. `isUnreadable` may be null; it takes whether there is one in the user folder that can't be opened.
FStream* openArchiveFile(const char16* name, int flags, const FFileType& type, bool* isUnreadable = nullptr);

/// Makes a type known to paths; lives as long as the process.
const FFileType& registerArchiveType(const char* extension, const char (&macType)[5], const char* typeName);
