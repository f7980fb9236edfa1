// CDaoTableDef: a table of the database. A new one is described field by
// field and comes into being at Append; what SQLite's declared types cannot
// say (field attributes, required, zero length allowed, index names per table
// and which index is the primary one) the engine keeps in its catalogue.
#include "dao_private.h"

#include <stdlib.h>

using namespace qodao;

namespace {

struct TableDefState {
  CString strName;
  BOOL bOpen = FALSE;
  BOOL bNew = FALSE;   // created, not yet appended
  long lAttributes = 0;
  std::vector<FieldDef> fields;
};

TableDefState& StateOf(void* p) { return *static_cast<TableDefState*>(p); }

TableDefState& OpenState(CDaoTableDef* pTd) {
  ASSERT(pTd->m_pState != NULL && StateOf(pTd->m_pState).bOpen);
  return StateOf(pTd->m_pState);
}

// The catalogue of index names and primary keys, made on first use (files
// of an older engine version have none).
void EnsureIndexCatalogue(Engine& engine) {
  Guard([&] {
    engine.db.ExecuteSQL("create table if not exists qo_dao_indexes (tbl text not null, idx text not null, "
                         "sqlname text not null, isprimary integer, primary key (tbl, idx))");
  });
}

// SQLite's index names are one namespace for the whole file; DAO's are per table.
CString SqlIndexName(const CString& strTable, const CString& strIndex) { return "qo_" + strTable + "_" + strIndex; }

BOOL IsReservedName(const CString& strName) {
  return strName.Left(7).CompareNoCase("qo_dao_") == 0 || strName.Left(7).CompareNoCase("sqlite_") == 0;
}

[[noreturn]] void ThrowTableExists(const CString& strName) {
  CString strError;
  strError.Format("Table '%s' already exists.", (LPCSTR)strName);
  Throw(3010, strError);
}

void MakeIndex(CDaoTableDef* pTd, const CDaoIndexInfo& info) {
  Engine& engine = EngineOf(pTd->m_pDatabase);
  TableDefState& st = StateOf(pTd->m_pState);
  if (info.m_nFields <= 0 || info.m_nFields > 10 || info.m_pFieldInfos == NULL)
    Throw(3264, "No field defined--cannot append TableDef or Index.");
  CheckName(info.m_strName);
  CString strColumns;
  for (short i = 0; i < info.m_nFields; ++i) {
    int n = FindField(st.fields, info.m_pFieldInfos[i].m_strName);
    if (n < 0) {
      CString strError;
      strError.Format("Item not found in this collection ('%s').", (LPCSTR)info.m_pFieldInfos[i].m_strName);
      Throw(3265, strError);
    }
    if (i > 0) strColumns += ", ";
    strColumns += Quote(engine, st.fields[(size_t)n].strName);
    if (info.m_pFieldInfos[i].m_bDescending) strColumns += " desc";
  }
  EnsureIndexCatalogue(engine);
  Value existing = QueryValue(engine, "select count(*) from qo_dao_indexes where tbl = " + QuoteLiteral(st.strName) +
                                          " and idx = " + QuoteLiteral(info.m_strName));
  if (existing.bytes != "0") {
    CString strError;
    strError.Format("Index '%s' already exists.", (LPCSTR)info.m_strName);
    Throw(3375, strError);
  }
  CString strSqlName = SqlIndexName(st.strName, info.m_strName);
  Transaction transaction(engine);
  Guard([&] {
    engine.db.ExecuteSQL(CString("create ") + (info.m_bUnique || info.m_bPrimary ? "unique " : "") + "index " +
                         Quote(engine, strSqlName) + " on " + Quote(engine, st.strName) + " (" + strColumns + ")");
    engine.db.ExecuteSQL("insert into qo_dao_indexes (tbl, idx, sqlname, isprimary) values (" +
                         QuoteLiteral(st.strName) + ", " + QuoteLiteral(info.m_strName) + ", " +
                         QuoteLiteral(strSqlName) + ", " + (info.m_bPrimary ? "1" : "0") + ")");
  });
  transaction.Commit();
}

struct IndexRow {
  CString strName;
  CString strSqlName;
  BOOL bUnique;
  BOOL bPrimary;
};

std::vector<IndexRow> ListIndexes(Engine& engine, const CString& strTable) {
  std::vector<IndexRow> rows;
  if (engine.kind != kindSqlite) return rows;
  Cursor list(engine, "PRAGMA index_list(" + Quote(engine, strTable) + ")");
  std::vector<std::pair<CString, BOOL>> sqlIndexes;
  while (list.Next() && sqlIndexes.size() < (size_t)kMaxObjects)
    sqlIndexes.push_back({CString(list.Get(1).bytes.c_str()), list.Get(2).bytes == "1"});
  BOOL bCatalogue = QueryValue(engine, "select count(*) from sqlite_master where name = 'qo_dao_indexes'").bytes == "1";
  // Oldest first, as they were made.
  for (auto it = sqlIndexes.rbegin(); it != sqlIndexes.rend(); ++it) {
    if (it->first.Left(17) == "sqlite_autoindex_") continue;
    IndexRow row;
    row.strSqlName = it->first;
    row.strName = it->first;
    row.bUnique = it->second;
    row.bPrimary = FALSE;
    if (bCatalogue) {
      Cursor cat(engine, "select idx, isprimary from qo_dao_indexes where sqlname = " + QuoteLiteral(it->first));
      if (cat.Next()) {
        row.strName = cat.Get(0).bytes.c_str();
        row.bPrimary = cat.Get(1).bytes == "1";
      }
    }
    rows.push_back(row);
  }
  return rows;
}

} // namespace

