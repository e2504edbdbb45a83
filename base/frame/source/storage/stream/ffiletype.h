#pragma once

#include "foundation/object/cmobject.h"
#include "foundation/text/fstring.h"

class FStream;

/// Four letters as one number, the first in the highest byte: `fourCharCode("TEXT")`.
constexpr int32 fourCharCode(const char (&text)[5])
{
    uint32 code = 0;
    for (int i = 0; i < 4; i++)
        code = (code << 8) | static_cast<uint8>(text[i]);
    return static_cast<int32>(code);
}

/// What a file holds, in the words of several platforms at once.
///
/// Two types are equal as soon as one word that both have is equal, in the order UTI, DOS extension, Mac
/// type, Unix extension, MIME type; a word that differs doesn't decide. So equality isn't transitive, and
/// types have no hash. Types that the program knows are registered during start-up, which isn't locked. A
/// value; one thread at a time.
class FFileType : public CmObject
{
    DECLARE_CLASS(FFileType, CmObject)

    /// Tells a type by the first bytes of a file, of which there are `length`, 1024 at most; null where it
    /// doesn't know them. The result lives as long as the program.
    using Identifier = FFileType* (*)(unsigned char* header, int length);

    FFileType() = default;
    /// Null texts leave their member empty.
    FFileType(const char* mime, const char* dosExtension, const char* unixExtension, int32 macCode,
              const char* typeName, const char* typeUti = nullptr);

    /// Whether anything but the name is set.
    bool isValid() const;
    bool operator==(const FFileType& other) const;
    void reset();

    // The members
    int32 getMacType() const { return macType; }
    void setMacType(int32 code) { macType = code; }
    const FString& getDosType() const { return dosType; }
    void setDosType(const ConstString& extension) { dosType.assign(extension); }
    const FString& getUnixType() const { return unixType; }
    void setUnixType(const ConstString& extension) { unixType.assign(extension); }
    const FString& getMimeType() const { return mimeType; }
    void setMimeType(const ConstString& text) { mimeType.assign(text); }
    const FString& getUti() const { return uti; }
    void setUti(const ConstString& text) { uti.assign(text); }
    /// The type's name for the user.
    const FString& getName() const { return name; }
    void setName(const ConstString& text) { name.assign(text); }
    /// The extension that a file of this type gets, without its dot: the DOS one, else the Unix one.
    const FString& getExtension() const { return dosType.isEmpty() ? unixType : dosType; }
    /// Whether `extension` is the DOS or the Unix one, without regard to case.
    bool hasExtension(const ConstString& extension) const;

    // The types that the program knows; what is registered isn't owned and must outlive all look-ups
    static void registerType(FFileType* type);
    static void unregisterType(FFileType* type);
    static void registerTypeIdentifier(Identifier identify);
    /// The first registered type with this extension, case respected; null where there is none.
    static FFileType* getTypeByString(const char16* extension);
    /// The type that the first identifier finds in the first 1024 bytes; null where none does or nothing can
    /// be read. The stream stands at its start afterwards.
    static FFileType* getTypeByStream(FStream* stream);

    bool storeAttributes(FAttributes& attributes) const override;
    bool restoreAttributes(FAttributes& attributes) override;
    bool internalize(FArchive& archive) override;
    bool externalize(FArchive& archive) const override;

private:
    int32 macType = 0;
    FString dosType;
    FString unixType;
    FString mimeType;
    FString uti;
    FString name;
};
