#include "BenchMeasure.h"

#include <chrono>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>

#if defined(_WIN32)
#include <windows.h>
#include <psapi.h>
#else
#include <sys/resource.h>
#include <unistd.h>
#include <time.h>
#endif

namespace qobench {

namespace {
// Taken before main, so that the figures of the runtime and (under Wine) of
// the loader can be told apart from the benchmark's own.
Memory const g_atStart = ReadMemory();

#if defined(_WIN32)
double FileTimeSeconds(FILETIME const &time)
{
    ULARGE_INTEGER value;
    value.LowPart = time.dwLowDateTime;
    value.HighPart = time.dwHighDateTime;
    return static_cast<double>(value.QuadPart) / 1e7; // 100 ns units
}
#else
// One "Name:   1234 kB" line of /proc/self/status in bytes, or -1.
long long StatusBytes(char const *text, char const *name)
{
    char const *at = std::strstr(text, name);
    if (at == nullptr)
        return -1;
    long long kb = -1;
    if (std::sscanf(at + std::strlen(name), " %lld kB", &kb) != 1 || kb < 0 || kb > (1LL << 40))
        return -1;
    return kb * 1024;
}
#endif
} // namespace

double WallSeconds()
{
    return std::chrono::duration<double>(std::chrono::steady_clock::now().time_since_epoch()).count();
}

double CpuSeconds()
{
#if defined(_WIN32)
    FILETIME created, exited, kernel, user;
    if (!GetProcessTimes(GetCurrentProcess(), &created, &exited, &kernel, &user))
        return -1;
    return FileTimeSeconds(kernel) + FileTimeSeconds(user);
#else
    timespec now;
    if (clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &now) != 0)
        return -1;
    return static_cast<double>(now.tv_sec) + static_cast<double>(now.tv_nsec) / 1e9;
#endif
}

double ChildCpuSeconds()
{
#if defined(_WIN32)
    return -1;
#else
    rusage usage;
    if (getrusage(RUSAGE_CHILDREN, &usage) != 0)
        return -1;
    return static_cast<double>(usage.ru_utime.tv_sec + usage.ru_stime.tv_sec) +
           static_cast<double>(usage.ru_utime.tv_usec + usage.ru_stime.tv_usec) / 1e6;
#endif
}

Memory ReadMemory()
{
    Memory memory;
#if defined(_WIN32)
    PROCESS_MEMORY_COUNTERS_EX counters;
    std::memset(&counters, 0, sizeof counters);
    counters.cb = sizeof counters;
    if (GetProcessMemoryInfo(GetCurrentProcess(), reinterpret_cast<PROCESS_MEMORY_COUNTERS *>(&counters),
                             sizeof counters)) {
        memory.resident = static_cast<long long>(counters.WorkingSetSize);
        memory.peakResident = static_cast<long long>(counters.PeakWorkingSetSize);
        memory.committed = static_cast<long long>(counters.PrivateUsage != 0 ? counters.PrivateUsage
                                                                             : counters.PagefileUsage);
        // Wine gives the current page-file usage as its peak.
        if (!UnderWine())
            memory.peakCommitted = static_cast<long long>(counters.PeakPagefileUsage);
    }
#else
    if (std::FILE *status = std::fopen("/proc/self/status", "r")) {
        char text[8192];
        std::size_t length = std::fread(text, 1, sizeof text - 1, status);
        std::fclose(status);
        text[length] = '\0';
        memory.resident = StatusBytes(text, "VmRSS:");
        memory.peakResident = StatusBytes(text, "VmHWM:");
    }
#endif
    return memory;
}

Memory const &MemoryAtStart()
{
    return g_atStart;
}

namespace {
unsigned CoreCount()
{
#if defined(_WIN32)
    SYSTEM_INFO info;
    GetSystemInfo(&info);
    return info.dwNumberOfProcessors;
#else
    long n = sysconf(_SC_NPROCESSORS_ONLN);
    return n > 0 ? static_cast<unsigned>(n) : 0u;
#endif
}
}

std::string MachineLoad()
{
    // The host's load average, also for a Windows program under Wine, whose
    // drive Z: is the host's root: figures of a loaded machine are not
    // figures of the code.
    char const *path = "/proc/loadavg";
#if defined(_WIN32)
    if (!UnderWine())
        return "not known on Windows";
    path = "Z:\\proc\\loadavg";
#endif
    std::FILE *file = std::fopen(path, "r");
    if (file == nullptr)
        return "not known";
    double one = 0, five = 0, fifteen = 0;
    int n = std::fscanf(file, "%lf %lf %lf", &one, &five, &fifteen);
    std::fclose(file);
    if (n != 3)
        return "not known";
    char text[96];
    std::snprintf(text, sizeof text, "%.2f %.2f %.2f (1, 5, 15 min; %u cores)", one, five, fifteen,
                  CoreCount());
    return text;
}

namespace {
// Every benchmark says how loaded the machine was, before and after it ran.
struct LoadReport {
    LoadReport() { std::printf("machine load at start: %s\n", MachineLoad().c_str()); }
    ~LoadReport() { std::printf("machine load at end: %s\n", MachineLoad().c_str()); }
} const g_loadReport;
}

bool UnderWine()
{
#if defined(_WIN32)
    static bool const wine = [] {
        HMODULE ntdll = GetModuleHandleA("ntdll.dll");
        return ntdll != NULL && GetProcAddress(ntdll, "wine_get_version") != NULL;
    }();
    return wine;
#else
    return false;
#endif
}

double MiB(long long bytes)
{
    return static_cast<double>(bytes) / 1048576.0;
}

std::string DescribePeakMemory()
{
    Memory const now = ReadMemory();
    char text[256];
    int length = 0;
#if defined(_WIN32)
    char const *residentSource = "PeakWorkingSetSize";
#else
    char const *residentSource = "VmHWM";
#endif
    if (now.peakResident >= 0)
        length = std::snprintf(text, sizeof text, "resident %.1f MiB (%s; %.1f MiB at start)", MiB(now.peakResident),
                               residentSource, MiB(g_atStart.resident));
    else
        length = std::snprintf(text, sizeof text, "resident: not reported");
    if (length < 0 || length >= static_cast<int>(sizeof text))
        length = 0;
    if (now.peakCommitted >= 0)
        std::snprintf(text + length, sizeof text - std::size_t(length), ", committed %.1f MiB (PeakPagefileUsage)",
                      MiB(now.peakCommitted));
    else if (now.committed >= 0)
        std::snprintf(text + length, sizeof text - std::size_t(length),
                      ", committed %.1f MiB now (PagefileUsage; Wine keeps no peak of it)", MiB(now.committed));
    return text;
}

void PrintPeakMemory(char const *what)
{
    std::printf("peak memory after %s: %s\n", what, DescribePeakMemory().c_str());
}

long CountArgument(int argc, char **argv, int index, long fallback, long max)
{
    if (index >= argc)
        return fallback;
    char const *text = argv[index];
    char *end = nullptr;
    errno = 0;
    long long value = std::strtoll(text, &end, 10);
    if (end == text || *end != '\0' || errno != 0 || value < 1 || value > max) {
        std::fprintf(stderr, "%s: argument %d must be a count from 1 to %ld, not \"%s\"\n", argv[0], index, max, text);
        std::exit(2);
    }
    return static_cast<long>(value);
}

} // namespace qobench