IMPLEMENT_DYNAMIC(CDaoTableDef, CObject)

CDaoTableDef::CDaoTableDef(CDaoDatabase* pDatabase) : m_pDatabase(pDatabase), m_pState(new TableDefState) {}

CDaoTableDef::~CDaoTableDef() {
  Close();
  delete &StateOf(m_pState);
}

void CDaoTableDef::Create(LPCTSTR lpszName, long lAttributes, LPCTSTR lpszSrcTable, LPCTSTR lpszConnect) {
  ASSERT(!IsOpen());
  ASSERT(m_pDatabase != NULL && m_pDatabase->IsOpen());
  if (lpszSrcTable != NULL || (lpszConnect != NULL && *lpszConnect != '\0'))
    Throw(3251, "Operation is not supported for this type of object: verknüpfte Tabellen gibt es in dieser "
                "Datenbank nicht.");
  CheckName(lpszName != NULL ? lpszName : "");
  TableDefState& st = StateOf(m_pState);
  st = TableDefState();
  st.strName = lpszName;
  st.lAttributes = lAttributes;
  st.bNew = TRUE;
  st.bOpen = TRUE;
}

void CDaoTableDef::CreateField(LPCTSTR lpszName, short nType, long lSize, long lAttributes) {
  CDaoFieldInfo info;
  info.m_strName = lpszName != NULL ? lpszName : "";
  info.m_nType = nType;
  info.m_lSize = lSize;
  info.m_lAttributes = lAttributes;
  info.m_bRequired = FALSE;
  info.m_bAllowZeroLength = nType == dbText || nType == dbMemo;
  CreateField(info);
}

