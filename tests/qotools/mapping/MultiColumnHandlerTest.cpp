#include "CMultiColumnHandler.h"
#include "CQoConfigFile.h"
#include "CQoOutputSourceInputFilter.h"
#include "MultiColumnTestData.h"
#include "TextFilterTestSupport.h"

#include <gtest/gtest.h>

#include <memory>

namespace {

struct FilterDeleter {
    void operator()(CQoInputFilter *f) const { f->Delete(); }
};
struct SourceDeleter {
    void operator()(CQoOutputSource *s) const { s->Delete(); }
};
typedef std::unique_ptr<CQoInputFilter, FilterDeleter> FilterPtr;
typedef std::unique_ptr<CQoOutputSource, SourceDeleter> SourcePtr;

// What a filter, a source or the handler answers; "unset" where it leaves the text alone.
std::string Val(CQoInputFilter &f, int col) { CQoString v("unset"); f.Value(col, v); return std::string(v.Str()); }
std::string Val(CQoOutputSource &s, long row, int col) { CQoString v("unset"); s.GetValue(row, col, v); return std::string(v.Str()); }
std::string Name(CQoInputFilter &f, int col) { CQoString v("unset"); f.ColName(col, v); return std::string(v.Str()); }
std::string Name(CQoOutputSource &s, int col) { CQoString v("unset"); s.GetColumnName(col, v); return std::string(v.Str()); }

// An address file: column 0 "Name, Vorname Titel", column 1 the town.
MemoryInputFilter AddressFile()
{
    return MemoryInputFilter({"Person", "Ort"}, {{"Meier, Hans Dr.", "Bonn"},
                                                  {"Schulz, Eva", "K\xF6ln"},
                                                  {"Meier Prof.", "Ulm"},
                                                  {"", ""},
                                                  {", Otto", "Hof"}});
}

// The address file split as a page sets it up: column 0 holds the
// combination Name / ", " Vorname / " " Titel, column 1 the plain function Ort.
class MultiColumnSplit : public ::testing::Test {
protected:
    void SetUp() override
    {
        h.SetReadFilter(&file);
        h.AddInnerColumn(0, 10001, "Name", -1);
        h.AddAssignment(0, 0, "", false);
        h.AddInnerColumn(1, 10002, "Vorname", -1);
        h.AddAssignment(0, 1, ", ", false);
        h.AddInnerColumn(2, 10003, "Titel", -1);
        h.AddAssignment(0, 2, " ", false);
        h.AddInnerColumn(3, 10004, "Ort", -1);
        h.AddAssignment(1, 3, "", false);
    }
    MemoryInputFilter file = AddressFile();
    CMultiColumnHandler h{CMultiColumnHandler::splitInput};
};

} // namespace

