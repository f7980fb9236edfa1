// The file-database filters on real files: Access-type databases made by the
// tests (password prompt answered as a user would), the value-to-text rule,
// and the .mdb files the set-up fetches.
#include "FilterTestSupport.h"

#include <CQoConfigFile.h>
#include <CQoDaoDatabase.h>
#include <CQoInputFilterDao.h>
#include <CQoLog.h>
#include <CQoOutputFilterDao.h>
#include <QoBatchMessageBox.h>

#include <DialogDriver.h>

#include <filesystem>
#include <fstream>
#include <functional>
#include <sstream>
#include <vector>

namespace {

// The worked example's table T: A text(40), B integer, K text(5) indexed.
void DefineT(CQoOutputFilterDao& out)
{
    out.SetTableName("T");
    out.NumCols(3);
    out.ColumnName(0, "A");
    out.SetLength(0, 40);
    out.ColumnName(1, "B");
    out.SetType(1, CQoOutputFilterDB::dbtypeInteger);
    out.ColumnName(2, "K");
    out.SetLength(2, 5);
    out.SetIndexed(2, true);
}

void WriteRows(CQoOutputFilterDao& out, const std::vector<Row>& rows)
{
    for (const Row& row : rows) {
        out.InitRow();
        for (int c = 0; c < (int)row.size(); ++c)
            out.Value(c, row[c].c_str());
        EXPECT_TRUE(out.WriteRow());
    }
}

void WriteT(const std::string& path, const std::vector<Row>& rows, const char* password = nullptr)
{
    CQoOutputFilterDao out;
    DefineT(out);
    if (password)
        out.Password(password);
    out.UseDB(path.c_str());
    ASSERT_TRUE(out.Init());
    WriteRows(out, rows);
    out.ReleaseDB();
}

void OpenT(CQoInputFilterDao& in, const std::string& path)
{
    in.SetTableName("T");
    in.SetTableType(CQoInputFilterDB::tableTable);
    in.Init(path.c_str());
}

// Everything a user could tell apart in the file: every table with its
// fields (type, size, attributes), its indexes and its rows.
std::string Dump(const std::string& path)
{
    CDaoDatabase db;
    db.Open(path.c_str());
    std::ostringstream out;
    for (int t = 0; t < db.GetTableDefCount(); ++t) {
        CDaoTableDefInfo info;
        db.GetTableDefInfo(t, info);
        CDaoTableDef table(&db);
        table.Open(info.m_strName);
        out << "table " << (LPCSTR)info.m_strName << "\n";
        for (int f = 0; f < table.GetFieldCount(); ++f) {
            CDaoFieldInfo field;
            table.GetFieldInfo(f, field, AFX_DAO_ALL_INFO);
            out << " field " << (LPCSTR)field.m_strName << " " << field.m_nType << " " << field.m_lSize << " "
                << field.m_lAttributes << " " << field.m_bAllowZeroLength << "\n";
        }
        for (int i = 0; i < table.GetIndexCount(); ++i) {
            CDaoIndexInfo index;
            table.GetIndexInfo(i, index, AFX_DAO_ALL_INFO);
            out << " index " << (LPCSTR)index.m_strName << " on";
            for (int k = 0; k < index.m_nFields; ++k)
                out << " " << (LPCSTR)index.m_pFieldInfos[k].m_strName;
            out << "\n";
        }
        CDaoRecordset rows(&db);
        rows.Open(&table);
        for (; !rows.IsEOF(); rows.MoveNext()) {
            out << " row";
            for (int f = 0; f < rows.GetFieldCount(); ++f) {
                CQoString text;
                CQoInputFilterDao::ConvertOleVariant(rows.GetFieldValue(f), text);
                out << " [" << text.GetString() << "]";
            }
            out << "\n";
        }
    }
    return out.str();
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
    COleVariant null;
    null.vt = VT_NULL;
    struct Case {
        const char* what;
        COleVariant value;
        const char* text;
    } cases[] = {
        {"empty", COleVariant(), ""},
        {"SQL null", null, ""},
        {"null", COleVariant(COleVariant(0L, VT_ERROR)), "VT_ERROR"},
        {"negative whole", COleVariant(-7.0), "-7"},
        {"fraction", COleVariant(1.5), "1.500000e+000"},
        {"digits kept", COleVariant(1234567.89), "1.23456789e+006"},
        {"single, its own digits only", COleVariant(0.1f), "1.000000e-001"},
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
        CQoString text;
        CQoInputFilterDao::ConvertOleVariant(c.value, text);
        EXPECT_EQ(c.text, std::string(text.GetString()));
    }
    byRef.vt = VT_EMPTY;   // not ours to free
    decimal.vt = VT_EMPTY;
}

TEST(DaoFilters, WhatTheOutputWritesTheInputReadsBack)
{
    Folder folder;
    std::string path = folder.Path("ziel.mdb");
    std::vector<Row> rows = kRows;
    rows[0][2] = "abcdefgh";   // longer than K: cut to 5
    WriteT(path, rows);

    CQoInputFilterDao in(CQoFile::typeAccess);
    OpenT(in, path);
    EXPECT_EQ(5, in.NumRows());
    std::vector<Row> expected = kRows;
    expected[0][2] = "abcde";
    EXPECT_EQ(expected, AllRows(in));

    // A statement, counted only when asked; a missing table raises.
    in.InitTable("select A from T where B > 4", CQoInputFilterDB::tableSql, false);
    EXPECT_EQ(0, in.NumRows());
    EXPECT_EQ((std::vector<Row>{{"\xC4rger \xDF \x80"}, {"sechs"}}), AllRows(in));
    EXPECT_FALSE(ErrorOf([&] { in.InitTable("Fehlt", CQoInputFilterDB::tableTable, true); }).empty());

    CQoConfigFile cfg;
    in.SetTableName("T");
    in.SetTableType(CQoInputFilterDB::tableTable);
    in.WriteConfig(cfg, "ein");
    CQoInputFilterDao again(CQoFile::typeAccess);
    again.ReadConfig(cfg, "ein");
    again.Init(again.GetDatabaseName());
    EXPECT_EQ(5, again.NumRows());
}

TEST(DaoFilters, ThePasswordIsAskedForUntilItFitsOrTheUserCancelsButNeverInABatchRun)
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
    OpenT(in, path);
    EXPECT_TRUE(driver.Done());
    EXPECT_EQ(5, in.NumRows());

