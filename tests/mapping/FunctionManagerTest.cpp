// The function manager: id ranges and next ids, the registry in id order,
// deleting and restoring functions by name, combinations, and copies.
#include <CFunctionManager.h>

#include <gtest/gtest.h>


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

// --- id ranges and next ids ------------------------------------------------

TEST(FunctionManagerIds, DefaultRangesClassifyIdsAtTheirBounds)
{
    CFunctionManager m;
    EXPECT_EQ(CFunctionManager::predefinedType, m.Id2Type(0));
    EXPECT_EQ(CFunctionManager::predefinedType, m.Id2Type(9999));
    EXPECT_EQ(CFunctionManager::userdefinedType, m.Id2Type(10000));
    EXPECT_EQ(CFunctionManager::userdefinedType, m.Id2Type(19999));
    EXPECT_EQ(CFunctionManager::combiType, m.Id2Type(20000));
    EXPECT_EQ(CFunctionManager::combiType, m.Id2Type(29999));
    EXPECT_EQ(CFunctionManager::fileType, m.Id2Type(30000));
    EXPECT_EQ(CFunctionManager::fileType, m.Id2Type(2000000000L));
    EXPECT_EQ(CFunctionManager::noType, m.Id2Type(-1));
    EXPECT_EQ(0L, CFunctionManager::unusedFunction);
}

TEST(FunctionManagerIds, GapsBetweenChangedRangesHaveNoType)
{
    CFunctionManager m;
    m.SetMaxPredefinedId(99);
    EXPECT_EQ(99L, m.GetMaxPredefinedId());
    EXPECT_EQ(CFunctionManager::noType, m.Id2Type(500));
    EXPECT_EQ(CFunctionManager::predefinedType, m.Id2Type(99));

    m.SetMinUnusedFileId(50000);
    EXPECT_EQ(CFunctionManager::noType, m.Id2Type(30000));
    EXPECT_EQ(CFunctionManager::fileType, m.Id2Type(50000));

    m.SetMinCombiId(25000);
    m.SetMaxCombiId(26000);
    EXPECT_EQ(CFunctionManager::noType, m.Id2Type(24999));
    EXPECT_EQ(CFunctionManager::combiType, m.Id2Type(26000));
    EXPECT_EQ(CFunctionManager::noType, m.Id2Type(26001));

    // Overlapping ranges: the earlier kind in the order predefined,
    // user-defined, combination wins.
    m.SetMinUserdefinedId(50);
    EXPECT_EQ(CFunctionManager::predefinedType, m.Id2Type(60));
    EXPECT_EQ(CFunctionManager::userdefinedType, m.Id2Type(100));
}

TEST(FunctionManagerIds, PredefinedNextIdIsAlwaysTakenOthersOnlyOnRequest)
{
    CFunctionManager m;
    EXPECT_EQ(0L, m.GetNextPredefinedId());
    EXPECT_EQ(1L, m.GetNextPredefinedId());

    EXPECT_EQ(10000L, m.GetNextUserdefinedId(false));
    EXPECT_EQ(10000L, m.GetNextUserdefinedId(false));
    EXPECT_EQ(10000L, m.GetNextUserdefinedId(true));
    EXPECT_EQ(10001L, m.GetNextUserdefinedId(false));

    EXPECT_EQ(20000L, m.GetNextCombiId(false));
    EXPECT_EQ(20000L, m.GetNextCombiId(true));
    EXPECT_EQ(20001L, m.GetNextCombiId(true));

    m.SetNextPredefinedId(42);
    m.SetNextUserdefinedId(10500);
    m.SetNextCombiId(29999);
    EXPECT_EQ(42L, m.GetNextPredefinedId());
    EXPECT_EQ(10500L, m.GetNextUserdefinedId(true));
    // Nothing stops a next id at its range's end.
    EXPECT_EQ(29999L, m.GetNextCombiId(true));
    EXPECT_EQ(30000L, m.GetNextCombiId(false));
}

// --- the registry ------------------------------------------------------------

