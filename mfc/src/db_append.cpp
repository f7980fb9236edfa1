// CRecordset, appending: rows of an appendOnly recordset go into the table
// through one prepared insert. With optimizeBulkAdd they are queued column by
// column and sent as parameter arrays inside transactions that this recordset
// commits itself; a failure rolls back to the last commit and the recordset
// then refuses further rows, so that no row is dropped without an error.
#include "afxdb.h"

#include "db_private.h"

#include <ctype.h>
#include <string.h>

using qodb::StateOf;

namespace {

// The table of "select ... from T ...": T as written, quotes and all.
CString TableOf(const CString& strSQL) {
  LPCSTR pSQL = strSQL;
  LPCSTR pFrom = NULL;
  for (LPCSTR p = pSQL; *p != '\0'; ++p) {
    if (_strnicmp(p, "from", 4) == 0 && p > pSQL && isspace((unsigned char)p[-1]) &&
        (p[4] == '\0' || isspace((unsigned char)p[4]))) {
      pFrom = p + 4;
      break;
    }
  }
  if (pFrom == NULL) return CString();
  while (isspace((unsigned char)*pFrom)) ++pFrom;
  LPCSTR p = pFrom;
  while (*p != '\0' && !isspace((unsigned char)*p) && *p != ';' && *p != ',' && *p != ')') {
    if (*p == '"' || *p == '`' || *p == '[') {
      char chClose = *p == '[' ? ']' : *p;
      for (++p; *p != '\0'; ++p) {
        if (*p != chClose) continue;
        if (chClose != ']' && p[1] == chClose) {
          ++p;   // a doubled quote inside the name
          continue;
        }
        break;
      }
      if (*p != '\0') ++p;
    } else {
      ++p;
    }
  }
  return CString(pFrom, (int)(p - pFrom));
}

SQLSMALLINT WideType(int nColumnType) {
  switch (nColumnType) {
  case SQL_CHAR: return SQL_WCHAR;
  case SQL_VARCHAR: return SQL_WVARCHAR;
  case SQL_LONGVARCHAR: return SQL_WLONGVARCHAR;
  default: return (SQLSMALLINT)nColumnType;
  }
}

} // namespace

void CRecordset::OpenForAppend() {
  qodb::RecordsetState& st = StateOf(m_pState);
  const int nTextForm = m_pDatabase->GetTextForm();
  if (st.strTable.IsEmpty()) st.strTable = TableOf(m_strSQL);
  if (st.strTable.IsEmpty()) {
    CString strError;
    strError.Format("\"%s\" nennt keine Tabelle, an die Zeilen angefügt werden könnten.", (LPCSTR)m_strSQL);
    qodb::Throw(SQL_ERROR, strError);
  }

  // The table's columns, read without reading its rows; a driver that cannot
  // select from a subquery describes the statement itself.
  CString strSQL = m_strSQL;
  strSQL.TrimRight(" \t\r\n;");
  st.sql = qodb::ToDriver(nTextForm, "select * from (" + strSQL + ") qo_columns where 1=0");
  try {
    Execute();
  } catch (CException* e) {
    e->Delete();
    st.sql = qodb::ToDriver(nTextForm, strSQL);
    Execute();
  }
  DescribeColumns();
  CDatabase::FreeStatement(m_hstmt);
  m_hstmt = SQL_NULL_HSTMT;
  st.sql.clear();

  CFieldExchange fx(CFieldExchange::BindFieldToColumn, this);
  DoFieldExchange(&fx);
  ASSERT(!st.bindings.empty());

  // The names as the driver spells them, quoted so that any name works.
  const CString& strQuote = m_pDatabase->m_strIdentifierQuote;
  CString strInsert = "insert into " + st.strTable + " (";
  CString strMarkers;
  for (size_t i = 0; i < st.bindings.size(); ++i) {
    CString strName = st.columns[(size_t)st.bindings[i].nColumn].strName;
    if (!strQuote.IsEmpty()) {
      strName.Replace(strQuote, strQuote + strQuote);
      strName = strQuote + strName + strQuote;
    }
    if (i > 0) {
      strInsert += ", ";
      strMarkers += ", ";
    }
    strInsert += strName;
    strMarkers += '?';
  }
  strInsert += ") values (" + strMarkers + ")";
  std::string insert = qodb::ToDriver(nTextForm, strInsert);
  m_hstmt = m_pDatabase->AllocStatement();
  m_pDatabase->Check(SQLPrepare(m_hstmt, (SQLCHAR*)insert.data(), (SQLINTEGER)insert.size()), m_hstmt,
                     "SQLPrepare");

  st.queue.assign(st.bindings.size(), qodb::QueuedColumn());
  for (qodb::QueuedColumn& column : st.queue) column.nWidest = 0;
  st.pending.assign(st.bindings.size(), std::string());
  // Arrays only inside a transaction of our own: without one, the rows of a
  // failed array before the failing row may or may not be stored, and nobody
  // could say which. A caller's open transaction is not ours to commit.
  st.bBulk = (m_dwOptions & optimizeBulkAdd) != 0 && m_pDatabase->m_nTxnCapable != SQL_TC_NONE &&
             !m_pDatabase->m_bTransactionPending;
  if (st.bBulk) {
    m_pDatabase->SetAutoCommit(FALSE);
    st.bOwnTransaction = true;
  }
  m_bBOF = m_bEOF = TRUE;
}

