// Workbooks: served through a reader the program registers, here the base
// library's .xlsx reader; the workbook is written by openpyxl (the host's
// Python) so that what the engine reads is checked against an independent
// writer.
#include "DaoTestSupport.h"

#include "CQoException.h"
#include "CQoXlsxReader.h"
#include "PythonPeer.h"

#include <algorithm>
#include <fstream>
#include <functional>

namespace {

// What a program does to let the engine read workbooks: CQoException becomes
// the DAO error the engine's callers expect.
class CXlsxSource : public CDaoWorkbookReader {
public:
  void Open(LPCTSTR lpszPath) override { Guard([&] { m_reader.Open(lpszPath); }); }
  int GetSheetCount() override { return m_reader.SheetCount(); }
  CString GetSheetName(int nIndex) override { return CString((const char*)m_reader.SheetName(nIndex)); }
  void OpenSheet(int nIndex) override { Guard([&] { m_reader.OpenSheet(nIndex); }); }
  void RewindSheet() override { Guard([&] { m_reader.RewindSheet(); }); }
  int GetColumnCount() override { return m_reader.ColumnCount(); }
  BOOL NextRow() override {
    BOOL bRow = FALSE;
    Guard([&] { bRow = m_reader.NextRow(m_row); });
    return bRow;
  }
  void GetCell(int nColumn, int& nType, double& dValue, CString& strText) override {
    const CQoXlsxReader::Cell& cell = m_row[(size_t)nColumn];
    nType = cell.type;
    dValue = cell.number;
    strText = (const char*)cell.text;
  }

private:
  template <typename F>
  static void Guard(F&& f) {
    try {
      f();
    } catch (const CQoException& e) {
      AfxThrowDaoError(3161, e.what());
    }
  }
  CQoXlsxReader m_reader;
  std::vector<CQoXlsxReader::Cell> m_row;
};

CDaoWorkbookReader* AFXAPI MakeXlsxSource() { return new CXlsxSource; }

struct Registration {
  Registration() { AfxDaoRegisterWorkbookReader(MakeXlsxSource); }
  ~Registration() { AfxDaoRegisterWorkbookReader(NULL); }
};

const char kWriteWorkbook[] = R"PY(
import datetime, openpyxl
wb = openpyxl.Workbook()
ws = wb.active
ws.title = 'Kunden'
ws.append(['Name', 'Betrag', 'Seit', 'Aktiv', 'Gemischt'])
ws.append(['M\u00fcller', 12.5, datetime.datetime(2024, 3, 1), True, 1])
ws.append(['Stra\u00dfe & Co', None, datetime.datetime(1999, 12, 31), False, 'zwei'])
ws.append([None, -3, None, True, None])
wb.create_sheet('Leer')
wb.save(os.path.join(folder, 'kunden.xlsx'))
)PY";

} // namespace

TEST(DaoWorkbookTest, SheetsAreTablesWithTypedFieldsAndTheCopyGoesAtClose) {
  PeerFolder folder;
  if (!folder.Usable() || !RunPython(folder, "write", kWriteWorkbook)) PEER_UNAVAILABLE();
  std::string path = folder.Path("kunden.xlsx");
  CDaoDatabase db;
  EXPECT_EQ(3343, DaoError([&] { db.Open(path.c_str(), FALSE, TRUE, "Excel 8.0;"); }).lCode);
  Registration registration;
  db.Open(path.c_str(), FALSE, TRUE, "Excel 8.0;");
  EXPECT_FALSE(db.CanUpdate());
  EXPECT_EQ((std::vector<CString>{"Kunden$", "Leer$"}), TableNames(db));

  CDaoRecordset rs(&db);
  rs.Open(dbOpenDynaset, "select * from [Kunden$]");
  const short types[] = {dbText, dbDouble, dbDate, dbBoolean, dbText}; // a mixed column is text
  ASSERT_EQ(5, rs.GetFieldCount());
  for (int i = 0; i < 5; ++i) {
    CDaoFieldInfo info;
    rs.GetFieldInfo(i, info);
    EXPECT_EQ(types[i], info.m_nType) << (LPCSTR)info.m_strName;
  }
  EXPECT_EQ(12.5, rs.GetFieldValue("Betrag").dblVal);
  EXPECT_EQ(CString("01.03.2024"), COleDateTime(rs.GetFieldValue("Seit").date).Format("%d.%m.%Y"));
  rs.MoveNext();
  EXPECT_EQ(CString("Straße & Co"), TextOf(rs.GetFieldValue("Name")));
  rs.MoveLast();
  EXPECT_EQ(3, rs.GetRecordCount());
  EXPECT_EQ(VT_NULL, rs.GetFieldValue("Name").vt);
  EXPECT_EQ(3027, DaoError([&] { rs.AddNew(); }).lCode);
  rs.Close();
  // The copy lives in the temporary folder while the workbook is open, and not after.
  WIN32_FIND_DATAA found;
  char szPattern[MAX_PATH];
  GetTempPathA(MAX_PATH, szPattern);
  lstrcatA(szPattern, "qox*.tmp");
  auto countCopies = [&] {
    int n = 0;
    HANDLE hFind = FindFirstFileA(szPattern, &found);
    for (BOOL bMore = hFind != INVALID_HANDLE_VALUE; bMore; bMore = FindNextFileA(hFind, &found)) ++n;
    if (hFind != INVALID_HANDLE_VALUE) FindClose(hFind);
    return n;
  };
  int nOpen = countCopies();
  EXPECT_GE(nOpen, 1);
  db.Close();
  EXPECT_EQ(nOpen - 1, countCopies());
}

