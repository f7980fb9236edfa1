// CDaoDatabase: a database file served by the driver that fits its kind,
// found by the file's first bytes (not by its name). The engine's own tables
// inside an Access-type (SQLite) file mark it as ours and keep its password.
#include "dao_private.h"

#include <wincrypt.h>

#include <string.h>

namespace qodao {

void MakeEngineTables(Engine& engine) {
  Guard([&] {
    engine.db.ExecuteSQL("create table qo_dao_engine (version integer not null)");
    engine.db.ExecuteSQL("insert into qo_dao_engine (version) values (1)");
    engine.db.ExecuteSQL("create table qo_dao_password (salt text not null, hash text not null)");
    engine.db.ExecuteSQL("create table qo_dao_fields (tbl text not null, fld text not null, attributes integer, "
                         "required integer, allowzero integer, primary key (tbl, fld))");
  });
}

namespace {

std::vector<Engine*>& OpenFiles() {
  static std::vector<Engine*> s_files;
  return s_files;
}

// SQLite's wait for a lock: the driver's (100 s) would stall a conversion
// that reads and writes one file; two seconds cover a commit of the other.
void WaitShortly(Engine& engine) {
  try {
    QueryValue(engine, "pragma busy_timeout = 2000");
  } catch (CDaoException* e) {
    e->Delete();   // the driver's own wait stays
  }
}

} // namespace

void RegisterOpenFile(Engine& engine) {
  if (engine.kind != kindSqlite) return;
  char szFull[MAX_PATH * 2] = {0};
  DWORD nFull = GetFullPathNameA(engine.strName, (DWORD)sizeof(szFull), szFull, NULL);
  engine.strFullPath = nFull > 0 && nFull < sizeof(szFull) ? CString(szFull) : engine.strName;
  for (Engine* pOther : OpenFiles()) {
    if (pOther->strFullPath.CompareNoCase(engine.strFullPath) != 0) continue;
    WaitShortly(*pOther);
    WaitShortly(engine);
  }
  OpenFiles().push_back(&engine);
}

void UnregisterOpenFile(Engine& engine) {
  std::vector<Engine*>& files = OpenFiles();
  for (size_t i = 0; i < files.size(); ++i)
    if (files[i] == &engine) {
      files.erase(files.begin() + (long)i);
      return;
    }
}

CString FilesOpenTwice() {
  CString strNames;
  const std::vector<Engine*>& files = OpenFiles();
  for (size_t i = 0; i < files.size(); ++i) {
    bool bTwice = false, bListed = false;
    for (size_t j = 0; j < files.size(); ++j) {
      if (j == i || files[j]->strFullPath.CompareNoCase(files[i]->strFullPath) != 0) continue;
      bTwice = true;
      if (j < i) bListed = true;
    }
    if (!bTwice || bListed) continue;
    if (!strNames.IsEmpty()) strNames += "', '";
    strNames += files[i]->strName;
  }
  return strNames;
}

Engine& EngineOf(CDaoDatabase* pDatabase) {
  ASSERT(pDatabase != NULL && pDatabase->m_pEngine != NULL);
  return *static_cast<Engine*>(pDatabase->m_pEngine);
}

} // namespace qodao

using namespace qodao;

