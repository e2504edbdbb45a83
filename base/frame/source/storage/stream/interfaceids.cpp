#include "storage/stream/ibstream.h"
#include "storage/stream/imemorystream.h"
#include "storage/stream/isizeablestream.h"

DEFINE_INTERFACE_ID(IBStream, 0x793B2034, 0x670648C8, 0x8D63DC89, 0x018DF029)
DEFINE_INTERFACE_ID(ISizeableStream, 0x20837C2F, 0x289D4F34, 0x8FA3F0D9, 0x558AB69F)
DEFINE_INTERFACE_ID(IMemoryStream, 0x79F73043, 0x1AEB49E0, 0xA7C8D05F, 0x7EB961B4)
