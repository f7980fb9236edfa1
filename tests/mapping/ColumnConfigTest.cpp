// The column configuration page on a real window over a delimited file, used
// with the real mouse.
#include <gtest/gtest.h>

#include <CQoInputFilterTextVar.h>

#include <string>
#include <vector>

#include "CColumnConfig.h"
#include "MenuDriver.h"
#include "MfcTestHost.h"
#include "resource.h"

namespace {

enum { kIdP = 10, kIdQ = 20, kIdR = 30 };  // P is the default value
const int kNotifierId = 7;

class CTestColumns : public CColumnConfig {
public:
    CTestColumns() : CColumnConfig(kNotifierId, NULL) {}

    int m_nBlockIndex = -1;  // a value the application forbids for every field
    void AdjustValueFlags() override { Enabled(m_nBlockIndex, FALSE); }

    CQoComboBox& Values() { return m_cbValues; }
    CComboBox& Fields() { return m_cbFields; }
    CColoredInputFilterListCtrl& Preview() { return m_list; }
    std::vector<int> Ids()
    {
        std::vector<int> ids;
        for (int f = 0; f < 4; ++f) ids.push_back(Value(f));
        return ids;
    }
    std::vector<int> ValueFlags()
    {
        std::vector<int> flags;
        for (int i = 0; i < m_cbValues.GetCount(); ++i) flags.push_back(m_cbValues.IsEnabled(i));
        return flags;
    }
    CString Caption(int field)
    {
        CString text;
        DWORD clr = 0, clrSel = 0;
        bool bold = false;
        m_list.GetColoredItem(0, field, text, clr, clrSel, bold);
        return text;
    }
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

class ColumnConfigTest : public qotest::HostFrameTest {
protected:
    ColumnConfigTest() : HostFrameTest("Spalten", 700, 500) {}
    void SetUp() override
    {
        HostFrameTest::SetUp();
        m_filter.Delimiter(';');
        m_filter.SetFirstRowHasNames(true);
        m_filter.Init(qotest::WriteTempFile("qo_columns.csv", "Name;Vorname;Ort;PLZ\r\nM\xfcller;Hans;K\xf6ln;50667\r\n"
                                                              "Schmidt;Anna;Berlin;10115\r\nWei\xdf;Eva;Ulm;89073\r\n")
                          .c_str());
        m_page.AddValue(kIdP, "(ohne Bedeutung)", TRUE, TRUE);
        m_page.AddValue(kIdQ, "Nachname", TRUE, FALSE);
        m_page.AddValue(kIdR, "Wohnort", TRUE, FALSE);
        ASSERT_TRUE(m_page.Create(m_pFrame));
        m_page.ShowWindow(SW_SHOW);
        m_page.Init(&m_filter);
        m_page.AddModifiedListener(&m_listener);
        qotest::BringToFront(m_pFrame->m_hWnd);
    }
    void TearDown() override
    {
        if (::IsWindow(m_page.m_hWnd)) m_page.DestroyWindow();
        m_page.Init(nullptr);
        HostFrameTest::TearDown();
    }

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
    // A field's cell in the caption row of the preview; `below` rows lower.
    CRect CaptionCell(int field, int below = 0)
    {
        CRect row, head;
        m_page.Preview().GetItemRect(below, &row, LVIR_BOUNDS);
        m_page.Preview().GetHeaderCtrl()->GetItemRect(field, &head);
        return CRect(head.left, row.top, head.right, row.bottom);
    }
    // The release is queued with the press: the list view waits for it in a loop of its own.
    static void RightClick(HWND hwnd, CPoint at)
    {
        qotest::MoveMouse(hwnd, at.x, at.y);
        qotest::InjectButton(qotest::MouseButton::Right, true);
        qotest::InjectButton(qotest::MouseButton::Right, false);
        qotest::PumpFor(200);
    }

    CQoInputFilterTextVar m_filter;
    CTestColumns m_page;
    CCountingListener m_listener;
};

TEST_F(ColumnConfigTest, OffersTheFieldsAndGreysTheValuesThatOtherFieldsHold)
{
    ASSERT_EQ(4, m_page.Fields().GetCount());
    Assign(0, 1);  // field 0 takes Q
    struct Case {
        const char* what;
        int field, blocked;      // blocked: the index the application forbids, -1 none
        std::vector<int> flags;  // P Q R
    } cases[] = {
        {"another field", 1, -1, {1, 0, 1}},
        {"the field holding Q", 0, -1, {1, 1, 1}},
        {"the application forbids R", 3, 2, {1, 0, 0}},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.what);
        m_page.m_nBlockIndex = c.blocked;
        Choose(m_page.Fields(), c.field);
        EXPECT_EQ(c.flags, m_page.ValueFlags());
        EXPECT_EQ(c.field == 0 ? 1 : 0, m_page.Values().GetCurSel());
    }
    EXPECT_EQ(std::vector<int>{kNotifierId}, m_listener.m_ids);

