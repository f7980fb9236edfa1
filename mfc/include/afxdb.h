// The ODBC classes of the MFC subset: CDatabase (a connection), CRecordset (a
// result set or an append-only table, bound by field exchange), CFieldExchange
// with RFX_Text, CODBCFieldInfo and CDBException, over the ODBC C API.
//
// Using them:
//
//     CDatabase db;
//     db.OpenEx("Driver=SQLite3;Database=C:\\daten\\kunden.db", CDatabase::useCursorLib);
//     db.ExecuteSQL("create table T (A varchar(40))");
//     CMyRecordset rs(&db);                    // DoFieldExchange binds with RFX_Text
//     rs.Open(CRecordset::snapshot, "select * from T", CRecordset::readOnly);
//     for (; !rs.IsEOF(); rs.MoveNext()) ...  // the bound CStrings hold the row
//
// Every failure of the data source is a CDBException (thrown as a pointer, ended
// with Delete()) carrying the driver's diagnostic records: m_strError holds their
// texts, m_strStateNativeOrigin the SQLSTATE, native code and origin. A call in
// the wrong state (moving a closed recordset, AddNew on a read-only one) is a
// programming error and an assertion.
//
// What the layer adds to the bare driver, as MFC's cursor library promised:
// - Scrolling whatever cursor the driver offers. A result the driver can only
//   read forward is scrolled by the layer (MoveFirst, MovePrev and backward
//   Move re-run the statement and step to the row), so memory stays flat
//   whatever the result's size.
// - Text in the program is Windows-1252; each driver receives and returns it in
//   the form it stores (see OpenEx).
// - Windows paths in a connect string (Database=, DBQ=) reach a driver of the
//   host system as the host's paths when the program runs under Wine.
// - Appending with optimizeBulkAdd sends rows as parameter arrays inside
//   transactions (see AddNew/Update and FlushBulkAdd).
#pragma once

#include "afx.h"

#include <sql.h>
#include <sqlext.h>

class CDatabase;
class CRecordset;

// ---------------------------------------------------------------------------
// CDBException
// ---------------------------------------------------------------------------

class AFX_API CDBException : public CException {
  DECLARE_DYNAMIC(CDBException)
public:
  explicit CDBException(RETCODE nRetCode = SQL_ERROR);
  virtual ~CDBException();

  virtual BOOL GetErrorMessage(LPSTR lpszError, UINT nMaxError, PUINT pnHelpContext = NULL) const;

  // Reads the diagnostic records of the handles (statement first, then the
  // connection, then the environment) into m_strError and
  // m_strStateNativeOrigin. `lpszCall` names the ODBC function that failed.
  void BuildErrorString(CDatabase* pdb, HSTMT hstmt, LPCSTR lpszCall = NULL);

  RETCODE m_nRetCode;
  // The driver's texts, one line per diagnostic record (the message a user reads).
  CString m_strError;
  // "State:42S02,Native:1,Origin:[SQLite]" per record, as MFC writes them.
  CString m_strStateNativeOrigin;
  // The SQLSTATE of the first record ("" when the driver gave none).
  CString m_strSqlState;
  // A failed bulk append: the 0-based number (counted since the recordset was
  // opened) of the first row that is not stored; every row before it is
  // committed. -1 for every other failure.
  long m_lFirstRowNotStored;
};

// Raises a CDBException for nRetCode with the diagnostics of the handles.
AFX_API void AFXAPI AfxThrowDBException(RETCODE nRetCode, CDatabase* pdb, HSTMT hstmt);

// ---------------------------------------------------------------------------
// CDatabase
// ---------------------------------------------------------------------------

class AFX_API CDatabase : public CObject {
  DECLARE_DYNAMIC(CDatabase)
public:
  enum DbOpenOptions {
    openExclusive = 0x0001,    // not supported (asserts)
    openReadOnly = 0x0002,
    useCursorLib = 0x0004,     // scrolling is always the layer's; accepted for MFC's sake
    noOdbcDialog = 0x0008,
    forceOdbcDialog = 0x0010
  };

