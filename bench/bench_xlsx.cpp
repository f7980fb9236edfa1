// Reading speed of the workbook reader: a 100,000-row x 10-column workbook
// (text, shared and repeated text, numbers, dates, booleans) read row by
// row with every cell touched, beside python3-openpyxl reading the same file
// in read-only mode. The workbook is written by python3-xlsxwriter when it
// is missing (natively, with `rows` rows; under Wine, run the native
// benchmark first or pass a file).
//
//   bench_xlsx [file.xlsx] [rows]      default rows 100000
// Build without sanitizers for figures (-DQO_SANITIZE=OFF), or run
// bench/run-native-and-wine.sh.
#include "CQoException.h"
#include "CQoXlsxReader.h"
#include "BenchMeasure.h"

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <string>
#include <vector>

namespace {
using qobench::Stopwatch;

#ifdef _WIN32
char const defaultPath[] = "Z:\\tmp\\qo_bench_xlsx.xlsx";
#else
char const defaultPath[] = "/tmp/qo_bench_xlsx.xlsx";

char const writer[] = R"(import sys, datetime, xlsxwriter
wb = xlsxwriter.Workbook(sys.argv[1], {'constant_memory': True})
ws = wb.add_worksheet('Tabelle1')
datefmt = wb.add_format({'num_format': 'dd.mm.yyyy'})
ws.write_row(0, 0, ['Name', 'Ort', 'PLZ', 'Strasse', 'Nr', 'Betrag', 'Datum', 'Aktiv', 'Kunde', 'Bemerkung'])
orte = ['M\u00fcnchen', 'K\u00f6ln', 'D\u00fcsseldorf', 'Berlin', 'Hamburg']
start = datetime.date(2000, 1, 1)
for r in range(1, int(sys.argv[2]) + 1):
    ws.write_string(r, 0, 'Kunde %d M\u00fcller' % r)
    ws.write_string(r, 1, orte[r % 5])
    ws.write_string(r, 2, '%05d' % (r % 99999))
    ws.write_string(r, 3, 'Hauptstra\u00dfe')
    ws.write_number(r, 4, r % 200)
    ws.write_number(r, 5, r * 1.25)
    ws.write_datetime(r, 6, start + datetime.timedelta(days=r % 9000), datefmt)
    ws.write_boolean(r, 7, r % 2 == 0)
    ws.write_number(r, 8, 100000 + r)
    ws.write_string(r, 9, 'Bemerkung zu Zeile %d' % r)
wb.close()
)";

char const reader[] = R"(import sys, time, openpyxl
t = time.perf_counter()
wb = openpyxl.load_workbook(sys.argv[1], read_only=True)
rows = 0
for row in wb.worksheets[0].iter_rows(values_only=True):
    rows += 1
print('openpyxl (read-only): %d rows in %.2f s' % (rows, time.perf_counter() - t))
)";

int RunPython(char const *script, std::string const &args)
{
    std::string path = std::filesystem::temp_directory_path() / "qo_bench_xlsx.py";
    std::ofstream(path) << script;
    std::fflush(stdout);
    return std::system(("/usr/bin/python3 " + path + " " + args).c_str());
}
#endif

} // namespace

int main(int argc, char **argv)
{
    std::string path = argc > 1 ? argv[1] : defaultPath;
    long const rows = qobench::CountArgument(argc, argv, 2, 100000, 10000000);
    if (!std::filesystem::exists(path)) {
#ifdef _WIN32
        (void)rows;
        std::printf("%s is missing: run the native bench_xlsx first, or pass a workbook\n", path.c_str());
        return 1;
#else
        Stopwatch watch;
        if (RunPython(writer, path + " " + std::to_string(rows)) != 0) {
            std::printf("python3-xlsxwriter could not write %s\n", path.c_str());
            return 1;
        }
        std::printf("wrote %s (%ld rows x 10 columns) with xlsxwriter in %.2f s\n", path.c_str(), rows, watch.Wall());
#endif
    }
    std::printf("workbook: %s, %.1f MB\n", path.c_str(), double(std::filesystem::file_size(path)) / 1e6);

    try {
        for (int round = 0; round < 3; ++round) {
            Stopwatch watch;
            CQoXlsxReader xlsx;
            xlsx.Open(path.c_str());
            xlsx.OpenSheet(0);
            double opened = watch.Wall();
            std::vector<CQoXlsxReader::Cell> row;
            long count = 0;
            double sum = 0;
            std::size_t textBytes = 0;
            while (xlsx.NextRow(row)) {
                ++count;
                for (CQoXlsxReader::Cell const &cell : row) {
                    sum += cell.number;
                    textBytes += std::size_t(cell.text.GetLength());
                }
            }
            double seconds = watch.Wall();
            std::printf("CQoXlsxReader: %ld rows x %d columns in %.2f s (CPU %.2f s; open and range pass %.2f s;"
                        " check %.0f/%zu)\n",
                        count, xlsx.ColumnCount(), seconds, watch.Cpu(), opened, sum, textBytes);
        }
    } catch (CQoException const &e) {
        std::printf("error: %s\n", e.Message());
        return 1;
    }
    qobench::PrintPeakMemory("reading");
#ifndef _WIN32
    for (int round = 0; round < 2; ++round) {
        Stopwatch watch;
        double childCpu = qobench::ChildCpuSeconds();
        if (RunPython(reader, path) != 0)
            std::printf("python3-openpyxl did not run\n");
        std::printf("  (process %.2f s, CPU %.2f s)\n", watch.Wall(), qobench::ChildCpuSeconds() - childCpu);
    }
#endif
    return 0;
}
