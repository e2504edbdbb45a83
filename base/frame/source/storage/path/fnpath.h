#pragma once

#include "storage/path/fpath.h"

#include <string>

/// A location in the local file system.
///
/// Texts are normalised to the composed form; where a file has its name in another form on disk, the file
/// system finds it all the same. Names on disk are bytes: a byte that isn't part of valid UTF-8 travels as
/// the lone surrogate 0xDC80 plus its low seven bits and goes back to disk as it was. One thread at a time.
class FNPath : public FPath
{
    DECLARE_CLASS(FNPath, FPath)

    /// The characters that `toPlatformPath` takes, with the terminator.
    static constexpr int kMaxPathLength = 1024;
    /// The bytes that it needs for them: a character of 16 bits makes three at most.
    static constexpr int kPlatformBufferSize = 3 * (kMaxPathLength - 1) + 1;

    /// The folders of `getStandardFolder`.
    enum StandardFolder
    {
        kUserFolder = 1,
        kTempFolder = 2,
        kAppFolder = 3,
        kSystemFolder = 4
    };

    explicit FNPath(int newType = kFile);
    FNPath(const char16* text, int newType);
    /// A child of `folder`; without one a relative path.
    FNPath(const char16* newName, const FNPath* folder, int newType);
    /// The place to which the relative path `relative` leads from `base`.
    FNPath(FNPath* base, FNPath* relative);
    explicit FNPath(IPath* other);
    /// A file or folder below a standard folder; `subFolder` may hold several levels, or be null. With
    /// `create` the folders are made. Where the folder isn't known, the path stays empty, so that nothing is
    /// taken for it by chance.
    FNPath(const char16* newName, int standardFolder, int newType, const char16* subFolder, bool create);
    FNPath(const FNPath& other) = default;
    FNPath& operator=(const FNPath& other) = default;

    using FPath::newCopy;

    // Text
    bool fromString(const char16* text, int newType) override;
    /// Takes the bytes that the platform has as a path, up to their zero:
    ///
    /// | bytes    | `path` | `name` |
    /// |----------|--------|--------|
    /// | "/"      | "/"    |        |
    /// | "/a"     | "/"    | "a"    |
    /// | "a"      |        | "a"    |
    /// | "./a/b/" | "a/"   | "b"    |
    /// | "a\b"    | "a/"   | "b"    |
    /// | "c:/x"   | "C:/"  | "x"    |
    bool fromPlatformPath(const void* utf8Text);
    /// Writes the path's bytes and a terminator to `buffer`, of kPlatformBufferSize bytes. False, with an
    /// empty text of two zero bytes, for a path of 1024 characters or more.
    bool toPlatformPath(void* buffer) const;
    /// The path's bytes, whatever their number.
    std::string platformPath() const;
    /// The path as a URL of the protocol "file", with all but plain characters as %XX; false for a relative
    /// path.
    bool createURL(FString& url) const;
    bool isRoot(const char16* text) const override;
    /// Whether the path begins at the root.
    bool isAbsolute() const;
    /// Makes name and folder part valid for the file system. True if anything changed.
    bool makeValidName(char16 replacement);

    // What is on disk
    bool detectFileType(bool lookIntoFile) override;
    bool updateExtension(bool replace) override;
    bool uniqueName() override;
    /// In bytes; 0 where there is no such file.
    int64 getSize() const;
    /// The mode word that the platform gave when it was last asked, -1 while it wasn't.
    int32 getPlatformState() const { return platformState; }

    // Relative paths
    /// This path becomes the way from the folder of `base` to `absolute`: "../b/c" for "/a/b/c" from "/a/x/".
    /// Where they have nothing in common, it becomes `absolute`. False where an argument doesn't fit.
    bool assignRelative(const FNPath* absolute, const FNPath* base);
    bool makeRelative(const FNPath* base);
    /// A new path for the caller; null for a path that is absolute already.
    FNPath* createAbsolutePath(const FNPath* base) const;
    /// False where the path is absolute already.
    bool makeAbsolute(const FNPath* base);
    /// How many levels up the path leads first.
    int countAscendLevels() const;

    // Standard folders
    /// The folder part becomes a standard folder, or `subFolder` below it; the name stays. False where it
    /// doesn't exist and isn't to be made, or nobody knows the folders. Touches the disk.
    bool getStandardFolder(int which, const char16* subFolder, bool create);

    // Storage
    /// Keeps the full path in the group "Default Paths" of the user's settings.
    bool storeAsDefault(const char* key) const;
    bool fromDefault(const char* key);
    bool storeAttributes(FAttributes& attributes) const override;
    bool restoreAttributes(FAttributes& attributes) override;
    bool internalize(FArchive& archive) override;
    bool externalize(FArchive& archive) const override;

    /// Whether the paths of files store their type.
    static bool storeAttrFileType;

private:
    bool enterFolder(const FString& folder, bool create);
    bool enterSubFolder(const char16* subFolder, bool create);
    FFileType* typeOfContent();
    void askPlatform();
    void splitText(const String& text);

    int32 platformState = -1;
};

/// The user folder as a path for the caller, made on disk if needed; null where there is none.
FNPath* createUserFolderPath();