void CDaoTableDef::CreateField(CDaoFieldInfo& fieldinfo) {
  TableDefState& st = OpenState(this);
  Engine& engine = EngineOf(m_pDatabase);
  if (engine.bReadOnly) ThrowReadOnly();
  CheckName(fieldinfo.m_strName);
  if (FindField(st.fields, fieldinfo.m_strName) >= 0) Throw(3191, "Cannot define field more than once.");
  if ((int)st.fields.size() >= kMaxFields) Throw(3190, "Too many fields defined.");
  FieldDef field;
  field.strName = fieldinfo.m_strName;
  field.nType = fieldinfo.m_nType;
  CString strDeclared = DeclaredType(field.nType, fieldinfo.m_lSize);   // checks type and size
  FromDeclaredType(strDeclared, field);
  if (field.nType == dbText || field.nType == dbBinary)
    field.lSize = fieldinfo.m_lSize > 0 ? fieldinfo.m_lSize : DefaultSize(field.nType);
  long lKind = fieldinfo.m_lAttributes & (dbFixedField | dbVariableField);
  if (lKind != 0) field.lAttributes = lKind;
  else field.lAttributes &= (dbFixedField | dbVariableField);
  field.lAttributes |= (fieldinfo.m_lAttributes & dbAutoIncrField) | dbUpdatableField;
  if ((field.lAttributes & dbAutoIncrField) && field.nType != dbLong)
    Throw(3259, "Invalid field data type: nur ein Long-Feld kann automatisch zählen.");
  field.bRequired = fieldinfo.m_bRequired;
  field.bAllowZeroLength = fieldinfo.m_bAllowZeroLength;
  if (!st.bNew) {
    // A field added to an existing table.
    CString strSQL = "alter table " + Quote(engine, st.strName) + " add column " + Quote(engine, field.strName) + " " +
                     strDeclared;
    Transaction transaction(engine);
    Guard([&] {
      engine.db.ExecuteSQL(strSQL);
      CString strRow;
      strRow.Format(", %ld, %d, %d)", field.lAttributes, field.bRequired ? 1 : 0, field.bAllowZeroLength ? 1 : 0);
      engine.db.ExecuteSQL("insert or replace into qo_dao_fields (tbl, fld, attributes, required, allowzero) values (" +
                           QuoteLiteral(st.strName) + ", " + QuoteLiteral(field.strName) + strRow);
    });
    transaction.Commit();
  }
  st.fields.push_back(field);
}

void CDaoTableDef::Append() {
  TableDefState& st = OpenState(this);
  ASSERT(st.bNew);
  Engine& engine = EngineOf(m_pDatabase);
  if (engine.bReadOnly) ThrowReadOnly();
  if (st.fields.empty()) Throw(3264, "No field defined--cannot append TableDef or Index.");
  if (FindTable(engine, st.strName, FALSE) || FindTable(engine, st.strName, TRUE) || IsReservedName(st.strName))
    ThrowTableExists(st.strName);
  CString strSQL = "create table " + Quote(engine, st.strName) + " (";
  for (size_t i = 0; i < st.fields.size(); ++i) {
    const FieldDef& field = st.fields[i];
    if (i > 0) strSQL += ", ";
    strSQL += Quote(engine, field.strName) + " " + DeclaredType(field.nType, field.lSize);
    if (field.lAttributes & dbAutoIncrField) strSQL += " primary key autoincrement";
    if (field.bRequired) strSQL += " not null";
  }
  strSQL += ")";
  // The table and its catalogue rows together or not at all.
  Transaction transaction(engine);
  Guard([&] {
    engine.db.ExecuteSQL(strSQL);
    for (const FieldDef& field : st.fields) {
      CString strRow;
      strRow.Format(", %ld, %d, %d)", field.lAttributes, field.bRequired ? 1 : 0, field.bAllowZeroLength ? 1 : 0);
      engine.db.ExecuteSQL("insert or replace into qo_dao_fields (tbl, fld, attributes, required, allowzero) "
                           "values (" +
                           QuoteLiteral(st.strName) + ", " + QuoteLiteral(field.strName) + strRow);
    }
  });
  transaction.Commit();
  st.bNew = FALSE;
  st.fields = TableFields(engine, st.strName);
}

void CDaoTableDef::Open(LPCTSTR lpszName) {
  ASSERT(!IsOpen());
  ASSERT(m_pDatabase != NULL && m_pDatabase->IsOpen());
  Engine& engine = EngineOf(m_pDatabase);
  CString strStored;
  if (!FindTable(engine, lpszName != NULL ? lpszName : "", FALSE, &strStored)) {
    CString strError;
    strError.Format("The Microsoft Jet database engine cannot find the input table or query '%s'. Make sure it "
                    "exists and that its name is spelled correctly.",
                    lpszName != NULL ? lpszName : "");
    Throw(3011, strError);
  }
  TableDefState& st = StateOf(m_pState);
  st = TableDefState();
  st.strName = strStored;
  st.fields = TableFields(engine, strStored);
  st.bOpen = TRUE;
}

void CDaoTableDef::Close() {
  TableDefState& st = StateOf(m_pState);
  st = TableDefState();
}

BOOL CDaoTableDef::IsOpen() const { return StateOf(m_pState).bOpen; }

CString CDaoTableDef::GetName() { return OpenState(this).strName; }

