// CDaoRecordset: reading a table or query by position, and appending or
// editing rows of one table.
//
// Reading holds one row: the engine's cursor reads forward and is run again to
// go back, so memory does not grow with the result. Appending goes through a
// CRecordset in bulk mode (rows sent as parameter arrays inside transactions);
// that recordset binds the fields a row gives values for, so a field left
// empty gets no value (NULL) rather than an empty text. A row with another set
// of fields, or with binary values, is the moment the pending rows are sent.
// A row the file did not take is never reported as stored: the failure raises
// from Update, or from Close for the last rows, naming the first record lost.
#include "dao_private.h"

#include <ctype.h>
#include <stdlib.h>

using namespace qodao;

namespace {

// Binds the fields a row gives values for, as text.
class CAppendSet : public CRecordset {
public:
  CAppendSet(CDatabase* pDatabase, const std::vector<CString>& names)
      : CRecordset(pDatabase), m_names(names), m_values(names.size()) {}

  void DoFieldExchange(CFieldExchange* pFX) override {
    // Every value is set for every row: not emptying them first lets each
    // keep its buffer from row to row.
    if (pFX->m_nOperation == CFieldExchange::MarkForAddNew) return;
    pFX->SetFieldType(CFieldExchange::outputColumn);
    for (size_t i = 0; i < m_names.size(); ++i) RFX_Text(pFX, m_names[i], m_values[i], 255);
  }

  std::vector<CString> m_names;
  std::vector<CString> m_values;
};

enum EditMode { editNone = 0, editAdd = 1, editEdit = 2 };

struct RecordsetState {
  BOOL bOpen = FALSE;
  int nType = dbOpenDynaset;
  BOOL bUpdatable = FALSE;
  CString strTable;                 // the one table rows are written to ("" when none)
  CString strSelect;                // what the cursor runs
  BOOL bRowid = FALSE;              // the cursor's first column is the row id
  std::vector<FieldDef> fields;
  std::unique_ptr<Cursor> cursor;

  long lPos = -1;                   // 0-based current record; -1 before the first
  BOOL bBOF = TRUE;
  BOOL bEOF = TRUE;
  BOOL bDeleted = FALSE;            // the current record was deleted
  long lCount = 0;                  // records seen (or all, when bCountKnown)
  BOOL bCountKnown = FALSE;
  BOOL bDirty = FALSE;              // rows written since the cursor ran

  int nEdit = editNone;
  std::vector<Value> buffer;
  std::vector<bool> assigned;