  CDatabase();
  virtual ~CDatabase();   // closes

  // Connects with a connect string ("DSN=...;UID=..." or "Driver=...;..."); an
  // "ODBC;" prefix is dropped. Never shows a driver dialog unless
  // forceOdbcDialog is given. After connecting, the layer asks the driver what
  // it is and sets the text form: SQLite stores UTF-8 (text is converted from
  // and to Windows-1252 on the way); PostgreSQL gets the client encoding
  // WIN1252; others receive the bytes unchanged. TRUE when open; failures
  // raise CDBException.
  virtual BOOL OpenEx(LPCTSTR lpszConnectString, DWORD dwOptions = 0);
  virtual BOOL Open(LPCTSTR lpszDSN, BOOL bExclusive = FALSE, BOOL bReadOnly = FALSE,
                    LPCTSTR lpszConnect = _T("ODBC;"), BOOL bUseCursorLib = TRUE);
  // Rolls back an open transaction, frees the connection. Never raises.
  virtual void Close();

  BOOL IsOpen() const { return m_hdbc != SQL_NULL_HDBC; }
  // The connect string as the driver manager completed it.
  const CString GetConnect() const { return m_strConnect; }
  // The driver's name for its data source ("SQLite", "PostgreSQL" ...).
  CString GetDatabaseName() const;
  BOOL CanUpdate() const;
  BOOL CanTransact() const;

  // Runs one statement directly (on a statement handle of its own).
  void ExecuteSQL(LPCTSTR lpszSQL);

  // Manual-commit transactions on this connection.
  BOOL BeginTrans();
  BOOL CommitTrans();
  BOOL Rollback();

  // Seconds for logins and queries (0: no limit).
  void SetLoginTimeout(DWORD dwSeconds) { m_dwLoginTimeout = dwSeconds; }
  void SetQueryTimeout(DWORD dwSeconds) { m_dwQueryTimeout = dwSeconds; }

  // --- the layer's own, used by CRecordset -------------------------------------
  enum TextForm { textBytes = 0, textUtf8 = 1 };
  int GetTextForm() const { return m_nTextForm; }
  // What the driver quotes names with (SQL_IDENTIFIER_QUOTE_CHAR); "" when it
  // quotes none.
  CString GetIdentifierQuote() const { return m_strIdentifierQuote; }
  // Raises CDBException when nRetCode is an error (SQL_ERROR, SQL_INVALID_HANDLE).
  void Check(RETCODE nRetCode, HSTMT hstmt, LPCSTR lpszCall);
  HSTMT AllocStatement();
  static void FreeStatement(HSTMT hstmt);

  HDBC m_hdbc;

protected:
  CString m_strConnect;
  DWORD m_dwLoginTimeout;
  DWORD m_dwQueryTimeout;
  int m_nTextForm;
  BOOL m_bTransactionPending;
  BOOL m_bUpdatable;
  CString m_strDBMS;

private:
  friend class CRecordset;

  // Turns the driver's automatic commit off or on (appending and BeginTrans).
  void SetAutoCommit(BOOL bOn);
  // Ends the current manual-commit transaction; raises when the driver fails.
  void EndTransaction(BOOL bCommit);
  // Every recordset opened on this connection: Close closes them before the
  // handles they use disappear.
  void AddRecordset(CRecordset* pSet);
  void RemoveRecordset(CRecordset* pSet);

  CString m_strIdentifierQuote;   // "" when the driver quotes no names
  SQLUSMALLINT m_nTxnCapable;
  BOOL m_bReadOnlyRequested;
  CRecordset* m_pFirstRecordset;
};

// ---------------------------------------------------------------------------
// Field exchange
// ---------------------------------------------------------------------------

