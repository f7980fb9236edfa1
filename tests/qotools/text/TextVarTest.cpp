#include "CQoConfigFile.h"
#include "CQoException.h"
#include "CQoFile.h"
#include "CQoInputFilterTextVar.h"

#include "TempFolder.h"
#include "TextFilterTestSupport.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <random>

namespace {

CQoInputFilterTextVar *OpenVar(std::string const &path, char delimiter = ';', bool names = false)
{
    auto *filter = new CQoInputFilterTextVar;
    filter->Delimiter(delimiter);
    filter->SetFirstRowHasNames(names);
    filter->Init(path.c_str());
    return filter;
}

struct Deleter {
    void operator()(CQoInputFilter *f) const { f->Delete(); }
};
typedef std::unique_ptr<CQoInputFilterTextVar, Deleter> VarPtr;

} // namespace

TEST(TextVarReading, EnclosedFieldsHoldDelimitersQuotesAndLineBreaks)
{
    TempFolder tmp;
    std::string path = tmp.Path("a.csv");
    WriteBytes(path, "Name;Ort;Notiz\r\n"
                     "\"M\xFCller; Hans\";Berlin;\"sagt \"\"hallo\"\"\"\r\n"
                     "Meier;;\"zwei\r\nZeilen\"\r\n"
                     ";;\n"
                     "Schulz;Bonn;letzte ohne Zeilenende");
    VarPtr f(OpenVar(path, ';', true));
    EXPECT_EQ((std::vector<Row>{{"M\xFCller; Hans", "Berlin", "sagt \"hallo\""},
                                {"Meier", "", "zwei\r\nZeilen"},
                                {"", "", ""},
                                {"Schulz", "Bonn", "letzte ohne Zeilenende"}}),
              AllRows(*f));

    // Short values at the end of the reader's first block and at the end of
    // the file (values are copied with a fixed-size move that reads past them).
    std::string const filler(4081, 'f');
    WriteBytes(path, "a;b\r\n" + filler + ";f\r\nxy;z\r\nend;e");
    VarPtr g(OpenVar(path, ';', true));
    EXPECT_EQ((std::vector<Row>{{filler, "f"}, {"xy", "z"}, {"end", "e"}}), AllRows(*g));

    // An empty file has no rows; a missing one raises naming it.
    WriteBytes(path, "");
    CQoInputFilterTextVar empty;
    empty.SetFirstRowHasNames(true);
    empty.Init(path.c_str());
    EXPECT_EQ(0, empty.NumRows());
    EXPECT_FALSE(empty.AbsoluteRow(0));
    try {
        empty.Init(tmp.Path("fehlt.csv").c_str());
        FAIL() << "a missing file must raise";
    } catch (CQoException const &e) {
        EXPECT_NE(std::string::npos, std::string(e.Message()).find("fehlt.csv"));
    }
    EXPECT_FALSE(empty.FirstRow());
}

