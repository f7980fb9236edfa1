// The tree view on a real window: items with their texts (also beyond the first
// buffer size), data, images and button, navigation, expansion and selection,
// hit testing, and a reflected TVN_SELCHANGING that refuses a change.
#include <gtest/gtest.h>

#include <afxcmn.h>

#include <string>
#include <vector>

namespace {

class CRefusingTree : public CTreeCtrl {
public:
    HTREEITEM m_hLocked = NULL;  // the selection does not leave this item
    std::vector<HTREEITEM> m_changed;

protected:
    void OnSelChanging(NMHDR* pNMHDR, LRESULT* pResult)
    {
        *pResult = reinterpret_cast<NMTREEVIEW*>(pNMHDR)->itemOld.hItem == m_hLocked && m_hLocked != NULL;
    }
    void OnSelChanged(NMHDR* pNMHDR, LRESULT* pResult)
    {
        m_changed.push_back(reinterpret_cast<NMTREEVIEW*>(pNMHDR)->itemNew.hItem);
        *pResult = 0;
    }
    DECLARE_MESSAGE_MAP()
};

BEGIN_MESSAGE_MAP(CRefusingTree, CTreeCtrl)
    ON_NOTIFY_REFLECT(TVN_SELCHANGING, OnSelChanging)
    ON_NOTIFY_REFLECT(TVN_SELCHANGED, OnSelChanged)
END_MESSAGE_MAP()

class TreeTest : public ::testing::Test {
protected:
    void SetUp() override
    {
        ASSERT_TRUE(m_pFrame->CreateEx(0, AfxRegisterWndClass(0), "Baum", WS_OVERLAPPEDWINDOW | WS_VISIBLE, 20, 20,
                                       320, 300, NULL, NULL));
        ASSERT_TRUE(m_tree.Create(WS_CHILD | WS_VISIBLE | WS_BORDER | TVS_HASBUTTONS | TVS_HASLINES |
                                      TVS_LINESATROOT | TVS_SHOWSELALWAYS,
                                  CRect(5, 5, 300, 260), m_pFrame, 7));
    }
    void TearDown() override
    {
        if (::IsWindow(m_pFrame->m_hWnd)) m_pFrame->DestroyWindow();
    }
    CFrameWnd* m_pFrame = new CFrameWnd;  // deletes itself with its window
    CRefusingTree m_tree;
};

}  // namespace

TEST_F(TreeTest, ItemsKeepTextDataImagesAndOrder)
{
    const std::string longText(700, 'x');
    HTREEITEM hRoot = m_tree.InsertItem(TVIF_TEXT | TVIF_IMAGE | TVIF_SELECTEDIMAGE | TVIF_PARAM, "Wurzel", 2, 3, 0,
                                        0, 4711, TVI_ROOT, TVI_LAST);
    HTREEITEM hB = m_tree.InsertItem("b", hRoot);
    HTREEITEM hA = m_tree.InsertItem("a", hRoot, TVI_FIRST);
    HTREEITEM hLong = m_tree.InsertItem(longText.c_str(), hRoot, TVI_SORT);
    ASSERT_TRUE(hRoot && hA && hB && hLong);

    EXPECT_EQ(4u, m_tree.GetCount());
    EXPECT_EQ(hRoot, m_tree.GetRootItem());
    EXPECT_EQ(4711u, m_tree.GetItemData(hRoot));
    int image = 0, selected = 0;
    ASSERT_TRUE(m_tree.GetItemImage(hRoot, image, selected));
    EXPECT_EQ((std::vector<int>{2, 3}), (std::vector<int>{image, selected}));
    EXPECT_EQ(longText, std::string(m_tree.GetItemText(hLong)));

    std::vector<HTREEITEM> order;
    for (HTREEITEM h = m_tree.GetChildItem(hRoot); h != NULL; h = m_tree.GetNextSiblingItem(h)) order.push_back(h);
    EXPECT_EQ((std::vector<HTREEITEM>{hA, hB, hLong}), order);
    EXPECT_EQ(hA, m_tree.GetPrevSiblingItem(hB));
    EXPECT_EQ(hRoot, m_tree.GetParentItem(hLong));

    ASSERT_TRUE(m_tree.SetItemText(hB, "B neu"));
    ASSERT_TRUE(m_tree.SetItemData(hB, 99));
    EXPECT_STREQ("B neu", m_tree.GetItemText(hB));
    EXPECT_EQ(99u, m_tree.GetItemData(hB));

    // cChildren decides the button, whatever items exist.
    TVITEM item = {};
    item.hItem = hA;
    item.mask = TVIF_CHILDREN;
    item.cChildren = 1;
    ASSERT_TRUE(m_tree.SetItem(&item));
    EXPECT_TRUE(m_tree.ItemHasChildren(hA));
    EXPECT_TRUE(m_tree.DeleteItem(hA));
    EXPECT_EQ(3u, m_tree.GetCount());
    EXPECT_TRUE(m_tree.DeleteAllItems());
    EXPECT_EQ(0u, m_tree.GetCount());
}

TEST_F(TreeTest, ExpandSelectHitTestAndARefusedSelectionChange)
{
    HTREEITEM hRoot = m_tree.InsertItem("Wurzel");
    HTREEITEM hChild = m_tree.InsertItem("Kind", hRoot);
    HTREEITEM hOther = m_tree.InsertItem("Anderes");

    EXPECT_EQ(0u, m_tree.GetItemState(hRoot, TVIS_EXPANDED));
    EXPECT_TRUE(m_tree.Expand(hRoot, TVE_EXPAND));
    EXPECT_EQ((UINT)TVIS_EXPANDED, m_tree.GetItemState(hRoot, TVIS_EXPANDED));
    EXPECT_TRUE(m_tree.SetItemState(hRoot, TVIS_BOLD, TVIS_BOLD));
    EXPECT_EQ((UINT)TVIS_BOLD, m_tree.GetItemState(hRoot, TVIS_BOLD));

    CRect rc;
    ASSERT_TRUE(m_tree.GetItemRect(hChild, rc, TRUE));
    UINT flags = 0;
    EXPECT_EQ(hChild, m_tree.HitTest(rc.CenterPoint(), &flags));
    EXPECT_NE(0u, flags & TVHT_ONITEMLABEL);
    EXPECT_EQ(NULL, m_tree.HitTest(CPoint(5, 240), &flags));

    ASSERT_TRUE(m_tree.SelectItem(hChild));
    EXPECT_EQ(hChild, m_tree.GetSelectedItem());
    m_tree.m_hLocked = hChild;
    m_tree.SelectItem(hOther);
    EXPECT_EQ(hChild, m_tree.GetSelectedItem());
    m_tree.m_hLocked = NULL;
    ASSERT_TRUE(m_tree.SelectItem(hOther));
    EXPECT_EQ(hOther, m_tree.GetSelectedItem());
    EXPECT_EQ((std::vector<HTREEITEM>{hChild, hOther}), m_tree.m_changed);

    EXPECT_TRUE(m_tree.Expand(hRoot, TVE_COLLAPSE));
    EXPECT_EQ(0u, m_tree.GetItemState(hRoot, TVIS_EXPANDED));
    m_tree.EnsureVisible(hChild);  // answers zero here: it expanded an item
    EXPECT_EQ((UINT)TVIS_EXPANDED, m_tree.GetItemState(hRoot, TVIS_EXPANDED));
}
