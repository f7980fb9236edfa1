// Damaged projects and files, absurd numbers: a clear CQoException, never a crash.
#include "CQoConfigFile.h"
#include "CQoException.h"
#include "CQoFile.h"
#include "CQoInputFilterTextFix.h"
#include "CQoInputFilterTextVF.h"
#include "CQoInputFilterTextVar.h"
#include "CQoOutputFilterDbase.h"
#include "CQoOutputFilterTextFix.h"
#include "CQoOutputFilterTextVar.h"
#include "QoLimits.h"

#include "TempFolder.h"
#include "TextFilterTestSupport.h"

#include <gtest/gtest.h>

#include <cstring>
#include <functional>
#include <memory>

namespace {

std::string ErrorOf(std::function<void()> const &action)
{
    try {
        action();
    } catch (CQoException const &e) {
        return e.Message();
    }
    return std::string();
}

} // namespace

TEST(HostileSettings, OutOfBoundNumbersRaiseAHugeRecordOnATinyFileReads)
{
    struct Case {
        char const *what;
        char const *project;
        char const *key;        // must appear in the message
        int which;              // 0 fixed-length input, 1 fixed-column input, 2 fixed-length output, 3 delimited output, 4 dBase output
    };
    Case const cases[] = {
        {"record length of 2 GB", "[s]\nrecordlen=2147483647\n", "recordlen", 0},
        {"record length beyond long", "[s]\nrecordlen=99999999999999\n", "recordlen", 0},
        {"record length not a number", "[s]\nrecordlen=12x\n", "recordlen", 0},
        {"record length 0", "[s]\nrecordlen=0\n", "recordlen", 0},
        {"one huge column", "[s]\ncolumns=2\ncollen1=2000000000\n", "collen1", 0},
        {"widths whose sum wraps", "[s]\ncolumns=3\ncollen0=16000000\ncollen1=16000000\ncollen2=16000000\n",
         "16777216", 1},
        {"a million columns", "[s]\ncolumns=1000000\n", "columns", 1},
        {"negative column count", "[s]\ncolumns=-5\n", "columns", 1},
        {"fixed output column of 2 GB", "[s]\ncolumns=2\ncolumn1_len=2147483647\n", "column1_len", 2},
        {"fixed output widths whose sum wraps",
         "[s]\ncolumns=2\ncolumn0_len=10000000\ncolumn1_len=10000000\n", "column1_len", 2},
        {"output with 2^31-1 columns", "[s]\ncolumns=2147483647\n", "columns", 3},
        {"dBase output with 100 million columns", "[s]\ncolumns=100000000\n", "columns", 4},
    };
    std::function<std::string(CQoConfigFile &)> const readers[] = {
        [](CQoConfigFile &cfg) {
            CQoInputFilterTextFix f;
            std::string message = ErrorOf([&] { f.ReadConfig(cfg, "s"); });
            EXPECT_LE(f.RecordLen(), qolimits::maxRecordLength);
            return message;
        },
        [](CQoConfigFile &cfg) {
            CQoInputFilterTextVF f;
            std::string message = ErrorOf([&] { f.ReadConfig(cfg, "s"); });
            EXPECT_EQ(0, f.NumCols()) << "a refused layout is not taken over";
            return message;
        },
        [](CQoConfigFile &cfg) {
            CQoOutputFilterTextFix f;
            std::string message = ErrorOf([&] { f.ReadConfig(cfg, "s"); });
            EXPECT_LE(f.RecordLength(), qolimits::maxRecordLength);
            return message;
        },
        [](CQoConfigFile &cfg) { CQoOutputFilterTextVar f; return ErrorOf([&] { f.ReadConfig(cfg, "s"); }); },
        [](CQoConfigFile &cfg) { CQoOutputFilterDbase f; return ErrorOf([&] { f.ReadConfig(cfg, "s"); }); },
    };
    for (Case const &c : cases) {
        SCOPED_TRACE(c.what);
        CQoConfigFile cfg;
        cfg.FromText(c.project, std::strlen(c.project));
        std::string message = readers[c.which](cfg);
        EXPECT_NE(std::string::npos, message.find(c.key)) << message;
    }

    // The same bounds hold for callers.
    CQoInputFilterTextFix fix;
    EXPECT_NE(std::string::npos, ErrorOf([&] { fix.RecordLen(qolimits::maxRecordLength + 1); }).find("recordlen"));
    fix.SetNumCols(2);
    fix.ColLen(0, qolimits::maxRecordLength - 1);
    EXPECT_NE(std::string::npos, ErrorOf([&] { fix.ColLen(1, 2); }).find("collen1"));
    EXPECT_EQ(1, fix.ColLen(1));

    CQoOutputFilterTextFix out;
    out.NumCols(3);
    out.SetLength(0, qolimits::maxRecordLength - 60);
    EXPECT_NE(std::string::npos, ErrorOf([&] { out.SetLength(1, 100); }).find("column1_len"));
    EXPECT_NE(std::string::npos, ErrorOf([&] { out.NumCols(5); }).find("columns"));
    EXPECT_EQ(3, out.NumCols());

    // A huge record length on a tiny file reads without a huge buffer.
    TempFolder tmp;
    std::string path = tmp.Path("klein.txt");
    WriteBytes(path, "abcdefghijklmnopqrstuvwx"); // 24 bytes
    CQoInputFilterTextFix f;
    f.RecordLen(qolimits::maxRecordLength);
    f.SetNumCols(2);
    f.ColLen(0, qolimits::maxRecordLength - 1);
    RepairScript skip({CQoInterActive::repairTakeOver});
    f.Init(path.c_str());
    EXPECT_EQ(1, f.NumRows());
    ASSERT_TRUE(f.FirstRow());
    EXPECT_EQ((Row{"abcdefghijklmnopqrstuvwx", ""}), CurrentRow(f));
}

