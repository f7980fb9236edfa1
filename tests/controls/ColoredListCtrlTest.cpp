// The coloured list on a real window: a virtual list of a million rows, checked
// by the pixels a user would see.
#include <gtest/gtest.h>

#include <afxcmn.h>

#include <string>
#include <vector>

#include "CColoredListCtrl.h"
#include "MfcTestHost.h"

namespace {

const int kRows = 1000000;
const int kEmptyRow = 5;  // answers "no data": painted as a line
const int kColumns = 5;
const COLORREF kColumnColour[kColumns] = {RGB(200, 0, 0), RGB(0, 140, 0), RGB(0, 0, 220), RGB(120, 0, 120),
                                          RGB(0, 120, 120)};
const COLORREF kSelectedColour = RGB(255, 255, 0);

class CTestList : public CColoredListCtrl {
public:
    bool m_bAllowChange = true;
    int m_nChanged = 0, m_nAsked = 0;

    int GetColoredItem(int row, int col, CString& text, DWORD& clr, DWORD& clrSelected, bool& bold) override
    {
        clr = kColumnColour[col];
        clrSelected = kSelectedColour;
        bold = false;
        if (row == kEmptyRow) return 0;
        if (col == 2)
            text.Format("WWWWWWWWWWWWWWWWWWWWWWWW %d", row);  // wider than its column
        else if (col == 4)
            text = "i";
        else
            text.Format("%c%d", 'A' + col, row);
        return 1;
    }
    bool ItemChanging() override
    {
        ++m_nAsked;
        return m_bAllowChange;
    }
    void ItemChanged() override { ++m_nChanged; }
};

class CountingListener : public CColoredListCtrlListener {
public:
    int m_nCalls = 0;
    void ColoredListCtrlOrderChanged() override { ++m_nCalls; }
};

class ColoredListCtrlTest : public ::testing::Test {
protected:
    void SetUp() override
    {
        m_pFrame = new CFrameWnd;
        ASSERT_TRUE(qotest::CreateHostFrame(m_pFrame, "Liste", 640, 360, COLOR_WINDOW));
        ASSERT_TRUE(m_list.Create(WS_CHILD | WS_VISIBLE | WS_BORDER | LVS_REPORT | LVS_OWNERDRAWFIXED |
                                      LVS_OWNERDATA | LVS_SHOWSELALWAYS,
                                  CRect(5, 5, 605, 305), m_pFrame, 100));
        m_list.SendMessage(LVM_SETEXTENDEDLISTVIEWSTYLE, LVS_EX_HEADERDRAGDROP, LVS_EX_HEADERDRAGDROP);
        const char* captions[kColumns] = {"Name", "Ort", "Lang", "Rechts", "Mitte"};
        const int formats[kColumns] = {LVCFMT_LEFT, LVCFMT_LEFT, LVCFMT_LEFT, LVCFMT_RIGHT, LVCFMT_CENTER};
        for (int c = 0; c < kColumns; ++c) m_list.InsertColumn(c, captions[c], formats[c], 110);
        m_list.SetItemCountEx(kRows, 0);
        m_list.Init();
        m_list.AddListener(&m_listener);
        qotest::BringToFront(m_pFrame->m_hWnd);
    }

    void TearDown() override
    {
        m_list.RemoveListener(&m_listener);
        qotest::DestroyHostFrame(m_pFrame);
    }

    CRect Cell(int row, int col)
    {
        CRect rc;
        m_list.GetItemRect(row, &rc, LVIR_BOUNDS);
        CRect head;
        m_list.GetHeaderCtrl()->GetItemRect(col, &head);
        return CRect(head.left, rc.top, head.right, rc.bottom);
    }

    static bool Contains(const qotest::Image& img, const CRect& rc, COLORREF colour)
    {
        return qotest::CountPixels(img, rc, colour) > 0;
    }

    CFrameWnd* m_pFrame = nullptr;
    CTestList m_list;
    CountingListener m_listener;
};

TEST_F(ColoredListCtrlTest, PaintsEachCellInItsOwnColoursOnTheRowsBackground)
{
    m_list.SetHeaderLines(1);
    m_list.SetItemState(0, LVIS_SELECTED, LVIS_SELECTED);
    m_list.SetItemState(2, LVIS_SELECTED, LVIS_SELECTED);
    qotest::Image img = qotest::Screen(m_list.m_hWnd);
    qotest::CaptureWindow(m_pFrame->m_hWnd, qotest::CapturePath("coloured-list.png").c_str());
    const COLORREF window = m_list.GetBkColor();

    struct Case {
        const char* what;
        int row;
        COLORREF background;
        COLORREF text;  // of column 1
    } cases[] = {
        {"caption row, selected", 0, ::GetSysColor(COLOR_BTNFACE), kSelectedColour},
        {"plain row", 1, window, kColumnColour[1]},
        {"selected row", 2, ::GetSysColor(COLOR_HIGHLIGHT), kSelectedColour},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.what);
        const CRect cell = Cell(c.row, 1);
        EXPECT_EQ(c.background, img.Pixel(cell.right - 3, cell.top + 1));
        EXPECT_TRUE(Contains(img, cell, c.text));
    }
    EXPECT_FALSE(Contains(img, Cell(1, 3), kColumnColour[2])) << "the long text is cut, not run into the next column";

