// The combination and function manager dialogs on real windows.
#include <gtest/gtest.h>

#include <sstream>
#include <string>
#include <vector>

#include "CCombiColumnConfig.h"
#include "CFunctionManagerConfig.h"
#include "MfcTestHost.h"
#include "resource.h"

using qotest::Answering;
using qotest::Dialog;
using qotest::DialogScript;
using CPart = CFunctionManager::CCombiPart;
using CFunction = CFunctionManager::CFunction;
using Texts = std::vector<std::string>;

namespace {

CFunction Combination(long id, const char* name, std::vector<CPart> parts)
{
    CFunction f(id, name);
    return f.SetCombination(parts), f;
}

// "No function" is 0; Filiale is used by a combination.
CFunctionManager Sample()
{
    CFunctionManager m;
    for (CFunction f : {CFunction(0, "(keine)"), CFunction(1, "Name"), CFunction(2, "Vorname"), CFunction(3, "PLZ"),
                        CFunction(4, "Ort"), CFunction(30000, "Feld aus Datei"), CFunction(10000, "Kunde"),
                        CFunction(10001, "Filiale"),
                        Combination(20000, "Vorname Name", {CPart(2, "", false), CPart(1, " ", false)}),
                        Combination(20001, "Filiale-PLZ", {CPart(10001, "", false), CPart(3, "-", true)})})
        m.AddFunction(f);
    m.SetNextPredefinedId(5);
    m.SetNextUserdefinedId(10002);
    m.SetNextCombiId(20002);
    return m;
}

// Every function as "id name" with its parts as "|separator|id|flag".
std::string Dump(const CFunctionManager& m)
{
    std::ostringstream out;
    for (int i = 0; i < m.GetNumFunctions(); ++i) {
        CFunction f(0, "");
        m.GetFunctionAt(i, f);
        out << f.GetId() << ' ' << (const char*)f.GetName();
        for (const CPart& p : f.GetCombination())
            out << '|' << (const char*)p.GetSeparator() << '|' << p.GetFunctionId() << '|' << p.GetAlwaysSeparate();
        out << '\n';
    }
    return out.str();
}

std::string Function(const CFunctionManager& m, long id)
{
    CFunction f(0, "");
    return m.GetFunction(id, f) ? std::string(f.GetName()) : std::string("-");
}

// A function chosen and the answer to the separator question (none for the first part).
struct Part {
    const char* function;
    const char* separator;
    bool always;
};

Texts Rows(Dialog& d)
{
    CListCtrl* pList = static_cast<CListCtrl*>(CWnd::FromHandle(d.Item(IDC_COMBI_PARTS)));
    Texts rows;
    for (int r = 0; r < pList->GetItemCount(); ++r)
        rows.push_back(std::string(pList->GetItemText(r, 0)) + "/" + (const char*)pList->GetItemText(r, 1) + "/" +
                       (const char*)pList->GetItemText(r, 2));  // separator/function/flag
    return rows;
}

// The combination dialog's script (adding `parts`, then `then`) and the answers
// to its separator questions, appended to `scripts`.
std::vector<DialogScript> Composing(const std::vector<Part>& parts, std::function<void(Dialog&)> then,
                                    std::vector<DialogScript> scripts = {})
{
    scripts.push_back([parts, then](Dialog& d) {
        const size_t start = Rows(d).size();
        for (size_t i = 0; i < parts.size(); ++i) {
            d.SelectText(IDC_COMBI_FUNCTIONS, parts[i].function);
            d.Press(IDC_COMBI_ADD);
            EXPECT_TRUE(qotest::WaitFor([&] { return Rows(d).size() == start + i + 1; }, 3000)) << parts[i].function;
        }
        then(d);
    });
    for (const Part& part : parts) {
        if (part.separator == nullptr) continue;
        scripts.push_back([part](Dialog& p) {
            EXPECT_EQ("Trenner definieren", p.Title());
            p.SetText(IDC_PREFIX_SEPARATOR, part.separator);
            p.Check(IDC_PREFIX_ALWAYS, part.always);
            p.Press(IDOK);
        });
    }
    return scripts;
}

DialogScript Naming(const std::string& name)
{
    return [name](Dialog& d) {
        EXPECT_EQ("Bezeichnung eingeben", d.Text(IDC_INPUT_PROMPT));
        d.SetText(IDC_INPUT_VALUE, name);
        d.Press(IDOK);
    };
}

}  // namespace

