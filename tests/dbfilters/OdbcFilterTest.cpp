// The ODBC database, input and output filters on real data sources: what a
// host reads and writes, the SQL the server receives, what an unfinished or
// failed run leaves behind, and what happens when the source fails.
#include "FilterTestSupport.h"

#include <CQoInputFilterODBC.h>
#include <CQoODBCDatabase.h>
#include <CQoInterActive.h>
#include <CQoLog.h>
#include <CQoOutputFilterODBC.h>
#include <QoSqlName.h>

#include <DialogDriver.h>

#include <cstdlib>
#include <fstream>
#include <functional>
#include <regex>
#include <vector>

namespace {

enum Kind { sqlite, postgres };

// A new SQLite file per test, or the loopback PostgreSQL server of the test
// run when QO_PG_CONNECT names it ("" otherwise).
std::string Connect(Kind kind, const Folder& folder)
{
    if (kind == sqlite)
        return "Driver=SQLite3;Database=" + folder.Path("test.db");
    const char* pg = std::getenv("QO_PG_CONNECT");
    return pg ? pg : "";
}

#define SKIP_WITHOUT(connect) \
    if ((connect).empty()) GTEST_SKIP() << "no PostgreSQL server (QO_PG_CONNECT is not set)"

// Values that must arrive exactly: quotes, semicolons, umlauts, a long text.
const std::vector<Row> kRows = {
    {"M\xFCller; \"Hans\"", "1"},
    {"O'Brien -- drop table x;", "-42"},
    {"\xC4rger \xDF \x80 \xE9", "0"},
    {std::string(300, 'x'), "2147483647"},
    {"", "7"},
};

// An output of kRows' shape (name varchar(400), num integer) into `table`.
void Prepare(CQoOutputFilterODBC& out, const std::string& connect, const char* table, int indexedColumn = -1)
{
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
}

void Put(CQoOutputFilterODBC& out, const Row& row)
{
    out.InitRow();
    out.Value(0, row[0].c_str());
    out.Value(1, row[1].c_str());
    EXPECT_TRUE(out.WriteRow());
}

void WriteRows(const std::string& connect, const char* table, int indexedColumn = -1)
{
    CQoOutputFilterODBC out;
    Prepare(out, connect, table, indexedColumn);
    ASSERT_TRUE(out.Init());
    for (const Row& row : kRows)
        Put(out, row);
    out.ReleaseDB();
}

std::vector<Row> Query(const std::string& connect, const std::string& sql)
{
    CQoInputFilterODBC in(connect.c_str());
    in.Init("");
    in.InitTable(sql.c_str(), CQoInputFilterDB::tableSql, true);
    return AllRows(in);
}

// Everything a user of the database sees of its tables: each table's
// columns with their types, each index, and the rows of `table`.
std::vector<Row> Dump(Kind kind, const std::string& connect, const std::string& table)
{
    std::vector<Row> dump =
        kind == sqlite
            ? Query(connect, "select type, name, tbl_name, sql from sqlite_master order by type, name")
            : Query(connect, "select table_name, column_name, data_type, character_maximum_length "
                             "from information_schema.columns where table_schema = current_schema() "
                             "order by table_name, ordinal_position");
    if (kind == postgres)
        for (const Row& row : Query(connect, "select indexname, indexdef from pg_indexes "
                                             "where schemaname = current_schema() order by indexname"))
            dump.push_back(row);
    for (const Row& row : Query(connect, "select * from " + table + " order by num"))
        dump.push_back(row);
    return dump;
}

class OdbcFilters : public testing::TestWithParam<Kind> {
protected:
    void SetUp() override
    {
        m_connect = Connect(GetParam(), m_folder);
        SKIP_WITHOUT(m_connect);
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

TEST_P(OdbcFilters, NamesThatWouldBeMoreThanANameAreRefusedBeforeAnythingIsSent)
{
    const char* plain = "ist kein einfacher Name";
    const char* unpaired = "unpaariges Anf\xFChrungszeichen";
    const char* control = "Steuerzeichen";
    struct Case {
        const char* name;
        const char* problem;   // nullptr: a name
    } cases[] = {
        {"Kunden", nullptr},
        {"public.Kunden_2024$#@", nullptr},
        {"\"Kunden; M\xFC" "ller's \"\"neu\"\"\"", nullptr},
        {"[a]]b].`c``d`", nullptr},
        {"\xC4nderungen", nullptr},
        {"opfer; drop table opfer", plain},
        {"a integer); drop table opfer; --", plain},
        {"opfer -- Kommentar", plain},
        {"\"opfer\"; drop table opfer", plain},
        {"\"opfer", unpaired},
        {"op\"fer", unpaired},
        {"\"a\nb\"", control},
        {"", "leer"},
        {"a..b", "leer"},
    };
    WriteRows(m_connect, "opfer");
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        CQoString problem;
        EXPECT_EQ(c.problem == nullptr, QoCheckSqlName(c.name, problem));
        if (c.problem == nullptr)
            continue;
        EXPECT_NE(std::string::npos, std::string(problem).find(c.problem)) << problem;
        // As a table name of the output, as a column name, and as a table of the input.
        for (int asColumn = 0; asColumn < 2; ++asColumn) {
            CQoOutputFilterODBC out;
            Prepare(out, m_connect, asColumn ? "neu" : c.name);
            if (asColumn)
                out.ColumnName(1, c.name);
            else if (*c.name == '\0') {
                EXPECT_FALSE(out.Init()) << "no table name: nothing to do";
                continue;
            }
            std::string error = ErrorOf([&] { out.Init(); });
            EXPECT_NE(std::string::npos, error.find(problem)) << error;
            EXPECT_NE(std::string::npos, error.find(asColumn ? "Spalte" : "Tabelle")) << error;
        }
        if (*c.name != '\0') {
            CQoInputFilterODBC in(m_connect.c_str());
            in.Init("");
            EXPECT_NE("", ErrorOf([&] { in.InitTable(c.name, CQoInputFilterDB::tableTable, true); }));
        }
    }
    EXPECT_EQ(kRows, Query(m_connect, "select * from opfer"));

    // A statement is the host's SQL; one of blanks only is an error, not the end of the program.
    CQoInputFilterODBC in(m_connect.c_str());
    in.Init("");
    for (const char* blank : {"", "   \t "})
        EXPECT_NE(std::string::npos, ErrorOf([&] { in.InitTable(blank, CQoInputFilterDB::tableSql, true); })
                                         .find("keine SQL-Anweisung"));

    // Any text becomes one name in the driver's quote.
    CQoOutputFilterODBC out;
    out.UseDB(m_connect.c_str());
    CQoString quote = (const char*)out.GetDatabase().GetIdentifierQuote();
    EXPECT_EQ("\"", std::string(quote));
    out.ReleaseDB();
    CQoString odd = QoQuoteSqlName("Kunden \"neu\"; drop table opfer", quote);
    CQoString problem;
    EXPECT_TRUE(QoCheckSqlName(odd, problem)) << odd;
    WriteRows(m_connect, odd);
    EXPECT_EQ(kRows, Query(m_connect, std::string("select * from ") + odd.GetString()));
    EXPECT_EQ(kRows, Query(m_connect, "select * from opfer"));
}

TEST_P(OdbcFilters, AnUnfinishedOrFailedRunLeavesTheOldTableExactlyAsItWas)
{
    const bool pg = GetParam() == postgres;
    WriteRows(m_connect, "bestand", 1);
    const std::vector<Row> before = Dump(GetParam(), m_connect, "bestand");
    bool indexed = false;
    for (const Row& row : before)
        for (const std::string& value : row)
            indexed = indexed || value.find("bestand2") != std::string::npos;
    EXPECT_TRUE(indexed) << "the index of the second column, named by its number";

    std::string longName(70, 'x');
    struct Case {
        const char* what;
        std::function<void(CQoOutputFilterODBC&)> run;   // on an output prepared for "bestand"
        const char* error;                               // what the report holds; nullptr: no report
        bool postgresOnly;
    } cases[] = {
        {"the host discards after some rows",
         [&](CQoOutputFilterODBC& out) {
             out.Init();
             Put(out, kRows[0]);
             Put(out, kRows[1]);
             out.Discard();
             out.ReleaseDB();
         },
         nullptr, false},
        {"the host stops with an exception",
         [&](CQoOutputFilterODBC& out) {
             out.Init();
             Put(out, kRows[0]);
             CQoException::Throw("Abbruch", nullptr);
         },
         "Abbruch", false},
        {"two columns differ only in case",
         [&](CQoOutputFilterODBC& out) {
             out.ColumnName(1, "NAME");
             out.Init();
         },
         "name", false},
        {"two names are one after the server's cut",
         [&](CQoOutputFilterODBC& out) {
             out.ColumnName(0, (longName + "a").c_str());
             out.ColumnName(1, (longName + "b").c_str());
             out.Init();
         },
         "xxxxxxxx", true},
        {"the server refuses a row",
         [&](CQoOutputFilterODBC& out) {
             out.SetLength(0, 5);
             out.Init();
             Put(out, {"kurz", "1"});
             Put(out, {"viel zu lang", "2"});
             out.ReleaseDB();
         },
         "character varying(5)", true},
        {"PostgreSQL keeps no NUL in text: the value is refused, never cut",
         [&](CQoOutputFilterODBC& out) {
             out.Init();
             Put(out, kRows[0]);
             out.InitRow();
             out.Value(0, CQoString("ab\0cd", 5));
             out.Value(1, "2");
             out.WriteRow();
             out.ReleaseDB();
         },
         "Datensatz 2, Spalte name", true},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.what);
        if (c.postgresOnly && !pg)
            continue;
        std::string error = ErrorOf([&] {
            CQoOutputFilterODBC out;
            Prepare(out, m_connect, "bestand", 1);
            c.run(out);
        });
        if (c.error == nullptr)
            EXPECT_EQ("", error);
        else
            EXPECT_NE(std::string::npos, error.find(c.error)) << error;
        EXPECT_EQ(before, Dump(GetParam(), m_connect, "bestand"));
    }

