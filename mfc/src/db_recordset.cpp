// CRecordset, reading: a result read forward by the driver and scrolled by the
// layer. Only the current row is held; moving back runs the statement again
// on a new handle and steps forward to the row, so memory does not grow with
// the result.
#include "afxdb.h"

#include "db_private.h"

#include <limits.h>
#include <string.h>

#include <exception>
#include <vector>

using qodb::StateOf;

namespace {

// Reads the whole value of column nColumn (1-based) of the fetched row in
// pieces; FALSE for NULL. Most values fit the first, small piece; for a longer
// one the rest is asked for in one piece when the driver says how long it is
// (some drivers convert the whole value again for every piece).
BOOL ReadValue(CDatabase* pdb, HSTMT hstmt, SQLUSMALLINT nColumn, CString& strValue) {
  const BOOL bWide = pdb->GetTextForm() == CDatabase::textUtf8;
  const SQLSMALLINT nCType = bWide ? SQL_C_WCHAR : SQL_C_CHAR;
  const SQLLEN nTerm = bWide ? (SQLLEN)sizeof(WCHAR) : 1;
  const SQLLEN kMaxPieceBytes = 16 << 20;   // a piece of unknown length
  WCHAR first[2048];                        // WCHAR-aligned
  std::vector<char> heap;
  char* pBuffer = (char*)first;
  SQLLEN nBufferBytes = (SQLLEN)sizeof(first);
  std::string bytes;
  for (;;) {
    SQLLEN nIndicator = 0;
    SQLRETURN rc = SQLGetData(hstmt, nColumn, nCType, pBuffer, nBufferBytes, &nIndicator);
    if (rc == SQL_NO_DATA) break;   // every piece has been read
    pdb->Check(rc, hstmt, "SQLGetData");
    if (nIndicator == SQL_NULL_DATA) {
      strValue.Empty();
      return FALSE;
    }
    SQLLEN nPiece;
    BOOL bMore;
    if (nIndicator != SQL_NO_TOTAL && nIndicator >= 0 && nIndicator <= nBufferBytes - nTerm) {
      nPiece = nIndicator;
      bMore = FALSE;
    } else if (rc == SQL_SUCCESS_WITH_INFO) {
      // Cut at the buffer's end: the driver keeps the rest for the next call.
      nPiece = nBufferBytes - nTerm;
      bMore = TRUE;
    } else if (nIndicator == SQL_NO_TOTAL) {
      nPiece = bWide ? (SQLLEN)(wcsnlen((const WCHAR*)pBuffer, (size_t)(nBufferBytes / nTerm - 1)) * sizeof(WCHAR))
                     : (SQLLEN)strnlen(pBuffer, (size_t)(nBufferBytes - 1));
      bMore = FALSE;
    } else {
      qodb::Throw(SQL_ERROR, "Der ODBC-Treiber hat eine ungültige Länge eines Werts gemeldet.");
    }
    // The indicator is the length still to come: checked before it sizes the next piece.
    SQLLEN nTotal = (SQLLEN)bytes.size() + (bMore && nIndicator != SQL_NO_TOTAL ? nIndicator : nPiece);
    if (nTotal > qodb::kMaxValueBytes) {
      CString strError;
      strError.Format("Ein Wert der Spalte %u ist länger als %ld MB und wird nicht gelesen.", (unsigned)nColumn,
                      (long)(qodb::kMaxValueBytes >> 20));
      qodb::Throw(SQL_ERROR, strError);
    }
    bytes.append(pBuffer, (size_t)nPiece);
    if (!bMore) break;
    SQLLEN nNext = nIndicator != SQL_NO_TOTAL ? nIndicator - nPiece + nTerm
                                               : (nBufferBytes < kMaxPieceBytes / 2 ? nBufferBytes * 2 : kMaxPieceBytes);
    if (nNext < nTerm + 2) nNext = nTerm + 2;
    if (bWide) nNext = (nNext + 1) & ~(SQLLEN)1;
    heap.resize((size_t)nNext);
    pBuffer = heap.data();
    nBufferBytes = nNext;
  }
  if (bWide)
    strValue = qodb::Narrow((const WCHAR*)bytes.data(), (int)(bytes.size() / sizeof(WCHAR)));
  else
    strValue = CString(bytes.data(), (int)bytes.size());
  return TRUE;
}

} // namespace

