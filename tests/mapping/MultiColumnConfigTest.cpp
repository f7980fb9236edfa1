// The combination field page on real windows over a delimited file: columns
// split by their functions in read mode, composed in write mode.
#include <gtest/gtest.h>

#include <CQoInputFilterTextVar.h>
#include <CQoOutputSource.h>

#include <algorithm>
#include <string>
#include <vector>

#include "CMultiColumnConfig.h"
#include "MenuDriver.h"
#include "MfcTestHost.h"
#include "resource.h"

namespace {

const int kNotifierId = 11;
enum { kName = 1, kFirst = 2, kZip = 3, kTown = 4, kPhone = 5, kNameFirst = 20000, kZipTown = 20001 };

// The application's display order: by name.
class CByName : public CFunctionManager::CSorter {
public:
    void Sort(std::vector<CFunctionManager::CFunction>& functions) override
    {
        std::sort(functions.begin(), functions.end(), [](const auto& a, const auto& b) { return a.GetName().Compare(b.GetName()) < 0; });
    }
};

class CCountingListener : public CModifiedListener {
public:
    int m_nCalls = 0;
    int ModifiedListenerSetModified(int, int nNotifierId) override
    {
        EXPECT_EQ(kNotifierId, nNotifierId);
        return ++m_nCalls, 1;
    }
};

// The application's output source: one column per plain function, read from a file.
class CFileSource : public CQoOutputSource {
public:
    explicit CFileSource(CQoInputFilter& file) : m_file(file) {}
    int GetNumColumns() override { return m_file.NumCols(); }
    long GetNumRows() override { return m_file.NumRows(); }
    void GetValue(long row, int col, CQoString& value) override
    {
        if (value.Empty(), m_file.AbsoluteRow(row)) m_file.Value(col, value);
    }
    void GetColumnName(int col, CQoString& name) override { m_file.ColName(col, name); }

private:
    CQoInputFilter& m_file;
};

class CTestPage : public CMultiColumnConfig {
public:
    CTestPage(CFunctionManager& manager, CFunctionManager::CSorter& sorter, bool bRead)
        : CMultiColumnConfig(manager, sorter, bRead, kNotifierId, NULL) {}
    CComboBox& Functions() { return m_cbFunctions; }
    CComboBox& Names() { return m_cbNames; }
    CColoredInputFilterListCtrl& Preview() { return m_list; }
};

class MultiColumnConfigTest : public qotest::HostFrameTest {
protected:
    MultiColumnConfigTest() : HostFrameTest("Kombifelder", 700, 560) {}

    void SetUp() override
    {
        HostFrameTest::SetUp();
        const char* plain[] = {"Name", "Vorname", "PLZ", "Ort", "Telefon"};
        for (long id = kName; id <= kPhone; ++id) {
            CFunctionManager::CFunction f(id, plain[id - 1]);
            m_manager.AddFunction(f);
        }
        using CPart = CFunctionManager::CCombiPart;
        CFunctionManager::CFunction nameFirst(kNameFirst, "Name, Vorname"), zipTown(kZipTown, "PLZ Ort");
        nameFirst.SetCombination({CPart(kName, "", false), CPart(kFirst, ", ", false)});
        zipTown.SetCombination({CPart(kZip, "", false), CPart(kTown, " ", false)});
        m_manager.AddFunction(nameFirst);
        m_manager.AddFunction(zipTown);
    }
    void TearDown() override
    {
        if (m_page != NULL && ::IsWindow(m_page->m_hWnd)) m_page->DestroyWindow();
        delete m_page;
        HostFrameTest::TearDown();
    }

