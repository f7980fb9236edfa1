// The function dialogs on real windows: combinations composed by choosing
// functions and answering the separator question, the function manager
// dialog's lists and buttons, names typed into the input dialog, refusals
// with their messages, and the manager the caller gets back after OK or keeps
// after Cancel.
#include <gtest/gtest.h>

#include <sstream>
#include <string>
#include <vector>

#include "CCombiColumnConfig.h"
#include "CFuncToNamesDlg.h"
#include "CFunctionManagerConfig.h"
#include "MfcTestHost.h"
#include "resource.h"

using qotest::Answering;
using qotest::Dialog;
using qotest::DialogScript;
using CPart = CFunctionManager::CCombiPart;
using CFunction = CFunctionManager::CFunction;

namespace {

const char* const kTooShort = "Eine Kombination muss aus mindestens 2 Einzelfeldern bestehen!";
const char* const kExists = "Diese Kombination wurde schon definiert!";
const char* const kInUse = "Diese Bezeichnung ist schon vergeben!";
const char* const kEmpty = "Bitte geben Sie eine Bezeichnung ein!";

// A project's functions: predefined ones with "no function" as 0, a file
// function, two user-defined ones (Filiale used by a combination) and two
// combinations.
CFunctionManager Sample()
{
    CFunctionManager m;
    const char* predefined[] = {"(keine)", "Name", "Vorname", "PLZ", "Ort"};
    for (long id = 0; id < 5; ++id) {
        CFunction f(id, predefined[id]);
        m.AddFunction(f);
    }
    CFunction file(30000, "Feld aus Datei"), kunde(10000, "Kunde"), filiale(10001, "Filiale");
    m.AddFunction(file);
    m.AddFunction(kunde);
    m.AddFunction(filiale);
    CFunction fullName(20000, "Vorname Name");
    fullName.SetCombination({CPart(2, "", false), CPart(1, " ", false)});
    m.AddFunction(fullName);
    CFunction branch(20001, "Filiale-PLZ");
    branch.SetCombination({CPart(10001, "", false), CPart(3, "-", true)});
    m.AddFunction(branch);
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

// One part as the user composes it: the function chosen and the answer to the
// separator question (not asked for the first part).
struct Part {
    const char* function;
    const char* separator;
    bool always;
};

// The rows of the part list: separator, function, "true"/"false".
std::vector<std::string> Rows(Dialog& d)
{
    CListCtrl* pList = static_cast<CListCtrl*>(CWnd::FromHandle(d.Item(IDC_COMBI_PARTS)));
    std::vector<std::string> rows;
    for (int r = 0; r < pList->GetItemCount(); ++r)
        rows.push_back(std::string(pList->GetItemText(r, 0)) + "/" + (const char*)pList->GetItemText(r, 1) + "/" +
                       (const char*)pList->GetItemText(r, 2));
    return rows;
}

int RowCount(Dialog& d)
{
    return static_cast<int>(d.Send(IDC_COMBI_PARTS, LVM_GETITEMCOUNT));
}

// A real click on a row of the part list.
void ClickRow(Dialog& d, int row)
{
    RECT rc = {LVIR_LABEL, 0, 0, 0};
    d.Send(IDC_COMBI_PARTS, LVM_GETITEMRECT, row, reinterpret_cast<LPARAM>(&rc));
    qotest::Click(d.Item(IDC_COMBI_PARTS), rc.left + 4, (rc.top + rc.bottom) / 2);
    qotest::PumpFor(100);
}

// Scripts that compose `parts` in the combination dialog: the dialog's own
// script (adding the parts, then running `then`) and one answer to each
// separator question.
std::vector<DialogScript> Composing(const std::vector<Part>& parts, std::function<void(Dialog&)> then)
{
    std::vector<DialogScript> scripts;
    scripts.push_back([parts, then](Dialog& d) {
        const int start = RowCount(d);
        for (size_t i = 0; i < parts.size(); ++i) {
            d.SelectText(IDC_COMBI_FUNCTIONS, parts[i].function);
            d.Press(IDC_COMBI_ADD);
            EXPECT_TRUE(qotest::WaitFor([&] { return RowCount(d) == start + static_cast<int>(i) + 1; }, 3000))
                << parts[i].function;
        }
        then(d);
    });
    for (size_t i = 0; i < parts.size(); ++i) {
        if (i == 0 && parts[0].separator == nullptr) continue;  // the first part of a new combination
        const Part part = parts[i];
        scripts.push_back([part](Dialog& p) {
            EXPECT_EQ("Trenner definieren", p.Title());
            p.SetText(IDC_PREFIX_SEPARATOR, part.separator);
            p.Check(IDC_PREFIX_ALWAYS, part.always);
            p.Press(IDOK);
        });
    }
    return scripts;
}

// Presses OK in a dialog that must refuse with a message box, which a later
// script answers into `message`; then closes the dialog with Cancel.
void PressOkRefused(Dialog& d, const std::string& message, const std::string* seen)
{
    d.Press(IDOK);
    EXPECT_TRUE(qotest::WaitFor([&] { return !seen->empty(); }, 3000));
    EXPECT_EQ(message, *seen);
    EXPECT_TRUE(::IsWindowVisible(d.Hwnd())) << "the dialog stays open";
    d.Press(IDCANCEL);
}

DialogScript Reading(std::string& into)
{
    return [&into](Dialog& box) {
        into = box.MessageText();
        box.Press(IDOK);
    };
}

}  // namespace

// ---------------------------------------------------------------------------
// Combination definition

TEST(CombiColumnConfig, ComposesCombinationFromChosenFunctionsAndSeparators)
{
    const CFunctionManager original = Sample();
    CCombiColumnConfig dlg(original, false);
    std::vector<Part> parts = {{"PLZ", nullptr, false}, {"Ort", " ", true}, {"Filiale", " & ", false}};
    bool cancelled = false;
    std::vector<DialogScript> scripts = Composing(parts, [&cancelled](Dialog& d) {
        // Neither combinations nor "no function" (0) can be parts.
        EXPECT_EQ((std::vector<std::string>{"Name", "Vorname", "PLZ", "Ort", "Kunde", "Filiale", "Feld aus Datei"}),
                  d.ListItems(IDC_COMBI_FUNCTIONS));
        CListCtrl* pList = static_cast<CListCtrl*>(CWnd::FromHandle(d.Item(IDC_COMBI_PARTS)));
        EXPECT_EQ("Trenner|Funktionalit\xE4t|immer trennen", std::string(qotest::ColumnTitle(*pList, 0)) + "|" +
                                                                (const char*)qotest::ColumnTitle(*pList, 1) + "|" +
                                                                (const char*)qotest::ColumnTitle(*pList, 2));
        EXPECT_EQ((std::vector<std::string>{"/PLZ/false", " /Ort/true", " & /Filiale/false"}), Rows(d));
        EXPECT_EQ("PLZ Ort & Filiale", d.Text(IDC_COMBI_NAME));
        EXPECT_NE(0, ::GetWindowLongA(d.Item(IDC_COMBI_NAME), GWL_STYLE) & SS_NOPREFIX);
        // A double click adds too; cancelling its separator question adds nothing.
        d.SelectText(IDC_COMBI_FUNCTIONS, "Kunde");
        RECT rc;
        d.Send(IDC_COMBI_FUNCTIONS, LB_GETITEMRECT, d.Selection(IDC_COMBI_FUNCTIONS), reinterpret_cast<LPARAM>(&rc));
        qotest::DoubleClick(d.Item(IDC_COMBI_FUNCTIONS), rc.left + 5, (rc.top + rc.bottom) / 2);
        EXPECT_TRUE(qotest::WaitFor([&] { return cancelled; }, 3000));
        qotest::PumpFor(100);
        EXPECT_EQ(3, RowCount(d));
        ClickRow(d, 1);
        EXPECT_TRUE(d.IsEnabled(IDC_COMBI_DELETE));
        qotest::CaptureWindow(d.Hwnd(), qotest::CapturePath("combination-4040.png").c_str());
        d.Press(IDOK);
    });
    // The script for the separator question that the double click opens.
    scripts.push_back([&cancelled](Dialog& p) {
        p.Press(IDCANCEL);
        cancelled = true;
    });
    Answering(scripts, [&] { EXPECT_EQ(IDOK, dlg.DoModal()); }, 8000);

    const std::string made = "20002 PLZ Ort & Filiale||3|0| |4|1| & |10001|0\n";
    std::string expected = Dump(Sample());
    expected.insert(expected.find("30000 "), made);
    EXPECT_EQ(expected, Dump(dlg.GetFunctionManager()));
    EXPECT_EQ(Dump(Sample()), Dump(original)) << "the caller's manager is not touched";
}

TEST(CombiColumnConfig, RefusesShortAndDefinedCombinationsAndKeepsTheParts)
{
    // The manager holds the combinations 20000-20002; a new one takes the
    // first id from the next one on that is in the range and free.
    const char* const kFull = "F\xFCr weitere Kombinationen ist keine Nummer mehr frei!";
    struct Case {
        std::vector<Part> parts;
        const char* message;  // null: accepted as 20003
        long next, max;
    } cases[] = {
        {{{"Name", nullptr, false}}, kTooShort, 20003, 29999},
        {{{"Vorname", nullptr, false}, {"Name", " ", true}}, kExists, 20003, 29999},  // only the flag differs
        {{{"Filiale", nullptr, false}, {"PLZ", "-", true}}, kExists, 20003, 29999},
        {{{"Ort", nullptr, false}, {"PLZ", "x", false}}, kExists, 20003, 29999},
        {{{"Vorname", nullptr, false}, {"Name", "  ", false}}, nullptr, 20003, 29999},
        {{{"Ort", nullptr, false}, {"PLZ", "X", false}}, nullptr, 20003, 29999},  // differs in case only
        {{{"Ort", nullptr, false}, {"Name", ": ", false}}, nullptr, 19000, 29999},  // next below the range
        {{{"Ort", nullptr, false}, {"Name", ": ", false}}, nullptr, 20001, 29999},  // next held
        {{{"Ort", nullptr, false}, {"Name", ": ", false}}, kFull, 20001, 20002},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.parts.back().function + std::string("/") +
                     (c.parts.back().separator != nullptr ? c.parts.back().separator : ""));
        CFunctionManager start = Sample();
        CFunction existing(20002, "Ort" "xPLZ");
        existing.SetCombination({CPart(4, "", false), CPart(3, "x", false)});
        start.AddFunction(existing);
        start.SetNextCombiId(c.next);
        start.SetMaxCombiId(c.max);
        CCombiColumnConfig dlg(start, false);
        std::string message;
        std::vector<DialogScript> scripts = Composing(c.parts, [&](Dialog& d) {
            if (c.message == nullptr) {
                d.Press(IDOK);
                return;
            }
            const std::vector<std::string> before = Rows(d);
            PressOkRefused(d, c.message, &message);
            EXPECT_EQ(before, Rows(d));
        });
        if (c.message != nullptr) scripts.push_back(Reading(message));
        const bool accepted = c.message == nullptr;
        Answering(scripts, [&] { EXPECT_EQ(accepted ? IDOK : IDCANCEL, dlg.DoModal()); }, 8000);
        EXPECT_EQ(start.GetNumFunctions() + (accepted ? 1 : 0), dlg.GetFunctionManager().GetNumFunctions());
        if (accepted) EXPECT_EQ(std::string(c.parts[0].function) + c.parts[1].separator + c.parts[1].function,
                                Function(dlg.GetFunctionManager(), 20003));
    }
}

