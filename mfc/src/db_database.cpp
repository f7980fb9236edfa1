// CDatabase: one ODBC connection. Besides connecting, it decides how text
// travels to the driver (see OpenEx) and prepares the connect string so that
// the drivers of the host system find their files and read with flat memory.
#include "afxdb.h"

#include "db_private.h"

#include <limits.h>

#include <vector>

namespace qodb {

HENV Environment() {
  // Made once for the process; a function-local static is initialised by one
  // thread while the others wait.
  static HENV s_henv = [] {
    SQLHENV henv = SQL_NULL_HENV;
    if (!SQL_SUCCEEDED(SQLAllocHandle(SQL_HANDLE_ENV, SQL_NULL_HANDLE, &henv))) return (HENV)SQL_NULL_HENV;
    if (!SQL_SUCCEEDED(SQLSetEnvAttr(henv, SQL_ATTR_ODBC_VERSION, (SQLPOINTER)(SQLULEN)SQL_OV_ODBC3, 0))) {
      SQLFreeHandle(SQL_HANDLE_ENV, henv);
      return (HENV)SQL_NULL_HENV;
    }
    return (HENV)henv;
  }();
  return s_henv;
}

} // namespace qodb

namespace {

// One "key=value" of a connect string; a braced value keeps ';' and '='.
struct ConnectPair {
  CString strKey;
  CString strValue;
  bool bBraced;
};

std::vector<ConnectPair> ParseConnect(const CString& strConnect) {
  std::vector<ConnectPair> pairs;
  LPCSTR p = strConnect;
  while (*p != '\0') {
    while (*p == ';' || *p == ' ') ++p;
    if (*p == '\0') break;
    ConnectPair pair;
    pair.bBraced = false;
    LPCSTR pKey = p;
    while (*p != '\0' && *p != '=' && *p != ';') ++p;
    pair.strKey = CString(pKey, (int)(p - pKey));
    pair.strKey.Trim();
    if (*p == '=') {
      ++p;
      if (*p == '{') {
        // "}}" inside braces stands for one '}'.
        pair.bBraced = true;
        ++p;
        while (*p != '\0') {
          if (*p == '}') {
            if (p[1] == '}') {
              pair.strValue += '}';
              p += 2;
              continue;
            }
            ++p;
            break;
          }
          pair.strValue += *p++;
        }
        while (*p != '\0' && *p != ';') ++p;
      } else {
        LPCSTR pValue = p;
        while (*p != '\0' && *p != ';') ++p;
        pair.strValue = CString(pValue, (int)(p - pValue));
      }
    }
    pairs.push_back(pair);
  }
  return pairs;
}

CString JoinConnect(const std::vector<ConnectPair>& pairs) {
  CString strConnect;
  for (const ConnectPair& pair : pairs) {
    if (!strConnect.IsEmpty()) strConnect += ';';
    strConnect += pair.strKey;
    strConnect += '=';
    CString strTrimmed = pair.strValue;
    strTrimmed.Trim();
    if (pair.bBraced || pair.strValue.FindOneOf(";{}") >= 0 || pair.strValue != strTrimmed) {
      CString strValue = pair.strValue;
      strValue.Replace("}", "}}");
      strConnect += '{' + strValue + '}';
    } else {
      strConnect += pair.strValue;
    }
  }
  return strConnect;
}

const ConnectPair* FindKey(const std::vector<ConnectPair>& pairs, LPCSTR lpszKey) {
  for (const ConnectPair& pair : pairs)
    if (pair.strKey.CompareNoCase(lpszKey) == 0) return &pair;
  return NULL;
}

typedef char*(CDECL* WineUnixFileName)(LPCWSTR);

// Wine's own export: present only when the program runs under Wine.
WineUnixFileName GetWineUnixFileName() {
  HMODULE hKernel = GetModuleHandleA("kernel32");
  return hKernel == NULL ? NULL : (WineUnixFileName)(void*)GetProcAddress(hKernel, "wine_get_unix_file_name");
}

BOOL IsWindowsAbsolute(const CString& str) {
  return str.GetLength() >= 3 && isalpha((unsigned char)str[0]) && str[1] == ':' && (str[2] == '\\' || str[2] == '/');
}

// A relative file name: not absolute, no drive, no URI or special name
// (":memory:", "file:..."), and not a host path already.
BOOL IsRelativePath(const CString& str) {
  return !str.IsEmpty() && str[0] != '/' && str[0] != '\\' && str.Find(':') < 0;
}

// The host's path of a Windows path (UTF-8, as the host's drivers take it);
// the path unchanged when Wine cannot map it.
CString ToUnixPath(WineUnixFileName pfn, const CString& strPath) {
  char szFull[MAX_PATH * 4];
  DWORD nFull = GetFullPathNameA(strPath, (DWORD)sizeof(szFull), szFull, NULL);
  if (nFull == 0 || nFull >= sizeof(szFull)) return strPath;
  std::wstring wide = qodb::Widen(szFull, (int)nFull);
  char* pUnix = pfn(wide.c_str());
  if (pUnix == NULL) return strPath;
  CString strUnix(pUnix);
  HeapFree(GetProcessHeap(), 0, pUnix);
  return strUnix;
}

// The connect string as the driver should get it: file paths of the host
// system under Wine, and the keys that keep reading a large result in flat
// memory for the drivers known to need them.
CString PrepareConnect(const CString& strConnect) {
  std::vector<ConnectPair> pairs = ParseConnect(strConnect);
  if (WineUnixFileName pfn = GetWineUnixFileName()) {
    // A server database has a name, not a file: only values of file
    // databases are taken as relative paths.
    BOOL bServer = FindKey(pairs, "Server") != NULL || FindKey(pairs, "Servername") != NULL ||
                   FindKey(pairs, "Host") != NULL;
    for (ConnectPair& pair : pairs) {
      if (pair.strKey.CompareNoCase("Database") != 0 && pair.strKey.CompareNoCase("DBQ") != 0) continue;
      if (IsWindowsAbsolute(pair.strValue) || (!bServer && IsRelativePath(pair.strValue))) {
        pair.strValue = ToUnixPath(pfn, pair.strValue);
        // Drivers differ in reading braces (SQLite's takes them as part of
        // the name): a host path gets them only when it needs them.
        pair.bBraced = false;
      }
    }
  }
  if (const ConnectPair* pDriver = FindKey(pairs, "Driver")) {
    CString strDriver = pDriver->strValue;
    strDriver.MakeLower();
    // Without these the SQLite driver holds a whole result in memory, and the
    // PostgreSQL driver does the same.
    if (strDriver.Find("sqlite") >= 0 && FindKey(pairs, "StepAPI") == NULL) pairs.push_back({"StepAPI", "1", false});
    if (strDriver.Find("postgres") >= 0 && FindKey(pairs, "UseDeclareFetch") == NULL) {
      pairs.push_back({"UseDeclareFetch", "1", false});
      if (FindKey(pairs, "Fetch") == NULL) pairs.push_back({"Fetch", "10000", false});
    }
  }
  return JoinConnect(pairs);
}

CString GetInfoText(HDBC hdbc, SQLUSMALLINT nInfo) {
  char szValue[256] = {0};
  SQLSMALLINT nLength = 0;
  if (!SQL_SUCCEEDED(SQLGetInfo(hdbc, nInfo, szValue, (SQLSMALLINT)sizeof(szValue), &nLength))) return CString();
  if (nLength < 0) nLength = 0;
  if (nLength >= (SQLSMALLINT)sizeof(szValue)) nLength = (SQLSMALLINT)(sizeof(szValue) - 1);
  return CString(szValue, lstrlenA(szValue) < nLength ? lstrlenA(szValue) : nLength);
}

} // namespace

