// The function manager: id ranges and next ids, the registry in id order,
// deleting and restoring functions by name, combinations, and copies.
#include <CFunctionManager.h>

#include <gtest/gtest.h>

#include <functional>

using Function = CFunctionManager::CFunction;
using Part = CFunctionManager::CCombiPart;

namespace {

Function Add(CFunctionManager& manager, long id, const char* name)
{
    Function f(id, name);
    manager.AddFunction(f);
    return f;
}

std::vector<long> Ids(const CFunctionManager& manager)
{
    std::vector<long> ids;
    Function f(-1, "");
    for (int i = 0; i < manager.GetNumFunctions(); ++i) {
        EXPECT_TRUE(manager.GetFunctionAt(i, f));
        ids.push_back(f.GetId());
    }
    return ids;
}

} // namespace

TEST(FunctionManagerIds, RangesClassifyIdsAtTheirBoundsAndGapsHaveNoType)
{
    const auto pre = CFunctionManager::predefinedType, user = CFunctionManager::userdefinedType,
               combi = CFunctionManager::combiType, file = CFunctionManager::fileType, none = CFunctionManager::noType;
    CFunctionManager m;
    const std::pair<long, CFunctionManager::type> defaults[] = {
        {0, pre}, {9999, pre}, {10000, user}, {19999, user}, {20000, combi},
        {29999, combi}, {30000, file}, {2000000000L, file}, {-1, none}};
    for (const auto& c : defaults)
        EXPECT_EQ(c.second, m.Id2Type(c.first)) << c.first;

    // Changed ranges leave gaps; where they overlap, the earlier kind in the
    // order predefined, user-defined, combination wins.
    m.SetMaxPredefinedId(99);
    m.SetMinUnusedFileId(50000);
    m.SetMinCombiId(25000);
    m.SetMaxCombiId(26000);
    m.SetMinUserdefinedId(50);
    const std::pair<long, CFunctionManager::type> changed[] = {
        {99, pre}, {60, pre}, {100, user}, {24999, none}, {26000, combi}, {26001, none}, {30000, none}, {50000, file}};
    for (const auto& c : changed)
        EXPECT_EQ(c.second, m.Id2Type(c.first)) << c.first;
}

TEST(FunctionManagerIds, PredefinedNextIdIsAlwaysTakenOthersOnlyOnRequest)
{
    CFunctionManager m;
    EXPECT_EQ(0L, m.GetNextPredefinedId());
    EXPECT_EQ(1L, m.GetNextPredefinedId());
    EXPECT_EQ(10000L, m.GetNextUserdefinedId(false));
    EXPECT_EQ(10000L, m.GetNextUserdefinedId(true));
    EXPECT_EQ(10001L, m.GetNextUserdefinedId(false));
    EXPECT_EQ(20000L, m.GetNextCombiId(true));
    EXPECT_EQ(20001L, m.GetNextCombiId(true));

    m.SetNextPredefinedId(42);
    m.SetNextCombiId(29999);
    EXPECT_EQ(42L, m.GetNextPredefinedId());
    // Nothing stops a next id at its range's end.
    EXPECT_EQ(29999L, m.GetNextCombiId(true));
    EXPECT_EQ(30000L, m.GetNextCombiId(false));
}

TEST(FunctionManagerRegistry, FunctionsInIdOrderReplacedByIdFoundByNameInAnyCase)
{
    CFunctionManager m;
    Add(m, 20001, "Name komplett");
    Add(m, 3, "Straße");
    Add(m, 10000, "Kunde");
    Add(m, 1, "Änderung");
    Add(m, 10000, "Kundennummer");
    EXPECT_EQ((std::vector<long>{1, 3, 10000, 20001}), Ids(m));

    Function f(-7, "unverändert");
    EXPECT_FALSE(m.GetFunctionAt(4, f));
    EXPECT_FALSE(m.GetFunction(2, f));
    EXPECT_EQ(-7L, f.GetId());
    ASSERT_TRUE(m.GetFunction(10000, f));
    EXPECT_STREQ("Kundennummer", f.GetName());

    for (const char* name : {"kundennummer", "KUNDENNUMMER", "straße", "änderung"})
        EXPECT_TRUE(m.ExistsFunction(name)) << name;
    for (const char* name : {"Kunde", "Kunden", ""})
        EXPECT_FALSE(m.ExistsFunction(name)) << name;
}