  std::unique_ptr<CAppendSet> appender;
  std::vector<int> appenderFields;
  long lAppenderBase = 0;           // rows handed to earlier appenders
  long lAdded = 0;                  // rows handed to Update since Open
  int nNullTrigger = 0;             // 1 installed, -1 not possible, 0 not tried
  std::vector<int> given;           // Update's fields with values, kept to spare allocations
};

RecordsetState& StateOf(void* p) { return *static_cast<RecordsetState*>(p); }

RecordsetState& OpenState(const CDaoRecordset* pSet) {
  ASSERT(pSet->m_pState != NULL && StateOf(pSet->m_pState).bOpen);
  return StateOf(pSet->m_pState);
}

size_t FirstField(const RecordsetState& st) { return st.bRowid ? 1 : 0; }

// The table of "select * from <name>" (nothing else), or "".
CString SimpleTable(const CString& strSQL) {
  CString str = strSQL;
  str.Trim(" \t\r\n;");
  CString strLower = str;
  strLower.MakeLower();
  const char kHead[] = "select * from ";
  if (strLower.Left(14) != kHead) return CString();
  CString strName = str.Mid(14);
  strName.Trim();
  if (strName.IsEmpty()) return CString();
  TCHAR chFirst = strName[0];
  if (chFirst == '[' || chFirst == '"' || chFirst == '`') {
    TCHAR chClose = chFirst == '[' ? ']' : chFirst;
    int nClose = strName.Find(chClose, 1);
    if (nClose != strName.GetLength() - 1) return CString();
    return strName.Mid(1, nClose - 1);
  }
  for (int i = 0; i < strName.GetLength(); ++i)
    if (!isalnum((unsigned char)strName[i]) && strName[i] != '_' && (unsigned char)strName[i] < 0x80) return CString();
  return strName;
}

[[noreturn]] void ThrowMdbSql() {
  Throw(3251, "Operation is not supported for this type of object: aus Access-Dateien liest diese Datenbank-Engine "
              "nur ganze Tabellen (\"select * from [Tabelle]\").");
}

// A file deleted while it is open takes what SQLite writes with it (the host
// keeps writing to the unlinked file): appended rows are not stored then.
void CheckFileStillThere(Engine& engine, const RecordsetState& st) {
  if (engine.kind != kindSqlite || GetFileAttributesA(engine.strName) != INVALID_FILE_ATTRIBUTES) return;
  CString strError;
  strError.Format("Could not find file '%s'. Die Datenbankdatei ist während der Arbeit verschwunden; die %ld "
                  "angefügten Datensätze sind nicht gespeichert.",
                  (LPCSTR)engine.strName, st.lAdded);
  Throw(3024, strError);
}

void Flush(Engine& engine, RecordsetState& st) {
  if (!st.appender) return;
  std::unique_ptr<CAppendSet> appender(std::move(st.appender));
  long lBase = st.lAppenderBase;
  st.appenderFields.clear();
  try {
    appender->Close();
  } catch (CDBException* e) {
    if (e->m_lFirstRowNotStored >= 0) e->m_lFirstRowNotStored += lBase;
    ThrowFromDb(e);
  }
  CheckFileStillThere(engine, st);
}

// Steps the cursor onto record nTarget; false when there are fewer records.
bool Reach(CDaoRecordset* pSet, long lTarget) {
  RecordsetState& st = StateOf(pSet->m_pState);
  if (st.bCountKnown && lTarget >= st.lCount) return false;
  if (st.bDirty) {
    Flush(EngineOf(pSet->m_pDatabase), st);
    st.bDirty = FALSE;
    st.cursor->Restart();
  } else if (st.cursor->Row() > lTarget || st.cursor->AtEnd()) {
    st.cursor->Restart();
  }
  while (st.cursor->Row() < lTarget) {
    if (!st.cursor->Next()) {
      st.lCount = st.cursor->Row();
      st.bCountKnown = TRUE;
      return false;
    }
  }
  if (st.cursor->Row() + 1 > st.lCount) st.lCount = st.cursor->Row() + 1;
  return true;
}

void StandOn(RecordsetState& st, long lPos) {
  st.lPos = lPos;
  st.bBOF = st.bEOF = FALSE;
  st.bDeleted = FALSE;
}

void StandAfterLast(RecordsetState& st) {
  st.lPos = st.lCount;
  st.bEOF = TRUE;
  st.bBOF = st.lCount == 0;
  st.bDeleted = FALSE;
}

void StandBeforeFirst(RecordsetState& st) {
  st.lPos = -1;
  st.bBOF = TRUE;
  st.bEOF = st.bCountKnown && st.lCount == 0;
  st.bDeleted = FALSE;
}

void CheckEditing(RecordsetState& st) {
  if (st.nEdit == editNone)
    Throw(3020, "Update or CancelUpdate without AddNew or Edit.");
}

void LoadFields(CDaoRecordset* pSet, Engine& engine) {
  RecordsetState& st = StateOf(pSet->m_pState);
  if (!st.strTable.IsEmpty()) {
    st.fields = TableFields(engine, st.strTable);
    return;
  }
  for (const Cursor::Column& column : st.cursor->Columns()) {
    FieldDef field;
    field.strName = column.strName;
    FromSqlType(column.nSqlType, column.nPrecision, column.nScale, field);
    st.fields.push_back(field);
  }
}

void OpenOn(CDaoRecordset* pSet, int nType, const CString& strSQL, int nOptions, BOOL bTableType) {
  Engine& engine = EngineOf(pSet->m_pDatabase);
  RecordsetState& st = StateOf(pSet->m_pState);
  ASSERT(!st.bOpen);
  CheckSingleStatement(strSQL);
  CString strTable = SimpleTable(strSQL);
  CString strStored;
  if (!strTable.IsEmpty()) {
    if (FindTable(engine, strTable, FALSE, &strStored)) {
      strTable = strStored;
    } else {
      if (engine.kind == kindMdb && FindTable(engine, strTable, TRUE)) ThrowMdbQuery(strTable);
      strTable.Empty();
    }
  }
  if (engine.kind == kindMdb && strTable.IsEmpty()) ThrowMdbSql();
  RecordsetState fresh;
  fresh.nType = nType;
  fresh.strTable = strTable;
  fresh.bUpdatable = !engine.bReadOnly && !strTable.IsEmpty() && nType != dbOpenSnapshot &&
                     nType != dbOpenForwardOnly && (nOptions & dbReadOnly) == 0;
  fresh.bRowid = engine.kind == kindSqlite && !strTable.IsEmpty();
  fresh.strSelect = fresh.bRowid ? "select rowid, * from " + Quote(engine, strTable)
                                 : (!strTable.IsEmpty() ? "select * from " + Quote(engine, strTable) : strSQL);
  st = std::move(fresh);
  st.cursor.reset(new Cursor(engine, st.strSelect));
  LoadFields(pSet, engine);
  if (st.fields.size() + FirstField(st) != st.cursor->Columns().size() && !st.strTable.IsEmpty()) {
    // The catalogue and the result disagree: read what the result says.
    st.fields.clear();
    st.strTable.Empty();
    st.bUpdatable = FALSE;
    st.bRowid = FALSE;
    st.strSelect = strSQL;
    st.cursor.reset(new Cursor(engine, st.strSelect));
    LoadFields(pSet, engine);
  }
  st.bOpen = TRUE;
  engine.recordsets.push_back(pSet);
  pSet->m_strSQL = strSQL;
  if (bTableType) {
    // A table-type recordset knows its size at once.
    if (engine.kind == kindSqlite) {
      st.lCount = atol(QueryValue(engine, "select count(*) from " + Quote(engine, st.strTable)).bytes.c_str());
    } else {
      Cursor counter(engine, st.strSelect);
      while (counter.Next()) {
      }
      st.lCount = counter.Row();
    }
    st.bCountKnown = TRUE;
  }
  if (Reach(pSet, 0))
    StandOn(st, 0);
  else
    StandAfterLast(st), st.bBOF = TRUE;
}

void RequireCurrent(RecordsetState& st) {
  if (st.bBOF || st.bEOF || st.lPos < 0) ThrowNoCurrentRecord();
  if (st.bDeleted) Throw(3167, "Record is deleted.");
}

} // namespace

