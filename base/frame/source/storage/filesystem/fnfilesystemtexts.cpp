#include "foundation/text/fstring.h"
#include "foundation/text/utranslatedstring.h"
#include "storage/filesystem/fnfilesystem.h"
#include "storage/filesystem/platformfiles.h"
#include "storage/path/filenametext.h"
#include "storage/path/fnpath.h"

// Names and words: what is valid on disk, and what the user is told.

namespace
{
using PlatformFiles::Trouble;

constexpr size_t kMaxNameBytes = 255;

const UTranslatedString stringNoError("No error occurred.");
const UTranslatedString
    stringReadWrite("A reading/writing error occurred. This disk is not working normaly.");
const UTranslatedString stringNotFound("The file/folder could not be found at this location.");
const UTranslatedString stringNameTooLong("This name is too long.");
const UTranslatedString stringDiskFull("This disk is full.");
const UTranslatedString stringReadOnly("This disk is read only.");
const UTranslatedString stringNotAllowed("This operation is not allowed.");
const UTranslatedString stringUnexpected("An unexpected error occurred. The system's description is: ");

const UTranslatedString stringHarddisk("Harddisk");
const UTranslatedString stringRemovable("Removable Drive");
const UTranslatedString stringCompactDisc("Compact Disc");
const UTranslatedString stringNetwork("Network Drive");

const UTranslatedString stringUnits[] = {UTranslatedString("Bytes"), UTranslatedString("KB"),
                                         UTranslatedString("MB"), UTranslatedString("GB")};

// Numbers of older file managers, which files and components from elsewhere may still give.
Trouble meaningOfManagerCode(int code)
{
    switch (code)
    {
    case -38:
    case -36:
        return Trouble::kReadWrite;
    case -43:
    case -35:
        return Trouble::kNotFound;
    case -34:
    case -33:
        return Trouble::kDiskFull;
    case -44:
        return Trouble::kReadOnly;
    case -61:
    case -54:
    case -46:
    case -45:
        return Trouble::kNotAllowed;
    default:
        return Trouble::kOther;
    }
}

const UTranslatedString& textOf(Trouble trouble)
{
    switch (trouble)
    {
    case Trouble::kNone:
        return stringNoError;
    case Trouble::kReadWrite:
        return stringReadWrite;
    case Trouble::kNotFound:
        return stringNotFound;
    case Trouble::kNameTooLong:
        return stringNameTooLong;
    case Trouble::kDiskFull:
        return stringDiskFull;
    case Trouble::kReadOnly:
        return stringReadOnly;
    case Trouble::kNotAllowed:
        return stringNotAllowed;
    default:
        return stringUnexpected;
    }
}

bool replaceIn(FString& text, char16 wanted, char16 replacement)
{
    const char16 set[] = {wanted, 0};
    return text.replaceChars16(set, replacement);
}

// The bytes of the last extension with its dot.
size_t extensionBytes(const FString& name)
{
    const int dot = name.findPrev(-1, u'.');
    if (dot <= 0)
        return 0;
    const size_t bytes = FileNameText::toBytes(ConstString(name.text16() + dot)).size();
    return bytes < kMaxNameBytes / 2 ? bytes : 0;
}
} // namespace

// Errors

void FNFileSystem::getErrorMessage(int systemError, FString& result)
{
    const Trouble trouble =
        systemError < 0 ? meaningOfManagerCode(systemError) : PlatformFiles::meaningOf(systemError);
    result.assign(textOf(trouble).text());
    if (trouble != Trouble::kOther)
        return;
    FString description;
    description.fromUTF8(PlatformFiles::describe(systemError).c_str());
    result.append(description);
}

