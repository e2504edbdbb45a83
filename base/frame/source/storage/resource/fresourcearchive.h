#pragma once

#include "storage/resource/ffilearchive.h"
#include "storage/resource/fresourceentry.h"
#include "storage/resource/resourceformat.h"
#include "storage/stream/fcompressionengine.h"

#include <vector>

/// A resource file: header, the bytes of the files, a table, and an ending. docs/resource-files.md has the form.
///
/// A reader trusts no number of the file: what doesn't fit into it is not there, and `getDamage` tells that something is
/// missing. A new file has its content in the order of the names, so that the same files give the same bytes. Opening
/// may alert the user, and then belongs to the main thread; writing and rebuilding are for one thread at a time.
class FResourceArchive : public FFileArchive
{
    DECLARE_TYPE(FResourceArchive, FFileArchive)

    enum CreateFlags
    {
        kCompressContent = 2
    };

    /// Deeper folders are neither written nor read: they would exhaust the stack, and each path would be long.
    static constexpr int kMaxDepth = 128;
    static constexpr float kDefaultQuality = 0.6f;

    using FFileArchive::FFileArchive;
    ~FResourceArchive() override;

    // Reading
    /// False for any other file, for one with a damaged end, and for one that is compressed in a way that this
    /// program doesn't have.
    bool open() override;
    /// Completes a file that is being written; false where it isn't whole on disk.
    bool close() override;
    FStream* openNode(const FFileArchiveNode* node) override;
    bool isBitwiseCopyable(FPath* inner) override;
    /// Whether the user is told why an archive can't be opened.
    void displayWarnings(bool state) { warns = state; }
    /// How many times something in the table made no sense and was left out.
    int getDamage() const { return damage; }
    /// 0 while nothing is open.
    int getVersion() const { return formatVersion; }
    /// The one that the file is compressed by; null for none. Borrowed.
    FCompressionEngine* getEngine() const { return engine; }
    /// Where the table begins; all content lies before it.
    int64 getContentEnd() const { return contentEnd; }

    // Writing
    /// Begins an empty file. With kCompressContent what is copied into it is compressed, by the engine with that
    /// identifier or, for null, by the first there is; false without it. `close` completes the file.
    bool create(int createFlags, const FUID* compression);
    /// Writes a whole folder and closes the file. On failure, and where the hook cancels, there is no such file.
    bool create(FPath* folder, short createFlags, UProgressHook* hook, const FUID* compression = nullptr,
                float itsQuality = kDefaultQuality);
    /// 0, the fastest, to 1, the smallest; for what is written from now on.
    void setQuality(float newQuality) { quality = newQuality; }
    /// Adds the content of a folder on disk. A link to a file is taken for the file. What is left out, as
    /// `getLeftOut` tells, are links to folders or to nothing, devices, and names that the file can't hold.
    bool addFolder(FPath* folder, FResourceEntry& into, FArchiveProgress& progress, int depth = 0);
    /// Writes what is left of `from` to `to`, the stream of this archive, at its position; the entry takes place and
    /// size. False where it was cancelled or can't be written.
    bool copyInto(FStream& from, FStream& to, FResourceEntry& entry, UProgressHook* hook);

    // Rebuilding: a new file beside this one, with its rights, takes its place once it is whole. Not while a stream of the
    // archive is open, nor when it is damaged, for what is left out would be lost. On failure all is as it was.
    /// Files that stand for nodes become the nodes' content.
    bool compact(int createFlags, const FUID* compression, UProgressHook* hook);
    /// Writes the content of a folder into another archive that is being written.
    bool compactFolder(const FFileArchiveNode& from, FResourceArchive& target, FResourceEntry& to,
                       FArchiveProgress& progress);
    /// Puts another content in the place of a file's.
    bool replaceFileInArchive(FPath* inner, const FNPath* newContent, int createFlags,
                              const FUID* compression, UProgressHook* hook);

    // The data of all files
    /// Where it ends: behind the header at least.
    int64 findEndOfDataSection() const;
    void updateNodeOffsets(int64 delta);

private:
    // Reading
    bool readHeader();
    bool readEnding(ResourceFileEnding& ending, int64 size);
    bool prepareEngine(const ResourceFileEnding& ending);
    bool makeCompressionEngine(const FUID* id);
    void warnOfCompression() const;
    bool readTable(const ResourceFileEnding& ending);
    /// Reads entries into `parent` while `count` lasts. Gives how many it used up.
    uint32 unpackContentTable(FResourceEntry& parent, FStream& table, uint32 count, int depth);
    IPtr<FResourceEntry> readEntry(FStream& table);
    bool readNumber(FStream& table, int64& number) const;
    bool isPlausible(const FResourceEntry& entry) const;
    /// Whether the entry makes sense, beside those before it: together they hold no more than the file.
    bool claimContent(const FResourceEntry& entry);
    void forget();

    // Writing
    bool openToWrite();
    bool addFile(FPath& file, FResourceEntry& entry, FArchiveProgress& progress);
    bool collect(FPath& folder, FFileArchiveNode::Children& found);
    bool copyCompressed(FStream& from, FStream& to, FResourceEntry& entry, UProgressHook* hook);
    bool writeContent();
    int chooseVersion() const;
    /// Gives how many entries it wrote; 0 below an empty folder.
    uint32 packContentTable(FStream& table, const FFileArchiveNode& folder) const;
    void writeEntry(FStream& table, const FResourceEntry& entry) const;
    void writeNumber(FStream& table, int64 number) const;
    void fillId(ResourceFileEnding& ending) const;
    void abandon();
    bool exchange(FNPath& rebuilt, FNPath& former);

    IPtr<FCompressionEngine> engine;
    float quality = kDefaultQuality;
    int formatVersion = 0;
    int64 contentEnd = 0;
    /// While the table is read: the bytes of content that no entry has named yet.
    int64 unclaimed = 0;
    int damage = 0;
    bool warns = false;
    bool isWriting = false;
};

/// Opens a resource file for mounting; null where that fails. The caller gets the reference.
FFileSystem* createQzrArchive(FPath* path);
/// The type of resource files, where the bytes are those of one; else null.
FFileType* checkQzrFileType(unsigned char* header, int length);
/// The type of resource files, extension "qzr".
FFileType& qzrFileType();
/// Makes resource files known to paths and mounts, once.
void initFResourceArchive();
