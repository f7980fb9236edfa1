// CDaoQueryDef: a stored query (an SQLite view, kept by Append) or a
// temporary one that only lives in the object. Stored queries of Access files
// are listed but cannot be run: the MDBTools driver cannot select them.
#include "dao_private.h"

using namespace qodao;

namespace {

struct QueryDefState {
  CString strName;
  CString strSQL;
  BOOL bOpen = FALSE;
  BOOL bStored = FALSE;   // appended or opened: exists in the file
};

QueryDefState& StateOf(void* p) { return *static_cast<QueryDefState*>(p); }

QueryDefState& OpenState(CDaoQueryDef* pQd) {
  ASSERT(pQd->m_pState != NULL && StateOf(pQd->m_pState).bOpen);
  return StateOf(pQd->m_pState);
}

} // namespace

namespace qodao {

BOOL IsSelect(const CString& strSQL) {
  CString str = strSQL;
  str.TrimLeft(" \t\r\n(");
  CString strHead = str.Left(6);
  strHead.MakeLower();
  return strHead == "select" || strHead.Left(4) == "with";
}

void CheckSingleStatement(const CString& strSQL) {
  // The driver runs the first statement and drops the rest without a word.
  LPCSTR p = strSQL;
  char chQuote = 0;
  for (; *p != '\0'; ++p) {
    if (chQuote != 0) {
      if (*p == chQuote) chQuote = 0;   // a doubled quote closes and opens again
      continue;
    }
    if (*p == '\'' || *p == '"' || *p == '`') chQuote = *p;
    else if (*p == '[') chQuote = ']';
    else if (*p == ';') break;
  }
  if (*p != ';') return;
  for (++p; *p != '\0'; ++p)
    if (*p != ';' && *p != ' ' && *p != '\t' && *p != '\r' && *p != '\n')
      Throw(3142, "Characters found after end of SQL statement.");
}

[[noreturn]] void ThrowMdbQuery(const CString& strName) {
  CString strError;
  strError.Format("Item not found in this collection: die gespeicherte Abfrage '%s' einer Access-Datei kann diese "
                  "Datenbank-Engine nicht ausführen, nur ihre Tabellen lesen.",
                  (LPCSTR)strName);
  Throw(3265, strError);
}

CString QuerySQL(CDaoQueryDef* pQueryDef) {
  QueryDefState& st = OpenState(pQueryDef);
  Engine& engine = EngineOf(pQueryDef->m_pDatabase);
  if (st.bStored) {
    if (engine.kind == kindMdb) ThrowMdbQuery(st.strName);
    return "select * from " + Quote(engine, st.strName);
  }
  return st.strSQL;
}

std::vector<FieldDef> QueryFields(CDaoQueryDef* pQueryDef) {
  return ResultFields(EngineOf(pQueryDef->m_pDatabase), QuerySQL(pQueryDef));
}

} // namespace qodao

IMPLEMENT_DYNAMIC(CDaoQueryDef, CObject)

CDaoQueryDef::CDaoQueryDef(CDaoDatabase* pDatabase) : m_pDatabase(pDatabase), m_pState(new QueryDefState) {}

CDaoQueryDef::~CDaoQueryDef() {
  Close();
  delete &StateOf(m_pState);
}

void CDaoQueryDef::Create(LPCTSTR lpszName, LPCTSTR lpszSQL) {
  ASSERT(!IsOpen());
  ASSERT(m_pDatabase != NULL && m_pDatabase->IsOpen());
  if (lpszName != NULL && *lpszName != '\0') CheckName(lpszName);
  QueryDefState& st = StateOf(m_pState);
  st = QueryDefState();
  st.strName = lpszName != NULL ? lpszName : "";
  st.strSQL = lpszSQL != NULL ? lpszSQL : "";
  st.bOpen = TRUE;
}

