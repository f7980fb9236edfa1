// The ODBC database, input and output filters on real data sources: what a
// host reads and writes, the SQL the server receives, and what happens when
// the source fails.
#include "FilterTestSupport.h"
#include "OdbcTestTargets.h"

#include <CQoException.h>
#include <CQoInputFilterODBC.h>
#include <CQoInterActive.h>
#include <CQoOutputFilterODBC.h>

#include <DialogDriver.h>

#include <fstream>
#include <functional>
#include <sstream>
#include <vector>

using namespace odbctest;

namespace {

// Values that must arrive exactly: quotes, semicolons, umlauts, a long text.
const std::vector<Row> kRows = {
    {"M\xFCller; \"Hans\"", "1"},
    {"O'Brien -- drop table x;", "-42"},
    {"\xC4rger \xDF \x80 \xE9", "0"},
    {std::string(300, 'x'), "2147483647"},
    {"", "7"},
};

// Writes kRows into table `table` (name varchar(400), num integer).
void WriteRows(const std::string& connect, const char* table, int indexedColumn = -1)
{
    CQoOutputFilterODBC out;
    out.SetTableName(table);
    out.NumCols(2);
    out.ColumnName(0, "name");
    out.ColumnName(1, "num");
    out.SetType(0, CQoOutputFilterDB::dbtypeText);
    out.SetLength(0, 400);
    out.SetType(1, CQoOutputFilterDB::dbtypeInteger);
    if (indexedColumn >= 0)
        out.SetIndexed(indexedColumn, true);
    out.UseDB(connect.c_str());
    ASSERT_TRUE(out.Init());
    for (const Row& row : kRows) {
        out.InitRow();
        out.Value(0, row[0].c_str());
        out.Value(1, row[1].c_str());
        EXPECT_TRUE(out.WriteRow());
    }
    out.ReleaseDB();
}

class OdbcFilters : public testing::TestWithParam<Kind> {
protected:
    void SetUp() override
    {
        m_connect = Connect(GetParam(), m_folder);
        if (m_connect.empty())
            GTEST_SKIP() << "no PostgreSQL server (QO_PG_CONNECT is not set)";
        CQoInterActive::SetQuiet(false);
    }
    Folder m_folder;
    std::string m_connect;
};

} // namespace

TEST_P(OdbcFilters, DatabaseOpensRunsStatementsAndNeverCreates)
{
    CQoODBCDatabase db(m_connect.c_str());
    db.ExecuteSql("this is not sent: the database is closed");
    EXPECT_EQ("ODBC Datenbanken m\xFCssen schon angelegt sein!", ErrorOf([&] { db.Open(true); }));
    ASSERT_TRUE(db.Open(false));
    std::string error = ErrorOf([&] { db.ExecuteSql("select * from no_such_table_here"); });
    EXPECT_NE(std::string::npos, error.find("no_such_table_here")) << error;

    CQoODBCDatabase bad("Driver={No Such Driver};Database=x");
    EXPECT_FALSE(ErrorOf([&] { bad.Open(false); }).empty());
    EXPECT_FALSE(bad.IsOpen());
}

TEST_P(OdbcFilters, WhatTheOutputWritesTheInputReadsBackExactly)
{
    WriteRows(m_connect, "kunden");

    CQoInputFilterODBC in(m_connect.c_str());
    in.SetTableName("kunden");
    in.SetTableType(CQoInputFilterDB::tableTable);
    in.Init("");
    EXPECT_EQ(5, in.NumRows());
    EXPECT_EQ(kRows, AllRows(in));

    // Moves by number, backwards, and beyond the end.
    ASSERT_TRUE(in.AbsoluteRow(3));
    ASSERT_TRUE(in.AbsoluteRow(1));
    EXPECT_EQ(kRows[1], CurrentRow(in));
    EXPECT_FALSE(in.AbsoluteRow(5));

    // Counting in the middle of a walk does not end the walk.
    CQoInputFilterODBC counting(m_connect.c_str());
    counting.Init("");
    counting.InitTable("select name, num from kunden order by num", CQoInputFilterDB::tableSql, true);
    ASSERT_TRUE(counting.FirstRow());
    ASSERT_TRUE(counting.NextRow());
    EXPECT_EQ(5, counting.NumRows());
    ASSERT_TRUE(counting.NextRow());
    EXPECT_EQ(kRows[0], CurrentRow(counting)) << "the third by number: -42, 0, 1";

    // An empty result has no rows at all.
    counting.InitTable("select * from kunden where num < -1000", CQoInputFilterDB::tableSql, true);
    EXPECT_EQ(0, counting.NumRows());
    EXPECT_FALSE(counting.FirstRow());
}

