#pragma once

#include "foundation/text/string.h"

/// What a number means to the user, for its reading and writing.
enum UTextFormatType : int
{
    kTextFormatNone = -1,
    kTextFormatSampleRate = 0,
    kTextFormatChannels = 1,
    kTextFormatBitDepth = 2,
    kTextFormatBitRate = 3,
    kTextFormatFileSize = 4,
    kTextFormatDateTime = 5,
    kTextFormatDuration = 6,
    kTextFormatHex = 7
};

/// Numbers, sizes, dates and durations in the user's words, and back. Main thread: it speaks through translations.
class FTextUtils
{
public:
    /// "Tune", "Tune Copy", "Tune Copy 2", "Tune Copy 3".
    static void makeCopyString(String& name);

    /// `bytes` in the largest unit of 1024 that leaves at least 1: "512 bytes", "1.50 KB".
    static void printFileSize(String& result, double bytes);
    /// "1.5 KB" gives 1536.
    static bool scanFileSize(const String& text, int64& bytes);

    /// Seconds as CmTime counts them, written as date, blank, time.
    static void printDateTime(String& result, int64 seconds);
    /// Without a time it is midnight.
    static bool scanDateTime(const String& text, int64& seconds);

    static void printChannels(String& result, int channels);
    /// A span in words: 61 gives "1 minute 1 second". `shorten` leaves out what is small beside the largest part.
    static void printFriendlyDuration(String& result, unsigned seconds, bool shorten);

    /// By the type; of an unknown one the text stays as it is.
    static void printInt(String& result, int64 value, UTextFormatType type);
    static bool scanInt(const String& text, int64& value, UTextFormatType type);
};