// ---------------------------------------------------------------------------
// CRecordset
// ---------------------------------------------------------------------------

IMPLEMENT_DYNAMIC(CRecordset, CObject)

CRecordset::CRecordset(CDatabase* pDatabase)
    : m_nFields(0), m_nParams(0), m_pDatabase(pDatabase), m_hstmt(SQL_NULL_HSTMT), m_nDefaultType(snapshot),
      m_bOpen(FALSE), m_bBOF(TRUE), m_bEOF(TRUE), m_dwOptions(none), m_nOpenType(snapshot), m_lCurrentRow(-1),
      m_lRecordCount(0), m_nResultCols(0), m_pState(new qodb::RecordsetState), m_lRowsQueued(0), m_lRowsStored(0),
      m_bAdding(FALSE), m_pNextRecordset(NULL), m_bOwnDatabase(FALSE) {}

CRecordset::~CRecordset() {
  try {
    Close();
  } catch (CException* e) {
    // Whoever needs to know about a lost row calls FlushBulkAdd or Close first.
    e->Delete();
  }
  delete &StateOf(m_pState);
}

CString CRecordset::GetDefaultConnect() { return "ODBC;"; }

CString CRecordset::GetDefaultSQL() { return CString(); }

void CRecordset::DoFieldExchange(CFieldExchange* pFX) { UNUSED(pFX); }

void CRecordset::ThrowDBException(RETCODE nRetCode, HSTMT hstmt) { AfxThrowDBException(nRetCode, m_pDatabase, hstmt); }

BOOL CRecordset::CanUpdate() const {
  return m_bOpen && (m_dwOptions & readOnly) == 0 && m_pDatabase != NULL && m_pDatabase->CanUpdate();
}

BOOL CRecordset::CanAppend() const { return m_bOpen && (m_dwOptions & appendOnly) != 0 && m_pDatabase->CanUpdate(); }

void CRecordset::ResetState() {
  qodb::RecordsetState& st = StateOf(m_pState);
  st = qodb::RecordsetState();
  m_bBOF = m_bEOF = TRUE;
  m_lCurrentRow = -1;
  m_lRecordCount = 0;
  m_nResultCols = 0;
  m_lRowsQueued = 0;
  m_lRowsStored = 0;
  m_bAdding = FALSE;
}

BOOL CRecordset::Open(UINT nOpenType, LPCTSTR lpszSQL, DWORD dwOptions) {
  ASSERT(!m_bOpen);
  ASSERT((dwOptions & (useMultiRowFetch | userAllocMultiRowBuffers)) == 0);
  if (m_pDatabase == NULL) {
    m_pDatabase = new CDatabase;
    m_bOwnDatabase = TRUE;
    try {
      m_pDatabase->OpenEx(GetDefaultConnect(), CDatabase::noOdbcDialog);
    } catch (CException*) {
      delete m_pDatabase;
      m_pDatabase = NULL;
      m_bOwnDatabase = FALSE;
      throw;
    }
  }
  ASSERT(m_pDatabase->IsOpen());
  m_nOpenType = nOpenType == AFX_DB_USE_DEFAULT_TYPE ? m_nDefaultType : nOpenType;
  m_dwOptions = dwOptions;
  ASSERT((dwOptions & appendOnly) == 0 || (dwOptions & readOnly) == 0);

  ResetState();
  // A bare table name stands for all of its rows, as in MFC.
  CString strSQL = lpszSQL != NULL ? lpszSQL : (LPCSTR)GetDefaultSQL();
  strSQL.Trim();
  // A statement may come from a user: none at all is the data source's kind
  // of failure, not a programming error.
  if (strSQL.IsEmpty()) qodb::Throw(SQL_ERROR, "Die SQL-Anweisung ist leer.");
  CString strHead = strSQL.Left(7);
  strHead.MakeLower();
  if (strHead.Left(6) != "select" && strHead.Left(4) != "with" && strHead.Left(1) != "{") {
    StateOf(m_pState).strTable = strSQL;
    strSQL = "select * from " + strSQL;
  }
  m_strSQL = strSQL;

  m_pDatabase->AddRecordset(this);
  m_bOpen = TRUE;
  try {
    if (dwOptions & appendOnly) {
      OpenForAppend();
      return TRUE;
    }
    qodb::RecordsetState& st = StateOf(m_pState);
    st.sql = qodb::ToDriver(m_pDatabase->GetTextForm(), m_strSQL);
    if (st.sql.size() > (size_t)INT_MAX) qodb::Throw(SQL_ERROR, "Die SQL-Anweisung ist zu lang.");
    Execute();
    DescribeColumns();
    CFieldExchange fx(CFieldExchange::BindFieldToColumn, this);
    DoFieldExchange(&fx);
    StepTo(0);
  } catch (CException*) {
    try {
      Close();
    } catch (CException* e) {
      e->Delete();
    }
    throw;
  }
  return TRUE;
}

