#include "storage/virtual/farchivemanager.h"

#include "containers/match/cmtokens.h"
#include "foundation/object/singleton.h"
#include "foundation/thread/flockscope.h"
#include "storage/path/fpath.h"
#include "storage/url/furl.h"
#include "storage/virtual/archiveprotocols.h"

#include <vector>

DEFINE_INTERFACE_ID(FRemovableFileSystem, 0x51E7C0A9, 0x2B6D4F83, 0x9C04A7E2, 0x6F318BD5)

FObject* FArchiveManager::theInstance = nullptr;

namespace
{
constexpr int kPostfixLength = 3;
/// No protocol is longer.
constexpr int kMaxProtocolLength = 12;
constexpr const char16* kProtocols[] = {kVFSProtocolPlusColon, kArchiveProtocolPlusColon,
                                        kQZRProtocolPlusColon, kTonerackProtocolPlusColon,
                                        kTonepackProtocolPlusColon};

bool isWordOfLetters(const ConstString& word)
{
    for (unsigned i = 0; i < word.length(); i++)
        if (!ConstString::isCharAlpha(word.getChar16(i)))
            return false;
    return !word.isEmpty();
}

/// The text of a path; that of a URL without its escapes.
FString textOf(const FPath& path)
{
    FString text;
    path.getFullPath(text);
    if (FCast(FUrl, &path))
        FUrl::urlDecode(text);
    text.toWideString();
    return text;
}
} // namespace

// The one manager

FArchiveManager* FArchiveManager::instance()
{
    if (!theInstance && !Singleton::isTerminated())
    {
        auto* manager = new FArchiveManager;
        theInstance = manager;
        Singleton::registerInstance(&theInstance);
        IArchiveLookup::setInstance(manager);
    }
    return static_cast<FArchiveManager*>(theInstance);
}

void FArchiveManager::terminate()
{
    if (theInstance)
        theInstance->release();
    theInstance = nullptr;
}

FArchiveManager::FArchiveManager() = default;

FArchiveManager::~FArchiveManager()
{
    if (IArchiveLookup::instance() == this)
        IArchiveLookup::setInstance(nullptr);
}

// Archives

bool FArchiveManager::registerArchive(FFileSystem* files, const FString& name, const FString& key)
{
    const IPtr<ArchiveEntry> entry = adopt(ArchiveEntry::create(files, name, key));
    if (!entry)
        return false;
    const auto view = adopt(askInterface<FRemovableFileSystem>(files));
    FLockScope guard(lock);
    if (IPtr<ArchiveEntry>* present = entries.lookup(entry->getKey()))
    {
        (*present)->use();
        return true;
    }
    if (view && !isRemovable(files))
        removable.add(view);
    return entries.add(entry->getKey(), entry);
}

bool FArchiveManager::isRemovable(FFileSystem* files) const
{
    for (TLinkedListIterator<IPtr<FRemovableFileSystem>> it(removable); !it.done(); it.next())
        if (it.current()->getFileSystem() == files)
            return true;
    return false;
}

bool FArchiveManager::unregisterArchive(FFileSystem* files)
{
    // Let go of behind the lock: what ends there may look for archives itself.
    IPtr<ArchiveEntry> gone;
    IPtr<FRemovableFileSystem> goneView;
    FLockScope guard(lock);
    auto walk = entries.iterate();
    while (!walk.done() && walk.current().value->getFileSystem() != files)
        walk.next();
    if (walk.done())
        return false;
    if (!walk.current().value->unuse())
        return true;
    gone = walk.current().value;
    entries.remove(gone->getKey());
    for (auto rest = entries.iterate(); !rest.done(); rest.next())
        if (rest.current().value->getFileSystem() == files)
            return true;
    for (TLinkedListIterator<IPtr<FRemovableFileSystem>> it(removable); !it.done(); it.next())
        if (it.current()->getFileSystem() == files)
            goneView = it.current();
    removable.remove(goneView);
    return true;
}

IPtr<FFileSystem> FArchiveManager::find(const FString& key)
{
    const FString upperCase = ArchiveEntry::keyOf(key);
    FLockScope guard(lock);
    const IPtr<ArchiveEntry>* entry = entries.lookup(upperCase);
    return entry ? (*entry)->getFileSystem() : nullptr;
}

