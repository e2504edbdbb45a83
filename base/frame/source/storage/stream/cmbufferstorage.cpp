#include "containers/value/cmbuffer.h"
#include "storage/stream/fstream.h"

#include <algorithm>

bool CmBuffer::writeToStream(FStream& stream) const
{
    return stream.writeInt32u(memSize) && stream.writeInt32u(fillSize) &&
           stream.writeRaw(buffer, memSize) == int64{memSize};
}

bool CmBuffer::readFromStream(FStream& stream)
{
    // The stored size is believed as far as there are bytes to it.
    constexpr uint32 kPiece = 1 << 20;
    setSize(0);
    uint32 storedSize = 0, storedFill = 0;
    if (!stream.readInt32u(storedSize) || !stream.readInt32u(storedFill) || storedFill > storedSize)
        return false;
    while (memSize < storedSize)
    {
        const uint32 done = memSize;
        const uint32 piece = std::min(storedSize - done, std::max(done, kPiece));
        if (setSize(done + piece) && stream.readRaw(buffer + done, piece) == int64{piece})
            continue;
        setSize(0);
        return false;
    }
    fillSize = storedFill;
    return true;
}
