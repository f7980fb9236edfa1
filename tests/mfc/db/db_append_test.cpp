// Appending: long values read back whole, failures that say exactly which rows
// are stored, and an SQLite file that other programs read as UTF-8.
#include "DbTestSupport.h"

#include "PythonPeer.h"

class DbAppendTest : public DbTest {};

// Values far longer than the exchange declared, many of them: the queue is
// sent in smaller batches, and every value arrives whole.
TEST_P(DbAppendTest, LongValuesArriveWhole) {
  MakeTable("mfcdb_long", IsPostgres() ? "k varchar(10), v text" : "k varchar(10), v varchar(10)");
  const int nRows = 20, nLength = 1 << 20; // more than one batch's bytes
  {
    CTextSet rs(&m_db);
    rs.Open(CRecordset::snapshot, "select * from mfcdb_long", CRecordset::appendOnly | CRecordset::optimizeBulkAdd);
    for (int i = 0; i < nRows; ++i) {
      rs.AddNew();
      rs.m_values[0].Format("%d", i);
      rs.m_values[1] = CString((char)('A' + i % 26), nLength);
      rs.Update();
    }
    rs.Close();
  }
  CTextSet rs(&m_db);
  rs.Open(CRecordset::snapshot, "select k, v from mfcdb_long", CRecordset::readOnly);
  int nSeen = 0;
  for (; !rs.IsEOF(); rs.MoveNext(), ++nSeen)
    ASSERT_EQ(CString((char)('A' + atoi(rs.m_values[0]) % 26), nLength), rs.m_values[1]) << rs.m_values[0];
  EXPECT_EQ(nRows, nSeen);
}

// What the failure says is stored is what a fresh count finds.
TEST_P(DbAppendTest, FailedRowsAreNamedAndNothingElseIsLost) {
  // serverText: the data source's own words, kept in the message.
  struct Case {
    const char *name, *columns;
    long rows, badRow;
    const char* badKey;
    DWORD options;
    long firstNotStored, inTable;
    bool postgresOnly;
    const char* serverText;
  } cases[] = {
      // The duplicate lies after the first commit: the batches since are lost.
      {"unique", "k varchar(10) primary key, v varchar(40)", 60000, 55555, "7", CRecordset::optimizeBulkAdd, 50000,
       50000, false, "UNIQUE"},
      {"too long", "k varchar(3), v varchar(40)", 10, 2, "abcd", CRecordset::optimizeBulkAdd, 0, 0, true,
       "character varying(3)"},
      // One row at a time: only the failing row is missing.
      {"single rows", "k varchar(10) primary key, v varchar(40)", 6, 3, "1", 0, 3, 5, false, "UNIQUE"},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    if (c.postgresOnly && !IsPostgres()) continue;
    MakeTable("mfcdb_fail", c.columns);
    long lFirst = -2;
    CString strError;
    {
      CTextSet rs(&m_db);
      rs.Open(CRecordset::snapshot, "select * from mfcdb_fail", CRecordset::appendOnly | c.options);
      for (long i = 0; i < c.rows && (strError.IsEmpty() || !c.options); ++i) {
        CString strRowError = DbError(
            [&] {
              rs.AddNew();
              rs.m_values[0].Format("%ld", i);
              if (i == c.badRow) rs.m_values[0] = c.badKey;
              rs.m_values[1].Format("Zeile %ld \xE4", i);
              rs.Update();
            },
            &lFirst);
        if (strError.IsEmpty()) strError = strRowError;
      }
      if (strError.IsEmpty()) strError = DbError([&] { rs.Close(); }, &lFirst);
    }
    EXPECT_FALSE(strError.IsEmpty());
    EXPECT_EQ(c.firstNotStored, lFirst) << (LPCSTR)strError;
    EXPECT_EQ(c.inTable, Count("mfcdb_fail"));
    CString strRow;
    strRow.Format("%ld.", c.firstNotStored + 1);
    EXPECT_GE(strError.Find(strRow), 0) << (LPCSTR)strError;
    CString strServer = IsPostgres() && CString(c.serverText) == "UNIQUE" ? "duplicate key" : c.serverText;
    EXPECT_GE(strError.Find(strServer), 0) << (LPCSTR)strError;
  }
}