namespace {

const char kSqliteMagic[] = "SQLite format 3";   // followed by a NUL: 16 bytes

CDaoWorkspace& DefaultWorkspace() {
  static CDaoWorkspace s_workspace;
  return s_workspace;
}

// The value of "key=" in a ";"-separated string (case-insensitive); "" when absent.
CString KeyValue(LPCTSTR lpszText, LPCSTR lpszKey) {
  CString strText = lpszText != NULL ? lpszText : "";
  CString strLower = strText;
  strLower.MakeLower();
  CString strKey = CString(lpszKey) + "=";
  strKey.MakeLower();
  int nPos = 0;
  for (;;) {
    int nFound = strLower.Find(strKey, nPos);
    if (nFound < 0) return CString();
    if (nFound == 0 || strLower[nFound - 1] == ';' || strLower[nFound - 1] == ' ') {
      int nStart = nFound + strKey.GetLength();
      int nEnd = strText.Find(';', nStart);
      return nEnd < 0 ? strText.Mid(nStart) : strText.Mid(nStart, nEnd - nStart);
    }
    nPos = nFound + 1;
  }
}

enum ProbeResult { probeMissing, probeSqlite, probeJet, probeXls, probeZip, probeOther };

ProbeResult Probe(LPCTSTR lpszName, int* pnJetVersion = NULL) {
  HANDLE hFile = CreateFileA(lpszName, GENERIC_READ, FILE_SHARE_READ | FILE_SHARE_WRITE, NULL, OPEN_EXISTING,
                             FILE_ATTRIBUTE_NORMAL, NULL);
  if (hFile == INVALID_HANDLE_VALUE) {
    DWORD dwError = GetLastError();
    return dwError == ERROR_FILE_NOT_FOUND || dwError == ERROR_PATH_NOT_FOUND ? probeMissing : probeOther;
  }
  unsigned char head[32] = {0};
  DWORD nRead = 0;
  BOOL bRead = ReadFile(hFile, head, sizeof(head), &nRead, NULL);
  CloseHandle(hFile);
  if (!bRead) return probeOther;
  if (nRead >= 16 && memcmp(head, kSqliteMagic, 16) == 0) return probeSqlite;
  if (nRead >= 21 && (memcmp(head + 4, "Standard Jet DB", 15) == 0 || memcmp(head + 4, "Standard ACE DB", 15) == 0)) {
    if (pnJetVersion != NULL) *pnJetVersion = head[20];
    return probeJet;
  }
  if (nRead >= 8 && memcmp(head, "\xD0\xCF\x11\xE0\xA1\xB1\x1A\xE1", 8) == 0) return probeXls;
  if (nRead >= 4 && memcmp(head, "PK\x03\x04", 4) == 0) return probeZip;
  return probeOther;
}

[[noreturn]] void ThrowInvalidPath(LPCTSTR lpszName, LPCSTR lpszWhy) {
  CString strError;
  strError.Format("'%s' is not a valid path: %s", lpszName != NULL ? lpszName : "", lpszWhy);
  Throw(3044, strError);
}

// What a project can name but no database file can be: checked before the
// file is touched (a device would be opened and read, a network path makes
// the driver wait, an overlong one is cut by it).
void CheckPath(LPCTSTR lpszName) {
  if (lpszName == NULL || *lpszName == '\0') ThrowInvalidPath(lpszName, "es ist kein Dateiname angegeben.");
  if (strlen(lpszName) >= MAX_PATH) ThrowInvalidPath(lpszName, "der Pfad ist länger als 259 Zeichen.");
  if ((lpszName[0] == '\\' || lpszName[0] == '/') && (lpszName[1] == '\\' || lpszName[1] == '/'))
    ThrowInvalidPath(lpszName, "Netzwerkpfade werden nicht unterstützt.");
  LPCTSTR pszLeaf = lpszName;
  for (LPCTSTR p = lpszName; *p != '\0'; ++p)
    if (*p == '\\' || *p == '/' || *p == ':') pszLeaf = p + 1;
  CString strStem = pszLeaf;
  int nDot = strStem.Find('.');
  if (nDot >= 0) strStem = strStem.Left(nDot);
  strStem.TrimRight(' ');
  strStem.MakeUpper();
  bool bDevice = strStem == "CON" || strStem == "PRN" || strStem == "AUX" || strStem == "NUL" ||
                 (strStem.GetLength() == 4 && (strStem.Left(3) == "COM" || strStem.Left(3) == "LPT") &&
                  strStem[3] >= '1' && strStem[3] <= '9');
  if (bDevice) ThrowInvalidPath(lpszName, "der Name bezeichnet ein Gerät, keine Datei.");
  DWORD dwAttributes = GetFileAttributesA(lpszName);
  if (dwAttributes != INVALID_FILE_ATTRIBUTES && (dwAttributes & FILE_ATTRIBUTE_DIRECTORY))
    ThrowInvalidPath(lpszName, "das ist ein Ordner.");
}

[[noreturn]] void ThrowUnrecognized(LPCTSTR lpszName) {
  CString strError;
  strError.Format("Unrecognized database format '%s'.", lpszName);
  Throw(3343, strError);
}

[[noreturn]] void ThrowBadPassword() { Throw(3031, "Not a valid password."); }

// SHA-256 of salt and password, repeated so that guessing costs time.
CString HashPassword(const CString& strSalt, const CString& strPassword) {
  HCRYPTPROV hProv = 0;
  if (!CryptAcquireContextA(&hProv, NULL, NULL, PROV_RSA_AES, CRYPT_VERIFYCONTEXT))
    Throw(3000, "Die Kryptografie-Dienste von Windows stehen nicht zur Verfügung.");
  BYTE digest[32] = {0};
  std::string input = std::string((LPCSTR)strSalt) + '\n' + (LPCSTR)strPassword;
  bool bOk = true;
  for (int nRound = 0; nRound < 2000 && bOk; ++nRound) {
    HCRYPTHASH hHash = 0;
    DWORD nDigest = sizeof(digest);
    bOk = CryptCreateHash(hProv, CALG_SHA_256, 0, 0, &hHash) &&
          CryptHashData(hHash, (const BYTE*)input.data(), (DWORD)input.size(), 0) &&
          CryptGetHashParam(hHash, HP_HASHVAL, digest, &nDigest, 0);
    if (hHash != 0) CryptDestroyHash(hHash);
    input.assign((const char*)digest, sizeof(digest));
    input += (LPCSTR)strPassword;
  }
  CryptReleaseContext(hProv, 0);
  if (!bOk) Throw(3000, "Das Kennwort konnte nicht verschlüsselt werden.");
  CString strHex;
  for (BYTE b : digest) {
    CString strByte;
    strByte.Format("%02x", b);
    strHex += strByte;
  }
  return strHex;
}

CString NewSalt() {
  BYTE salt[16] = {0};
  HCRYPTPROV hProv = 0;
  bool bOk = CryptAcquireContextA(&hProv, NULL, NULL, PROV_RSA_AES, CRYPT_VERIFYCONTEXT) &&
             CryptGenRandom(hProv, sizeof(salt), salt);
  if (hProv != 0) CryptReleaseContext(hProv, 0);
  if (!bOk) Throw(3000, "Die Kryptografie-Dienste von Windows stehen nicht zur Verfügung.");
  CString strHex;
  for (BYTE b : salt) {
    CString strByte;
    strByte.Format("%02x", b);
    strHex += strByte;
  }
  return strHex;
}

void CheckPasswordLength(const CString& strPassword) {
  if (strPassword.GetLength() > kMaxPasswordLength)
    Throw(3031, "Not a valid password. Ein Kennwort hat höchstens 20 Zeichen.");
}

void StorePassword(Engine& engine, const CString& strPassword) {
  CheckPasswordLength(strPassword);
  Guard([&] {
    engine.db.ExecuteSQL("delete from qo_dao_password");
    if (strPassword.IsEmpty()) return;
    CString strSalt = NewSalt();
    engine.db.ExecuteSQL("insert into qo_dao_password (salt, hash) values (" + QuoteLiteral(strSalt) + ", " +
                         QuoteLiteral(HashPassword(strSalt, strPassword)) + ")");
  });
}

// Connects to an SQLite file of ours and checks its password.
void OpenSqlite(Engine& engine, LPCTSTR lpszName, const CString& strPassword, BOOL bReadOnly) {
  try {
    engine.db.OpenEx("Driver=SQLite3;NoCreat=1;Database=" + CString(lpszName),
                     CDatabase::noOdbcDialog | (bReadOnly ? CDatabase::openReadOnly : 0));
  } catch (CDBException* e) {
    ThrowFromDb(e);
  }
  Value marker;
  try {
    marker = QueryValue(engine, "select count(*) from sqlite_master where type = 'table' and name = 'qo_dao_engine'");
  } catch (CDaoException* e) {
    // A damaged or truncated file fails its first read.
    e->Delete();
    ThrowUnrecognized(lpszName);
  }
  if (marker.bNull || marker.bytes != "1") ThrowUnrecognized(lpszName);
  Cursor stored(engine, "select salt, hash from qo_dao_password");
  if (stored.Next()) {
    if (strPassword.IsEmpty()) ThrowBadPassword();
    CString strSalt(stored.Get(0).bytes.c_str());
    CString strHash(stored.Get(1).bytes.c_str());
    if (HashPassword(strSalt, strPassword) != strHash) ThrowBadPassword();
  }
}

void OpenEngine(Engine& engine, LPCTSTR lpszName, BOOL bReadOnly, LPCTSTR lpszConnect) {
  CString strConnect = lpszConnect != NULL ? lpszConnect : "";
  ProbeResult kind = Probe(lpszName, &engine.nJetVersion);
  if (kind == probeMissing) {
    CString strError;
    strError.Format("Could not find file '%s'.", lpszName);
    Throw(3024, strError);
  }
  if (strConnect.Left(6).CompareNoCase("Excel ") == 0) {
    CString strError;
    if (kind == probeXls) {
      // Both an .xls file and a password-protected workbook are compound files.
      strError.Format("Die Datei '%s' ist eine Excel-Arbeitsmappe im alten Format (.xls) oder mit einem Kennwort "
                      "geschützt; gelesen werden nur ungeschützte .xlsx-Arbeitsmappen.",
                      lpszName);
      Throw(3161, strError);
    }
    if (kind != probeZip) ThrowUnrecognized(lpszName);
    OpenWorkbook(engine, lpszName);
    return;
  }
  if (kind == probeSqlite) {
    engine.kind = kindSqlite;
    DWORD dwAttributes = GetFileAttributesA(lpszName);
    // A file marked read-only is opened for reading, whoever runs the program.
    engine.bReadOnly = bReadOnly || (dwAttributes != INVALID_FILE_ATTRIBUTES && (dwAttributes & FILE_ATTRIBUTE_READONLY));
    OpenSqlite(engine, lpszName, KeyValue(strConnect, "pwd"), engine.bReadOnly);
    return;
  }
  if (kind == probeJet) {
    engine.kind = kindMdb;
    engine.bReadOnly = TRUE;
    try {
      engine.db.OpenEx("DRIVER={MDBTools};DBQ=" + CString(lpszName), CDatabase::noOdbcDialog | CDatabase::openReadOnly);
    } catch (CDBException* e) {
      CString strError;
      strError.Format("Die Access-Datei '%s' kann nicht gelesen werden (ist der MDBTools-ODBC-Treiber installiert?): %s",
                      lpszName, (LPCSTR)e->m_strError);
      e->Delete();
      Throw(3343, strError);
    }
    return;
  }
  ThrowUnrecognized(lpszName);
}

} // namespace