    // A run that dies leaves its new table; the next run removes it.
    {
        CQoOutputFilterODBC out;
        Prepare(out, m_connect, "bestand", 1);
        out.Init();
        Put(out, {"neu", "99"});
        out.GetDatabase().Close();   // as the connection of a killed process ends
    }
    EXPECT_NE(before, Dump(GetParam(), m_connect, "bestand"));
    EXPECT_EQ(kRows, Query(m_connect, "select * from bestand")) << "the old table is still untouched";
    WriteRows(m_connect, "bestand", 1);
    EXPECT_EQ(before, Dump(GetParam(), m_connect, "bestand"));
}

// A statement over the target table is read while its successor fills;
// the input is closed before the output ends. The SQLite driver answers a
// statement from memory with StepAPI=0, so no read lock stands in the way.
TEST_P(OdbcFilters, TheSameTableIsReadAndReplaced)
{
    WriteRows(m_connect, "kunden", 0);
    std::string input = m_connect + (GetParam() == sqlite ? ";StepAPI=0" : "");
    CQoInputFilterODBC in(input.c_str());
    in.Init("");
    in.InitTable("select * from kunden", CQoInputFilterDB::tableSql, true);
    CQoOutputFilterODBC out;
    Prepare(out, m_connect, "kunden", 0);
    ASSERT_TRUE(out.Init());
    std::vector<Row> expected;
    for (bool ok = in.FirstRow(); ok; ok = in.NextRow()) {
        Row row = CurrentRow(in);
        row[0] += " (neu)";
        expected.push_back(row);
        Put(out, row);
    }
    in.CloseResources();
    EXPECT_EQ("", ErrorOf([&] { out.ReleaseDB(); }));
    ASSERT_EQ(kRows.size(), expected.size());
    EXPECT_EQ(expected, Query(m_connect, "select * from kunden"));
}

TEST_P(OdbcFilters, ErrorsAreShownInsteadOfRaisedWhenTheHostAsks)
{
    qotest::DialogDriver driver;
    driver.Expect([](qotest::Dialog& d) {
        std::string text = d.MessageText();
        EXPECT_NE(std::string::npos, text.find("name")) << text;
        d.Press(IDOK);
    });
    CQoOutputFilterODBC shown;
    Prepare(shown, m_connect, "gezeigt");
    shown.ColumnName(1, "Name");   // the create statement fails
    shown.SetShowError(true);
    EXPECT_EQ("", ErrorOf([&] { EXPECT_TRUE(shown.Init()); }));
    EXPECT_FALSE(shown.WriteRow()) << "no table, no row";
    EXPECT_TRUE(driver.Done());

    // A column type the table cannot have is refused before anything is sent.
    CQoOutputFilterODBC out;
    Prepare(out, m_connect, "gezeigt");
    out.SetType(1, 7);
    EXPECT_NE(std::string::npos, ErrorOf([&] { out.Init(); }).find("unbekannter Datentyp 7"));
}

INSTANTIATE_TEST_SUITE_P(Sources, OdbcFilters, testing::Values(sqlite, postgres),
                         [](const testing::TestParamInfo<Kind>& info) { return info.param == sqlite ? "SQLite" : "PostgreSQL"; });

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
    Prepare(out, connect, "t_beispiel", 1);
    ASSERT_TRUE(out.Init());
    out.ReleaseDB();