TEST_P(OdbcFilters, EveryInitRecreatesTheTableAndUnusableSettingsLoseNothing)
{
    WriteRows(m_connect, "neu", 1);
    WriteRows(m_connect, "neu");   // a second run starts from an empty table
    auto count = [&] {
        CQoInputFilterODBC in(m_connect.c_str());
        in.Init("");
        in.InitTable("neu", CQoInputFilterDB::tableTable, true);
        return in.NumRows();
    };
    EXPECT_EQ(5, count());

    // A column type the table cannot have is refused before anything is dropped.
    CQoOutputFilterODBC out;
    out.SetTableName("neu");
    out.NumCols(2);
    out.SetType(1, 7);
    out.UseDB(m_connect.c_str());
    EXPECT_NE(std::string::npos, ErrorOf([&] { out.Init(); }).find("unbekannter Datentyp 7"));
    out.ReleaseDB();
    EXPECT_EQ(5, count());

    // A name that needs quoting comes quoted from the host and is used as given.
    const char* odd = "\"Kunden; M\xFCller's\"";
    WriteRows(m_connect, odd);
    CQoInputFilterODBC named(m_connect.c_str());
    named.Init("");
    named.InitTable(odd, CQoInputFilterDB::tableTable, true);
    EXPECT_EQ(kRows, AllRows(named));

    // With errors shown, the data source's message is a message box, not an exception.
    qotest::DialogDriver driver;
    driver.Expect([](qotest::Dialog& d) {
        std::string text = d.MessageText();
        EXPECT_TRUE(text.find("syntax") != std::string::npos || text.find("drop") != std::string::npos) << text;
        d.Press(IDOK);
    });
    CQoOutputFilterODBC shown;
    shown.SetTableName("drop");   // a keyword: the create statement fails
    shown.NumCols(1);
    shown.SetShowError(true);
    shown.UseDB(m_connect.c_str());
    EXPECT_EQ("", ErrorOf([&] { EXPECT_TRUE(shown.Init()); }));
    EXPECT_FALSE(shown.WriteRow()) << "no table, no row";
    EXPECT_TRUE(driver.Done());
}

INSTANTIATE_TEST_SUITE_P(Sources, OdbcFilters, testing::Values(sqlite, postgres),
                         [](const testing::TestParamInfo<Kind>& info) { return std::string(KindName(info.param)); });

// --- what the server receives, and failures --------------------------------------------