    // Write mode composes from the file as the application's source, given before
    // the window exists.
    void Open(bool read, std::vector<long> functions = {})
    {
        m_file.Delimiter(';');
        m_file.SetFirstRowHasNames(true);
        m_file.Init(qotest::WriteTempFile("qo_multi.csv",
                                          read ? "Kunde;Anschrift;Telefon\r\nMeier, Hans;50667 K\xf6ln;0221 12345\r\n"
                                                 "Wei\xdf, Eva;89073 Ulm;0731 5555\r\n"
                                               : "Name;Vorname;PLZ;Ort;Telefon\r\nMeier;Hans;50667;K\xf6ln;0221 12345\r\n"
                                                 "Wei\xdf;;89073;Ulm;0731 5555\r\n")
                        .c_str());
        m_page = new CTestPage(m_manager, m_sorter, read);
        m_page->SetOuterColumnFunctions(functions);
        if (!read) m_page->SetOutputSource(&m_source);
        ASSERT_TRUE(m_page->Create(m_pFrame));
        m_page->AddModifiedListener(&m_listener);
        qotest::ShowChild(*m_page, 5, 5);
        if (read) m_page->SetInputFilter(&m_file);
    }
    void Columns(std::vector<std::pair<const char*, long>> columns)
    {
        while (m_page->GetNumOuterColumns() > 0) m_page->RemoveOuterColumn(0);
        for (const auto& c : columns) {
            m_page->AddOuterColumn(c.first);
            m_page->SetOuterColumnFunction(m_page->GetNumOuterColumns() - 1, c.second);
        }
        m_page->RebuildNameList();
        m_page->DisplayWriteList();
        m_listener.m_nCalls = 0;
    }

    void Choose(CComboBox& combo, const char* text)
    {
        const int index = combo.FindStringExact(-1, text);
        ASSERT_GE(index, 0) << text;
        combo.SetCurSel(index);
        m_page->SendMessage(WM_COMMAND, MAKEWPARAM(combo.GetDlgCtrlID(), CBN_SELCHANGE), (LPARAM)combo.m_hWnd);
    }
    void Click(int id) { qotest::ClickMiddle(m_page->GetDlgItem(id)->m_hWnd); }
    qotest::DialogScript Rename(const char* name)
    {
        return [=](qotest::Dialog& d) {
            EXPECT_EQ("Feldbezeichnung", d.Text(IDC_INPUT_PROMPT));
            d.SetText(IDC_INPUT_VALUE, name);
            d.Press(IDOK);
        };
    }

    // Texts joined by '|'; Output(-1) gives the column names.
    template <class Get> static std::string Join(int n, Get get)
    {
        std::string line;
        for (int i = 0; i < n; ++i) line += (i ? "|" : "") + std::string(get(i));
        return line;
    }
    std::string Output(long row)
    {
        CQoOutputSource* out = m_page->GetOutputSource();
        return Join(out->GetNumColumns(), [&](int c) {
            CQoString v;
            row < 0 ? out->GetColumnName(c, v) : out->GetValue(row, c, v);
            return std::string(v.GetString());
        });
    }
    std::string InnerRow(long row)
    {
        CQoInputFilter* in = m_page->GetInnerInputFilter();
        EXPECT_TRUE(in->AbsoluteRow(row));
        return Join(in->NumCols(), [&](int c) {
            CQoString v;
            in->Value(c, v);
            return std::string(v.GetString());
        });
    }
    std::string Functions()
    {
        return Join(m_page->GetNumOuterColumns(), [&](int i) { return std::to_string(m_page->GetOuterFunction(i)); });
    }
    // The release is queued with the press: the list view waits for it in a loop of its own.
    void RightClick(int col)
    {
        CRect row, head;
        m_page->Preview().GetItemRect(1, &row, LVIR_BOUNDS);
        m_page->Preview().GetHeaderCtrl()->GetItemRect(col, &head);
        qotest::MoveMouse(m_page->Preview().m_hWnd, head.CenterPoint().x, row.CenterPoint().y);
        qotest::InjectButton(qotest::MouseButton::Right, true);
        qotest::InjectButton(qotest::MouseButton::Right, false);
        qotest::PumpFor(200);
    }

