// The report list on a real window: rows of a virtual list painted through
// DrawItem, item rectangles by their code, and rows that keep long texts and
// their data.
#include <gtest/gtest.h>

#include <afxcmn.h>

#include <string>
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
        m_pFrame = new CFrameWnd;  // deletes itself with its window
        ASSERT_TRUE(m_pFrame->CreateEx(0, AfxRegisterWndClass(0), "Liste", WS_OVERLAPPEDWINDOW | WS_VISIBLE, 20,
                                       20, 400, 300, NULL, NULL));
        ASSERT_TRUE(m_list.Create(WS_CHILD | WS_VISIBLE | LVS_REPORT | LVS_OWNERDRAWFIXED | LVS_OWNERDATA,
                                  CRect(0, 0, 380, 250), m_pFrame, 7));
        for (int c = 0; c < 3; ++c) ASSERT_EQ(c, m_list.InsertColumn(c, "Spalte", LVCFMT_LEFT, 50 + 10 * c));
    }
    void TearDown() override
    {
        if (::IsWindow(m_pFrame->m_hWnd)) m_pFrame->DestroyWindow();
        Pump();
    }
    CFrameWnd* m_pFrame = nullptr;
    CCountingList m_list;
};

}  // namespace

TEST_F(ListCtrlTest, VirtualRowsArePaintedThroughDrawItemAndRowsKeepTextsAndData)
{
    m_list.SetItemCountEx(1000000, 0);
    CRect bounds, label;
    ASSERT_TRUE(m_list.GetItemRect(1, &bounds, LVIR_BOUNDS));
    ASSERT_TRUE(m_list.GetItemRect(1, &label, LVIR_LABEL));
    EXPECT_GT(bounds.top, 0);  // below the header and row 0
    EXPECT_LT(label.Width(), bounds.Width());  // the first column only, not the whole row

    m_list.m_painted.clear();
    m_list.Invalidate();
    m_list.UpdateWindow();
    Pump();
    ASSERT_FALSE(m_list.m_painted.empty());
    EXPECT_EQ(0, m_list.m_painted.front());
    EXPECT_LT((int)m_list.m_painted.size(), 100);  // the visible rows only

    // An ordinary report list keeps long texts and each row's data.
    CListCtrl list;
    ASSERT_TRUE(list.Create(WS_CHILD | WS_VISIBLE | LVS_REPORT, CRect(0, 0, 280, 150), m_pFrame, 3));
    list.InsertColumn(0, "Name", LVCFMT_LEFT, 100);
    const std::string longText(700, 'x');  // beyond the first buffer
    ASSERT_EQ(0, list.InsertItem(0, "Vorname"));
    ASSERT_EQ(1, list.InsertItem(1, longText.c_str()));
    ASSERT_TRUE(list.SetItemData(1, (DWORD_PTR)(LONG_PTR)-5));
    EXPECT_EQ(longText, std::string(list.GetItemText(1, 0)));
    ASSERT_TRUE(list.DeleteItem(0));
    EXPECT_EQ(-5L, (long)(LONG_PTR)list.GetItemData(0));
    EXPECT_EQ(0u, (unsigned)list.GetItemData(5));  // no such row: no data
    list.DestroyWindow();
}