TEST(CombiColumnConfig, EditingChangesPartsInPlaceAndMayKeepThem)
{
    // Delete the first of three parts: the former second keeps its separator;
    // add another. Then the unchanged combination and a change of a flag
    // alone are accepted, since the edited combination is not another one.
    CFunctionManager m = Sample();
    CFunction three(20002, "PLZ Ort, Kunde");
    three.SetCombination({CPart(3, "", false), CPart(4, " ", false), CPart(10000, ", ", false)});
    m.AddFunction(three);

    CCombiColumnConfig edit(m, true);
    edit.SetCombination(three.GetCombination(), 20002);
    Answering(Composing({{"Name", " / ", true}},
                        [](Dialog& d) {
                            ClickRow(d, 0);
                            d.Press(IDC_COMBI_DELETE);
                            qotest::PumpFor(200);
                            EXPECT_EQ((std::vector<std::string>{" /Ort/false", ", /Kunde/false", " / /Name/true"}),
                                      Rows(d));
                            EXPECT_EQ(" Ort, Kunde / Name", d.Text(IDC_COMBI_NAME));
                            d.Press(IDOK);
                        }),
              [&] { EXPECT_EQ(IDOK, edit.DoModal()); }, 8000);
    EXPECT_EQ(CString(" Ort, Kunde / Name"), edit.GetCombinationName());
    EXPECT_EQ(3u, edit.GetCombination().size());
    EXPECT_EQ(Dump(m), Dump(edit.GetFunctionManager())) << "editing adds nothing to the manager";

    CCombiColumnConfig same(m, true);
    same.SetCombination(three.GetCombination(), 20002);
    Answering({[](Dialog& d) { d.Press(IDOK); }}, [&] { EXPECT_EQ(IDOK, same.DoModal()); });

    // A part whose function the manager does not know has no row; deleting
    // the first row deletes the part that row shows.
    CCombiColumnConfig unknown(m, true);
    unknown.SetCombination({CPart(77, "", false), CPart(3, " ", false), CPart(4, "-", false)}, 20002);
    Answering({[](Dialog& d) {
                  EXPECT_EQ((std::vector<std::string>{" /PLZ/false", "-/Ort/false"}), Rows(d));
                  EXPECT_EQ(" PLZ-Ort", d.Text(IDC_COMBI_NAME));
                  ClickRow(d, 0);
                  d.Press(IDC_COMBI_DELETE);
                  qotest::PumpFor(200);
                  EXPECT_EQ((std::vector<std::string>{"-/Ort/false"}), Rows(d));
                  d.Press(IDOK);
              }},
              [&] { EXPECT_EQ(IDOK, unknown.DoModal()); });
    std::vector<CPart> kept = unknown.GetCombination();
    ASSERT_EQ(2u, kept.size());
    EXPECT_EQ(77, kept[0].GetFunctionId());
    EXPECT_EQ(4, kept[1].GetFunctionId());
}

