#include "foundation/text/encodings.h"

#include <atomic>

namespace
{
// Set once while the process starts; read by every thread that converts text.
constinit std::atomic<unsigned> defaultEncoding{kEncodingMacRoman};
} // namespace

void setDefaultEncoding(unsigned encoding)
{
    defaultEncoding = encoding == kEncodingDefault ? kEncodingMacRoman : encoding;
}

unsigned getDefaultEncoding()
{
    return defaultEncoding;
}