void CRecordset::Execute() {
  qodb::RecordsetState& st = StateOf(m_pState);
  // A fresh handle for every execution: some drivers return stale rows from
  // a handle that has run a statement before.
  CDatabase::FreeStatement(m_hstmt);
  m_hstmt = SQL_NULL_HSTMT;
  m_hstmt = m_pDatabase->AllocStatement();
  SQLRETURN rc = SQLExecDirect(m_hstmt, (SQLCHAR*)st.sql.data(), (SQLINTEGER)st.sql.size());
  m_pDatabase->Check(rc, m_hstmt, "SQLExecDirect");
  st.lCursorRow = -1;
  st.bCursorAtEnd = false;
}

void CRecordset::DescribeColumns() {
  qodb::RecordsetState& st = StateOf(m_pState);
  SQLSMALLINT nColumns = 0;
  m_pDatabase->Check(SQLNumResultCols(m_hstmt, &nColumns), m_hstmt, "SQLNumResultCols");
  if (nColumns < 0 || nColumns > qodb::kMaxColumns) {
    CString strError;
    strError.Format("Der ODBC-Treiber meldet %d Spalten; mehr als %d werden nicht gelesen.", (int)nColumns,
                    qodb::kMaxColumns);
    qodb::Throw(SQL_ERROR, strError);
  }
  st.columns.clear();
  for (SQLSMALLINT i = 1; i <= nColumns; ++i) {
    std::vector<SQLCHAR> name(256);
    SQLSMALLINT nNameLength = 0;
    qodb::ColumnInfo info;
    SQLRETURN rc = SQLDescribeCol(m_hstmt, (SQLUSMALLINT)i, name.data(), (SQLSMALLINT)name.size(), &nNameLength,
                                  &info.nSQLType, &info.nPrecision, &info.nScale, &info.nNullability);
    m_pDatabase->Check(rc, m_hstmt, "SQLDescribeCol");
    if (nNameLength >= (SQLSMALLINT)name.size() && nNameLength < qodb::kMaxNameBytes) {
      name.assign((size_t)nNameLength + 1, 0);
      rc = SQLDescribeCol(m_hstmt, (SQLUSMALLINT)i, name.data(), (SQLSMALLINT)name.size(), &nNameLength,
                          &info.nSQLType, &info.nPrecision, &info.nScale, &info.nNullability);
      m_pDatabase->Check(rc, m_hstmt, "SQLDescribeCol");
    }
    int nLength = nNameLength < 0 ? 0 : nNameLength;
    if (nLength >= (int)name.size()) nLength = (int)name.size() - 1;
    info.strName = qodb::FromDriver(m_pDatabase->GetTextForm(), (const char*)name.data(), nLength);
    st.columns.push_back(info);
  }
  m_nResultCols = nColumns;
  st.row.assign((size_t)nColumns, CString());
}

void CRecordset::GetODBCFieldInfo(short nIndex, CODBCFieldInfo& fieldinfo) const {
  const qodb::RecordsetState& st = StateOf(m_pState);
  ASSERT(m_bOpen);
  ASSERT(nIndex >= 0 && nIndex < (short)st.columns.size());
  const qodb::ColumnInfo& info = st.columns[(size_t)nIndex];
  fieldinfo.m_strName = info.strName;
  fieldinfo.m_nSQLType = info.nSQLType;
  fieldinfo.m_nPrecision = info.nPrecision;
  fieldinfo.m_nScale = info.nScale;
  fieldinfo.m_nNullability = info.nNullability;
}