namespace qodao {

void FlushAppends(Engine& engine) {
  for (CDaoRecordset* pSet : engine.recordsets) Flush(engine, StateOf(pSet->m_pState));
}

std::vector<FieldDef> ResultFields(Engine& engine, const CString& strSQL) {
  CString strTable = SimpleTable(strSQL);
  CString strStored;
  if (!strTable.IsEmpty() && FindTable(engine, strTable, FALSE, &strStored)) return TableFields(engine, strStored);
  if (engine.kind == kindMdb) ThrowMdbSql();
  Cursor cursor(engine, strSQL);
  std::vector<FieldDef> fields;
  for (const Cursor::Column& column : cursor.Columns()) {
    FieldDef field;
    field.strName = column.strName;
    FromSqlType(column.nSqlType, column.nPrecision, column.nScale, field);
    fields.push_back(field);
  }
  return fields;
}

} // namespace qodao

IMPLEMENT_DYNAMIC(CDaoRecordset, CObject)

CDaoRecordset::CDaoRecordset(CDaoDatabase* pDatabase) : m_pDatabase(pDatabase), m_pState(new RecordsetState) {}

CDaoRecordset::~CDaoRecordset() {
  try {
    Close();
  } catch (CException* e) {
    // Whoever must know that rows were lost calls Close first.
    e->Delete();
  }
  delete &StateOf(m_pState);
}