TEST(CombiColumnConfig, ComposesCombinationFromChosenFunctionsAndSeparators)
{
    const CFunctionManager original = Sample();
    CCombiColumnConfig dlg(original, false);
    bool cancelled = false;
    std::vector<DialogScript> scripts =
        Composing({{"PLZ", nullptr, false}, {"Ort", " ", true}, {"Filiale", " & ", false}}, [&](Dialog& d) {
            // Neither combinations nor "no function" (0) can be parts.
            EXPECT_EQ((Texts{"Name", "Vorname", "PLZ", "Ort", "Kunde", "Filiale", "Feld aus Datei"}),
                      d.ListItems(IDC_COMBI_FUNCTIONS));
            EXPECT_EQ((Texts{"/PLZ/false", " /Ort/true", " & /Filiale/false"}), Rows(d));
            EXPECT_EQ("PLZ Ort & Filiale", d.Text(IDC_COMBI_NAME));
            // Cancelling the separator question adds nothing.
            d.SelectText(IDC_COMBI_FUNCTIONS, "Kunde");
            d.Press(IDC_COMBI_ADD);
            EXPECT_TRUE(qotest::WaitFor([&] { return cancelled; }, 3000));
            qotest::PumpFor(100);
            EXPECT_EQ(3u, Rows(d).size());
            qotest::CaptureWindow(d.Hwnd(), qotest::CapturePath("combination-4040.png").c_str());
            d.Press(IDOK);
        });
    scripts.push_back([&cancelled](Dialog& p) {
        p.SetText(IDC_PREFIX_SEPARATOR, " - ");
        p.Check(IDC_PREFIX_ALWAYS, true);
        qotest::CaptureWindow(p.Hwnd(), qotest::CapturePath("prefix-4041.png").c_str());
        p.Press(IDCANCEL);
        cancelled = true;
    });
    Answering(scripts, [&] { EXPECT_EQ(IDOK, dlg.DoModal()); }, 8000);

    std::string expected = Dump(Sample());
    expected.insert(expected.find("30000 "), "20002 PLZ Ort & Filiale||3|0| |4|1| & |10001|0\n");
    EXPECT_EQ(expected, Dump(dlg.GetFunctionManager()));
    EXPECT_EQ(Dump(Sample()), Dump(original)) << "the caller's manager is not touched";
}

TEST(CombiColumnConfig, RefusesShortAndDefinedCombinationsAndKeepsTheParts)
{
    // The manager holds the combinations 20000-20002; a new one takes the
    // first id from the next one on that is in the range and free.
    const struct {
        std::vector<Part> parts;
        const char* message;  // null: accepted as 20003
        long next, max;
    } cases[] = {
        {{{"Name", nullptr, false}}, "Eine Kombination muss aus mindestens 2 Einzelfeldern bestehen!", 20003, 29999},
        {{{"Vorname", nullptr, false}, {"Name", " ", true}}, "Diese Kombination wurde schon definiert!", 20003, 29999},  // only the flag differs
        {{{"Ort", nullptr, false}, {"Name", ": ", false}}, nullptr, 19000, 29999},  // next below the range
        {{{"Ort", nullptr, false}, {"Name", ": ", false}}, nullptr, 20001, 29999},  // next held
        {{{"Ort", nullptr, false}, {"Name", ": ", false}}, "F\xFCr weitere Kombinationen ist keine Nummer mehr frei!",
         20001, 20002},
    };
    for (const auto& c : cases) {
        const Part& last = c.parts.back();
        SCOPED_TRACE(last.function + std::string("/") + (last.separator != nullptr ? last.separator : ""));
        CFunctionManager start = Sample();
        CFunction ortPlz = Combination(20002, "OrtxPLZ", {CPart(4, "", false), CPart(3, "x", false)});
        start.AddFunction(ortPlz);
        start.SetNextCombiId(c.next);
        start.SetMaxCombiId(c.max);
        CCombiColumnConfig dlg(start, false);
        std::string message;
        std::vector<DialogScript> scripts = Composing(c.parts, [&](Dialog& d) {
            const Texts before = Rows(d);
            d.Press(IDOK);
            if (c.message == nullptr) return;
            EXPECT_TRUE(qotest::WaitFor([&] { return !message.empty(); }, 3000));
            EXPECT_TRUE(::IsWindowVisible(d.Hwnd())) << "the dialog stays open";
            EXPECT_EQ(before, Rows(d));
            d.Press(IDCANCEL);
        });
        if (c.message != nullptr) scripts.push_back(qotest::Reading(message));
        const bool accepted = c.message == nullptr;
        Answering(scripts, [&] { EXPECT_EQ(accepted ? IDOK : IDCANCEL, dlg.DoModal()); }, 8000);
        EXPECT_EQ(accepted ? "" : c.message, message);
        EXPECT_EQ(start.GetNumFunctions() + (accepted ? 1 : 0), dlg.GetFunctionManager().GetNumFunctions());
        if (accepted) {
            EXPECT_EQ(std::string(c.parts[0].function) + last.separator + last.function,
                      Function(dlg.GetFunctionManager(), 20003));
        }
    }
}

