// Appending through the DAO engine: N rows of ten fields (a number, eight
// texts, a double) into a new Access-type database with AddNew/SetFieldValue/
// Update, as an import does. Prints the wall and CPU seconds (the CPU time
// of the whole process: the engine and the SQLite driver run in it);
// bench/dao/run.sh puts them beside sqlite3 .import of the same rows.
//   bench_dao.exe <database file> <rows> [<csv file to write the same rows to>]
#include "afxdao.h"
#include "afxdb.h"

#include "BenchMeasure.h"

#include <stdio.h>
#include <stdlib.h>

namespace {

CString Value(long lRow, int nField) {
  CString str;
  if (nField == 0) str.Format("%ld", lRow);
  else if (nField == 9) str.Format("%ld.%02ld", lRow % 100000, lRow % 100);
  else str.Format("Wert %ld/%d Straße", lRow, nField);
  return str;
}

// The ODBC layer's own bulk append of the same rows: the floor under the engine.
class CTenSet : public CRecordset {
public:
  explicit CTenSet(CDatabase* pdb) : CRecordset(pdb) {}
  void DoFieldExchange(CFieldExchange* pFX) override {
    pFX->SetFieldType(CFieldExchange::outputColumn);
    static const char* names[] = {"F0", "F1", "F2", "F3", "F4", "F5", "F6", "F7", "F8", "F9"};
    for (int i = 0; i < 10; ++i) RFX_Text(pFX, names[i], m_values[i], 40);
  }
  CString m_values[10];
};

} // namespace

int main(int argc, char** argv) {
  if (argc < 3) {
    fprintf(stderr, "usage: bench_dao <database file> <rows> [<csv file>]\n");
    return 2;
  }
  long lRows = qobench::CountArgument(argc, argv, 2, 0, 100000000);
  DeleteFileA(argv[1]);
  if (argc > 3) {
    // The same rows as CSV (Windows-1252 turned UTF-8 as sqlite3 stores it).
    FILE* pCsv = fopen(argv[3], "wb");
    for (long i = 0; i < lRows; ++i) {
      for (int f = 0; f < 10; ++f) {
        CString str = Value(i, f);
        str.Replace("ß", "\xC3\x9F");
        fprintf(pCsv, "%s%s", f > 0 ? "," : "", (LPCSTR)str);
      }
      fputc('\n', pCsv);
    }
    fclose(pCsv);
  }
  try {
    CDaoDatabase db;
    db.Create(argv[1]);
    CDaoTableDef td(&db);
    td.Create("T");
    td.CreateField("F0", dbLong, 4);
    for (int f = 1; f <= 8; ++f) {
      CString strName;
      strName.Format("F%d", f);
      td.CreateField(strName, dbText, 40);
    }
    td.CreateField("F9", dbDouble, 8);
    td.Append();
    // What making the values costs alone, so that it can be told apart.
    qobench::Stopwatch values;
    size_t nBytes = 0;
    for (long i = 0; i < lRows; ++i)
      for (int f = 0; f < 10; ++f) nBytes += (size_t)Value(i, f).GetLength();
    printf("making_values rows=%ld seconds=%.2f cpu_seconds=%.2f bytes=%zu\n", lRows, values.Wall(), values.Cpu(),
           nBytes);
    qobench::Stopwatch append;
    CDaoRecordset rs(&db);
    rs.Open(&td);
    for (long i = 0; i < lRows; ++i) {
      rs.AddNew();
      for (int f = 0; f < 10; ++f) rs.SetFieldValue(f, (LPCTSTR)Value(i, f));
      rs.Update();
    }
    rs.Close();
    double dSeconds = append.Wall(), dCpu = append.Cpu();
    CDaoTableDef check(&db);
    check.Open("T");
    if (getenv("QO_BENCH_ODBC") != NULL) {
      CDatabase odbc;
      odbc.OpenEx(CString("Driver=SQLite3;Database=") + argv[1], CDatabase::noOdbcDialog);
      odbc.ExecuteSQL("delete from T");
      qobench::Stopwatch odbcAppend;
      CTenSet set(&odbc);
      set.Open(CRecordset::snapshot, "select * from T", CRecordset::appendOnly | CRecordset::optimizeBulkAdd);
      for (long i = 0; i < lRows; ++i) {
        set.AddNew();
        for (int f = 0; f < 10; ++f) set.m_values[f] = Value(i, f);
        set.Update();
      }
      set.Close();
      printf("odbc_append rows=%ld seconds=%.2f cpu_seconds=%.2f\n", lRows, odbcAppend.Wall(), odbcAppend.Cpu());
    }
    printf("dao_append rows=%ld seconds=%.2f cpu_seconds=%.2f stored=%ld\n", lRows, dSeconds, dCpu,
           check.GetRecordCount());

    // Reading every row forward, then jumping back to the first and to the
    // middle: the peak memory shows whether rows are held.
    qobench::Stopwatch read;
    CDaoRecordset reader(&db);
    reader.Open(dbOpenDynaset, "select * from T");
    double dSum = 0;
    for (; !reader.IsEOF(); reader.MoveNext()) dSum += reader.GetFieldValue(9).dblVal;
    reader.MoveFirst();
    reader.SetAbsolutePosition(lRows / 2);
    long lMiddle = reader.GetFieldValue(0).lVal;
    double dRead = read.Wall(), dReadCpu = read.Cpu();
    qobench::Memory const memory = qobench::ReadMemory();
    printf("dao_read rows=%ld seconds=%.2f cpu_seconds=%.2f middle=%ld sum=%.0f peak_working_set_mib=%.1f"
           " start_working_set_mib=%.1f\n",
           reader.GetRecordCount(), dRead, dReadCpu, lMiddle, dSum, qobench::MiB(memory.peakResident),
           qobench::MiB(qobench::MemoryAtStart().resident));
  } catch (CDaoException* e) {
    fprintf(stderr, "failed: %s\n", e->m_pErrorInfo != NULL ? (LPCSTR)e->m_pErrorInfo->m_strDescription : "?");
    e->Delete();
    return 1;
  }
  return 0;
}
