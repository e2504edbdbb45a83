#include "network/messenger/netmessageform.h"

#include "containers/sequence/cmcontainer.h"
#include "storage/attribute/fsimplearchive.h"
#include "storage/stream/fmemorystream.h"

namespace
{
/// Gives the lists that came the references of their elements, which the archive left to nobody.
void ownElements(const FSimpleArchive& archive)
{
    for (const auto& object : archive.getObjects())
        if (auto* container = FCast(CmContainer, object.get()))
            if (const int16 mode = container->getOwnership();
                mode != CmContainer::kTaken && mode != CmContainer::kRetained)
                container->takeElements();
}

IPtr<FMemoryStream> writeWithinLimit(const char* receiver, const FMessage& message)
{
    auto bytes = adopt(new FMemoryStream);
    const bool isWritten = writeNetMessage(*bytes, receiver, message);
    return isWritten && bytes->getSize() <= kMaxNetMessage ? bytes : nullptr;
}

IPtr<NMessage> readBytes(const FMemoryStream& bytes, FString& receiver)
{
    FMemoryStream reading(bytes.getData(), bytes.getSize());
    return readNetMessage(reading, receiver);
}

bool readParts(FSimpleArchive& archive, FString& receiver, NMessage& message)
{
    int32 zero = 0;
    return receiver.internalize(archive) && archive.getStream().readInt32(zero) && zero == 0 &&
           message.internalize(archive);
}
} // namespace

bool writeNetMessage(FStream& stream, const char* receiver, const FMessage& message)
{
    FSimpleArchive archive(&stream, true);
    return FString(receiver).externalize(archive) && stream.writeInt32(0) && message.externalize(archive);
}

IPtr<NMessage> readNetMessage(FStream& stream, FString& receiver)
{
    auto message = adopt(new NMessage);
    FSimpleArchive archive(&stream, false);
    archive.setObjectLimit(kMaxNetMessageObjects);
    const bool isRead = readParts(archive, receiver, *message);
    ownElements(archive);
    return isRead ? message : nullptr;
}

IPtr<FMemoryStream> bytesForNetwork(const char* receiver, const FMessage& message)
{
    const IPtr<FMemoryStream> bytes = writeWithinLimit(receiver, message);
    FString readReceiver;
    return bytes && readBytes(*bytes, readReceiver) ? bytes : nullptr;
}

IPtr<FMemoryStream> withSentTime(const FMemoryStream& bytes, int64 microseconds)
{
    FString receiver;
    const IPtr<NMessage> message = readBytes(bytes, receiver);
    if (!message)
        return nullptr;
    message->setSentTime(microseconds);
    return writeWithinLimit(receiver.text8(), *message);
}