// One exchange between a recordset's members and the current row. A
// DoFieldExchange override calls SetFieldType, then one RFX_ function per
// column, in the same order every time.
class AFX_API CFieldExchange {
public:
  enum FieldType { noFieldType = -1, outputColumn = 0, param = 1, inputParam = param,
                   outputParam = 4, inoutParam = 2 };
  enum RFX_Operation {
    BindParam,          // unused by this subset
    RebindParam,
    BindFieldToColumn,  // register the member: column name, buffer, maximum length
    BindFieldForUpdate,
    UnbindFieldForUpdate,
    Fixup,              // fill the members from the fetched row
    MarkForAddNew,      // empty the members for a new row
    MarkForUpdate,
    Name,
    NameValue,
    Value,
    SetFieldNull,
    StoreField,         // read the members into the row being appended
    LoadField,
    AllocCache,
    AllocMultiRowBuffer,
    DeleteMultiRowBuffer
  };

  CFieldExchange(UINT nOperation, CRecordset* prs, void* pvField = NULL);
  void SetFieldType(UINT nFieldType) { m_nFieldType = nFieldType; }

  UINT m_nOperation;
  UINT m_nFieldType;
  CRecordset* m_prs;
  UINT m_nFieldFound;   // 1-based number of the field being exchanged
};

// Exchanges `value` with the column `szName` as text. nMaxLength is the
// longest text the column holds; values are never cut shorter than what the
// driver delivers (a longer value is read whole). nColumnType is the SQL type
// the parameter is sent as when appending.
AFX_API void AFXAPI RFX_Text(CFieldExchange* pFX, LPCTSTR szName, CString& value, int nMaxLength = 255,
                             int nColumnType = SQL_VARCHAR, short nScale = 0);

// ---------------------------------------------------------------------------
// CRecordset
// ---------------------------------------------------------------------------

struct AFX_API CODBCFieldInfo {
  CString m_strName;
  SWORD m_nSQLType;
  SQLULEN m_nPrecision;
  SWORD m_nScale;
  SWORD m_nNullability;
};

#define AFX_DB_USE_DEFAULT_TYPE (0xFFFFFFFF)

class AFX_API CRecordset : public CObject {
  DECLARE_DYNAMIC(CRecordset)
public:
  enum OpenType { dynaset = 0, snapshot = 1, forwardOnly = 2, dynamic = 3 };
  enum OpenOptions {
    none = 0x0,
    readOnly = 0x0004,
    appendOnly = 0x0008,
    skipDeletedRecords = 0x0010,
    noDirtyFieldCheck = 0x0020,
    useBookmarks = 0x0100,
    useMultiRowFetch = 0x0200,
    userAllocMultiRowBuffers = 0x0400,
    useExtendedFetch = 0x0800,
    executeDirect = 0x2000,
    optimizeBulkAdd = 0x4000,
    firstBulkAdd = 0x8000
  };

  explicit CRecordset(CDatabase* pDatabase = NULL);
  virtual ~CRecordset();   // closes; pending bulk rows are sent, a failure then is swallowed

  // Runs lpszSQL (or GetDefaultSQL()) and stands on the first row (IsEOF for an
  // empty result). With appendOnly no rows are read: the statement names the
  // table ("select * from T") whose columns AddNew/Update fill. Failures raise
  // CDBException; the recordset is closed then.
  virtual BOOL Open(UINT nOpenType = AFX_DB_USE_DEFAULT_TYPE, LPCTSTR lpszSQL = NULL, DWORD dwOptions = none);
  // Sends pending bulk rows (a failure raises, see FlushBulkAdd), frees the statement.
  virtual void Close();

  BOOL IsOpen() const { return m_bOpen; }
  BOOL IsBOF() const { return m_bBOF; }
  BOOL IsEOF() const { return m_bEOF; }
  BOOL CanUpdate() const;
  BOOL CanAppend() const;
  BOOL CanScroll() const { return TRUE; }
  // The rows seen so far (MFC's high-water mark); the whole count once the
  // last row has been passed.
  long GetRecordCount() const { return m_lRecordCount; }
  // 0-based number of the current row.
  long GetCurrentRow() const { return m_lCurrentRow; }

