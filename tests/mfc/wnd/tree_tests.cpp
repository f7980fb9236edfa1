// The tree view on a real window: items keep their texts (also beyond the first
// buffer size), data and images, text and data are set apart, the button follows
// cChildren, and an item's rectangle leads back to it by hit testing.
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

TEST_F(TreeTest, ItemsKeepTextDataImagesAndAreFoundByTheirRectangle)
{
    const std::string longText(700, 'x');
    HTREEITEM hRoot = m_tree.InsertItem(TVIF_TEXT | TVIF_IMAGE | TVIF_SELECTEDIMAGE | TVIF_PARAM, "Wurzel", 2, 3, 0,
                                        0, 4711, TVI_ROOT, TVI_LAST);
    HTREEITEM hB = m_tree.InsertItem("b", hRoot);
    HTREEITEM hLong = m_tree.InsertItem(longText.c_str(), hRoot);
    ASSERT_TRUE(hRoot && hB && hLong);
    EXPECT_EQ(4711u, m_tree.GetItemData(hRoot));
    int image = 0, selected = 0;
    ASSERT_TRUE(m_tree.GetItemImage(hRoot, image, selected));
    EXPECT_EQ((std::vector<int>{2, 3}), (std::vector<int>{image, selected}));
    EXPECT_EQ(longText, std::string(m_tree.GetItemText(hLong)));

    // Text and data are set apart: neither clears the other.
    ASSERT_TRUE(m_tree.SetItemData(hB, 99));
    ASSERT_TRUE(m_tree.SetItemText(hB, "B neu"));
    EXPECT_STREQ("B neu", m_tree.GetItemText(hB));
    EXPECT_EQ(99u, m_tree.GetItemData(hB));

    // cChildren decides the button, whatever items exist.
    TVITEM item = {};
    item.hItem = hB;
    item.mask = TVIF_CHILDREN;
    item.cChildren = 1;
    ASSERT_TRUE(m_tree.SetItem(&item));
    EXPECT_TRUE(m_tree.ItemHasChildren(hB));
    EXPECT_FALSE(m_tree.ItemHasChildren(hLong));

    ASSERT_TRUE(m_tree.Expand(hRoot, TVE_EXPAND));
    CRect rc;
    ASSERT_TRUE(m_tree.GetItemRect(hB, rc, TRUE));
    UINT flags = 0;
    EXPECT_EQ(hB, m_tree.HitTest(rc.CenterPoint(), &flags));
    EXPECT_NE(0u, flags & TVHT_ONITEMLABEL);
}
