// Recordsets: moving, counting, values as variants of the field's type,
// appending (in bulk) and editing, and the failures a caller must see.
#include "DaoTestSupport.h"

class DaoRecordsetTest : public DaoFileTest {
protected:
  void SetUp() override {
    DaoFileTest::SetUp();
    m_db.Create(m_file.c_str());
    MakeTable("Zahlen", {{"N", dbLong, 0}, {"Text", dbText, 20}});
    for (int i = 1; i <= 5; ++i) {
      CString strSQL;
      strSQL.Format("insert into Zahlen (N, Text) values (%d, 'Nr. %d')", i, i);
      m_db.Execute(strSQL);
    }
  }
  long Current(CDaoRecordset& rs) { return rs.GetFieldValue("N").lVal; }
};

TEST_F(DaoRecordsetTest, MovesStandWhereDaoStandsAndRaise3021WithoutARecord) {
  CDaoRecordset rs(&m_db);
  rs.Open(dbOpenDynaset, "select * from Zahlen");
  EXPECT_EQ(1, rs.GetRecordCount());   // only what was accessed
  rs.Move(2);
  rs.MovePrev();
  EXPECT_EQ(2, Current(rs));
  rs.MoveLast();
  EXPECT_EQ(5, rs.GetRecordCount());
  EXPECT_EQ(4, rs.GetAbsolutePosition());
  rs.MoveNext();
  EXPECT_TRUE(rs.IsEOF());
  EXPECT_EQ(3021, DaoError([&] { rs.MoveNext(); }).lCode);
  EXPECT_EQ(3021, DaoError([&] { rs.GetFieldValue(0); }).lCode);
  rs.MoveFirst();
  rs.MovePrev();
  EXPECT_TRUE(rs.IsBOF());
  EXPECT_EQ(3021, DaoError([&] { rs.MovePrev(); }).lCode);
  rs.SetAbsolutePosition(3);
  EXPECT_EQ(4, Current(rs));
  EXPECT_EQ(3001, DaoError([&] { rs.SetAbsolutePosition(5); }).lCode);

  CDaoRecordset empty(&m_db);
  empty.Open(dbOpenSnapshot, "select * from Zahlen where N > 100");
  EXPECT_TRUE(empty.IsBOF() && empty.IsEOF());
  EXPECT_EQ(3021, DaoError([&] { empty.MoveFirst(); }).lCode);

  m_db.Close(); // takes its recordsets with it
  EXPECT_FALSE(rs.IsOpen());
}

TEST_F(DaoRecordsetTest, ValuesComeAsVariantsOfTheFieldsType) {
  MakeTable("Alles", {{"Lang", dbLong, 0},
                      {"Text", dbText, 30},
                      {"Geld", dbCurrency, 0},
                      {"Wann", dbDate, 0},
                      {"Memo", dbMemo, 0},
                      {"Roh", dbLongBinary, 0},
                      {"Leer", dbLong, 0}});
  CDaoRecordset rs(&m_db);
  rs.Open(dbOpenTable, "Alles");
  rs.AddNew();
  rs.SetFieldValue("Lang", "-123456");
  rs.SetFieldValue("Text", "Grüße aus Köln");
  rs.SetFieldValue("Geld", "1234,56");
  rs.SetFieldValue("Wann", "24.12.2026 18:30:00");
  CString strLong = "Straße " + CString('ü', 70000);
  rs.SetFieldValue("Memo", COleVariant(strLong, VT_BSTRT));
  COleVariant bytes;
  const unsigned char raw[] = {0, 1, 0xFF, 'x'};
  bytes.SetBytes(raw, sizeof(raw));
  rs.SetFieldValue("Roh", bytes);
  rs.Update();
  rs.Close();

  rs.Open(dbOpenDynaset, "select * from Alles");
  EXPECT_EQ(VT_I4, rs.GetFieldValue("Lang").vt);
  EXPECT_EQ(-123456, rs.GetFieldValue("Lang").lVal);
  EXPECT_EQ(CString("Grüße aus Köln"), TextOf(rs.GetFieldValue("Text")));
  EXPECT_EQ(VT_CY, rs.GetFieldValue("Geld").vt);
  EXPECT_EQ(12345600, rs.GetFieldValue("Geld").cyVal.int64);
  COleVariant when = rs.GetFieldValue("Wann");
  ASSERT_EQ(VT_DATE, when.vt);
  EXPECT_EQ(CString("24.12.2026 18:30"), COleDateTime(when.date).Format("%d.%m.%Y %H:%M"));
  EXPECT_EQ(strLong, TextOf(rs.GetFieldValue("Memo")));
  COleVariant blob = rs.GetFieldValue("Roh");
  ASSERT_EQ(VT_ARRAY | VT_UI1, blob.vt);
  ASSERT_EQ(1, (int)SafeArrayGetDim(blob.parray));
  EXPECT_EQ(0, memcmp(blob.parray->pvData, raw, sizeof(raw)));
  EXPECT_EQ(VT_NULL, rs.GetFieldValue("Leer").vt);
}