TEST(FunctionManagerConfig, UsedFunctionsStayAndChangesReachTheCallerAfterOk)
{
    // New "Region", Kunde renamed, the combination Filiale-PLZ deleted, then
    // Filiale - no longer used by then - deleted too.
    CFunctionManagerConfig dlg(Sample(), true);
    Answering({[&](Dialog& d) {
                   EXPECT_EQ((Texts{"Kunde", "Filiale"}), d.ListItems(IDC_FUNC_USERDEFINED));
                   d.SelectText(IDC_FUNC_USERDEFINED, "Filiale");  // part of Filiale-PLZ
                   EXPECT_FALSE(d.IsEnabled(IDC_FUNC_USER_EDIT) || d.IsEnabled(IDC_FUNC_USER_DELETE));
                   d.SelectText(IDC_FUNC_USERDEFINED, "Kunde");
                   EXPECT_TRUE(d.IsEnabled(IDC_FUNC_USER_EDIT) && d.IsEnabled(IDC_FUNC_USER_DELETE));
                   qotest::CaptureWindow(d.Hwnd(), qotest::CapturePath("functions-4039.png").c_str());
                   d.Press(IDC_FUNC_USER_NEW);
                   qotest::WaitFor([&] { return d.ListItems(IDC_FUNC_USERDEFINED).size() == 3; }, 3000);
                   d.SelectText(IDC_FUNC_USERDEFINED, "Kunde");
                   d.Press(IDC_FUNC_USER_EDIT);
                   qotest::WaitFor([&] { return d.Selection(IDC_FUNC_USERDEFINED) < 0; }, 3000);
                   d.SelectText(IDC_FUNC_COMBINATIONS, "Filiale-PLZ");
                   d.Press(IDC_FUNC_COMBI_DELETE);
                   qotest::PumpFor(100);
                   d.SelectText(IDC_FUNC_USERDEFINED, "Filiale");
                   d.Press(IDC_FUNC_USER_DELETE);
                   qotest::PumpFor(100);
                   EXPECT_EQ((Texts{"Stammkunde", "Region"}), d.ListItems(IDC_FUNC_USERDEFINED));
                   d.Press(IDOK);
               },
               Naming("Region"), Naming("Stammkunde")},
              [&] { EXPECT_EQ(IDOK, dlg.DoModal()); });
    CFunctionManager manager = dlg.GetFunctionManager();
    EXPECT_EQ("Stammkunde|Region|-|-", Function(manager, 10000) + "|" + Function(manager, 10002) + "|" +
                                           Function(manager, 10001) + "|" + Function(manager, 20001));
    EXPECT_TRUE(manager.IsDeleted("filiale"));
    EXPECT_EQ(10003, manager.GetNextUserdefinedId(false));
}