TEST_P(DbAppendTest, RecordsetRefusesRowsAfterAFailedBatch) {
  MakeTable("mfcdb_refuse", "k varchar(10) primary key, v varchar(40)");
  CTextSet rs(&m_db);
  rs.Open(CRecordset::snapshot, "select * from mfcdb_refuse", CRecordset::appendOnly | CRecordset::optimizeBulkAdd);
  for (const char* key : {"a", "b", "a"}) {
    rs.AddNew();
    rs.m_values[0] = key;
    EXPECT_TRUE(rs.Update());   // queued
  }
  long lFirst = -2;
  EXPECT_NE("", DbError([&] { rs.FlushBulkAdd(); }, &lFirst));
  EXPECT_EQ(0, lFirst);
  lFirst = -2;
  EXPECT_NE("", DbError([&] { rs.AddNew(); }, &lFirst));
  EXPECT_EQ(0, lFirst);
  EXPECT_EQ("", DbError([&] { rs.Close(); }));
  EXPECT_EQ(0, Count("mfcdb_refuse"));
  // The connection commits by itself again.
  m_db.ExecuteSQL("insert into mfcdb_refuse values ('z', 'z')");
  CDatabase other;
  other.OpenEx(m_strConnect);
  CTextSet count(&other);
  count.Open(CRecordset::snapshot, "select count(*) from mfcdb_refuse", CRecordset::readOnly);
  EXPECT_STREQ("1", count.m_values[0]);
}

// A driver without transactions gets every row on its own: a failure costs
// that row only.
TEST(DbAppendNoTransactions, EachUpdateStoresItsRow) {
  std::string file = (std::filesystem::temp_directory_path() / (UniqueLeaf("qo_notxn_") + ".db")).string();
  CDatabase db;
  db.OpenEx(("Driver=SQLite3;NoTXN=1;Database=" + file).c_str());
  ASSERT_FALSE(db.CanTransact());
  db.ExecuteSQL("create table t (k varchar(10) primary key)");
  CTextSet rs(&db);
  rs.Open(CRecordset::snapshot, "select * from t", CRecordset::appendOnly | CRecordset::optimizeBulkAdd);
  std::vector<long> failed;
  for (const char* key : {"a", "b", "a", "c"}) {
    long lFirst = -2;
    if (!DbError([&] { rs.AddNew(); rs.m_values[0] = key; rs.Update(); }, &lFirst).IsEmpty()) failed.push_back(lFirst);
  }
  EXPECT_EQ(std::vector<long>{2}, failed);
  rs.Close();
  EXPECT_EQ(3, rs.GetRowsStored());
  db.Close();
  std::error_code ignored;
  std::filesystem::remove(file, ignored);
}

INSTANTIATE_TEST_SUITE_P(Drivers, DbAppendTest, testing::Values(Driver::SQLite, Driver::PostgreSQL), DriverName);

// The file holds UTF-8: the sqlite3 shell reads what we wrote as the same letters.
TEST(DbSqliteFile, HoldsUtf8ThatTheShellShares) {
  PeerFolder folder;
  if (!folder.Usable()) GTEST_SKIP() << "no Z:\\tmp in this Wine prefix";
  std::string file = folder.Path("shared.db");
  CDatabase db;
  db.OpenEx(("Driver=SQLite3;Database=" + file).c_str());
  db.ExecuteSQL("create table t (name varchar(20))");
  {
    CTextSet rs(&db);
    rs.Open(CRecordset::snapshot, "select * from t", CRecordset::appendOnly);
    rs.AddNew();
    rs.m_values[0] = "M\xFCller";
    rs.Update();
  }
  db.Close();
  EXPECT_NE(std::string::npos, ReadWholeFile(file).find("M\xC3\xBCller"));

  std::string script = "cd " + folder.UnixPath("") + " && sqlite3 shared.db 'select hex(name) from t' > hex.txt && "
                       "echo ok > done\n";
  std::ofstream(folder.Path("peer.sh"), std::ios::binary) << script;
  std::system(("start /wait /unix /bin/sh " + folder.UnixPath("peer.sh") + " >NUL 2>&1").c_str());
  for (int i = 0; i < 600 && !std::filesystem::exists(folder.Path("done")); ++i)
    std::this_thread::sleep_for(std::chrono::milliseconds(100));
  if (!std::filesystem::exists(folder.Path("done"))) GTEST_SKIP() << "the host's sqlite3 could not be started";
  EXPECT_EQ("4DC3BC6C6C6572\n", ReadWholeFile(folder.Path("hex.txt")));
}