TEST(TextVarReading, CrLfAndCrEndLinesAlikeTabEscapeSkipAndShortRows)
{
    TempFolder tmp;
    std::string path = tmp.Path("ende.csv");
    for (std::string end : {"\r", "\n", "\r\n"}) {
        SCOPED_TRACE(end.size() == 2 ? "CR LF" : end == "\r" ? "CR" : "LF");
        WriteBytes(path, "Vorspann" + end + "Name;Ort" + end + "Meier;\"Bonn" + end + "Nord\"" + end + end +
                             "Li;Ulm\r\nSchulz;Berlin\rKoch;Kiel\n");
        CQoInputFilterTextVar f;
        f.Delimiter(';');
        f.Skip(1);
        f.SetFirstRowHasNames(true);
        f.Init(path.c_str());
        CQoString name;
        f.ColName(1, name);
        EXPECT_STREQ("Ort", name);
        EXPECT_EQ(5, f.NumRows());
        EXPECT_EQ((std::vector<Row>{{"Meier", "Bonn" + end + "Nord"},
                                    {"", ""},
                                    {"Li", "Ulm"},
                                    {"Schulz", "Berlin"},
                                    {"Koch", "Kiel"}}),
                  AllRows(f));
    }

    // Tab, escape, no encloser, skipped lines and short rows.
    path = tmp.Path("t.txt");
    WriteBytes(path, "Kopfzeile \"ohne\" Ende\nnoch eine\n"
                     "a\\\tb\t\"c\"\td\n"
                     "x\n"
                     "\"q\\\"q\"\t2\t3\t4\n");
    CQoInputFilterTextVar f;
    f.Delimiter('\t');
    f.Escape('\\');
    f.Skip(2);
    f.Init(path.c_str());
    EXPECT_EQ((std::vector<Row>{{"a\tb", "c", "d", ""}, {"x", "", "", ""}, {"q\"q", "2", "3", "4"}}), AllRows(f));

    f.Encloser(0);
    f.Escape(0);
    f.Init(path.c_str());
    EXPECT_EQ((Row{"a\\", "b", "\"c\"", "d"}), AllRows(f)[0]);
}

TEST(TextVarIndex, AbsoluteRowSeeksToAnyRowAndRaisesWhereTheFileWasCut)
{
    TempFolder tmp;
    std::string path = tmp.Path("n.csv");
    std::string text = "id;wert\n";
    for (int i = 0; i < 5000; ++i)
        text += std::to_string(i) + ";\"w" + std::to_string(i * 7) + (i % 97 == 0 ? "\nx" : "") + "\"\n";
    WriteBytes(path, text);
    VarPtr f(OpenVar(path, ';', true));
    EXPECT_TRUE(f->AbsoluteRow(4321)); // before any full pass: walks there
    EXPECT_EQ("4321", CurrentRow(*f)[0]);
    EXPECT_EQ(5000, f->NumRows());
    EXPECT_EQ("4321", CurrentRow(*f)[0]) << "counting keeps the current row";
    std::mt19937 random(7);
    for (int k = 0; k < 500; ++k) {
        long row = static_cast<long>(random() % 5000);
        ASSERT_TRUE(f->AbsoluteRow(row));
        Row r = CurrentRow(*f);
        ASSERT_EQ(std::to_string(row), r[0]);
        ASSERT_EQ("w" + std::to_string(row * 7) + (row % 97 == 0 ? "\nx" : ""), r[1]);
    }
    EXPECT_FALSE(f->AbsoluteRow(5000));

    // A file cut short while reading raises; what is left stays readable.
    path = tmp.Path("kurz.csv");
    text.clear();
    for (int i = 0; i < 300000; ++i)
        text += "zeile;" + std::to_string(i) + "\n";
    WriteBytes(path, text);
    VarPtr cut(OpenVar(path));
    ASSERT_EQ(300000, cut->NumRows());
    ASSERT_TRUE(cut->AbsoluteRow(0)); // what is in memory now is the start
    std::filesystem::resize_file(path, text.size() / 2);
    EXPECT_THROW(cut->AbsoluteRow(299999), CQoException);
    // Still usable for what is left.
    EXPECT_TRUE(cut->AbsoluteRow(10));
    EXPECT_EQ((Row{"zeile", "10"}), CurrentRow(*cut));
}

