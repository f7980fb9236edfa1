// What the DAO classes of the MFC subset share (dao_*.cpp): the engine behind
// an open CDaoDatabase, the conversion of ODBC failures into CDaoException, a
// forward-reading cursor of its own (it tells NULL from empty text and reads
// binary values, which CRecordset's text rows cannot), and the field types.
//
// An Access-type database is an SQLite file holding, besides the user's
// tables and views, the engine's own tables (named qo_dao_...): a marker that
// the file is ours, the password's salted hash, and the field attributes that
// SQLite's declared types cannot carry. They never appear in the table lists.
#pragma once

#include "afxdao.h"
#include "afxdb.h"

#include "db_private.h"

#include <memory>
#include <string>
#include <vector>

namespace qodao {

// Bounds on what a file, a driver or a caller hands the engine.
const int kMaxFields = 255;            // fields of a table or result (Jet's limit)
const long kMaxTextSize = 255;         // characters of a dbText field
const long kMaxBinarySize = 510;       // bytes of a dbBinary field
const int kMaxObjects = 32767;         // tables or queries listed (the counts are short)
const int kMaxPasswordLength = 20;     // characters, as Jet allows
const int kMaxNameLength = 64;         // characters of a table, field or index name

enum FileKind { kindSqlite = 1, kindMdb = 2 };

// The state of an open CDaoDatabase (m_pEngine).
struct SheetFailure {
  CString strTable;
  long lCode = 0;
  CString strDescription;
};

struct Engine {
  Engine() = default;
  ~Engine();   // closes; removes the temporary copy of a workbook
  Engine(const Engine&) = delete;
  Engine& operator=(const Engine&) = delete;

  FileKind kind = kindSqlite;
  CDatabase db;
  CString strName;          // as given to Open or Create
  CString strConnect;
  BOOL bReadOnly = FALSE;
  long lRecordsAffected = 0;
  int nJetVersion = 0;      // an Access file's: 0 Jet 3, 1 Jet 4, 2 and more ACE
  // The open recordsets: closed before the connection their handles belong to.
  std::vector<CDaoRecordset*> recordsets;
  CString strTempFile;      // a workbook's copy
  // A workbook's sheets that could not be read, with the reason raised when
  // one of them is named.
  std::vector<SheetFailure> sheetFailures;
  // Open transaction levels: the outermost is the connection's transaction,
  // each inner one a savepoint of it (see Transaction).
  int nTransDepth = 0;
  CDaoWorkspace* pWorkspace = NULL;   // whose transactions cover this file
  CString strFullPath;      // an Access-type file's resolved path, while it is open
};

// Access-type files open in this process. A file open on two connections
// (an input and an output of one conversion) gets a short wait for the
// other's lock, and a lock conflict then says so (ThrowFromDb).
void RegisterOpenFile(Engine& engine);
void UnregisterOpenFile(Engine& engine);
// The files open on more than one connection, "" when none.
CString FilesOpenTwice();

// A unit of work that is stored whole or not at all. Outside any transaction
// it is a transaction of its own; inside one (the caller's, through
// CDaoWorkspace::BeginTrans, or another unit) it is a savepoint, so that the
// caller's rollback takes it back too and its own failure takes back only itself.
class Transaction {
public:
  explicit Transaction(Engine& engine);
  ~Transaction();   // rolls back what was not committed; never raises
  Transaction(const Transaction&) = delete;
  Transaction& operator=(const Transaction&) = delete;
  void Commit();

private:
  Engine& m_engine;
  int m_nLevel;   // 1 the outermost
  bool m_bOpen = true;
};
// The level functions behind Transaction and the workspace's transactions.
void BeginLevel(Engine& engine);
void EndLevel(Engine& engine, bool bCommit);

// Jet's rule for the name of a table, field, index or query: 1 to 64
// characters, no control character, none of . ! [ ] `, no leading blank.
// Raises 3125 naming it. A name that breaks it would make an object no other
// program could address, or one whose brackets a caller meant as quoting.
void CheckName(const CString& strName);

// A database's place in its workspace (Open and Create join, Close leaves).
void JoinWorkspace(CDaoDatabase* pDatabase);
void LeaveWorkspace(CDaoDatabase* pDatabase);
// Stores the rows the open recordsets of the file still hold back (dao_recordset.cpp).
void FlushAppends(Engine& engine);

// The engine's own tables in a new file.
void MakeEngineTables(Engine& engine);
// Copies a workbook into a temporary database (dao_workbook.cpp).
void OpenWorkbook(Engine& engine, LPCTSTR lpszName);
// Raises the reason when strName is a sheet of the workbook that could not be read.
void ThrowIfFailedSheet(Engine& engine, const CString& strName);

Engine& EngineOf(CDaoDatabase* pDatabase);   // asserts that it is open

// Errors.
[[noreturn]] void Throw(long lCode, const CString& strDescription);
[[noreturn]] void ThrowFromDb(CDBException* e);   // takes over and deletes e
[[noreturn]] void ThrowReadOnly();
[[noreturn]] void ThrowNoCurrentRecord();

// Runs f; a CDBException from the ODBC layer leaves as CDaoException.
template <typename F>
auto Guard(F&& f) -> decltype(f()) {
  try {
    return f();
  } catch (CDBException* e) {
    ThrowFromDb(e);
  }
}

// A name as the file's SQL quotes it.
CString Quote(const Engine& engine, const CString& strName);
CString QuoteLiteral(const CString& strText);   // '...' with doubled quotes

// One value as the engine moves it: text in Windows-1252, numbers as their
// decimal text, dates as "YYYY-MM-DD HH:MM:SS", binary as its bytes.
struct Value {
  bool bNull = true;
  std::string bytes;
};

// A field as the engine knows it.
struct FieldDef {
  CString strName;
  short nType = dbText;
  long lSize = 0;
  long lAttributes = dbVariableField | dbUpdatableField;
  BOOL bRequired = FALSE;
  BOOL bAllowZeroLength = TRUE;
  CString strDefault;
};

// The declared type an SQLite column of a DAO type gets, and back.
CString DeclaredType(short nType, long lSize);
void FromDeclaredType(const CString& strDeclared, FieldDef& field);
// A DAO type for an ODBC type of a result column.
void FromSqlType(SWORD nSqlType, SQLULEN nPrecision, SWORD nScale, FieldDef& field);
long DefaultSize(short nType);
void FillFieldInfo(const FieldDef& field, int nOrdinal, CDaoFieldInfo& info, DWORD dwInfoOptions);
int FindField(const std::vector<FieldDef>& fields, LPCTSTR lpszName);   // -1 when none
// As FindField, but a missing field raises 3265.
int FieldIndex(const std::vector<FieldDef>& fields, LPCTSTR lpszName);
// FillFieldInfo of field nIndex; an index outside the fields raises 3265.
void FieldInfoAt(const std::vector<FieldDef>& fields, int nIndex, CDaoFieldInfo& info, DWORD dwInfoOptions);

// The fields of a table (3011 when there is no such table).
std::vector<FieldDef> TableFields(Engine& engine, const CString& strTable);
// Does a user table (or, with bView, a view) of that name exist? Its name as stored.
BOOL FindTable(Engine& engine, const CString& strName, BOOL bView, CString* pstrStored = NULL);
// The names of user tables or of views, in the file's order.
std::vector<CString> ObjectNames(Engine& engine, BOOL bViews);

// Conversions between values and variants by field type.
void ToVariant(const FieldDef& field, const Value& value, COleVariant& var);
// Text as the field's type stores it; raises 3421 or 3163.
Value FromText(const FieldDef& field, LPCTSTR lpszText);
void FromText(const FieldDef& field, LPCTSTR lpszText, Value& value);
Value FromVariant(const FieldDef& field, const VARIANT& var);

// A statement read forward on a handle of its own; Restart runs it again.
class Cursor {
public:
  Cursor(Engine& engine, const CString& strSQL);
  ~Cursor();
  Cursor(const Cursor&) = delete;
  Cursor& operator=(const Cursor&) = delete;

