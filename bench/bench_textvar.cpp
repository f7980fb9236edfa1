// Reading a large delimited file through CQoInputFilterTextVar, beside `wc -l`
// and Python's csv module reading the same file in the same run (both only
// where they can be started: natively, not under Wine), and AbsoluteRow at
// random rows after the first pass.
//
//   bench_textvar [rows] [file] [probes]   defaults: 1000000 rows, a new file in the
//                                          temp folder, 200000 AbsoluteRow calls
#include "CQoFile.h"
#include "CQoInputFilterTextVar.h"
#include "PeakMemory.h"

#include <chrono>
#include <ctime>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <random>
#include <string>

namespace {
typedef std::chrono::steady_clock Clock;

double Seconds(Clock::time_point since)
{
    return std::chrono::duration<double>(Clock::now() - since).count();
}

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
double TimeCommand(std::string const &command, std::string &output)
{
    Clock::time_point start = Clock::now();
    output.clear();
    if (std::FILE *pipe = popen(command.c_str(), "r")) {
        char chunk[256];
        std::size_t n;
        while ((n = std::fread(chunk, 1, sizeof chunk, pipe)) > 0)
            output.append(chunk, n);
        pclose(pipe);
    }
    while (!output.empty() && (output.back() == '\n' || output.back() == ' '))
        output.pop_back();
    return Seconds(start);
}
#endif
} // namespace

int main(int argc, char **argv)
{
    long rows = argc > 1 ? std::atol(argv[1]) : 1000000;
    std::string path = argc > 2 ? argv[2]
                                : (std::filesystem::temp_directory_path() / "bench_textvar.csv").string();
    if (!CQoFile::Exists(path.c_str()) || argc <= 2)
        MakeFile(path, rows);
    double mb = static_cast<double>(std::filesystem::file_size(path)) / 1e6;
    std::printf("file %s: %ld rows, %.1f MB\n", path.c_str(), rows, mb);

    CQoInputFilterTextVar filter;
    filter.Init(path.c_str());
    // Warm the page cache once, as the targets assume.
    {
        CQoFile warm(path.c_str(), CQoFile::read | CQoFile::binary);
        static char block[1 << 20];
        while (warm.Read(block, sizeof block) > 0) {
        }
    }

    Clock::time_point start = Clock::now();
    std::clock_t cpu = std::clock();
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
    double t = Seconds(start);
    double tc = static_cast<double>(std::clock() - cpu) / CLOCKS_PER_SEC;
    std::printf("CQoInputFilterTextVar: %ld rows x %d fields in %.3f s = %.0f MB/s"
                " (CPU %.3f s = %.0f MB/s; %zu value bytes)\n",
                read, cols, t, mb / t, tc, mb / tc, bytes);

#if !defined(_WIN32)
    std::string out;
    double tw = TimeCommand("wc -l '" + path + "'", out);
    std::printf("wc -l: %.3f s = %.0f MB/s (%s)\n", tw, mb / tw, out.c_str());
    double tp = TimeCommand("/usr/bin/python3 -c \"import csv,sys\n"
                            "n=0\n"
                            "with open(sys.argv[1], encoding='latin-1', newline='') as f:\n"
                            "    for row in csv.reader(f, delimiter=';'):\n"
                            "        n+=1\n"
                            "print(n)\" '" + path + "'",
                            out);
    std::printf("python3 csv: %.3f s = %.0f MB/s (%s rows)\n", tp, mb / tp, out.c_str());
#else
    std::printf("wc -l, python3 csv: not started under Wine (host programs); see the native run\n");
#endif

    long total = filter.NumRows();
    std::mt19937 random(5);
    int const probes = argc > 3 ? std::atoi(argv[3]) : 200000;
    start = Clock::now();
    cpu = std::clock();
    long hits = 0;
    for (int k = 0; k < probes; ++k) {
        if (filter.AbsoluteRow(static_cast<long>(random() % total)))
            ++hits;
        filter.Value(cols - 1, value);
    }
    double ta = Seconds(start);
    double tac = static_cast<double>(std::clock() - cpu) / CLOCKS_PER_SEC;
    std::printf("AbsoluteRow at random rows: %.2f us per call (CPU %.2f us; %ld of %d found),"
                " index %.2f bytes per row\n",
                ta * 1e6 / probes, tac * 1e6 / probes, hits, probes,
                static_cast<double>(filter.IndexBytes()) / static_cast<double>(total));
    // The file is far larger: the reader keeps the current record and the index.
    PrintPeakMemory("reading the whole file and jumping");
    return 0;
}