    std::string text;
    for (int i = 0; i < 50 && text.find("create index t_beispiel2") == std::string::npos; ++i) {
        Sleep(100);
        text = ReadBytes(log);
    }
    std::smatch created;
    ASSERT_TRUE(std::regex_search(text, created, std::regex("create table (qo_neu_[0-9a-f]{8}) \\(name varchar\\(400\\), num integer\\)")))
        << "statement log:\n" << text.substr(text.size() > 3000 ? text.size() - 3000 : 0);
    const std::string temp = created[1];
    std::size_t at = (std::size_t)created.position(0);
    std::size_t leftover = text.rfind("drop table if exists " + temp, at);
    std::size_t select = text.find("select * from " + temp, at);
    std::size_t drop = text.find("drop table if exists t_beispiel", at);
    std::size_t rename = text.find("alter table " + temp + " rename to t_beispiel", at);
    std::size_t index = text.find("create index t_beispiel2 on t_beispiel(num)", at);
    EXPECT_NE(std::string::npos, leftover);
    EXPECT_LT(select, drop);
    EXPECT_LT(drop, rename);
    EXPECT_LT(rename, index);
    EXPECT_EQ(std::string::npos, text.find("create index t_beispiel1", at)) << "only indexed columns get one";
}

TEST(OdbcFiltersPostgres, ALostConnectionStopsTheWriteAndKeepsTheOldTable)
{
    Folder folder;
    std::string connect = Connect(postgres, folder);
    SKIP_WITHOUT(connect);
    WriteRows(connect, "abbruch");
    CQoOutputFilterODBC out;
    Prepare(out, connect, "abbruch");
    ASSERT_TRUE(out.Init());
    long accepted = 0;
    std::string error;
    try {
        for (long i = 0; i < 200000; ++i) {
            if (i == 60000) {   // the server ends every other session: as if it stopped
                CQoODBCDatabase db(connect.c_str());
                db.Open(false);
                db.ExecuteSql("select pg_terminate_backend(pid) from pg_stat_activity "
                              "where datname = current_database() and pid <> pg_backend_pid()");
            }
            Put(out, {"x", std::to_string(i)});
            ++accepted;
        }
        out.ReleaseDB();
    } catch (const CQoException& e) {
        error = e.Message();
    }
    ASSERT_FALSE(error.empty()) << "the lost connection went unnoticed";
    EXPECT_LT(accepted, 200000);
    EXPECT_NE(std::string::npos, error.find("abbruch")) << error;
    EXPECT_NE(std::string::npos, error.find("unver\xE4ndert")) << error;
    EXPECT_EQ(kRows, Query(connect, "select * from abbruch"));
}

