#pragma once

// The vocabulary of the network messenger.

/// The ports that all programs meet on: TCP for messages, UDP for hello and goodbye.
inline constexpr int kNetMessagePort = 6991;
inline constexpr int kNetBroadcastPort = 6990;

// Types of messages

/// Somebody said hello or goodbye; posted to the notify group.
inline constexpr char kNetAvailableMessage[] = "kNetAvailableMessage";
inline constexpr char kNetByeByeMessage[] = "kNetByeByeMessage";
/// Posted to the messenger, makes it say hello.
inline constexpr char kSendHalloMsg[] = "kSendHalloMsg";
/// What a messenger tells another one about itself, and the name under which messengers receive it.
inline constexpr char kNetMessengerName[] = "kNetMessengerName";
/// The answer to a request for the name or address of a host.
inline constexpr char kIpToNameResult[] = "IpToNameResult";

// Values of hello and goodbye

inline constexpr char kNetProgramName[] = "kNetProgramName";
inline constexpr char kNetProgramVersion[] = "kNetProgramVersion";
/// The name of the sender's host.
inline constexpr char kNetSender[] = "Sender";

// Values of every message that came over the network

/// "a.b.c.d".
inline constexpr char kMsgRemoteIPAddr[] = "kMsgRemoteIPAddr";
/// In hello and goodbye the port on which the sender takes messages, else the port that it sent from.
inline constexpr char kMsgRemotePort[] = "kMsgRemotePort";
/// The port on which the sender of `kNetMessengerName` takes messages.
inline constexpr char kNetMessagePortKey[] = "msgPort";
/// When the message was sent and received, each an NTimeStamp of that side's clock; only where it has one.
inline constexpr char kNetSentStamp[] = "oTcK";
inline constexpr char kNetReceivedStamp[] = "iTcK";
/// The number in a time stamp.
inline constexpr char kNetStampValue[] = "stmp";

// Values of a host request's answer; an empty text where it isn't known

inline constexpr char kNetHost[] = "Host";
inline constexpr char kNetIP[] = "IP";
