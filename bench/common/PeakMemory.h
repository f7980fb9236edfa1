// The process's peak resident memory, for benchmarks that claim a reader
// holds only its current record and its row index. Natively only; under Wine
// the figure would be Wine's own.
#pragma once

#if !defined(_WIN32)
#include <sys/resource.h>
#endif

#include <cstdio>

inline void PrintPeakMemory(char const *what)
{
#if !defined(_WIN32)
    struct rusage usage;
    if (getrusage(RUSAGE_SELF, &usage) == 0)
        std::printf("peak resident memory after %s: %.1f MB\n", what, usage.ru_maxrss / 1024.0);
#else
    (void)what;
#endif
}
