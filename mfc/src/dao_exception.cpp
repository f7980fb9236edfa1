// CDaoException and the engine's ways of raising it. Every failure that leaves
// a DAO class is a CDaoException: the ODBC layer's CDBException is turned into
// one carrying the driver's text, so callers catch one kind only.
#include "dao_private.h"

IMPLEMENT_DYNAMIC(CDaoException, CException)

CDaoException::CDaoException() : m_pErrorInfo(NULL), m_scode(S_OK), m_nAfxDaoError(NO_AFX_DAO_ERROR) {}

CDaoException::~CDaoException() { delete m_pErrorInfo; }

BOOL CDaoException::GetErrorMessage(LPSTR lpszError, UINT nMaxError, PUINT pnHelpContext) const {
  if (pnHelpContext != NULL) *pnHelpContext = m_pErrorInfo != NULL ? (UINT)m_pErrorInfo->m_lHelpContext : 0;
  CString strText;
  if (m_pErrorInfo != NULL)
    strText = m_pErrorInfo->m_strDescription;
  else if (m_nAfxDaoError == AFX_DAO_ERROR_OBJECT_NOT_OPEN)
    strText = "Das DAO-Objekt ist nicht geöffnet.";
  else if (m_nAfxDaoError != NO_AFX_DAO_ERROR)
    strText.Format("DAO-Fehler %d.", m_nAfxDaoError);
  if (lpszError != NULL && nMaxError > 0) lstrcpynA(lpszError, strText, (int)nMaxError);
  return !strText.IsEmpty();
}

// The engine keeps the one error of the failed operation in m_pErrorInfo.
short CDaoException::GetErrorCount() { return m_pErrorInfo != NULL ? 1 : 0; }

void CDaoException::GetErrorInfo(int nIndex) { ASSERT(nIndex == 0 && m_pErrorInfo != NULL); }

void AFXAPI AfxThrowDaoException(int nAfxDaoError, SCODE scode) {
  CDaoException* pException = new CDaoException;
  pException->m_nAfxDaoError = nAfxDaoError;
  pException->m_scode = scode;
  throw pException;
}

void AFXAPI AfxThrowDaoError(long lErrorCode, LPCTSTR lpszDescription) {
  CDaoException* pException = new CDaoException;
  pException->m_scode = E_FAIL;
  CDaoErrorInfo* pInfo = new CDaoErrorInfo;
  pInfo->m_lErrorCode = lErrorCode;
  pInfo->m_strSource = "DAO.Database";
  pInfo->m_strDescription = lpszDescription != NULL ? lpszDescription : "";
  pInfo->m_lHelpContext = 0;
  pException->m_pErrorInfo = pInfo;
  throw pException;
}

CDaoIndexInfo::CDaoIndexInfo()
    : m_pFieldInfos(NULL), m_nFields(0), m_bPrimary(FALSE), m_bUnique(FALSE), m_bClustered(FALSE),
      m_bIgnoreNulls(FALSE), m_bRequired(FALSE), m_bForeign(FALSE), m_lDistinctCount(0), m_bCleanupFieldInfo(FALSE) {}

CDaoIndexInfo::~CDaoIndexInfo() {
  if (m_bCleanupFieldInfo) delete[] m_pFieldInfos;
}

namespace qodao {

void Throw(long lCode, const CString& strDescription) {
  AfxThrowDaoError(lCode, strDescription);
  __builtin_unreachable();
}

void ThrowFromDb(CDBException* e) {
  CString strText = e->m_strError;
  if (strText.IsEmpty()) strText = "Die Datenquelle hat einen Fehler ohne Meldung gemeldet.";
  long lFirst = e->m_lFirstRowNotStored;
  e->Delete();
  long lCode = 3146;   // DAO's number for a failure reported by an ODBC data source
  if (strText.Find("database is locked") >= 0) {
    CString strTwice = FilesOpenTwice();
    if (!strTwice.IsEmpty()) {
      // The usual cause: the same file is the input of the running conversion.
      CString strFull;
      strFull.Format("Could not update; currently locked. Die Datenbankdatei '%s' ist in diesem Programm zugleich "
                     "zum Lesen geöffnet (etwa als Eingabe); solange sie dort gelesen wird, kann sie nicht "
                     "geschrieben werden. Schreiben Sie in eine andere Datei.",
                     (LPCSTR)strTwice);
      strText = strFull;
      lCode = 3218;
    }
  }
  if (lFirst >= 0) {
    CString strFull;
    strFull.Format("Der Datensatz %ld und alle folgenden wurden nicht gespeichert: %s", lFirst + 1, (LPCSTR)strText);
    strText = strFull;
  }
  Throw(lCode, strText);
}

void ThrowReadOnly() { Throw(3027, "Cannot update. Database or object is read-only."); }

void ThrowNoCurrentRecord() { Throw(3021, "No current record."); }

} // namespace qodao
