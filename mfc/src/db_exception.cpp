// CDBException: a failure of the data source, with every diagnostic record the
// driver manager and the driver left on the handles involved.
#include "afxdb.h"

#include "db_private.h"

#include <vector>

IMPLEMENT_DYNAMIC(CDBException, CException)

CDBException::CDBException(RETCODE nRetCode) : m_nRetCode(nRetCode), m_lFirstRowNotStored(-1) {}

CDBException::~CDBException() {}

BOOL CDBException::GetErrorMessage(LPSTR lpszError, UINT nMaxError, PUINT pnHelpContext) const {
  if (pnHelpContext != NULL) *pnHelpContext = 0;
  if (lpszError != NULL && nMaxError > 0) lstrcpynA(lpszError, m_strError, (int)nMaxError);
  return !m_strError.IsEmpty();
}

namespace {

// Splits "[unixODBC][Driver Manager]Data source not found" into the origin
// ("[unixODBC][Driver Manager]") and the text a user reads, as MFC reports them.
void SplitOrigin(const CString& strMessage, CString& strOrigin, CString& strText) {
  int nPos = 0;
  while (nPos < strMessage.GetLength() && strMessage[nPos] == '[') {
    int nEnd = strMessage.Find(']', nPos);
    if (nEnd < 0) break;
    nPos = nEnd + 1;
  }
  strOrigin = strMessage.Left(nPos);
  strText = strMessage.Mid(nPos);
  strText.TrimRight();
}

void ReadRecords(CDBException* pException, SQLSMALLINT nHandleType, SQLHANDLE hHandle, int nTextForm) {
  if (hHandle == SQL_NULL_HANDLE) return;
  for (SQLSMALLINT nRecord = 1; nRecord <= qodb::kMaxDiagRecords; ++nRecord) {
    SQLCHAR szState[SQL_SQLSTATE_SIZE + 1] = {0};
    SQLINTEGER nNative = 0;
    std::vector<SQLCHAR> text(512);
    SQLSMALLINT nTextLength = 0;
    SQLRETURN rc = SQLGetDiagRec(nHandleType, hHandle, nRecord, szState, &nNative, text.data(),
                                 (SQLSMALLINT)text.size(), &nTextLength);
    if (rc == SQL_SUCCESS_WITH_INFO && nTextLength >= (SQLSMALLINT)text.size()) {
      // The text was cut: ask again with room for all of it (within bounds).
      SQLSMALLINT nWanted = nTextLength < qodb::kMaxDiagText ? (SQLSMALLINT)(nTextLength + 1) : qodb::kMaxDiagText;
      text.assign((size_t)nWanted, 0);
      rc = SQLGetDiagRec(nHandleType, hHandle, nRecord, szState, &nNative, text.data(), nWanted, &nTextLength);
    }
    if (rc != SQL_SUCCESS && rc != SQL_SUCCESS_WITH_INFO) break;
    int nLength = nTextLength < 0 ? 0 : nTextLength;
    if (nLength >= (int)text.size()) nLength = (int)text.size() - 1;
    CString strOrigin, strText;
    SplitOrigin(qodb::FromDriver(nTextForm, (const char*)text.data(), nLength), strOrigin, strText);
    CString strState((LPCSTR)szState);
    if (pException->m_strSqlState.IsEmpty() && pException->m_strStateNativeOrigin.IsEmpty())
      pException->m_strSqlState = strState;
    if (!pException->m_strError.IsEmpty()) pException->m_strError += '\n';
    pException->m_strError += strText;
    CString strRecord;
    strRecord.Format("State:%s,Native:%ld,Origin:%s\n", (LPCSTR)strState, (long)nNative, (LPCSTR)strOrigin);
    pException->m_strStateNativeOrigin += strRecord;
  }
}

} // namespace

void CDBException::BuildErrorString(CDatabase* pdb, HSTMT hstmt, LPCSTR lpszCall) {
  int nTextForm = pdb != NULL ? pdb->GetTextForm() : CDatabase::textBytes;
  ReadRecords(this, SQL_HANDLE_STMT, hstmt, nTextForm);
  if (pdb != NULL) ReadRecords(this, SQL_HANDLE_DBC, pdb->m_hdbc, nTextForm);
  ReadRecords(this, SQL_HANDLE_ENV, qodb::Environment(), nTextForm);
  if (m_strError.IsEmpty()) {
    // A driver that fails without saying why: at least name the call.
    if (m_nRetCode == SQL_INVALID_HANDLE)
      m_strError.Format("%s: ungültiges ODBC-Handle.", lpszCall != NULL ? lpszCall : "ODBC");
    else
      m_strError.Format("%s ist ohne Fehlermeldung des Treibers fehlgeschlagen (Rückgabewert %d).",
                        lpszCall != NULL ? lpszCall : "Ein ODBC-Aufruf", (int)m_nRetCode);
  }
}

void AFXAPI AfxThrowDBException(RETCODE nRetCode, CDatabase* pdb, HSTMT hstmt) {
  CDBException* pException = new CDBException(nRetCode);
  pException->BuildErrorString(pdb, hstmt);
  throw pException;
}

namespace qodb {

CDBException* NewException(RETCODE nRetCode, const CString& strError) {
  CDBException* pException = new CDBException(nRetCode);
  pException->m_strError = strError;
  return pException;
}

void Throw(RETCODE nRetCode, const CString& strError) { throw NewException(nRetCode, strError); }

} // namespace qodb
