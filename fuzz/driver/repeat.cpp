#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <random>

// Changes an input as the fuzzer does by itself, and at times repeats a piece of it until the input is as large as
// allowed. A reader whose cost grows faster than its input, or that keeps too much, shows within one such step; byte by
// byte the fuzzer would hardly get there.

extern "C" size_t LLVMFuzzerMutate(uint8_t* data, size_t size, size_t capacity);
extern "C" size_t LLVMFuzzerCustomMutator(uint8_t* data, size_t size, size_t capacity, unsigned seed);

namespace
{
constexpr unsigned kRepeatOneIn = 64;

/// The piece stays where it is and is repeated behind itself; what follows it moves to the end.
size_t repeatPiece(uint8_t* data, size_t size, size_t capacity, std::minstd_rand& random)
{
    const size_t start = random() % size;
    const size_t length = 1 + random() % std::min<size_t>(size - start, 64);
    const size_t tail = size - start - length;
    const size_t times = random() % ((capacity - size) / length + 1);
    uint8_t* piece = data + start;
    memmove(piece + length * (times + 1), piece + length, tail);
    for (size_t i = 1; i <= times; i++)
        memcpy(piece + length * i, piece, length);
    return size + length * times;
}
} // namespace

extern "C" size_t LLVMFuzzerCustomMutator(uint8_t* data, size_t size, size_t capacity, unsigned seed)
{
    std::minstd_rand random(seed);
    if (size == 0 || size >= capacity || random() % kRepeatOneIn != 0)
        return LLVMFuzzerMutate(data, size, capacity);
    return repeatPiece(data, size, capacity, random);
}
