// Writing speed of the output filters: 1,000,000 rows of 10 columns through
// the delimited text, fixed-length text and dBase outputs into a file in the
// temporary folder (the page cache), in MB/s of file written.
//
//   bench_write [rows] [folder]
#include "CQoArray.h"
#include "CQoFile.h"
#include "CQoOutputFilterDbase.h"
#include "CQoOutputFilterTextFix.h"
#include "CQoOutputFilterTextVar.h"
#include "BenchMeasure.h"

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <string>
#include <vector>

namespace {

int const kCols = 10;

// Ten columns of typical values (names, places, amounts, dates), varied by row.
void MakeRow(long row, std::vector<CQoString> &values)
{
    static char const *const names[] = {"M\xFCller", "Schmidt", "Schneider", "Fischer", "Weber", "Meyer"};
    static char const *const places[] = {"M\xFCnchen", "Berlin", "K\xF6ln", "Hamburg", "D\xFCsseldorf"};
    char buffer[32];
    values[0] = names[row % 6];
    values[1] = places[row % 5];
    std::snprintf(buffer, sizeof buffer, "%ld", 10000 + row % 90000);
    values[2] = buffer;
    values[3] = "Hauptstra\xDF" "e";
    std::snprintf(buffer, sizeof buffer, "%ld", row % 200);
    values[4] = buffer;
    std::snprintf(buffer, sizeof buffer, "%ld.%02ld", row % 100000, row % 100);
    values[5] = buffer;
    std::snprintf(buffer, sizeof buffer, "20%02ld%02ld%02ld", row % 25, 1 + row % 12, 1 + row % 28);
    values[6] = buffer;
    values[7] = row % 3 ? "J" : "N";
    std::snprintf(buffer, sizeof buffer, "K%08ld", row);
    values[8] = buffer;
    values[9] = row % 7 ? "Bemerkung; mit Trenner" : "";
}

void Run(char const *label, CQoOutputFilter &out, std::string const &path, long rows, bool binary)
{
    std::vector<std::vector<CQoString>> sample(1000, std::vector<CQoString>(kCols));
    for (long r = 0; r < 1000; ++r)
        MakeRow(r, sample[std::size_t(r)]);
    CQoFile file;
    if (!file.Open(path.c_str(), CQoFile::write | CQoFile::create | (binary ? CQoFile::binary : 0))) {
        std::printf("%s: cannot create %s\n", label, path.c_str());
        return;
    }
    qobench::Stopwatch watch;
    out.UseFile(&file, true);
    out.Init();
    out.WriteHeader();
    for (long r = 0; r < rows; ++r) {
        std::vector<CQoString> const &values = sample[std::size_t(r % 1000)];
        out.InitRow();
        for (int c = 0; c < kCols; ++c)
            out.Value(c, values[std::size_t(c)]);
        out.WriteRow();
    }
    out.ReleaseFile();
    double seconds = watch.Wall();
    double cpu = watch.Cpu();
    double mb = double(std::filesystem::file_size(path)) / 1e6;
    std::printf("%-22s %9ld rows  %8.1f MB  %7.3f s  CPU %7.3f s  %8.1f MB/s  %6.2f Mrows/s\n", label, rows, mb,
                seconds, cpu, mb / seconds, double(rows) / seconds / 1e6);
    std::filesystem::remove(path);
}

} // namespace

int main(int argc, char **argv)
{
    long const rows = qobench::CountArgument(argc, argv, 1, 1000000, 100000000);
    std::string folder = argc > 2 ? argv[2] : std::filesystem::temp_directory_path().string();
    std::printf("bench_write: %ld rows, %d columns, files in %s\n", rows, kCols, folder.c_str());

    CQoOutputFilterTextVar var;
    var.NumCols(kCols);
    var.WriteHeaderFlag(true);
    for (int c = 0; c < kCols; ++c)
        var.ColumnName(c, ("Spalte" + std::to_string(c)).c_str());
    Run("delimited (ansi)", var, folder + "/bench_write.csv", rows, true);
    var.FileCharSet(CQoFile::ascii);
    Run("delimited (DOS 850)", var, folder + "/bench_write.csv", rows, true);

    CQoOutputFilterTextFix fix;
    fix.NumCols(kCols);
    int lengths[kCols] = {20, 20, 5, 30, 4, 10, 8, 1, 9, 25};
    for (int c = 0; c < kCols; ++c)
        fix.SetLength(c, lengths[c]);
    Run("fixed-length", fix, folder + "/bench_write.txt", rows, true);

    CQoOutputFilterDbase dbf;
    CQoArray<CDbaseField> fields;
    fields.Add(CDbaseField("NAME", 'C', 20));
    fields.Add(CDbaseField("ORT", 'C', 20));
    fields.Add(CDbaseField("PLZ", 'C', 5));
    fields.Add(CDbaseField("STRASSE", 'C', 30));
    fields.Add(CDbaseField("HAUSNR", 'N', 4));
    fields.Add(CDbaseField("BETRAG", 'N', 12, 2));
    fields.Add(CDbaseField("DATUM", 'D', 8));
    fields.Add(CDbaseField("AKTIV", 'L', 1));
    fields.Add(CDbaseField("KUNDE", 'C', 9));
    fields.Add(CDbaseField("BEMERKUNG", 'C', 25));
    dbf.SetFieldDescs(&fields);
    Run("dBase (DOS 850)", dbf, folder + "/bench_write.dbf", rows, true);
    dbf.FileCharSet(CQoFile::ansi);
    Run("dBase (ansi)", dbf, folder + "/bench_write.dbf", rows, true);
    qobench::PrintPeakMemory("writing");
    return 0;
}
