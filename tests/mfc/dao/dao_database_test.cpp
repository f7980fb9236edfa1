// Making and opening database files: the kinds of file the engine refuses,
// passwords, read-only files.
#include "DaoTestSupport.h"

#include "afxdb.h"

#include <fstream>

using DaoDatabaseTest = DaoFileTest;

TEST_F(DaoDatabaseTest, CreateMakesAFileThatOpensAgainAndRefusesToOverwrite) {
  m_db.Create(m_file.c_str());
  EXPECT_TRUE(m_db.CanUpdate());
  m_db.Close();

  EXPECT_EQ(3204, DaoError([&] { m_db.Create(m_file.c_str()); }).lCode);

  // A folder that does not exist: an error, and no file anywhere else either.
  std::string nowhere = (std::filesystem::path(m_file).parent_path() / "fehlt" / "neu.db").string();
  EXPECT_EQ(3044, DaoError([&] { m_db.Create(nowhere.c_str()); }).lCode);
  EXPECT_FALSE(m_db.IsOpen());
  EXPECT_FALSE(std::filesystem::exists(nowhere));
}

TEST_F(DaoDatabaseTest, FilesThatAreNoDatabaseOfOursAreRefused) {
  // Name, the file's content ("-" for no file), and the error.
  const struct { const char* pszName; std::string content; long lCode; } cases[] = {
      {"missing", "-", 3024}, {"empty", "", 3343},
      {"truncated SQLite", std::string("SQLite format 3") + '\0' + std::string(84, '\x01'), 3343},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.pszName);
    std::string file = TempFile(".mdb");
    if (c.content != "-") std::ofstream(file, std::ios::binary) << c.content;
    DaoFailure failure = DaoError([&] { m_db.Open(file.c_str()); });
    EXPECT_EQ(c.lCode, failure.lCode);
    EXPECT_FALSE(m_db.IsOpen());
    if (c.lCode == 3343) {
      EXPECT_EQ("Unrecognized database format '" + CString(file.c_str()) + "'.", failure.strDescription);
    }
    std::filesystem::remove(file);
  }
}

TEST_F(DaoDatabaseTest, PasswordIsCheckedAtOpenAndCanBeChanged) {
  m_db.Create(m_file.c_str(), dbLangGeneral + CString(";pwd=Geheim"));
  m_db.Close();
  for (const char* pszConnect : {"", ";PWD=geheim"}) { // none, or in the wrong case
    EXPECT_EQ(3031, DaoError([&] { m_db.Open(m_file.c_str(), FALSE, FALSE, pszConnect); }).lCode) << pszConnect;
    m_db.Close();
  }
  // The password's text is not in the file.
  std::ifstream in(m_file, std::ios::binary);
  std::string all((std::istreambuf_iterator<char>(in)), std::istreambuf_iterator<char>());
  EXPECT_EQ(std::string::npos, all.find("Geheim"));

  EXPECT_EQ(3031, DaoError([&] { CDaoDatabase::SetPassword(m_file.c_str(), "falsch", "Neu"); }).lCode);
  CDaoDatabase::SetPassword(m_file.c_str(), "Geheim", "Neu");
  EXPECT_EQ(3031, DaoError([&] { m_db.Open(m_file.c_str(), FALSE, FALSE, ";PWD=Geheim"); }).lCode);
  m_db.Open(m_file.c_str(), FALSE, FALSE, ";PWD=Neu");
  EXPECT_TRUE(m_db.IsOpen());
}

TEST_F(DaoDatabaseTest, AReadOnlyFileIsReadButNotWritten) {
  m_db.Create(m_file.c_str());
  MakeTable("T", {{"A", dbLong, 4}});
  m_db.Execute("insert into T (A) values (7)");
  m_db.Close();
  // The read-only attribute counts even for an administrator (the tests run as root).
  ASSERT_TRUE(SetFileAttributesA(m_file.c_str(), FILE_ATTRIBUTE_READONLY));
  m_db.Open(m_file.c_str());
  EXPECT_FALSE(m_db.CanUpdate());
  CDaoRecordset rs(&m_db);
  rs.Open(dbOpenTable, "T");
  EXPECT_EQ(7, rs.GetFieldValue(0).lVal);
  EXPECT_FALSE(rs.CanUpdate());
  EXPECT_EQ(3027, DaoError([&] { rs.AddNew(); }).lCode);
  rs.Close();
  m_db.Close();
  SetFileAttributesA(m_file.c_str(), FILE_ATTRIBUTE_NORMAL);
}

TEST_F(DaoDatabaseTest, ExecuteRunsActionStatementsAndRaisesOnFailure) {
  m_db.Create(m_file.c_str());
  MakeTable("T", {{"A", dbLong, 4}});
  m_db.Execute("insert into T (A) values (1)");
  m_db.Execute("insert into T (A) select A + 1 from T");
  m_db.Execute("update T set A = A * 10");
  EXPECT_EQ(2, m_db.GetRecordsAffected());
  m_db.Execute("update T set A = A + 1 where A = 'x;y';  ");
  const struct { const char* pszSQL; long lCode; } cases[] = {
      {"das ist kein SQL", 3146}, {"select * from T", 3065}, {"update T set A = 0; delete from T", 3142}};
  for (const auto& c : cases) {
    SCOPED_TRACE(c.pszSQL);
    DaoFailure failure = DaoError([&] { m_db.Execute(c.pszSQL, dbFailOnError); });
    EXPECT_EQ(c.lCode, failure.lCode);
    EXPECT_FALSE(failure.strDescription.IsEmpty());
  }
}