  // Moves by nRows (SQL_FETCH_RELATIVE, NEXT, PRIOR, FIRST, LAST, ABSOLUTE with
  // a 1-based row). Past the end: IsEOF, before the start: IsBOF.
  virtual void Move(long nRows, WORD wFetchType = SQL_FETCH_RELATIVE);
  void MoveFirst() { Move(0, SQL_FETCH_FIRST); }
  void MoveNext() { Move(1, SQL_FETCH_NEXT); }
  void MovePrev() { Move(-1, SQL_FETCH_PRIOR); }
  void MoveLast() { Move(0, SQL_FETCH_LAST); }
  void SetAbsolutePosition(long nRows) { Move(nRows, SQL_FETCH_ABSOLUTE); }

  short GetODBCFieldCount() const { return m_nResultCols; }
  // Description of result column nIndex (0-based).
  void GetODBCFieldInfo(short nIndex, CODBCFieldInfo& fieldinfo) const;
  void GetODBCFieldInfo(LPCTSTR lpszName, CODBCFieldInfo& fieldinfo) const;
  // The current row's value of a column as text ("" for NULL).
  void GetFieldValue(short nIndex, CString& strValue);
  void GetFieldValue(LPCTSTR lpszName, CString& strValue);

  // Appending: AddNew empties the bound members, the caller sets them, Update
  // stores the row. With optimizeBulkAdd, Update queues the row; full batches
  // go out as one parameter array and are committed every few batches, the
  // rest at FlushBulkAdd or Close. A failed batch rolls back to the last
  // commit and raises CDBException with m_lFirstRowNotStored; nothing queued
  // after it is kept. Without optimizeBulkAdd each Update stores its row.
  virtual void AddNew();
  virtual BOOL Update();
  virtual void CancelUpdate();
  void FlushBulkAdd();
  // Rows committed so far by this recordset's appends.
  long GetRowsStored() const { return m_lRowsStored; }

  virtual CString GetDefaultConnect();
  virtual CString GetDefaultSQL();
  virtual void DoFieldExchange(CFieldExchange* pFX);
  virtual void ThrowDBException(RETCODE nRetCode, HSTMT hstmt = SQL_NULL_HSTMT);

  UINT m_nFields;          // bound fields (RFX_ calls per exchange)
  UINT m_nParams;
  CDatabase* m_pDatabase;
  HSTMT m_hstmt;
  CString m_strSQL;
  UINT m_nDefaultType;

  // --- the layer's own: used by RFX_Text -----------------------------------------
  struct Binding;
  void ExchangeText(CFieldExchange* pFX, LPCTSTR szName, CString& value, int nMaxLength, int nColumnType);

protected:
  void Execute();
  BOOL FetchForward();
  void Rewind();
  void FillBoundFields();
  void DescribeColumns();
  void SendBatch();

  BOOL m_bOpen;
  BOOL m_bBOF;
  BOOL m_bEOF;
  DWORD m_dwOptions;
  UINT m_nOpenType;
  long m_lCurrentRow;        // 0-based, -1 before the first
  long m_lRecordCount;
  short m_nResultCols;
  void* m_pState;            // columns, bindings, queued rows (db_private.h)
  long m_lRowsQueued;
  long m_lRowsStored;
  BOOL m_bAdding;

private:
  friend class CDatabase;

  void ResetState();
  void ReadRow();
  void StepTo(long nTarget);
  void SetBeforeFirst();
  void SetAfterLast();
  // Appending (db_append.cpp).
  void OpenForAppend();
  void PrepareMultiRowInsert(const CString& strInsert, const CString& strMarkers);
  void RaiseIfFailed();
  [[noreturn]] void FailAppend(CDBException* pException);
  void CommitAppended();
  void ReleaseAppend();

  CRecordset* m_pNextRecordset;   // the connection's list of its recordsets
  BOOL m_bOwnDatabase;            // made by Open from GetDefaultConnect
};
