// Helpers shared by the ODBC classes of the MFC subset (db_*.cpp): the
// process's ODBC environment, the text conversions between the program's
// Windows-1252 and the form a driver stores, and errors of the layer itself.
#pragma once

#include "afxdb.h"

#include <string>
#include <vector>

namespace qodb {

// Bounds on what a driver reports, checked before anything is sized by it.
const int kMaxColumns = 4096;                 // result columns of one statement
const int kMaxNameBytes = 4096;               // a column or object name
const SQLLEN kMaxValueBytes = 64 << 20;       // one value read with SQLGetData
const int kMaxDiagRecords = 64;               // diagnostic records read per handle
const SQLSMALLINT kMaxDiagText = 8192;        // one diagnostic text

// The one ODBC 3 environment of the process, made on first use.
HENV Environment();

// Windows-1252 <-> UTF-16 (the code page is fixed: the program's text is
// Windows-1252 whatever the system's ANSI code page is).
std::wstring Widen(LPCSTR lpsz, int nLength);
CString Narrow(const WCHAR* pwch, int nLength);
std::string Utf8FromWide(const WCHAR* pwch, int nLength);
std::wstring WideFromUtf8(const char* p, int nLength);

// Text the program hands to the driver (SQL, names) in the driver's form, and
// text from the driver (names, messages) back in Windows-1252.
std::string ToDriver(int nTextForm, LPCSTR lpsz, int nLength = -1);
// Appends the UTF-8 form of Windows-1252 text to `out`, through a table: this
// runs for every value of every appended row.
void AppendUtf8(std::string& out, const char* p, size_t nLength);
CString FromDriver(int nTextForm, const char* p, int nLength = -1);

// A column name as an exchange or a caller may write it, without the quotes
// ("[Name]", "\"Name\"", `Name`).
CString BareName(LPCSTR lpszName);

// A CDBException that the layer raises itself (no driver diagnostics).
CDBException* NewException(RETCODE nRetCode, const CString& strError);
[[noreturn]] void Throw(RETCODE nRetCode, const CString& strError);

// Owns a statement handle until released.
class StatementHandle {
public:
  StatementHandle() : m_hstmt(SQL_NULL_HSTMT) {}
  explicit StatementHandle(HSTMT hstmt) : m_hstmt(hstmt) {}
  ~StatementHandle() { CDatabase::FreeStatement(m_hstmt); }
  StatementHandle(const StatementHandle&) = delete;
  StatementHandle& operator=(const StatementHandle&) = delete;
  HSTMT get() const { return m_hstmt; }
  void reset(HSTMT hstmt = SQL_NULL_HSTMT) {
    CDatabase::FreeStatement(m_hstmt);
    m_hstmt = hstmt;
  }

private:
  HSTMT m_hstmt;
};

// What a recordset holds besides its MFC members (CRecordset::m_pState).
struct ColumnInfo {
  CString strName;
  SWORD nSQLType;
  SQLULEN nPrecision;
  SWORD nScale;
  SWORD nNullability;
};

} // namespace qodb

struct CRecordset::Binding {
  CString strName;   // as the exchange named it
  CString* pValue;
  int nMaxLength;
  int nColumnType;
  int nColumn;       // 0-based result column
};

namespace qodb {

// Rows queued for one parameter array, column by column: the values as the
// driver gets them (bytes or UTF-16), one after the other.
struct QueuedColumn {
  std::string data;
  std::vector<SQLLEN> lengths;   // bytes of each value, without terminator
  size_t nWidest;                // bytes of the longest value
};

struct RecordsetState {
  std::vector<ColumnInfo> columns;
  std::vector<CRecordset::Binding> bindings;

  // Reading.
  std::string sql;               // the statement in the driver's form
  std::vector<CString> row;      // values of row lRowInCache
  long lRowInCache = -1;
  long lCursorRow = -1;          // last row the driver's cursor fetched
  bool bCursorAtEnd = false;     // the driver reported no further row
  bool bAllSeen = false;         // m_lRecordCount is the whole count

  // Appending.
  CString strTable;
  bool bBulk = false;            // rows go out as parameter arrays
  bool bOwnTransaction = false;  // this recordset turned automatic commit off
  bool bFailed = false;          // a batch was lost: no further rows are taken
  CString strFailure;            // the message of that failure, raised again
  CString strFailureState;
  CString strFailureSqlState;
  long lRowsInTransaction = 0;   // sent since the last commit
  std::vector<QueuedColumn> queue;
  long lQueued = 0;              // rows in the queue
  // The rows of a batch as the driver reads them: row-wise, each row holding
  // every value at its column's width (NUL-terminated) and their lengths.
  // The layout only grows, so the arrays stay bound from batch to batch.
  std::vector<size_t> widths;          // bytes a value of each column may have
  std::vector<size_t> valueOffsets;    // of each value within a row
  std::vector<size_t> lengthOffsets;   // of each length within a row
  size_t nRowBytes = 0;
  std::vector<char> rows;              // the batch
  // An insert of several rows at once, where the driver can take one: it
  // parses once for many rows.
  HSTMT hMulti = SQL_NULL_HSTMT;
  long nRowsPerInsert = 1;
  bool bMultiBound = false;
  std::vector<std::string> pending;   // the row being stored, one value per binding
};

inline RecordsetState& StateOf(void* pState) { return *static_cast<RecordsetState*>(pState); }

// The rows a recordset sends in one parameter array, and the bytes of queued
// values it holds at most (a single larger row goes out alone).
const long kBatchRows = 1000;
const size_t kMaxBatchBytes = 16u << 20;
// Rows appended in one transaction before it is committed.
const long kCommitRows = 50000;

} // namespace qodb