void CDaoRecordset::Open(int nOpenType, LPCTSTR lpszSQL, int nOptions) {
  ASSERT(!IsOpen());
  ASSERT(m_pDatabase != NULL && m_pDatabase->IsOpen());
  Engine& engine = EngineOf(m_pDatabase);
  if (lpszSQL == NULL || *lpszSQL == '\0') Throw(3078, "Es ist weder eine Tabelle noch eine Abfrage angegeben.");
  if (nOpenType == AFX_DAO_USE_DEFAULT_TYPE) nOpenType = dbOpenDynaset;
  CString strSQL = lpszSQL;
  strSQL.Trim();
  if (!IsSelect(strSQL)) {
    // A table or stored query by its name.
    CString strStored;
    if (FindTable(engine, strSQL, FALSE, &strStored)) {
      strSQL = "select * from " + Quote(engine, strStored);
    } else if (FindTable(engine, strSQL, TRUE, &strStored)) {
      if (engine.kind == kindMdb) ThrowMdbQuery(strStored);
      strSQL = "select * from " + Quote(engine, strStored);
    } else {
      CString strError;
      strError.Format("The Microsoft Jet database engine cannot find the input table or query '%s'. Make sure it "
                      "exists and that its name is spelled correctly.",
                      (LPCSTR)strSQL);
      Throw(3078, strError);
    }
  }
  if (nOpenType == dbOpenTable) {
    CString strTable = SimpleTable(strSQL);
    if (strTable.IsEmpty() || !FindTable(engine, strTable, FALSE))
      Throw(3219, "Invalid operation: ein Recordset vom Typ Tabelle braucht eine Tabelle.");
  }
  OpenOn(this, nOpenType, strSQL, nOptions, nOpenType == dbOpenTable);
}

void CDaoRecordset::Open(CDaoTableDef* pTableDef, int nOpenType, int nOptions) {
  ASSERT(!IsOpen());
  ASSERT(pTableDef != NULL && pTableDef->IsOpen());
  if (m_pDatabase == NULL) m_pDatabase = pTableDef->m_pDatabase;
  ASSERT(m_pDatabase == pTableDef->m_pDatabase);
  Engine& engine = EngineOf(m_pDatabase);
  if (nOpenType == AFX_DAO_USE_DEFAULT_TYPE) nOpenType = dbOpenTable;
  OpenOn(this, nOpenType, "select * from " + Quote(engine, pTableDef->GetName()), nOptions, nOpenType == dbOpenTable);
}

void CDaoRecordset::Open(CDaoQueryDef* pQueryDef, int nOpenType, int nOptions) {
  ASSERT(!IsOpen());
  ASSERT(pQueryDef != NULL && pQueryDef->IsOpen());
  if (m_pDatabase == NULL) m_pDatabase = pQueryDef->m_pDatabase;
  ASSERT(m_pDatabase == pQueryDef->m_pDatabase);
  ASSERT(nOpenType != dbOpenTable);
  if (nOpenType == AFX_DAO_USE_DEFAULT_TYPE) nOpenType = dbOpenDynaset;
  CString strSQL = QuerySQL(pQueryDef);
  if (!IsSelect(strSQL)) Throw(3219, "Invalid operation: eine Aktionsabfrage liefert keine Datensätze.");
  OpenOn(this, nOpenType, strSQL, nOptions, FALSE);
}

void CDaoRecordset::Close() {
  if (m_pState == NULL || !StateOf(m_pState).bOpen) return;
  RecordsetState& st = StateOf(m_pState);
  struct Reset {
    RecordsetState& st;
    ~Reset() { st = RecordsetState(); }
  } reset{st};
  st.cursor.reset();
  Engine& engine = EngineOf(m_pDatabase);
  std::vector<CDaoRecordset*>& open = engine.recordsets;
  for (size_t i = 0; i < open.size(); ++i)
    if (open[i] == this) {
      open.erase(open.begin() + (long)i);
      break;
    }
  Flush(engine, st);
}

BOOL CDaoRecordset::IsOpen() const { return StateOf(m_pState).bOpen; }
BOOL CDaoRecordset::IsBOF() const { return OpenState(this).bBOF; }
BOOL CDaoRecordset::IsEOF() const { return OpenState(this).bEOF; }
BOOL CDaoRecordset::CanUpdate() const { return OpenState(this).bUpdatable; }
BOOL CDaoRecordset::CanAppend() const { return OpenState(this).bUpdatable; }

long CDaoRecordset::GetRecordCount() { return OpenState(this).lCount; }

void CDaoRecordset::MoveFirst() {
  RecordsetState& st = OpenState(this);
  if (st.nEdit != editNone) CancelUpdate();
  if (!Reach(this, 0)) {
    StandAfterLast(st);
    ThrowNoCurrentRecord();
  }
  StandOn(st, 0);
}

