// The tree view on a real window: items with their texts (also beyond the first
// buffer size), data, images and button, their order, expansion, item rectangles,
// hit testing and selection.
#include <gtest/gtest.h>

#include <afxcmn.h>

#include <string>
#include <vector>

#include "MfcTestHost.h"

namespace {

class TreeTest : public qotest::HostFrameTest {
protected:
    TreeTest() : HostFrameTest("Baum", 320, 300) {}
    void SetUp() override
    {
        HostFrameTest::SetUp();
        ASSERT_TRUE(m_tree.Create(WS_CHILD | WS_VISIBLE | WS_BORDER | TVS_HASBUTTONS | TVS_HASLINES |
                                      TVS_LINESATROOT | TVS_SHOWSELALWAYS,
                                  CRect(5, 5, 300, 260), m_pFrame, 7));
    }
    CTreeCtrl m_tree;
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

    EXPECT_EQ(4711u, m_tree.GetItemData(hRoot));
    int image = 0, selected = 0;
    ASSERT_TRUE(m_tree.GetItemImage(hRoot, image, selected));
    EXPECT_EQ((std::vector<int>{2, 3}), (std::vector<int>{image, selected}));
    EXPECT_EQ(longText, std::string(m_tree.GetItemText(hLong)));

    std::vector<HTREEITEM> order;
    for (HTREEITEM h = m_tree.GetChildItem(hRoot); h != NULL; h = m_tree.GetNextSiblingItem(h)) order.push_back(h);
    EXPECT_EQ((std::vector<HTREEITEM>{hA, hB, hLong}), order);
    EXPECT_EQ(hRoot, m_tree.GetParentItem(hLong));

    // Text and data are set apart: neither clears the other.
    ASSERT_TRUE(m_tree.SetItemData(hB, 99));
    ASSERT_TRUE(m_tree.SetItemText(hB, "B neu"));
    EXPECT_STREQ("B neu", m_tree.GetItemText(hB));
    EXPECT_EQ(99u, m_tree.GetItemData(hB));

    // cChildren decides the button, whatever items exist.
    TVITEM item = {};
    item.hItem = hA;
    item.mask = TVIF_CHILDREN;
    item.cChildren = 1;
    ASSERT_TRUE(m_tree.SetItem(&item));
    EXPECT_TRUE(m_tree.ItemHasChildren(hA));
    EXPECT_FALSE(m_tree.ItemHasChildren(hB));
}

TEST_F(TreeTest, ExpandHitTestAndSelect)
{
    HTREEITEM hRoot = m_tree.InsertItem("Wurzel");
    HTREEITEM hChild = m_tree.InsertItem("Kind", hRoot);
    EXPECT_TRUE(m_tree.Expand(hRoot, TVE_EXPAND));
    EXPECT_EQ((UINT)TVIS_EXPANDED, m_tree.GetItemState(hRoot, TVIS_EXPANDED));

    CRect rc;
    ASSERT_TRUE(m_tree.GetItemRect(hChild, rc, TRUE));
    UINT flags = 0;
    EXPECT_EQ(hChild, m_tree.HitTest(rc.CenterPoint(), &flags));
    EXPECT_NE(0u, flags & TVHT_ONITEMLABEL);
    EXPECT_EQ(NULL, m_tree.HitTest(CPoint(5, 240), &flags));

    ASSERT_TRUE(m_tree.SelectItem(hChild));
    EXPECT_EQ(hChild, m_tree.GetSelectedItem());
}