// ---------------------------------------------------------------------------

IMPLEMENT_DYNAMIC(CDatabase, CObject)

CDatabase::CDatabase()
    : m_hdbc(SQL_NULL_HDBC), m_dwLoginTimeout(15), m_dwQueryTimeout(0), m_nTextForm(textBytes),
      m_bTransactionPending(FALSE), m_bUpdatable(FALSE), m_nTxnCapable(SQL_TC_NONE), m_bReadOnlyRequested(FALSE),
      m_pFirstRecordset(NULL) {}

CDatabase::~CDatabase() { Close(); }

BOOL CDatabase::Open(LPCTSTR lpszDSN, BOOL bExclusive, BOOL bReadOnly, LPCTSTR lpszConnect, BOOL bUseCursorLib) {
  CString strConnect = lpszConnect != NULL ? lpszConnect : "";
  if (strConnect.Left(5).CompareNoCase("ODBC;") == 0) strConnect = strConnect.Mid(5);
  if (lpszDSN != NULL && *lpszDSN != '\0' && FindKey(ParseConnect(strConnect), "DSN") == NULL) {
    CString strDSN = CString("DSN=") + lpszDSN;
    strConnect = strConnect.IsEmpty() ? strDSN : strDSN + ";" + strConnect;
  }
  DWORD dwOptions = noOdbcDialog;
  if (bExclusive) dwOptions |= openExclusive;
  if (bReadOnly) dwOptions |= openReadOnly;
  if (bUseCursorLib) dwOptions |= useCursorLib;
  return OpenEx(strConnect, dwOptions);
}