namespace {
const char kWriteOddWorkbook[] = R"PY(
import openpyxl
wb = openpyxl.Workbook()
ws = wb.active
ws.title = 'Werte'
ws.append(['Text', 'Datum'])
for value, serial in [(0.1 + 0.2, 1), ('x', 59), (1 / 3, 61), (123456789.12345679, 0.75)]:
    ws.append([value, serial])
    ws.cell(row=ws.max_row, column=2).number_format = 'dd.mm.yyyy'
wide = wb.create_sheet('Breit')
wide.append(['S%d' % i for i in range(300)])
wb.create_sheet('Danach').append(['Name'])
wb.save(os.path.join(folder, 'mappe.xlsx'))
)PY";

std::string TempCopy(DWORD dwProcess, const char* pszTail) {
  char szFolder[MAX_PATH];
  GetTempPathA(MAX_PATH, szFolder);
  char szName[64];
  wsprintfA(szName, "qox%08lx-%s.tmp", (unsigned long)dwProcess, pszTail);
  return std::string(szFolder) + szName;
}
} // namespace

// Dates before March 1900 as Excel shows them (a time without a date stays
// one), one sheet the engine cannot take leaves the others readable and says why,
// and copies left by a killed process are cleared by the next open.
TEST(DaoWorkbookTest, EveryReadableSheetWithExactValuesAndNoStaleCopies) {
  PeerFolder folder;
  if (!folder.Usable() || !RunPython(folder, "odd", kWriteOddWorkbook)) PEER_UNAVAILABLE();
  std::string dead = TempCopy(0x7FFFFFF0, "1");
  std::string mine = TempCopy(GetCurrentProcessId(), "fremd");
  for (const std::string& path : {dead, mine}) CloseHandle(CreateFileA(path.c_str(), GENERIC_WRITE, 0, NULL, CREATE_ALWAYS, 0, NULL));
  Registration registration;
  CDaoDatabase db;
  db.Open(folder.Path("mappe.xlsx").c_str(), FALSE, TRUE, "Excel 8.0;");
  EXPECT_EQ(INVALID_FILE_ATTRIBUTES, GetFileAttributesA(dead.c_str()));
  EXPECT_NE(INVALID_FILE_ATTRIBUTES, GetFileAttributesA(mine.c_str()));
  DeleteFileA(mine.c_str());

  CDaoRecordset rs(&db);
  rs.Open(dbOpenDynaset, "select * from [Werte$]");
  const char* dates[] = {"01.01.1900 00:00", "28.02.1900 00:00", "01.03.1900 00:00", "30.12.1899 18:00"};
  for (int i = 0; i < 4; ++i, rs.MoveNext()) {
    EXPECT_EQ(CString(dates[i]), COleDateTime(rs.GetFieldValue("Datum").date).Format("%d.%m.%Y %H:%M")) << i;
  }
  rs.Close();
  CDaoRecordset after(&db);
  after.Open(dbOpenDynaset, "select * from [Danach$]");
  CDaoFieldInfo info;
  after.GetFieldInfo(0, info);
  EXPECT_EQ(CString("Name"), info.m_strName);
  after.Close();
  for (int nType : {dbOpenDynaset, dbOpenTable}) {
    DaoFailure failure = DaoError([&] {
      CDaoRecordset wide(&db);
      wide.Open(nType, "Breit$");
    });
    EXPECT_EQ(3190, failure.lCode);
    EXPECT_NE(-1, failure.strDescription.Find("Breit")) << (LPCSTR)failure.strDescription;
    EXPECT_NE(-1, failure.strDescription.Find("300")) << (LPCSTR)failure.strDescription;
  }
}

