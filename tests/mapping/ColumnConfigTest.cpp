// The column configuration page on a real window over a delimited file: the
// user chooses fields and values in the lists, right-clicks the preview for the
// popup menu and clicks column headers; what the page shows is read from the
// controls and from captured pixels.
#include <gtest/gtest.h>

#include <afxwin.h>

#include <CQoInputFilterTextVar.h>

#include <cstdio>
#include <filesystem>
#include <memory>
#include <string>
#include <vector>

#include "CColumnConfig.h"
#include "Capture.h"
#include "DialogDriver.h"
#include "Input.h"
#include "MenuDriver.h"
#include "resource.h"

namespace {

enum { kIdP = 10, kIdQ = 20, kIdR = 30 };  // P is the default value
const int kNotifierId = 7;
const COLORREF kCaptionGreen = RGB(0, 127, 0);

class CTestColumns : public CColumnConfig {
public:
    CTestColumns() : CColumnConfig(kNotifierId, NULL) {}

    int m_nBlockIndex = -1;  // a value the application forbids for every field
    std::vector<int> m_nameClicks;

    void AdjustValueFlags() override { Enabled(m_nBlockIndex, FALSE); }
    void PopupNameClicked(int nField) override { m_nameClicks.push_back(nField); }

    CQoComboBox& Values() { return m_cbValues; }
    CComboBox& Fields() { return m_cbFields; }
    CColoredInputFilterListCtrl& Preview() { return m_list; }
    void AllowFieldNameItem() { m_bFieldNameEnabled = true; }
};

class CCountingListener : public CModifiedListener {
public:
    int m_nAnswer = 1;
    std::vector<int> m_ids;
    int ModifiedListenerSetModified(int, int nNotifierId) override
    {
        m_ids.push_back(nNotifierId);
        return m_nAnswer;
    }
};

class ColumnConfigTest : public ::testing::Test {
protected:
    void SetUp() override
    {
        m_path = std::filesystem::temp_directory_path() / ("qo_columns_" + std::to_string(GetCurrentProcessId()) + ".csv");
        WriteFile(m_path, "Name;Vorname;Ort;PLZ\r\n"
                          "M\xfcller;Hans;K\xf6ln;50667\r\n"
                          "Schmidt;Anna;Berlin;10115\r\n"
                          "Wei\xdf;Eva;M\xfcnchen;80331\r\n");
        m_pFilter.reset(new CQoInputFilterTextVar);
        m_pFilter->Delimiter(';');
        m_pFilter->SetFirstRowHasNames(true);
        m_pFilter->Init(m_path.string().c_str());

        m_pFrame = new CFrameWnd;
        ASSERT_TRUE(m_pFrame->CreateEx(0, AfxRegisterWndClass(0, ::LoadCursor(NULL, IDC_ARROW), (HBRUSH)(COLOR_BTNFACE + 1)),
                                       "Spalten", WS_OVERLAPPEDWINDOW | WS_VISIBLE, 20, 20, 700, 500, NULL, NULL));
        m_page.AddValue(kIdP, "(ohne Bedeutung)", TRUE, TRUE);
        m_page.AddValue(kIdQ, "Nachname", TRUE, FALSE);
        m_page.AddValue(kIdR, "Wohnort", TRUE, FALSE);
        ASSERT_TRUE(m_page.Create(m_pFrame));
        m_page.SetWindowPos(NULL, 0, 0, 0, 0, SWP_NOSIZE | SWP_NOZORDER);
        m_page.ShowWindow(SW_SHOW);
        m_page.Init(m_pFilter.get());
        m_page.AddModifiedListener(&m_listener);
        qotest::BringToFront(m_pFrame->m_hWnd);
    }

    void TearDown() override
    {
        if (::IsWindow(m_page.m_hWnd)) m_page.DestroyWindow();
        if (::IsWindow(m_pFrame->m_hWnd)) m_pFrame->DestroyWindow();  // deletes it
        qotest::PumpFor(50);
        m_page.Init(nullptr);
        m_pFilter.reset();  // closes the file
        std::error_code ignored;
        std::filesystem::remove(m_path, ignored);
    }

    static void WriteFile(const std::filesystem::path& path, const std::string& bytes)
    {
        std::FILE* fp = std::fopen(path.string().c_str(), "wb");
        ASSERT_NE(nullptr, fp);
        std::fwrite(bytes.data(), 1, bytes.size(), fp);
        std::fclose(fp);
    }

