// A report list that holds its own rows: item data that travels with its row
// when rows before it go, the selection as the next selected item, and the
// extended styles.
#include <gtest/gtest.h>

#include <afxcmn.h>

namespace {

void Pump()
{
    MSG msg;
    while (PeekMessageA(&msg, NULL, 0, 0, PM_REMOVE)) DispatchMessageA(&msg);
}

}  // namespace

TEST(ListCtrlItems, DataSelectionDeletionAndExtendedStyles)
{
    CFrameWnd* pFrame = new CFrameWnd;  // deletes itself with its window
    ASSERT_TRUE(pFrame->CreateEx(0, AfxRegisterWndClass(0), "Zeilen", WS_OVERLAPPEDWINDOW | WS_VISIBLE, 20, 20, 300,
                                 200, NULL, NULL));
    CListCtrl list;
    ASSERT_TRUE(list.Create(WS_CHILD | WS_VISIBLE | LVS_REPORT | LVS_SINGLESEL, CRect(0, 0, 280, 150), pFrame, 3));
    list.InsertColumn(0, "Name", LVCFMT_LEFT, 100);

    const char* names[] = {"Vorname", "Name", "Ort"};
    const long ids[] = {-5, 20000, 0x7FFFFFFF};
    for (int i = 0; i < 3; ++i) {
        ASSERT_EQ(i, list.InsertItem(i, names[i]));
        ASSERT_TRUE(list.SetItemData(i, (DWORD_PTR)(LONG_PTR)ids[i]));
    }
    EXPECT_EQ(-1, list.GetNextItem(-1, LVNI_SELECTED));
    ASSERT_TRUE(list.SetItemState(2, LVIS_SELECTED, LVIS_SELECTED));
    EXPECT_EQ(2, list.GetNextItem(-1, LVNI_SELECTED));
    EXPECT_EQ(-1, list.GetNextItem(2, LVNI_SELECTED));

    ASSERT_TRUE(list.DeleteItem(0));
    EXPECT_EQ(2, list.GetItemCount());
    EXPECT_EQ(CString("Name"), list.GetItemText(0, 0));
    EXPECT_EQ(20000L, (long)(LONG_PTR)list.GetItemData(0));
    EXPECT_EQ(0x7FFFFFFFL, (long)(LONG_PTR)list.GetItemData(1));
    EXPECT_EQ(1, list.GetNextItem(-1, LVNI_SELECTED));  // the selection moved up with its row
    EXPECT_FALSE(list.DeleteItem(5));
    EXPECT_EQ(0u, (unsigned)list.GetItemData(5));  // no such row: no data

    EXPECT_EQ(0u, list.GetExtendedStyle() & LVS_EX_FULLROWSELECT);
    const DWORD before = list.SetExtendedStyle(list.GetExtendedStyle() | LVS_EX_FULLROWSELECT);
    EXPECT_EQ(0u, before & LVS_EX_FULLROWSELECT);
    EXPECT_NE(0u, list.GetExtendedStyle() & LVS_EX_FULLROWSELECT);
    list.SetExtendedStyle(before);
    EXPECT_EQ(before, list.GetExtendedStyle());

    list.DestroyWindow();
    pFrame->DestroyWindow();
    Pump();
}
