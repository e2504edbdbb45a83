#pragma once

#include "containers/sequence/cmlinkedlist.h"
#include "foundation/object/iptr.h"
#include "storage/filesystem/ffilesystem.h"

#include <memory>
#include <string>

class FFileType;
class FNPath;
class FUrl;
class VolumeWatch;

/// The disk. All access to files goes through the one object `gFileSystem`, which reports each change to the
/// watcher.
///
/// Paths may also be URLs of the protocol "file", and paths into archives are handed on to whoever serves
/// them. What is made below the user folder is for the owner only (files 0600, folders 0700), since secrets
/// are kept there, and files written there are forced to the disk when they are closed, so that renaming one
/// over its forerunner never loses both. Without a lock of its own: thread-safe but for `lastPath`, the
/// signature and the listeners, which belong to the main thread.
class FNFileSystem : public FFileSystem
{
    DECLARE_TYPE(FNFileSystem, FFileSystem)

    /// Numbers of `fromPlatformErrorCode`.
    enum Error
    {
        kNoError = 0,
        kUnexpected = -2000,
        kReadWriteError = -2001,
        kNotFound = -2002,
        kNameTooLong = -2003,
        kDiskFull = -2004,
        kReadOnly = -2005,
        kNotAllowed = -2006
    };
    /// Kinds of `getDriveType`, also as a mask.
    enum DriveType
    {
        kFixedDrive = 2,
        kRemovableDrive = 4,
        kOpticalDrive = 8,
        kNetworkDrive = 32,
        kArchiveDrive = 64
    };
    /// Units of `getFileSizeString`; -1 takes the one that fits.
    enum SizeUnit
    {
        kBytes = 0,
        kKiloBytes = 1,
        kMegaBytes = 2,
        kGigaBytes = 3
    };
    enum class ModeDirection
    {
        kToPlain,  ///< kFileReadWrite becomes kFileRead and kFileWrite
        kFromPlain ///< kFileRead and kFileWrite together become kFileReadWrite
    };

    FNFileSystem();
    ~FNFileSystem() override;
    /// Null: there is one disk.
    CmObject* newCopy() const override { return nullptr; }

    // The contract
    FStream* createFile(FPath* path, int flags, int* error) override;
    FStream* openFile(FPath* path, int flags, int* error) override;
    bool closeFile(FStream* stream) override;
    bool removeFile(FPath* path) override;
    bool fileExists(FPath* path) override;
    bool renameFile(FPath* path, const char16* newName) override;
    bool moveFile(FPath* from, FPath* to, bool updateSource) override;
    bool copyFile(FPath* from, FPath* to, UProgressHook* hook, int* error) override;
    bool createDir(FPath* path) override;
    bool changeDir(FPath* path) override;
    bool getDirName(FPath* path, FString& result) override;
    bool removeDir(FPath* path, bool recursive) override;
    bool getFileTimes(FPath* path, CmTime& created, CmTime& modified) override;
    int64 getFileSize(FPath* path) override;
    int64 getFileSize(FStream* stream) override;
    FFileIterator* newIterator(const FPath* path, bool recursive) override;

    // Folders
    bool dirExists(FNPath* path);
    bool isFolderEmpty(FNPath* path);
    /// Removes the empty folders below `path`, and those that become empty by that, but not `path` itself.
    /// False where one could not be removed.
    bool removeEmptyFolders(FNPath* path);
    /// Makes the folders below `from` again below `to`.
    bool copyFolderStructure(FNPath* from, FNPath* to);
    bool copyFolderAndFileStructure(FNPath* from, FNPath* to, UProgressHook* hook);
    /// Forces the names in a folder to the disk: until then a power loss may undo what was made, renamed or removed.
    bool syncFolder(FPath* path);

    // Files
    /// Moves a file or folder to the desktop's trash.
    bool trashFile(FPath* path);
    /// Looks for a name in a folder and, with `recursive`, below it; `result` takes the first found.
    bool findFile(const FNPath* folder, const char16* name, bool recursive, FNPath& result);
    /// The figure has three places: "1.465 KB". A figure in bytes is divided by 1000, so that 1500 bytes are
    /// "1.500 Bytes". False for an empty or missing file.
    bool getFileSizeString(FPath* path, FString& result, int unit);
    /// The same for a number of bytes.
    static void makeFileSizeString(double bytes, FString& result, int unit);
    bool canWrite(FPath* path);
    bool enableWrite(FPath* path, bool state);
    /// Gives `to` the rights of `from`: who may read and write it.
    bool copyRights(FPath* from, FPath* to);
    bool isHidden(FPath* path);
    bool isBitwiseCopyable(FPath*) override { return true; }
    /// Files have no type besides their name and content here: always false.
    bool changeFileType(FPath* path, const FFileType& fileType);
    /// Whether name or content say that the file is of this type.
    bool verifyType(FPath* path, const FFileType& fileType);

