// Writing a large delimited file into a table through CQoOutputFilterODBC and
// reading the table back through CQoInputFilterODBC, for SQLite and (when
// QO_PG_CONNECT names a server) PostgreSQL, and the same through the file
// database filters (CQoOutputFilterDao, CQoInputFilterDao) into an
// Access-type database. bench/odbc/run.sh runs it beside sqlite3's .import
// and psql's \copy of the same file. CPU time is this process's: the SQLite
// driver runs in it, the PostgreSQL server does not.
//
//   bench_odbc <delimited file> <folder for the SQLite file>
#include <CQoException.h>
#include <CQoInputFilterDao.h>
#include <CQoInputFilterODBC.h>
#include <CQoOutputFilterDao.h>
#include <CQoInputFilterTextVar.h>
#include <CQoOutputFilterODBC.h>

#include <windows.h>

#include "BenchMeasure.h"

#include <cstdio>
#include <cstdlib>
#include <string>

namespace {
using qobench::Stopwatch;

double WorkingSetMiB()
{
    return qobench::MiB(qobench::ReadMemory().resident);
}

// Copies the delimited file into table "bench" of `out` (text columns of 60),
// opened by `open`, closed by `close`; prints the time from the open on.
template <class Output, class Open, class Close>
void Write(const char* what, Output& out, const char* file, Open open, Close close)
{
    CQoInputFilterTextVar in;
    in.Delimiter(';');
    in.SetFirstRowHasNames(true);
    in.Init(file);
    int const cols = in.NumCols();
    out.SetTableName("bench");
    out.NumCols(cols);
    for (int c = 0; c < cols; ++c) {
        CQoString name;
        in.ColName(c, name);
        out.ColumnName(c, name);
        out.SetLength(c, 60);
    }
    Stopwatch watch;
    open();
    out.Init();
    long rows = 0;
    CQoString value;
    for (bool ok = in.FirstRow(); ok; ok = in.NextRow()) {
        out.InitRow();
        for (int c = 0; c < cols; ++c) {
            in.Value(c, value);
            out.Value(c, value);
        }
        out.WriteRow();
        ++rows;
    }
    close();
    double t = watch.Wall();
    std::printf("%s wrote %ld rows x %d columns in %.2f s = %.0f rows/s (CPU %.2f s)\n", what, rows, cols, t,
                rows / t, watch.Cpu());
}

// Reads every value of the table `in` stands on; prints the rate and the
// working set, which must not grow with the rows.
void ReadAll(const char* what, CQoInputFilter& in)
{
    double before = WorkingSetMiB();
    Stopwatch watch;
    long rows = 0;
    std::size_t bytes = 0;
    double at100k = 0;
    CQoString value;
    for (bool ok = in.FirstRow(); ok; ok = in.NextRow()) {
        for (int c = 0; c < in.NumCols(); ++c) {
            in.Value(c, value);
            bytes += static_cast<std::size_t>(value.GetLength());
        }
        if (++rows == 100000)
            at100k = WorkingSetMiB();
    }
    double t = watch.Wall();
    double cpu = watch.Cpu();
    char after100k[64] = "no 100,000th row";
    if (rows >= 100000)
        std::snprintf(after100k, sizeof after100k, "%.1f MiB after 100,000 rows", at100k);
    std::printf("%s read %ld rows in %.2f s = %.0f rows/s (CPU %.2f s; %zu value bytes); working set "
                "%.1f MiB before, %s, %.1f MiB at the end\n",
                what, rows, t, rows / t, cpu, bytes, before, after100k, WorkingSetMiB());
}

void Odbc(const char* what, const std::string& connect, const char* file)
{
    std::string label = std::string(what) + ": CQoOutputFilterODBC";
    CQoOutputFilterODBC out;
    Write(label.c_str(), out, file, [&] { out.UseDB(connect.c_str()); }, [&] { out.ReleaseDB(); });
    CQoInputFilterODBC in(connect.c_str());
    in.Init("");
    in.InitTable("bench", CQoInputFilterDB::tableTable, false);
    label = std::string(what) + ": CQoInputFilterODBC";
    ReadAll(label.c_str(), in);
}

void Dao(const std::string& database, const char* file)
{
    CQoOutputFilterDao out;
    Write("Access-type: CQoOutputFilterDao", out, file, [&] { out.UseDB(database.c_str()); },
          [&] { out.ReleaseFile(); });
    CQoInputFilterDao in(CQoFile::typeAccess);
    in.SetTableName("bench");
    in.SetTableType(CQoInputFilterDB::tableTable);
    in.Init(database.c_str());
    ReadAll("Access-type: CQoInputFilterDao", in);
}
} // namespace

int main(int argc, char** argv)
{
    if (argc < 3) {
        std::fprintf(stderr, "bench_odbc <delimited file> <folder for the SQLite file>\n");
        return 2;
    }
    try {
        std::string db = std::string(argv[2]) + "\\bench_odbc.db";
        DeleteFileA(db.c_str());
        std::string sqlite = "Driver=SQLite3;Database=" + db;
        const char* only = std::getenv("QO_BENCH_ONLY");   // "sqlite", "dao" or "postgres", for profiling one
        if (!only || std::string(only) == "sqlite") {
            Odbc("SQLite", sqlite, argv[1]);
        }
        if (!only || std::string(only) == "dao") {
            std::string mdb = std::string(argv[2]) + "\\bench_dao.mdb";
            DeleteFileA(mdb.c_str());
            Dao(mdb, argv[1]);
        }
        if (!only || std::string(only) == "postgres") {
            if (const char* pg = std::getenv("QO_PG_CONNECT")) {
                Odbc("PostgreSQL", pg, argv[1]);
            } else {
                std::printf("PostgreSQL: QO_PG_CONNECT is not set\n");
            }
        }
        qobench::PrintPeakMemory("writing and reading the tables");
    } catch (const CQoException& e) {
        std::fprintf(stderr, "bench_odbc: %s\n", e.Message());
        return 1;
    }
    return 0;
}
