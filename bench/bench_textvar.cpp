// Reading a large delimited file through CQoInputFilterTextVar, beside `wc -l`
// and Python's csv module reading the same file in the same run (both only
// where they can be started: natively, not under Wine), and AbsoluteRow at
// random rows after the first pass.
//
//   bench_textvar [rows] [file] [probes]   defaults: 1000000 rows, a new file in the
//                                          temp folder, 200000 AbsoluteRow calls;
//                                          a named file that exists is read as found
#include "CQoFile.h"
#include "CQoInputFilterTextVar.h"
#include "BenchMeasure.h"

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <random>
#include <string>

namespace {
using qobench::Stopwatch;

// 10 columns: a number, an enclosed name holding the delimiter, and eight
// short fields; about 80 bytes per row.
void MakeFile(std::string const &path, long rows)
{
    CQoFile file(path.c_str(), CQoFile::create | CQoFile::binary);
    std::mt19937 random(1);
    std::string line;
    char const letters[] = "abcdefghijklmnopqrstuvwxyz\xE4\xF6\xFC";
    for (long r = 0; r < rows; ++r) {
        line = std::to_string(r) + ";\"Name; " + std::to_string(r % 9973) + "\"";
        for (int c = 0; c < 8; ++c) {
            line += ';';
            int length = 3 + static_cast<int>(random() % 6);
            for (int k = 0; k < length; ++k)
                line += letters[random() % (sizeof letters - 1)];
        }
        line += "\r\n";
        file.Write(line.data(), line.size());
    }
    file.Close();
}

#if !defined(_WIN32)
// Runs a host program through the shell and prints its wall time (from the
// start of the shell to its end) and the CPU time of the shell and the
// program, with the program's output.
void TimeCommand(char const *label, std::string const &command, double mb)
{
    std::string output;
    double childCpu = qobench::ChildCpuSeconds();
    Stopwatch watch;
    if (std::FILE *pipe = popen(command.c_str(), "r")) {
        char chunk[256];
        std::size_t n;
        while ((n = std::fread(chunk, 1, sizeof chunk, pipe)) > 0)
            output.append(chunk, n);
        pclose(pipe);
    }
    double wall = watch.Wall();
    childCpu = qobench::ChildCpuSeconds() - childCpu;
    while (!output.empty() && (output.back() == '\n' || output.back() == ' '))
        output.pop_back();
    std::printf("%s: %.3f s = %.0f MB/s (CPU %.3f s; %s)\n", label, wall, mb / wall, childCpu, output.c_str());
}
#endif
} // namespace

int main(int argc, char **argv)
{
    long const rows = qobench::CountArgument(argc, argv, 1, 1000000, 100000000);
    long const probes = qobench::CountArgument(argc, argv, 3, 200000, 100000000);
    std::string path = argc > 2 ? argv[2]
                                : (std::filesystem::temp_directory_path() / "bench_textvar.csv").string();
    // A named file that exists is read as it is: the rows are the ones counted.
    bool const made = !CQoFile::Exists(path.c_str()) || argc <= 2;
    if (made)
        MakeFile(path, rows);
    auto const size = std::filesystem::file_size(path);
    double mb = static_cast<double>(size) / 1e6;
    if (made)
        std::printf("file %s: %.1f MB (%llu bytes), made with %ld rows\n", path.c_str(), mb,
                    static_cast<unsigned long long>(size), rows);
    else
        std::printf("file %s: %.1f MB (%llu bytes), as found\n", path.c_str(), mb,
                    static_cast<unsigned long long>(size));

    CQoInputFilterTextVar filter;
    filter.Init(path.c_str());
    // Warm the page cache once, as the targets assume.
    {
        CQoFile warm(path.c_str(), CQoFile::read | CQoFile::binary);
        static char block[1 << 20];
        while (warm.Read(block, sizeof block) > 0) {
        }
    }

    Stopwatch watch;
    long read = 0;
    std::size_t bytes = 0;
    CQoString value;
    int cols = filter.NumCols();
    for (bool ok = filter.FirstRow(); ok; ok = filter.NextRow()) {
        for (int c = 0; c < cols; ++c) {
            filter.Value(c, value);
            bytes += static_cast<std::size_t>(value.GetLength());
        }
        ++read;
    }
    double t = watch.Wall();
    double tc = watch.Cpu();
    std::printf("CQoInputFilterTextVar: %ld rows x %d fields in %.3f s = %.0f MB/s"
                " (CPU %.3f s; %zu value bytes)\n",
                read, cols, t, mb / t, tc, bytes);

    // The same pass without taking the values: what the parsing alone costs.
    watch.Restart();
    long parsed = 0;
    for (bool ok = filter.FirstRow(); ok; ok = filter.NextRow())
        ++parsed;
    t = watch.Wall();
    std::printf("rows without their values: %ld rows in %.3f s = %.0f MB/s\n", parsed, t, mb / t);

#if !defined(_WIN32)
    TimeCommand("wc -l", "wc -l '" + path + "'", mb);
    TimeCommand("python3 csv", "/usr/bin/python3 -c \"import csv,sys\n"
                            "n=0\n"
                            "with open(sys.argv[1], encoding='latin-1', newline='') as f:\n"
                            "    for row in csv.reader(f, delimiter=';'):\n"
                            "        n+=1\n"
                            "print(n, 'rows')\" '" + path + "'",
                mb);
#else
    std::printf("wc -l, python3 csv: not started under Wine (host programs); see the native run\n");
#endif

    long total = filter.NumRows();
    if (total <= 0) {
        std::printf("AbsoluteRow: the file has no rows to jump to\n");
        return 1;
    }
    std::mt19937 random(5);
    watch.Restart();
    long hits = 0;
    for (long k = 0; k < probes; ++k) {
        if (filter.AbsoluteRow(static_cast<long>(random() % total)))
            ++hits;
        filter.Value(cols - 1, value);
    }
    double ta = watch.Wall();
    double tac = watch.Cpu();
    std::printf("AbsoluteRow at random rows: %ld calls in %.3f s = %.2f us per call (CPU %.3f s; %ld found),"
                " index %zu bytes for %ld rows\n",
                probes, ta, ta * 1e6 / probes, tac, hits, filter.IndexBytes(), total);
    // The file is far larger: the reader keeps the current record and the index.
    qobench::PrintPeakMemory("reading the whole file and jumping");
    return 0;
}
