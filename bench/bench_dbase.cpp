// Reading speed of the dBase input: a 1,000,000-record file (written by the
// dBase output) read through FirstRow/NextRow/Value of every field, then
// AbsoluteRow at random rows; once without and once with deleted records
// (every tenth), where the index of deleted records is built by the count.
//
//   bench_dbase [records] [folder]
#include "CQoArray.h"
#include "CQoFile.h"
#include "CQoInputFilterDbase34.h"
#include "CQoOutputFilterDbase.h"
#include "BenchMeasure.h"

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <random>
#include <string>
#include <vector>

namespace {
using qobench::Stopwatch;

void WriteFile(std::string const &path, long records)
{
    CQoOutputFilterDbase out;
    CQoArray<CDbaseField> fields;
    fields.Add(CDbaseField("NAME", 'C', 20));
    fields.Add(CDbaseField("ORT", 'C', 20));
    fields.Add(CDbaseField("PLZ", 'C', 5));
    fields.Add(CDbaseField("STRASSE", 'C', 24));
    fields.Add(CDbaseField("NR", 'N', 4));
    fields.Add(CDbaseField("BETRAG", 'N', 10, 2));
    fields.Add(CDbaseField("DATUM", 'D', 8));
    fields.Add(CDbaseField("AKTIV", 'L', 1));
    fields.Add(CDbaseField("KUNDE", 'C', 9));
    fields.Add(CDbaseField("INFO", 'C', 8));
    out.SetFieldDescs(&fields);
    out.UseFile(path.c_str());
    out.Init();
    char buffer[32];
    for (long r = 0; r < records; ++r) {
        out.InitRow();
        out.Value(0, r % 2 ? "M\xFCller" : "Schmidt");
        out.Value(1, r % 3 ? "K\xF6ln" : "Berlin");
        std::snprintf(buffer, sizeof buffer, "%05ld", r % 100000);
        out.Value(2, buffer);
        out.Value(3, "Hauptstra\xDF" "e");
        std::snprintf(buffer, sizeof buffer, "%ld", r % 999);
        out.Value(4, buffer);
        std::snprintf(buffer, sizeof buffer, "%ld.%02ld", r % 100000, r % 100);
        out.Value(5, buffer);
        out.Value(6, "20240131");
        out.Value(7, "T");
        std::snprintf(buffer, sizeof buffer, "K%08ld", r);
        out.Value(8, buffer);
        out.Value(9, "x");
        out.WriteRow();
    }
    out.ReleaseFile();
}

// Marks every tenth record deleted, in place.
void DeleteEveryTenth(std::string const &path, long records)
{
    std::FILE *fp = std::fopen(path.c_str(), "r+b");
    unsigned char head[12];
    if (!fp || std::fread(head, 1, 12, fp) != 12)
        std::exit(1);
    long long header = head[8] | head[9] << 8, length = head[10] | head[11] << 8;
    for (long r = 0; r < records; r += 10) {
        // Offsets in 64 bits: long is 32 bits on Windows.
        long long offset = header + r * length;
#if defined(_WIN32)
        _fseeki64(fp, offset, SEEK_SET);
#else
        fseeko(fp, static_cast<off_t>(offset), SEEK_SET);
#endif
        std::fputc('*', fp);
    }
    std::fclose(fp);
}

void Measure(char const *label, std::string const &path)
{
    double mb = double(std::filesystem::file_size(path)) / 1e6;
    CQoInputFilterDbase34 dbf;
    Stopwatch watch;
    dbf.Init(path.c_str());
    long rows = 0;
    std::size_t bytes = 0;
    CQoString value;
    for (bool ok = dbf.FirstRow(); ok; ok = dbf.NextRow()) {
        for (int c = 0; c < dbf.NumCols(); ++c) {
            dbf.Value(c, value);
            bytes += std::size_t(value.GetLength());
        }
        ++rows;
    }
    double seconds = watch.Wall();
    std::printf("%-20s read   %8ld rows %7.1f MB %7.3f s %8.1f MB/s (CPU %.3f s; %zu value bytes)\n", label, rows, mb,
                seconds, mb / seconds, watch.Cpu(), bytes);

    // The count keeps the numbers of the deleted records: what it adds to
    // the resident memory is measured, not assumed.
    long long residentBefore = qobench::ReadMemory().resident;
    watch.Restart();
    long count = dbf.NumRows();
    double countSeconds = watch.Wall();
    double countCpu = watch.Cpu();
    long long residentAfter = qobench::ReadMemory().resident;
    long long deleted = dbf.DeclaredRecords() - count;
    std::printf("%-20s count  %8ld rows in %.3f s (CPU %.3f s); %lld deleted records,"
                " resident memory %+.1f KiB across the count\n",
                label, count, countSeconds, countCpu, deleted, double(residentAfter - residentBefore) / 1024.0);
    if (count <= 0)
        return;

    std::mt19937 random(5);
    int const calls = 200000;
    std::vector<long> targets(calls);
    for (long &t : targets)
        t = long(random() % std::uint32_t(count));
    watch.Restart();
    long found = 0;
    for (long t : targets) {
        found += dbf.AbsoluteRow(t) ? 1 : 0;
        dbf.Value(0, value);
    }
    seconds = watch.Wall();
    std::printf("%-20s random %8d AbsoluteRow+Value in %.3f s = %.2f us per call (CPU %.3f s; %ld found)\n", label,
                calls, seconds, seconds / calls * 1e6, watch.Cpu(), found);
}

} // namespace

int main(int argc, char **argv)
{
    // The dBase header counts records in 32 bits; files beyond 100 million
    // records are not what this measures.
    long const records = qobench::CountArgument(argc, argv, 1, 1000000, 100000000);
    std::string folder = argc > 2 ? argv[2] : std::filesystem::temp_directory_path().string();
    std::string path = folder + "/bench_dbase.dbf";
    std::printf("bench_dbase: %ld records, file %s\n", records, path.c_str());
    Stopwatch watch;
    WriteFile(path, records);
    std::printf("written in %.3f s (CPU %.3f s; %.1f MB)\n", watch.Wall(), watch.Cpu(),
                double(std::filesystem::file_size(path)) / 1e6);
    Measure("no deleted", path);
    DeleteEveryTenth(path, records);
    Measure("every 10th deleted", path);
    qobench::PrintPeakMemory("writing and reading the whole file twice");
    std::filesystem::remove(path);
    return 0;
}