void CRecordset::RaiseIfFailed() {
  qodb::RecordsetState& st = StateOf(m_pState);
  if (!st.bFailed) return;
  CDBException* pException = qodb::NewException(SQL_ERROR, st.strFailure);
  pException->m_strStateNativeOrigin = st.strFailureState;
  pException->m_strSqlState = st.strFailureSqlState;
  pException->m_lFirstRowNotStored = m_lRowsStored;
  throw pException;
}

void CRecordset::AddNew() {
  ASSERT(m_bOpen && (m_dwOptions & appendOnly) != 0);
  ASSERT(m_pDatabase->CanUpdate());
  RaiseIfFailed();
  CFieldExchange fx(CFieldExchange::MarkForAddNew, this);
  DoFieldExchange(&fx);
  m_bAdding = TRUE;
}

void CRecordset::CancelUpdate() { m_bAdding = FALSE; }

BOOL CRecordset::Update() {
  ASSERT(m_bOpen && (m_dwOptions & appendOnly) != 0);
  ASSERT(m_bAdding);
  qodb::RecordsetState& st = StateOf(m_pState);
  RaiseIfFailed();
  m_bAdding = FALSE;
  for (std::string& value : st.pending) value.clear();
  CFieldExchange fx(CFieldExchange::StoreField, this);
  DoFieldExchange(&fx);

  // The arrays hold every value at the width of the column's longest: send
  // what is queued before this row would make them larger than the bound.
  const size_t nTerm = m_pDatabase->GetTextForm() == CDatabase::textUtf8 ? sizeof(WCHAR) : 1;
  size_t nRowWidth = 0;
  for (size_t i = 0; i < st.queue.size(); ++i) {
    size_t nWidest = st.queue[i].nWidest > st.pending[i].size() ? st.queue[i].nWidest : st.pending[i].size();
    nRowWidth += nWidest + nTerm;
  }
  if (st.lQueued > 0 && (size_t)(st.lQueued + 1) * nRowWidth > qodb::kMaxBatchBytes) SendBatch();

  for (size_t i = 0; i < st.queue.size(); ++i) {
    qodb::QueuedColumn& column = st.queue[i];
    const std::string& value = st.pending[i];
    column.data += value;
    column.lengths.push_back((SQLLEN)value.size());
    if (value.size() > column.nWidest) column.nWidest = value.size();
  }
  ++st.lQueued;
  ++m_lRowsQueued;
  if (!st.bBulk || st.lQueued >= qodb::kBatchRows) SendBatch();
  return TRUE;
}

void CRecordset::SendBatch() {
  qodb::RecordsetState& st = StateOf(m_pState);
  if (st.lQueued == 0) return;
  const BOOL bWide = m_pDatabase->GetTextForm() == CDatabase::textUtf8;
  const size_t nTerm = bWide ? sizeof(WCHAR) : 1;
  const size_t nRows = (size_t)st.lQueued;

  std::vector<std::string> arrays(st.queue.size());
  SQLRETURN rc = SQL_SUCCESS;
  for (size_t i = 0; i < st.queue.size() && SQL_SUCCEEDED(rc); ++i) {
    qodb::QueuedColumn& column = st.queue[i];
    const size_t nWidth = column.nWidest + nTerm;
    std::string& array = arrays[i];
    array.assign(nRows * nWidth, '\0');
    size_t nOffset = 0;
    for (size_t r = 0; r < nRows; ++r) {
      size_t nLength = (size_t)column.lengths[r];
      memcpy(&array[r * nWidth], column.data.data() + nOffset, nLength);
      nOffset += nLength;
    }
    const CRecordset::Binding& binding = st.bindings[i];
    // The column size is what the values need, not what the exchange
    // declared: a longer value is sent whole and the database decides.
    SQLULEN nChars = column.nWidest / (bWide ? sizeof(WCHAR) : 1);
    rc = SQLBindParameter(m_hstmt, (SQLUSMALLINT)(i + 1), SQL_PARAM_INPUT, bWide ? SQL_C_WCHAR : SQL_C_CHAR,
                          bWide ? WideType(binding.nColumnType) : (SQLSMALLINT)binding.nColumnType,
                          nChars > 0 ? nChars : 1, 0, &array[0], (SQLLEN)nWidth, column.lengths.data());
  }
  std::vector<SQLUSMALLINT> status(nRows, (SQLUSMALLINT)0xFFFF);
  if (SQL_SUCCEEDED(rc))
    rc = SQLSetStmtAttr(m_hstmt, SQL_ATTR_PARAM_BIND_TYPE, (SQLPOINTER)(SQLULEN)SQL_PARAM_BIND_BY_COLUMN, 0);
  if (SQL_SUCCEEDED(rc)) rc = SQLSetStmtAttr(m_hstmt, SQL_ATTR_PARAMSET_SIZE, (SQLPOINTER)(SQLULEN)nRows, 0);
  if (SQL_SUCCEEDED(rc)) rc = SQLSetStmtAttr(m_hstmt, SQL_ATTR_PARAM_STATUS_PTR, status.data(), 0);
  if (SQL_SUCCEEDED(rc)) rc = SQLExecute(m_hstmt);
  BOOL bFailed = !SQL_SUCCEEDED(rc) && rc != SQL_NO_DATA;
  // A driver that goes on after a failing row reports it only in the status.
  for (size_t r = 0; r < nRows && !bFailed; ++r) bFailed = status[r] == SQL_PARAM_ERROR;
  CDBException* pException = NULL;
  if (bFailed) {
    pException = new CDBException(rc == SQL_SUCCESS_WITH_INFO || SQL_SUCCEEDED(rc) ? SQL_ERROR : rc);
    pException->BuildErrorString(m_pDatabase, m_hstmt, "SQLExecute");
  }
  // The arrays end with this call: the statement must not keep pointing at them.
  SQLSetStmtAttr(m_hstmt, SQL_ATTR_PARAM_STATUS_PTR, NULL, 0);
  SQLFreeStmt(m_hstmt, SQL_CLOSE);
  SQLFreeStmt(m_hstmt, SQL_RESET_PARAMS);

  for (qodb::QueuedColumn& column : st.queue) {
    column.data.clear();
    column.lengths.clear();
    column.nWidest = 0;
  }
  st.lQueued = 0;
  if (pException != NULL) FailAppend(pException);
  if (st.bOwnTransaction) {
    st.lRowsInTransaction += (long)nRows;
    if (st.lRowsInTransaction >= qodb::kCommitRows) CommitAppended();
  } else {
    m_lRowsStored += (long)nRows;
  }
}

