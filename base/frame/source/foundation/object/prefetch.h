#pragma once

/// Lets the processor bring what stands at `address` near while it goes on. A hint only: any address will do, and
/// where the compiler knows no such thing, nothing happens.
inline void prefetch([[maybe_unused]] const void* address)
{
#ifdef __GNUC__
    __builtin_prefetch(address);
#endif
}
