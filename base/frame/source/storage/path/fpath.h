#pragma once

#include "foundation/object/cmobject.h"
#include "foundation/text/fstring.h"
#include "storage/path/ffiletypeinfo.h"
#include "storage/path/ipath.h"
#include "storage/stream/ffiletype.h"

class FFileSystem;

inline constexpr char16 kUnixDelimiter = u'/';
inline constexpr char16 kWindowsDelimiter = u'\\';
/// The platform's own.
inline constexpr char16 PATH_DELIMITER = kUnixDelimiter;

/// A location: a folder part, a name, and what is there.
///
/// The folder part ends with a delimiter unless it is empty, the name holds none; a folder too has its last
/// component as the name, a root has an empty one. So the full path is always `path` followed by `name`.
/// No operation but those that say so touches the disk. One thread at a time.
class FPath : public CmObject, public IPath
{
    DECLARE_CLASS(FPath, CmObject)
    FORWARD_FUNKNOWN(CmObject)

    enum Type
    {
        kFile = 0,
        kFolder = 1,
        kLink = 2,
        kBundle = 3
    };

    FPath() = default;
    FPath(const char16* fullPath, int newType);
    /// A child of `folder`; without one, or with an empty one, a relative path.
    FPath(const char16* newName, const FPath* folder, int newType);
    FPath(const char16* newName, const char16* folder, int newType);
    explicit FPath(IPath* other);
    FPath(const FPath& other) = default;
    FPath& operator=(const FPath& other) = default;

    /// Takes a text apart. A text without a delimiter becomes the folder part, with an empty name.
    virtual bool fromString(const char16* text, int newType);
    /// True where there is any text.
    virtual bool getFullPath(FString& result) const;

    // Parts
    virtual const FString& getName() const { return name; }
    virtual void setName(const char16* text);
    const FString& getPathName() const { return path; }
    /// A delimiter is added where it is missing.
    virtual void setPathName(const char16* text);
    int16 getPathType() const { return type; }
    void setPathType(int newType) { type = static_cast<int16>(newType); }
    bool isFile() const { return type == kFile; }
    /// Also true of a bundle.
    bool isFolder() const { return type == kFolder || type == kBundle; }
    bool isLink() const { return type == kLink; }
    bool isBundle() const { return type == kBundle; }
    bool isVisible() const { return (flags & kHidden) == 0; }
    void setVisible(bool state);

    // Extension, without its dot
    /// False, with an empty result, where the name has none.
    bool getExtension(FString& result) const;
    void getNameWithoutExtension(FString& result, bool useFileType) const;
    /// The place of the dot in the name, -1 without an extension:
    ///
    /// | name       | file type | `useFileType` | result |
    /// |------------|-----------|---------------|--------|
    /// | "a.txt"    | "txt"     | either        | 1      |
    /// | "a.txt"    | "bin"     | true          | -1     |
    /// | "a.b c"    | none      | either        | -1     |
    /// | ".profile" | any       | either        | -1     |
    int getExtensionIndex(bool useFileType) const;
    /// Gives a file the extension of its type. Without `replace` a name that ends in another extension keeps
    /// it and the new one is appended. False for a folder, and where the type has no extension.
    virtual bool updateExtension(bool replace);

    // File type
    /// May look into the file on disk where the type isn't known yet.
    FFileType& getFileType();
    /// The type as it is known now.
    const FFileType& getKnownFileType() const { return fileType; }
    /// Also changes the extension of a file, if the new type has one.
    void setFileType(const FFileType& newType);
    /// Finds the type by the extension or, with `lookIntoFile`, by the file's first bytes. False where none
    /// is found.
    virtual bool detectFileType(bool lookIntoFile);
    static void toFrameworkFileType(const FFileTypeInfo& info, FFileType& result);
    static void fromFrameworkFileType(const FFileType& fileType, FFileTypeInfo& result);

    // Moving
    /// The path becomes a child of itself. Beware: a delimiter is added to a folder part that has none, so
    /// that a name alone, "a", becomes "/a/b".
    virtual bool descend(const char16* childName, int childType);
    /// The path becomes its folder. False, with the path as it was, at a root and where the folder part of a
    /// relative path has one component or none.
    virtual bool ascend();
    virtual bool isRootDir() const;
    virtual bool isRoot(const char16* text) const;
    /// Whether all components of `folder` lead this path; false for the folder itself.
    bool isInDir(const FPath* folder) const;

    /// Whether paths that differ in the case of letters are different places.
    virtual bool isCaseSensitive() const { return true; }

    // Unused names
    /// Numbers the name until `fileSystem` has no such file: "take.wav", "take-01.wav", "take-02.wav". False,
    /// with the path as it was, where all numbers up to 9999 are taken. Touches the disk.
    bool makeUnique(FFileSystem& fileSystem);
    /// The same in the global file system.
    virtual bool uniqueName();

    // Comparison
    unsigned hash(unsigned size) const override;
    /// In the order of a tree: what is in a folder comes right behind it. -1 where `other` is no path.
    int compare(const CmObject* other) const override;
    bool isEqual(const CmObject* other) const override;
    bool operator==(const FPath& other) const;

    // Storage: the base class has nothing to store, and says that all went well
    bool internalize(FArchive& archive) override;
    bool externalize(FArchive& archive) const override;

    int32 queryInterface(const char* interfaceID, void** object) override;

    int32 setFullPath(const char16* text, int newType) override;
    int32 setFileName(const char16* text) override;
    int32 getType(int* result) override;
    int32 goDown(const char16* childName, int childType) override;
    int32 goUp() override;
    int32 getFullPath(char16* buffer) override;
    int32 getFileName(char16* buffer) override;
    int32 getPathName(char16* buffer) override;
    int32 getFileExtension(char16* buffer) override;
    int32 getNameWithoutExt(char16* buffer) override;
    int32 getFileType(FFileTypeInfo* info) override;
    int32 setFileType(FFileTypeInfo* info) override;
    int32 updateFileExtension() override;
    int32 newCopy(IPath** copy) override;

protected:
    static constexpr uint16 kHidden = 1;

    /// All members become those of `other`.
    void takeParts(const FPath& other);
    /// What another component tells of its path, by text.
    void takeInterface(IPath& other);
    FFileType* typeOfExtension() const;
    /// Without a type that was found, the extension becomes the type, or "???" where there is none.
    bool assignType(const FFileType* found);
    /// Numbers the name until nothing of that name exists; `isTaken` asks.
    bool numberName(bool (*isTaken)(FPath& path, void* context), void* context);

    FString name;
    FFileType fileType;
    uint16 flags = 0;
    int16 type = kFile;
    FString path;

private:
    bool endsInTypeExtension() const;
    bool ascendFromRoot();
};