TEST(HostileFiles, SeekAfterALargeDirectReadFindsTheFileBytes)
{
    TempFolder tmp;
    std::string path = tmp.Path("daten.bin");
    std::string data;
    for (int i = 0; i < 300000; ++i)
        data += char('A' + i % 26);
    WriteBytes(path, data);
    CQoFile file;
    ASSERT_TRUE(file.Open(path.c_str(), CQoFile::read | CQoFile::binary));
    char small[10];
    ASSERT_EQ(10u, file.Read(small, 10));          // fills the buffer
    std::string big(200000, '\0');
    ASSERT_EQ(big.size(), file.Read(&big[0], big.size())); // straight into memory
    for (std::int64_t at : {std::int64_t(200000), std::int64_t(199990), std::int64_t(5), std::int64_t(250001)}) {
        SCOPED_TRACE(at);
        file.Seek(at);
        char got[8];
        ASSERT_EQ(8u, file.Read(got, 8));
        EXPECT_EQ(data.substr(std::size_t(at), 8), std::string(got, 8));
    }
}

TEST(HostileFiles, ByteOrderMarkAndEndMarkAreNotData)
{
    TempFolder tmp;
    std::string const bom = "\xEF\xBB\xBF";

    std::string ini = tmp.Path("projekt.ini");
    WriteBytes(ini, bom + "[Eingabe]\r\nDatei=kunden.txt\r\n");
    CQoConfigFile cfg;
    ASSERT_TRUE(cfg.Open(ini.c_str()));
    CQoString value;
    EXPECT_TRUE(cfg.GetValue("Eingabe", "Datei", value));
    EXPECT_EQ("kunden.txt", value.Str());

    std::string path = tmp.Path("daten.txt");
    struct Case {
        char const *what;
        std::string bytes;
        std::vector<Row> rows;
    };
    std::vector<Case> const delimited = {
        {"mark after the last line", bom + "Name;Ort\r\nA;B\r\n\x1A", {{"A", "B"}}},
        {"mark ending the last line", bom + "Name;Ort\r\nA;B\x1A", {{"A", "B"}}},
        {"mark inside a field stays", "Name;Ort\r\nA\x1A;B\r\n", {{"A\x1A", "B"}}},
    };
    for (Case const &c : delimited) {
        SCOPED_TRACE(c.what);
        WriteBytes(path, c.bytes);
        for (int charSet : {CQoFile::ansi, CQoFile::ascii}) {
            CQoInputFilterTextVar f;
            f.CharSet(charSet);
            f.SetFirstRowHasNames(true);
            f.Init(path.c_str());
            CQoString name;
            f.ColName(0, name);
            EXPECT_EQ("Name", name.Str());
            EXPECT_EQ(c.rows, AllRows(f));
            EXPECT_EQ(long(c.rows.size()), f.NumRows());
        }
    }

    WriteBytes(path, bom + "NameOrt \r\nAnnaBonn\r\n\x1A");
    auto layout = [](auto &f) {
        f.SetNumCols(2);
        f.ColLen(0, 4);
        f.ColLen(1, 4);
        f.SetFirstRowHasNames(true);
    };
    CQoInputFilterTextVF vf;
    layout(vf);
    vf.Init(path.c_str());
    EXPECT_EQ((std::vector<Row>{{"Anna", "Bonn"}}), AllRows(vf));
    WriteBytes(path, bom + "NameOrt Anna\xE4" "Bon\x1A");
    CQoInputFilterTextFix fix;
    fix.RecordLen(8);
    layout(fix);
    fix.Init(path.c_str());
    EXPECT_EQ((std::vector<Row>{{"Anna", "\xE4" "Bon"}}), AllRows(fix));
}