BOOL CDatabase::OpenEx(LPCTSTR lpszConnectString, DWORD dwOptions) {
  ASSERT(!IsOpen());
  ASSERT((dwOptions & openExclusive) == 0);
  CString strConnect = lpszConnectString != NULL ? lpszConnectString : "";
  if (strConnect.Left(5).CompareNoCase("ODBC;") == 0) strConnect = strConnect.Mid(5);
  strConnect = PrepareConnect(strConnect);

  HENV henv = qodb::Environment();
  if (henv == SQL_NULL_HENV) qodb::Throw(SQL_ERROR, "Die ODBC-Umgebung konnte nicht angelegt werden.");
  SQLHDBC hdbc = SQL_NULL_HDBC;
  SQLRETURN rc = SQLAllocHandle(SQL_HANDLE_DBC, henv, &hdbc);
  Check(rc, SQL_NULL_HSTMT, "SQLAllocHandle");
  m_hdbc = (HDBC)hdbc;
  m_bReadOnlyRequested = (dwOptions & openReadOnly) != 0;
  try {
    if (m_dwLoginTimeout != 0)
      SQLSetConnectAttr(m_hdbc, SQL_ATTR_LOGIN_TIMEOUT, (SQLPOINTER)(SQLULEN)m_dwLoginTimeout, 0);
    if (m_bReadOnlyRequested)
      SQLSetConnectAttr(m_hdbc, SQL_ATTR_ACCESS_MODE, (SQLPOINTER)(SQLULEN)SQL_MODE_READ_ONLY, 0);
    BOOL bDialog = (dwOptions & forceOdbcDialog) != 0;
    std::vector<SQLCHAR> completed(8192, 0);
    SQLSMALLINT nCompleted = 0;
    rc = SQLDriverConnect(m_hdbc, bDialog ? GetDesktopWindow() : NULL, (SQLCHAR*)(LPCSTR)strConnect, SQL_NTS,
                          completed.data(), (SQLSMALLINT)completed.size(), &nCompleted,
                          bDialog ? SQL_DRIVER_PROMPT : SQL_DRIVER_NOPROMPT);
    if (rc == SQL_NO_DATA) {
      // The user cancelled the driver's dialog.
      SQLFreeHandle(SQL_HANDLE_DBC, m_hdbc);
      m_hdbc = SQL_NULL_HDBC;
      return FALSE;
    }
    Check(rc, SQL_NULL_HSTMT, "SQLDriverConnect");
    if (nCompleted > 0 && nCompleted < (SQLSMALLINT)completed.size())
      m_strConnect = CString((LPCSTR)completed.data(), nCompleted);
    else
      m_strConnect = strConnect;

    m_strDBMS = GetInfoText(m_hdbc, SQL_DBMS_NAME);
    CString strDBMS = m_strDBMS;
    strDBMS.MakeLower();
    SQLUSMALLINT nTxn = SQL_TC_NONE;
    if (!SQL_SUCCEEDED(SQLGetInfo(m_hdbc, SQL_TXN_CAPABLE, &nTxn, sizeof(nTxn), NULL))) nTxn = SQL_TC_NONE;
    m_nTxnCapable = nTxn;
    m_strIdentifierQuote = GetInfoText(m_hdbc, SQL_IDENTIFIER_QUOTE_CHAR);
    if (m_strIdentifierQuote == " ") m_strIdentifierQuote.Empty();
    m_bUpdatable = !m_bReadOnlyRequested && GetInfoText(m_hdbc, SQL_DATA_SOURCE_READ_ONLY) != "Y";

    if (strDBMS.Find("sqlite") >= 0) {
      m_nTextForm = textUtf8;
      // NoTXN=1 makes the SQLite driver commit every statement while it
      // still says it has transactions: a rollback would undo nothing.
      const ConnectPair* pNoTxn = FindKey(ParseConnect(m_strConnect), "NoTXN");
      if (pNoTxn != NULL && !pNoTxn->strValue.IsEmpty() && pNoTxn->strValue != "0") m_nTxnCapable = SQL_TC_NONE;
      // The SQLite driver takes no access mode: the database itself refuses
      // writes for this connection.
      if (m_bReadOnlyRequested) ExecuteSQL("PRAGMA query_only = 1");
    } else if (strDBMS.Find("postgres") >= 0) {
      // The ANSI driver passes bytes through: make the server read and write
      // them as Windows-1252.
      ExecuteSQL("SET client_encoding TO 'WIN1252'");
    }
  } catch (CException*) {
    SQLDisconnect(m_hdbc);
    SQLFreeHandle(SQL_HANDLE_DBC, m_hdbc);
    m_hdbc = SQL_NULL_HDBC;
    m_nTextForm = textBytes;
    throw;
  }
  return TRUE;
}

