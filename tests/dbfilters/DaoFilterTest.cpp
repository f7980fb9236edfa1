// The file-database filters on real files: Access-type databases made by the
// tests (password prompt answered as a user would), the value-to-text rule,
// and the .mdb files the set-up fetches.
#include "FilterTestSupport.h"
#include "OdbcTestTargets.h"

#include <CQoConfigFile.h>
#include <CQoDaoDatabase.h>
#include <CQoException.h>
#include <CQoInputFilterDao.h>
#include <CQoOutputFilterDao.h>

#include <DialogDriver.h>

#include "../qotools/PythonPeer.h"

#include <fstream>
#include <functional>
#include <vector>

using odbctest::Folder;

namespace {

std::string Text(const COleVariant& v)
{
    CQoString out;
    CQoInputFilterDao::ConvertOleVariant(v, out);
    return out.GetString();
}

// The worked example's table T: A text(40), B integer, K text(5) indexed.
void WriteT(const std::string& path, const std::vector<Row>& rows, const char* password = nullptr)
{
    CQoOutputFilterDao out;
    out.SetTableName("T");
    out.NumCols(3);
    out.ColumnName(0, "A");
    out.SetLength(0, 40);
    out.ColumnName(1, "B");
    out.SetType(1, CQoOutputFilterDB::dbtypeInteger);
    out.ColumnName(2, "K");
    out.SetLength(2, 5);
    out.SetIndexed(2, true);
    if (password)
        out.Password(password);
    out.UseDB(path.c_str());
    ASSERT_TRUE(out.Init());
    for (const Row& row : rows) {
        out.InitRow();
        for (int c = 0; c < 3; ++c)
            out.Value(c, row[c].c_str());
        EXPECT_TRUE(out.WriteRow());
    }
    out.ReleaseDB();
}

const std::vector<Row> kRows = {
    {"M\xFCller; \"Hans\"", "1", "abc"},
    {"O'Brien", "-42", "x"},
    {"", "0", ""},
    {"\xC4rger \xDF \x80", "7", "12345"},
    {"sechs", "6", "y"},
};

} // namespace

TEST(DaoValues, EveryVariantTypeHasItsText)
{
    COleVariant bytes;
    bytes.SetBytes("\x01\x02", 2);
    COleVariant byRef;
    long number = 5;
    byRef.vt = VT_I4 | VT_BYREF;
    byRef.plVal = &number;
    COleVariant decimal;
    decimal.vt = VT_DECIMAL;
    struct Case {
        const char* what;
        COleVariant value;
        const char* text;
    } cases[] = {
        {"empty", COleVariant(), ""},
        {"null", COleVariant(COleVariant(0L, VT_ERROR)), "VT_ERROR"},
        {"negative whole", COleVariant(-7.0), "-7"},
        {"fraction", COleVariant(1.5), "1.500000e+000"},
        {"beyond 32 bits", COleVariant(1e10), "1.000000e+010"},
        {"digits kept", COleVariant(1234567.89), "1.23456789e+006"},
        {"single, its own digits only", COleVariant(0.1f), "1.000000e-001"},
        {"single with cents", COleVariant(19.99f), "1.999000e+001"},
        {"single that needs more digits", COleVariant(8388607.5f), "8.3886075e+006"},
        {"text", COleVariant("M\xFCller", VT_BSTRT), "M\xFCller"},
        {"true", COleVariant((short)-1, VT_BOOL), "true"},
        {"byte", COleVariant((BYTE)10), "0x0A"},
        {"date", COleVariant(COleDateTime(2024, 3, 5, 0, 0, 0)), "03 05 2024"},
        {"date and time", COleVariant(COleDateTime(2099, 12, 31, 23, 59, 1)), "12 31 2099 23:59:01"},
        {"bytes", bytes, "Array of VT_UI1"},
        {"by reference", byRef, "Pointer to VT_I4"},
        {"decimal", decimal, "Fish"},
    };
    for (Case& c : cases) {
        SCOPED_TRACE(c.what);
        EXPECT_EQ(c.text, Text(c.value));
    }
    byRef.vt = VT_EMPTY;   // not ours to free
    decimal.vt = VT_EMPTY;
    COleVariant null;
    null.vt = VT_NULL;
    EXPECT_EQ("", Text(null));
}