FFileSystem* FArchiveManager::lookupArchive(const FString& key)
{
    return find(key).take();
}

bool FArchiveManager::containsArchive(const FString& key)
{
    return find(key) != nullptr;
}

int FArchiveManager::getUseCount(const FString& key)
{
    const FString upperCase = ArchiveEntry::keyOf(key);
    FLockScope guard(lock);
    const IPtr<ArchiveEntry>* entry = entries.lookup(upperCase);
    return entry ? (*entry)->getUseCount() : 0;
}

void FArchiveManager::unmountUnusedVirtualFileSystems()
{
    std::vector<IPtr<FRemovableFileSystem>> candidates;
    {
        FLockScope guard(lock);
        for (TLinkedListIterator<IPtr<FRemovableFileSystem>> it(removable); !it.done(); it.next())
            candidates.push_back(it.current());
    }
    for (const IPtr<FRemovableFileSystem>& candidate : candidates)
        if (candidate->unmount())
            forget(candidate->getFileSystem());
}

// All registrations of it end.
void FArchiveManager::forget(FFileSystem* files)
{
    for (bool isKnown = true; isKnown;)
        isKnown = unregisterArchive(files);
}

// Paths

int FArchiveManager::findFirstProtocolPostfix(const FString& text)
{
    FString wide(text);
    CmTokens tokens(wide.text16());
    for (ConstString word = tokens.next(u":"); !word.isEmpty(); word = tokens.next(u":"))
    {
        const auto end = static_cast<unsigned>(tokens.getIndex());
        if (isWordOfLetters(word) && wide.compareAt(end, kPROTOCOL_POSTFIX, kPostfixLength) == 0)
            return static_cast<int>(end);
    }
    return -1;
}

bool FArchiveManager::isArchivePath(const FString& text)
{
    const int postfix = findFirstProtocolPostfix(text);
    if (postfix < 0)
        return false;
    for (const ConstString protocol : kProtocols)
        if (static_cast<int>(protocol.length()) == postfix + 1 &&
            text.compare(protocol, postfix + 1, kCaseInsensitive) == 0)
            return true;
    return false;
}

bool FArchiveManager::isArchivePath(const FPath* path)
{
    return path && isArchivePath(textOf(*path));
}

bool FArchiveManager::isRoot(const FString& text)
{
    const int postfix = text.findNext(-1, ConstString(kPROTOCOL_POSTFIX));
    const int delimiter = text.findNext(-1, PATH_DELIMITER);
    if (postfix < 1 || postfix > kMaxProtocolLength || delimiter <= postfix)
        return false;
    const int name = postfix + kPostfixLength;
    const int length = static_cast<int>(text.length());
    const int end = name < length ? text.findNext(name, PATH_DELIMITER) : -1;
    return name < length && (end < 0 || (end > name && end == length - 1));
}

// False where the path isn't one into an archive.
bool FArchiveManager::splitText(const FPath& path, FString& name, FString& inner)
{
    const FString text = textOf(path);
    if (!isArchivePath(text))
        return false;
    const int begin = findFirstProtocolPostfix(text) + kPostfixLength;
    int end = text.findNext(begin, PATH_DELIMITER);
    if (end < 0)
        end = static_cast<int>(text.length());
    if (end > begin)
        text.extract(name, static_cast<unsigned>(begin), end - begin);
    text.extract(inner, static_cast<unsigned>(end));
    return true;
}

FFileSystem* FArchiveManager::getFileSystem(const FPath* path)
{
    FString name;
    FString inner;
    return path && splitText(*path, name, inner) ? lookupArchive(name) : nullptr;
}

FPath* FArchiveManager::getPath(const FPath& path)
{
    FString name;
    FString inner;
    if (!splitText(path, name, inner))
        return static_cast<FPath*>(path.CmObject::newCopy());
    return new FPath(inner.text16(), path.getPathType());
}

bool FArchiveManager::isBitwiseCopyable(const FPath* path)
{
    const IPtr<FFileSystem> files = adopt(getFileSystem(path));
    return !files || files->isBitwiseCopyable(adopt(getPath(*path)));
}
