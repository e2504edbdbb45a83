#pragma once

/// While it lives, what is allocated may stay: objects of a file may own one another in a circle, or be in a container
/// that doesn't own its elements and keeps them, by contract, when they are read.
class LeaksAllowed
{
public:
    LeaksAllowed();
    LeaksAllowed(const LeaksAllowed&) = delete;
    ~LeaksAllowed();
};