    CFunctionManager m_manager;
    CByName m_sorter;
    CQoInputFilterTextVar m_file;
    CFileSource m_source{m_file};
    CCountingListener m_listener;
    CTestPage* m_page = NULL;
};

TEST_F(MultiColumnConfigTest, ReadModeSplitsEachColumnIntoThePartsOfItsFunction)
{
    // Telefon has no function (the manager has no function 0).
    Open(true, {kNameFirst, kZipTown});
    EXPECT_EQ("Name, Vorname", qotest::WindowText(m_page->Functions().m_hWnd));
    EXPECT_EQ("Meier|Hans|50667|K\xf6ln", InnerRow(0));
    EXPECT_FALSE(m_page->GetDlgItem(IDC_MULTI_NEW)->IsWindowVisible() && m_page->GetDlgItem(IDC_MULTI_NEW)->IsWindowEnabled());

    qotest::CaptureWindow(m_page->m_hWnd, qotest::CapturePath("multicolumn-4038-read.png").c_str());

    m_page->SetDontShowLimit(kZipTown);  // PLZ Ort is not offered
    m_page->InitFunctionList();
    qotest::MenuDriver menus;
    menus.Expect([&](qotest::Menu& m) {
        EXPECT_EQ((std::vector<std::string>{"Kunde", "", "Feldbezeichnung bearbeiten...", "Funktionalit\xe4ten bearbeiten...",
                                            "", "Name", "Name, Vorname", "Ort", "PLZ", "Telefon", "Vorname"}),
                  m.Labels());
        EXPECT_TRUE(m.Items()[2].grayed) << "the file names its columns";
        m.ChooseLabel("Name");
    });
    RightClick(1);  // Vorname, the second part of Kunde
    EXPECT_TRUE(menus.Done());
    EXPECT_EQ("1|20001|0", Functions());
    EXPECT_EQ("Meier, Hans|50667|K\xf6ln", InnerRow(0)) << "Kunde is taken whole";
    EXPECT_EQ(1, m_listener.m_nCalls);
}

TEST_F(MultiColumnConfigTest, WriteModeComposesTheOutputColumnsAsTheUserNamesThem)
{
    Open(false);
    EXPECT_EQ(0, m_page->GetOutputSource()->GetNumColumns());
    for (const char* name : {"Kunde", "Anschrift"}) qotest::Answering({Rename(name)}, [&] { Click(IDC_MULTI_NEW); });
    EXPECT_EQ("Kunde|Anschrift", Output(-1));
    Choose(m_page->Names(), "Kunde");
    Choose(m_page->Functions(), "Name, Vorname");
    Choose(m_page->Names(), "Anschrift");
    Choose(m_page->Functions(), "PLZ Ort");
    EXPECT_EQ("Meier, Hans|50667 K\xf6ln", Output(0));
    EXPECT_EQ("Wei\xdf|89073 Ulm", Output(1)) << "no separator before an empty part";
    qotest::CaptureWindow(m_page->m_hWnd, qotest::CapturePath("multicolumn-4038.png").c_str());
    Choose(m_page->Names(), "Kunde");
    Click(IDC_MULTI_DELETE);
    EXPECT_EQ("Anschrift", Output(-1));
    EXPECT_EQ("50667 K\xf6ln", Output(0));
}

TEST_F(MultiColumnConfigTest, ARenameThatClashesInAnyCaseChangesNothing)
{
    Open(false);
    Columns({{"Kunde", kNameFirst}, {"Anschrift", kZipTown}});
    struct Case {
        const char* typed;
        const char* message;  // empty: accepted
        const char* column;   // the second column's name afterwards
    } cases[] = {
        {"KUNDE", "Diese Bezeichnung ist schon vergeben!", "Anschrift"},
        {"", "Bitte geben Sie eine Bezeichnung ein!", "Anschrift"},
        {"anschrift", "", "anschrift"},  // its own name in other letters
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.typed);
        m_listener.m_nCalls = 0;
        m_page->Names().SetCurSel(1);
        std::string message;
        std::vector<qotest::DialogScript> scripts{Rename(c.typed)};
        if (*c.message) scripts.push_back(qotest::Reading(message));
        qotest::Answering(scripts, [&] { Click(IDC_MULTI_EDIT_NAME); });
        EXPECT_EQ(c.message, message);
        EXPECT_EQ(std::string("Kunde|") + c.column, Output(-1));
        EXPECT_EQ(*c.message ? 0 : 1, m_listener.m_nCalls);
    }
}