IMPLEMENT_DYNAMIC(CDaoDatabase, CObject)

CDaoDatabase::CDaoDatabase(CDaoWorkspace* pWorkspace)
    : m_pWorkspace(pWorkspace != NULL ? pWorkspace : &DefaultWorkspace()), m_pEngine(NULL) {}

CDaoDatabase::~CDaoDatabase() { Close(); }

void CDaoDatabase::Create(LPCTSTR lpszName, LPCTSTR lpszLocale, int dwOptions) {
  UNUSED(dwOptions);
  ASSERT(!IsOpen());
  CheckPath(lpszName);
  if (GetFileAttributesA(lpszName) != INVALID_FILE_ATTRIBUTES) {
    CString strError;
    strError.Format("Database '%s' already exists.", lpszName);
    Throw(3204, strError);
  }
  // The driver, given a path it cannot map to the host, makes a file of that
  // literal name in the current folder: the folder is checked first.
  char szFull[MAX_PATH * 2] = {0};
  LPSTR pszLeaf = NULL;
  DWORD nFull = GetFullPathNameA(lpszName, (DWORD)sizeof(szFull), szFull, &pszLeaf);
  if (nFull == 0 || nFull >= sizeof(szFull) || pszLeaf == NULL || pszLeaf <= szFull) {
    CString strError;
    strError.Format("'%s' is not a valid path.", lpszName);
    Throw(3044, strError);
  }
  CString strFolder(szFull, (int)(pszLeaf - szFull));
  DWORD dwFolder = GetFileAttributesA(strFolder);
  if (dwFolder == INVALID_FILE_ATTRIBUTES || !(dwFolder & FILE_ATTRIBUTE_DIRECTORY)) {
    CString strError;
    strError.Format("'%s' is not a valid path: den Ordner gibt es nicht.", (LPCSTR)strFolder);
    Throw(3044, strError);
  }
  CString strPassword = KeyValue(lpszLocale, "pwd");
  CheckPasswordLength(strPassword);
  std::unique_ptr<Engine> engine(new Engine);
  engine->kind = kindSqlite;
  engine->strName = lpszName;
  try {
    Guard([&] { engine->db.OpenEx("Driver=SQLite3;Database=" + CString(lpszName), CDatabase::noOdbcDialog); });
    MakeEngineTables(*engine);
    if (!strPassword.IsEmpty()) StorePassword(*engine, strPassword);
  } catch (CException*) {
    // No half-made database is left behind to be mistaken for one.
    engine->db.Close();
    DeleteFileA(lpszName);
    throw;
  }
  m_pEngine = engine.release();
  RegisterOpenFile(EngineOf(this));
  JoinWorkspace(this);
}

