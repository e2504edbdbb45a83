#include "storage/stream/fcompressionstream.h"

#include "services/components/fcomponentregistry.h"
#include "storage/stream/fmemorystream.h"

#include <algorithm>
#include <cassert>
#include <limits>

static constexpr const char* kEngineCategory = "Compression Engine";
static constexpr int64 kMaxPiece = std::numeric_limits<int32>::max();

/// The engine behind a new component, whose reference is taken over; null where it is something else.
static IPtr<FCompressionEngine> toEngine(FUnknown* component)
{
    const auto unknown = adopt(component);
    return IPtr<FCompressionEngine>(FCast(FCompressionEngine, toFObject(unknown)));
}

FCompressionEngine* FCompressionStream::createDefaultEngine()
{
    const int count = gComponentRegistry ? gComponentRegistry->countComponents(kEngineCategory) : 0;
    for (int i = 0; i < count; i++)
    {
        auto engine = toEngine(gComponentRegistry->createComponent(kEngineCategory, i));
        if (engine && engine->getType() == FCompressionEngine::kDefaultEngine)
            return engine.take();
    }
    return nullptr;
}

FCompressionStream::FCompressionStream(FStream* innerStream, FCompressionEngine* itsEngine)
    : stream(innerStream),
      engine(itsEngine)
{
    if (!engine)
        engine = adopt(createDefaultEngine());
    takeFormOfStream();
}

FCompressionStream::FCompressionStream(FStream* innerStream, const FUID& engineClass) : stream(innerStream)
{
    if (gComponentRegistry)
        engine = toEngine(gComponentRegistry->createUnknownComponent(engineClass));
    takeFormOfStream();
}

FCompressionStream::FCompressionStream(const FCompressionStream& other)
    : IBStream(other),
      FStream(other),
      stream(other.stream),
      engine(other.engine)
{
}

FCompressionStream::~FCompressionStream()
{
    engine = nullptr;
    endCompressor();
    endDecompressor();
}

void FCompressionStream::takeFormOfStream()
{
    if (!stream)
        return;
    fileType = stream->getFileType();
    byteOrder = stream->getByteOrder();
}

void FCompressionStream::endCompressor()
{
    if (!compressor)
        return;
    compressor->end();
    compressor = nullptr;
}

void FCompressionStream::endDecompressor()
{
    if (!decompressor)
        return;
    decompressor->end();
    decompressor = nullptr;
}

bool FCompressionStream::beginCompress(float quality)
{
    if (!engine || !stream)
        return false;
    endCompressor();
    compressor = adopt(engine->newCompressor());
    position = 0;
    return compressor && compressor->begin(stream, quality);
}

bool FCompressionStream::beginDecompress(int64 size)
{
    if (!engine || !stream)
        return false;
    endDecompressor();
    decompressor = adopt(engine->newDecompressor());
    uncompressedSize = size;
    position = 0;
    return decompressor && decompressor->begin(stream);
}

int64 FCompressionStream::readRaw(void* target, int64 count)
{
    assert(decompressor && "beginDecompress comes first");
    const int got = decompressor->read(target, static_cast<int>(std::min(count, kMaxPiece)));
    position += std::max(got, 0);
    return got;
}

int64 FCompressionStream::writeRaw(const void* source, int64 count)
{
    assert(compressor && "beginCompress comes first");
    // The interface of compressors is no stickler for const; they don't change what they are given.
    auto* bytes = const_cast<char*>(static_cast<const char*>(source));
    for (int64 done = 0; done < count;)
    {
        const int64 piece = std::min(count - done, kMaxPiece);
        if (!compressor->write(bytes + done, static_cast<int>(piece)))
            return 0;
        done += piece;
    }
    position += count;
    return count;
}

void FCompressionStream::readAway(int64 count)
{
    char byte;
    while (decompressor && count > 0 && readRaw(&byte, 1) == 1)
        count--;
}

int64 FCompressionStream::seek(int64 target, FSeekMode mode)
{
    if (decompressor && decompressor->canSeek())
    {
        position = decompressor->seek(target, mode);
        return position;
    }
    if (mode == kSeekStart && target < position)
    {
        rewind();
        return target;
    }
    if (mode == kSeekStart)
        readAway(target - position);
    else if (mode == kSeekCurrent)
        readAway(target);
    return position;
}

void FCompressionStream::rewind()
{
    if (position != 0 && decompressor)
    {
        if (decompressor->canSeek())
            position = decompressor->seek(0, kSeekStart);
        if (position != 0)
        {
            decompressor->end();
            stream->rewind();
            decompressor->begin(stream);
        }
    }
    position = 0;
}

void FCompressionStream::flush()
{
    if (compressor)
        compressor->flush();
}

IBStream* FCompressionStream::createUncompressedStream(IBStream* source)
{
    auto* packed = FCast(FCompressionStream, toFObject(source));
    if (!packed)
    {
        if (source)
            source->addRef();
        return source;
    }
    auto plain = adopt(new FMemoryStream);
    const int64 size = packed->getUncompressedSize();
    if (size < 0)
        plain->copyFrom(*packed);
    else if (plain->setSize(size))
        plain->setSize(packed->readRaw(plain->getData(), size));
    if (!plain->verify())
        return nullptr;
    plain->rewind();
    return plain.take();
}
