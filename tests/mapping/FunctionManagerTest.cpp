// The function manager: id ranges, the registry in id order, and deleted
// names that take their old id back.
#include <CFunctionManager.h>

#include <gtest/gtest.h>

#include <functional>

using Function = CFunctionManager::CFunction;

namespace {

Function Add(CFunctionManager& manager, long id, const char* name)
{
    Function f(id, name);
    manager.AddFunction(f);
    return f;
}

} // namespace

TEST(FunctionManagerIds, RangesClassifyIdsAtTheirBoundsAndGapsHaveNoType)
{
    const auto pre = CFunctionManager::predefinedType, user = CFunctionManager::userdefinedType,
               combi = CFunctionManager::combiType, file = CFunctionManager::fileType, none = CFunctionManager::noType;
    CFunctionManager m;
    const std::pair<long, CFunctionManager::type> defaults[] = {
        {9999, pre}, {10000, user}, {29999, combi}, {30000, file}, {-1, none}};
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
        {60, pre}, {100, user}, {24999, none}, {26001, none}, {30000, none}, {50000, file}};
    for (const auto& c : changed)
        EXPECT_EQ(c.second, m.Id2Type(c.first)) << c.first;
}

TEST(FunctionManagerRegistry, FunctionsInIdOrderReplacedByIdFoundByNameInAnyCase)
{
    CFunctionManager m;
    Add(m, 20001, "Name komplett");
    Add(m, 3, "Straße");
    Add(m, 10000, "Kunde");
    Add(m, 10000, "Kundennummer");
    Function f(-7, "unverändert");
    EXPECT_FALSE(m.GetFunctionAt(3, f));
    EXPECT_FALSE(m.GetFunction(2, f));
    EXPECT_EQ(-7L, f.GetId());
    ASSERT_TRUE(m.GetFunctionAt(1, f));
    EXPECT_STREQ("Kundennummer", f.GetName());

    for (const char* name : {"KUNDENNUMMER", "straße"})
        EXPECT_TRUE(m.ExistsFunction(name)) << name;
    for (const char* name : {"Kunde", ""})
        EXPECT_FALSE(m.ExistsFunction(name)) << name;
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
}