    // What the combo box sends its parent when the user selects an entry.
    void Choose(CComboBox& combo, int index)
    {
        combo.SetCurSel(index);
        m_page.SendMessage(WM_COMMAND, MAKEWPARAM(combo.GetDlgCtrlID(), CBN_SELCHANGE), (LPARAM)combo.m_hWnd);
    }
    void Assign(int field, int valueIndex)
    {
        Choose(m_page.Fields(), field);
        Choose(m_page.Values(), valueIndex);
    }

    std::vector<int> ValueFlags()
    {
        std::vector<int> flags;
        for (int i = 0; i < m_page.Values().GetCount(); ++i) flags.push_back(m_page.Values().IsEnabled(i));
        return flags;
    }

    // The caption cell of a field in the preview's client coordinates.
    CRect CaptionCell(int field)
    {
        CRect row, head;
        m_page.Preview().GetItemRect(0, &row, LVIR_BOUNDS);
        m_page.Preview().GetHeaderCtrl()->GetItemRect(field, &head);
        return CRect(head.left, row.top, head.right, row.bottom);
    }
    qotest::Image CapturePreview()
    {
        m_page.Preview().Invalidate();
        m_page.Preview().UpdateWindow();
        qotest::PumpFor(100);
        qotest::Image img;
        EXPECT_TRUE(qotest::CaptureImage(m_page.Preview().m_hWnd, img, true));
        return img;
    }
    static std::vector<COLORREF> Pixels(const qotest::Image& img, const CRect& rc)
    {
        std::vector<COLORREF> px;
        for (int y = rc.top; y < rc.bottom; ++y)
            for (int x = rc.left; x < rc.right; ++x) px.push_back(img.Pixel(x, y));
        return px;
    }
    static int Count(const qotest::Image& img, const CRect& rc, COLORREF colour)
    {
        int n = 0;
        for (COLORREF c : Pixels(img, rc)) n += c == colour;
        return n;
    }

    // A right click whose release is queued with the press: the list view waits
    // in a loop of its own for the release (a drag could start), and a release
    // sent only after a pause would never reach it.
    static void RightClick(HWND hwnd, CPoint at)
    {
        qotest::MoveMouse(hwnd, at.x, at.y);
        qotest::InjectButton(qotest::MouseButton::Right, true);
        qotest::InjectButton(qotest::MouseButton::Right, false);
        qotest::PumpFor(200);
    }

    // A point in the preview's client area at the middle of a field's column, below the caption row.
    CPoint InColumn(int field)
    {
        CRect head, row;
        m_page.Preview().GetHeaderCtrl()->GetItemRect(field, &head);
        m_page.Preview().GetItemRect(2, &row, LVIR_BOUNDS);
        return CPoint(head.CenterPoint().x, row.CenterPoint().y);
    }

    std::filesystem::path m_path;
    std::unique_ptr<CQoInputFilterTextVar> m_pFilter;
    CFrameWnd* m_pFrame = nullptr;
    CTestColumns m_page;
    CCountingListener m_listener;
};

TEST_F(ColumnConfigTest, OffersTheFieldsAndGreysTheValuesThatOtherFieldsHold)
{
    EXPECT_EQ(4, m_page.NumFields());
    ASSERT_EQ(4, m_page.Fields().GetCount());
    CString name;
    m_page.Fields().GetLBText(3, name);
    EXPECT_STREQ("PLZ", name);

    Assign(0, 1);  // field 0 takes Q
    struct Case {
        const char* what;
        int field;
        int blocked;             // index the application forbids, -1 none
        std::vector<int> flags;  // P Q R
    } cases[] = {
        {"another field", 1, -1, {1, 0, 1}},
        {"the field holding Q", 0, -1, {1, 1, 1}},
        {"the default held by three fields", 2, -1, {1, 0, 1}},
        {"the application forbids R", 3, 2, {1, 0, 0}},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.what);
        m_page.m_nBlockIndex = c.blocked;
        Choose(m_page.Fields(), c.field);
        EXPECT_EQ(c.flags, ValueFlags());
        EXPECT_EQ(m_page.Value(c.field) == kIdQ ? 1 : 0, m_page.Values().GetCurSel());
    }
    EXPECT_EQ(std::vector<int>{kNotifierId}, m_listener.m_ids);