TEST(MultiColumnSplitting, CutsEachValueAtItsSeparatorsFollowsChangesAndOutlivesTheHandler)
{
    struct Part {
        int outer; // -1: not assigned
        char const *separator;
        bool always;
    };
    struct Case {
        char const *what;
        std::vector<std::string> names;
        Rows file;
        std::vector<Part> parts; // inner column i is parts[i]
        Rows expected;
    };
    Case const cases[] = {
        // An empty first name leaves its separator out: the title still lands in its own column.
        {"address", {"Person", "Ort"}, AddressFile().m_rows,
         {{0, "", false}, {0, ", ", false}, {0, " ", false}, {1, "", false}},
         {{"Meier", "Hans", "Dr.", "Bonn"},
          {"Schulz", "Eva", "", "K\xF6ln"},
          {"Meier", "", "Prof.", "Ulm"},
          {"", "", "", ""},
          {"", "Otto", "", "Hof"}}},
        // Always-present and leading separators are taken off; what cannot be
        // cut stays with the part before.
        {"always", {"Nummer"}, {{"<12>-<>-<7>"}, {"<1>--<3>"}},
         {{0, "<", true}, {0, ">-<", true}, {0, ">-<", true}},
         {{"12", "", "7>"}, {"1>--<3>", "", ""}}},
        // Nothing marks where a part without separator starts; an unassigned column stays empty.
        {"no separator", {"PLZOrt", "Rest"}, {{"53111Bonn", "x"}},
         {{0, "", false}, {0, "", false}, {-1, "", false}},
         {{"53111Bonn", "", ""}}},
    };
    for (Case const &c : cases) {
        SCOPED_TRACE(c.what);
        MemoryInputFilter file(c.names, c.file);
        CMultiColumnHandler h(CMultiColumnHandler::splitInput);
        h.SetReadFilter(&file);
        for (int i = 0; i < static_cast<int>(c.parts.size()); ++i) {
            h.AddInnerColumn(i, 10001 + i, "f");
            if (c.parts[i].outer >= 0)
                h.AddAssignment(c.parts[i].outer, i, c.parts[i].separator, c.parts[i].always);
        }
        FilterPtr split(h.CreateMultiColumnInputFilter());
        ASSERT_TRUE(split);
        EXPECT_EQ(static_cast<int>(c.parts.size()), split->NumCols());
        EXPECT_EQ(static_cast<long>(c.file.size()), split->NumRows());
        EXPECT_EQ(c.expected, AllRows(*split));
    }

    // The filter follows later changes and outlives the handler.
    MemoryInputFilter file = AddressFile();
    FilterPtr split;
    {
        CMultiColumnHandler h(CMultiColumnHandler::splitInput);
        h.SetReadFilter(&file);
        h.AddInnerColumn(0, 10001, "Ganz");
        h.AddAssignment(0, 0, "", false);
        split.reset(h.CreateMultiColumnInputFilter());
        ASSERT_TRUE(split->FirstRow());
        EXPECT_EQ("Meier, Hans Dr.", Val(*split, 0));

        // The current row's values follow a change of the mapping at once.
        h.AddInnerColumn(1, 10002, "Vorname");
        h.AddAssignment(0, 1, ", ", false);
        EXPECT_EQ(2, split->NumCols());
        EXPECT_EQ("Hans Dr.", Val(*split, 1));
    }
    ASSERT_TRUE(split->AbsoluteRow(1));
    EXPECT_EQ("Eva", Val(*split, 1));
    EXPECT_EQ("", Val(*split, 2)); // no such column
    EXPECT_EQ("", Val(*split, -1));
}

TEST_F(MultiColumnSplit, FilterNamesItsColumnsAfterInnerOrOuterColumns)
{
    h.AddInnerColumn(4, 10005, ""); // unassigned, no name
    FilterPtr split(h.CreateMultiColumnInputFilter());
    EXPECT_EQ("Vorname", Name(*split, 1));
    EXPECT_EQ("Feld 5", Name(*split, 4));

    h.SetAlwaysUseOuterNames(true);
    EXPECT_EQ("Person", Name(*split, 2));

    // A name given to an outer column is the handler's; the file keeps its own.
    EXPECT_TRUE(h.ChangeColumnName(true, 0, "Kunde"));
    EXPECT_EQ("Kunde", Name(*split, 1));
    EXPECT_EQ("Person", Name(file, 0));
}

TEST(MultiColumnRules, RefusesWhatCannotBeMappedAndRemovesAssignmentsWithColumns)
{
    MemoryInputFilter file = AddressFile();
    CMultiColumnHandler split(CMultiColumnHandler::splitInput);
    split.SetReadFilter(&file);
    EXPECT_TRUE(split.AddInnerColumn(0, 1, "a"));
    EXPECT_FALSE(split.AddInnerColumn(0, 2, "b")); // id in use
    EXPECT_FALSE(split.AddOuterColumn(5, "x"));   // outer columns are the file's
    EXPECT_FALSE(split.AddAssignment(2, 0, "", false)); // the file has 2 columns
    EXPECT_FALSE(split.AddAssignment(0, 7, "", false)); // no such inner column
    EXPECT_TRUE(split.AddAssignment(1, 0, "", false));
    EXPECT_FALSE(split.AddAssignment(0, 0, "", false)); // a value comes from one place
    EXPECT_EQ(1, split.NumAssignments());

    CMultiColumnHandler compose(CMultiColumnHandler::composeOutput);
    EXPECT_TRUE(compose.AddOuterColumn(4, "A"));
    EXPECT_TRUE(compose.AddInnerColumn(10, 10, "x"));
    EXPECT_FALSE(compose.AddAssignment(0, 10, "", false)); // outer ids, not indexes
    EXPECT_TRUE(compose.AddAssignment(4, 10, "", false));
    EXPECT_EQ(nullptr, compose.CreateMultiColumnInputFilter());

    // Removing columns removes their assignments.
    CMultiColumnHandler h(CMultiColumnHandler::composeOutput);
    h.AddOuterColumn(0, "A");
    h.AddOuterColumn(1, "B");
    h.AddInnerColumn(10, 10, "x");
    h.AddInnerColumn(11, 11, "y");
    h.AddAssignment(0, 10, "", false);
    h.AddAssignment(0, 11, " ", false);
    h.AddAssignment(1, 11, "", false);

    EXPECT_TRUE(h.DeleteColumn(true, 1)); // inner y
    EXPECT_EQ(1, h.NumAssignments());
    EXPECT_TRUE(h.DeleteColumn(false, 0)); // outer A
    EXPECT_EQ(0, h.NumAssignments());
    CQoString name;
    EXPECT_TRUE(h.GetOuterColName(0, name));
    EXPECT_STREQ("B", name);
    EXPECT_FALSE(h.DeleteColumn(false, 1));
}