void CRecordset::GetODBCFieldInfo(LPCTSTR lpszName, CODBCFieldInfo& fieldinfo) const {
  const qodb::RecordsetState& st = StateOf(m_pState);
  CString strName = qodb::BareName(lpszName);
  for (size_t i = 0; i < st.columns.size(); ++i) {
    if (st.columns[i].strName.CompareNoCase(strName) == 0) {
      GetODBCFieldInfo((short)i, fieldinfo);
      return;
    }
  }
  CString strError;
  strError.Format("Die Spalte \"%s\" gibt es im Ergebnis nicht.", (LPCSTR)strName);
  qodb::Throw(SQL_ERROR, strError);
}

void CRecordset::ReadRow() {
  qodb::RecordsetState& st = StateOf(m_pState);
  for (size_t i = 0; i < st.columns.size(); ++i) ReadValue(m_pDatabase, m_hstmt, (SQLUSMALLINT)(i + 1), st.row[i]);
  st.lRowInCache = st.lCursorRow;
}

BOOL CRecordset::FetchForward() {
  qodb::RecordsetState& st = StateOf(m_pState);
  if (st.bCursorAtEnd || m_nResultCols == 0) {
    st.bCursorAtEnd = true;
  } else {
    SQLRETURN rc = SQLFetch(m_hstmt);
    if (rc != SQL_NO_DATA) {
      m_pDatabase->Check(rc, m_hstmt, "SQLFetch");
      if (st.lCursorRow == LONG_MAX - 1) qodb::Throw(SQL_ERROR, "Das Ergebnis hat zu viele Zeilen.");
      ++st.lCursorRow;
      if (m_lRecordCount < st.lCursorRow + 1) m_lRecordCount = st.lCursorRow + 1;
      return TRUE;
    }
    st.bCursorAtEnd = true;
  }
  st.bAllSeen = true;
  m_lRecordCount = st.lCursorRow + 1;
  return FALSE;
}

void CRecordset::Rewind() {
  qodb::RecordsetState& st = StateOf(m_pState);
  Execute();
  SQLSMALLINT nColumns = 0;
  m_pDatabase->Check(SQLNumResultCols(m_hstmt, &nColumns), m_hstmt, "SQLNumResultCols");
  if (nColumns != m_nResultCols)
    qodb::Throw(SQL_ERROR, "Das Ergebnis hat beim erneuten Ausführen andere Spalten als beim Öffnen.");
  st.lRowInCache = -1;
}

void CRecordset::SetBeforeFirst() {
  m_bBOF = TRUE;
  m_bEOF = m_lRecordCount == 0 && StateOf(m_pState).bAllSeen;
  m_lCurrentRow = -1;
}

void CRecordset::SetAfterLast() {
  m_bEOF = TRUE;
  m_bBOF = m_lRecordCount == 0;
  m_lCurrentRow = m_lRecordCount;
}

// Stands on row nTarget (0-based), reading forward from where the driver's
// cursor is, or from a new execution when the row lies behind it.
void CRecordset::StepTo(long nTarget) {
  qodb::RecordsetState& st = StateOf(m_pState);
  if (nTarget < 0) {
    SetBeforeFirst();
    return;
  }
  if (st.bAllSeen && nTarget >= m_lRecordCount) {
    SetAfterLast();
    return;
  }
  if (nTarget != st.lRowInCache) {
    if (nTarget <= st.lCursorRow || st.bCursorAtEnd) Rewind();
    while (st.lCursorRow < nTarget) {
      if (!FetchForward()) {
        SetAfterLast();
        return;
      }
    }
    ReadRow();
  }
  m_lCurrentRow = nTarget;
  m_bBOF = m_bEOF = FALSE;
  FillBoundFields();
}