// ---------------------------------------------------------------------------
// Function manager dialog

TEST(FunctionManagerConfig, ListsTheGroupsAndEnablesEditingOnlyForUnusedFunctions)
{
    for (bool editing : {true, false}) {
        SCOPED_TRACE(editing);
        CFunctionManagerConfig dlg(Sample(), editing);
        Answering({[&](Dialog& d) {
                      EXPECT_EQ("Definitionen bearbeiten...", d.Title());
                      EXPECT_EQ((std::vector<std::string>{"(keine)", "Name", "Vorname", "PLZ", "Ort", "Feld aus Datei"}),
                                d.ListItems(IDC_FUNC_PREDEFINED));
                      EXPECT_EQ((std::vector<std::string>{"Kunde", "Filiale"}), d.ListItems(IDC_FUNC_USERDEFINED));
                      EXPECT_EQ((std::vector<std::string>{"Vorname Name", "Filiale-PLZ"}),
                                d.ListItems(IDC_FUNC_COMBINATIONS));
                      EXPECT_EQ(editing, d.IsEnabled(IDC_FUNC_USER_NEW));
                      EXPECT_FALSE(d.IsEnabled(IDC_FUNC_USER_EDIT));
                      EXPECT_FALSE(d.IsEnabled(IDC_FUNC_COMBI_EDIT));
                      EXPECT_FALSE(d.IsEnabled(IDC_FUNC_COMBI_DELETE));

                      d.SelectText(IDC_FUNC_USERDEFINED, "Filiale");  // part of Filiale-PLZ
                      EXPECT_FALSE(d.IsEnabled(IDC_FUNC_USER_EDIT));
                      EXPECT_FALSE(d.IsEnabled(IDC_FUNC_USER_DELETE));
                      d.SelectText(IDC_FUNC_USERDEFINED, "Kunde");
                      EXPECT_TRUE(d.IsEnabled(IDC_FUNC_USER_EDIT));
                      EXPECT_TRUE(d.IsEnabled(IDC_FUNC_USER_DELETE));
                      EXPECT_EQ(editing, d.IsEnabled(IDC_FUNC_USER_NEW));
                      d.SelectText(IDC_FUNC_COMBINATIONS, "Filiale-PLZ");
                      EXPECT_TRUE(d.IsEnabled(IDC_FUNC_COMBI_EDIT));
                      EXPECT_TRUE(d.IsEnabled(IDC_FUNC_COMBI_DELETE));
                      if (editing) qotest::CaptureWindow(d.Hwnd(), qotest::CapturePath("functions-4039.png").c_str());
                      d.Press(IDOK);
                  }},
                  [&] { EXPECT_EQ(IDOK, dlg.DoModal()); });
    }
}