void CDatabase::Close() {
  while (m_pFirstRecordset != NULL) {
    CRecordset* pSet = m_pFirstRecordset;
    // A recordset that made this connection itself must not delete it while
    // it is being closed here.
    pSet->m_bOwnDatabase = FALSE;
    try {
      pSet->Close();
    } catch (CException* e) {
      e->Delete();
    }
    if (m_pFirstRecordset == pSet) RemoveRecordset(pSet);
  }
  if (m_hdbc != SQL_NULL_HDBC) {
    if (m_bTransactionPending) SQLEndTran(SQL_HANDLE_DBC, m_hdbc, SQL_ROLLBACK);
    SQLDisconnect(m_hdbc);
    SQLFreeHandle(SQL_HANDLE_DBC, m_hdbc);
    m_hdbc = SQL_NULL_HDBC;
  }
  m_bTransactionPending = FALSE;
  m_strConnect.Empty();
  m_strDBMS.Empty();
  m_strIdentifierQuote.Empty();
  m_nTextForm = textBytes;
  m_bUpdatable = FALSE;
  m_nTxnCapable = SQL_TC_NONE;
}

CString CDatabase::GetDatabaseName() const { return m_strDBMS; }

BOOL CDatabase::CanUpdate() const {
  ASSERT(IsOpen());
  return m_bUpdatable;
}

BOOL CDatabase::CanTransact() const {
  ASSERT(IsOpen());
  return m_nTxnCapable != SQL_TC_NONE;
}

void CDatabase::Check(RETCODE nRetCode, HSTMT hstmt, LPCSTR lpszCall) {
  if (nRetCode != SQL_ERROR && nRetCode != SQL_INVALID_HANDLE) return;
  CDBException* pException = new CDBException(nRetCode);
  pException->BuildErrorString(this, hstmt, lpszCall);
  throw pException;
}

HSTMT CDatabase::AllocStatement() {
  ASSERT(IsOpen());
  SQLHSTMT hstmt = SQL_NULL_HSTMT;
  Check(SQLAllocHandle(SQL_HANDLE_STMT, m_hdbc, &hstmt), SQL_NULL_HSTMT, "SQLAllocHandle");
  if (m_dwQueryTimeout != 0)
    SQLSetStmtAttr(hstmt, SQL_ATTR_QUERY_TIMEOUT, (SQLPOINTER)(SQLULEN)m_dwQueryTimeout, 0);
  return (HSTMT)hstmt;
}

