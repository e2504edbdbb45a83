#include "storage/filesystem/fnfileiterator.h"

#include "storage/filesystem/diskname.h"
#include "storage/filesystem/platformfiles.h"
#include "storage/path/filenametext.h"

namespace
{
int typeOf(const PlatformFiles::Facts& facts)
{
    if (facts.isLink)
        return FPath::kLink;
    return facts.kind == PlatformFiles::Kind::kFolder ? FPath::kFolder : FPath::kFile;
}
} // namespace

FNFileIterator::FNFileIterator(const FNPath* folder, bool skipHiddenEntries) : skipHidden(skipHiddenEntries)
{
    if (folder)
        base = *folder;
}

void FNFileIterator::first()
{
    entries.clear();
    index = 0;
    started = true;
    base.setPathType(FPath::kFolder);
    folderBytes = DiskName::find(base);
    PlatformFiles::list(folderBytes, entries);
    settle();
}

void FNFileIterator::next()
{
    if (done())
        return;
    index++;
    settle();
}

bool FNFileIterator::done()
{
    if (!started)
        first();
    return index >= entries.size();
}

// Makes the path of the entry, going on to the next one that is wanted.
void FNFileIterator::settle()
{
    for (entry = nullptr; index < entries.size(); index++)
    {
        String name;
        FileNameText::fromBytes(entries[index].c_str(), name);
        name.normalize(kUnicodeNormC);
        const PlatformFiles::Facts facts = PlatformFiles::look(folderBytes + "/" + entries[index]);
        entry = adopt(new FNPath(name.text16(), &base, typeOf(facts)));
        entry->setVisible(!name.testChar16(0, u'.'));
        if (!skipHidden || (entry->isVisible() && !isPackage()))
            return;
    }
}

bool FNFileIterator::isPackage() const
{
    if (!entry->isFolder())
        return false;
    FNPath asked(*entry);
    asked.setPathType(FPath::kFile);
    asked.detectFileType(false);
    return asked.isBundle();
}

IPtr<FPath> FNFileIterator::current()
{
    if (done())
        return nullptr;
    return adopt(new FNPath(*entry));
}