// Types a name into the input dialog and confirms it.
DialogScript Naming(const std::string& name, std::string* proposed = nullptr)
{
    return [name, proposed](Dialog& d) {
        EXPECT_EQ("Eingabe", d.Title());
        EXPECT_EQ("Bezeichnung eingeben", d.Text(IDC_INPUT_PROMPT));
        if (proposed != nullptr) *proposed = d.Text(IDC_INPUT_VALUE);
        d.SetText(IDC_INPUT_VALUE, name);
        d.Press(IDOK);
    };
}

TEST(FunctionManagerConfig, ChangesReachTheCallerOnlyAfterOk)
{
    // New "Region", Kunde renamed, the combination Filiale-PLZ deleted, then
    // Filiale - no longer used by then - deleted too.
    for (int end : {IDOK, IDCANCEL}) {
        CFunctionManager manager = Sample();
        std::string proposed;
        CFunctionManagerConfig dlg(manager, true);
        Answering({[&](Dialog& d) {
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
                       EXPECT_EQ((std::vector<std::string>{"Stammkunde", "Region"}), d.ListItems(IDC_FUNC_USERDEFINED));
                       EXPECT_EQ((std::vector<std::string>{"Vorname Name"}), d.ListItems(IDC_FUNC_COMBINATIONS));
                       d.Press(end);
                   },
                   Naming("Region"), Naming("Stammkunde", &proposed)},
                  [&] { EXPECT_EQ(end, dlg.DoModal()); });
        EXPECT_EQ("Kunde", proposed);
        if (end == IDOK) manager = dlg.GetFunctionManager();
        if (end == IDCANCEL) {
            EXPECT_EQ(Dump(Sample()), Dump(manager));
            continue;
        }
        EXPECT_EQ("Stammkunde", Function(manager, 10000));
        EXPECT_EQ("Region", Function(manager, 10002));
        EXPECT_EQ("-", Function(manager, 10001));
        EXPECT_EQ("-", Function(manager, 20001));
        EXPECT_TRUE(manager.IsDeleted("filiale"));
        EXPECT_EQ(10003, manager.GetNextUserdefinedId(false));
    }
}