void CDatabase::FreeStatement(HSTMT hstmt) {
  if (hstmt != SQL_NULL_HSTMT) SQLFreeHandle(SQL_HANDLE_STMT, hstmt);
}

void CDatabase::ExecuteSQL(LPCTSTR lpszSQL) {
  ASSERT(IsOpen());
  ASSERT(lpszSQL != NULL);
  std::string sql = qodb::ToDriver(m_nTextForm, lpszSQL);
  if (sql.size() > (size_t)INT_MAX) qodb::Throw(SQL_ERROR, "Die SQL-Anweisung ist zu lang.");
  qodb::StatementHandle stmt(AllocStatement());
  SQLRETURN rc = SQLExecDirect(stmt.get(), (SQLCHAR*)sql.data(), (SQLINTEGER)sql.size());
  Check(rc, stmt.get(), "SQLExecDirect");
  // A batch of statements reports each one's failure in its own result.
  while ((rc = SQLMoreResults(stmt.get())) != SQL_NO_DATA) Check(rc, stmt.get(), "SQLMoreResults");
}

void CDatabase::SetAutoCommit(BOOL bOn) {
  SQLRETURN rc = SQLSetConnectAttr(m_hdbc, SQL_ATTR_AUTOCOMMIT,
                                   (SQLPOINTER)(SQLULEN)(bOn ? SQL_AUTOCOMMIT_ON : SQL_AUTOCOMMIT_OFF), 0);
  Check(rc, SQL_NULL_HSTMT, "SQLSetConnectAttr");
}

void CDatabase::EndTransaction(BOOL bCommit) {
  Check(SQLEndTran(SQL_HANDLE_DBC, m_hdbc, bCommit ? SQL_COMMIT : SQL_ROLLBACK), SQL_NULL_HSTMT, "SQLEndTran");
}

BOOL CDatabase::BeginTrans() {
  ASSERT(IsOpen());
  ASSERT(!m_bTransactionPending);
  if (m_nTxnCapable == SQL_TC_NONE) return FALSE;
  SetAutoCommit(FALSE);
  m_bTransactionPending = TRUE;
  return TRUE;
}

BOOL CDatabase::CommitTrans() {
  ASSERT(IsOpen());
  ASSERT(m_bTransactionPending);
  m_bTransactionPending = FALSE;
  // Automatic commit comes back whatever the outcome, so that the
  // connection is not left in a transaction nobody ends.
  try {
    EndTransaction(TRUE);
  } catch (CException*) {
    SQLEndTran(SQL_HANDLE_DBC, m_hdbc, SQL_ROLLBACK);
    SQLSetConnectAttr(m_hdbc, SQL_ATTR_AUTOCOMMIT, (SQLPOINTER)(SQLULEN)SQL_AUTOCOMMIT_ON, 0);
    throw;
  }
  SetAutoCommit(TRUE);
  return TRUE;
}

BOOL CDatabase::Rollback() {
  ASSERT(IsOpen());
  ASSERT(m_bTransactionPending);
  m_bTransactionPending = FALSE;
  try {
    EndTransaction(FALSE);
  } catch (CException*) {
    SQLSetConnectAttr(m_hdbc, SQL_ATTR_AUTOCOMMIT, (SQLPOINTER)(SQLULEN)SQL_AUTOCOMMIT_ON, 0);
    throw;
  }
  SetAutoCommit(TRUE);
  return TRUE;
}

void CDatabase::AddRecordset(CRecordset* pSet) {
  pSet->m_pNextRecordset = m_pFirstRecordset;
  m_pFirstRecordset = pSet;
}

void CDatabase::RemoveRecordset(CRecordset* pSet) {
  for (CRecordset** ppSet = &m_pFirstRecordset; *ppSet != NULL; ppSet = &(*ppSet)->m_pNextRecordset) {
    if (*ppSet == pSet) {
      *ppSet = pSet->m_pNextRecordset;
      pSet->m_pNextRecordset = NULL;
      return;
    }
  }
}