TEST(FunctionManagerRegistry, FunctionsComeInAscendingIdOrder)
{
    CFunctionManager m;
    Add(m, 20001, "Name komplett");
    Add(m, 3, "Strasse");
    Add(m, 10000, "Kunde");
    Add(m, 1, "Name");
    EXPECT_EQ(4, m.GetNumFunctions());
    EXPECT_EQ((std::vector<long>{1, 3, 10000, 20001}), Ids(m));

    Function f(-7, "unverändert");
    EXPECT_FALSE(m.GetFunctionAt(-1, f));
    EXPECT_FALSE(m.GetFunctionAt(4, f));
    EXPECT_FALSE(m.GetFunction(2, f));
    EXPECT_EQ(-7L, f.GetId());
    EXPECT_STREQ("unverändert", f.GetName());

    ASSERT_TRUE(m.GetFunction(10000, f));
    EXPECT_STREQ("Kunde", f.GetName());
}

TEST(FunctionManagerRegistry, AddingUnderAnExistingIdReplacesThatFunction)
{
    CFunctionManager m;
    Add(m, 10000, "Kunde");
    Add(m, 10000, "Kundennummer");
    EXPECT_EQ(1, m.GetNumFunctions());
    Function f(0, "");
    ASSERT_TRUE(m.GetFunctionAt(0, f));
    EXPECT_STREQ("Kundennummer", f.GetName());
    EXPECT_FALSE(m.ExistsFunction("Kunde"));
}

TEST(FunctionManagerRegistry, ExistsFunctionIgnoresCaseIncludingUmlauts)
{
    CFunctionManager m;
    Add(m, 1, "Kunde");
    Add(m, 2, "Straße");
    Add(m, 3, "Änderung");
    EXPECT_TRUE(m.ExistsFunction("kunde"));
    EXPECT_TRUE(m.ExistsFunction("KUNDE"));
    EXPECT_TRUE(m.ExistsFunction("straße"));
    EXPECT_TRUE(m.ExistsFunction("änderung"));
    EXPECT_FALSE(m.ExistsFunction("Kunden"));
    EXPECT_FALSE(m.ExistsFunction(""));
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
    std::vector<Part> parts = read.GetCombination();
    ASSERT_EQ(2u, parts.size());
    EXPECT_EQ(1L, parts[0].GetFunctionId());
    EXPECT_STREQ("", parts[0].GetSeparator());
    EXPECT_FALSE(parts[0].GetAlwaysSeparate());
    EXPECT_EQ(2L, parts[1].GetFunctionId());
    EXPECT_STREQ(" ", parts[1].GetSeparator());
    EXPECT_TRUE(parts[1].GetAlwaysSeparate());

    EXPECT_TRUE(m.ExistsCombiWithId(1));
    EXPECT_TRUE(m.ExistsCombiWithId(2));
    EXPECT_FALSE(m.ExistsCombiWithId(3));
    EXPECT_FALSE(m.ExistsCombiWithId(20000));

    // The copy handed out is the caller's: changing it leaves the stored one.
    parts.clear();
    read.SetCombination(parts);
    ASSERT_TRUE(m.GetFunction(20000, read));
    EXPECT_EQ(2u, read.GetCombination().size());

    m.DeleteFunction(20000);
    EXPECT_FALSE(m.ExistsCombiWithId(1));
}

// --- deleting and restoring ------------------------------------------------

TEST(FunctionManagerDelete, ReAddedNameOfTheSameKindGetsItsOldIdBack)
{
    CFunctionManager m;
    Add(m, 10003, "Kunde");
    Add(m, 10004, "Lieferant");
    m.DeleteFunction(10003);
    EXPECT_EQ(1, m.GetNumFunctions());
    EXPECT_TRUE(m.IsDeleted("kunde"));
    EXPECT_TRUE(m.IsDeleted("KUNDE"));
    EXPECT_FALSE(m.ExistsFunction("Kunde"));

    Function f(10007, "KUNDE");
    m.AddFunction(f);
    EXPECT_EQ(10003L, f.GetId());
    EXPECT_FALSE(m.IsDeleted("kunde"));
    Function stored(0, "");
    ASSERT_TRUE(m.GetFunction(10003, stored));
    EXPECT_STREQ("KUNDE", stored.GetName());
    EXPECT_FALSE(m.GetFunction(10007, stored));
    EXPECT_EQ((std::vector<long>{10003, 10004}), Ids(m));
}