TEST(FunctionManagerConfig, RefusedNamesChangeNothing)
{
    struct Case {
        int button;         // new or rename (of Kunde)
        const char* typed;
        const char* message;
    } cases[] = {
        {IDC_FUNC_USER_NEW, "kunde", kInUse},   {IDC_FUNC_USER_NEW, "ORT", kInUse},
        {IDC_FUNC_USER_NEW, "  \t", kEmpty},    {IDC_FUNC_USER_NEW, " Filiale ", kInUse},
        {IDC_FUNC_USER_EDIT, "KUNDE", kInUse},  {IDC_FUNC_USER_EDIT, "Kunde", kInUse},
        {IDC_FUNC_USER_EDIT, "", kEmpty},       {IDC_FUNC_USER_EDIT, "vorname name", kInUse},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.typed);
        CFunctionManagerConfig dlg(Sample(), true);
        std::string message;
        Answering({[&](Dialog& d) {
                       if (c.button == IDC_FUNC_USER_EDIT) d.SelectText(IDC_FUNC_USERDEFINED, "Kunde");
                       d.Press(c.button);
                       EXPECT_TRUE(qotest::WaitFor([&] { return !message.empty(); }, 3000));
                       EXPECT_EQ((std::vector<std::string>{"Kunde", "Filiale"}), d.ListItems(IDC_FUNC_USERDEFINED));
                       d.Press(IDOK);
                   },
                   Naming(c.typed), Reading(message)},
                  [&] { EXPECT_EQ(IDOK, dlg.DoModal()); });
        EXPECT_EQ(c.message, message);
        CFunctionManager expected = Sample();
        EXPECT_EQ(Dump(expected), Dump(dlg.GetFunctionManager()));
        EXPECT_EQ(10002, dlg.GetFunctionManager().GetNextUserdefinedId(false));
    }
}

