// The change notification: who is told, with what, in which order, and what a
// refusal does to the pass; the list changing while it is being told.
#include <gtest/gtest.h>

#include <functional>
#include <map>
#include <string>
#include <vector>

#include "CModifiedNotifier.h"

namespace {

using Names = std::vector<std::string>;

// Logs "name" (or "name(flag,id)" when asked to) for every call it gets.
class Recorder : public CModifiedListener {
public:
    Recorder(std::vector<std::string>& log, const char* name, int answer = 1)
        : m_log(log), m_name(name), m_answer(answer) {}
    int ModifiedListenerSetModified(int bModified, int nNotifierId) override
    {
        m_log.push_back(m_bDetails ? m_name + "(" + std::to_string(bModified) + "," + std::to_string(nNotifierId) + ")"
                                   : m_name);
        if (m_onCall) {
            auto action = m_onCall;
            m_onCall = nullptr;  // once
            action();
        }
        return m_answer;
    }
    std::vector<std::string>& m_log;
    std::string m_name;
    int m_answer;
    bool m_bDetails = false;
    std::function<void()> m_onCall;
};

TEST(ModifiedNotifier, ListenersHearFlagOneAndTheNotifiersIdInTheOrderTheyCame)
{
    Names log;
    Recorder a(log, "a"), b(log, "b"), c(log, "c"), stranger(log, "x");
    a.m_bDetails = b.m_bDetails = true;
    CModifiedNotifier page(7), list(42);
    page.AddModifiedListener(&a);
    page.AddModifiedListener(&b);
    list.AddModifiedListener(&a);
    EXPECT_EQ(1, page.NotifyListeners());
    EXPECT_EQ(1, list.NotifyListeners());
    EXPECT_EQ((Names{"a(1,7)", "b(1,7)", "a(1,42)"}), log);

    // Null, repeats and strangers are ignored; a listener added again comes last.
    a.m_bDetails = b.m_bDetails = false;
    CModifiedNotifier n(1);
    for (Recorder* r : {&a, (Recorder*)nullptr, &b, &a, &c}) n.AddModifiedListener(r);
    n.RemoveModifiedListener(&stranger);
    n.RemoveModifiedListener(NULL);
    const struct {
        std::function<void()> change;
        Names told;
    } steps[] = {
        {[] {}, {"a", "b", "c"}},
        {[&] { n.RemoveModifiedListener(&b), n.RemoveModifiedListener(&b); }, {"a", "c"}},
        {[&] { n.AddModifiedListener(&b); }, {"a", "c", "b"}},
    };
    for (const auto& s : steps) {
        log.clear();
        s.change();
        n.NotifyListeners();
        EXPECT_EQ(s.told, log);
    }
}

// What b does while it is told - answer, or change the list ("+x" adds x,
// "-x" removes it) - and which listeners that pass and the next pass reach.
// A refusal stops the pass; the next pass starts again at the first.
TEST(ModifiedNotifier, RefusalsAndListenersChangingTheListWhileTold)
{
    const struct {
        Names act;
        int answer;
        Names thisPass, nextPass;
    } cases[] = {
        {{}, 0, {"a", "b"}, {"a", "b"}},
        {{"+d"}, 1, {"a", "b", "c", "d"}, {"a", "b", "c", "d"}},
        {{"-b"}, 1, {"a", "b", "c"}, {"a", "c"}},
        {{"-c"}, 1, {"a", "b"}, {"a", "b"}},
    };
    for (const auto& k : cases) {
        SCOPED_TRACE(::testing::PrintToString(k.act));
        Names log;
        Recorder a(log, "a"), b(log, "b", k.answer), c(log, "c"), d(log, "d");
        std::map<char, Recorder*> by = {{'a', &a}, {'b', &b}, {'c', &c}, {'d', &d}};
        CModifiedNotifier n(9);
        for (Recorder* r : {&a, &b, &c}) n.AddModifiedListener(r);
        b.m_onCall = [&] {
            for (const std::string& op : k.act)
                op[0] == '+' ? n.AddModifiedListener(by[op[1]]) : n.RemoveModifiedListener(by[op[1]]);
        };
        EXPECT_EQ(k.answer, n.NotifyListeners());
        EXPECT_EQ(k.thisPass, log);
        log.clear();
        EXPECT_EQ(k.answer, n.NotifyListeners());
        EXPECT_EQ(k.nextPass, log);
    }
}

}  // namespace