void CRecordset::CommitAppended() {
  qodb::RecordsetState& st = StateOf(m_pState);
  if (!st.bOwnTransaction || st.lRowsInTransaction == 0) return;
  SQLRETURN rc = SQLEndTran(SQL_HANDLE_DBC, m_pDatabase->m_hdbc, SQL_COMMIT);
  if (!SQL_SUCCEEDED(rc)) {
    CDBException* pException = new CDBException(rc);
    pException->BuildErrorString(m_pDatabase, SQL_NULL_HSTMT, "SQLEndTran");
    FailAppend(pException);
  }
  m_lRowsStored += st.lRowsInTransaction;
  st.lRowsInTransaction = 0;
}

void CRecordset::FailAppend(CDBException* pException) {
  qodb::RecordsetState& st = StateOf(m_pState);
  CString strNote;
  if (st.bOwnTransaction) {
    SQLEndTran(SQL_HANDLE_DBC, m_pDatabase->m_hdbc, SQL_ROLLBACK);
    st.lRowsInTransaction = 0;
    pException->m_lFirstRowNotStored = m_lRowsStored;
    strNote.Format("Der %ld. angefügte Datensatz und alle danach wurden nicht gespeichert; die %ld Datensätze "
                   "davor sind gespeichert. Weitere Datensätze nimmt diese Tabelle nicht mehr an.",
                   m_lRowsStored + 1, m_lRowsStored);
    st.bFailed = true;
  } else {
    // One row at a time: only this row is lost, the caller may go on.
    pException->m_lFirstRowNotStored = m_lRowsQueued - 1;
    strNote.Format("Der %ld. angefügte Datensatz wurde nicht gespeichert.", m_lRowsQueued);
  }
  if (!pException->m_strError.IsEmpty()) pException->m_strError += '\n';
  pException->m_strError += strNote;
  if (st.bFailed) {
    st.strFailure = pException->m_strError;
    st.strFailureState = pException->m_strStateNativeOrigin;
    st.strFailureSqlState = pException->m_strSqlState;
  }
  throw pException;
}

void CRecordset::FlushBulkAdd() {
  ASSERT(m_bOpen && (m_dwOptions & appendOnly) != 0);
  RaiseIfFailed();
  SendBatch();
  CommitAppended();
}

void CRecordset::ReleaseAppend() {
  qodb::RecordsetState& st = StateOf(m_pState);
  if (!st.bOwnTransaction) return;
  // Nothing uncommitted is left after a flush; after a failure it was rolled
  // back already. Whatever remains here was never confirmed to anyone.
  if (st.lRowsInTransaction > 0) SQLEndTran(SQL_HANDLE_DBC, m_pDatabase->m_hdbc, SQL_ROLLBACK);
  st.lRowsInTransaction = 0;
  SQLSetConnectAttr(m_pDatabase->m_hdbc, SQL_ATTR_AUTOCOMMIT, (SQLPOINTER)(SQLULEN)SQL_AUTOCOMMIT_ON, 0);
  st.bOwnTransaction = false;
}
