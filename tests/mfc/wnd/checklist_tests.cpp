// The check list box on a real window: the caller's item data kept apart from
// the check and enabled state (also in WM_DELETEITEM), real clicks in the box
// and on the text, the space bar in each check style, the parent's
// CLBN_CHKCHANGE, and the boxes as the screen shows them.
#include <gtest/gtest.h>

#include <afxwin.h>

#include <algorithm>
#include <string>
#include <vector>

#include "MfcTestHost.h"

namespace {

const UINT kListId = 7;

class CCheckParent : public CFrameWnd {
public:
    int m_nChanges = 0;

protected:
    void OnCheckChange() { ++m_nChanges; }
    DECLARE_MESSAGE_MAP()
};

BEGIN_MESSAGE_MAP(CCheckParent, CFrameWnd)
    ON_CONTROL(CLBN_CHKCHANGE, kListId, OnCheckChange)
END_MESSAGE_MAP()

// Remembers the item data that each WM_DELETEITEM carried back to the list.
class CRecordingCheckList : public CCheckListBox {
public:
    std::vector<DWORD_PTR> m_deleted;
    void DeleteItem(LPDELETEITEMSTRUCT lpDeleteItemStruct) override { m_deleted.push_back(lpDeleteItemStruct->itemData); }
};

class CheckListTest : public ::testing::Test {
protected:
    void SetUp() override
    {
        ASSERT_TRUE(qotest::CreateHostFrame(m_pFrame, "Haken", 320, 260, COLOR_WINDOW));
        ASSERT_TRUE(m_list.Create(WS_CHILD | WS_VISIBLE | WS_BORDER | WS_VSCROLL | LBS_NOTIFY | LBS_OWNERDRAWFIXED |
                                      LBS_HASSTRINGS | LBS_NOINTEGRALHEIGHT,
                                  CRect(10, 10, 230, 190), m_pFrame, kListId));
        m_list.SetFont(CFont::FromHandle((HFONT)::GetStockObject(DEFAULT_GUI_FONT)));
        for (const char* text : {"Alpha", "Beta", "Gamma", "Delta"}) m_list.AddString(text);
        qotest::BringToFront(m_pFrame->m_hWnd);
    }
    void TearDown() override { qotest::DestroyHostFrame(m_pFrame); }

    CRect Item(int i)
    {
        CRect rc;
        m_list.GetItemRect(i, &rc);
        return rc;
    }

    CCheckParent* m_pFrame = new CCheckParent;  // deletes itself with its window
    CRecordingCheckList m_list;
};

}  // namespace

TEST_F(CheckListTest, ItemDataStaysTheCallersBesideCheckAndEnabledState)
{
    m_list.SetItemData(0, 1000);
    m_list.SetCheck(0, 1);
    m_list.SetCheck(1, 2);
    m_list.SetItemData(1, (DWORD_PTR)-7);
    m_list.Enable(2, FALSE);
    struct {
        int index;
        DWORD_PTR data;
        int check;
        BOOL enabled;
    } const cases[] = {
        {0, 1000, 1, TRUE}, {1, (DWORD_PTR)-7, 2, TRUE}, {2, 0, 0, FALSE}, {99, (DWORD_PTR)LB_ERR, 0, TRUE},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.index);
        // Whoever asks the window itself gets the caller's data too.
        EXPECT_EQ((LRESULT)c.data, ::SendMessageA(m_list.m_hWnd, LB_GETITEMDATA, c.index, 0));
        EXPECT_EQ(c.check, m_list.GetCheck(c.index));
        EXPECT_EQ(c.enabled, m_list.IsEnabled(c.index));
    }
    EXPECT_EQ(LB_ERR, m_list.SetItemData(99, 5));

    // A deleted item and the items that go with the window hand back the caller's data.
    m_list.DeleteString(1);
    EXPECT_EQ(std::vector<DWORD_PTR>{(DWORD_PTR)-7}, m_list.m_deleted);
    EXPECT_FALSE(m_list.IsEnabled(1));  // Gamma moved up, with its own state
    m_list.DestroyWindow();
    std::sort(m_list.m_deleted.begin() + 1, m_list.m_deleted.end());
    EXPECT_EQ((std::vector<DWORD_PTR>{(DWORD_PTR)-7, 0, 0, 1000}), m_list.m_deleted);
}

