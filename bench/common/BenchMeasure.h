// What the benchmarks measure, taken the same way natively and on Windows
// (under Wine):
//   - wall time from a monotonic clock (std::chrono::steady_clock);
//   - CPU time of the whole process, user and system, all threads, as the
//     system counts it: clock_gettime(CLOCK_PROCESS_CPUTIME_ID) natively,
//     GetProcessTimes on Windows (Wine counts it in ticks of 10 ms).
//     std::clock() is not used: the Windows runtime's clock() is wall time;
//   - the process's memory as the system counts it: VmRSS and its high-water
//     mark VmHWM from /proc/self/status natively (getrusage's ru_maxrss may
//     be the launching process's figure), GetProcessMemoryInfo on Windows
//     (the working set and its peak, and the committed private memory:
//     PrivateUsage, or PagefileUsage where PrivateUsage is 0 as under Wine).
// Figures the system does not give are -1 and are not printed.
#pragma once

#include <string>

namespace qobench {

// Seconds on the monotonic clock since an arbitrary start.
double WallSeconds();
// CPU seconds of this process so far (user + system, every thread).
double CpuSeconds();
// CPU seconds of the child processes that have ended and been waited for
// (natively; -1 on Windows).
double ChildCpuSeconds();

// Wall and CPU time from its start (or the last Restart).
class Stopwatch {
public:
    Stopwatch() { Restart(); }
    void Restart()
    {
        m_wall = WallSeconds();
        m_cpu = CpuSeconds();
    }
    double Wall() const { return WallSeconds() - m_wall; }
    double Cpu() const { return CpuSeconds() - m_cpu; }

private:
    double m_wall = 0;
    double m_cpu = 0;
};

// Memory figures in bytes; -1 where the system does not give one.
struct Memory {
    long long resident = -1;      // VmRSS, WorkingSetSize
    long long peakResident = -1;  // VmHWM, PeakWorkingSetSize
    long long committed = -1;     // Windows: PrivateUsage, or PagefileUsage where that is 0
    long long peakCommitted = -1; // Windows: PeakPagefileUsage (not under Wine: there it is the current figure)
};

Memory ReadMemory();
// The figures as they were when the program started (before main).
Memory const &MemoryAtStart();
// The host's load average ("0.71 0.99 1.52 (1, 5, 15 min; 2 cores)"), read
// from /proc/loadavg, under Wine too; every benchmark prints it when it starts
// and when it ends.
std::string MachineLoad();
// True for a Windows program that runs under Wine.
bool UnderWine();
// Bytes in MiB (2^20).
double MiB(long long bytes);

// The peak memory as one line of text, e.g. "resident 50.3 MiB (VmHWM; 3.1 MiB
// at start)", with the committed memory where the system tells it.
std::string DescribePeakMemory();
// Prints "peak memory after <what>: <DescribePeakMemory()>".
void PrintPeakMemory(char const *what);

// The count in argv[index] (rows, calls), `fallback` when it is not given;
// anything but a whole number from 1 to `max` ends the program with a message.
long CountArgument(int argc, char **argv, int index, long fallback, long max);

} // namespace qobench