TEST(DaoFilters, WhatTheOutputWritesTheInputReadsBack)
{
    Folder folder;
    std::string path = folder.Path("ziel.mdb");
    std::vector<Row> rows = kRows;
    rows[0][2] = "abcdefgh";   // longer than K: cut to 5
    WriteT(path, rows);

    // The table as the engine describes it: the worked example's fields and index.
    CQoInputFilterDao in(CQoFile::typeAccess);
    in.SetTableName("T");
    in.SetTableType(CQoInputFilterDB::tableTable);
    in.Init(path.c_str());
    CDaoTableDef table(&in.GetDatabase());
    table.Open("T");
    CDaoFieldInfo field;
    table.GetFieldInfo(0, field, AFX_DAO_ALL_INFO);
    EXPECT_EQ(dbText, field.m_nType);
    EXPECT_EQ(40, field.m_lSize);
    ASSERT_EQ(1, table.GetIndexCount());
    CDaoIndexInfo index;
    table.GetIndexInfo(0, index, AFX_DAO_ALL_INFO);
    EXPECT_EQ("T2", std::string((LPCSTR)index.m_strName)) << "named by the 0-based column";
    table.Close();

    EXPECT_EQ(5, in.NumRows());
    std::vector<Row> expected = kRows;
    expected[0][2] = "abcde";
    EXPECT_EQ(expected, AllRows(in));

    // A statement, counted only when asked; a missing table raises.
    in.InitTable("select A from T where B > 4", CQoInputFilterDB::tableSql, false);
    EXPECT_EQ(0, in.NumRows());
    EXPECT_EQ((std::vector<Row>{{"\xC4rger \xDF \x80"}, {"sechs"}}), AllRows(in));
    EXPECT_FALSE(ErrorOf([&] { in.InitTable("Fehlt", CQoInputFilterDB::tableTable, true); }).empty());

    // Settings survive the project.
    CQoConfigFile cfg;
    in.SetTableName("T");
    in.SetTableType(CQoInputFilterDB::tableTable);
    in.WriteConfig(cfg, "ein");
    CQoInputFilterDao again(CQoFile::typeAccess);
    again.ReadConfig(cfg, "ein");
    again.Init(again.GetDatabaseName());
    EXPECT_EQ(5, again.NumRows());
}

TEST(DaoFilters, ThePasswordIsAskedForUntilItFitsOrTheUserCancels)
{
    Folder folder;
    std::string path = folder.Path("geheim.mdb");
    {
        CDaoDatabase db;
        db.Create(path.c_str(), ";LANGID=0x0409;CP=1252;COUNTRY=0;pwd=Sesam");
        db.Close();
    }
    WriteT(path, kRows, "Sesam");

    qotest::DialogDriver driver;
    driver.Expect([&](qotest::Dialog& d) {
        EXPECT_EQ("Passwort eingeben", d.Title());
        EXPECT_NE(std::string::npos, d.Text(4029).find("geheim.mdb")) << d.Text(4029);
        d.SetText(4028, "falsch");
        d.Press(IDOK);
    });
    driver.Expect([](qotest::Dialog& d) {
        d.SetText(4028, "Sesam");
        d.Press(IDOK);
    });
    CQoInputFilterDao in(CQoFile::typeAccess);
    in.SetTableName("T");
    in.SetTableType(CQoInputFilterDB::tableTable);
    in.Init(path.c_str());
    EXPECT_TRUE(driver.Done());
    EXPECT_EQ(5, in.NumRows());
    EXPECT_EQ(";PWD=Sesam", std::string(in.Password().GetString()));

    driver.Expect([](qotest::Dialog& d) { d.Press(IDCANCEL); });
    CQoInputFilterDao cancelled(CQoFile::typeAccess);
    cancelled.SetTableName("T");
    cancelled.SetTableType(CQoInputFilterDB::tableTable);
    cancelled.Init(path.c_str());
    EXPECT_TRUE(driver.Done());
    EXPECT_FALSE(cancelled.FirstRow());
}

TEST(DaoFilters, AFileOfAnotherKindIsRefusedAndKept)
{
    Folder folder;
    std::string text = folder.Path("kunden.txt");
    std::ofstream(text, std::ios::binary) << "Nr;Name\r\n1;M\xFCller\r\n";
    CQoOutputFilterDao out;
    out.SetTableName("T");
    out.NumCols(1);
    EXPECT_FALSE(ErrorOf([&] { out.UseDB(text.c_str()); }).empty());
    EXPECT_FALSE(out.Init());
    std::ifstream in(text, std::ios::binary);
    std::string kept((std::istreambuf_iterator<char>(in)), std::istreambuf_iterator<char>());
    EXPECT_EQ("Nr;Name\r\n1;M\xFCller\r\n", kept);

    // A path without a file becomes a new database; a bad column type loses no table.
    std::string fresh = folder.Path("neu.mdb");
    WriteT(fresh, kRows);
    CQoOutputFilterDao bad;
    bad.SetTableName("T");
    bad.NumCols(1);
    bad.SetType(0, 9);
    bad.UseDB(fresh.c_str());
    EXPECT_EQ("Unbekannter Spaltentyp!", ErrorOf([&] { bad.Init(); }));
    bad.ReleaseDB();
    CQoInputFilterDao check(CQoFile::typeAccess);
    check.SetTableName("T");
    check.SetTableType(CQoInputFilterDB::tableTable);
    check.Init(fresh.c_str());
    EXPECT_EQ(5, check.NumRows());
}

