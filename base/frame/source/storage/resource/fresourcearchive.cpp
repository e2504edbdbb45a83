#include "storage/resource/fresourcearchive.h"

#include "foundation/text/iuseralert.h"
#include "foundation/text/utranslatedstring.h"
#include "services/components/fcomponentregistry.h"
#include "storage/stream/fcompressionstream.h"

#include <cstring>

// Opening and reading, but for the table.

namespace
{
constexpr const char* kEngineCategory = "Compression Engine";
constexpr int kMaxHeaderLine = 254;
constexpr int kNotice = 0;

const UTranslatedString stringComprNotSupported("Resource File Error: Compression not supported!");

IPtr<FCompressionEngine> toEngine(FUnknown* component)
{
    const auto unknown = adopt(component);
    return FCast(FCompressionEngine, toFObject(unknown));
}

IPtr<FCompressionEngine> firstEngine()
{
    const int count = gComponentRegistry->countComponents(kEngineCategory);
    for (int i = 0; i < count; i++)
        if (IPtr<FCompressionEngine> engine =
                toEngine(gComponentRegistry->createComponent(kEngineCategory, i)))
            return engine;
    return nullptr;
}
} // namespace

FResourceArchive::~FResourceArchive()
{
    FResourceArchive::close();
}

void FResourceArchive::forget()
{
    engine = nullptr;
    formatVersion = 0;
    contentEnd = 0;
    damage = 0;
}

bool FResourceArchive::open()
{
    if (!FFileArchive::open())
        return false;
    stream->setByteOrder(0);
    const int64 size = stream->seek(0, kSeekEnd);
    ResourceFileEnding ending;
    if (!readHeader() || !readEnding(ending, size))
    {
        close();
        return false;
    }
    if (!prepareEngine(ending))
    {
        close();
        warnOfCompression();
        return false;
    }
    if (readTable(ending))
        return true;
    close();
    return false;
}

bool FResourceArchive::close()
{
    if (hasOpenStreams())
        return false;
    const bool isComplete = !isWriting || writeContent();
    isWriting = false;
    forget();
    return FFileArchive::close() && isComplete;
}

bool FResourceArchive::readHeader()
{
    // The line comes without its end, which was two characters.
    char line[kMaxHeaderLine + 3];
    stream->rewind();
    stream->readString8(line, kMaxHeaderLine + 1);
    strcat(line, "\r\n");
    return strcmp(line, kResourceHeader) == 0;
}

bool FResourceArchive::readEnding(ResourceFileEnding& ending, int64 size)
{
    int32 magic = 0;
    constexpr int64 kMagicSize = sizeof(magic);
    if (size < kMagicSize || stream->seek(size - kMagicSize, kSeekStart) < 0 || !stream->readInt32(magic))
        return false;
    formatVersion = getMagicVersion(magic);
    const int64 endingSize = getVersionSize(formatVersion);
    if (formatVersion == 0 || size < kResourceHeaderSize + endingSize ||
        stream->seek(size - endingSize, kSeekStart) < 0 || !ending.read(*stream, formatVersion))
        return false;
    contentEnd = size - endingSize - ending.tableSize;
    return ending.endingSize == endingSize && contentEnd >= kResourceHeaderSize;
}

// Engine

bool FResourceArchive::prepareEngine(const ResourceFileEnding& ending)
{
    char text[ResourceFileEnding::kIdSize + 1] = {};
    memcpy(text, ending.compressionId, ResourceFileEnding::kIdSize);
    FUID id;
    if (!id.fromString(text) || !id.isValid())
        return true;
    return makeCompressionEngine(&id);
}

bool FResourceArchive::makeCompressionEngine(const FUID* id)
{
    engine = nullptr;
    if (gComponentRegistry)
        engine = id ? toEngine(gComponentRegistry->createUnknownComponent(*id)) : firstEngine();
    return engine != nullptr;
}

void FResourceArchive::warnOfCompression() const
{
    if (IUserAlert* alert = warns ? IUserAlert::get() : nullptr)
        alert->run(stringComprNotSupported.text(), kNotice, nullptr, nullptr, nullptr);
}

// Content

FStream* FResourceArchive::openNode(const FFileArchiveNode* node)
{
    IPtr<FStream> stored = adopt(FFileArchive::openNode(node));
    const auto* entry = FCast(FResourceEntry, node);
    if (!stored || !entry || !entry->isCompressed() || entry->getReference())
        return stored.take();
    IPtr<FCompressionStream> content = adopt(new FCompressionStream(stored, engine));
    return content->beginDecompress(entry->getFileSize()) ? content.take() : nullptr;
}

bool FResourceArchive::isBitwiseCopyable(FPath* inner)
{
    const auto* entry = FCast(FResourceEntry, static_cast<const FObject*>(lookupNode(inner)));
    return entry && !entry->isCompressed();
}

int64 FResourceArchive::findEndOfDataSection() const
{
    int64 end = kResourceHeaderSize;
    if (!root)
        return end;
    std::vector<const FFileArchiveNode*> waiting{root};
    while (!waiting.empty())
    {
        const FFileArchiveNode* node = waiting.back();
        waiting.pop_back();
        if (!node->isFolder())
            end = std::max(end, node->getDataOffset() + node->getDataSize());
        waiting.insert(waiting.end(), node->getChildren().begin(), node->getChildren().end());
    }
    return end;
}

void FResourceArchive::updateNodeOffsets(int64 delta)
{
    std::vector<FFileArchiveNode*> waiting{root};
    while (!waiting.empty())
    {
        FFileArchiveNode* node = waiting.back();
        waiting.pop_back();
        if (!node)
            continue;
        if (!node->isFolder())
            static_cast<FResourceEntry*>(node)->setDataOffset(node->getDataOffset() + delta);
        waiting.insert(waiting.end(), node->getChildren().begin(), node->getChildren().end());
    }
}
