// The DAO classes of the MFC subset: a file-database engine of our own over the
// ODBC classes (afxdb.h), since no Access engine exists on this platform.
//
//   - An Access-type database is an SQLite file: Create makes one; tables,
//     indexes, stored queries (views) and temporary query definitions from
//     SQL; table-type and dynaset recordsets that scroll, count, append.
//     A password given at Create (";pwd=...") or set with SetPassword is kept
//     in the file by the engine and checked at Open (missing or wrong: 3031).
//     It keeps the file from being opened by mistake; it is not encryption.
//   - A real Access file (.mdb, Jet 3 and 4) is read only, through the
//     MDBTools ODBC driver: whole tables and the catalogue; its stored queries
//     are listed but cannot be run (a clear error says so).
//   - An Excel workbook (.xlsx, connect string "Excel 8.0;...") is read only,
//     through a workbook reader the program registers (see
//     AfxDaoRegisterWorkbookReader): each worksheet is a table named by the
//     sheet followed by '$', the first row holds the field names.
//
//     CDaoDatabase db;
//     db.Open("C:\\daten\\kunden.mdb");
//     CDaoRecordset rs(&db);
//     rs.Open(dbOpenDynaset, "select * from Kunden");
//     for (; !rs.IsEOF(); rs.MoveNext()) { COleVariant v; rs.GetFieldValue(0, v); ... }
//
// Names of new tables, fields, indexes and queries follow Jet's rule: 1 to 64
// characters, no control character, none of . ! [ ] `, no leading blank
// (3125 otherwise, before anything is made). Brackets are never taken as
// quoting in a name given to Create: "[Kunden]" is refused, not stripped.
//
// Failures are CDaoException (thrown as pointers, ended with Delete()) whose
// m_pErrorInfo carries DAO's error number and a description: 3021 no current
// record, 3024 file not found, 3031 wrong or missing password, 3161 an Excel
// file that cannot be read (password protected), 3343 unrecognized database
// format, 3011 object not found, 3010 table exists, 3027 read-only database or
// object, 3265 item not found in this collection, 3061 parameters expected.
// Field values are variants: VT_I2, VT_I4, VT_R4, VT_R8, VT_CY, VT_DATE,
// VT_BOOL, VT_UI1, VT_BSTR holding single-byte Windows-1252 text, VT_NULL,
// VT_ARRAY|VT_UI1 for binary fields.
#pragma once

#include "afx.h"
#include "afxdisp.h"

class CDaoWorkspace;
class CDaoDatabase;
class CDaoTableDef;
class CDaoQueryDef;
class CDaoRecordset;

// --- DAO constants ------------------------------------------------------------------

// Recordset types and options.
#define dbOpenTable 1
#define dbOpenDynaset 2
#define dbOpenSnapshot 4
#define dbOpenForwardOnly 8
#define dbAppendOnly 8
#define dbReadOnly 4
#define dbFailOnError 128
#define AFX_DAO_USE_DEFAULT_TYPE (-1)

// Object attributes.
#define dbSystemObject 0x80000002L
#define dbHiddenObject 0x1L
#define dbAttachedTable 0x40000000L

// Field types.
#define dbBoolean 1
#define dbByte 2
#define dbInteger 3
#define dbLong 4
#define dbCurrency 5
#define dbSingle 6
#define dbDouble 7
#define dbDate 8
#define dbBinary 9
#define dbText 10
#define dbLongBinary 11
#define dbMemo 12
#define dbGUID 15

// Field attributes.
#define dbFixedField 0x1L
#define dbVariableField 0x2L
#define dbAutoIncrField 0x10L
#define dbUpdatableField 0x20L

// Information levels of the Get...Info calls.
#define AFX_DAO_PRIMARY_INFO 0x1
#define AFX_DAO_SECONDARY_INFO 0x2
#define AFX_DAO_ALL_INFO 0x3

// Query definition types.
#define dbQSelect 0
#define dbQAction 0xF0

// The locale of new databases.
#define dbLangGeneral _T(";LANGID=0x0409;CP=1252;COUNTRY=0")