TEST(FunctionManagerRegistry, CombinationsKeepTheirPartsAndAreFoundByPart)
{
    CFunctionManager m;
    Add(m, 1, "Vorname");
    Add(m, 2, "Name");
    Add(m, 3, "Titel");
    Function combi(20000, "Vorname Name");
    combi.SetCombination({Part(1, "", false), Part(2, " ", true)});
    m.AddFunction(combi);

    Function read(0, "");
    ASSERT_TRUE(m.GetFunction(20000, read));
    std::string parts;
    for (const Part& p : read.GetCombination())
        parts += std::to_string(p.GetFunctionId()) + "|" + (const char*)p.GetSeparator() + "|" +
                 std::to_string(p.GetAlwaysSeparate()) + ";";
    EXPECT_EQ("1||0;2| |1;", parts);
    EXPECT_TRUE(m.ExistsCombiWithId(1) && m.ExistsCombiWithId(2));
    EXPECT_FALSE(m.ExistsCombiWithId(3) || m.ExistsCombiWithId(20000));

    // The copy handed out is the caller's: changing it leaves the stored one.
    read.SetCombination({});
    ASSERT_TRUE(m.GetFunction(20000, read));
    EXPECT_EQ(2u, read.GetCombination().size());
    m.DeleteFunction(20000);
    EXPECT_FALSE(m.ExistsCombiWithId(1));
}

// A deleted name added again takes its old id back when it is of the same kind
// and no function holds that id now.
TEST(FunctionManagerDelete, ReAddedNameGetsItsOldIdBackOnlyWhereThatIsSafe)
{
    const struct {
        const char* what;
        std::function<void(CFunctionManager&)> before;  // Kunde 10003 was deleted first
        long added;                                     // the id "KUNDE" is added with
        long expected;
    } cases[] = {
        {"same kind", [](CFunctionManager&) {}, 10007, 10003},
        {"another kind", [](CFunctionManager&) {}, 20005, 20005},
        {"the old id held by another function", [](CFunctionManager& m) { Add(m, 10003, "Lieferant"); }, 10008, 10008},
        {"another kind added and deleted in between",
         [](CFunctionManager& m) {
             Add(m, 20005, "Kunde");
             m.DeleteFunction(20005);
         },
         10009, 10009},
        {"cleared, not deleted, functions are forgotten", [](CFunctionManager& m) { m.ClearFunctions(); }, 10010,
         10003},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.what);
        CFunctionManager m;
        Add(m, 10003, "Kunde");
        Add(m, 1, "Name");
        m.DeleteFunction(10003);
        EXPECT_TRUE(m.IsDeleted("KUNDE"));
        EXPECT_FALSE(m.ExistsFunction("Kunde"));
        c.before(m);
        Function f(c.added, "KUNDE");
        m.AddFunction(f);
        EXPECT_EQ(c.expected, f.GetId());
        EXPECT_FALSE(m.IsDeleted("kunde"));
        Function stored(0, "");
        EXPECT_TRUE(m.GetFunction(c.expected, stored) && stored.GetName() == "KUNDE");
    }
    // The manager itself does not enforce unique names: the last deletion of a
    // name wins. Cleared functions were not deleted: their names bring nothing back.
    CFunctionManager m;
    Add(m, 10001, "Kunde");
    Add(m, 10002, "KUNDE");
    Add(m, 1, "Name");
    m.DeleteFunction(10001);
    m.DeleteFunction(10002);
    m.DeleteFunction(12345);  // unknown: nothing happens
    m.ClearFunctions();
    EXPECT_EQ(0, m.GetNumFunctions());
    EXPECT_EQ(10002L, Add(m, 10050, "kunde").GetId());
    EXPECT_EQ(11L, Add(m, 11, "Name").GetId());
}

TEST(FunctionManagerCopy, CopyAndAssignmentTakeFunctionsDeletedNamesAndSettings)
{
    CFunctionManager m;
    m.SetMaxPredefinedId(99);
    m.SetNextUserdefinedId(10020);
    Add(m, 5, "Name");
    Add(m, 10003, "Kunde");
    m.DeleteFunction(10003);

    CFunctionManager copy(m);
    Add(copy, 6, "Vorname");
    EXPECT_EQ(1, m.GetNumFunctions());
    EXPECT_EQ(10020L, copy.GetNextUserdefinedId(true));
    EXPECT_EQ(10020L, m.GetNextUserdefinedId(false));

    CFunctionManager target;
    target = copy;
    EXPECT_EQ((std::vector<long>{5, 6}), Ids(target));
    EXPECT_EQ(10021L, target.GetNextUserdefinedId(false));
    EXPECT_EQ(CFunctionManager::noType, target.Id2Type(500));
    EXPECT_EQ(10003L, Add(target, 10077, "KUNDE").GetId());
    EXPECT_TRUE(copy.IsDeleted("kunde"));
}
