// Transactions of the engine: the workspace's, over every database open in
// it, and the engine's own units of work, which become savepoints when a
// caller's transaction is open (SQLite has one transaction per connection;
// savepoints are how it nests). And the rule for the names of new objects.
#include "dao_private.h"

#include <string.h>

#include <algorithm>

using namespace qodao;

namespace {

const int kMaxTransLevels = 5;   // as DAO allows

struct WorkspaceState {
  std::vector<CDaoDatabase*> databases;
  int nLevel = 0;
};

WorkspaceState& StateOf(CDaoWorkspace* pWorkspace) { return *static_cast<WorkspaceState*>(pWorkspace->m_pState); }

CString SavepointName(int nLevel) {
  CString str;
  str.Format("qo_level%d", nLevel);
  return str;
}

[[noreturn]] void ThrowNoTransaction() {
  Throw(3034, "You tried to commit or roll back a transaction without first beginning a transaction.");
}

} // namespace

namespace qodao {

void BeginLevel(Engine& engine) {
  if (engine.kind == kindSqlite) {
    Guard([&] {
      if (engine.nTransDepth == 0) {
        // Rows an appender still holds in a transaction of its own belong
        // before the caller's: they are stored first, so that neither
        // commits the other's work.
        FlushAppends(engine);
        engine.db.BeginTrans();
      } else {
        engine.db.ExecuteSQL("savepoint " + SavepointName(engine.nTransDepth + 1));
      }
    });
  }
  ++engine.nTransDepth;
}

void EndLevel(Engine& engine, bool bCommit) {
  ASSERT(engine.nTransDepth > 0);
  const int nLevel = engine.nTransDepth--;
  if (engine.kind != kindSqlite) return;
  Guard([&] {
    if (nLevel == 1) {
      if (bCommit)
        engine.db.CommitTrans();
      else
        engine.db.Rollback();
      return;
    }
    CString strName = SavepointName(nLevel);
    if (!bCommit) engine.db.ExecuteSQL("rollback to " + strName);
    engine.db.ExecuteSQL("release " + strName);
  });
}

Transaction::Transaction(Engine& engine) : m_engine(engine), m_nLevel(engine.nTransDepth + 1) {
  BeginLevel(engine);
}

Transaction::~Transaction() {
  if (!m_bOpen || m_engine.nTransDepth != m_nLevel) return;
  try {
    EndLevel(m_engine, false);
  } catch (CException* e) {
    // The connection's own rollback (at close) still takes it back.
    e->Delete();
  }
}

void Transaction::Commit() {
  ASSERT(m_bOpen && m_engine.nTransDepth == m_nLevel);
  m_bOpen = false;
  EndLevel(m_engine, true);
}

void CheckName(const CString& strName) {
  bool bValid = !strName.IsEmpty() && strName.GetLength() <= kMaxNameLength && strName[0] != ' ';
  for (int i = 0; bValid && i < strName.GetLength(); ++i) {
    unsigned char ch = (unsigned char)strName[i];
    if (ch < 0x20 || strchr(".![]`", ch) != NULL) bValid = false;
  }
  if (bValid) return;
  CString strShown = strName;
  for (int i = 0; i < strShown.GetLength(); ++i)
    if ((unsigned char)strShown[i] < 0x20) strShown.SetAt(i, '?');   // the message stays one line
  CString strError;
  strError.Format("'%s' is not a valid name. Make sure that it does not include invalid characters or punctuation "
                  "and that it is not too long.",
                  (LPCSTR)strShown);
  Throw(3125, strError);
}

void JoinWorkspace(CDaoDatabase* pDatabase) {
  Engine& engine = EngineOf(pDatabase);
  engine.pWorkspace = pDatabase->m_pWorkspace;
  WorkspaceState& ws = StateOf(pDatabase->m_pWorkspace);
  // Opened inside the workspace's transaction: its changes belong to it too.
  for (int i = 0; i < ws.nLevel; ++i) BeginLevel(engine);
  ws.databases.push_back(pDatabase);
}

void LeaveWorkspace(CDaoDatabase* pDatabase) {
  std::vector<CDaoDatabase*>& list = StateOf(pDatabase->m_pWorkspace).databases;
  list.erase(std::remove(list.begin(), list.end(), pDatabase), list.end());
}

} // namespace qodao

IMPLEMENT_DYNAMIC(CDaoWorkspace, CObject)

CDaoWorkspace::CDaoWorkspace() : m_pState(new WorkspaceState) {}

CDaoWorkspace::~CDaoWorkspace() { delete &StateOf(this); }

void CDaoWorkspace::BeginTrans() {
  WorkspaceState& ws = StateOf(this);
  if (ws.nLevel >= kMaxTransLevels)
    Throw(3003, "Could not start transaction; too many transactions already nested.");
  size_t nBegun = 0;
  try {
    for (; nBegun < ws.databases.size(); ++nBegun) BeginLevel(EngineOf(ws.databases[nBegun]));
  } catch (CException*) {
    for (size_t i = 0; i < nBegun; ++i) {
      try {
        EndLevel(EngineOf(ws.databases[i]), false);
      } catch (CException* e) {
        e->Delete();
      }
    }
    throw;
  }
  ++ws.nLevel;
}

namespace {
// Ends the workspace's innermost level in every database that has it. A
// database whose commit fails is rolled back by its connection; the others
// still end their level (rolled back once one has failed), and the first
// failure is raised.
void EndWorkspaceLevel(WorkspaceState& ws, bool bCommit) {
  if (ws.nLevel == 0) ThrowNoTransaction();
  --ws.nLevel;
  CException* pFirst = NULL;
  for (CDaoDatabase* pDatabase : ws.databases) {
    Engine& engine = EngineOf(pDatabase);
    if (engine.nTransDepth <= ws.nLevel) continue;
    try {
      EndLevel(engine, bCommit && pFirst == NULL);
    } catch (CException* e) {
      if (pFirst == NULL) pFirst = e;
      else e->Delete();
    }
  }
  if (pFirst != NULL) throw pFirst;
}
} // namespace

void CDaoWorkspace::CommitTrans() { EndWorkspaceLevel(StateOf(this), true); }

void CDaoWorkspace::Rollback() { EndWorkspaceLevel(StateOf(this), false); }