  struct Column {
    CString strName;
    SWORD nSqlType;
    SQLULEN nPrecision;
    SWORD nScale;
  };
  const std::vector<Column>& Columns() const { return m_columns; }

  // The next row; false past the last one.
  bool Next();
  void Restart();
  long Row() const { return m_lRow; }           // 0-based; -1 before the first
  bool AtEnd() const { return m_bAtEnd; }
  // A value of the current row; the row's values are read on first use, so
  // that stepping over rows to reach one costs no reading of values.
  const Value& Get(size_t nColumn);

private:
  void Execute();
  void ReadRealsExactly();
  void ExactReal(Value& value);
  void ReadValue(SQLUSMALLINT nColumn, Value& value);
  bool m_bRowRead = false;
  // Floating-point columns are read through an exact form of the value (see
  // ReadRealsExactly); these say which ones.
  std::vector<bool> m_exactReal;

  Engine& m_engine;
  std::string m_sql;
  HSTMT m_hstmt = SQL_NULL_HSTMT;
  std::vector<Column> m_columns;
  std::vector<Value> m_row;
  long m_lRow = -1;
  bool m_bAtEnd = false;
};

// The shortest decimal text that reads back as the same double.
CString RoundTripText(double d);

// One value of the first row of a query (NULL when none).
Value QueryValue(Engine& engine, const CString& strSQL);
// Runs a statement with values for its '?' markers (NULL or text/binary).
long ExecuteWith(Engine& engine, const CString& strSQL, const std::vector<Value>& params,
                 const std::vector<bool>& binary);

// Queries.
BOOL IsSelect(const CString& strSQL);
void CheckSingleStatement(const CString& strSQL);   // 3142 for a second statement
[[noreturn]] void ThrowMdbQuery(const CString& strName);
CString QuerySQL(CDaoQueryDef* pQueryDef);   // what a recordset on it runs
std::vector<FieldDef> QueryFields(CDaoQueryDef* pQueryDef);
// The fields of a result, without reading its rows.
std::vector<FieldDef> ResultFields(Engine& engine, const CString& strSQL);

} // namespace qodao