void CDaoDatabase::Open(LPCTSTR lpszName, BOOL bExclusive, BOOL bReadOnly, LPCTSTR lpszConnect) {
  UNUSED(bExclusive);
  ASSERT(!IsOpen());
  CheckPath(lpszName);
  std::unique_ptr<Engine> engine(new Engine);
  engine->strName = lpszName;
  engine->strConnect = lpszConnect != NULL ? lpszConnect : "";
  OpenEngine(*engine, lpszName, bReadOnly, lpszConnect);
  m_pEngine = engine.release();
  if (EngineOf(this).strTempFile.IsEmpty()) RegisterOpenFile(EngineOf(this));   // not a workbook's copy
  JoinWorkspace(this);
}

void CDaoDatabase::Close() {
  if (m_pEngine == NULL) return;
  Engine* pEngine = static_cast<Engine*>(m_pEngine);
  // Close never raises: a caller who must know whether appended rows were
  // stored closes the recordset first, where a failure raises.
  while (!pEngine->recordsets.empty()) {
    CDaoRecordset* pSet = pEngine->recordsets.back();
    try {
      pSet->Close();
    } catch (CException* e) {
      e->Delete();
    }
    if (!pEngine->recordsets.empty() && pEngine->recordsets.back() == pSet) pEngine->recordsets.pop_back();
  }
  LeaveWorkspace(this);
  UnregisterOpenFile(*pEngine);
  m_pEngine = NULL;
  delete pEngine;   // CDatabase closes its recordsets and the connection, rolling back what is pending
}

