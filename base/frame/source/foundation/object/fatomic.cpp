#include "foundation/object/fatomic.h"

#include <atomic>

namespace
{
// std::atomic_ref has no volatile form; the counters are volatile only to keep plain reads honest.
std::atomic_ref<int> atomic(volatile int& value)
{
    return std::atomic_ref<int>(const_cast<int&>(value));
}
} // namespace

int FAtomicIncrement(volatile int& value)
{
    return FAtomicAdd(value, 1);
}

int FAtomicDecrement(volatile int& value)
{
    return FAtomicAdd(value, -1);
}

int FAtomicAdd(volatile int& value, int delta)
{
    return atomic(value).fetch_add(delta, std::memory_order_seq_cst);
}

bool FAtomicCompareAndSwap(volatile int& value, int oldValue, int newValue)
{
    return atomic(value).compare_exchange_strong(oldValue, newValue, std::memory_order_seq_cst);
}