namespace {
// Numbers Excel keeps but 15 digits do not tell apart, in a column of numbers
// and in one of mixed kinds (text). openpyxl writes numbers with 16 digits,
// so its sheet is patched.
const char kWriteExactWorkbook[] = R"PY(
import openpyxl, zipfile
values = [0.1 + 0.2, 1 / 3, 123456789.12345679, 9007199254740993.0, -1.7435332921043034e-297,
          1.2345678901234567e300, 2.2250738585072014e-308, 0.0, -2.5]
wb = openpyxl.Workbook()
ws = wb.active
ws.title = 'Zahlen'
ws.append(['Zahl', 'Gemischt'])
for i in range(len(values)):
    ws.append([1000 + i, 2000 + i])
ws.append([None, 'Text'])
wb.save(os.path.join(folder, 'tmp.xlsx'))
with zipfile.ZipFile(os.path.join(folder, 'tmp.xlsx')) as src, \
     zipfile.ZipFile(os.path.join(folder, 'genau.xlsx'), 'w', zipfile.ZIP_DEFLATED) as dst:
    for item in src.infolist():
        data = src.read(item.filename)
        for i, v in enumerate(values):
            for base in (1000, 2000):
                data = data.replace(b'<v>%d</v>' % (base + i), b'<v>%s</v>' % repr(v).encode())
        dst.writestr(item, data)
open(os.path.join(folder, 'values.txt'), 'w').write('\n'.join(repr(v) for v in values))
)PY";
} // namespace

// Every digit of a number arrives, whether its column holds numbers only
// (read as doubles, also through SQL that sorts them) or mixed kinds (read as
// text).
TEST(DaoWorkbookTest, NumbersKeepEveryDigit) {
  PeerFolder folder;
  if (!folder.Usable() || !RunPython(folder, "exact", kWriteExactWorkbook)) PEER_UNAVAILABLE();
  std::vector<double> values;
  std::ifstream in(folder.Path("values.txt"));
  for (std::string line; std::getline(in, line);) values.push_back(strtod(line.c_str(), NULL));
  ASSERT_EQ(9u, values.size());
  Registration registration;
  CDaoDatabase db;
  DaoFailure failure = DaoError([&] { db.Open(folder.Path("genau.xlsx").c_str(), FALSE, TRUE, "Excel 8.0;"); });
  ASSERT_EQ(0, failure.lCode) << (LPCSTR)failure.strDescription;
  failure = DaoError([&] {
    CDaoRecordset rs(&db);
    rs.Open(dbOpenTable, "Zahlen$");
    for (size_t i = 0; i < values.size(); ++i, rs.MoveNext()) {
      ASSERT_FALSE(rs.IsEOF());
      COleVariant number = rs.GetFieldValue("Zahl");
      ASSERT_EQ(VT_R8, number.vt) << i;
      EXPECT_EQ(values[i], number.dblVal) << i;
      CString strMixed = TextOf(rs.GetFieldValue("Gemischt"));
      EXPECT_EQ(values[i], strtod(strMixed, NULL)) << i << ": " << (LPCSTR)strMixed;
    }
    rs.Close();
    std::vector<double> sorted(values);
    std::sort(sorted.begin(), sorted.end(), std::greater<double>());
    CDaoRecordset query(&db);
    query.Open(dbOpenDynaset, "select Zahl from [Zahlen$] where Zahl is not null order by Zahl desc");
    for (size_t i = 0; i < sorted.size(); ++i, query.MoveNext()) {
      ASSERT_FALSE(query.IsEOF());
      EXPECT_EQ(sorted[i], query.GetFieldValue(0).dblVal) << i;
    }
    EXPECT_TRUE(query.IsEOF());
  });
  EXPECT_EQ(0, failure.lCode) << (LPCSTR)failure.strDescription;
}