namespace {

// The functions' values: Name, Vorname, Titel, PLZ, Ort.
MemoryOutputSource PersonSource()
{
    return MemoryOutputSource({"Name", "Vorname", "Titel", "PLZ", "Ort"},
                              {{"Meier", "Hans", "Dr.", "53111", "Bonn"},
                               {"Schulz", "", "", "", "K\xF6ln"},
                               {"", "Otto", "", "95028", ""}},
                              {30, 20, 10, 5, 25});
}

// Write mode as a configuration page fills it: inner columns are the functions
// (id = function id), outer columns with ids of their own.
void FillCompose(CMultiColumnHandler &h)
{
    char const *names[] = {"Name", "Vorname", "Titel", "PLZ", "Ort"};
    for (int i = 0; i < 5; ++i)
        h.AddInnerColumn(10001 + i, 10001 + i, names[i]);
    h.AddOuterColumn(7, "Person");
    h.AddAssignment(7, 10001, "", false);
    h.AddAssignment(7, 10002, ", ", false);
    h.AddAssignment(7, 10003, " ", false);
    h.AddOuterColumn(3, "");
    h.AddAssignment(3, 10004, "D-", false);
    h.AddAssignment(3, 10005, " ", true);
}

class MultiColumnCompose : public ::testing::Test {
protected:
    void SetUp() override { h.SetWriteOutputSource(&values); }
    MemoryOutputSource values = PersonSource();
    CMultiColumnHandler h{CMultiColumnHandler::composeOutput};
};

} // namespace

TEST_F(MultiColumnCompose, SeparatorsStandOnlyBeforeValuesUnlessAlwaysAndNamesAndLengths)
{
    FillCompose(h);
    SourcePtr out(h.CreateMultiColumnOutputSource());
    ASSERT_TRUE(out);
    EXPECT_EQ(2, out->GetNumColumns());
    CQoOutputSourceInputFilter rows(out.get());
    // No postcode: no "D-", but the always blank.
    EXPECT_EQ((Rows{{"Meier, Hans Dr.", "D-53111 Bonn"}, {"Schulz", " K\xF6ln"}, {", Otto", "D-95028 "}}),
              AllRows(rows));
    EXPECT_EQ("", Val(*out, 3, 0));
    EXPECT_EQ("D-PLZ Ort", Name(*out, 1)); // no name of its own: its parts
    EXPECT_EQ(30 + 20 + 2 + 10 + 1, out->GetDataLength(0));
    EXPECT_EQ(2 + 5 + 1 + 25, out->GetDataLength(1));
    values.m_lengths.resize(4); // Ort's length no longer known
    EXPECT_EQ(-1, out->GetDataLength(1));
}

TEST_F(MultiColumnCompose, InnerColumnsReadTheirPositionOrAGivenSourceColumn)
{
    h.AddInnerColumn(50, 50, "Ort", 4);
    h.AddInnerColumn(51, 51, "Vorname"); // second inner column: source column 1
    h.AddOuterColumn(0, "A");
    h.AddAssignment(0, 50, "", false);
    h.AddAssignment(0, 51, "/", false);
    h.AddAssignment(0, 50, "/", false); // the same value twice is allowed
    SourcePtr out(h.CreateMultiColumnOutputSource());
    EXPECT_EQ("Bonn/Hans/Bonn", Val(*out, 0, 0));
}