    // A click on a column header chooses that field.
    m_page.m_nBlockIndex = -1;
    m_page.Value(2, kIdR);
    CRect head;
    m_page.Preview().GetHeaderCtrl()->GetItemRect(2, &head);
    qotest::Click(m_page.Preview().GetHeaderCtrl()->m_hWnd, head.CenterPoint().x, head.CenterPoint().y);
    EXPECT_EQ(2, m_page.Fields().GetCurSel());
    EXPECT_EQ(2, m_page.Values().GetCurSel());
    EXPECT_EQ((std::vector<int>{1, 0, 1}), ValueFlags());
}

TEST_F(ColumnConfigTest, AGreyedValueInTheDroppedListCannotBeChosen)
{
    Assign(0, 1);  // field 0 takes Q
    m_listener.m_ids.clear();
    Choose(m_page.Fields(), 1);

    // Drop the value list with a real click and look at it.
    CQoComboBox& values = m_page.Values();
    CRect rc;
    values.GetClientRect(&rc);
    qotest::Click(values.m_hWnd, rc.right - 8, rc.CenterPoint().y);
    ASSERT_TRUE(qotest::WaitFor([&] { return values.GetDroppedState() != FALSE; }, 2000));
    COMBOBOXINFO info = {sizeof(info)};
    ASSERT_TRUE(::GetComboBoxInfo(values.m_hWnd, &info));
    qotest::PumpFor(100);
    qotest::Image img;
    ASSERT_TRUE(qotest::CaptureImage(info.hwndList, img, true));
    const int h = values.GetItemHeight(0);
    ASSERT_GT(h, 8);
    const CRect itemQ(0, h, img.width, 2 * h), itemR(0, 2 * h, img.width, 3 * h);
    EXPECT_GT(Count(img, itemQ, ::GetSysColor(COLOR_GRAYTEXT)), 10);
    EXPECT_EQ(0, Count(img, itemQ, ::GetSysColor(COLOR_WINDOWTEXT)));
    EXPECT_GT(Count(img, itemR, ::GetSysColor(COLOR_WINDOWTEXT)), 10);
    EXPECT_EQ(0, Count(img, itemR, ::GetSysColor(COLOR_GRAYTEXT)));

    // The user clicks the greyed entry: the field keeps its value, nobody is told,
    // and the list shows the field's value again.
    qotest::Click(info.hwndList, 20, itemQ.CenterPoint().y);
    qotest::PumpFor(100);
    EXPECT_EQ(kIdP, m_page.Value(1));
    EXPECT_TRUE(m_listener.m_ids.empty());
    EXPECT_EQ(0, values.GetCurSel());
    // The same list takes an enabled entry.
    Choose(values, 2);
    EXPECT_EQ(kIdR, m_page.Value(1));
    EXPECT_EQ(std::vector<int>{kNotifierId}, m_listener.m_ids);
}

TEST_F(ColumnConfigTest, CaptionRowNamesEachFieldsValueAndARefusalRestoresIt)
{
    Assign(0, 1);
    qotest::Image before = CapturePreview();
    const COLORREF face = ::GetSysColor(COLOR_BTNFACE);
    for (int f = 0; f < 4; ++f) {
        SCOPED_TRACE(f);
        const CRect cell = CaptionCell(f);
        EXPECT_EQ(face, before.Pixel(cell.right - 3, cell.top + 1));
        EXPECT_GT(Count(before, cell, kCaptionGreen), 5);
        CString text;
        DWORD clr = 0, clrSel = 0;
        bool bold = true;
        m_page.Preview().GetColoredItem(0, f, text, clr, clrSel, bold);
        EXPECT_STREQ(f == 0 ? "Nachname" : "(ohne Bedeutung)", text);
    }
    const CRect cell2 = CaptionCell(2);

    struct Case {
        const char* what;
        int answer;
        int idAfter;
        bool captionChanges;
    } cases[] = {{"refused", 0, kIdP, false}, {"accepted", 1, kIdR, true}};
    for (const Case& c : cases) {
        SCOPED_TRACE(c.what);
        m_listener.m_ids.clear();
        m_listener.m_nAnswer = c.answer;
        Assign(2, 2);  // field 2 asks for R
        EXPECT_EQ(std::vector<int>{kNotifierId}, m_listener.m_ids);
        EXPECT_EQ(c.idAfter, m_page.Value(2));
        EXPECT_EQ(c.idAfter == kIdR ? 2 : 0, m_page.Values().GetCurSel());
        qotest::Image after = CapturePreview();
        EXPECT_EQ(c.captionChanges, Pixels(before, cell2) != Pixels(after, cell2));
    }
    qotest::CaptureWindow(m_page.m_hWnd, qotest::CapturePath("column-config-4017.png").c_str());
}