// MFC's own DAO error codes (m_nAfxDaoError); DAO's numbers are in m_pErrorInfo.
#define NO_AFX_DAO_ERROR 0
#define AFX_DAO_ERROR_MIN 2200
#define AFX_DAO_ERROR_ENGINE_INITIALIZATION 2200
#define AFX_DAO_ERROR_DFX_BIND 2201
#define AFX_DAO_ERROR_OBJECT_NOT_OPEN 2202

// --- information records ------------------------------------------------------------

struct AFX_API CDaoErrorInfo {
  long m_lErrorCode;
  CString m_strSource;
  CString m_strDescription;
  CString m_strHelpFile;
  long m_lHelpContext;
};

struct AFX_API CDaoTableDefInfo {
  CString m_strName;          // primary
  BOOL m_bUpdatable;          // primary
  long m_lAttributes;         // primary
  COleDateTime m_dateCreated; // secondary
  COleDateTime m_dateLastUpdated;
  CString m_strSrcTableName;
  CString m_strConnect;
  CString m_strValidationRule; // all
  CString m_strValidationText;
  long m_lRecordCount;        // all
};

struct AFX_API CDaoQueryDefInfo {
  CString m_strName;          // primary
  short m_nType;              // primary
  COleDateTime m_dateCreated; // secondary
  COleDateTime m_dateLastUpdated;
  BOOL m_bUpdatable;
  BOOL m_bReturnsRecords;
  CString m_strSQL;           // all
  CString m_strConnect;
  short m_nODBCTimeout;
};

struct AFX_API CDaoFieldInfo {
  CString m_strName;          // primary
  short m_nType;              // primary
  long m_lSize;               // primary
  long m_lAttributes;         // primary
  short m_nOrdinalPosition;   // secondary
  BOOL m_bRequired;
  BOOL m_bAllowZeroLength;
  long m_lCollatingOrder;
  CString m_strForeignName;
  CString m_strSourceField;
  CString m_strSourceTable;
  CString m_strValidationRule; // all
  CString m_strValidationText;
  CString m_strDefaultValue;
};

struct AFX_API CDaoIndexFieldInfo {
  CString m_strName;
  BOOL m_bDescending;
};

struct AFX_API CDaoIndexInfo {
  CDaoIndexInfo();
  ~CDaoIndexInfo();            // frees m_pFieldInfos when the engine allocated them

  CString m_strName;          // primary
  CDaoIndexFieldInfo* m_pFieldInfos;
  short m_nFields;
  BOOL m_bPrimary;
  BOOL m_bUnique;
  BOOL m_bClustered;          // secondary
  BOOL m_bIgnoreNulls;
  BOOL m_bRequired;
  BOOL m_bForeign;
  long m_lDistinctCount;      // all
  BOOL m_bCleanupFieldInfo;   // the engine allocated m_pFieldInfos
};

// --- CDaoException ---------------------------------------------------------------------

class AFX_API CDaoException : public CException {
  DECLARE_DYNAMIC(CDaoException)
public:
  CDaoException();
  virtual ~CDaoException();

  virtual BOOL GetErrorMessage(LPSTR lpszError, UINT nMaxError, PUINT pnHelpContext = NULL) const;

  // The errors of the failed operation (the engine keeps one).
  short GetErrorCount();
  void GetErrorInfo(int nIndex);

  CDaoErrorInfo* m_pErrorInfo;   // the first error; owned
  SCODE m_scode;
  int m_nAfxDaoError;
};

AFX_API void AFXAPI AfxThrowDaoException(int nAfxDaoError = NO_AFX_DAO_ERROR, SCODE scode = S_OK);
// Raises a CDaoException with DAO's error number and description (the engine's own errors).
AFX_API void AFXAPI AfxThrowDaoError(long lErrorCode, LPCTSTR lpszDescription);

// --- workbooks -------------------------------------------------------------------------

