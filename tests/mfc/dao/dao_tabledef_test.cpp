// Table definitions (fields, indexes) and query definitions, read back through
// the engine's catalogue calls.
#include "DaoTestSupport.h"

class DaoTableDefTest : public DaoFileTest {
protected:
  void SetUp() override {
    DaoFileTest::SetUp();
    m_db.Create(m_file.c_str());
  }
};

TEST_F(DaoTableDefTest, FieldTypesSizesAndAttributesReadBack) {
  // Name, type, size asked for, size read back, dbFixedField or dbVariableField.
  const struct { LPCTSTR pszName; short nType; long lSize, lExpected, lKind; } cases[] = {
      {"Kennung", dbLong, 0, 4, dbFixedField},    {"Kürzel", dbText, 3, 3, dbVariableField},
      {"Aktiv", dbBoolean, 0, 1, dbFixedField},   {"Betrag", dbCurrency, 0, 8, dbFixedField},
      {"Datum", dbDate, 0, 8, dbFixedField},      {"Notiz", dbMemo, 0, 0, dbVariableField},
      {"Roh", dbBinary, 16, 16, dbVariableField},
  };
  CDaoTableDef td(&m_db);
  td.Create("Kunden");
  for (const auto& c : cases) td.CreateField(c.pszName, c.nType, c.lSize);
  EXPECT_EQ(3191, DaoError([&] { td.CreateField("Kürzel", dbText, 10); }).lCode);
  EXPECT_EQ(3047, DaoError([&] { td.CreateField("Lang", dbText, 256); }).lCode);
  td.Append();
  td.Close();

  CDaoTableDef reopened(&m_db);
  reopened.Open("kunden");
  ASSERT_EQ((short)(sizeof(cases) / sizeof(cases[0])), reopened.GetFieldCount());
  for (int i = 0; i < (int)(sizeof(cases) / sizeof(cases[0])); ++i) {
    SCOPED_TRACE(cases[i].pszName);
    CDaoFieldInfo info;
    reopened.GetFieldInfo(i, info, AFX_DAO_ALL_INFO);
    EXPECT_EQ(CString(cases[i].pszName), info.m_strName);
    EXPECT_EQ(cases[i].nType, info.m_nType);
    EXPECT_EQ(cases[i].lExpected, info.m_lSize);
    EXPECT_EQ(cases[i].lKind, info.m_lAttributes & (dbFixedField | dbVariableField));
  }
  CDaoFieldInfo info;
  EXPECT_EQ(3265, DaoError([&] { reopened.GetFieldInfo("Fehlt", info); }).lCode);
}

TEST_F(DaoTableDefTest, TablesAreListedOpenedAndDeleted) {
  MakeTable("Orte", {{"Ort", dbText, 30}});
  MakeTable("Länder", {{"Land", dbText, 30}});
  EXPECT_EQ(3010, DaoError([&] { MakeTable("orte", {{"X", dbLong, 0}}); }).lCode);
  ASSERT_EQ(2, m_db.GetTableDefCount());
  CDaoTableDefInfo info;
  m_db.GetTableDefInfo(1, info, AFX_DAO_ALL_INFO);
  EXPECT_EQ(CString("Länder"), info.m_strName);

  CDaoTableDef td(&m_db);
  EXPECT_EQ(3265, DaoError([&] { m_db.DeleteTableDef("Fehlt"); }).lCode);
  m_db.DeleteTableDef("Orte");
  EXPECT_EQ(std::vector<CString>{"Länder"}, TableNames(m_db));
  EXPECT_EQ(3011, DaoError([&] { td.Open("Orte"); }).lCode);
}

TEST_F(DaoTableDefTest, IndexesAreMadeAndListedWithTheirFields) {
  MakeTable("Personen", {{"Nr", dbLong, 0}, {"Name", dbText, 40}, {"Ort", dbText, 40}});
  CDaoTableDef td(&m_db);
  td.Open("Personen");
  MakeIndex(td, "PrimaryKey", {{"Nr", FALSE}}, FALSE, TRUE);
  MakeIndex(td, "NachName", {{"Name", FALSE}, {"Ort", TRUE}});
  EXPECT_EQ(3375, DaoError([&] { MakeIndex(td, "NachName", {{"Name", FALSE}}); }).lCode);
  // Index names are per table: another table may use the same one.
  MakeTable("Firmen", {{"Nr", dbLong, 0}});
  CDaoTableDef firms(&m_db);
  firms.Open("Firmen");
  MakeIndex(firms, "PrimaryKey", {{"Nr", FALSE}}, FALSE, TRUE);

  ASSERT_EQ(2, td.GetIndexCount());
  CDaoIndexInfo info;
  td.GetIndexInfo(1, info);
  EXPECT_EQ(CString("NachName"), info.m_strName);
  EXPECT_FALSE(info.m_bUnique);
  ASSERT_EQ(2, info.m_nFields);
  EXPECT_EQ(CString("Ort"), info.m_pFieldInfos[1].m_strName);
  EXPECT_TRUE(info.m_pFieldInfos[1].m_bDescending);

  // The primary index refuses a second row with the same key.
  m_db.Execute("insert into Personen (Nr) values (1)");
  EXPECT_EQ(3146, DaoError([&] { m_db.Execute("insert into Personen (Nr) values (1)"); }).lCode);
}