BOOL CDaoDatabase::IsOpen() const { return m_pEngine != NULL; }

BOOL CDaoDatabase::CanUpdate() { return !EngineOf(this).bReadOnly; }

BOOL CDaoDatabase::CanTransact() { return EngineOf(this).kind == kindSqlite; }

CString CDaoDatabase::GetName() { return EngineOf(this).strName; }

CString CDaoDatabase::GetConnect() { return EngineOf(this).strConnect; }

void CDaoDatabase::Execute(LPCTSTR lpszSQL, int nOptions) {
  UNUSED(nOptions);   // a failure raises with or without dbFailOnError: none is reported as success
  Engine& engine = EngineOf(this);
  ASSERT(lpszSQL != NULL);
  CString strSQL = lpszSQL;
  strSQL.TrimLeft(" \t\r\n(");
  if (strSQL.Left(6).CompareNoCase("select") == 0 && strSQL.Find(" into ") < 0)
    Throw(3065, "Cannot execute a select query.");
  if (engine.bReadOnly) ThrowReadOnly();
  CheckSingleStatement(lpszSQL);
  engine.lRecordsAffected = ExecuteWith(engine, lpszSQL, {}, {});
}

long CDaoDatabase::GetRecordsAffected() { return EngineOf(this).lRecordsAffected; }