TEST_F(ColumnConfigTest, ValueAndFilterIndexRules)
{
    m_page.AddValue(kIdQ, "Nachname (zweiter)", TRUE, FALSE);  // index 3 shares Q's id
    m_page.Value(1, kIdQ);
    m_page.Value(3, 999);
    CString name = "alt";
    struct Case {
        const char* what;
        int actual, expected;
    } cases[] = {
        {"a shared id gives the later value", m_page.Value(1), kIdQ},
        {"an unknown id gives the default", m_page.Value(3), kIdP},
        {"a field out of range answers the default", m_page.Value(4), kIdP},
        {"a negative field answers the default", m_page.Value(-1), kIdP},
        {"the first value with the id, not held", m_page.GetFilterIndex(kIdQ), -1},
        {"the lowest field holding the value", m_page.GetFilterIndex(kIdP), 0},
        {"no value has the id", m_page.GetFilterIndex(999), -1},
        {"an index out of range is not enabled", m_page.Enabled(4), FALSE},
    };
    for (const Case& c : cases) EXPECT_EQ(c.expected, c.actual) << c.what;
    m_page.GetName(1, name);
    EXPECT_STREQ("Nachname (zweiter)", name);

    m_page.Value(2, kIdR);
    EXPECT_EQ(2, m_page.GetFilterIndex(kIdR));
    m_page.Init(nullptr);  // without a filter no field is found and none is shown
    EXPECT_EQ(-1, m_page.GetFilterIndex(kIdR));
    EXPECT_EQ(0, m_page.NumFields());
    EXPECT_EQ(0, m_page.Fields().GetCount());
    EXPECT_STREQ("Feld 3", m_page.GetFieldName(3));
}

TEST_F(ColumnConfigTest, RemovedValuesLeaveTheirFieldsAtTheDefault)
{
    // Values A, B before the default: the default must go on naming its value.
    CTestColumns page;
    page.AddValue(1, "A", TRUE, FALSE);
    page.AddValue(2, "B", TRUE, FALSE);
    page.AddValue(3, "Standard", TRUE, TRUE);
    page.AddValue(4, "D", TRUE, FALSE);
    ASSERT_TRUE(page.Create(m_pFrame));
    page.Init(m_pFilter.get());
    page.Value(0, 2);
    page.Value(1, 4);
    page.Value(2, 1);
    page.Value(3, 3);

    page.RemoveValue(1);  // A, before the default
    EXPECT_EQ(3, page.NumValues());
    EXPECT_EQ((std::vector<int>{2, 4, 3, 3}), (std::vector<int>{page.Value(0), page.Value(1), page.Value(2), page.Value(3)}));
    EXPECT_EQ(3, page.Value(99)) << "the default index follows its value";

    page.RemoveValue(3);  // the default stays
    EXPECT_EQ(3, page.NumValues());
    page.RemoveValue(4);
    EXPECT_EQ((std::vector<int>{2, 3, 3, 3}), (std::vector<int>{page.Value(0), page.Value(1), page.Value(2), page.Value(3)}));
    EXPECT_EQ(2, page.Values().GetCount());
    CString text;
    DWORD clr, clrSel;
    bool bold;
    page.Preview().GetColoredItem(0, 1, text, clr, clrSel, bold);
    EXPECT_STREQ("Standard", text);
    page.DestroyWindow();
}

TEST_F(ColumnConfigTest, InitKeepsTheAssignmentsOfFieldsThatRemain)
{
    m_page.Value(1, kIdQ);
    m_page.Value(3, kIdR);
    m_page.AddValue(50, "Neu", TRUE, TRUE);  // a new default is not where new fields start

    const std::filesystem::path two = m_path.string() + ".2.csv";
    WriteFile(two, "A;B\r\n1;2\r\n");
    {
        CQoInputFilterTextVar small;
        small.SetFirstRowHasNames(true);
        small.Init(two.string().c_str());
        m_page.Init(&small);
        EXPECT_EQ(2, m_page.NumFields());
        EXPECT_EQ(2, m_page.Preview().GetHeaderCtrl()->GetItemCount());
        EXPECT_EQ(kIdQ, m_page.Value(1));

        m_page.Init(m_pFilter.get());
        EXPECT_EQ((std::vector<int>{kIdP, kIdQ, kIdP, kIdP}),
                  (std::vector<int>{m_page.Value(0), m_page.Value(1), m_page.Value(2), m_page.Value(3)}));
    }
    std::error_code ignored;
    std::filesystem::remove(two, ignored);
}