// The MFC subset reads no spreadsheets itself: a program or library that can
// read .xlsx workbooks registers a factory of readers, and "Excel 8.0;"
// connections are served through it. At Open the engine copies each worksheet
// (table "<sheet>$", the first row naming the fields, each field typed by
// what its cells hold) into a temporary Access-type database that is removed
// at Close: the workbook is read twice, rows are never held in memory.
// Without a registered reader, opening a workbook raises 3343.
class AFX_API CDaoWorkbookReader {
public:
  enum CellType { cellEmpty = 0, cellNumber = 1, cellText = 2, cellBoolean = 3, cellDate = 4, cellError = 5 };
  virtual ~CDaoWorkbookReader() {}

  // Each raises CDaoException when the file fails it (3161: a workbook that
  // cannot be read, such as a password-protected one).
  virtual void Open(LPCTSTR lpszPath) = 0;
  virtual int GetSheetCount() = 0;
  virtual CString GetSheetName(int nIndex) = 0;
  // Stands before the sheet's first row.
  virtual void OpenSheet(int nIndex) = 0;
  virtual void RewindSheet() = 0;
  virtual int GetColumnCount() = 0;
  // The next row; FALSE after the last.
  virtual BOOL NextRow() = 0;
  // A cell of the current row: nType a CellType; a number, a boolean (0 or 1)
  // or a date (an OLE date, which is Excel's serial number) in dValue; text
  // and error values ("#DIV/0!") in strText, Windows-1252.
  virtual void GetCell(int nColumn, int& nType, double& dValue, CString& strText) = 0;
};

typedef CDaoWorkbookReader*(AFXAPI* AFX_DAO_WORKBOOK_FACTORY)();
// Registers (or with NULL removes) the factory of workbook readers.
AFX_API void AFXAPI AfxDaoRegisterWorkbookReader(AFX_DAO_WORKBOOK_FACTORY pfnFactory);

// --- CDaoWorkspace ---------------------------------------------------------------------

// A workspace groups the databases opened in it, and its transactions cover
// them all. A CDaoDatabase made without one uses the default workspace (one
// per process); a caller whose transaction must not reach other databases of
// the process gives its database a workspace object of its own (it needs no
// Create or Open here: there is one user and one engine).
//
//     ws.BeginTrans();
//     try { ... changes to tables, table definitions, indexes ...; ws.CommitTrans(); }
//     catch (CDaoException* e) { ws.Rollback(); ... }
//
// Transactions nest (up to 5 levels, as DAO allows): a rollback takes back
// only what was done since the matching BeginTrans. What the engine does as
// one step by itself (Append, DeleteTableDef, SetName, CreateIndex) is a
// level of its own inside the caller's transaction. Closing a database rolls
// back what its transactions hold.
class AFX_API CDaoWorkspace : public CObject {
  DECLARE_DYNAMIC(CDaoWorkspace)
public:
  CDaoWorkspace();
  virtual ~CDaoWorkspace();

  void BeginTrans();    // a sixth level raises 3003
  void CommitTrans();   // without a BeginTrans: 3034
  void Rollback();      // without a BeginTrans: 3034; never leaves a level open

  void* m_pState;   // the engine's: the open databases and the level (dao_transaction.cpp)
};

// --- CDaoDatabase ----------------------------------------------------------------------

class AFX_API CDaoDatabase : public CObject {
  DECLARE_DYNAMIC(CDaoDatabase)
public:
  explicit CDaoDatabase(CDaoWorkspace* pWorkspace = NULL);
  virtual ~CDaoDatabase();   // closes

  // Makes a new Access-type database file; lpszLocale may carry ";pwd=..."
  // (the password the file is protected by). An existing file: 3204.
  virtual void Create(LPCTSTR lpszName, LPCTSTR lpszLocale = dbLangGeneral, int dwOptions = 0);
  // Opens a database file by its kind (Access-type, .mdb, or with an
  // "Excel 8.0;" connect string an .xlsx workbook); lpszConnect may carry
  // ";PWD=...". Missing file: 3024; no database: 3343.
  virtual void Open(LPCTSTR lpszName, BOOL bExclusive = FALSE, BOOL bReadOnly = FALSE,
                    LPCTSTR lpszConnect = _T(""));
  virtual void Close();   // closes its recordsets and definitions' handles; never raises

  BOOL IsOpen() const;
  BOOL CanUpdate();
  BOOL CanTransact();
  CString GetName();      // the file name given to Open or Create
  CString GetConnect();

