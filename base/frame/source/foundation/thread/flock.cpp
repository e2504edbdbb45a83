#include "foundation/thread/flock.h"

FLock::FLock(const char*) {}