void CDaoRecordset::MoveNext() {
  RecordsetState& st = OpenState(this);
  if (st.bEOF) ThrowNoCurrentRecord();
  if (st.nEdit != editNone) CancelUpdate();
  long lTarget = st.bDeleted ? st.lPos : st.lPos + 1;
  if (Reach(this, lTarget))
    StandOn(st, lTarget);
  else
    StandAfterLast(st);
}

void CDaoRecordset::MovePrev() {
  RecordsetState& st = OpenState(this);
  if (st.bBOF) ThrowNoCurrentRecord();
  if (st.nEdit != editNone) CancelUpdate();
  long lTarget = st.lPos - 1;
  if (lTarget >= 0 && Reach(this, lTarget))
    StandOn(st, lTarget);
  else
    StandBeforeFirst(st);
}

void CDaoRecordset::MoveLast() {
  RecordsetState& st = OpenState(this);
  if (st.nEdit != editNone) CancelUpdate();
  Engine& engine = EngineOf(m_pDatabase);
  if (st.bDirty) Flush(engine, st);
  if (!st.bCountKnown || st.bDirty) {
    if (engine.kind == kindSqlite) {
      CString strBody = st.strSelect;
      strBody.TrimRight(" \t\r\n;");
      st.lCount = atol(QueryValue(engine, "select count(*) from (" + strBody + ")").bytes.c_str());
    } else {
      Cursor counter(engine, st.strSelect);
      while (counter.Next()) {
      }
      st.lCount = counter.Row();
    }
    st.bCountKnown = TRUE;
  }
  if (st.lCount == 0 || !Reach(this, st.lCount - 1)) {
    StandAfterLast(st);
    ThrowNoCurrentRecord();
  }
  StandOn(st, st.lCount - 1);
}

void CDaoRecordset::Move(long lRows) {
  RecordsetState& st = OpenState(this);
  RequireCurrent(st);
  if (st.nEdit != editNone) CancelUpdate();
  long long llTarget = (long long)st.lPos + lRows;
  if (llTarget < 0) {
    StandBeforeFirst(st);
    return;
  }
  if (llTarget > LONG_MAX || !Reach(this, (long)llTarget)) {
    if (!st.bCountKnown) Reach(this, LONG_MAX);
    StandAfterLast(st);
    return;
  }
  StandOn(st, (long)llTarget);
}

void CDaoRecordset::SetAbsolutePosition(long lPosition) {
  RecordsetState& st = OpenState(this);
  if (st.nEdit != editNone) CancelUpdate();
  if (lPosition < 0 || !Reach(this, lPosition)) Throw(3001, "Invalid argument.");
  StandOn(st, lPosition);
}

long CDaoRecordset::GetAbsolutePosition() {
  RecordsetState& st = OpenState(this);
  return st.bBOF || st.bEOF || st.bDeleted ? -1 : st.lPos;
}

short CDaoRecordset::GetFieldCount() { return (short)OpenState(this).fields.size(); }

void CDaoRecordset::GetFieldInfo(int nIndex, CDaoFieldInfo& fieldinfo, DWORD dwInfoOptions) {
  RecordsetState& st = OpenState(this);
  FieldInfoAt(st.fields, nIndex, fieldinfo, dwInfoOptions);
  if (dwInfoOptions & AFX_DAO_SECONDARY_INFO) fieldinfo.m_strSourceTable = st.strTable;
}

void CDaoRecordset::GetFieldInfo(LPCTSTR lpszName, CDaoFieldInfo& fieldinfo, DWORD dwInfoOptions) {
  int n = FieldIndex(OpenState(this).fields, lpszName);
  GetFieldInfo(n, fieldinfo, dwInfoOptions);
}

void CDaoRecordset::GetFieldValue(int nIndex, COleVariant& varValue) {
  RecordsetState& st = OpenState(this);
  if (nIndex < 0 || (size_t)nIndex >= st.fields.size()) Throw(3265, "Item not found in this collection.");
  if (st.nEdit != editNone && st.assigned[(size_t)nIndex]) {
    ToVariant(st.fields[(size_t)nIndex], st.buffer[(size_t)nIndex], varValue);
    return;
  }
  if (st.nEdit == editAdd) {
    varValue.Clear();
    varValue.vt = VT_NULL;
    return;
  }
  RequireCurrent(st);
  if (st.bDirty || st.cursor->Row() != st.lPos || st.cursor->AtEnd()) {
    if (!Reach(this, st.lPos)) ThrowNoCurrentRecord();
  }
  ToVariant(st.fields[(size_t)nIndex], st.cursor->Get(FirstField(st) + (size_t)nIndex), varValue);
}

