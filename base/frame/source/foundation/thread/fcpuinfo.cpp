#include "foundation/thread/fcpuinfo.h"

#include "foundation/thread/platformthread.h"

FCpuInfo::FCpuInfo()
{
    initialize();
}

void FCpuInfo::initialize()
{
    present = PlatformThread::countProcessors();
    available = PlatformThread::countAvailableProcessors();
}