TEST(FunctionManagerDelete, ReAddedNameOfAnotherKindKeepsItsNewId)
{
    CFunctionManager m;
    Add(m, 10003, "Kunde");
    m.DeleteFunction(10003);
    Function f(20005, "Kunde");
    m.AddFunction(f);
    EXPECT_EQ(20005L, f.GetId());
    EXPECT_FALSE(m.IsDeleted("Kunde"));
    EXPECT_EQ((std::vector<long>{20005}), Ids(m));

    // The memory was used up: deleting the combination and adding a
    // user-defined Kunde again now goes by the combination's id.
    m.DeleteFunction(20005);
    Function g(10009, "Kunde");
    m.AddFunction(g);
    EXPECT_EQ(10009L, g.GetId());
}

TEST(FunctionManagerDelete, OldIdIsNotTakenFromAFunctionThatHoldsItNow)
{
    CFunctionManager m;
    Add(m, 10003, "Kunde");
    m.DeleteFunction(10003);
    Add(m, 10003, "Lieferant");   // the host reused the free id

    Function f(10008, "Kunde");
    m.AddFunction(f);
    EXPECT_EQ(10008L, f.GetId());
    EXPECT_FALSE(m.IsDeleted("kunde"));
    Function stored(0, "");
    ASSERT_TRUE(m.GetFunction(10003, stored));
    EXPECT_STREQ("Lieferant", stored.GetName());
    EXPECT_EQ(2, m.GetNumFunctions());
}

TEST(FunctionManagerDelete, LastDeletionOfANameWinsAndUnknownIdsAreIgnored)
{
    CFunctionManager m;
    // The manager itself does not enforce unique names.
    Add(m, 10001, "Kunde");
    Add(m, 10002, "KUNDE");
    m.DeleteFunction(10001);
    m.DeleteFunction(10002);
    m.DeleteFunction(12345);   // unknown: nothing happens
    EXPECT_EQ(0, m.GetNumFunctions());

    Function f(10050, "kunde");
    m.AddFunction(f);
    EXPECT_EQ(10002L, f.GetId());
}

TEST(FunctionManagerDelete, ClearKeepsTheMemoryOfDeletedNames)
{
    CFunctionManager m;
    Add(m, 10003, "Kunde");
    Add(m, 1, "Name");
    m.DeleteFunction(10003);
    m.ClearFunctions();
    EXPECT_EQ(0, m.GetNumFunctions());
    Function f(0, "");
    EXPECT_FALSE(m.GetFunctionAt(0, f));
    EXPECT_TRUE(m.IsDeleted("Kunde"));

    Function again(10010, "kunde");
    m.AddFunction(again);
    EXPECT_EQ(10003L, again.GetId());
    // Cleared functions were not deleted: their names bring nothing back.
    Function name(10011, "Name");
    m.AddFunction(name);
    EXPECT_EQ(10011L, name.GetId());
}

// --- copies ----------------------------------------------------------------------

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
    EXPECT_EQ(2, copy.GetNumFunctions());
    EXPECT_EQ(99L, copy.GetMaxPredefinedId());
    EXPECT_EQ(10020L, copy.GetNextUserdefinedId(true));
    EXPECT_EQ(10020L, m.GetNextUserdefinedId(false));
    EXPECT_TRUE(copy.IsDeleted("kunde"));

    CFunctionManager target;
    target = copy;
    EXPECT_EQ((std::vector<long>{5, 6}), Ids(target));
    EXPECT_EQ(10021L, target.GetNextUserdefinedId(false));
    EXPECT_EQ(CFunctionManager::noType, target.Id2Type(500));
    Function f(10077, "KUNDE");
    target.AddFunction(f);
    EXPECT_EQ(10003L, f.GetId());
    EXPECT_TRUE(copy.IsDeleted("kunde"));
}