void CRecordset::Move(long nRows, WORD wFetchType) {
  ASSERT(m_bOpen);
  ASSERT((m_dwOptions & appendOnly) == 0);
  qodb::RecordsetState& st = StateOf(m_pState);
  // Where the recordset stands: -1 before the first row, the count after the last.
  long nHere = m_bBOF ? -1 : (m_bEOF ? m_lRecordCount : m_lCurrentRow);
  BOOL bForward = wFetchType == SQL_FETCH_NEXT || (wFetchType == SQL_FETCH_RELATIVE && nRows > 0);
  BOOL bBackward = wFetchType == SQL_FETCH_PRIOR || (wFetchType == SQL_FETCH_RELATIVE && nRows < 0);
  if ((bForward && m_bEOF) || (bBackward && m_bBOF)) {
    qodb::Throw(SQL_NO_DATA, bForward ? "Es gibt keinen Datensatz nach dem letzten."
                                      : "Es gibt keinen Datensatz vor dem ersten.");
  }
  switch (wFetchType) {
  case SQL_FETCH_NEXT: StepTo(nHere + 1); break;
  case SQL_FETCH_PRIOR: StepTo(nHere - 1); break;
  case SQL_FETCH_FIRST: StepTo(0); break;
  case SQL_FETCH_RELATIVE: {
    long long nTarget = (long long)nHere + nRows;
    if (nTarget > LONG_MAX) nTarget = LONG_MAX;
    if (nTarget < -1) nTarget = -1;
    StepTo((long)nTarget);
    break;
  }
  case SQL_FETCH_ABSOLUTE:
    if (nRows >= 0) {
      StepTo(nRows - 1L);
      break;
    }
    // Counted from the end: the end must be known first.
    if (!st.bAllSeen) Move(0, SQL_FETCH_LAST);
    StepTo(m_lRecordCount + nRows < -1 ? -1 : m_lRecordCount + nRows);
    break;
  case SQL_FETCH_LAST:
    if (st.bAllSeen) {
      StepTo(m_lRecordCount - 1);
      break;
    }
    // Read every row on the way: the last one is then in hand when the
    // driver says there is no further row.
    if (st.bCursorAtEnd) Rewind();
    while (FetchForward()) ReadRow();
    if (m_lRecordCount == 0) {
      SetAfterLast();
      break;
    }
    m_lCurrentRow = m_lRecordCount - 1;
    m_bBOF = m_bEOF = FALSE;
    FillBoundFields();
    break;
  default:
    ASSERT(FALSE);
  }
}

void CRecordset::GetFieldValue(short nIndex, CString& strValue) {
  const qodb::RecordsetState& st = StateOf(m_pState);
  ASSERT(m_bOpen && (m_dwOptions & appendOnly) == 0);
  ASSERT(nIndex >= 0 && nIndex < (short)st.columns.size());
  ASSERT(!m_bBOF && !m_bEOF);
  strValue = st.row[(size_t)nIndex];
}

void CRecordset::GetFieldValue(LPCTSTR lpszName, CString& strValue) {
  const qodb::RecordsetState& st = StateOf(m_pState);
  CString strName = qodb::BareName(lpszName);
  for (size_t i = 0; i < st.columns.size(); ++i) {
    if (st.columns[i].strName.CompareNoCase(strName) == 0) {
      GetFieldValue((short)i, strValue);
      return;
    }
  }
  CString strError;
  strError.Format("Die Spalte \"%s\" gibt es im Ergebnis nicht.", (LPCSTR)strName);
  qodb::Throw(SQL_ERROR, strError);
}

void CRecordset::Close() {
  if (!m_bOpen) return;
  qodb::RecordsetState& st = StateOf(m_pState);
  // Raised again after cleaning up, as the type it was thrown as.
  std::exception_ptr failure;
  if (m_dwOptions & appendOnly) {
    try {
      if (!st.bFailed) FlushBulkAdd();
    } catch (...) {
      failure = std::current_exception();
    }
    ReleaseAppend();
  }
  CDatabase::FreeStatement(m_hstmt);
  m_hstmt = SQL_NULL_HSTMT;
  m_bOpen = FALSE;
  long lRowsStored = m_lRowsStored;
  ResetState();
  // What was stored stays readable after Close.
  m_lRowsStored = lRowsStored;
  if (m_pDatabase != NULL) {
    m_pDatabase->RemoveRecordset(this);
    if (m_bOwnDatabase) {
      delete m_pDatabase;
      m_pDatabase = NULL;
      m_bOwnDatabase = FALSE;
    }
  }
  if (failure) std::rethrow_exception(failure);
}
