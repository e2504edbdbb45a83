#pragma once

#include "foundation/object/funknown.h"

struct FFileTypeInfo;

/// Results of IPath's operations.
inline constexpr int32 kPathOk = 0;
inline constexpr int32 kPathFailed = 1;
inline constexpr int32 kPathInvalidArgument = 2;

/// The characters that a text handed out by IPath can have, with its terminator.
inline constexpr int kPathBufferSize = 1024;

/// A location, as it crosses a component boundary.
///
/// Each operation gives kPathOk, kPathFailed or, for a null argument, kPathInvalidArgument. A buffer for a
/// text has kPathBufferSize characters; a text that is too long for it fails, with the buffer left empty.
class IPath : public FUnknown
{
public:
    virtual int32 setFullPath(const char16* text, int type) = 0;
    virtual int32 setFileName(const char16* text) = 0;
    /// 0 file, 1 folder, 2 link, 3 bundle.
    virtual int32 getType(int* result) = 0;
    virtual int32 goDown(const char16* childName, int childType) = 0;
    virtual int32 goUp() = 0;
    virtual int32 getFullPath(char16* buffer) = 0;
    virtual int32 getFileName(char16* buffer) = 0;
    virtual int32 getPathName(char16* buffer) = 0;
    virtual int32 getFileExtension(char16* buffer) = 0;
    virtual int32 getNameWithoutExt(char16* buffer) = 0;
    virtual int32 getFileType(FFileTypeInfo* info) = 0;
    virtual int32 setFileType(FFileTypeInfo* info) = 0;
    virtual int32 updateFileExtension() = 0;
    /// The caller gets the reference.
    virtual int32 newCopy(IPath** copy) = 0;

    DECLARE_INTERFACE_ID
};
