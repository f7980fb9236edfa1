// Real Access files, read through the MDBTools driver: tables, exact values,
// and the refusals of writing and of running stored queries.
#include "DaoTestSupport.h"

class DaoMdbTest : public testing::Test {
protected:
  void OpenFixture(const char* pszLeaf) {
    std::string path = std::string(QO_FIXTURES) + "/" + pszLeaf;
    if (!std::filesystem::exists(path)) GTEST_SKIP() << path << " is missing: tools/setup.sh fetches it";
    m_db.Open(path.c_str());
  }
  CDaoDatabase m_db;
};

TEST_F(DaoMdbTest, TheFruitFileListsItsTablesAndReadsThemWhole) {
  OpenFixture("fruit.mdb");
  EXPECT_FALSE(m_db.CanUpdate());
  EXPECT_EQ((std::vector<CString>{"Fruit", "Fruit Salad", "Veggie Salad", "Muffin/Bread", "Dried"}), TableNames(m_db));

  CDaoTableDef td(&m_db);
  td.Open("Fruit");
  ASSERT_EQ(11, td.GetFieldCount());

  CDaoRecordset rs(&m_db);
  rs.Open(&td);
  EXPECT_EQ(37, rs.GetRecordCount());
  EXPECT_EQ(CString("Apple"), TextOf(rs.GetFieldValue("Fruit")));
  rs.MoveNext();
  EXPECT_EQ(CString("Apricot"), TextOf(rs.GetFieldValue(0)));
  EXPECT_EQ(420, rs.GetFieldValue("Vit A").lVal);
}

TEST_F(DaoMdbTest, WritingAndStoredQueriesAreRefusedClearly) {
  OpenFixture("fruit.mdb");
  CDaoRecordset rs(&m_db);
  rs.Open(dbOpenDynaset, "select * from [Dried]");
  EXPECT_FALSE(rs.CanUpdate());
  EXPECT_EQ(3027, DaoError([&] { rs.AddNew(); }).lCode);
  rs.Close();
  EXPECT_EQ(3027, DaoError([&] { m_db.Execute("delete from [Dried]"); }).lCode);
  // What the driver cannot answer correctly is not asked.
  EXPECT_EQ(3251, DaoError([&] { rs.Open(dbOpenDynaset, "select * from [Dried] where Fruit = 'Apple'"); }).lCode);

  if (m_db.GetQueryDefCount() == 0) GTEST_SKIP() << "the MDBTools driver lists no stored queries of this file";
  CDaoQueryDefInfo info;
  m_db.GetQueryDefInfo(0, info);
  CDaoQueryDef qd(&m_db);
  qd.Open(info.m_strName);
  DaoFailure failure = DaoError([&] { rs.Open(&qd); });
  EXPECT_EQ(3265, failure.lCode);
  EXPECT_NE(-1, failure.strDescription.Find("Access-Datei"));
}

TEST_F(DaoMdbTest, TheUsersFileGivesTypedValues) {
  OpenFixture("node-adodb.mdb");
  EXPECT_EQ((std::vector<CString>{"Users"}), TableNames(m_db));
  CDaoRecordset rs(&m_db);
  rs.Open(dbOpenTable, "Users");
  EXPECT_EQ(3, rs.GetRecordCount());
  EXPECT_EQ(1, rs.GetFieldValue("UserId").lVal);
  EXPECT_EQ(CString("Nuintun"), TextOf(rs.GetFieldValue("UserName")));
  COleVariant born = rs.GetFieldValue("UserBirthday");
  ASSERT_EQ(VT_DATE, born.vt);
  EXPECT_EQ(CString("25.01.1989"), COleDateTime(born.date).Format("%d.%m.%Y"));
  COleVariant married = rs.GetFieldValue("UserMarried");
  ASSERT_EQ(VT_BOOL, married.vt);
  EXPECT_EQ(VARIANT_TRUE, married.boolVal);
}