    driver.Expect([](qotest::Dialog& d) { d.Press(IDCANCEL); });
    CQoInputFilterDao cancelled(CQoFile::typeAccess);
    OpenT(cancelled, path);
    EXPECT_TRUE(driver.Done());
    EXPECT_FALSE(cancelled.FirstRow());

    _theLog.Open(folder.Path("lauf.log").c_str());
    QoBatchMessageBoxSetMode(true);
    CQoInputFilterDao batch(CQoFile::typeAccess);
    EXPECT_EQ("", ErrorOf([&] { OpenT(batch, path); }));
    EXPECT_FALSE(batch.GetDatabase().IsOpen());
    EXPECT_EQ("Die Datenbank '" + path + "' ist durch ein Passwort gesch\xFCtzt; das Passwort fehlt oder ist falsch.",
              batch.LastError().GetString());
    CQoOutputFilterDao out;
    DefineT(out);
    out.UseDB(path.c_str());
    EXPECT_FALSE(out.Init());
    EXPECT_EQ(batch.LastError().GetString(), std::string(out.LastError().GetString()));
    QoBatchMessageBoxSetMode(false);
    _theLog.Close();
    EXPECT_EQ(0, driver.Unanswered()) << "no dialog in a batch run";
    std::string text = ReadBytes(folder.Path("lauf.log"));
    size_t first = text.find(path);
    ASSERT_NE(std::string::npos, first) << text;
    EXPECT_NE(std::string::npos, text.find(path, first + 1)) << "one line for each filter: " << text;
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
    EXPECT_EQ("Nr;Name\r\n1;M\xFCller\r\n", ReadBytes(text));
}

