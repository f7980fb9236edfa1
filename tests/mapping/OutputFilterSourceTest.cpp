// The output filter source: the column view over the host's inner columns and
// the conversions on the way out.
#include "MappingTestSource.h"

#include <CQoString.h>

using mappingtest::TableSource;

namespace {

TableSource Addresses()
{
    return TableSource({"Name", "Ort", "Plz"},
                       {{"Müller", "Köln", "50667"}, {"Weiß", "Gießen", "35390"}});
}

std::string Out(COutputFilterSource& source, long row, int col)
{
    CQoString value("vorher");
    source.GetValue(row, col, value);
    return value.GetString();
}

} // namespace

TEST(OutputFilterSourceView, SelectionAndOrderOverTheInnerColumns)
{
    TableSource s = Addresses();
    EXPECT_EQ(2L, s.GetNumRows());
    s.SetSelected("Ort", false);   // before the first read: kept
    EXPECT_EQ("Name,Plz", s.OutputNames());
    // A missing output column: the text is kept and the host not asked; through
    // the output source interface it is emptied.
    CString value("vorher");
    s.GetValue(0, 2, value);
    s.GetValue(0, -1, value);
    s.GetName(5, value, 0);
    EXPECT_STREQ("vorher", value);
    EXPECT_EQ(0, s.valueCalls);
    EXPECT_EQ("", Out(s, 0, 2));
    CQoString name("vorher");
    s.GetColumnName(2, name);
    EXPECT_STREQ("", name);
    EXPECT_EQ("35390", Out(s, 1, 1));
    EXPECT_EQ(1L, s.lastRow);   // row numbers reach the host unchanged

    s.SelectAll(true);
    s.ToFront("Plz");
    s.ToFront("Strasse");   // unknown: nothing moves
    EXPECT_EQ("Plz,Name,Ort", s.OutputNames());
    EXPECT_EQ("Gießen", Out(s, 1, 2));
}

TEST(OutputFilterSourceView, EditsActOnTheFirstOfTwoEqualNames)
{
    TableSource s({"A", "B", "A"}, {{"1", "2", "3"}});
    s.SetSelected("A", false);
    EXPECT_EQ("-A,B,A", s.Entries());
    EXPECT_EQ("2", Out(s, 0, 0));
    s.SelectAll(true);
    s.ToFront("B");
    s.ToFront("A");   // the first A is the inner column 0
    EXPECT_EQ("1|2|3", Out(s, 0, 0) + "|" + Out(s, 0, 1) + "|" + Out(s, 0, 2));
}

TEST(OutputFilterSourceView, ListIsBuiltOnceUntilInitArrayAndKeepsItsNames)
{
    TableSource s = Addresses();
    s.SetSelected("Plz", false);
    s.ToFront("Ort");
    s.AddColumn("Land", "D");
    s.Rename(1, "Wohnort");
    EXPECT_EQ("Wohnort,Name", s.OutputNames()) << "names come from the host each time";
    EXPECT_EQ("Ort,Name,-Plz", s.Entries()) << "the new host column is not noticed";

    s.InitArray();   // selection and order are gone, the new column is there
    EXPECT_EQ("Name,Wohnort,Plz,Land", s.Entries());
    EXPECT_EQ("D", Out(s, 1, 3));
}

TEST(OutputFilterSourceConversion, UmlautsAreReplacedBeforeUpperCasing)
{
    TableSource s({"Name"}, {{"Müller-Weiß, Öde Äcker"}});
    s.SetNoUmlaute(true);
    EXPECT_EQ("Mueller-Weiss, Oede Aecker", Out(s, 0, 0));
    s.SetUseCapitals(true);
    EXPECT_EQ("MUELLER-WEISS, OEDE AECKER", Out(s, 0, 0));
    // Capitals alone upper-case the letters of the code page; ß has no
    // capital there and stays.
    s.SetNoUmlaute(false);
    EXPECT_EQ("MÜLLER-WEIß, ÖDE ÄCKER", Out(s, 0, 0));
    CQoString name;   // names are never converted
    s.GetColumnName(0, name);
    EXPECT_STREQ("Name", name);
}

TEST(OutputFilterSourceEntries, EntriesAreCopiesAndAListWrittenByTheUserIsKept)
{
    TableSource s = Addresses();
    COutputFilterSource::CEntry e(99, "x", false);
    EXPECT_FALSE(s.GetEntry(3, e));
    ASSERT_TRUE(s.GetEntry(2, e));   // reading builds the list
    e.SetSelected(false);   // a copy: the source is unchanged
    EXPECT_EQ(3, s.NumColumns());
    ASSERT_TRUE(s.SetEntry(2, e));
    EXPECT_EQ(2, s.NumColumns());
    EXPECT_FALSE(s.SetEntry(3, e));

    // As the page does it: empty the list, then append its items; written
    // before anything was read, it is not replaced by a later build.
    TableSource t = Addresses();
    t.RemoveAllEntries();
    EXPECT_EQ(0, t.GetNumColumns());
    t.AddEntry(COutputFilterSource::CEntry(2, "Plz", true));
    t.AddEntry(COutputFilterSource::CEntry(0, "Name", false));
    EXPECT_EQ("Plz,-Name", t.Entries());
    EXPECT_EQ("35390", Out(t, 1, 0));
}
