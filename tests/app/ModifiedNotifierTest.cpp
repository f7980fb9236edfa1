// The change notification: who is told, with what, in which order, and what a
// refusal does to the pass; the list changing while it is being told.
#include <gtest/gtest.h>

#include <functional>
#include <string>
#include <vector>

#include "CModifiedNotifier.h"

namespace {

struct Call {
    std::string name;
    int flag;
    int id;
    bool operator==(const Call& o) const { return name == o.name && flag == o.flag && id == o.id; }
};

std::ostream& operator<<(std::ostream& os, const Call& c)
{
    return os << c.name << "(" << c.flag << "," << c.id << ")";
}

class Recorder : public CModifiedListener {
public:
    Recorder(std::vector<Call>& log, const char* name, int answer = 1)
        : m_log(log), m_name(name), m_answer(answer) {}
    int ModifiedListenerSetModified(int bModified, int nNotifierId) override
    {
        m_log.push_back({m_name, bModified, nNotifierId});
        if (m_onCall) {
            auto action = m_onCall;
            m_onCall = nullptr;  // once
            action();
        }
        return m_answer;
    }
    std::vector<Call>& m_log;
    std::string m_name;
    int m_answer;
    std::function<void()> m_onCall;
};

std::vector<std::string> Names(const std::vector<Call>& log)
{
    std::vector<std::string> names;
    for (const Call& c : log) names.push_back(c.name);
    return names;
}

using Names_t = std::vector<std::string>;

TEST(ModifiedNotifier, EveryListenerHearsFlagOneAndItsNotifiersId)
{
    std::vector<Call> log;
    Recorder a(log, "a"), b(log, "b");
    CModifiedNotifier page(7), list(42);
    page.AddModifiedListener(&a);
    page.AddModifiedListener(&b);
    list.AddModifiedListener(&a);

    EXPECT_EQ(1, page.NotifyListeners());
    EXPECT_EQ(1, list.NotifyListeners());
    EXPECT_EQ((std::vector<Call>{{"a", 1, 7}, {"b", 1, 7}, {"a", 1, 42}}), log);

    CModifiedNotifier nobody(3);
    EXPECT_EQ(1, nobody.NotifyListeners());
}

TEST(ModifiedNotifier, RegistrationKeepsOrderAndIgnoresNullRepeatsAndStrangers)
{
    std::vector<Call> log;
    Recorder a(log, "a"), b(log, "b"), c(log, "c"), stranger(log, "x");
    CModifiedNotifier n(1);
    n.AddModifiedListener(&a);
    n.AddModifiedListener(NULL);
    n.AddModifiedListener(&b);
    n.AddModifiedListener(&a);
    n.AddModifiedListener(&c);
    n.RemoveModifiedListener(&stranger);
    n.RemoveModifiedListener(NULL);
    n.NotifyListeners();
    EXPECT_EQ((Names_t{"a", "b", "c"}), Names(log));

    log.clear();
    n.RemoveModifiedListener(&b);
    n.RemoveModifiedListener(&b);
    n.NotifyListeners();
    EXPECT_EQ((Names_t{"a", "c"}), Names(log));

    log.clear();
    n.AddModifiedListener(&b);  // back at the end
    n.NotifyListeners();
    EXPECT_EQ((Names_t{"a", "c", "b"}), Names(log));
}

TEST(ModifiedNotifier, ARefusalStopsThePassAndTheNextPassStartsAgain)
{
    std::vector<Call> log;
    Recorder a(log, "a"), b(log, "b", 0), c(log, "c");
    CModifiedNotifier n(5);
    n.AddModifiedListener(&a);
    n.AddModifiedListener(&b);
    n.AddModifiedListener(&c);

    EXPECT_EQ(0, n.NotifyListeners());
    EXPECT_EQ((Names_t{"a", "b"}), Names(log));

    log.clear();
    EXPECT_EQ(0, n.NotifyListeners());
    EXPECT_EQ((Names_t{"a", "b"}), Names(log));

    log.clear();
    b.m_answer = 1;
    EXPECT_EQ(1, n.NotifyListeners());
    EXPECT_EQ((Names_t{"a", "b", "c"}), Names(log));

    log.clear();
    Recorder firstRefuses(log, "f", 0);
    CModifiedNotifier m(6);
    m.AddModifiedListener(&firstRefuses);
    m.AddModifiedListener(&a);
    EXPECT_EQ(0, m.NotifyListeners());
    EXPECT_EQ((Names_t{"f"}), Names(log));
}

// The list changing under a pass: (what the listener named "during" does while
// it is told, which listeners the pass reaches, who the next pass reaches).
TEST(ModifiedNotifier, ListenersChangingTheListWhileTold)
{
    struct Case {
        const char* what;
        std::function<void(CModifiedNotifier&, Recorder& a, Recorder& b, Recorder& c, Recorder& d)> act;
        Names_t thisPass;
        Names_t nextPass;
    };
    const std::vector<Case> cases = {
        {"b registers d", [](CModifiedNotifier& n, Recorder&, Recorder&, Recorder&, Recorder& d) {
             n.AddModifiedListener(&d); },
         {"a", "b", "c", "d"}, {"a", "b", "c", "d"}},
        {"b registers a again", [](CModifiedNotifier& n, Recorder& a, Recorder&, Recorder&, Recorder&) {
             n.AddModifiedListener(&a); },
         {"a", "b", "c"}, {"a", "b", "c"}},
        {"b removes itself", [](CModifiedNotifier& n, Recorder&, Recorder& b, Recorder&, Recorder&) {
             n.RemoveModifiedListener(&b); },
         {"a", "b", "c"}, {"a", "c"}},
        {"b removes a", [](CModifiedNotifier& n, Recorder& a, Recorder&, Recorder&, Recorder&) {
             n.RemoveModifiedListener(&a); },
         {"a", "b", "c"}, {"b", "c"}},
        {"b removes a and itself", [](CModifiedNotifier& n, Recorder& a, Recorder& b, Recorder&, Recorder&) {
             n.RemoveModifiedListener(&a);
             n.RemoveModifiedListener(&b); },
         {"a", "b", "c"}, {"c"}},
        {"b removes c", [](CModifiedNotifier& n, Recorder&, Recorder&, Recorder& c, Recorder&) {
             n.RemoveModifiedListener(&c); },
         {"a", "b"}, {"a", "b"}},
        {"b removes and re-adds itself", [](CModifiedNotifier& n, Recorder&, Recorder& b, Recorder&, Recorder&) {
             n.RemoveModifiedListener(&b);
             n.AddModifiedListener(&b); },
         {"a", "b", "c"}, {"a", "c", "b"}},
    };
    for (const Case& k : cases) {
        SCOPED_TRACE(k.what);
        std::vector<Call> log;
        Recorder a(log, "a"), b(log, "b"), c(log, "c"), d(log, "d");
        CModifiedNotifier n(9);
        n.AddModifiedListener(&a);
        n.AddModifiedListener(&b);
        n.AddModifiedListener(&c);
        b.m_onCall = [&] { k.act(n, a, b, c, d); };
        EXPECT_EQ(1, n.NotifyListeners());
        EXPECT_EQ(k.thisPass, Names(log));
        log.clear();
        EXPECT_EQ(1, n.NotifyListeners());
        EXPECT_EQ(k.nextPass, Names(log));
    }
}

}  // namespace