TEST_F(DaoTableDefTest, StoredQueriesAreViewsAndTemporaryOnesAreNeverStored) {
  MakeTable("T", {{"A", dbLong, 0}, {"B", dbText, 10}});
  m_db.Execute("insert into T (A, B) values (2, 'zwei')");

  CDaoQueryDef stored(&m_db);
  stored.Create("Grosse", "select B from T where A > 1");
  stored.Append();
  CDaoQueryDef temporary(&m_db);
  temporary.Create(NULL, "select A from T");
  EXPECT_EQ(1, m_db.GetQueryDefCount());
  EXPECT_EQ(1, m_db.GetTableDefCount()); // a view is no table

  CDaoQueryDef reopened(&m_db);
  reopened.Open("Grosse");
  EXPECT_EQ(CString("select B from T where A > 1"), reopened.GetSQL());
  CDaoRecordset rs(&m_db);
  rs.Open(&reopened);
  EXPECT_EQ(CString("zwei"), TextOf(rs.GetFieldValue("B")));
  rs.Close();

  EXPECT_EQ(3012, DaoError([&] {
              CDaoQueryDef again(&m_db);
              again.Create("Grosse", "select * from T");
              again.Append();
            }).lCode);
  m_db.DeleteQueryDef("Grosse");
  EXPECT_EQ(0, m_db.GetQueryDefCount());
}

TEST_F(DaoTableDefTest, NamesJetRefusesAreRefusedBeforeAnythingIsMade) {
  const std::string longest(64, 'n'), tooLong(65, 'n');
  const char* refused[] = {"[Kunden]", "a.b", "a!b", "a`b", " vorn", "Tab\tulator", "", tooLong.c_str()};
  MakeTable("T", {{"A", dbLong, 0}});
  CDaoTableDef existing(&m_db);
  existing.Open("T");
  for (const char* name : refused) {
    SCOPED_TRACE(name);
    CDaoTableDef td(&m_db);
    DaoFailure failure = DaoError([&] { td.Create(name); });
    EXPECT_EQ(3125, failure.lCode);
    if (*name != '\0' && strchr(name, '\t') == nullptr) EXPECT_EQ(0, failure.strDescription.Find(CString("'") + name + "'"));
    td.Create("Neu");
    EXPECT_EQ(3125, DaoError([&] { td.CreateField(name, dbLong, 0); }).lCode);
    EXPECT_EQ(3125, DaoError([&] { MakeIndex(existing, name, {{"A", FALSE}}); }).lCode);
    EXPECT_EQ(3125, DaoError([&] { existing.SetName(name); }).lCode);
  }
  MakeTable(longest.c_str(), {{longest.c_str(), dbLong, 0}});
  EXPECT_EQ(2, m_db.GetTableDefCount()) << "nothing but T and the longest name";
}

TEST_F(DaoTableDefTest, ATableIsSwappedInOneTransactionWithItsFieldsAndIndexes) {
  // "Alt" is the table in use, with a view on it; "Neu" its successor.
  MakeTable("Alt", {{"X", dbLong, 0}});
  m_db.Execute("insert into Alt (X) values (1)");
  CDaoQueryDef view(&m_db);
  view.Create("Sicht", "select * from Alt");
  view.Append();
  CDaoTableDef neu(&m_db);
  neu.Create("Neu");
  neu.CreateField("Nr", dbLong, 0);
  CDaoFieldInfo name;
  name.m_strName = "Name";
  name.m_nType = dbText;
  name.m_lSize = 40;
  name.m_lAttributes = dbVariableField;
  name.m_bRequired = FALSE;
  name.m_bAllowZeroLength = FALSE;
  neu.CreateField(name);
  neu.Append();
  MakeIndex(neu, "Schluessel", {{"Nr", FALSE}}, TRUE);
  m_db.Execute("insert into Neu (Nr, Name) values (7, 'sieben')");
  auto swap = [&] {
    m_db.DeleteTableDef("Alt");
    neu.SetName("Alt");
    MakeIndex(neu, "Alt1", {{"Name", FALSE}});
  };

  CDaoWorkspace* ws = m_db.m_pWorkspace;
  EXPECT_EQ(3034, DaoError([&] { ws->CommitTrans(); }).lCode);
  ws->BeginTrans();
  swap();
  // A unit of the caller's own, given up inside the transaction, takes back only itself.
  ws->BeginTrans();
  MakeTable("Zwischen", {{"Z", dbLong, 0}});
  ws->Rollback();
  ws->Rollback();
  neu.Close();
  EXPECT_EQ((std::vector<CString>{"Alt", "Neu"}), TableNames(m_db));
  neu.Open("Neu");
  EXPECT_EQ(1, neu.GetIndexCount());
  CDaoRecordset old(&m_db);
  old.Open(&view);
  EXPECT_EQ(1, old.GetFieldValue(0).lVal);
  old.Close();

  ws->BeginTrans();
  swap();
  ws->CommitTrans();
  EXPECT_EQ(std::vector<CString>{"Alt"}, TableNames(m_db));
  CDaoTableDef swapped(&m_db);
  swapped.Open("Alt");
  CDaoFieldInfo info;
  swapped.GetFieldInfo(1, info, AFX_DAO_ALL_INFO);
  EXPECT_FALSE(info.m_bAllowZeroLength) << "the field's attributes move with the table";
  ASSERT_EQ(2, swapped.GetIndexCount());
  CDaoIndexInfo index;
  swapped.GetIndexInfo(0, index);
  EXPECT_EQ(CString("Schluessel"), index.m_strName);
  EXPECT_TRUE(index.m_bUnique);
  EXPECT_EQ(3146, DaoError([&] { m_db.Execute("insert into Alt (Nr, Name) values (7, 'doppelt')"); }).lCode);
  CDaoRecordset viaView(&m_db);
  viaView.Open(&view);
  EXPECT_EQ(CString("sieben"), TextOf(viaView.GetFieldValue("Name"))) << "the view serves the new table";
}