TEST(OdbcFiltersPostgres, TheServerReceivesTheStatementsOfTheTableInOrder)
{
    Folder folder;
    std::string connect = Connect(postgres, folder);
    SKIP_WITHOUT(connect);
    const char* logPath = std::getenv("QO_PG_LOG");
    if (!logPath)
        GTEST_SKIP() << "no statement log (QO_PG_LOG is not set)";
    std::string log = std::string("Z:") + logPath;

    CQoOutputFilterODBC out;
    out.SetTableName("t_beispiel");
    out.NumCols(3);
    out.ColumnName(0, "a");
    out.SetLength(0, 40);
    out.ColumnName(1, "b");
    out.SetType(1, CQoOutputFilterDB::dbtypeInteger);
    out.ColumnName(2, "k");
    out.SetLength(2, 5);
    out.SetIndexed(2, true);
    out.UseDB(connect.c_str());
    ASSERT_TRUE(out.Init());
    out.ReleaseDB();

    // The server writes its log a moment later.
    std::string text;
    for (int i = 0; i < 50 && text.find("select * from t_beispiel") == std::string::npos; ++i) {
        Sleep(100);
        std::ifstream in(log, std::ios::binary);
        std::ostringstream all;
        all << in.rdbuf();
        text = all.str();
    }
    std::size_t drop = text.rfind("drop table t_beispiel");
    ASSERT_NE(std::string::npos, drop) << "statement log:\n" << text.substr(text.size() > 3000 ? text.size() - 3000 : 0);
    std::size_t create = text.find("create table t_beispiel (a varchar(40), b integer, k varchar(5))", drop);
    std::size_t index = text.find("create index t_beispiel3 on t_beispiel(k)", drop);
    std::size_t select = text.find("select * from t_beispiel", drop);
    EXPECT_NE(std::string::npos, create);
    EXPECT_LT(create, index);
    EXPECT_LT(index, select);
    EXPECT_EQ(std::string::npos, text.find("create index t_beispiel1", drop)) << "only indexed columns get one";
}

TEST(OdbcFiltersPostgres, ALostConnectionStopsTheWriteAndNamesWhatWasNotStored)
{
    Folder folder;
    std::string connect = Connect(postgres, folder);
    SKIP_WITHOUT(connect);
    CQoOutputFilterODBC out;
    out.SetTableName("abbruch");
    out.NumCols(1);
    out.ColumnName(0, "v");
    out.UseDB(connect.c_str());
    ASSERT_TRUE(out.Init());
    long accepted = 0;
    std::string error;
    try {
        for (long i = 0; i < 200000; ++i) {
            if (i == 60000)   // the server ends every other session: as if it stopped
                Sql(connect, "select pg_terminate_backend(pid) from pg_stat_activity "
                             "where datname = current_database() and pid <> pg_backend_pid()");
            out.InitRow();
            out.Value(0, std::to_string(i).c_str());
            if (out.WriteRow())
                ++accepted;
        }
        out.ReleaseDB();
    } catch (const CQoException& e) {
        error = e.Message();
    }
    ASSERT_FALSE(error.empty()) << "the lost connection went unnoticed";
    EXPECT_LT(accepted, 200000);
    CQoInputFilterODBC in(connect.c_str());
    in.Init("");
    in.InitTable("select count(*) from abbruch", CQoInputFilterDB::tableSql, true);
    ASSERT_TRUE(in.FirstRow());
    std::string stored = CurrentRow(in)[0];
    // The message names the first row that is not in the table.
    EXPECT_NE(std::string::npos, error.find(std::to_string(std::stol(stored) + 1))) << error << " / stored " << stored;
}

TEST(OdbcFiltersSqlite, FilesThatAreNoDatabaseGiveClearErrorsAndBatchModeReadsNothing)
{
    Folder folder;
    std::string path = folder.Path("kein.db");
    std::ofstream(path, std::ios::binary) << "Dies ist keine Datenbank, nur Text.\r\n";
    CQoInputFilterODBC in(("Driver=SQLite3;Database=" + path).c_str());
    in.SetTableName("x");
    in.SetTableType(CQoInputFilterDB::tableTable);
    EXPECT_FALSE(ErrorOf([&] { in.Init(""); }).empty());
    EXPECT_EQ(0, in.NumCols());
    EXPECT_FALSE(in.FirstRow());

    // Quiet (batch) mode: no error, and nothing to read.
    CQoInputFilterODBC quiet(("Driver=SQLite3;NoCreat=1;Database=" + folder.Path("fehlt.db")).c_str());
    CQoInterActive::SetQuiet(true);
    std::string error = ErrorOf([&] { quiet.Init(""); });
    CQoInterActive::SetQuiet(false);
    EXPECT_EQ("", error);
    EXPECT_FALSE(quiet.FirstRow());
    EXPECT_FALSE(ErrorOf([&] { quiet.Init(""); }).empty()) << "interactively the same failure is raised";
}