int FNFileSystem::fromPlatformErrorCode(int systemError)
{
    switch (PlatformFiles::meaningOf(systemError))
    {
    case Trouble::kNone:
        return kNoError;
    case Trouble::kNotFound:
        return kNotFound;
    case Trouble::kReadWrite:
        return kReadWriteError;
    case Trouble::kNameTooLong:
        return kNameTooLong;
    case Trouble::kDiskFull:
        return kDiskFull;
    case Trouble::kReadOnly:
        return kReadOnly;
    case Trouble::kNotAllowed:
        return kNotAllowed;
    default:
        return kUnexpected;
    }
}

uint32 FNFileSystem::convertOpenMode(uint32 mode, ModeDirection direction)
{
    constexpr uint32 kPlain = kFileRead | kFileWrite;
    if (direction == ModeDirection::kToPlain)
        return (mode & kFileReadWrite) ? (mode & ~uint32{kFileReadWrite}) | kPlain : mode;
    return (mode & kPlain) == kPlain ? (mode & ~kPlain) | kFileReadWrite : mode;
}

bool FNFileSystem::showPlatformErrors(bool state)
{
    const bool former = platformErrorsShown;
    platformErrorsShown = state;
    return former;
}

// Names

bool FNFileSystem::makeValidFileName(FString& name, char16 replacement, bool trim)
{
    bool isChanged = makeValidName(name, replacement, trim);
    isChanged = makeSystemName(name) || isChanged;
    if (!name.isEmpty() && !(name == ConstString(".")) && !(name == ConstString("..")))
        return isChanged;
    name.insertAt(0, replacement ? replacement : u'_');
    if (name.isEmpty())
        name.assign(replacement ? replacement : u'_');
    return true;
}

bool FNFileSystem::makeValidPath(FString& text, char16 replacement)
{
    text.toWideString();
    const bool hadStars = replaceIn(text, u'*', replacement ? replacement : u'x');
    const bool hadMarks = replaceIn(text, u'?', replacement ? replacement : u'S');
    return hadStars || hadMarks;
}

bool FNFileSystem::makeSystemName(FString& name)
{
    const FString former(name);
    name.toWideString();
    name.normalize(kUnicodeNormC);
    const size_t ending = extensionBytes(name);
    FString extension;
    if (ending > 0)
    {
        const unsigned dot = static_cast<unsigned>(name.findPrev(-1, u'.'));
        name.extract(extension, dot);
        name.remove(dot);
    }
    while (!name.isEmpty() && FileNameText::toBytes(name).size() + ending > kMaxNameBytes)
        name.remove(name.length() - 1);
    // Half of a pair would be no character.
    if (!name.isEmpty() && (name.getChar16(name.length() - 1) & 0xFC00) == 0xD800)
        name.remove(name.length() - 1);
    name.append(extension);
    return !(name == former);
}

bool FNFileSystem::isRoot(const char16* text)
{
    return text && text[0] == PATH_DELIMITER && text[1] == 0;
}

// For the user

bool FNFileSystem::getFileSizeString(FPath* path, FString& result, int unit)
{
    const int64 size = getFileSize(path);
    if (size <= 0)
        return false;
    makeFileSizeString(static_cast<double>(size), result, unit);
    return true;
}

void FNFileSystem::makeFileSizeString(double bytes, FString& result, int unit)
{
    double figure = bytes;
    int step = kBytes;
    while (step < kGigaBytes && (unit < 0 ? figure >= 1024 : step < unit))
    {
        figure /= 1024;
        step++;
    }
    if (step == kBytes)
        figure /= 1000;
    FString figureText;
    figureText.printf("%.3f ", figure);
    result = figureText;
    result.append(stringUnits[step].text());
}

const char16* FNFileSystem::getDriveTypeString(int driveType)
{
    switch (driveType)
    {
    case kFixedDrive:
        return stringHarddisk.text();
    case kRemovableDrive:
        return stringRemovable.text();
    case kOpticalDrive:
        return stringCompactDisc.text();
    case kNetworkDrive:
        return stringNetwork.text();
    default:
        return nullptr;
    }
}
