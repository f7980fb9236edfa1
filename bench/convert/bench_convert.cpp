// The whole conversion of the sample program under Wine: the module
// qoconvert_run.dll converts a project in batch mode (delimited input filter,
// output source, delimited output filter, Windows-1252 to code page 850) as
// qoconvert.exe /batch runs it. Prints the input's size, the wall and CPU
// time (of the whole process: the module's threads run in it), MB/s and the
// process's peak memory (bench/convert/run.sh runs it).
//
//     bench_convert.exe <module> <project folder>
#include <windows.h>

#include "BenchMeasure.h"

#include <cstdio>

int main(int argc, char** argv)
{
    if (argc != 3) {
        std::fprintf(stderr, "usage: bench_convert <qoconvert_run.dll> <project folder>\n");
        return 2;
    }
    HMODULE module = LoadLibraryA(argv[1]);
    typedef int (*Entry)(int, char**);
    Entry entry = module != NULL ? (Entry)GetProcAddress(module, "QoMain") : NULL;
    if (entry == NULL) {
        std::fprintf(stderr, "cannot load %s\n", argv[1]);
        return 2;
    }
    char input[MAX_PATH];
    std::snprintf(input, sizeof input, "%s\\kunden-gross.txt", argv[2]);
    WIN32_FILE_ATTRIBUTE_DATA data;
    if (!GetFileAttributesExA(input, GetFileExInfoStandard, &data)) {
        std::fprintf(stderr, "no input %s\n", input);
        return 2;
    }
    double mb = (double)(((long long)data.nFileSizeHigh << 32) | data.nFileSizeLow) / 1e6;

    char batch[] = "/batch";
    char* args[] = {argv[1], argv[2], batch};
    qobench::Stopwatch watch;
    int result = entry(3, args);
    double seconds = watch.Wall(), cpu = watch.Cpu();

    std::printf("qoconvert module (%s): %.1f MB in %.2f s = %.1f MB/s (CPU %.2f s), result %d, peak memory %s\n",
                qobench::UnderWine() ? "Wine" : "Windows", mb, seconds, mb / seconds, cpu, result,
                qobench::DescribePeakMemory().c_str());
    FreeLibrary(module);
    return result == 0 ? 0 : 1;
}