  // Runs an action statement.
  void Execute(LPCTSTR lpszSQL, int nOptions = dbFailOnError);
  long GetRecordsAffected();

  short GetTableDefCount();
  void GetTableDefInfo(int nIndex, CDaoTableDefInfo& tabledefinfo, DWORD dwInfoOptions = AFX_DAO_PRIMARY_INFO);
  void GetTableDefInfo(LPCTSTR lpszName, CDaoTableDefInfo& tabledefinfo, DWORD dwInfoOptions = AFX_DAO_PRIMARY_INFO);
  short GetQueryDefCount();
  void GetQueryDefInfo(int nIndex, CDaoQueryDefInfo& querydefinfo, DWORD dwInfoOptions = AFX_DAO_PRIMARY_INFO);
  void GetQueryDefInfo(LPCTSTR lpszName, CDaoQueryDefInfo& querydefinfo, DWORD dwInfoOptions = AFX_DAO_PRIMARY_INFO);
  void DeleteTableDef(LPCTSTR lpszName);
  void DeleteQueryDef(LPCTSTR lpszName);

  // Sets, changes or (with an empty new password) removes the password of an
  // Access-type database file that is not open. The old one must fit (3031).
  static void AFXAPI SetPassword(LPCTSTR lpszName, LPCTSTR lpszOldPassword, LPCTSTR lpszNewPassword);

  CDaoWorkspace* m_pWorkspace;

  // --- the engine's own ----------------------------------------------------------
  void* m_pEngine;   // the kind of file and its connection (dao_*.cpp)
};

// --- CDaoTableDef ----------------------------------------------------------------------

class AFX_API CDaoTableDef : public CObject {
  DECLARE_DYNAMIC(CDaoTableDef)
public:
  explicit CDaoTableDef(CDaoDatabase* pDatabase);
  virtual ~CDaoTableDef();

  // A new table: Create, CreateField for each field, Append (the table exists
  // from then on), CreateIndex for each index.
  virtual void Create(LPCTSTR lpszName, long lAttributes = 0, LPCTSTR lpszSrcTable = NULL,
                      LPCTSTR lpszConnect = NULL);
  virtual void Append();
  // An existing table (3011 when there is none).
  virtual void Open(LPCTSTR lpszName);
  virtual void Close();

  BOOL IsOpen() const;
  CString GetName();
  // Renames the table (an appended one: in the file, with its field
  // attributes and indexes, at once; views that name the old one keep that
  // name). Another table or query of that name: 3010.
  void SetName(LPCTSTR lpszName);
  long GetAttributes();
  long GetRecordCount();

  short GetFieldCount();
  void GetFieldInfo(int nIndex, CDaoFieldInfo& fieldinfo, DWORD dwInfoOptions = AFX_DAO_PRIMARY_INFO);
  void GetFieldInfo(LPCTSTR lpszName, CDaoFieldInfo& fieldinfo, DWORD dwInfoOptions = AFX_DAO_PRIMARY_INFO);
  void CreateField(LPCTSTR lpszName, short nType, long lSize, long lAttributes = 0);
  void CreateField(CDaoFieldInfo& fieldinfo);

  short GetIndexCount();
  void GetIndexInfo(int nIndex, CDaoIndexInfo& indexinfo, DWORD dwInfoOptions = AFX_DAO_PRIMARY_INFO);
  void CreateIndex(CDaoIndexInfo& indexinfo);

  CDaoDatabase* m_pDatabase;

  void* m_pState;   // the engine's (dao_*.cpp)
};

// --- CDaoQueryDef ----------------------------------------------------------------------

class AFX_API CDaoQueryDef : public CObject {
  DECLARE_DYNAMIC(CDaoQueryDef)
public:
  explicit CDaoQueryDef(CDaoDatabase* pDatabase);
  virtual ~CDaoQueryDef();

  // Without a name (or an empty one) a temporary query that is never stored;
  // with a name a stored query, kept by Append.
  virtual void Create(LPCTSTR lpszName = NULL, LPCTSTR lpszSQL = NULL);
  virtual void Append();
  // A stored query (3265 when there is none).
  virtual void Open(LPCTSTR lpszName = NULL);
  virtual void Close();

