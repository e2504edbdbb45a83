#pragma once

#include "foundation/object/iptr.h"
#include "network/messenger/nmessage.h"

class FMemoryStream;
class FStream;
class FString;

// The form of a message on its way: the name of its receiver, a 32-bit 0, the message.

/// The most bytes that a message may have.
inline constexpr int64 kMaxNetMessage = 16 * 1024 * 1024;
/// The most objects that it may have, references to them counted in.
inline constexpr int kMaxNetMessageObjects = 65536;

/// False where a value of the message can't be sent.
bool writeNetMessage(FStream& stream, const char* receiver, const FMessage& message);

/// Null where the bytes are no message. Lists that share their elements come out as lists that own them, for nobody
/// else would.
IPtr<NMessage> readNetMessage(FStream& stream, FString& receiver);

/// The bytes of a message; null where a value can't be sent or the other side would refuse them.
IPtr<FMemoryStream> bytesForNetwork(const char* receiver, const FMessage& message);

/// The bytes of the same message with the moment of its sending; null where that makes it too large.
IPtr<FMemoryStream> withSentTime(const FMemoryStream& bytes, int64 microseconds);
