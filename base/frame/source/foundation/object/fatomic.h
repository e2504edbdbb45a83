#pragma once

// The framework's only atomic primitives; all of them act with full barriers.

/// Adds 1; gives the value before.
int FAtomicIncrement(volatile int& value);

/// Takes 1 off; gives the value before.
int FAtomicDecrement(volatile int& value);

/// Adds `delta`; gives the value before.
int FAtomicAdd(volatile int& value, int delta);

/// Stores `newValue` where `value` is `oldValue`; tells whether it did.
bool FAtomicCompareAndSwap(volatile int& value, int oldValue, int newValue);