TEST_F(MultiColumnConfigTest, FunctionNamesBecomeColumnNamesUnlessTwoWouldClash)
{
    Open(false);
    struct Case {
        std::vector<std::pair<const char*, long>> columns;
        const char* message;
        const char* names;
    } cases[] = {
        {{{"Feld 1", kName}, {"Feld 2", kZipTown}, {"Feld 3", 0}}, "", "Name|PLZ Ort|Feld 3"},
        {{{"Feld 1", kName}, {"Feld 2", kFirst}, {"Feld 3", kName}},
         "Diese Bezeichnung ist schon vergeben!", "Feld 1|Feld 2|Feld 3"},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.names);
        Columns(c.columns);
        std::string message;
        std::vector<qotest::DialogScript> scripts{[&](qotest::Dialog& d) {
            EXPECT_EQ("Feldbezeichnungen...", d.Title());
            EXPECT_TRUE(d.IsChecked(IDC_FUNC_TO_NAMES_CURRENT)) << "the current field is the default";
            d.Check(IDC_FUNC_TO_NAMES_ALL);
            if (!*c.message)
                qotest::CaptureWindow(d.Hwnd(), qotest::CapturePath("field-names-4042.png").c_str());
            d.Press(IDOK);
        }};
        if (*c.message) scripts.push_back(qotest::Reading(message));
        qotest::Answering(scripts, [&] { Click(IDC_MULTI_FUNC_TO_NAMES); });
        EXPECT_EQ(c.message, message);
        EXPECT_EQ(c.names, Output(-1));
    }
}

TEST_F(MultiColumnConfigTest, AllColumnsReplaceTheUsersOnlyAfterYes)
{
    Open(false);
    Columns({{"Kunde", kNameFirst}});
    for (int answer : {IDNO, IDYES}) {
        SCOPED_TRACE(answer);
        std::string message;
        qotest::Answering({qotest::Reading(message, answer)}, [&] { Click(IDC_MULTI_SELECT_ALL); });
        EXPECT_EQ("Das Ausw\xe4hlen aller vorhandenen Spalten \xfc"
                  "berschreibt Ihre bisherigen Einstellungen.\nSind Sie sicher?",
                  message);
    }
    EXPECT_EQ("Feld 1|Feld 2|Feld 3|Feld 4|Feld 5|Feld 6|Feld 7", Output(-1));
    EXPECT_EQ("Meier|Hans|50667|K\xf6ln|0221 12345|Meier, Hans|50667 K\xf6ln", Output(0));
    EXPECT_EQ("1|2|3|4|5|20000|20001", Functions());
    EXPECT_EQ(1 + 7, m_listener.m_nCalls) << "one removal and seven additions";
}

TEST_F(MultiColumnConfigTest, DraggingAHeaderToTheFrontMovesTheColumnWithItsFunction)
{
    Open(false);
    Columns({{"Nachname", kName}, {"Vorname", kFirst}, {"Anschrift", kZipTown}});
    qotest::PumpApp(200);  // the first paint learns the order
    CHeaderCtrl* header = m_page->Preview().GetHeaderCtrl();
    CRect first, third;
    header->GetItemRect(0, &first);
    header->GetItemRect(2, &third);
    const int y = first.CenterPoint().y;
    qotest::Drag(header->m_hWnd, {third.CenterPoint().x, y}, {first.left + 3, y});
    ASSERT_TRUE(qotest::WaitFor([&] { return qotest::PumpApp(50), m_listener.m_nCalls > 0; }, 3000))
        << "the drag was not noticed";
    qotest::PumpApp(300);  // the order put back is painted and noticed too

    EXPECT_EQ("Anschrift|Nachname|Vorname", Output(-1));
    EXPECT_EQ("50667 K\xf6ln|Meier|Hans", Output(0));
    EXPECT_EQ("20001|1|2", Functions());
    EXPECT_EQ(1, m_listener.m_nCalls);
}

}  // namespace