TEST(DaoFilters, AccessFilesAreReadAsTheyAre)
{
    // build/<configuration>/bin/dbfilter_tests.exe -> build/fixtures/fruit.mdb
    char module[MAX_PATH];
    GetModuleFileNameA(NULL, module, MAX_PATH);
    std::string path = module;
    for (int up = 0; up < 3 && path.find_last_of('\\') != std::string::npos; ++up)
        path = path.substr(0, path.find_last_of('\\'));
    path += "\\fixtures\\fruit.mdb";
    if (GetFileAttributesA(path.c_str()) == INVALID_FILE_ATTRIBUTES)
        GTEST_SKIP() << "fruit.mdb is not fetched (tools/setup.sh puts it into build/fixtures)";
    CQoInputFilterDao in(CQoFile::typeAccess);
    in.Init(path.c_str());
    CDaoDatabase& db = in.GetDatabase();
    ASSERT_TRUE(db.IsOpen());
    ASSERT_GT(db.GetTableDefCount(), 0);
    std::string table;
    for (int i = 0; i < db.GetTableDefCount() && table.empty(); ++i) {
        CDaoTableDefInfo info;
        db.GetTableDefInfo(i, info, AFX_DAO_PRIMARY_INFO);
        if (!(info.m_lAttributes & dbSystemObject))
            table = (LPCSTR)info.m_strName;
    }
    ASSERT_FALSE(table.empty());
    in.InitTable(table.c_str(), CQoInputFilterDB::tableTable, true);
    EXPECT_GT(in.NumCols(), 0);
    EXPECT_EQ(std::size_t(in.NumRows()), AllRows(in).size());
    EXPECT_GT(in.NumRows(), 0);

    CQoOutputFilterDao out;
    out.SetTableName("Neu");
    out.NumCols(1);
    out.UseDB(path.c_str());
    EXPECT_FALSE(ErrorOf([&] { out.Init(); }).empty()) << "an .mdb file is read only";
}

TEST(DaoFilters, ExcelSheetsAreTablesNamedWithADollar)
{
    PeerFolder folder;
    if (!folder.Usable() || !RunPython(folder, "write", R"PY(
import datetime, openpyxl
wb = openpyxl.Workbook()
ws = wb.active
ws.title = 'Kunden'
ws.append(['Name', 'Betrag', 'Aktiv'])
ws.append(['M\u00fcller', 12.5, True])
ws.append(['Gr\u00f6\u00dfer', 3, False])
wb.save(os.path.join(folder, 'kunden.xlsx'))
open(os.path.join(folder, 'alt.xls'), 'wb').write(b'\xd0\xcf\x11\xe0\xa1\xb1\x1a\xe1' + b'\0' * 504)
)PY"))
        PEER_UNAVAILABLE();
    CQoInputFilterDao in(CQoFile::typeExcel);
    in.SetTableName("Kunden$");
    in.SetTableType(CQoInputFilterDB::tableTable);
    in.Init(folder.Path("kunden.xlsx").c_str());
    EXPECT_EQ((std::vector<Row>{{"M\xFCller", "1.250000e+001", "true"}, {"Gr\xF6\xDF" "er", "3", "false"}}), AllRows(in));

    // A workbook that cannot be read (the old binary format, or protected by
    // a password): the user is told so, the filter stays closed.
    qotest::DialogDriver driver;
    driver.Expect([](qotest::Dialog& d) {
        EXPECT_NE(std::string::npos, d.MessageText().find("Excel-Datei kann nicht gelesen werden")) << d.MessageText();
        d.Press(IDOK);
    });
    CQoInputFilterDao old(CQoFile::typeExcel);
    old.SetTableName("Kunden$");
    old.SetTableType(CQoInputFilterDB::tableTable);
    EXPECT_EQ("", ErrorOf([&] { old.Init(folder.Path("alt.xls").c_str()); }));
    EXPECT_TRUE(driver.Done());
    EXPECT_FALSE(old.FirstRow());
}