TEST(HostileFiles, SameFileComparesResolvedPathsWithoutCase)
{
    TempFolder tmp;
    std::filesystem::create_directory(tmp.Folder() / "sub");
    std::string const file = tmp.Path("kunden.txt");
    struct Case {
        std::string other;
        bool same;
    };
    Case const cases[] = {
        {file, true},
        {tmp.Path("KUNDEN.TXT"), true},
        {tmp.Path("sub/../kunden.txt"), true},
        {tmp.Path("./sub/./../Kunden.txt"), true},
        {tmp.Path("kunden.txt.bak"), false},
        {tmp.Path("sub/kunden.txt"), false},
        {"", false},
    };
    for (Case const &c : cases) {
        SCOPED_TRACE(c.other);
        EXPECT_EQ(c.same, CQoFile::SameFile(file.c_str(), c.other.c_str()));
    }
    EXPECT_TRUE(CQoFile::SameFile("\xC4rger.txt", "\xE4RGER.TXT"));
}

TEST(HostileFiles, ReplacingTheInputKeepsUnrelatedFilesAndTheOldOneOnFailure)
{
    TempFolder tmp;
    std::string path = tmp.Path("daten.txt");
    WriteBytes(path, "a;b\r\n1;2\r\n");
    WriteBytes(path + ".old", "eine Datei des Benutzers");
    std::string fresh = tmp.Path("neu.txt");
    WriteBytes(fresh, "a;b\r\n3;4\r\n5;6\r\n");

    CQoInputFilterTextVar f;
    f.SetFirstRowHasNames(true);
    f.Init(path.c_str());
    EXPECT_EQ(1, f.NumRows());
    f.replaceFile(fresh.c_str());
    EXPECT_EQ((std::vector<Row>{{"3", "4"}, {"5", "6"}}), AllRows(f));
    EXPECT_FALSE(CQoFile::Exists(fresh.c_str()));
    EXPECT_EQ("eine Datei des Benutzers", ReadBytes(path + ".old"));

    // A new file that is not there: the old one stays and is read on.
    EXPECT_THROW(f.replaceFile(tmp.Path("fehlt.txt").c_str()), CQoException);
    EXPECT_EQ(2, f.NumRows());
    EXPECT_EQ("a;b\r\n3;4\r\n5;6\r\n", ReadBytes(path));
}

TEST(HostileFiles, DefectMessagesSayWhatHappenedAndCountRowsFromOne)
{
    TempFolder tmp;
    std::string path = tmp.Path("lang.txt");
    struct Case {
        char const *what;
        std::string bytes;
        char const *expect;
    };
    std::string const longLine(qolimits::maxRecordLength + 10, 'x');
    Case const cases[] = {
        {"a line longer than any record", "a;b\n" + longLine + "\n", "Satz 2: Satz l\xE4nger als 16777216 Zeichen"},
        {"an encloser left open", "a;b\n\"offen;b\nc;d\n", "Satz 2: Begrenzer nicht geschlossen"},
        {"an open encloser in the header", "\"a;b\nc;d\n", "Kopfzeile: Begrenzer nicht geschlossen"},
    };
    for (Case const &c : cases) {
        SCOPED_TRACE(c.what);
        WriteBytes(path, c.bytes);
        CQoInputFilterTextVar f;
        f.SetFirstRowHasNames(c.expect[0] == 'K');
        std::string message = ErrorOf([&] {
            f.Init(path.c_str());
            AllRows(f);
        });
        EXPECT_NE(std::string::npos, message.find(c.expect)) << message.substr(0, 200);
    }

    WriteBytes(path, "aaaabbbbcc");
    CQoInputFilterTextFix fix;
    fix.RecordLen(4);
    fix.Init(path.c_str());
    std::string message = ErrorOf([&] { AllRows(fix); });
    EXPECT_NE(std::string::npos, message.find("Satz 3: 2 statt 4 Zeichen")) << message;
}