    // A click on a column header chooses that field.
    m_page.m_nBlockIndex = -1;
    m_page.Value(2, kIdR);
    qotest::Click(m_page.Preview().GetHeaderCtrl()->m_hWnd, CaptionCell(2).CenterPoint().x, 5);
    EXPECT_EQ(2, m_page.Fields().GetCurSel());
    EXPECT_EQ(2, m_page.Values().GetCurSel());
}

TEST_F(ColumnConfigTest, AGreyedValueInTheDroppedListCannotBeChosen)
{
    Assign(0, 1);  // field 0 takes Q
    m_listener.m_ids.clear();
    Choose(m_page.Fields(), 1);

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
    const CRect itemQ(0, h, img.width, 2 * h);
    EXPECT_GT(qotest::CountPixels(img, itemQ, ::GetSysColor(COLOR_GRAYTEXT)), 10);

    // A click on the greyed entry: the field keeps its value, nobody is told.
    qotest::Click(info.hwndList, 20, itemQ.CenterPoint().y);
    qotest::PumpFor(100);
    EXPECT_EQ(kIdP, m_page.Value(1));
    EXPECT_TRUE(m_listener.m_ids.empty());
    EXPECT_EQ(0, values.GetCurSel());
}

TEST_F(ColumnConfigTest, CaptionRowNamesEachFieldsValueAndARefusalRestoresIt)
{
    Assign(0, 1);
    EXPECT_STREQ("Nachname", m_page.Caption(0));
    // Field 2 asks for R: a listener's refusal undoes it, an acceptance shows it.
    for (int answer : {0, 1}) {
        SCOPED_TRACE(answer);
        m_listener.m_ids.clear();
        m_listener.m_nAnswer = answer;
        Assign(2, 2);
        EXPECT_EQ(std::vector<int>{kNotifierId}, m_listener.m_ids);
        EXPECT_EQ(answer ? kIdR : kIdP, m_page.Value(2));
        EXPECT_STREQ(answer ? "Wohnort" : "(ohne Bedeutung)", m_page.Caption(2));
    }
    qotest::CaptureWindow(m_page.m_hWnd, qotest::CapturePath("column-config-4017.png").c_str());
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
    page.Init(&m_filter);
    const int ids[] = {2, 4, 1, 3};
    for (int f = 0; f < 4; ++f) page.Value(f, ids[f]);

    page.RemoveValue(1);  // A, before the default
    EXPECT_EQ((std::vector<int>{2, 4, 3, 3}), page.Ids());
    EXPECT_EQ(3, page.Value(99)) << "the default index follows its value";
    page.RemoveValue(3);  // the default stays
    page.RemoveValue(4);
    EXPECT_EQ((std::vector<int>{2, 3, 3, 3}), page.Ids());
    EXPECT_EQ(2, page.Values().GetCount());
    EXPECT_STREQ("Standard", page.Caption(1));
    page.DestroyWindow();
}

TEST_F(ColumnConfigTest, ValuesByIdAndAssignmentsKeptForTheFieldsThatRemain)
{
    m_page.Value(1, kIdQ);
    m_page.Value(3, 999);
    EXPECT_EQ((std::vector<int>{kIdP, kIdQ, kIdP, kIdP}), m_page.Ids()) << "an unknown id gives the default";
    EXPECT_EQ(kIdP, m_page.Value(4)) << "a field that is not there";
    EXPECT_EQ(1, m_page.GetFilterIndex(kIdQ));

    m_page.Value(3, kIdR);
    m_page.AddValue(50, "Neu", TRUE, TRUE);  // a new default is not where new fields start
    CQoInputFilterTextVar small;
    small.SetFirstRowHasNames(true);
    small.Init(qotest::WriteTempFile("qo_columns_2.csv", "A;B\r\n1;2\r\n").c_str());
    m_page.Init(&small);
    EXPECT_EQ(2, m_page.Preview().GetHeaderCtrl()->GetItemCount());
    EXPECT_EQ(kIdQ, m_page.Value(1));
    m_page.Init(&m_filter);
    EXPECT_EQ((std::vector<int>{kIdP, kIdQ, kIdP, kIdP}), m_page.Ids());

    m_page.Init(nullptr);  // without a filter no field is found and none is shown
    EXPECT_EQ(-1, m_page.GetFilterIndex(kIdP));
    EXPECT_EQ(0, m_page.Fields().GetCount());
}

TEST_F(ColumnConfigTest, RightClickOnAColumnOffersItsValues)
{
    Assign(0, 1);  // field 0 holds Q
    m_listener.m_ids.clear();
    qotest::MenuDriver menus;
    menus.Expect([&](qotest::Menu& m) {
        ASSERT_EQ((std::vector<std::string>{"Ort", "", "(ohne Bedeutung)", "Nachname", "Wohnort"}), m.Labels());
        EXPECT_TRUE(m.Items()[3].grayed) << "Q belongs to field 0";
        qotest::CaptureWindow(m_pFrame->m_hWnd, qotest::CapturePath("column-config-4017-menu.png").c_str());
        m.Choose(CColumnConfig::kFirstValueCmd + 2);
    });
    RightClick(m_page.Preview().m_hWnd, CaptionCell(2, 2).CenterPoint());
    EXPECT_TRUE(menus.Done());
    EXPECT_EQ(2, m_page.Fields().GetCurSel());
    EXPECT_EQ(kIdR, m_page.Value(2));
    EXPECT_EQ(std::vector<int>{kNotifierId}, m_listener.m_ids);

    // Right of the last column there is no menu.
    qotest::MenuDriver none;
    none.SetReportFailures(false);
    m_page.Preview().SetColumnWidth(3, 30);
    const CRect last = CaptionCell(3, 2);
    RightClick(m_page.Preview().m_hWnd, CPoint(last.right + 15, last.top + 2));
    EXPECT_EQ(0, none.Seen());
}

}  // namespace