TEST(OdbcFiltersPostgres, AFailureFoundAtTheEndIsLoggedOnceOnOneLine)
{
    Folder folder;
    std::string connect = Connect(postgres, folder);
    SKIP_WITHOUT(connect);
    std::string log = folder.Path("qo.log");
    _theLog.Open(log.c_str());
    {
        CQoOutputFilterODBC out;
        Prepare(out, connect, "einmal");
        out.SetLength(0, 3);
        ASSERT_TRUE(out.Init());
        Put(out, {"abc", "1"});
        Put(out, {"abcdef", "2"});   // queued; refused when the filter ends
    }
    _theLog.Close();
    std::vector<std::string> lines;
    std::ifstream in(log, std::ios::binary);
    for (std::string line; std::getline(in, line);)
        if (!line.empty() && line != "\r")
            lines.push_back(line);
    ASSERT_EQ(1u, lines.size()) << (lines.empty() ? "" : lines[0] + " | " + lines.back());
    EXPECT_NE(std::string::npos, lines[0].find("ERR: ")) << lines[0];
    EXPECT_NE(std::string::npos, lines[0].find("character varying(3)")) << lines[0];
    EXPECT_NE(std::string::npos, lines[0].find("unver\xE4ndert")) << lines[0];
}

TEST(OdbcFiltersSqlite, ANulInsideAValueIsStoredWhole)
{
    Folder folder;
    std::string connect = "Driver=SQLite3;Database=" + folder.Path("werte.db");
    CQoOutputFilterODBC out;
    Prepare(out, connect, "t");
    ASSERT_TRUE(out.Init());
    out.InitRow();
    CQoString value;
    value.Assign("ab\0c\xE4", 5);
    out.Value(0, value);
    out.Value(1, "1");
    EXPECT_TRUE(out.WriteRow());
    out.ReleaseDB();
    ASSERT_TRUE(RunPython(folder, "hexread", "import subprocess\n"
                                         "out = subprocess.check_output(['sqlite3', os.path.join(folder, 'werte.db'),"
                                         " 'select hex(name) from t'])\n"
                                         "open(os.path.join(folder, 'hex.txt'), 'wb').write(out)\n"));
    EXPECT_EQ("61620063C3A4\n", ReadBytes(folder.Path("hex.txt")));
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

    // Quiet (batch) mode: no error, nothing to read, and the reason kept for the host.
    CQoInputFilterODBC quiet(("Driver=SQLite3;NoCreat=1;Database=" + folder.Path("fehlt.db")).c_str());
    CQoInterActive::SetQuiet(true);
    std::string error = ErrorOf([&] { quiet.Init(""); });
    CQoInterActive::SetQuiet(false);
    EXPECT_EQ("", error);
    EXPECT_FALSE(quiet.FirstRow());
    std::string reason = quiet.LastError().GetString();
    error = ErrorOf([&] { quiet.Init(""); });
    EXPECT_FALSE(error.empty()) << "interactively the same failure is raised";
    EXPECT_EQ(error, reason);
}