TEST(TextVarDefects, WithoutHookARecordRaisesWithItsRowAHookSkipsTakesOverOrStops)
{
    TempFolder tmp;
    std::string path = tmp.Path("r.csv");
    WriteBytes(path, "a;b\n1;2\n3;4;5\n6;7\n8;9;10\n11;12\n");
    {
        VarPtr f(OpenVar(path, ';', true));
        ASSERT_TRUE(f->FirstRow());
        try {
            f->NextRow();
            FAIL() << "three fields in a two-column file must raise";
        } catch (CQoException const &e) {
            EXPECT_EQ(CQoException::formatError, e.Code());
            // Counted as the user counts: the second data row.
            EXPECT_NE(std::string::npos, std::string(e.Message()).find("Satz 2:")) << e.Message();
        }
        EXPECT_EQ(1, f->WrongInputCount());
    }
    {
        RepairScript script({CQoInterActive::repairSkip, CQoInterActive::repairTakeOver},
                            {"", "8;9+10\r\n"});
        VarPtr f(OpenVar(path, ';', true));
        EXPECT_EQ((std::vector<Row>{{"1", "2"}, {"6", "7"}, {"8", "9+10"}, {"11", "12"}}), AllRows(*f));
        ASSERT_EQ(2u, RepairScript::calls.size());
        EXPECT_EQ("3;4;5\n6;7\n8;9;10\n11;12\n", RepairScript::calls[0].data);
        EXPECT_EQ(6, RepairScript::calls[0].pos);
        // Going back does not ask again.
        ASSERT_TRUE(f->AbsoluteRow(2));
        EXPECT_EQ((Row{"8", "9+10"}), CurrentRow(*f));
        EXPECT_EQ(2u, RepairScript::calls.size());
    }
    {
        RepairScript script({CQoInterActive::repairStop});
        VarPtr f(OpenVar(path, ';', true));
        ASSERT_TRUE(f->FirstRow());
        EXPECT_THROW(f->NextRow(), CQoException);
    }
    {
        // An encloser left open at the end: the offered next record is the line after it.
        WriteBytes(path, "1;2\n3;\"vier\n5;6");
        RepairScript script({CQoInterActive::repairSkip});
        VarPtr f(OpenVar(path));
        EXPECT_EQ((std::vector<Row>{{"1", "2"}, {"5", "6"}}), AllRows(*f));
        ASSERT_EQ(1u, RepairScript::calls.size());
        EXPECT_EQ(8, RepairScript::calls[0].pos);
    }
}

TEST(TextVarDefects, ATakenOverRecordThatStillDoesNotFitGoesToTheCorrection)
{
    TempFolder tmp;
    std::string path = tmp.Path("c.csv");
    WriteBytes(path, "a;b\n3;4;5\n6;7\n");
    static int corrections;
    corrections = 0;
    {
        RepairScript script({CQoInterActive::repairTakeOver}, {"3;4;5;6"});
        CQoInterActive::SetCorrectRepair(+[](CQoString &record) { ++corrections; record = "3;4,5"; return 1; });
        VarPtr f(OpenVar(path, ';', true));
        EXPECT_EQ((std::vector<Row>{{"3", "4,5"}, {"6", "7"}}), AllRows(*f));
        EXPECT_EQ(1, corrections);
    }
    {
        // The correction gives up: the record raises.
        RepairScript script({CQoInterActive::repairTakeOver}, {"3;4;5;6"});
        CQoInterActive::SetCorrectRepair(+[](CQoString &) { return 0; });
        VarPtr f(OpenVar(path, ';', true));
        EXPECT_THROW(f->FirstRow(), CQoException);
    }
}

TEST(TextVarSettings, ConfigurationRoundTripAndBadValues)
{
    CQoInputFilterTextVar a;
    a.Delimiter('\t');
    a.Encloser('\'');
    a.Escape('\\');
    a.Skip(3);
    a.CharSet(CQoFile::ansimix);
    a.SetFirstRowHasNames(true);
    CQoConfigFile cfg;
    a.WriteConfig(cfg, "Eingabe");
    CQoInputFilterTextVar b;
    b.ReadConfig(cfg, "Eingabe");
    EXPECT_EQ((std::vector<int>{'\t', '\'', '\\', 3, CQoFile::ansimix, 1}),
              (std::vector<int>{b.Delimiter(), b.Encloser(), b.Escape(), b.Skip(), b.CharSet(), b.GetFirstRowHasNames()}));

    b.CharSet(12345); // not a character set: ignored
    EXPECT_EQ(CQoFile::ansimix, b.CharSet());
    EXPECT_THROW(b.Delimiter('\n'), CQoException);
}
