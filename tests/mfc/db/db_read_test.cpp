// Reading: Windows-1252 text both ways, odd names, and scrolling a result
// that the driver reads forward only.
#include "DbTestSupport.h"

class DbReadTest : public DbTest {};

TEST_P(DbReadTest, TextAndOddNamesRoundTrip) {
  const CString strTable = "\"mfcdb odd \"\"Name\"\" \xE4;1\"";
  MakeTable(strTable, "nr varchar(5), \"Stra\xDF" "e & Nr\" varchar(20000), \"a;b\" varchar(20000)");
  CString strLong;
  for (int i = 0; i < 9000; ++i) strLong += "\xE4\xF6\xFC\x80xyz"[i % 7];
  const char* rows[][2] = {
      {"M\xFCller", "O'Brien; \"Bob\" = 1"},
      {"\x80 5,00 \x96 \xDF\xC4", ""},
      {"", "{braces}}; and %s"},
  };
  {
    CTextSet rs(&m_db);
    rs.Open(CRecordset::snapshot, "select * from " + strTable, CRecordset::appendOnly | CRecordset::optimizeBulkAdd);
    ASSERT_EQ(3u, rs.m_nFields);
    for (int i = 0; i < 4; ++i) {
      rs.AddNew();
      rs.m_values[0].Format("%d", i + 1);
      rs.m_values[1] = i < 3 ? rows[i][0] : (LPCSTR)strLong;
      rs.m_values[2] = i < 3 ? rows[i][1] : (LPCSTR)strLong;
      EXPECT_TRUE(rs.Update());
    }
    rs.Close();
    EXPECT_EQ(4, rs.GetRowsStored());
  }
  m_db.ExecuteSQL("insert into " + strTable + " (nr) values ('5')");

  CTextSet rs(&m_db);
  rs.Open(CRecordset::snapshot, "select * from " + strTable + " order by nr", CRecordset::readOnly);
  EXPECT_STREQ("Stra\xDF" "e & Nr", rs.m_names[1]);
  EXPECT_STREQ("a;b", rs.m_names[2]);
  for (int i = 0; i < 5; ++i, rs.MoveNext()) {
    SCOPED_TRACE(i);
    ASSERT_FALSE(rs.IsEOF());
    CString strExpected1 = i < 3 ? rows[i][0] : (i == 3 ? (LPCSTR)strLong : "");
    CString strExpected2 = i < 3 ? rows[i][1] : (i == 3 ? (LPCSTR)strLong : "");
    EXPECT_TRUE(rs.m_values[1] == strExpected1) << (LPCSTR)rs.m_values[1].Left(40);
    EXPECT_TRUE(rs.m_values[2] == strExpected2) << (LPCSTR)rs.m_values[2].Left(40);
    CString strByName;
    rs.GetFieldValue("[a;b]", strByName);
    EXPECT_TRUE(strByName == strExpected2);
  }
  EXPECT_TRUE(rs.IsEOF());
  // Empty members are stored as empty texts; only the row inserted without
  // them holds NULL.
  EXPECT_EQ(1, Count(strTable + " where \"a;b\" is null"));

  if (const char* pszLog = IsPostgres() ? std::getenv("QO_PG_LOG") : nullptr) {
    // The insert names the columns as the driver spelled them, quoted.
    std::string log = ReadWholeFile(std::string("Z:") + pszLog);
    EXPECT_NE(std::string::npos,
              log.find("insert into \"mfcdb odd \"\"Name\"\" \xE4;1\" (\"nr\", \"Stra\xDF" "e & Nr\", \"a;b\")"));
  }
}

TEST_P(DbReadTest, ScrollsAForwardOnlyResult) {
  MakeTable("mfcdb_scroll", "id integer, v varchar(10)");
  {
    // An empty result is before the first row and after the last.
    CTextSet rs(&m_db);
    rs.Open(CRecordset::snapshot, "select * from mfcdb_scroll", CRecordset::readOnly);
    EXPECT_TRUE(rs.IsBOF() && rs.IsEOF());
    EXPECT_EQ(0, rs.GetRecordCount());
    rs.MoveFirst();
    rs.MoveLast();
    EXPECT_TRUE(rs.IsBOF() && rs.IsEOF());
    EXPECT_NE("", DbError([&] { rs.MoveNext(); }));
  }
  m_db.ExecuteSQL("insert into mfcdb_scroll values (0,'r0'),(1,'r1'),(2,'r2'),(3,'r3'),(4,'r4'),(5,'r5'),"
                  "(6,'r6'),(7,'r7'),(8,'r8'),(9,'r9')");
  enum Op { Next, Prev, First, Last, Rel, Abs };
  // The move, the row's value after it (or BOF / EOF) and GetRecordCount then.
  struct Step { Op op; long n; const char* expected; long count; } steps[] = {
      {Next, 0, "r1", 2},   {Prev, 0, "r0", 2},   {Rel, 4, "r4", 5},    {Abs, 8, "r7", 8},   {Last, 0, "r9", 10},
      {Next, 0, "EOF", 10}, {Prev, 0, "r9", 10},  {Abs, -3, "r7", 10}, {Rel, 5, "EOF", 10}, {First, 0, "r0", 10},
      {Prev, 0, "BOF", 10}, {Abs, 10, "r9", 10}, {Rel, -20, "BOF", 10},
  };
  CTextSet rs(&m_db);
  rs.Open(CRecordset::snapshot, "select v from mfcdb_scroll order by id", CRecordset::readOnly);
  ASSERT_STREQ("r0", rs.m_values[0]);
  EXPECT_FALSE(rs.IsBOF());
  for (const Step& step : steps) {
    SCOPED_TRACE(testing::Message() << "op " << step.op << " " << step.n << " -> " << step.expected);
    switch (step.op) {
    case Next: rs.MoveNext(); break;
    case Prev: rs.MovePrev(); break;
    case First: rs.MoveFirst(); break;
    case Last: rs.MoveLast(); break;
    case Rel: rs.Move(step.n); break;
    case Abs: rs.SetAbsolutePosition(step.n); break;
    }
    EXPECT_EQ(step.count, rs.GetRecordCount());
    if (CString(step.expected) == "EOF" || CString(step.expected) == "BOF") {
      EXPECT_EQ(CString(step.expected) == "EOF", rs.IsEOF() != FALSE);
      EXPECT_EQ(CString(step.expected) == "BOF", rs.IsBOF() != FALSE);
    } else {
      ASSERT_FALSE(rs.IsEOF() || rs.IsBOF());
      EXPECT_STREQ(step.expected, rs.m_values[0]);
      EXPECT_EQ(atol(step.expected + 1), rs.GetCurrentRow());
    }
  }
  // Moving on from before the first row is an error, as in MFC.
  EXPECT_NE("", DbError([&] { rs.MovePrev(); }));
  rs.MoveLast();
  rs.MoveNext();
  EXPECT_NE("", DbError([&] { rs.MoveNext(); }));
}

INSTANTIATE_TEST_SUITE_P(Drivers, DbReadTest, testing::Values(Driver::SQLite, Driver::PostgreSQL), DriverName);