void CDaoTableDef::SetName(LPCTSTR lpszName) {
  TableDefState& st = OpenState(this);
  CString strNew = lpszName != NULL ? lpszName : "";
  CheckName(strNew);
  if (st.bNew) {
    st.strName = strNew;
    return;
  }
  Engine& engine = EngineOf(m_pDatabase);
  if (engine.bReadOnly) ThrowReadOnly();
  if (strNew == st.strName) return;
  const BOOL bSameTable = strNew.CompareNoCase(st.strName) == 0;
  if (IsReservedName(strNew) || (!bSameTable && (FindTable(engine, strNew, FALSE) || FindTable(engine, strNew, TRUE))))
    ThrowTableExists(strNew);
  const CString strOld = st.strName;
  Transaction transaction(engine);
  Guard([&] {
    // SQLite keeps the table's indexes under names that carry the table's:
    // each is made again under the new one, as the catalogue then says.
    struct Moved {
      CString strIndex, strSqlName, strColumns;
      BOOL bUnique;
    };
    std::vector<Moved> moved;
    EnsureIndexCatalogue(engine);
    for (const IndexRow& row : ListIndexes(engine, strOld)) {
      Value catalogued = QueryValue(engine, "select count(*) from qo_dao_indexes where sqlname = " +
                                                QuoteLiteral(row.strSqlName));
      if (catalogued.bytes != "1") continue;   // not made through CreateIndex: keeps its name
      Moved index{row.strName, row.strSqlName, CString(), row.bUnique};
      Cursor columns(engine, "PRAGMA index_xinfo(" + Quote(engine, row.strSqlName) + ")");
      while (columns.Next()) {
        if (columns.Get(5).bytes != "1" || columns.Get(2).bNull) continue;
        if (!index.strColumns.IsEmpty()) index.strColumns += ", ";
        index.strColumns += Quote(engine, CString(columns.Get(2).bytes.c_str()));
        if (columns.Get(3).bytes == "1") index.strColumns += " desc";
      }
      moved.push_back(index);
    }
    for (const Moved& index : moved) engine.db.ExecuteSQL("drop index " + Quote(engine, index.strSqlName));
    // The connection's null trigger is named after the table it serves.
    engine.db.ExecuteSQL("drop trigger if exists temp." + Quote(engine, "qo_dao_null_" + strOld));
    // Views that name the old table keep naming that name (a table put in its
    // place later serves them), and a view that names a table that is gone
    // does not stop the rename.
    engine.db.ExecuteSQL("pragma legacy_alter_table = on");
    try {
      CString strFrom = strOld;
      if (bSameTable) {
        // SQLite refuses a rename that only changes the letter case.
        CString strStep = "qo_dao_rename_" + strOld;
        engine.db.ExecuteSQL("alter table " + Quote(engine, strFrom) + " rename to " + Quote(engine, strStep));
        strFrom = strStep;
      }
      engine.db.ExecuteSQL("alter table " + Quote(engine, strFrom) + " rename to " + Quote(engine, strNew));
    } catch (CDBException*) {
      try {
        engine.db.ExecuteSQL("pragma legacy_alter_table = off");
      } catch (CDBException* e) {
        e->Delete();
      }
      throw;
    }
    engine.db.ExecuteSQL("pragma legacy_alter_table = off");
    engine.db.ExecuteSQL("update qo_dao_fields set tbl = " + QuoteLiteral(strNew) + " where tbl = " +
                         QuoteLiteral(strOld));
    for (const Moved& index : moved) {
      CString strSqlName = SqlIndexName(strNew, index.strIndex);
      engine.db.ExecuteSQL(CString("create ") + (index.bUnique ? "unique " : "") + "index " +
                           Quote(engine, strSqlName) + " on " + Quote(engine, strNew) + " (" + index.strColumns + ")");
      engine.db.ExecuteSQL("update qo_dao_indexes set tbl = " + QuoteLiteral(strNew) + ", sqlname = " +
                           QuoteLiteral(strSqlName) + " where sqlname = " + QuoteLiteral(index.strSqlName));
    }
  });
  transaction.Commit();
  st.strName = strNew;
}

long CDaoTableDef::GetAttributes() {
  TableDefState& st = OpenState(this);
  return EngineOf(m_pDatabase).kind == kindMdb ? 0 : st.lAttributes;
}

