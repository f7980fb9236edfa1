// Workbooks: each worksheet of an .xlsx file, read through the registered
// reader, is copied into a temporary Access-type database that the rest of
// the engine then serves read-only. A first pass over a sheet decides each
// field's type from its cells, a second one stores the rows.
#include "dao_private.h"

#include <limits.h>
#include <algorithm>
#include <stdio.h>

namespace {

AFX_DAO_WORKBOOK_FACTORY g_pfnWorkbookFactory = NULL;

struct ColumnKind {
  bool bNumber = false, bText = false, bBoolean = false, bDate = false;
  size_t nLongestText = 0;
};

CString NumberText(double d) {
  CString str;
  str.Format("%.15g", d);
  return str;
}

// A cell as the field stores it (NULL for an empty cell or an error value in
// a field that is not text).
qodao::Value CellValue(short nFieldType, int nType, double dValue, const CString& strText) {
  qodao::Value value;
  CString str;
  switch (nType) {
  case CDaoWorkbookReader::cellEmpty: return value;
  case CDaoWorkbookReader::cellText:
  case CDaoWorkbookReader::cellError:
    if (nFieldType != dbText && nFieldType != dbMemo) return value;
    str = strText;
    break;
  case CDaoWorkbookReader::cellBoolean:
    str = nFieldType == dbBoolean ? (dValue != 0 ? "1" : "0") : (dValue != 0 ? "WAHR" : "FALSCH");
    break;
  case CDaoWorkbookReader::cellDate:
    if (nFieldType == dbDate || nFieldType == dbText || nFieldType == dbMemo) {
      COleDateTime date(dValue);
      str = date.Format(nFieldType == dbDate ? "%Y-%m-%d %H:%M:%S" : "%d.%m.%Y");
      if (nFieldType == dbDate && date.GetYear() < 0) return value;
    } else {
      str = NumberText(dValue);
    }
    break;
  default: str = NumberText(dValue); break;
  }
  value.bNull = false;
  value.bytes.assign((LPCSTR)str, (size_t)str.GetLength());
  return value;
}

void ImportSheet(qodao::Engine& engine, CDaoWorkbookReader& reader, int nSheet) {
  using namespace qodao;
  CString strTable = reader.GetSheetName(nSheet) + "$";
  reader.OpenSheet(nSheet);
  int nColumns = reader.GetColumnCount();
  if (nColumns < 0 || nColumns > kMaxFields) {
    CString strError;
    strError.Format("Too many fields defined: das Blatt '%s' hat %d Spalten, gelesen werden höchstens %d.",
                    (LPCSTR)strTable, nColumns, kMaxFields);
    Throw(3190, strError);
  }
  std::vector<CString> names;
  std::vector<ColumnKind> kinds((size_t)nColumns);
  int nType = 0;
  double dValue = 0;
  CString strText;
  if (reader.NextRow()) {
    for (int c = 0; c < nColumns; ++c) {
      reader.GetCell(c, nType, dValue, strText);
      CString strName = nType == CDaoWorkbookReader::cellText ? strText
                        : nType == CDaoWorkbookReader::cellEmpty ? CString() : NumberText(dValue);
      strName.Trim();
      if (strName.GetLength() > 64) strName = strName.Left(64);
      if (strName.IsEmpty()) strName.Format("F%d", c + 1);
      // Field names are unique, whatever the header holds.
      auto taken = [&](const CString& strCandidate) {
        return std::find_if(names.begin(), names.end(), [&](const CString& strOther) {
                 return strOther.CompareNoCase(strCandidate) == 0;
               }) != names.end();
      };
      for (int n = 2; taken(strName); ++n) strName.Format("F%d_%d", c + 1, n);
      names.push_back(strName);
    }
    while (reader.NextRow()) {
      for (int c = 0; c < nColumns; ++c) {
        reader.GetCell(c, nType, dValue, strText);
        ColumnKind& kind = kinds[(size_t)c];
        switch (nType) {
        case CDaoWorkbookReader::cellNumber: kind.bNumber = true; break;
        case CDaoWorkbookReader::cellBoolean: kind.bBoolean = true; break;
        case CDaoWorkbookReader::cellDate: kind.bDate = true; break;
        case CDaoWorkbookReader::cellText:
          kind.bText = true;
          if ((size_t)strText.GetLength() > kind.nLongestText) kind.nLongestText = (size_t)strText.GetLength();
          break;
        default: break;
        }
      }
    }
  }
  std::vector<short> types;
  CString strCreate = "create table " + Quote(engine, strTable) + " (";
  for (size_t c = 0; c < names.size(); ++c) {
    const ColumnKind& kind = kinds[c];
    int nKinds = (int)kind.bNumber + (int)kind.bText + (int)kind.bBoolean + (int)kind.bDate;
    short nFieldType = dbText;
    if (nKinds == 1 && kind.bNumber) nFieldType = dbDouble;
    else if (nKinds == 1 && kind.bDate) nFieldType = dbDate;
    else if (nKinds == 1 && kind.bBoolean) nFieldType = dbBoolean;
    else if (kind.nLongestText > (size_t)kMaxTextSize) nFieldType = dbMemo;
    types.push_back(nFieldType);
    strCreate += (c > 0 ? ", " : "") + Quote(engine, names[c]) + " " + DeclaredType(nFieldType, kMaxTextSize);
  }
  if (names.empty()) strCreate += "F1 VARCHAR(255)";
  strCreate += ")";
  Guard([&] { engine.db.ExecuteSQL(strCreate); });
  if (names.empty()) return;

  CString strInsert = "insert into " + Quote(engine, strTable) + " values (";
  for (size_t c = 0; c < names.size(); ++c) strInsert += c > 0 ? ", ?" : "?";
  strInsert += ")";
  Guard([&] {
    const int nTextForm = engine.db.GetTextForm();
    std::string insert = qodb::ToDriver(nTextForm, strInsert);
    qodb::StatementHandle stmt(engine.db.AllocStatement());
    engine.db.Check(SQLPrepare(stmt.get(), (SQLCHAR*)insert.data(), (SQLINTEGER)insert.size()), stmt.get(),
                    "SQLPrepare");
    std::vector<std::string> data(names.size());
    std::vector<SQLLEN> lengths(names.size());
    reader.RewindSheet();
    reader.NextRow();   // the names
    engine.db.BeginTrans();
    try {
      while (reader.NextRow()) {
        for (size_t c = 0; c < names.size(); ++c) {
          reader.GetCell((int)c, nType, dValue, strText);
          Value value = CellValue(types[c], nType, dValue, strText);
          data[c] = value.bNull ? std::string() : qodb::ToDriver(nTextForm, value.bytes.c_str(), (int)value.bytes.size());
          lengths[c] = value.bNull ? SQL_NULL_DATA : (SQLLEN)data[c].size();
          engine.db.Check(SQLBindParameter(stmt.get(), (SQLUSMALLINT)(c + 1), SQL_PARAM_INPUT, SQL_C_CHAR, SQL_VARCHAR,
                                           data[c].size() > 0 ? data[c].size() : 1, 0, (SQLPOINTER)data[c].data(),
                                           (SQLLEN)data[c].size(), &lengths[c]),
                          stmt.get(), "SQLBindParameter");
        }
        engine.db.Check(SQLExecute(stmt.get()), stmt.get(), "SQLExecute");
      }
      engine.db.CommitTrans();
    } catch (CException*) {
      engine.db.Rollback();
      throw;
    }
  });
}

} // namespace