short CDaoDatabase::GetTableDefCount() { return (short)ObjectNames(EngineOf(this), FALSE).size(); }

namespace {

[[noreturn]] void ThrowNotInCollection(LPCTSTR lpszName) {
  CString strError = "Item not found in this collection.";
  if (lpszName != NULL) strError.Format("Item not found in this collection ('%s').", lpszName);
  Throw(3265, strError);
}

void FillTableInfo(CDaoDatabase* pdb, const CString& strName, CDaoTableDefInfo& info, DWORD dwInfoOptions) {
  Engine& engine = EngineOf(pdb);
  info.m_strName = strName;
  info.m_bUpdatable = !engine.bReadOnly;
  info.m_lAttributes = 0;
  if (dwInfoOptions & AFX_DAO_SECONDARY_INFO) {
    // The file keeps no dates of its tables.
    info.m_dateCreated.m_status = COleDateTime::null;
    info.m_dateLastUpdated.m_status = COleDateTime::null;
    info.m_strSrcTableName.Empty();
    info.m_strConnect.Empty();
  }
  if ((dwInfoOptions & AFX_DAO_ALL_INFO) == AFX_DAO_ALL_INFO) {
    info.m_strValidationRule.Empty();
    info.m_strValidationText.Empty();
    CDaoTableDef td(pdb);
    td.Open(strName);
    info.m_lRecordCount = td.GetRecordCount();
  }
}

CString ViewSQL(Engine& engine, const CString& strName) {
  Value sql = QueryValue(engine, "select sql from sqlite_master where type = 'view' and name = " + QuoteLiteral(strName));
  CString strSQL(sql.bytes.c_str());
  // The view was made as "CREATE VIEW <name> AS <sql>": the query is what follows.
  CString strUpper = strSQL;
  strUpper.MakeUpper();
  int nAs = strUpper.Find(" AS ", strUpper.Find("VIEW") + (int)strName.GetLength());
  return nAs >= 0 ? strSQL.Mid(nAs + 4) : strSQL;
}

void FillQueryInfo(Engine& engine, const CString& strName, CDaoQueryDefInfo& info, DWORD dwInfoOptions) {
  info.m_strName = strName;
  info.m_nType = dbQSelect;
  if (dwInfoOptions & AFX_DAO_SECONDARY_INFO) {
    info.m_dateCreated.m_status = COleDateTime::null;
    info.m_dateLastUpdated.m_status = COleDateTime::null;
    info.m_bUpdatable = !engine.bReadOnly;
    info.m_bReturnsRecords = TRUE;
  }
  if ((dwInfoOptions & AFX_DAO_ALL_INFO) == AFX_DAO_ALL_INFO) {
    info.m_strSQL = engine.kind == kindSqlite ? ViewSQL(engine, strName) : CString();
    info.m_strConnect.Empty();
    info.m_nODBCTimeout = 60;
  }
}

} // namespace