TEST_F(MultiColumnCompose, SourceMadeFirstFollowsTheMappingAsAPageBuildsIt)
{
    // A page makes the source first and fills the handler afterwards, again on
    // every change; the preview reads the source through an input filter.
    SourcePtr out(h.CreateMultiColumnOutputSource());
    CQoOutputSourceInputFilter preview(out.get());
    EXPECT_EQ(0, preview.NumCols());

    FillCompose(h);
    // Reordering as the page does: clear, add the outer columns anew.
    h.ClearAssignments();
    h.DeleteColumns(false);
    h.AddOuterColumn(3, "Ort");
    h.AddAssignment(3, 10005, "", false);
    h.AddOuterColumn(7, "Name");
    h.AddAssignment(7, 10001, "", false);
    ASSERT_TRUE(preview.AbsoluteRow(1));
    EXPECT_EQ((Row{"K\xF6ln", "Schulz"}), CurrentRow(preview));

    // Without an output source nothing is delivered.
    h.SetWriteOutputSource(nullptr);
    EXPECT_EQ(0, out->GetNumRows());
    EXPECT_EQ("", Val(*out, 0, 0));
}

TEST_F(MultiColumnCompose, MappingRoundTripsThroughAConfigurationFile)
{
    CQoConfigFile cfg;
    {
        CMultiColumnHandler written(CMultiColumnHandler::composeOutput);
        FillCompose(written);
        written.ChangeColumnName(false, 1, " Vor name "); // blanks at both ends
        CQoConfigFile project;
        written.WriteConfig(project, "Ausgabe");
        CQoString text = project.ToText();
        cfg.FromText(text, std::size_t(text.GetLength()));
    }
    SourcePtr out(h.CreateMultiColumnOutputSource());
    ASSERT_TRUE(h.ReadConfig(cfg, "Ausgabe"));
    EXPECT_EQ(5, h.NumAssignments());
    CQoString name;
    h.GetInnerColName(1, name, true);
    EXPECT_STREQ(" Vor name ", name);
    // The source made before reading follows the mapping read.
    EXPECT_EQ("Meier, Hans Dr.", Val(*out, 0, 0));
    EXPECT_EQ(" K\xF6ln", Val(*out, 1, 1));

    // A handler of the other type does not take it.
    CMultiColumnHandler other(CMultiColumnHandler::splitInput);
    other.AddInnerColumn(0, 1, "bleibt");
    EXPECT_FALSE(other.ReadConfig(cfg, "Ausgabe"));
    EXPECT_EQ(1, other.NumInnerColumns());
}

TEST_F(MultiColumnSplit, ShrinkingTheMappingLeavesNoStaleKeys)
{
    FilterPtr split(h.CreateMultiColumnInputFilter());
    CQoConfigFile cfg;
    split->WriteConfig(cfg, "Eingabe");
    EXPECT_TRUE(cfg.HasKey("Eingabe", "Inner1Id"));

    // Fewer columns written over the same section: the old numbered keys go.
    h.DeleteColumns(true);
    h.AddInnerColumn(0, 1, "nur");
    h.AddAssignment(1, 0, "", false);
    split->WriteConfig(cfg, "Eingabe");
    EXPECT_FALSE(cfg.HasKey("Eingabe", "Inner1Id"));
    EXPECT_FALSE(cfg.HasKey("Eingabe", "Assign1Inner"));
}

TEST(MultiColumnConfig, DamagedSettingsAreLeftOutNotFollowed)
{
    char const project[] = "[M]\nMultiColumnType=1\n"
                           "InnerColumns=2000000000\nInner0Id=5\nInner0Name=a\nInner1Id=kaputt\n" // a count that would take ages
                           "OuterColumns=2\nOuter0Id=1\nOuter1Id=1\n"                             // the same id twice
                           "Assignments=2\nAssign0Outer=1\nAssign0Inner=5\n"
                           "Assign1Outer=1\nAssign1Inner=6\n";                                     // no such inner column
    CQoConfigFile cfg;
    cfg.FromText(project, sizeof project - 1);
    CMultiColumnHandler h(CMultiColumnHandler::composeOutput);
    ASSERT_TRUE(h.ReadConfig(cfg, "M"));
    EXPECT_EQ(1, h.NumInnerColumns());
    EXPECT_EQ(1, h.NumOuterColumns());
    EXPECT_EQ(1, h.NumAssignments());
}