    // Links
    bool isSymlink(FPath* path);
    /// `target` takes the text of the link, which may be relative.
    bool readSymlink(FPath* path, FNPath& target);
    bool createSymlink(FPath* link, FPath* target);
    /// A second name for the same file.
    bool createLink(FPath* link, FPath* target);
    /// A link becomes the path of what it leads to in the end. False where that is missing; true for no link.
    bool checkResolveLink(FNPath* path);

    // Names
    /// Like `makeValidName`, and makes the name one that a disk takes: not empty, no "." or "..", 255 bytes
    /// at most.
    bool makeValidFileName(FString& name, char16 replacement, bool trim);
    static bool makeValidPath(FString& text, char16 replacement);
    /// Composes the name and cuts it to the 255 bytes that a disk takes, in front of the extension. True if
    /// changed.
    static bool makeSystemName(FString& name);
    /// Takes the text of a URL of the protocol "file".
    static bool pathFromURL(const char16* url, FNPath& result);
    /// Whether the text is the root. Volumes are mounted below it here, so their places are folders like
    /// others.
    static bool isRoot(const char16* text);

    // Drives
    /// Adds a new FNPath for each drive of the kinds in `mask`, which the container is to take over. Gives
    /// their number.
    int getDrives(CmContainer& result, int mask);
    /// One of DriveType.
    int getDriveType(FNPath* path);
    /// For the user; null for a number that isn't one of DriveType or has no name.
    const char16* getDriveTypeString(int driveType);
    /// The root at which the path begins; null for a relative path.
    IPtr<FNPath> getRootDir(const FNPath* path);
    /// `total` may be null.
    bool getFreeBytesOnDisk(FPath* path, uint64& freeBytes, uint64* total);
    /// These have no counterpart here: always false.
    bool getVolumeID(FPath* path, uint32& result);
    bool getVolumeSerialNumber(FPath* path, uint32& result);
    bool getPhysicalDiskUniqueIDString(FPath* path, FString& result);

    // Changes
    /// Tells the watcher of a change; `kind` is one of FileSystemChange, `newPath` may be null. Does nothing
    /// without a messenger or a running watcher, and for excluded paths. Thread-safe.
    void onFileSystemChange(int kind, const FNPath* path, const FNPath* newPath);
    /// `listener` gets the messages "VolMount" and "VolUnmount", with the root as "kRootPath", at the next
    /// pulse, as volumes come and go. Not counted. Main thread.
    void subscribeToMountEvent(CmObject* listener);
    void unsubscribeFromMountEvent(CmObject* listener);
    /// One of these names; others are ignored.
    void onMountEvent(const char* eventName, FNPath* root);

    // The folder that file dialogs begin with
    FNPath* getLastPath() const { return lastPath; }
    /// A copy is kept.
    void setLastPath(const FNPath* path);
    /// Keeps it in the user's settings.
    bool storeLastPath();
    bool loadLastPath();

    // Errors
    /// Describes a number of the system, for the user.
    static void getErrorMessage(int systemError, FString& result);
    /// One of Error for a number of the system.
    static int fromPlatformErrorCode(int systemError);
    /// Open flags in another spelling; all other bits pass unchanged.
    static uint32 convertOpenMode(uint32 mode, ModeDirection direction);
    /// Whether the platform may show its own alerts; it has none here. Gives the former state.
    bool showPlatformErrors(bool state);

    /// Four letters that mark files as made by this program, where a disk can hold them.
    int32 getSignature() const { return signature; }
    void setSignature(int32 code) { signature = code; }

    /// The native path behind `path`; null where it is none.
    static IPtr<FNPath> getNativePathFromPath(FPath* path);
    /// Whether the path is the user folder or below it.
    static bool isPrivate(const FNPath& path);

private:
    static FStream* openUrl(FPath* url);
    /// True for a stream that is none of a URL, too.
    static bool closeUrlStream(FStream* stream);
    static FStream* attachFile(const FNPath& path, int descriptor, int flags, const char* fileMode,
                               int* error);
    FStream* openNative(FNPath& path, int flags, int* error);
    int makeFolders(const FNPath& path);
    int makeLevel(const std::string& level);
    bool removeContent(const FNPath& folder);
    bool copyNative(FNPath& from, FNPath& to, UProgressHook* hook, int* error);
    bool copyTree(const FNPath& from, const FNPath& to, bool withFiles, UProgressHook* hook);
    bool moveAcrossDevices(FNPath& from, FNPath& to);

    int32 signature = 0x3F3F3F3F;
    FNPath* lastPath = nullptr;
    CmLinkedList mountListeners;
    // While anybody listens.
    std::unique_ptr<VolumeWatch> volumeWatch;
    bool platformErrorsShown = true;
};

/// The one file system of the process; set and cleared by the application.
extern FNFileSystem* gFileSystem;