void CDaoDatabase::GetTableDefInfo(int nIndex, CDaoTableDefInfo& tabledefinfo, DWORD dwInfoOptions) {
  std::vector<CString> names = ObjectNames(EngineOf(this), FALSE);
  if (nIndex < 0 || (size_t)nIndex >= names.size()) ThrowNotInCollection(NULL);
  FillTableInfo(this, names[(size_t)nIndex], tabledefinfo, dwInfoOptions);
}

void CDaoDatabase::GetTableDefInfo(LPCTSTR lpszName, CDaoTableDefInfo& tabledefinfo, DWORD dwInfoOptions) {
  CString strStored;
  if (!FindTable(EngineOf(this), lpszName, FALSE, &strStored)) ThrowNotInCollection(lpszName);
  FillTableInfo(this, strStored, tabledefinfo, dwInfoOptions);
}

short CDaoDatabase::GetQueryDefCount() { return (short)ObjectNames(EngineOf(this), TRUE).size(); }

void CDaoDatabase::GetQueryDefInfo(int nIndex, CDaoQueryDefInfo& querydefinfo, DWORD dwInfoOptions) {
  std::vector<CString> names = ObjectNames(EngineOf(this), TRUE);
  if (nIndex < 0 || (size_t)nIndex >= names.size()) ThrowNotInCollection(NULL);
  FillQueryInfo(EngineOf(this), names[(size_t)nIndex], querydefinfo, dwInfoOptions);
}

void CDaoDatabase::GetQueryDefInfo(LPCTSTR lpszName, CDaoQueryDefInfo& querydefinfo, DWORD dwInfoOptions) {
  CString strStored;
  if (!FindTable(EngineOf(this), lpszName, TRUE, &strStored)) ThrowNotInCollection(lpszName);
  FillQueryInfo(EngineOf(this), strStored, querydefinfo, dwInfoOptions);
}

void CDaoDatabase::DeleteTableDef(LPCTSTR lpszName) {
  Engine& engine = EngineOf(this);
  CString strStored;
  if (!FindTable(engine, lpszName, FALSE, &strStored)) ThrowNotInCollection(lpszName);
  if (engine.bReadOnly) ThrowReadOnly();
  Transaction transaction(engine);
  Guard([&] {
    engine.db.ExecuteSQL("drop table " + Quote(engine, strStored));
    engine.db.ExecuteSQL("delete from qo_dao_fields where tbl = " + QuoteLiteral(strStored));
    if (QueryValue(engine, "select count(*) from sqlite_master where name = 'qo_dao_indexes'").bytes == "1")
      engine.db.ExecuteSQL("delete from qo_dao_indexes where tbl = " + QuoteLiteral(strStored));
  });
  transaction.Commit();
}

void CDaoDatabase::DeleteQueryDef(LPCTSTR lpszName) {
  Engine& engine = EngineOf(this);
  CString strStored;
  if (!FindTable(engine, lpszName, TRUE, &strStored)) ThrowNotInCollection(lpszName);
  if (engine.bReadOnly) ThrowReadOnly();
  Guard([&] { engine.db.ExecuteSQL("drop view " + Quote(engine, strStored)); });
}

void AFXAPI CDaoDatabase::SetPassword(LPCTSTR lpszName, LPCTSTR lpszOldPassword, LPCTSTR lpszNewPassword) {
  ASSERT(lpszName != NULL);
  Engine engine;
  CString strOld = lpszOldPassword != NULL ? lpszOldPassword : "";
  OpenEngine(engine, lpszName, FALSE, ";PWD=" + strOld);
  if (engine.bReadOnly) ThrowReadOnly();
  StorePassword(engine, lpszNewPassword != NULL ? lpszNewPassword : "");
}
