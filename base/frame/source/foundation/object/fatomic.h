#pragma once

#include <atomic>

// The framework's only atomic primitives; all of them act with full barriers.

inline int FAtomicRead(const volatile int& value)
{
    return std::atomic_ref<int>(const_cast<int&>(value)).load(std::memory_order_seq_cst);
}

/// Adds `delta`; gives the value before.
inline int FAtomicAdd(volatile int& value, int delta)
{
    // std::atomic_ref has no volatile form; the counters are volatile only to keep plain reads honest.
    return std::atomic_ref<int>(const_cast<int&>(value)).fetch_add(delta, std::memory_order_seq_cst);
}

/// Adds 1; gives the value before.
inline int FAtomicIncrement(volatile int& value)
{
    return FAtomicAdd(value, 1);
}

/// Takes 1 off; gives the value before.
inline int FAtomicDecrement(volatile int& value)
{
    return FAtomicAdd(value, -1);
}

/// Stores `newValue` where `value` is `oldValue`; tells whether it did.
inline bool FAtomicCompareAndSwap(volatile int& value, int oldValue, int newValue)
{
    return std::atomic_ref<int>(const_cast<int&>(value))
        .compare_exchange_strong(oldValue, newValue, std::memory_order_seq_cst);
}