void CDaoRecordset::GetFieldValue(LPCTSTR lpszName, COleVariant& varValue) {
  int n = FieldIndex(OpenState(this).fields, lpszName);
  GetFieldValue(n, varValue);
}

COleVariant CDaoRecordset::GetFieldValue(int nIndex) {
  COleVariant var;
  GetFieldValue(nIndex, var);
  return var;
}

COleVariant CDaoRecordset::GetFieldValue(LPCTSTR lpszName) {
  COleVariant var;
  GetFieldValue(lpszName, var);
  return var;
}

void CDaoRecordset::AddNew() {
  RecordsetState& st = OpenState(this);
  if (!st.bUpdatable) ThrowReadOnly();
  if (st.nEdit != editNone) CancelUpdate();
  st.nEdit = editAdd;
  // The values' buffers are kept from row to row: appending allocates nothing per field.
  st.buffer.resize(st.fields.size());
  for (Value& value : st.buffer) {
    value.bNull = true;
    value.bytes.clear();
  }
  st.assigned.assign(st.fields.size(), false);
}

void CDaoRecordset::Edit() {
  RecordsetState& st = OpenState(this);
  if (!st.bUpdatable) ThrowReadOnly();
  RequireCurrent(st);
  if (st.nEdit != editNone) CancelUpdate();
  st.nEdit = editEdit;
  st.buffer.assign(st.fields.size(), Value());
  st.assigned.assign(st.fields.size(), false);
}

void CDaoRecordset::CancelUpdate() {
  RecordsetState& st = OpenState(this);
  st.nEdit = editNone;
  st.assigned.clear();
}

namespace {

void CheckRules(const RecordsetState& st, bool bAdding) {
  for (size_t i = 0; i < st.fields.size(); ++i) {
    const FieldDef& field = st.fields[i];
    if (!bAdding && !st.assigned[i]) continue;
    const Value& value = st.buffer[i];
    if (field.bRequired && value.bNull && !(field.lAttributes & dbAutoIncrField)) {
      CString strError;
      strError.Format("The field '%s.%s' cannot contain a Null value because the Required property for this field "
                      "is set to True. Enter a value in this field.",
                      (LPCSTR)st.strTable, (LPCSTR)field.strName);
      Throw(3314, strError);
    }
    if (!field.bAllowZeroLength && !value.bNull && value.bytes.empty() &&
        (field.nType == dbText || field.nType == dbMemo)) {
      CString strError;
      strError.Format("Field '%s.%s' cannot be a zero-length string.", (LPCSTR)st.strTable, (LPCSTR)field.strName);
      Throw(3315, strError);
    }
  }
}

bool IsBinary(short nType) { return nType == dbBinary || nType == dbLongBinary; }

bool IsNumeric(short nType) {
  return nType != dbText && nType != dbMemo && nType != dbBinary && nType != dbLongBinary;
}

// A trigger of this connection only (never stored in the file) that turns the
// '' a bulk append sends for a missing number or date back into NULL: such a
// column never holds '' otherwise, since its values are converted on the way in.
bool InstallNullTrigger(Engine& engine, const RecordsetState& st) {
  if (engine.kind != kindSqlite) return false;
  CString strCondition, strSet;
  for (const FieldDef& field : st.fields) {
    if (!IsNumeric(field.nType)) continue;
    CString strName = Quote(engine, field.strName);
    if (!strCondition.IsEmpty()) strCondition += " or ", strSet += ", ";
    strCondition += "new." + strName + " = ''";
    strSet += strName + " = nullif(" + strName + ", '')";
  }
  if (strCondition.IsEmpty()) return false;
  CString strTrigger = Quote(engine, "qo_dao_null_" + st.strTable);
  try {
    engine.db.ExecuteSQL("create temp trigger if not exists " + strTrigger + " after insert on main." +
                         Quote(engine, st.strTable) + " for each row when " + strCondition + " begin update main." +
                         Quote(engine, st.strTable) + " set " + strSet + " where rowid = new.rowid; end");
  } catch (CDBException* e) {
    // A table without row ids: each set of fields then gets its own append.
    e->Delete();
    return false;
  }
  return true;
}

} // namespace