TEST(DaoFilters, AccessFilesAreReadAsTheyAre)
{
    char module[MAX_PATH];
    GetModuleFileNameA(NULL, module, MAX_PATH);   // build/<configuration>/bin/dbfilter_tests.exe
    std::string path = (std::filesystem::path(module).parent_path().parent_path().parent_path() / "fixtures" /
                        "fruit.mdb").string();
    if (GetFileAttributesA(path.c_str()) == INVALID_FILE_ATTRIBUTES)
        GTEST_SKIP() << "fruit.mdb is not fetched (tools/setup.sh puts it into build/fixtures)";
    CQoInputFilterDao in(CQoFile::typeAccess);
    in.Init(path.c_str());
    CDaoDatabase& db = in.GetDatabase();
    ASSERT_TRUE(db.IsOpen());
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
    EXPECT_GT(in.NumRows(), 0);
    EXPECT_EQ(std::size_t(in.NumRows()), AllRows(in).size());

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

// A cell longer than Excel takes and numbers that 15 digits do not tell
// apart reach the conversion whole, in a column of numbers and in one of
// mixed kinds; a cell longer than the engine reads back as one value (32 Mi
// characters) makes its sheet fail naming the cell, never an empty value.
// openpyxl writes 16 digits and cuts text at 32,767 characters, so the
// sheets are patched.
TEST(DaoFilters, WorkbookCellsArriveWithEveryCharacterAndDigitOrAreRefused)
{
    PeerFolder folder;
    if (!folder.Usable() || !RunPython(folder, "write", R"PY(
import openpyxl, zipfile
wb = openpyxl.Workbook()
ws = wb.active
ws.title = 'Daten'
ws.append(['Text', 'Zahl', 'Gemischt'])
ws.append(['LANG', 1001, 1002])
ws.append(['kurz', 1003, 'x'])
huge = wb.create_sheet('Riesig')
huge.append(['Nr', 'Inhalt'])
huge.append([1, 'kurz'])
huge.append([2, 'RIESIG'])
wb.save(os.path.join(folder, 'tmp.xlsx'))
exact = {1001: 0.1 + 0.2, 1002: 123456789.12345679, 1003: 1 / 3}
with zipfile.ZipFile(os.path.join(folder, 'tmp.xlsx')) as src, \
     zipfile.ZipFile(os.path.join(folder, 'lang.xlsx'), 'w', zipfile.ZIP_DEFLATED) as dst:
    for item in src.infolist():
        data = src.read(item.filename)
        data = data.replace(b'>LANG<', b'>' + b''.join(b'%05d;' % i for i in range(6666)) + b'Ende<')
        data = data.replace(b'>RIESIG<', b'>' + b''.join(b'%07d;' % i for i in range(4194305)) + b'<')
        for k, v in exact.items():
            data = data.replace(b'<v>%d</v>' % k, b'<v>%s</v>' % repr(v).encode())
        dst.writestr(item, data)
)PY"))
        PEER_UNAVAILABLE();
    CQoInputFilterDao in(CQoFile::typeExcel);
    in.SetTableName("Daten$");
    in.SetTableType(CQoInputFilterDB::tableTable);
    in.Init(folder.Path("lang.xlsx").c_str());
    ASSERT_TRUE(in.FirstRow());
    CQoString text;
    in.Value(0, text);
    EXPECT_EQ(40000, text.GetLength());
    EXPECT_EQ(std::string("06665;Ende"), std::string(text.GetString()).substr(text.GetLength() - 10));
    in.Value(1, text);
    EXPECT_EQ(0.1 + 0.2, strtod(text.GetString(), nullptr)) << text.GetString();
    in.Value(2, text);
    EXPECT_EQ(123456789.12345679, strtod(text.GetString(), nullptr)) << text.GetString();
    ASSERT_TRUE(in.NextRow());
    in.Value(0, text);
    EXPECT_EQ(std::string("kurz"), text.GetString());
    in.Value(1, text);
    EXPECT_EQ(1.0 / 3, strtod(text.GetString(), nullptr)) << text.GetString();

    // 4,194,305 entries of 8 characters: one more than 32 Mi characters.
    std::string error = ErrorOf([&] { in.InitTable("Riesig$", CQoInputFilterDB::tableTable, true); });
    for (const char* part : {"Riesig$", "Zeile 3", "Inhalt", "33554440"})
        EXPECT_NE(std::string::npos, error.find(part)) << error;
}

TEST(DaoFilters, AFailedOrCancelledRunLeavesTheOldTableAsItWas)
{
    const std::string longName(65, 'x');
    struct FailedRun {
        const char* what;
        std::function<void(CQoOutputFilterDao&)> define;   // after T's columns
        std::function<void(CQoOutputFilterDao&)> run;      // after UseDB; may raise
    } const runs[] = {
        {"cancelled by the host", nullptr,
         [](CQoOutputFilterDao& out) {
             ASSERT_TRUE(out.Init());
             WriteRows(out, {{"neu", "1", "n"}, {"neu2", "2", "m"}});
             out.Discard();
         }},
        {"a row failed", nullptr,
         [](CQoOutputFilterDao& out) {
             ASSERT_TRUE(out.Init());
             WriteRows(out, {{"neu", "1", "n"}});
             EXPECT_NE("", ErrorOf([&] { WriteRows(out, {{"neu", "keine Zahl", "n"}}); }));
             std::string end = ErrorOf([&] { out.ReleaseDB(); });
             EXPECT_NE(std::string::npos, end.find("unver\xE4ndert")) << end;
         }},
        {"names that differ only in case", [](CQoOutputFilterDao& out) { out.ColumnName(1, "a"); },
         [](CQoOutputFilterDao& out) { EXPECT_NE("", ErrorOf([&] { out.Init(); })); }},
        {"256 columns",
         [](CQoOutputFilterDao& out) {
             out.NumCols(256);
             for (int c = 3; c < 256; ++c)
                 out.ColumnName(c, ("F" + std::to_string(c)).c_str()), out.SetLength(c, 1);
         },
         [](CQoOutputFilterDao& out) { EXPECT_NE("", ErrorOf([&] { out.Init(); })); }},
        {"a column name too long", [&](CQoOutputFilterDao& out) { out.ColumnName(0, longName.c_str()); },
         [](CQoOutputFilterDao& out) { EXPECT_NE("", ErrorOf([&] { out.Init(); })); }},
        {"an unknown column type", [](CQoOutputFilterDao& out) { out.SetType(0, 9); },
         [](CQoOutputFilterDao& out) { EXPECT_EQ("Unbekannter Spaltentyp!", ErrorOf([&] { out.Init(); })); }},
        {"brackets in the table name", [](CQoOutputFilterDao& out) { out.SetTableName("[T]"); },
         [](CQoOutputFilterDao& out) {
             EXPECT_NE(std::string::npos, ErrorOf([&] { out.Init(); }).find("'[T]' is not a valid name"));
         }},
    };
    for (const FailedRun& r : runs) {
        SCOPED_TRACE(r.what);
        Folder folder;
        std::string path = folder.Path("ziel.mdb");
        WriteT(path, kRows);
        const std::string before = Dump(path);
        {
            CQoOutputFilterDao out;
            DefineT(out);
            if (r.define)
                r.define(out);
            out.UseDB(path.c_str());
            r.run(out);
        }
        EXPECT_EQ(before, Dump(path));
    }
}

TEST(DaoFilters, TheTableIsReplacedOnlyWhenTheRunIsComplete)
{
    Folder folder;
    std::string path = folder.Path("ziel.mdb");
    WriteT(path, kRows);
    const std::string before = Dump(path);

    // A run killed after Init leaves its table under the temporary name (the
    // copy of the file is what a killed process leaves)...
    std::string killed = folder.Path("abgebrochen.mdb");
    {
        CQoOutputFilterDao out;
        DefineT(out);
        out.UseDB(path.c_str());
        ASSERT_TRUE(out.Init());
        EXPECT_EQ(0u, Dump(path).find(before)) << "the old table is untouched while the new one fills";
        std::filesystem::copy_file(path, killed);
        out.Discard();
    }
    EXPECT_NE(before, Dump(killed));
    // ...which the next run removes; a complete run ends with the new rows
    // under the old name, its fields and its index, and nothing else.
    WriteT(killed, {{"neu", "9", "n"}});
    WriteT(path, {{"neu", "9", "n"}});
    EXPECT_EQ(Dump(path), Dump(killed));
    EXPECT_EQ("table T\n field A 10 40 34 1\n field B 4 4 33 0\n field K 10 5 34 1\n index T2 on K\n"
              " row [neu] [9] [n]\n",
              Dump(path));

    // The destructor completes a run the host did not end, unless an error is
    // on its way out.
    for (bool raise : {true, false}) {
        try {
            CQoOutputFilterDao out;
            DefineT(out);
            out.UseDB(path.c_str());
            ASSERT_TRUE(out.Init());
            WriteRows(out, {{"ende", "1", "e"}});
            if (raise)
                throw std::runtime_error("Abbruch");
        } catch (const std::runtime_error&) {
        }
        EXPECT_EQ(raise, Dump(path).find("[neu]") != std::string::npos);
        EXPECT_EQ(!raise, Dump(path).find("[ende]") != std::string::npos);
    }
}

TEST(DaoFilters, AnOutputPathThatCannotHoldADatabaseIsACheckedError)
{
    Folder folder;
    const std::string longPath = folder.Path((std::string(250, 'l') + ".mdb").c_str());
    const std::string paths[] = {
        folder.Path("fehlt\\ziel.mdb"), folder.Path(""), "NUL", "CON", "COM1", "\\\\server\\share\\x.mdb", longPath,
    };
    for (const std::string& path : paths) {
        SCOPED_TRACE(path);
        CQoOutputFilterDao out;
        DefineT(out);
        std::string error = ErrorOf([&] { out.UseDB(path.c_str()); });
        EXPECT_NE(std::string::npos, error.find(path)) << error;
        EXPECT_FALSE(out.Init());
    }
    EXPECT_TRUE(std::filesystem::is_empty(std::filesystem::path(folder.Path(""))))
        << "no empty file is left behind";
}

TEST(DaoFilters, ValuesAreStoredWholeOrRefusedNamingRecordAndColumn)
{
    Folder folder;
    std::string path = folder.Path("ziel.mdb");
    struct Case {
        const char* what;
        CQoString value;
        int column;
        const char* error;
    } cases[] = {
        {"a number too big", "99999999999", 1, "Satz 2, Spalte B: Numeric field overflow."},
        {"a NUL inside", CQoString("ab\0cd", 5), 0, "Satz 2, Spalte A: "},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.what);
        CQoOutputFilterDao out;
        DefineT(out);
        out.UseDB(path.c_str());
        ASSERT_TRUE(out.Init());
        WriteRows(out, {{"eins", "1", "e"}});
        std::string error = ErrorOf([&] {
            out.InitRow();
            out.Value(c.column, c.value);
            out.WriteRow();
        });
        EXPECT_EQ(0u, error.find(c.error)) << error;
        out.Discard();
    }
}

TEST(DaoFilters, AnOutputIntoTheFileBeingReadIsRefusedAtOnceAndLosesNothing)
{
    // The input's connection holds its read lock while it is read: the
    // output's second connection to that file waits two seconds, not
    // minutes, and says why it cannot write.
    for (const char* target : {"U", "T"}) {
        SCOPED_TRACE(target);
        Folder folder;
        std::string path = folder.Path("beides.mdb");
        WriteT(path, kRows);
        const std::string before = Dump(path);
        CQoInputFilterDao in(CQoFile::typeAccess);
        OpenT(in, path);
        CQoOutputFilterDao out;
        DefineT(out);
        out.SetTableName(target);
        out.UseDB(path.c_str());
        std::string error = ErrorOf([&] {
            out.Init();
            for (bool ok = in.FirstRow(); ok; ok = in.NextRow()) {
                out.InitRow();
                for (int col = 0; col < 3; ++col) {
                    CQoString value;
                    in.Value(col, value);
                    out.Value(col, value);
                }
                out.WriteRow();
            }
            out.ReleaseDB();
        });
        EXPECT_NE(std::string::npos, error.find("'" + path + "' ist in diesem Programm zugleich zum Lesen")) << error;
        in.CloseResources();
        out.Discard();
        EXPECT_EQ(0u, Dump(path).find(before));
    }
}