void AFXAPI AfxDaoRegisterWorkbookReader(AFX_DAO_WORKBOOK_FACTORY pfnFactory) { g_pfnWorkbookFactory = pfnFactory; }

namespace qodao {

void OpenWorkbook(Engine& engine, LPCTSTR lpszName) {
  if (g_pfnWorkbookFactory == NULL) {
    CString strError;
    strError.Format("Unrecognized database format '%s': Excel-Arbeitsmappen liest diese Datenbank-Engine nur, wenn "
                    "ein Leser für Arbeitsmappen angemeldet ist.",
                    lpszName);
    Throw(3343, strError);
  }
  std::unique_ptr<CDaoWorkbookReader> reader(g_pfnWorkbookFactory());
  if (!reader) Throw(3343, "Der Leser für Arbeitsmappen konnte nicht angelegt werden.");
  reader->Open(lpszName);

  char szFolder[MAX_PATH] = {0};
  char szFile[MAX_PATH] = {0};
  DWORD nFolder = GetTempPathA(MAX_PATH, szFolder);
  if (nFolder == 0 || nFolder >= MAX_PATH || GetTempFileNameA(szFolder, "qox", 0, szFile) == 0)
    Throw(3000, "Für die Arbeitsmappe konnte keine temporäre Datei angelegt werden.");
  engine.strTempFile = szFile;
  Guard([&] { engine.db.OpenEx("Driver=SQLite3;Database=" + CString(szFile), CDatabase::noOdbcDialog); });
  MakeEngineTables(engine);
  int nSheets = reader->GetSheetCount();
  if (nSheets < 0 || nSheets > kMaxObjects) Throw(3161, "Die Arbeitsmappe meldet eine ungültige Zahl von Blättern.");
  for (int i = 0; i < nSheets; ++i) ImportSheet(engine, *reader, i);
  Guard([&] { engine.db.ExecuteSQL("PRAGMA query_only = 1"); });
  engine.bReadOnly = TRUE;
}

Engine::~Engine() {
  db.Close();
  if (!strTempFile.IsEmpty()) DeleteFileA(strTempFile);
}

} // namespace qodao