TEST(FunctionManagerConfig, NewFunctionIdsRestoreDeletedOnesAndSkipThoseInUse)
{
    struct Case {
        long next, max;
        bool deleteKunde;
        const char* name;
        long expected;  // 0: refused
    } cases[] = {
        {10002, 19999, true, "KUNDE", 10000},  // deleted and defined again: its old id
        {10000, 19999, false, "Region", 10002},  // the host's next id is held
        {10002, 10001, false, "Region", 0},      // the range is full
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        CFunctionManager m = Sample();
        m.SetNextUserdefinedId(c.next);
        m.SetMaxUserdefinedId(c.max);
        CFunctionManagerConfig dlg(m, true);
        std::string message;
        std::vector<DialogScript> scripts = {[&](Dialog& d) {
                                                 if (c.deleteKunde) {
                                                     d.SelectText(IDC_FUNC_USERDEFINED, "Kunde");
                                                     d.Press(IDC_FUNC_USER_DELETE);
                                                     qotest::PumpFor(100);
                                                 }
                                                 const size_t rows = c.deleteKunde ? 2 : 3;
                                                 d.Press(IDC_FUNC_USER_NEW);
                                                 EXPECT_TRUE(qotest::WaitFor(
                                                     [&] {
                                                         return c.expected == 0
                                                                    ? !message.empty()
                                                                    : d.ListItems(IDC_FUNC_USERDEFINED).size() == rows;
                                                     },
                                                     3000));
                                                 d.Press(IDOK);
                                             },
                                             Naming(c.name)};
        if (c.expected == 0) scripts.push_back(Reading(message));
        Answering(scripts, [&] { EXPECT_EQ(IDOK, dlg.DoModal()); });
        const CFunctionManager result = dlg.GetFunctionManager();
        if (c.expected == 0) {
            EXPECT_EQ("F\xFCr weitere benutzerdefinierte Funktionalit\xE4ten ist keine Nummer mehr frei!", message);
            EXPECT_EQ(Dump(m), Dump(result));
        } else {
            EXPECT_EQ(c.name, Function(result, c.expected));
        }
        EXPECT_EQ("Filiale", Function(result, 10001));
    }
}