void CDaoQueryDef::Append() {
  QueryDefState& st = OpenState(this);
  ASSERT(!st.bStored && !st.strName.IsEmpty());
  Engine& engine = EngineOf(m_pDatabase);
  if (engine.bReadOnly) ThrowReadOnly();
  if (FindTable(engine, st.strName, TRUE) || FindTable(engine, st.strName, FALSE)) {
    CString strError;
    strError.Format("Object '%s' already exists.", (LPCSTR)st.strName);
    Throw(3012, strError);
  }
  if (!IsSelect(st.strSQL))
    Throw(3251, "Operation is not supported for this type of object: gespeichert werden nur Auswahlabfragen "
                "(SELECT); Aktionsabfragen laufen als temporäre Abfragen.");
  CString strSQL = st.strSQL;
  strSQL.TrimRight(" \t\r\n;");
  Guard([&] { engine.db.ExecuteSQL("create view " + Quote(engine, st.strName) + " as " + strSQL); });
  st.bStored = TRUE;
}

void CDaoQueryDef::Open(LPCTSTR lpszName) {
  ASSERT(!IsOpen());
  ASSERT(m_pDatabase != NULL && m_pDatabase->IsOpen());
  Engine& engine = EngineOf(m_pDatabase);
  CString strStored;
  if (lpszName == NULL || !FindTable(engine, lpszName, TRUE, &strStored)) {
    CString strError;
    strError.Format("Item not found in this collection ('%s').", lpszName != NULL ? lpszName : "");
    Throw(3265, strError);
  }
  QueryDefState& st = StateOf(m_pState);
  st = QueryDefState();
  st.strName = strStored;
  st.bStored = TRUE;
  st.bOpen = TRUE;
  if (engine.kind == kindSqlite) {
    CDaoQueryDefInfo info;
    m_pDatabase->GetQueryDefInfo(strStored, info, AFX_DAO_ALL_INFO);
    st.strSQL = info.m_strSQL;
  }
}

void CDaoQueryDef::Close() {
  QueryDefState& st = StateOf(m_pState);
  st = QueryDefState();
}

BOOL CDaoQueryDef::IsOpen() const { return StateOf(m_pState).bOpen; }

CString CDaoQueryDef::GetName() { return OpenState(this).strName; }

CString CDaoQueryDef::GetSQL() { return OpenState(this).strSQL; }

void CDaoQueryDef::SetSQL(LPCTSTR lpszSQL) {
  QueryDefState& st = OpenState(this);
  CString strSQL = lpszSQL != NULL ? lpszSQL : "";
  if (st.bStored) {
    Engine& engine = EngineOf(m_pDatabase);
    if (engine.bReadOnly) ThrowReadOnly();
    if (!IsSelect(strSQL))
      Throw(3251, "Operation is not supported for this type of object: gespeichert werden nur Auswahlabfragen.");
    CString strBody = strSQL;
    strBody.TrimRight(" \t\r\n;");
    // The old query stays when the new one is refused.
    Guard([&] {
      engine.db.BeginTrans();
      try {
        engine.db.ExecuteSQL("drop view " + Quote(engine, st.strName));
        engine.db.ExecuteSQL("create view " + Quote(engine, st.strName) + " as " + strBody);
        engine.db.CommitTrans();
      } catch (CException*) {
        engine.db.Rollback();
        throw;
      }
    });
  }
  st.strSQL = strSQL;
}

short CDaoQueryDef::GetType() { return IsSelect(OpenState(this).strSQL) || OpenState(this).bStored ? dbQSelect : dbQAction; }

BOOL CDaoQueryDef::GetReturnsRecords() { return GetType() == dbQSelect; }

short CDaoQueryDef::GetFieldCount() { return (short)QueryFields(this).size(); }

void CDaoQueryDef::GetFieldInfo(int nIndex, CDaoFieldInfo& fieldinfo, DWORD dwInfoOptions) {
  std::vector<FieldDef> fields = QueryFields(this);
  FieldInfoAt(fields, nIndex, fieldinfo, dwInfoOptions);
}

void CDaoQueryDef::GetFieldInfo(LPCTSTR lpszName, CDaoFieldInfo& fieldinfo, DWORD dwInfoOptions) {
  std::vector<FieldDef> fields = QueryFields(this);
  int n = FieldIndex(fields, lpszName);
  FillFieldInfo(fields[(size_t)n], n, fieldinfo, dwInfoOptions);
}

void CDaoQueryDef::Execute(int nOptions) {
  UNUSED(nOptions);
  QueryDefState& st = OpenState(this);
  if (st.bStored || IsSelect(st.strSQL)) Throw(3065, "Cannot execute a select query.");
  m_pDatabase->Execute(st.strSQL, nOptions);
}
