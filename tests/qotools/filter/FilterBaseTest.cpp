// The filter bases as derived filters and hosts see them.
#include "CQoException.h"
#include "CQoFile.h"
#include "CQoOutputFilterDB.h"
#include "CQoOutputSource.h"
#include "CQoOutputSourceInputFilter.h"

#include "TempFolder.h"
#include "TextFilterTestSupport.h"

#include <gtest/gtest.h>

namespace {

// A table of rows held in memory, as the smallest input filter there is: it
// relies on the base for row counting, walking and names.
class ListFilter : public CQoInputFilter {
public:
    explicit ListFilter(std::vector<Row> rows, int cols) : m_rows(std::move(rows)) { SetNumColsInternal(cols); }
    bool FirstRow() override { return Go(0); }
    bool NextRow() override { return m_lCurrentRow >= 0 && Go(m_lCurrentRow + 1); }
    void Value(int col, CQoString &value) override
    {
        value.Empty();
        if (m_lCurrentRow >= 0 && col >= 0 && col < static_cast<int>(m_rows[m_lCurrentRow].size()))
            value = m_rows[m_lCurrentRow][col].c_str();
    }

private:
    bool Go(long row)
    {
        if (row >= static_cast<long>(m_rows.size()))
            return false;
        m_lCurrentRow = row;
        return true;
    }
    std::vector<Row> m_rows;
};

class Source : public CQoOutputSource {
public:
    int GetNumColumns() override { return 2; }
    long GetNumRows() override { return 3; }
    void GetValue(long row, int col, CQoString &value) override { value.Format("r%ldc%d", row, col); }
    void GetColumnName(int col, CQoString &name) override { name.Format("S%d", col); }
};

class OutDB : public CQoOutputFilterDB {
public:
    bool Init() override { return true; }
    bool WriteRow(CQoString * = nullptr) override
    {
        std::string line;
        for (CQoString const &v : m_values) {
            line += v.Str();
            line += ';';
        }
        line += "\n";
        WriteToFile(line.data(), line.size());
        return true;
    }
};

} // namespace

TEST(FilterBaseInput, CountsWalksNamesAndReportsWrongInputForADerivedFilter)
{
    ListFilter f({{"a", "b"}, {"", ""}, {"c"}}, 2);
    EXPECT_EQ(3, f.NumRows());
    ASSERT_TRUE(f.AbsoluteRow(2));
    EXPECT_EQ((Row{"c", ""}), CurrentRow(f));
    EXPECT_FALSE(f.AbsoluteRow(-1));

    CQoString name;
    f.ColName(1, name);
    EXPECT_EQ("Feld 2", name);
    f.SetColName(5, "nichts");
    f.ColName(5, name);
    EXPECT_EQ("", name);

    // A wrong input is counted, and the hook asked where there is one.
    CQoString data("kaputt\nnaechster");
    int pos = 7;
    EXPECT_EQ(CQoInterActive::repairNoHandler, f.ReportWrongInput(data, pos));
    EXPECT_EQ(1, f.WrongInputCount());
    RepairScript script({CQoInterActive::repairSkip}, {}, 3);
    EXPECT_EQ(CQoInterActive::repairSkip, f.ReportWrongInput(data, pos));
    EXPECT_EQ(3, pos);
}

TEST(FilterBaseOutput, ColumnsGrowKeepingTheirSettingsAndIndexesAreChecked)
{
    OutDB out;
    out.NumCols(2);
    out.SetType(0, OutDB::dbtypeInteger);
    out.SetLength(1, 12);
    try {
        out.GetType(2);
        ADD_FAILURE() << "an index outside the columns must raise";
    } catch (CQoException const &e) {
        EXPECT_EQ(CQoException::indexError, e.Code());
    }
    EXPECT_THROW(out.GetLength(-1), CQoException);
    EXPECT_THROW(out.Value(2, "x"), CQoException);
    out.NumCols(3);
    EXPECT_EQ(OutDB::dbtypeInteger, out.GetType(0));
    EXPECT_EQ(12, out.GetLength(1));
}

TEST(FilterBaseOutput, WritesThroughTheFileItUsesAndCountsBytes)
{
    TempFolder tmp;
    std::string path = tmp.Path("o.txt");
    OutDB out;
    out.NumCols(1);
    out.InitRow();
    EXPECT_THROW(out.WriteRow(), CQoException) << "no file in use";
    CQoFile file(path.c_str(), CQoFile::create | CQoFile::binary);
    out.FileCharSet(CQoFile::ascii);
    out.UseFile(&file, true);
    out.Value(0, "\xE4");
    out.WriteRow();
    out.Value(0, "z");
    out.WriteRow();
    EXPECT_EQ(6, out.wroteBytes());
    out.ReleaseFile();
    EXPECT_FALSE(file.IsOpen());
    EXPECT_EQ("\x84;\nz;\n", ReadBytes(path));
}

TEST(FilterBaseSource, AnOutputSourceReadsAsAnInputFilter)
{
    Source source;
    CQoOutputSourceInputFilter f(&source);
    std::vector<Row> rows = AllRows(f);
    ASSERT_EQ(3u, rows.size());
    EXPECT_EQ((Row{"r2c0", "r2c1"}), rows[2]);
    EXPECT_FALSE(f.AbsoluteRow(3));

    f.SetOutputSource(nullptr);
    EXPECT_EQ(0, f.NumCols());
    EXPECT_FALSE(f.FirstRow());
}
