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
  std::string insert = qodb::ToDriver(nTextForm, strInsert + ") values (" + strMarkers + ")");
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
    PrepareMultiRowInsert(strInsert, strMarkers);
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
  const size_t nTerm = 1;
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

void CRecordset::PrepareMultiRowInsert(const CString& strInsert, const CString& strMarkers) {
  qodb::RecordsetState& st = StateOf(m_pState);
  st.nRowsPerInsert = 1;
  // SQLite and PostgreSQL take "values (...), (...)". The SQLite driver
  // parses its statement again for every row of a parameter array, and the
  // PostgreSQL driver sends every row as a statement of its own: many rows
  // per statement cut that to a fraction (measured: SQLite 6.8 s -> 4.3 s,
  // PostgreSQL 20.5 s -> 11.8 s for 1,000,000 rows of 10 columns). Both take
  // 32766 markers and more in one statement; the rows per insert divide the
  // batch evenly.
  CString strDBMS = m_pDatabase->GetDatabaseName();
  strDBMS.MakeLower();
  if (!st.bBulk || (strDBMS.Find("sqlite") < 0 && strDBMS.Find("postgres") < 0)) return;
  const long nColumns = (long)st.bindings.size();
  // A few dozen rows per statement: neither gains beyond that.
  long nRows = 50;
  while (nRows > 1 && (nRows * nColumns > 32000 || qodb::kBatchRows % nRows != 0)) --nRows;
  if (nRows <= 1) return;
  CString strValues = strInsert + ") values ";
  for (long r = 0; r < nRows; ++r) {
    if (r > 0) strValues += ", ";
    strValues += "(" + strMarkers + ")";
  }
  std::string multi = qodb::ToDriver(m_pDatabase->GetTextForm(), strValues);
  st.hMulti = m_pDatabase->AllocStatement();
  SQLRETURN rc = SQLPrepare(st.hMulti, (SQLCHAR*)multi.data(), (SQLINTEGER)multi.size());
  if (!SQL_SUCCEEDED(rc)) {
    // Rows one by one then: slower, never wrong.
    CDatabase::FreeStatement(st.hMulti);
    st.hMulti = SQL_NULL_HSTMT;
    return;
  }
  st.nRowsPerInsert = nRows;
}

// Lays out the batch for the widths the queued values need, growing only;
// answers whether the layout changed (the arrays must then be bound anew).
static bool LayOut(qodb::RecordsetState& st, long nRows) {
  const size_t nColumns = st.queue.size();
  bool bChanged = st.widths.size() != nColumns;
  if (bChanged) st.widths.assign(nColumns, 0);
  for (size_t i = 0; i < nColumns; ++i) {
    if (st.queue[i].nWidest > st.widths[i]) {
      // Room to grow, so that a slightly longer value does not lay out again.
      size_t nWidth = st.queue[i].nWidest + st.queue[i].nWidest / 2;
      st.widths[i] = nWidth < 16 ? 16 : nWidth;
      bChanged = true;
    }
  }
  if (bChanged) {
    st.valueOffsets.resize(nColumns);
    st.lengthOffsets.resize(nColumns);
    size_t nOffset = 0;
    for (size_t i = 0; i < nColumns; ++i) {
      st.valueOffsets[i] = nOffset;
      nOffset += st.widths[i] + 1;
    }
    nOffset = (nOffset + sizeof(SQLLEN) - 1) / sizeof(SQLLEN) * sizeof(SQLLEN);
    for (size_t i = 0; i < nColumns; ++i) {
      st.lengthOffsets[i] = nOffset;
      nOffset += sizeof(SQLLEN);
    }
    st.nRowBytes = nOffset;
  }
  size_t nBytes = st.nRowBytes * (size_t)nRows;
  if (st.rows.size() < nBytes) {
    st.rows.resize(nBytes);
    bChanged = true;   // the arrays moved
  }
  return bChanged;
}