long CDaoTableDef::GetRecordCount() {
  TableDefState& st = OpenState(this);
  if (st.bNew) return 0;
  Engine& engine = EngineOf(m_pDatabase);
  if (engine.kind == kindMdb) {
    // The driver cannot count: the rows are read once.
    Cursor cursor(engine, "select * from " + Quote(engine, st.strName));
    long lCount = 0;
    while (cursor.Next()) ++lCount;
    return lCount;
  }
  Value count = QueryValue(engine, "select count(*) from " + Quote(engine, st.strName));
  return atol(count.bytes.c_str());
}

short CDaoTableDef::GetFieldCount() { return (short)OpenState(this).fields.size(); }

void CDaoTableDef::GetFieldInfo(int nIndex, CDaoFieldInfo& fieldinfo, DWORD dwInfoOptions) {
  TableDefState& st = OpenState(this);
  FieldInfoAt(st.fields, nIndex, fieldinfo, dwInfoOptions);
  if (dwInfoOptions & AFX_DAO_SECONDARY_INFO) fieldinfo.m_strSourceTable = st.strName;
}

void CDaoTableDef::GetFieldInfo(LPCTSTR lpszName, CDaoFieldInfo& fieldinfo, DWORD dwInfoOptions) {
  int n = FieldIndex(OpenState(this).fields, lpszName);
  GetFieldInfo(n, fieldinfo, dwInfoOptions);
}

short CDaoTableDef::GetIndexCount() {
  TableDefState& st = OpenState(this);
  if (st.bNew) return 0;
  return (short)ListIndexes(EngineOf(m_pDatabase), st.strName).size();
}

void CDaoTableDef::GetIndexInfo(int nIndex, CDaoIndexInfo& indexinfo, DWORD dwInfoOptions) {
  UNUSED(dwInfoOptions);
  TableDefState& st = OpenState(this);
  Engine& engine = EngineOf(m_pDatabase);
  std::vector<IndexRow> rows = st.bNew ? std::vector<IndexRow>() : ListIndexes(engine, st.strName);
  if (nIndex < 0 || (size_t)nIndex >= rows.size()) Throw(3265, "Item not found in this collection.");
  const IndexRow& row = rows[(size_t)nIndex];
  std::vector<CDaoIndexFieldInfo> fields;
  Cursor columns(engine, "PRAGMA index_xinfo(" + Quote(engine, row.strSqlName) + ")");
  while (columns.Next() && fields.size() < 10) {
    // Only the key columns (key = 1), not the row id SQLite adds.
    if (columns.Get(5).bytes != "1" || columns.Get(2).bNull) continue;
    CDaoIndexFieldInfo field;
    field.m_strName = columns.Get(2).bytes.c_str();
    field.m_bDescending = columns.Get(3).bytes == "1";
    fields.push_back(field);
  }
  if (indexinfo.m_bCleanupFieldInfo) delete[] indexinfo.m_pFieldInfos;
  indexinfo.m_strName = row.strName;
  indexinfo.m_nFields = (short)fields.size();
  indexinfo.m_pFieldInfos = new CDaoIndexFieldInfo[fields.size() > 0 ? fields.size() : 1];
  for (size_t i = 0; i < fields.size(); ++i) indexinfo.m_pFieldInfos[i] = fields[i];
  indexinfo.m_bCleanupFieldInfo = TRUE;
  indexinfo.m_bPrimary = row.bPrimary;
  indexinfo.m_bUnique = row.bUnique;
  indexinfo.m_bClustered = FALSE;
  indexinfo.m_bIgnoreNulls = FALSE;
  indexinfo.m_bRequired = row.bPrimary;
  indexinfo.m_bForeign = FALSE;
  indexinfo.m_lDistinctCount = 0;
}

void CDaoTableDef::CreateIndex(CDaoIndexInfo& indexinfo) {
  TableDefState& st = OpenState(this);
  if (EngineOf(m_pDatabase).bReadOnly) ThrowReadOnly();
  if (st.bNew) Throw(3264, "Der Index kann erst nach dem Anfügen der Tabelle (Append) angelegt werden.");
  MakeIndex(this, indexinfo);
}
