// The report list and its header on a real window: columns, their order, the
// virtual item count, item rectangles, and rows painted through DrawItem.
#include <gtest/gtest.h>

#include <afxcmn.h>

#include <vector>

namespace {

class CCountingList : public CListCtrl {
public:
    std::vector<int> m_painted;
    void DrawItem(LPDRAWITEMSTRUCT lpDrawItemStruct) override { m_painted.push_back((int)lpDrawItemStruct->itemID); }
};

void Pump()
{
    MSG msg;
    while (PeekMessageA(&msg, NULL, 0, 0, PM_REMOVE)) DispatchMessageA(&msg);
}

class ListCtrlTest : public ::testing::Test {
protected:
    void SetUp() override
    {
        m_pFrame = new CFrameWnd;
        ASSERT_TRUE(m_pFrame->CreateEx(0, AfxRegisterWndClass(0), "Liste", WS_OVERLAPPEDWINDOW | WS_VISIBLE, 20,
                                       20, 400, 300, NULL, NULL));
        ASSERT_TRUE(m_list.Create(WS_CHILD | WS_VISIBLE | LVS_REPORT | LVS_OWNERDRAWFIXED | LVS_OWNERDATA,
                                  CRect(0, 0, 380, 250), m_pFrame, 7));
        const char* names[] = {"A", "B", "C"};
        const int formats[] = {LVCFMT_LEFT, LVCFMT_RIGHT, LVCFMT_CENTER};
        for (int c = 0; c < 3; ++c) ASSERT_EQ(c, m_list.InsertColumn(c, names[c], formats[c], 50 + 10 * c));
    }
    void TearDown() override
    {
        if (::IsWindow(m_pFrame->m_hWnd)) m_pFrame->DestroyWindow();
        Pump();
    }
    CFrameWnd* m_pFrame = nullptr;
    CCountingList m_list;
};

TEST_F(ListCtrlTest, ColumnsWidthsFormatsAndOrder)
{
    CHeaderCtrl* pHeader = m_list.GetHeaderCtrl();
    ASSERT_NE(nullptr, pHeader);
    ASSERT_EQ(3, pHeader->GetItemCount());
    const int formats[] = {LVCFMT_LEFT, LVCFMT_RIGHT, LVCFMT_CENTER};
    for (int c = 0; c < 3; ++c) {
        EXPECT_EQ(50 + 10 * c, m_list.GetColumnWidth(c));
        LVCOLUMN lvc = {};
        lvc.mask = LVCF_FMT;
        ASSERT_TRUE(m_list.GetColumn(c, &lvc));
        EXPECT_EQ(formats[c], lvc.fmt & LVCFMT_JUSTIFYMASK);
        CRect rc;
        ASSERT_TRUE(pHeader->GetItemRect(c, &rc));
        EXPECT_EQ(50 + 10 * c, rc.Width());
    }
    HDITEM item = {};
    item.mask = HDI_WIDTH;
    item.cxy = 90;
    ASSERT_TRUE(pHeader->SetItem(1, &item));  // the list follows its header
    EXPECT_EQ(90, m_list.GetColumnWidth(1));

    int order[] = {2, 0, 1};
    ASSERT_TRUE(m_list.SetColumnOrderArray(3, order));
    int got[3] = {};
    ASSERT_TRUE(m_list.GetColumnOrderArray(got));
    EXPECT_EQ(std::vector<int>(order, order + 3), std::vector<int>(got, got + 3));
    CRect first;
    pHeader->GetItemRect(2, &first);  // by index: column 2 is now shown first
    EXPECT_EQ(0, first.left);
}

TEST_F(ListCtrlTest, VirtualRowsArePaintedThroughDrawItem)
{
    m_list.SetItemCountEx(1000000, 0);
    EXPECT_EQ(1000000, m_list.GetItemCount());
    EXPECT_EQ(::GetSysColor(COLOR_WINDOW), m_list.GetBkColor());
    CRect bounds, label;
    ASSERT_TRUE(m_list.GetItemRect(1, &bounds, LVIR_BOUNDS));
    ASSERT_TRUE(m_list.GetItemRect(1, &label, LVIR_LABEL));
    EXPECT_EQ(bounds.top, label.top);
    EXPECT_GT(bounds.top, 0);  // below the header and row 0

    m_list.SetItemState(1, LVIS_SELECTED, LVIS_SELECTED);
    EXPECT_EQ((UINT)LVIS_SELECTED, m_list.GetItemState(1, LVIS_SELECTED));
    m_list.m_painted.clear();
    m_list.Invalidate();
    m_list.UpdateWindow();
    Pump();
    ASSERT_FALSE(m_list.m_painted.empty());
    EXPECT_EQ(0, m_list.m_painted.front());
    EXPECT_LT((int)m_list.m_painted.size(), 100);  // the visible rows only
}

}  // namespace
