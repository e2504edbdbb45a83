#pragma once

#include "foundation/text/fstring.h"

#include <string>

/// What a hello or goodbye datagram says.
///
/// The text is "pock...pock...VELLAMOOR " or "bye bye", then values with blanks between them: program, version,
/// message port, host, and the number of this form, 1. Blanks and all else but plain characters are written as in
/// URLs, an empty value as "unknown". Values behind these are for later forms and are passed over. A value.
struct NBroadcastText
{
    /// Longer datagrams are none of ours; this fits into one packet of every network.
    static constexpr int kMaxSize = 1024;

    /// False for datagrams that are neither a hello nor a goodbye.
    [[nodiscard]] bool parse(const char* data, unsigned size);
    std::string print() const;
    /// Appends the values, each behind a blank but the first.
    void setBroadcastParams(std::string& text) const;

    bool isHello = true;
    FString program;
    FString version;
    uint16 port = 0;
    FString host;
};