void CDaoRecordset::Update() {
  RecordsetState& st = OpenState(this);
  CheckEditing(st);
  Engine& engine = EngineOf(m_pDatabase);
  CheckRules(st, st.nEdit == editAdd);

  if (st.nEdit == editAdd && st.nNullTrigger == 0) st.nNullTrigger = InstallNullTrigger(engine, st) ? 1 : -1;
  std::vector<int>& given = st.given;
  given.clear();
  bool bBinary = false;
  for (size_t i = 0; i < st.fields.size(); ++i) {
    const bool bNull = !st.assigned[i] || st.buffer[i].bNull;
    if (st.nEdit == editAdd) {
      // A number or date field always goes out (NULL as '', which the trigger
      // turns back into NULL), so that rows with and without its value share
      // one bulk append; a text field without a value is left out (NULL).
      bool bAlways = st.nNullTrigger > 0 && IsNumeric(st.fields[i].nType);
      if (bNull && !bAlways) continue;
    } else if (!st.assigned[i]) {
      continue;
    }
    given.push_back((int)i);
    if (IsBinary(st.fields[i].nType) && !bNull) bBinary = true;
  }

  if (st.nEdit == editEdit) {
    if (!given.empty()) {
      Flush(engine, st);
      // The row id of the record being edited, read again if the cursor moved on.
      if (st.bDirty || st.cursor->Row() != st.lPos || st.cursor->AtEnd()) {
        int nEdit = st.nEdit;
        if (!Reach(this, st.lPos)) ThrowNoCurrentRecord();
        st.nEdit = nEdit;
      }
      CString strSQL = "update " + Quote(engine, st.strTable) + " set ";
      std::vector<Value> params;
      std::vector<bool> binary;
      for (size_t n = 0; n < given.size(); ++n) {
        if (n > 0) strSQL += ", ";
        strSQL += Quote(engine, st.fields[(size_t)given[n]].strName) + " = ?";
        params.push_back(st.buffer[(size_t)given[n]]);
        binary.push_back(IsBinary(st.fields[(size_t)given[n]].nType));
      }
      strSQL += " where rowid = ?";
      params.push_back(st.cursor->Get(0));
      binary.push_back(false);
      if (ExecuteWith(engine, strSQL, params, binary) != 1)
        Throw(3197, "Der Datensatz wurde inzwischen geändert oder gelöscht und wurde nicht gespeichert.");
      st.bDirty = TRUE;
    }
    CancelUpdate();
    return;
  }

  long lRecord = st.lAdded;   // 0-based among the rows added since Open
  if (bBinary || given.empty()) {
    // Binary values cannot travel as text; a row without values needs "default values".
    Flush(engine, st);
    CString strSQL = "insert into " + Quote(engine, st.strTable);
    std::vector<Value> params;
    std::vector<bool> binary;
    if (given.empty()) {
      strSQL += " default values";
    } else {
      CString strNames, strMarkers;
      for (size_t n = 0; n < given.size(); ++n) {
        if (n > 0) strNames += ", ", strMarkers += ", ";
        strNames += Quote(engine, st.fields[(size_t)given[n]].strName);
        strMarkers += "?";
        params.push_back(st.buffer[(size_t)given[n]]);
        binary.push_back(IsBinary(st.fields[(size_t)given[n]].nType));
      }
      strSQL += " (" + strNames + ") values (" + strMarkers + ")";
    }
    try {
      ExecuteWith(engine, strSQL, params, binary);
    } catch (CDaoException* e) {
      CString strError;
      strError.Format("Der Datensatz %ld wurde nicht gespeichert: %s", lRecord + 1,
                      (LPCSTR)e->m_pErrorInfo->m_strDescription);
      e->m_pErrorInfo->m_strDescription = strError;
      throw;
    }
  } else {
    if (!st.appender || st.appenderFields != given) {
      Flush(engine, st);
      std::vector<CString> names;
      for (int n : given) names.push_back(st.fields[(size_t)n].strName);
      std::unique_ptr<CAppendSet> appender(new CAppendSet(&engine.db, names));
      Guard([&] {
        appender->Open(CRecordset::snapshot, "select * from " + Quote(engine, st.strTable),
                       CRecordset::appendOnly | CRecordset::optimizeBulkAdd);
      });
      st.appender = std::move(appender);
      st.appenderFields = given;
      st.lAppenderBase = st.lAdded;
    }
    try {
      st.appender->AddNew();
        for (size_t n = 0; n < given.size(); ++n) {
        const Value& value = st.buffer[(size_t)given[n]];
        // Text here holds no NUL (binary values take the other way).
        st.appender->m_values[n] = value.bNull ? "" : value.bytes.c_str();
      }
      st.appender->Update();
    } catch (CDBException* e) {
      if (e->m_lFirstRowNotStored >= 0) e->m_lFirstRowNotStored += st.lAppenderBase;
      // The appender takes no further rows: the next ones start a new one.
      std::unique_ptr<CAppendSet> failed(std::move(st.appender));
      st.appenderFields.clear();
      try {
        failed->Close();
      } catch (CException* eClose) {
        eClose->Delete();
      }
      if (e->m_lFirstRowNotStored >= 0) st.lAdded = e->m_lFirstRowNotStored;
      st.bDirty = TRUE;
      CancelUpdate();
      if (st.nType == dbOpenTable) {
        try {
          st.lCount = atol(QueryValue(engine, "select count(*) from " + Quote(engine, st.strTable)).bytes.c_str());
        } catch (CException* eCount) {
          eCount->Delete();
        }
      } else {
        st.bCountKnown = FALSE;
      }
      ThrowFromDb(e);
    }
  }
  ++st.lAdded;
  st.bDirty = TRUE;
  if (st.nType == dbOpenTable) ++st.lCount;
  else st.bCountKnown = FALSE;
  CancelUpdate();
}