TEST(FunctionManagerConfig, NamesAreRefusedOrGivenTheFirstFreeId)
{
    const char* const kFull = "F\xFCr weitere benutzerdefinierte Funktionalit\xE4ten ist keine Nummer mehr frei!";
    const struct {
        const char* typed;
        const char* message;  // null: accepted with the id `expected`
        long next, max, expected;
        bool deleteKunde;
    } cases[] = {
        {"  \t", "Bitte geben Sie eine Bezeichnung ein!", 10002, 19999, 0, false},
        {" Filiale ", "Diese Bezeichnung ist schon vergeben!", 10002, 19999, 0, false},
        {"Region", kFull, 10002, 10001, 0, false},
        {"KUNDE", nullptr, 10002, 19999, 10000, true},  // deleted and defined again: its old id
        {"Region", nullptr, 10000, 19999, 10002, false},  // the host's next id is held
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.typed);
        CFunctionManager m = Sample();
        m.SetNextUserdefinedId(c.next);
        m.SetMaxUserdefinedId(c.max);
        CFunctionManagerConfig dlg(m, true);
        std::string message;
        DialogScript main = [&](Dialog& d) {
            if (c.deleteKunde) d.SelectText(IDC_FUNC_USERDEFINED, "Kunde"), d.Press(IDC_FUNC_USER_DELETE);
            const size_t rows = c.deleteKunde ? 2 : 3;
            d.Press(IDC_FUNC_USER_NEW);
            EXPECT_TRUE(qotest::WaitFor(
                [&] { return c.message ? !message.empty() : d.ListItems(IDC_FUNC_USERDEFINED).size() == rows; }, 3000));
            d.Press(IDOK);
        };
        std::vector<DialogScript> scripts = {main, Naming(c.typed)};
        if (c.message != nullptr) scripts.push_back(qotest::Reading(message));
        Answering(scripts, [&] { EXPECT_EQ(IDOK, dlg.DoModal()); });
        CFunctionManager result = dlg.GetFunctionManager();
        if (c.message != nullptr) {
            EXPECT_EQ(c.message, message);
            EXPECT_EQ(Dump(m), Dump(result)) << "nothing applied";
            EXPECT_EQ(c.next, result.GetNextUserdefinedId(false));
        } else {
            EXPECT_EQ(c.typed, Function(result, c.expected));
            EXPECT_EQ("Filiale", Function(result, 10001));
        }
    }
}

TEST(FunctionManagerConfig, CombinationsEditedThroughTheCombinationDialog)
{
    CFunctionManagerConfig dlg(Sample(), true);
    std::vector<DialogScript> scripts = {[](Dialog& d) {
        d.SelectText(IDC_FUNC_COMBINATIONS, "Vorname Name");
        d.Press(IDC_FUNC_COMBI_EDIT);
        qotest::WaitFor([&] { return d.ListItems(IDC_FUNC_COMBINATIONS)[0] != "Vorname Name"; }, 5000);
        d.Press(IDOK);
    }};
    // Editing: the parts are there; the second's place is taken by a new one with the flag.
    scripts = Composing({{"Name", ", ", true}},
                        [](Dialog& c) {
                            EXPECT_EQ((Texts{"/Vorname/false", " /Name/false", ", /Name/true"}), Rows(c));
                            RECT rc = {LVIR_LABEL, 0, 0, 0};  // a real click on the second row
                            c.Send(IDC_COMBI_PARTS, LVM_GETITEMRECT, 1, reinterpret_cast<LPARAM>(&rc));
                            qotest::Click(c.Item(IDC_COMBI_PARTS), rc.left + 4, (rc.top + rc.bottom) / 2);
                            qotest::PumpFor(100);
                            c.Press(IDC_COMBI_DELETE);
                            qotest::PumpFor(200);
                            c.Press(IDOK);
                        },
                        std::move(scripts));
    Answering(scripts, [&] { EXPECT_EQ(IDOK, dlg.DoModal()); }, 12000);

    const CFunctionManager result = dlg.GetFunctionManager();
    EXPECT_EQ("Vorname, Name", Function(result, 20000));
    EXPECT_EQ(Sample().GetNumFunctions(), result.GetNumFunctions());
}