TEST_F(CheckListTest, AClickInTheBoxTogglesAndTellsTheParentAClickOnTheTextSelects)
{
    m_list.Enable(3, FALSE);
    struct {
        int item;
        bool inBox;
        std::vector<int> checks;
        int changes;
        int selected;
    } const steps[] = {
        {1, true, {0, 1, 0, 0}, 1, 1},   // box of Beta
        {2, false, {0, 1, 0, 0}, 1, 2},  // text of Gamma
        {3, true, {0, 1, 0, 0}, 1, 2},   // box of disabled Delta
    };
    for (const auto& s : steps) {
        SCOPED_TRACE(std::to_string(s.item) + (s.inBox ? " box" : " text"));
        ::Sleep(600);  // no double click with the step before
        qotest::Click(m_list.m_hWnd, Item(s.item).left + (s.inBox ? 8 : 60), Item(s.item).CenterPoint().y);
        std::vector<int> checks;
        for (int i = 0; i < 4; ++i) checks.push_back(m_list.GetCheck(i));
        EXPECT_EQ(s.checks, checks);
        EXPECT_EQ(s.changes, m_pFrame->m_nChanges);
        EXPECT_EQ(s.selected, m_list.GetCurSel());
    }
    // Both clicks of a double click on a box count.
    qotest::DoubleClick(m_list.m_hWnd, Item(2).left + 8, Item(2).CenterPoint().y);
    EXPECT_EQ(0, m_list.GetCheck(2));
    EXPECT_EQ(3, m_pFrame->m_nChanges);
}

TEST_F(CheckListTest, TheSpaceBarTogglesTheSelectedItemInTheAutoStylesOnly)
{
    struct {
        UINT style;
        std::vector<int> afterEachPress;
    } const cases[] = {
        {BS_AUTOCHECKBOX, {1, 0, 1}},
        {BS_AUTO3STATE, {1, 2, 0}},
        {BS_CHECKBOX, {0, 0, 0}},  // the program decides; it still hears of each press
    };
    int changes = 0;
    for (const auto& c : cases) {
        SCOPED_TRACE(c.style);
        m_list.SetCheckStyle(c.style);
        m_list.SetCheck(2, 0);
        m_list.SetCurSel(2);
        qotest::Focus(m_list.m_hWnd);
        for (int expected : c.afterEachPress) {
            qotest::KeyPress(VK_SPACE);
            qotest::PumpFor(30);
            EXPECT_EQ(expected, m_list.GetCheck(2));
            EXPECT_EQ(++changes, m_pFrame->m_nChanges);
        }
    }
}

TEST_F(CheckListTest, TheScreenShowsTickedBoxesAndGreyTextForDisabledItems)
{
    m_list.SetCheck(0, 1);
    m_list.Enable(2, FALSE);
    const qotest::Image img = qotest::Screen(m_list.m_hWnd);
    // Pixels of an item between x0 and x1 (from its left) over its middle rows.
    auto count = [&](int item, int x0, int x1, auto pred) {
        const CRect rc = Item(item);
        int n = 0;
        for (int y = rc.CenterPoint().y - 3; y < rc.CenterPoint().y + 4; ++y)
            for (int x = rc.left + x0; x < rc.left + x1; ++x) n += pred(img.Pixel(x, y));
        return n;
    };
    auto dark = [](COLORREF c) { return GetRValue(c) + GetGValue(c) + GetBValue(c) < 200; };
    auto grey = [](COLORREF c) { return c == ::GetSysColor(COLOR_GRAYTEXT); };
    // Inside the box (its dark upper and left edges left out): a tick, or nothing.
    EXPECT_GT(count(0, 5, 13, dark), 5);
    EXPECT_EQ(0, count(1, 5, 13, dark));
    // Text: grey for the disabled item only.
    EXPECT_EQ(0, count(1, 18, 120, grey));
    EXPECT_GT(count(2, 18, 120, grey), 5);
}
