// Connecting, the diagnostics of failures, and what the connection layer
// does to connect strings and statements.
#include "DbTestSupport.h"

#include <windows.h>

// No driver named, and a database file that is gone (the driver must not make
// a new empty one in its place).
TEST(DbConnect, FailureCarriesTheDriverDiagnostics) {
  std::string missing = (std::filesystem::temp_directory_path() / UniqueLeaf("qo_missing_")).string() + ".db";
  // The connect string, the first record's SQLSTATE, and the start of m_strStateNativeOrigin.
  struct Case { std::string connect; const char* state; const char* origin; } cases[] = {
      {"Database=x", "IM002", "State:IM002,Native:0,Origin:[unixODBC][Driver Manager]"},
      {"ODBC;Driver=SQLite3;NoCreat=1;Database=" + missing, "", "State:"},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.connect);
    CDatabase db;
    try {
      db.OpenEx(c.connect.c_str());
      FAIL() << "connected";
    } catch (CDBException* e) {
      EXPECT_EQ(SQL_ERROR, e->m_nRetCode);
      EXPECT_FALSE(e->m_strError.IsEmpty());
      if (*c.state != '\0') {
        EXPECT_STREQ(c.state, e->m_strSqlState);
      }
      EXPECT_EQ(0, e->m_strStateNativeOrigin.Find(c.origin)) << (LPCSTR)e->m_strStateNativeOrigin;
      EXPECT_EQ(-1, e->m_lFirstRowNotStored);
      e->Delete();
    }
    EXPECT_FALSE(db.IsOpen());
    EXPECT_FALSE(std::filesystem::exists(missing));
  }
}

// The Linux drivers take host paths: a Windows path, absolute or relative to
// the current folder, must name the same file for them as for the program.
// Opened read-only, the file refuses writes.
TEST(DbConnect, WindowsPathsReachTheDriverAsTheSameFileAndReadOnlyRefusesWrites) {
  std::string leaf = UniqueLeaf("qo_path_") + ".db";
  std::string absolute = (std::filesystem::temp_directory_path() / leaf).string();
  std::string relative = UniqueLeaf("qo_rel_") + ".db";
  ASSERT_EQ(':', absolute[1]) << absolute;
  for (const std::string& path : {absolute, relative}) {
    SCOPED_TRACE(path);
    {
      CDatabase db;
      db.OpenEx(("Driver={SQLite3};Database={" + path + "}").c_str());
      db.ExecuteSQL("create table t (a varchar(10))");
    }
    EXPECT_TRUE(std::filesystem::exists(path));
    CString strError = DbError([&] {
      CDatabase db;
      db.OpenEx(("Driver=SQLite3;Database=" + path).c_str(), CDatabase::openReadOnly);
      db.ExecuteSQL("insert into t values ('x')");
    });
    EXPECT_GE(strError.Find("readonly"), 0) << (LPCSTR)strError;
    std::error_code ignored;
    std::filesystem::remove(path, ignored);
  }
}

class DbConnectTest : public DbTest {};

TEST_P(DbConnectTest, StatementFailuresRaiseAndNoRowsIsNoFailure) {
  MakeTable("mfcdb_noop", "a varchar(10)");
  // Nothing to delete: the driver answers SQL_NO_DATA, which is not an error.
  EXPECT_EQ("", DbError([&] { m_db.ExecuteSQL("delete from mfcdb_noop"); }));
  CString strState;
  CString strError = DbError([&] { m_db.ExecuteSQL("select * from mfcdb_no_such_table"); }, nullptr, &strState);
  EXPECT_GE(strError.Find("mfcdb_no_such_table"), 0) << (LPCSTR)strError;
  EXPECT_FALSE(strState.IsEmpty());
  // A statement of blanks (a user's empty query) is a failure, not the end of the program.
  CTextSet blank(&m_db);
  EXPECT_NE("", DbError([&] { blank.Open(CRecordset::snapshot, " \t ", CRecordset::readOnly); }));
  EXPECT_FALSE(blank.IsOpen());
  // The connection is still usable after a failed statement.
  EXPECT_EQ(0, Count("mfcdb_noop"));
}

TEST_P(DbConnectTest, ConnectionIsPreparedForFlatReading) {
  if (IsPostgres()) {
    EXPECT_EQ(CDatabase::textBytes, m_db.GetTextForm());
    const char* pszLog = std::getenv("QO_PG_LOG");
    if (pszLog == nullptr) GTEST_SKIP() << "QO_PG_LOG names no statement log";
    MakeTable("mfcdb_flat", "a varchar(10)");
    m_db.ExecuteSQL("insert into mfcdb_flat values ('1')");
    EXPECT_EQ(1, Count("mfcdb_flat"));
    std::string log = ReadWholeFile(std::string("Z:") + pszLog);
    EXPECT_NE(std::string::npos, log.find("SET client_encoding TO 'WIN1252'"));
    // The driver reads through a server cursor in slices, not the whole result.
    EXPECT_NE(std::string::npos, log.find("fetch 10000 in")) << log.substr(log.size() > 2000 ? log.size() - 2000 : 0);
  } else {
    EXPECT_EQ(CDatabase::textUtf8, m_db.GetTextForm());
    EXPECT_GE(m_db.GetConnect().Find("StepAPI=1"), 0) << (LPCSTR)m_db.GetConnect();
    // A host that wants a result held in memory (no read lock while it reads) says so.
    CDatabase held;
    held.OpenEx(m_strConnect + ";StepAPI=0");
    EXPECT_GE(held.GetConnect().Find("StepAPI=0"), 0) << (LPCSTR)held.GetConnect();
    EXPECT_LT(held.GetConnect().Find("StepAPI=1"), 0) << (LPCSTR)held.GetConnect();
  }
}

INSTANTIATE_TEST_SUITE_P(Drivers, DbConnectTest, testing::Values(Driver::SQLite, Driver::PostgreSQL), DriverName);