TEST_F(ColumnConfigTest, RightClickOnAColumnOffersItsValues)
{
    Assign(0, 1);  // field 0 holds Q
    m_listener.m_ids.clear();
    qotest::MenuDriver menus;
    menus.Expect([&](qotest::Menu& m) {
        std::vector<qotest::MenuItem> items = m.Items();
        EXPECT_EQ((std::vector<std::string>{"Ort", "", "(ohne Bedeutung)", "Nachname", "Wohnort"}), m.Labels());
        if (items.size() != 5) return;
        EXPECT_EQ(UINT(CColumnConfig::kFieldNameCmd), items[0].id);
        EXPECT_TRUE(items[0].isDefault);
        EXPECT_FALSE(items[0].enabled);
        EXPECT_FALSE(items[0].grayed);
        EXPECT_EQ(UINT(CColumnConfig::kFirstValueCmd + 1), items[3].id);
        EXPECT_TRUE(items[3].grayed) << "Q belongs to field 0";
        EXPECT_TRUE(items[4].enabled);
        EXPECT_FALSE(items[2].checked || items[3].checked || items[4].checked);
        qotest::CaptureWindow(m_pFrame->m_hWnd, qotest::CapturePath("column-config-4017-menu.png").c_str());
        m.Choose(CColumnConfig::kFirstValueCmd + 2);
    });
    RightClick(m_page.Preview().m_hWnd, InColumn(2));
    EXPECT_TRUE(menus.Done());
    EXPECT_EQ(2, m_page.Fields().GetCurSel());
    EXPECT_EQ(kIdR, m_page.Value(2));
    EXPECT_EQ(std::vector<int>{kNotifierId}, m_listener.m_ids);

    // A subclass may let the field's name be chosen.
    m_page.AllowFieldNameItem();
    menus.Expect([&](qotest::Menu& m) { m.Choose(CColumnConfig::kFieldNameCmd); });
    RightClick(m_page.Preview().m_hWnd, InColumn(3));
    EXPECT_TRUE(menus.Done());
    EXPECT_EQ(std::vector<int>{3}, m_page.m_nameClicks);
}

TEST_F(ColumnConfigTest, NoMenuOutsideTheColumnsOrOnADisabledPage)
{
    qotest::MenuDriver menus;
    menus.SetReportFailures(false);
    CRect list, head;
    m_page.Preview().GetClientRect(&list);
    const int n = m_page.Preview().GetHeaderCtrl()->GetItemCount();
    m_page.Preview().GetHeaderCtrl()->GetItemRect(n - 1, &head);
    // The file's columns share the list's width: make room to the right of the last one.
    m_page.Preview().SetColumnWidth(n - 1, 30);
    m_page.Preview().GetHeaderCtrl()->GetItemRect(n - 1, &head);
    ASSERT_LT(head.right + 20, list.right);
    CRect instruction;
    m_page.GetDlgItem(IDC_COLUMN_INSTRUCTION)->GetWindowRect(&instruction);
    m_page.ScreenToClient(&instruction);

    struct Case {
        const char* what;
        HWND window;
        CPoint at;
        bool enabled;
    } cases[] = {
        {"right of the last column", m_page.Preview().m_hWnd, CPoint(head.right + 15, InColumn(0).y), true},
        {"outside the preview", m_page.m_hWnd, instruction.CenterPoint(), true},
        {"on a column of a disabled page", m_page.Preview().m_hWnd, InColumn(1), false},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.what);
        m_page.Enable(c.enabled);
        const int seen = menus.Seen();
        RightClick(c.window, c.at);
        EXPECT_EQ(seen, menus.Seen());
    }
    for (UINT id : {IDC_COLUMN_LBL_FIELD, IDC_COLUMN_LBL_VALUE, IDC_COLUMN_INSTRUCTION, IDC_COLUMN_FIELDS,
                    IDC_COLUMN_VALUES, IDC_COLUMN_PREVIEW})
        EXPECT_FALSE(m_page.GetDlgItem(id)->IsWindowEnabled()) << id;
}

}  // namespace
