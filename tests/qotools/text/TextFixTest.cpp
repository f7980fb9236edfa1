#include "CQoConfigFile.h"
#include "CQoException.h"
#include "CQoInputFilterTextFix.h"
#include "CQoInputFilterTextVF.h"

#include "TempFolder.h"
#include "TextFilterTestSupport.h"

#include <gtest/gtest.h>

namespace {
template <class Filter> void SetColumns(Filter &f, std::vector<int> const &lengths)
{
    f.SetNumCols(static_cast<int>(lengths.size()));
    for (std::size_t i = 0; i < lengths.size(); ++i)
        f.ColLen(static_cast<int>(i), lengths[i]);
}
} // namespace

TEST(TextFixRecords, RecordsFollowEachOtherAShortLastOneIsReported)
{
    TempFolder tmp;
    std::string path = tmp.Path("fix.dat");
    // Record length 12: name 6, city 4, code 2; the first record holds names.
    WriteBytes(path, "NAME  ORT CD"
                     "Meier Bonn01"
                     "M\xFCllerK\xF6ln02"
                     "Li    Ulm  3");
    CQoInputFilterTextFix f;
    f.RecordLen(12);
    SetColumns(f, {6, 4, 2});
    f.SetFirstRowHasNames(true);
    f.Init(path.c_str());
    EXPECT_EQ(3, f.NumRows());
    EXPECT_EQ((std::vector<Row>{{"Meier", "Bonn", "01"}, {"M\xFCller", "K\xF6ln", "02"}, {"Li", "Ulm", " 3"}}),
              AllRows(f));

    // A column beyond the record is cut at its end.
    f.ColLen(2, 5);
    ASSERT_TRUE(f.AbsoluteRow(0));
    EXPECT_EQ((Row{"Meier", "Bonn", "01"}), CurrentRow(f));

    // A short last record is reported, trailing line ends are not.
    path = tmp.Path("kurz.dat");
    WriteBytes(path, "aaaabbbbccc");
    f.RecordLen(4);
    SetColumns(f, {2, 2});
    f.SetFirstRowHasNames(false);
    {
        RepairScript script({CQoInterActive::repairTakeOver}, {"cc"});
        f.Init(path.c_str());
        EXPECT_EQ((Row{"cc", ""}), AllRows(f).at(2));
        EXPECT_EQ("ccc", RepairScript::calls.at(0).data);
    }
    {
        RepairScript script({CQoInterActive::repairSkip});
        f.Init(path.c_str());
        EXPECT_EQ(2u, AllRows(f).size());
    }
    WriteBytes(path, "aaaabbbb\r\n\x1A");
    f.Init(path.c_str());
    EXPECT_EQ(2u, AllRows(f).size());
}

TEST(TextVFLines, LinesAreCutIntoColumnsWhateverEndsThem)
{
    TempFolder tmp;
    std::string path = tmp.Path("vf.txt");
    WriteBytes(path, "Vorspann\r\n"
                     "Name      PLZ  Ort\r\n"
                     "Meier     53111Bonn\r\n"
                     "Li\n"
                     "Schulz    10115Berlin    \r");
    CQoInputFilterTextVF f;
    SetColumns(f, {10, 5, 10});
    f.Skip(1);
    f.SetFirstRowHasNames(true);
    f.Init(path.c_str());
    EXPECT_EQ((std::vector<Row>{{"Meier", "53111", "Bonn"}, {"Li", "", ""}, {"Schulz", "10115", "Berlin"}}),
              AllRows(f));

    // CR LF, LF and CR end lines alike.
    for (std::string end : {"\r", "\n", "\r\n"}) {
        WriteBytes(path, "Vorspann" + end + "NameOrt" + end + "Li  Ulm" + end + end + "Kai Kiel" + end);
        CQoInputFilterTextVF g;
        SetColumns(g, {4, 4});
        g.Skip(1);
        g.SetFirstRowHasNames(true);
        g.Init(path.c_str());
        EXPECT_EQ(3, g.NumRows()) << end.size();
        EXPECT_EQ((std::vector<Row>{{"Li", "Ulm"}, {"", ""}, {"Kai", "Kiel"}}), AllRows(g)) << end.size();
    }
}

TEST(TextVFLines, TextBeyondTheLastColumnIsDefective)
{
    TempFolder tmp;
    std::string path = tmp.Path("lang.txt");
    WriteBytes(path, "abcd\nabcdEF\nab  \n");
    CQoInputFilterTextVF f;
    SetColumns(f, {2, 2});
    f.Init(path.c_str());
    ASSERT_TRUE(f.FirstRow());
    EXPECT_THROW(f.NextRow(), CQoException);
    RepairScript script({CQoInterActive::repairTakeOver}, {"abEF"});
    f.Init(path.c_str());
    EXPECT_EQ((std::vector<Row>{{"ab", "cd"}, {"ab", "EF"}, {"ab", ""}}), AllRows(f));
}

TEST(TextFixSettings, TheLayoutRoundTripsThroughTheConfiguration)
{
    CQoInputFilterTextFix fix;
    fix.RecordLen(80);
    SetColumns(fix, {10, 30, 40});
    fix.SetFirstRowHasNames(true);
    CQoConfigFile cfg;
    fix.WriteConfig(cfg, "fix");

    CQoInputFilterTextFix fixBack;
    fixBack.ReadConfig(cfg, "fix");
    EXPECT_EQ(80, fixBack.RecordLen());
    ASSERT_EQ(3, fixBack.NumCols());
    EXPECT_EQ(30, fixBack.ColLen(1));
    EXPECT_EQ(0, fixBack.ColLen(3)); // no such column
    fixBack.RecordLen(-5);
    EXPECT_EQ(1, fixBack.RecordLen());
}