TEST_F(DaoRecordsetTest, EditAndDeleteChangeTheCurrentRecordAndTextThatDoesNotFitIsRefused) {
  CDaoRecordset rs(&m_db);
  rs.Open(dbOpenDynaset, "select * from Zahlen");
  rs.Move(1);
  rs.Edit();
  rs.SetFieldValue("Text", "zwei");
  rs.Update();
  rs.MoveNext();
  rs.Delete();
  EXPECT_EQ(3167, DaoError([&] { rs.GetFieldValue(0); }).lCode);
  rs.Close();
  CDaoTableDef td(&m_db);
  td.Open("Zahlen");
  EXPECT_EQ(4, td.GetRecordCount());

  rs.Open(dbOpenTable, "Zahlen");
  rs.AddNew();
  struct { LPCTSTR pszField, pszValue; long lCode; } const cases[] = {
      {"N", "12x", 3421}, {"N", "99999999999", 3349}, {"Text", "einundzwanzig Zeichen", 3163},
      {"Text", "genau zwanzig Zeiche", 0}, {"N", " 42 ", 0},
  };
  for (const auto& c : cases)
    EXPECT_EQ(c.lCode, DaoError([&] { rs.SetFieldValue(c.pszField, c.pszValue); }).lCode) << c.pszValue;
  rs.Update();
  rs.MoveLast();
  EXPECT_EQ(42, Current(rs));
  EXPECT_EQ(CString("genau zwanzig Zeiche"), TextOf(rs.GetFieldValue("Text")));
}

TEST_F(DaoRecordsetTest, BulkAppendStoresEveryRowWithItsNulls) {
  const long kRows = 20001;
  CDaoRecordset rs(&m_db);
  rs.Open(dbOpenTable, "Zahlen");
  for (long i = 0; i < kRows; ++i) {
    rs.AddNew();
    CString strN;
    strN.Format("%ld", 1000 + i);
    rs.SetFieldValue(0, (LPCTSTR)strN);
    // Now and then a row leaves the text out: it must read back as NULL, not "".
    if (i % 1000 != 7) rs.SetFieldValue(1, (LPCTSTR)("Zeile " + strN + " ä"));
    rs.Update();
  }
  rs.Close();

  rs.Open(dbOpenDynaset, "select * from Zahlen where N >= 1000 order by N");
  rs.MoveLast();
  EXPECT_EQ(kRows, rs.GetRecordCount());
  EXPECT_EQ(1000 + kRows - 1, Current(rs));
  EXPECT_EQ(CString("Zeile 21000 ä"), TextOf(rs.GetFieldValue(1)));
  rs.SetAbsolutePosition(7);
  EXPECT_EQ(1007, Current(rs));
  EXPECT_EQ(VT_NULL, rs.GetFieldValue(1).vt);
}

TEST_F(DaoRecordsetTest, ARowTheFileRefusesIsNeverReportedAsStored) {
  CDaoTableDef td(&m_db);
  td.Open("Zahlen");
  MakeIndex(td, "Eindeutig", {{"N", FALSE}}, TRUE);
  CDaoRecordset rs(&m_db);
  rs.Open(&td);
  // Rows 1 to 3 are new, row 4 repeats N = 2 (already in the table), row 5 is new.
  DaoFailure failure;
  for (const char* value : {"10", "11", "12", "2", "13"}) {
    failure = DaoError([&] {
      rs.AddNew();
      rs.SetFieldValue(0, value);
      rs.Update();
    });
    if (failure.lCode != 0) break;
  }
  if (failure.lCode == 0) failure = DaoError([&] { rs.Close(); });
  EXPECT_EQ(3146, failure.lCode);
  // The record named first not stored, and every one before it is in the table.
  int nAt = failure.strDescription.Find("Datensatz ");
  ASSERT_NE(-1, nAt) << (LPCSTR)failure.strDescription;
  long lFirstLost = atol((LPCSTR)failure.strDescription + nAt + 10);
  EXPECT_GE(lFirstLost, 1);
  EXPECT_LE(lFirstLost, 4);
  rs.Close();
  CDaoRecordset check(&m_db);
  check.Open(dbOpenSnapshot, "select count(*) as C from Zahlen where N >= 10");
  COleVariant count = check.GetFieldValue(0);
  count.ChangeType(VT_I4);
  EXPECT_EQ(lFirstLost - 1, count.lVal);
}

TEST_F(DaoRecordsetTest, RowsAppendedToAFileThatVanishedAreReportedAsNotStored) {
  CDaoRecordset rs(&m_db);
  rs.Open(dbOpenTable, "Zahlen");
  rs.AddNew();
  rs.SetFieldValue(0, "77");
  rs.Update();
  ASSERT_TRUE(DeleteFileA(m_file.c_str()));
  DaoFailure failure = DaoError([&] { rs.Close(); });
  // The driver may notice first (3146) or the engine's check after it (3024).
  EXPECT_TRUE(failure.lCode == 3024 || failure.lCode == 3146) << failure.lCode;
  EXPECT_NE(-1, failure.strDescription.Find("nicht gespeichert")) << (LPCSTR)failure.strDescription;
  EXPECT_FALSE(rs.IsOpen());
}
