// Reading an output filter source back as an input filter.
#include "MappingTestSource.h"

#include <CQoInputFilterOutSource.h>

#include <string>
#include <vector>

using mappingtest::TableSource;

namespace {

TableSource ThreeRows()
{
    return TableSource({"Name", "Ort"}, {{"Müller", "Köln"}, {"Weiß", ""}, {"", ""}});
}

std::string Field(CQoInputFilter& f, int col)
{
    CQoString value("vorher");
    f.Value(col, value);
    return value.GetString();
}

std::vector<std::string> Walk(CQoInputFilter& f)
{
    std::vector<std::string> rows;
    for (bool ok = f.FirstRow(); ok; ok = f.NextRow()) {
        std::string row;
        for (int c = 0; c < f.NumCols(); ++c)
            row += (c ? "|" : "") + Field(f, c);
        rows.push_back(row);
    }
    return rows;
}

} // namespace

TEST(InputFilterOutSource, RowsAreTheSourceRowsFromRowZeroAndColumnsItsOutputColumns)
{
    TableSource s = ThreeRows();
    CQoInputFilterOutSource f;
    f.SetOutputSource(&s);
    EXPECT_EQ(3L, f.NumRows());
    EXPECT_EQ("Müller", Field(f, 0)) << "attaching stands on the first row";
    EXPECT_EQ((std::vector<std::string>{"Müller|Köln", "Weiß|", "|"}), Walk(f));
    // After the last row NextRow stays there.
    EXPECT_FALSE(f.NextRow());
    EXPECT_EQ(2L, s.lastRow);
    EXPECT_FALSE(f.AbsoluteRow(3));

    // The columns follow the selection, the order and the conversions.
    s.ToFront("Ort");
    s.SetNoUmlaute(true);
    s.SetUseCapitals(true);
    CQoString name;
    f.ColName(0, name);
    EXPECT_STREQ("Ort", name);
    EXPECT_EQ((std::vector<std::string>{"KOELN|MUELLER", "|WEISS", "|"}), Walk(f));
    s.SetSelected("Ort", false);
    EXPECT_EQ(1, f.NumCols());

    // No rows: no first row, and the host is never asked for a row; rows that
    // arrive after a failed FirstRow are read from the first one.
    TableSource none({"A"}, {});
    f.SetOutputSource(&none);
    EXPECT_TRUE(Walk(f).empty());
    EXPECT_EQ("", Field(f, 0));
    EXPECT_EQ(0, none.valueCalls);
    none.AddRow({"erste"});
    ASSERT_TRUE(f.NextRow());
    EXPECT_EQ("erste", Field(f, 0));

    // Without a source there is nothing, and nothing is written.
    f.SetOutputSource(nullptr);
    EXPECT_EQ(0, f.NumCols());
    EXPECT_EQ(0L, f.NumRows());
    EXPECT_FALSE(f.FirstRow() || f.NextRow());
    EXPECT_EQ("vorher", Field(f, 0));
}

TEST(InputFilterOutSource, CopiesShareTheSourceAndNobodyDeletesIt)
{
    bool destroyed = false;
    {
        TableSource s = ThreeRows();
        s.WatchDestruction(&destroyed);
        {
            CQoInputFilterOutSource f;
            f.SetOutputSource(&s);
            f.NextRow();
            CQoInputFilterOutSource assigned;
            assigned = f;
            EXPECT_EQ("Weiß", Field(assigned, 0));
            assigned.FirstRow();
            EXPECT_EQ("Weiß", Field(f, 0));   // each keeps its own row
        }
        EXPECT_FALSE(destroyed);
    }
    EXPECT_TRUE(destroyed);
}