TEST(FunctionManagerConfig, CombinationsCreatedAndEditedThroughTheCombinationDialog)
{
    CFunctionManagerConfig dlg(Sample(), true);
    std::vector<DialogScript> scripts = {[](Dialog& d) {
        d.Press(IDC_FUNC_COMBI_NEW);
        qotest::WaitFor([&] { return d.ListItems(IDC_FUNC_COMBINATIONS).size() == 3; }, 5000);
        d.SelectText(IDC_FUNC_COMBINATIONS, "Vorname Name");
        d.Press(IDC_FUNC_COMBI_EDIT);
        qotest::WaitFor([&] { return d.ListItems(IDC_FUNC_COMBINATIONS)[0] != "Vorname Name"; }, 5000);
        // Kunde is now part of a combination and keeps its name.
        d.SelectText(IDC_FUNC_USERDEFINED, "Kunde");
        EXPECT_FALSE(d.IsEnabled(IDC_FUNC_USER_EDIT));
        d.Press(IDOK);
    }};
    for (DialogScript& s : Composing({{"Kunde", nullptr, false}, {"Ort", " in ", false}}, [](Dialog& c) {
             c.Press(IDOK);
         }))
        scripts.push_back(s);
    // Editing: the parts are there; the flag of the second changes.
    for (DialogScript& s : Composing({{"Name", ", ", true}}, [](Dialog& c) {
             EXPECT_EQ((std::vector<std::string>{"/Vorname/false", " /Name/false", ", /Name/true"}), Rows(c));
             ClickRow(c, 1);
             c.Press(IDC_COMBI_DELETE);
             qotest::PumpFor(200);
             c.Press(IDOK);
         }))
        scripts.push_back(s);
    Answering(scripts, [&] { EXPECT_EQ(IDOK, dlg.DoModal()); }, 12000);

    const CFunctionManager result = dlg.GetFunctionManager();
    EXPECT_EQ("Kunde in Ort", Function(result, 20002));
    EXPECT_EQ("Vorname, Name", Function(result, 20000));
    CFunction edited(0, "");
    ASSERT_TRUE(result.GetFunction(20000, edited));
    ASSERT_EQ(2u, edited.GetCombination().size());
    EXPECT_TRUE(edited.GetCombination()[1].GetAlwaysSeparate());
    EXPECT_EQ(Sample().GetNumFunctions() + 1, result.GetNumFunctions());
}

// ---------------------------------------------------------------------------
// Function names as field names

TEST(FuncToNamesDlg, ChoiceOfCurrentOrAllFields)
{
    for (int choice : {0, 1}) {
        CFuncToNamesDlg dlg;
        Answering({[&](Dialog& d) {
                      EXPECT_EQ("Feldbezeichnungen...", d.Title());
                      EXPECT_TRUE(d.IsChecked(IDC_FUNC_TO_NAMES_CURRENT));
                      EXPECT_FALSE(d.IsChecked(IDC_FUNC_TO_NAMES_ALL));
                      EXPECT_EQ("alle Felder \xE4ndern", d.Text(IDC_FUNC_TO_NAMES_ALL));
                      if (choice == 1) d.Check(IDC_FUNC_TO_NAMES_ALL);
                      if (choice == 1)
                          qotest::CaptureWindow(d.Hwnd(), qotest::CapturePath("field-names-4042.png").c_str());
                      d.Press(IDOK);
                  }},
                  [&] { EXPECT_EQ(IDOK, dlg.DoModal()); });
        EXPECT_EQ(choice, dlg.GetChoice());
    }
}
