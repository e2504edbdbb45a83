#pragma once

#include <csignal>
#include <sys/resource.h>

/// A limit on the size of files that the process writes, standing in for a full disk.
class SizeLimit
{
public:
    explicit SizeLimit(rlim_t bytes)
    {
        getrlimit(RLIMIT_FSIZE, &former);
        rlimit limited = {bytes, former.rlim_max};
        setrlimit(RLIMIT_FSIZE, &limited);
        formerHandler = std::signal(SIGXFSZ, SIG_IGN);
    }
    ~SizeLimit()
    {
        setrlimit(RLIMIT_FSIZE, &former);
        std::signal(SIGXFSZ, formerHandler);
    }

private:
    rlimit former = {};
    void (*formerHandler)(int) = nullptr;
};
