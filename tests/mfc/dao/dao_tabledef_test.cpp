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
  ASSERT_EQ(1, m_db.GetTableDefCount());
  EXPECT_EQ(3011, DaoError([&] { td.Open("Orte"); }).lCode);
}

TEST_F(DaoTableDefTest, IndexesAreMadeAndListedWithTheirFields) {
  MakeTable("Personen", {{"Nr", dbLong, 0}, {"Name", dbText, 40}, {"Ort", dbText, 40}});
  CDaoTableDef td(&m_db);
  td.Open("Personen");
  CDaoIndexFieldInfo key[] = {{"Nr", FALSE}};
  CDaoIndexInfo primary;
  primary.m_strName = "PrimaryKey";
  primary.m_pFieldInfos = key;
  primary.m_nFields = 1;
  primary.m_bPrimary = TRUE;
  td.CreateIndex(primary);
  CDaoIndexFieldInfo nameOrt[] = {{"Name", FALSE}, {"Ort", TRUE}};
  CDaoIndexInfo byName;
  byName.m_strName = "NachName";
  byName.m_pFieldInfos = nameOrt;
  byName.m_nFields = 2;
  td.CreateIndex(byName);
  EXPECT_EQ(3375, DaoError([&] { td.CreateIndex(byName); }).lCode);
  // Index names are per table: another table may use the same one.
  MakeTable("Firmen", {{"Nr", dbLong, 0}});
  CDaoTableDef firms(&m_db);
  firms.Open("Firmen");
  firms.CreateIndex(primary);

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