  BOOL IsOpen() const;
  CString GetName();
  CString GetSQL();
  void SetSQL(LPCTSTR lpszSQL);
  short GetType();
  BOOL GetReturnsRecords();

  short GetFieldCount();
  void GetFieldInfo(int nIndex, CDaoFieldInfo& fieldinfo, DWORD dwInfoOptions = AFX_DAO_PRIMARY_INFO);
  void GetFieldInfo(LPCTSTR lpszName, CDaoFieldInfo& fieldinfo, DWORD dwInfoOptions = AFX_DAO_PRIMARY_INFO);

  // Runs an action query.
  virtual void Execute(int nOptions = dbFailOnError);

  CDaoDatabase* m_pDatabase;

  void* m_pState;   // the engine's (dao_*.cpp)
};

// --- CDaoRecordset ---------------------------------------------------------------------

class AFX_API CDaoRecordset : public CObject {
  DECLARE_DYNAMIC(CDaoRecordset)
public:
  explicit CDaoRecordset(CDaoDatabase* pDatabase = NULL);
  virtual ~CDaoRecordset();   // closes

  // By SQL (or a table name) on m_pDatabase, on a table definition
  // (dbOpenTable), or on a query definition (dbOpenDynaset/dbOpenSnapshot).
  // Stands on the first record (BOF and EOF for none).
  virtual void Open(int nOpenType = AFX_DAO_USE_DEFAULT_TYPE, LPCTSTR lpszSQL = NULL, int nOptions = 0);
  virtual void Open(CDaoTableDef* pTableDef, int nOpenType = dbOpenTable, int nOptions = 0);
  virtual void Open(CDaoQueryDef* pQueryDef, int nOpenType = dbOpenDynaset, int nOptions = 0);
  virtual void Close();

  BOOL IsOpen() const;
  BOOL IsBOF() const;
  BOOL IsEOF() const;
  BOOL CanUpdate() const;
  BOOL CanAppend() const;

  // Records accessed so far (all of them after MoveLast); a table-type
  // recordset knows its count at once.
  long GetRecordCount();

  // Moving without a current record in that direction raises 3021.
  void MoveFirst();
  void MoveNext();
  void MovePrev();
  void MoveLast();
  virtual void Move(long lRows);
  void SetAbsolutePosition(long lPosition);   // 0-based
  long GetAbsolutePosition();                 // -1 without current record

  short GetFieldCount();
  void GetFieldInfo(int nIndex, CDaoFieldInfo& fieldinfo, DWORD dwInfoOptions = AFX_DAO_PRIMARY_INFO);
  void GetFieldInfo(LPCTSTR lpszName, CDaoFieldInfo& fieldinfo, DWORD dwInfoOptions = AFX_DAO_PRIMARY_INFO);

  // The current record's value (3021 without one).
  virtual void GetFieldValue(int nIndex, COleVariant& varValue);
  virtual void GetFieldValue(LPCTSTR lpszName, COleVariant& varValue);
  virtual COleVariant GetFieldValue(int nIndex);
  virtual COleVariant GetFieldValue(LPCTSTR lpszName);

  // Appending (and editing the current record): AddNew or Edit, the values,
  // Update. Text is converted to the field's type; text that does not fit
  // the type (not a number for a number field) raises 3421; text longer than
  // a text field raises 3163.
  virtual void AddNew();
  virtual void Edit();
  virtual void Update();
  virtual void CancelUpdate();
  virtual void Delete();
  virtual void SetFieldValue(int nIndex, const COleVariant& varValue);
  virtual void SetFieldValue(int nIndex, LPCTSTR lpszValue);
  virtual void SetFieldValue(LPCTSTR lpszName, const COleVariant& varValue);
  virtual void SetFieldValue(LPCTSTR lpszName, LPCTSTR lpszValue);
  void SetFieldValueNull(int nIndex);

  CDaoDatabase* m_pDatabase;
  CString m_strSQL;

  void* m_pState;   // the engine's (dao_*.cpp)
};