    // The row without data: a 2-pixel line centred across the whole row, no texts.
    CRect row;
    m_list.GetItemRect(kEmptyRow, &row, LVIR_BOUNDS);
    const int top = row.top + (row.Height() - 2) / 2;
    const int x = Cell(kEmptyRow, 2).CenterPoint().x;
    EXPECT_EQ((std::vector<COLORREF>{window, kColumnColour[0], kColumnColour[0], window}),
              (std::vector<COLORREF>{img.Pixel(x, top - 1), img.Pixel(x, top), img.Pixel(x, top + 1),
                                     img.Pixel(x, top + 2)}));
}

TEST_F(ColoredListCtrlTest, HidesSelectionAndFocusWhenAskedTo)
{
    m_list.SetItemState(2, LVIS_SELECTED | LVIS_FOCUSED, LVIS_SELECTED | LVIS_FOCUSED);
    m_list.SetDontShowSelected(true);
    qotest::Image hidden = qotest::Screen(m_list.m_hWnd);
    // Row 2 now looks like row 3: compare the pixels of the last column, whose text is
    // the same in every row.
    const CRect a = Cell(2, 4), b = Cell(3, 4);
    for (int y = 0; y < a.Height(); ++y)
        for (int x = a.left; x < a.right; ++x)
            ASSERT_EQ(hidden.Pixel(x, b.top + y), hidden.Pixel(x, a.top + y)) << x << "," << y;
}

TEST_F(ColoredListCtrlTest, AUserDraggingAColumnTellsEachListenerOnce)
{
    CountingListener second;
    m_list.AddListener(&second);
    m_list.AddListener(&second);  // held once
    qotest::Screen(m_list.m_hWnd);
    ASSERT_EQ(0, m_listener.m_nCalls);  // the first paint only learns the order

    CRect first, third;
    m_list.GetHeaderCtrl()->GetItemRect(0, &first);
    m_list.GetHeaderCtrl()->GetItemRect(2, &third);
    const int y = first.CenterPoint().y;
    qotest::Drag(m_list.GetHeaderCtrl()->m_hWnd, {first.CenterPoint().x, y}, {third.right - 10, y});
    qotest::Image img = qotest::Screen(m_list.m_hWnd);
    int order[kColumns] = {};
    m_list.GetColumnOrderArray(order, kColumns);
    ASSERT_NE(0, order[0]) << "the drag did not move column 0";
    EXPECT_EQ(1, m_listener.m_nCalls);
    EXPECT_EQ(1, second.m_nCalls);
    EXPECT_TRUE(Contains(img, Cell(1, 0), kColumnColour[0])) << "column 0's cells follow it";
    m_list.RemoveListener(&second);
}

TEST_F(ColoredListCtrlTest, DoubleClickNearADividerSizesTheColumnToItsWidestText)
{
    const int wide = m_list.GetMaxColumnWidth(2);
    EXPECT_GT(wide, 110);
    // Header item clicked, x from its left edge, column expected to change (-1: none).
    const struct {
        int item, x, sized;
    } cases[] = {{3, 5, 2}, {2, 55, -1}};
    for (const auto& c : cases) {
        SCOPED_TRACE(c.x);
        for (int col = 0; col < kColumns; ++col) m_list.SetColumnWidth(col, 110);
        qotest::PumpFor(50);
        CRect rc;
        m_list.GetHeaderCtrl()->GetItemRect(c.item, &rc);
        qotest::DoubleClick(m_list.GetHeaderCtrl()->m_hWnd, rc.left + c.x, rc.CenterPoint().y);
        for (int col = 0; col < kColumns; ++col)
            EXPECT_EQ(col == c.sized ? wide : 110, m_list.GetColumnWidth(col)) << "column " << col;
    }
}

TEST_F(ColoredListCtrlTest, ClickingARowAsksBeforeTheSelectionChanges)
{
    // A virtual list is never asked (the platform sends no LVN_ITEMCHANGING for it),
    // only told; a list that holds its items is asked first.
    CRect row;
    m_list.GetItemRect(3, &row, LVIR_BOUNDS);
    qotest::Click(m_list.m_hWnd, row.left + 20, row.CenterPoint().y);
    EXPECT_EQ((UINT)LVIS_SELECTED, m_list.GetItemState(3, LVIS_SELECTED));
    EXPECT_GT(m_list.m_nChanged, 0);
    EXPECT_EQ(0, m_list.m_nAsked);

    m_list.DestroyWindow();
    ASSERT_TRUE(m_list.Create(WS_CHILD | WS_VISIBLE | LVS_REPORT | LVS_OWNERDRAWFIXED, CRect(5, 5, 605, 305),
                              m_pFrame, 101));
    m_list.InsertColumn(0, "Name", LVCFMT_LEFT, 110);
    for (int i = 0; i < 5; ++i) m_list.InsertItem(i, "Zeile");
    m_list.SetItemState(3, LVIS_SELECTED, LVIS_SELECTED);
    qotest::PumpFor(50);
    m_list.m_bAllowChange = false;
    m_list.m_nAsked = 0;
    m_list.GetItemRect(1, &row, LVIR_LABEL);
    qotest::Click(m_list.m_hWnd, row.left + 4, row.CenterPoint().y);
    EXPECT_GT(m_list.m_nAsked, 0);
    EXPECT_EQ(3, (int)m_list.SendMessage(LVM_GETNEXTITEM, (WPARAM)-1, LVNI_SELECTED));
}

}  // namespace
