#pragma once

#include <cstddef>
#include <cstdint>

/// While it lives, what is allocated may stay, provided that the input names a class of containers: one that doesn't own
/// its elements keeps them, by contract, when it is read, and nobody frees them. Every other leak counts.
class LeaksAllowed
{
public:
    LeaksAllowed(const uint8_t* data, size_t size);
    LeaksAllowed(const LeaksAllowed&) = delete;
    ~LeaksAllowed();

private:
    bool isAllowed;
};