void CDaoRecordset::Delete() {
  RecordsetState& st = OpenState(this);
  if (!st.bUpdatable) ThrowReadOnly();
  RequireCurrent(st);
  if (st.bDirty || st.cursor->Row() != st.lPos) {
    if (!Reach(this, st.lPos)) ThrowNoCurrentRecord();
  }
  Engine& engine = EngineOf(m_pDatabase);
  Flush(engine, st);
  ExecuteWith(engine, "delete from " + Quote(engine, st.strTable) + " where rowid = ?", {st.cursor->Get(0)}, {false});
  st.bDirty = TRUE;
  st.bDeleted = TRUE;
  if (st.lCount > 0) --st.lCount;
}

void CDaoRecordset::SetFieldValue(int nIndex, const COleVariant& varValue) {
  RecordsetState& st = OpenState(this);
  CheckEditing(st);
  if (nIndex < 0 || (size_t)nIndex >= st.fields.size()) Throw(3265, "Item not found in this collection.");
  st.buffer[(size_t)nIndex] = FromVariant(st.fields[(size_t)nIndex], varValue);
  st.assigned[(size_t)nIndex] = true;
}

void CDaoRecordset::SetFieldValue(int nIndex, LPCTSTR lpszValue) {
  RecordsetState& st = OpenState(this);
  CheckEditing(st);
  if (nIndex < 0 || (size_t)nIndex >= st.fields.size()) Throw(3265, "Item not found in this collection.");
  Value& value = st.buffer[(size_t)nIndex];
  if (lpszValue == NULL) {
    value.bNull = true;
    value.bytes.clear();
  } else {
    FromText(st.fields[(size_t)nIndex], lpszValue, value);
  }
  st.assigned[(size_t)nIndex] = true;
}

void CDaoRecordset::SetFieldValue(LPCTSTR lpszName, const COleVariant& varValue) {
  int n = FieldIndex(OpenState(this).fields, lpszName);
  SetFieldValue(n, varValue);
}

void CDaoRecordset::SetFieldValue(LPCTSTR lpszName, LPCTSTR lpszValue) {
  int n = FieldIndex(OpenState(this).fields, lpszName);
  SetFieldValue(n, lpszValue);
}

void CDaoRecordset::SetFieldValueNull(int nIndex) {
  RecordsetState& st = OpenState(this);
  CheckEditing(st);
  if (nIndex < 0 || (size_t)nIndex >= st.fields.size()) Throw(3265, "Item not found in this collection.");
  st.buffer[(size_t)nIndex] = Value();
  st.assigned[(size_t)nIndex] = true;
}
