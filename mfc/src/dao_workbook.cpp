// Workbooks: each worksheet of an .xlsx file, read through the registered
// reader, is copied into a temporary Access-type database that the rest of
// the engine then serves read-only. A first pass over a sheet decides each
// field's type from its cells, a second one stores the rows.
#include "dao_private.h"

#include <limits.h>
#include <algorithm>
#include <cmath>
#include <stdio.h>
#include <stdlib.h>

namespace {

AFX_DAO_WORKBOOK_FACTORY g_pfnWorkbookFactory = NULL;

struct ColumnKind {
  bool bNumber = false, bText = false, bBoolean = false, bDate = false;
  size_t nLongestText = 0;
};

// The shortest text that reads back as the same double (Excel keeps the
// full value; 15 digits would change one in ten thousand of them).
CString NumberText(double d) { return qodao::RoundTripText(d); }

// Excel counts 29 February 1900, a day that never was (serial 60): serials
// 1 to 59 are one day later on the calendar than an OLE date of the same
// number. Serial 60 is read as 28 February 1900 (the last real day before
// it, time of day kept); below 1 a value is a time without a date, which
// OLE dates hold the same way.
double OleDateOfSerial(double dSerial) {
  return dSerial >= 1 && dSerial < 60 ? dSerial + 1 : dSerial;
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
      COleDateTime date(OleDateOfSerial(dValue));
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

// The longest text a cell may hold: what the engine's cursor reads back as
// one value (UTF-16, one unit for each Windows-1252 character). A longer one
// would be stored but arrive as no value at all, so its sheet is refused
// with the cell named instead.
const size_t kMaxCellText = (size_t)(qodb::kMaxValueBytes / (SQLLEN)sizeof(WCHAR));

[[noreturn]] void RefuseLongCell(const CString& strTable, long lRow, const CString& strField, const CString& strText) {
  CString strError;
  strError.Format("Das Blatt '%s' hat in Zeile %ld, Spalte '%s' einen Text von %d Zeichen; gelesen werden höchstens "
                  "%lu Zeichen in einer Zelle.",
                  (LPCSTR)strTable, lRow, (LPCSTR)strField, strText.GetLength(), (unsigned long)kMaxCellText);
  qodao::Throw(3163, strError);
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
    for (long lRow = 2; reader.NextRow(); ++lRow) {
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
          if ((size_t)strText.GetLength() > kMaxCellText) RefuseLongCell(strTable, lRow, names[(size_t)c], strText);
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
    std::vector<double> numbers(names.size());
    reader.RewindSheet();
    reader.NextRow();   // the names
    engine.db.BeginTrans();
    try {
      while (reader.NextRow()) {
        for (size_t c = 0; c < names.size(); ++c) {
          reader.GetCell((int)c, nType, dValue, strText);
          if (types[c] == dbDouble && nType == CDaoWorkbookReader::cellNumber && std::isfinite(dValue)) {
            // As the double itself: the driver would read a number's text
            // into SQLite's REAL with its own, less exact conversion.
            numbers[c] = dValue;
            lengths[c] = (SQLLEN)sizeof(double);
            engine.db.Check(SQLBindParameter(stmt.get(), (SQLUSMALLINT)(c + 1), SQL_PARAM_INPUT, SQL_C_DOUBLE,
                                             SQL_DOUBLE, 0, 0, &numbers[c], 0, &lengths[c]),
                            stmt.get(), "SQLBindParameter");
            continue;
          }
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

// The copies are named qox<process id>-<n>.tmp, so that an open can tell the
// copies of a process that has ended (killed, crashed) and remove them: a
// workbook's copy is as large as the workbook's data.
CString NewCopyName(const char* pszFolder) {
  static LONG nCounter = 0;
  for (int nAttempt = 0; nAttempt < 100; ++nAttempt) {
    CString strName;
    strName.Format("%sqox%08lx-%lx.tmp", pszFolder, (unsigned long)GetCurrentProcessId(),
                   (unsigned long)InterlockedIncrement(&nCounter));
    HANDLE hFile = CreateFileA(strName, GENERIC_WRITE, 0, NULL, CREATE_NEW, FILE_ATTRIBUTE_NORMAL, NULL);
    if (hFile != INVALID_HANDLE_VALUE) {
      CloseHandle(hFile);
      return strName;
    }
    if (GetLastError() != ERROR_FILE_EXISTS && GetLastError() != ERROR_ALREADY_EXISTS) break;
  }
  return CString();
}

void RemoveStaleCopies(const char* pszFolder) {
  CString strPattern = CString(pszFolder) + "qox*-*.tmp";
  WIN32_FIND_DATAA found;
  HANDLE hFind = FindFirstFileA(strPattern, &found);
  if (hFind == INVALID_HANDLE_VALUE) return;
  do {
    char* pszEnd = NULL;
    const char* pszId = found.cFileName + 3;
    unsigned long nProcess = strtoul(pszId, &pszEnd, 16);
    if (pszEnd != pszId + 8 || *pszEnd != '-' || nProcess == GetCurrentProcessId()) continue;
    // A process that still runs may still use its copy; so may one whose
    // state cannot be asked (then OpenProcess fails with access denied).
    HANDLE hProcess = OpenProcess(SYNCHRONIZE, FALSE, nProcess);
    if (hProcess != NULL) {
      BOOL bEnded = WaitForSingleObject(hProcess, 0) == WAIT_OBJECT_0;
      CloseHandle(hProcess);
      if (!bEnded) continue;
    } else if (GetLastError() != ERROR_INVALID_PARAMETER) {
      continue;
    }
    DeleteFileA(CString(pszFolder) + found.cFileName);   // fails harmlessly while in use
  } while (FindNextFileA(hFind, &found));
  FindClose(hFind);
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
  DWORD nFolder = GetTempPathA(MAX_PATH, szFolder);
  if (nFolder == 0 || nFolder >= MAX_PATH - 32)
    Throw(3000, "Für die Arbeitsmappe konnte keine temporäre Datei angelegt werden.");
  RemoveStaleCopies(szFolder);
  engine.strTempFile = NewCopyName(szFolder);
  if (engine.strTempFile.IsEmpty())
    Throw(3000, "Für die Arbeitsmappe konnte keine temporäre Datei angelegt werden.");
  Guard([&] { engine.db.OpenEx("Driver=SQLite3;Database=" + engine.strTempFile, CDatabase::noOdbcDialog); });
  MakeEngineTables(engine);
  int nSheets = reader->GetSheetCount();
  if (nSheets < 0 || nSheets > kMaxObjects) Throw(3161, "Die Arbeitsmappe meldet eine ungültige Zahl von Blättern.");
  // A sheet the engine cannot take costs only itself: the others are read,
  // and naming it later raises what went wrong with it.
  for (int i = 0; i < nSheets; ++i) {
    CString strTable = reader->GetSheetName(i) + "$";
    try {
      ImportSheet(engine, *reader, i);
    } catch (CDaoException* e) {
      SheetFailure failure;
      failure.strTable = strTable;
      failure.lCode = e->m_pErrorInfo != NULL ? e->m_pErrorInfo->m_lErrorCode : 3343;
      CString strWhy = e->m_pErrorInfo != NULL ? e->m_pErrorInfo->m_strDescription : CString();
      e->Delete();
      if (strWhy.Find(strTable) < 0)
        strWhy = "Das Blatt '" + strTable + "' der Arbeitsmappe kann nicht gelesen werden: " + strWhy;
      failure.strDescription = strWhy;
      engine.sheetFailures.push_back(failure);
      // What the failed import left behind goes.
      try {
        engine.db.ExecuteSQL("drop table if exists " + Quote(engine, strTable));
      } catch (CException* e2) {
        e2->Delete();
      }
    }
  }
  Guard([&] { engine.db.ExecuteSQL("PRAGMA query_only = 1"); });
  engine.bReadOnly = TRUE;
}

void ThrowIfFailedSheet(Engine& engine, const CString& strName) {
  for (const SheetFailure& failure : engine.sheetFailures)
    if (failure.strTable.CompareNoCase(strName) == 0) Throw(failure.lCode, failure.strDescription);
}

Engine::~Engine() {
  db.Close();
  if (!strTempFile.IsEmpty()) DeleteFileA(strTempFile);
}

} // namespace qodao