void CRecordset::SendBatch() {
  qodb::RecordsetState& st = StateOf(m_pState);
  if (st.lQueued == 0) return;
  const size_t nRows = (size_t)st.lQueued;
  const size_t nColumns = st.queue.size();
  if (LayOut(st, st.lQueued)) st.bMultiBound = false;

  // Row-wise, as the driver reads a parameter array bound by rows.
  for (size_t i = 0; i < nColumns; ++i) {
    qodb::QueuedColumn& column = st.queue[i];
    const char* pData = column.data.data();
    char* pRow = st.rows.data();
    for (size_t r = 0; r < nRows; ++r, pRow += st.nRowBytes) {
      size_t nLength = (size_t)column.lengths[r];
      memcpy(pRow + st.valueOffsets[i], pData, nLength);
      pRow[st.valueOffsets[i] + nLength] = '\0';
      *(SQLLEN*)(pRow + st.lengthOffsets[i]) = (SQLLEN)nLength;
      pData += nLength;
    }
  }

  // Binds every marker of `hstmt` (nRowsPerSet rows of markers) to the rows
  // starting at nFirstRow; one parameter set spans nRowsPerSet rows.
  auto bind = [&](HSTMT hstmt, long nRowsPerSet, size_t nFirstRow) -> SQLRETURN {
    SQLRETURN rc = SQLFreeStmt(hstmt, SQL_RESET_PARAMS);
    for (long r = 0; r < nRowsPerSet && SQL_SUCCEEDED(rc); ++r) {
      char* pRow = st.rows.data() + (nFirstRow + (size_t)r) * st.nRowBytes;
      for (size_t i = 0; i < nColumns && SQL_SUCCEEDED(rc); ++i) {
        const CRecordset::Binding& binding = st.bindings[i];
        // The column size is what the values need, not what the exchange
        // declared: a longer value is sent whole and the database decides.
        rc = SQLBindParameter(hstmt, (SQLUSMALLINT)((size_t)r * nColumns + i + 1), SQL_PARAM_INPUT, SQL_C_CHAR,
                              (SQLSMALLINT)binding.nColumnType, st.widths[i], 0, pRow + st.valueOffsets[i],
                              (SQLLEN)(st.widths[i] + 1), (SQLLEN*)(pRow + st.lengthOffsets[i]));
      }
    }
    if (SQL_SUCCEEDED(rc))
      rc = SQLSetStmtAttr(hstmt, SQL_ATTR_PARAM_BIND_TYPE, (SQLPOINTER)(SQLULEN)(st.nRowBytes * (size_t)nRowsPerSet),
                          0);
    return rc;
  };
  // Runs `hstmt` for nSets parameter sets; a failing set counts as failure
  // also where the driver goes on after it. The diagnostics are read at once:
  // every later call on the handle (even resetting an attribute) clears them,
  // and the server's own words would be lost.
  std::vector<SQLUSMALLINT> status;
  CDBException* pException = NULL;
  auto execute = [&](HSTMT hstmt, size_t nSets, SQLRETURN rc) -> SQLRETURN {
    status.assign(nSets, (SQLUSMALLINT)0xFFFF);
    LPCSTR lpszCall = "SQLBindParameter";
    if (SQL_SUCCEEDED(rc)) rc = SQLSetStmtAttr(hstmt, SQL_ATTR_PARAMSET_SIZE, (SQLPOINTER)(SQLULEN)nSets, 0);
    if (SQL_SUCCEEDED(rc)) rc = SQLSetStmtAttr(hstmt, SQL_ATTR_PARAM_STATUS_PTR, status.data(), 0);
    if (SQL_SUCCEEDED(rc)) {
      lpszCall = "SQLExecute";
      rc = SQLExecute(hstmt);
    }
    BOOL bFailed = !SQL_SUCCEEDED(rc) && rc != SQL_NO_DATA;
    for (size_t r = 0; r < nSets && !bFailed; ++r) bFailed = status[r] == SQL_PARAM_ERROR;
    if (bFailed) {
      pException = new CDBException(rc == SQL_SUCCESS_WITH_INFO || SQL_SUCCEEDED(rc) ? SQL_ERROR : rc);
      pException->BuildErrorString(m_pDatabase, hstmt, lpszCall);
    }
    // The status array ends with this call: the statement must not keep it.
    SQLSetStmtAttr(hstmt, SQL_ATTR_PARAM_STATUS_PTR, NULL, 0);
    SQLFreeStmt(hstmt, SQL_CLOSE);
    return bFailed ? SQL_ERROR : SQL_SUCCESS;
  };

  SQLRETURN rc = SQL_SUCCESS;
  const size_t nPerInsert = (size_t)st.nRowsPerInsert;
  const size_t nMultiRows = st.hMulti != SQL_NULL_HSTMT ? nRows / nPerInsert * nPerInsert : 0;
  if (nMultiRows > 0) {
    SQLRETURN rcBind = SQL_SUCCESS;
    if (!st.bMultiBound) {
      rcBind = bind(st.hMulti, st.nRowsPerInsert, 0);
      st.bMultiBound = SQL_SUCCEEDED(rcBind);
    }
    rc = execute(st.hMulti, nMultiRows / nPerInsert, rcBind);
  }
  if (rc == SQL_SUCCESS && nMultiRows < nRows) rc = execute(m_hstmt, nRows - nMultiRows, bind(m_hstmt, 1, nMultiRows));

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
  if (st.hMulti != SQL_NULL_HSTMT) {
    CDatabase::FreeStatement(st.hMulti);
    st.hMulti = SQL_NULL_HSTMT;
  }
  st.bMultiBound = false;
  if (!st.bOwnTransaction) return;
  // Nothing uncommitted is left after a flush; after a failure it was rolled
  // back already. Whatever remains here was never confirmed to anyone.
  if (st.lRowsInTransaction > 0) SQLEndTran(SQL_HANDLE_DBC, m_pDatabase->m_hdbc, SQL_ROLLBACK);
  st.lRowsInTransaction = 0;
  SQLSetConnectAttr(m_pDatabase->m_hdbc, SQL_ATTR_AUTOCOMMIT, (SQLPOINTER)(SQLULEN)SQL_AUTOCOMMIT_ON, 0);
  st.bOwnTransaction = false;
}
