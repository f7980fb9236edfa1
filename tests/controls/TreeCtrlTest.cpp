// The node tree and its tree view on a real window.
#include <afxcmn.h>

#include <functional>
#include <stdexcept>
#include <string>
#include <vector>

#include "CQoTreeCtrl.h"
#include "CQoTreeNode.h"
#include "MfcTestHost.h"

namespace {

// Records what reaches the root and refuses to let the selection leave a locked node.
class CRecordingNode : public CQoTreeNode {
public:
    using CQoTreeNode::CQoTreeNode;
    CQoTreeNode* m_pLocked = NULL;
    int m_nExpanding = 0;
    std::vector<std::string> m_log;

    void SelectionChanged(CQoTreeNode* pNode) override
    {
        if (pNode->GetTreeNodeText() == "wirft") throw std::runtime_error("kaputt");
        m_log.push_back("gewählt " + std::string(pNode->GetTreeNodeText()));
        CQoTreeNode::SelectionChanged(pNode);
    }
    bool SelectionChanging(CQoTreeNode* pNode) override
    {
        return pNode == m_pLocked || CQoTreeNode::SelectionChanging(pNode);
    }
    void ItemExpanding() override { ++m_nExpanding; }
};

class TreeCtrlTest : public qotest::HostFrameTest {
protected:
    TreeCtrlTest() : HostFrameTest("Baum", 360, 420) {}
    void SetUp() override
    {
        HostFrameTest::SetUp();
        ASSERT_TRUE(m_tree.Create(WS_CHILD | WS_VISIBLE | WS_BORDER | TVS_HASBUTTONS | TVS_HASLINES |
                                      TVS_LINESATROOT | TVS_SHOWSELALWAYS,
                                  CRect(5, 5, 330, 370), m_pFrame, 100));
        m_pRoot = new CRecordingNode("Projekt", -1, true);
        for (const char* text : {"a", "b", "c"}) m_pRoot->AddChild(new CRecordingNode(text));
        m_tree.SetTree(m_pRoot);
        qotest::BringToFront(m_pFrame->m_hWnd);
    }
    void TearDown() override
    {
        m_tree.DestroyWindow();
        m_pRoot->Delete();
        HostFrameTest::TearDown();
    }
    std::vector<HTREEITEM> Items(HTREEITEM hParent)
    {
        std::vector<HTREEITEM> items;
        for (HTREEITEM h = m_tree.GetChildItem(hParent); h != NULL; h = m_tree.GetNextSiblingItem(h))
            items.push_back(h);
        return items;
    }
    std::vector<std::string> Texts(HTREEITEM hParent)
    {
        std::vector<std::string> texts;
        for (HTREEITEM h : Items(hParent)) texts.push_back(std::string(m_tree.GetItemText(h)));
        return texts;
    }
    CQoTreeNode* Child(int i) { return m_pRoot->GetChild(i); }

    CQoTreeCtrl m_tree;
    CRecordingNode* m_pRoot = NULL;
};

}  // namespace

TEST_F(TreeCtrlTest, ViewFollowsEveryNodeChangeItemByItem)
{
    HTREEITEM hRoot = m_pRoot->GetTreeItem();
    ASSERT_EQ(m_tree.GetRootItem(), hRoot);
    const std::vector<HTREEITEM> before = Items(hRoot);
    HTREEITEM hA = before[0], hC = before[2];

    struct Step {
        const char* what;
        std::function<void()> change;
        std::vector<std::string> texts;
    };
    CRecordingNode stranger("x");
    const std::vector<Step> steps = {
        {"added", [&] { m_pRoot->AddChild(new CRecordingNode("d")); }, {"a", "b", "c", "d"}},
        {"middle removed", [&] { m_pRoot->RemoveChild(Child(1), true); }, {"a", "c", "d"}},
        {"last removed", [&] { m_pRoot->RemoveChild(Child(2), true); }, {"a", "c"}},
        {"text", [&] { Child(0)->SetTreeNodeText("A neu"); }, {"A neu", "c"}},
        {"last down", [&] { m_pRoot->ShiftDown(Child(1), true); }, {"A neu", "c"}},
        {"foreign node", [&] { m_pRoot->RemoveChild(&stranger, false); }, {"A neu", "c"}},
        // Listed twice, it would be freed twice.
        {"child put back again", [&] { m_pRoot->InsertChild(0, Child(1)); }, {"A neu", "c"}},
    };
    for (const Step& step : steps) {
        step.change();
        EXPECT_EQ(step.texts, Texts(hRoot)) << step.what;
    }
    // Nothing was rebuilt: the items left over are the ones shown first.
    EXPECT_EQ((std::vector<HTREEITEM>{hA, hC}), Items(hRoot));
    EXPECT_EQ(hA, Child(0)->GetTreeItem());

    // Moving the second child up selects it at the top.
    CQoTreeNode* pC = Child(1);
    m_pRoot->ShiftUp(pC, true);
    EXPECT_EQ((std::vector<std::string>{"c", "A neu"}), Texts(hRoot));
    EXPECT_EQ(pC->GetTreeItem(), m_tree.GetSelectedItem());
    EXPECT_EQ(hA, Items(hRoot)[1]);

    // A node that was shown elsewhere comes with its whole subtree.
    CQoTreeNode* pSub = new CRecordingNode("unten");
    pSub->AddChild(new CRecordingNode("ganz unten"));
    Child(1)->AddChild(pSub);
    Child(1)->RemoveChild(pSub, false);
    Child(0)->AddChild(pSub);
    EXPECT_EQ(nullptr, m_tree.GetChildItem(hA));
    HTREEITEM hSub = pSub->GetTreeItem();
    ASSERT_NE(nullptr, hSub);
    EXPECT_EQ(pC->GetTreeItem(), m_tree.GetParentItem(hSub));
    EXPECT_EQ((std::vector<std::string>{"ganz unten"}), Texts(hSub));
}

TEST_F(TreeCtrlTest, SelectionAndExpansionAreReportedAndMayBeRefused)
{
    // A child that may not collapse keeps its parent open: it opens at once, and collapsing,
    // the program's or the user's (the left arrow key), is refused.
    Child(1)->AddChild(new CRecordingNode("fest", -1, false));
    HTREEITEM hB = Child(1)->GetTreeItem();
    EXPECT_NE(0u, m_tree.GetItemState(hB, TVIS_EXPANDED));
    m_tree.CollapseAll(NULL);
    EXPECT_NE(0u, m_tree.GetItemState(hB, TVIS_EXPANDED));
    m_tree.SelectItem(hB);
    qotest::Focus(m_tree.m_hWnd);
    qotest::PressKey(VK_LEFT);
    EXPECT_NE(0u, m_tree.GetItemState(hB, TVIS_EXPANDED));
    EXPECT_EQ(hB, m_tree.GetSelectedItem());

    // Expanding a collapsible node is told to it.
    CRecordingNode* pA = static_cast<CRecordingNode*>(Child(0));
    pA->AddChild(new CRecordingNode("a1"));
    m_tree.Expand(pA->GetTreeItem(), TVE_EXPAND);
    EXPECT_EQ(1, pA->m_nExpanding);

    // Real clicks: a right click selects, a locked node keeps the selection.
    m_tree.ExpandAll(NULL);
    qotest::PumpApp(100);
    auto clickOn = [&](CQoTreeNode* pNode, bool right) {
        CRect rc;
        ASSERT_TRUE(m_tree.GetItemRect(pNode->GetTreeItem(), rc, TRUE));
        // Press and release queued together: the tree view watches the button in a loop of its own.
        const qotest::MouseButton button = right ? qotest::MouseButton::Right : qotest::MouseButton::Left;
        qotest::MoveMouse(m_tree.m_hWnd, rc.CenterPoint().x, rc.CenterPoint().y);
        qotest::InjectButton(button, true);
        qotest::InjectButton(button, false);
        qotest::PumpApp(::GetDoubleClickTime() + 100);  // two clicks on one item are no double click
    };
    m_pRoot->m_log.clear();
    clickOn(Child(2), true);
    EXPECT_EQ(Child(2)->GetTreeItem(), m_tree.GetSelectedItem());
    m_pRoot->m_pLocked = Child(2);
    clickOn(Child(0), false);
    EXPECT_EQ(Child(2)->GetTreeItem(), m_tree.GetSelectedItem());
    m_pRoot->m_pLocked = NULL;
    clickOn(Child(0), false);
    EXPECT_EQ(Child(0)->GetTreeItem(), m_tree.GetSelectedItem());
    EXPECT_EQ((std::vector<std::string>{"gewählt c", "gewählt a"}), m_pRoot->m_log);

    // A node that throws while being selected no longer answers for its item.
    Child(0)->SetTreeNodeText("wirft");
    HTREEITEM hThrowing = Child(0)->GetTreeItem();
    m_tree.SelectItem(m_tree.GetRootItem());
    m_tree.SelectNode(Child(0));
    EXPECT_EQ(hThrowing, m_tree.GetSelectedItem());
    EXPECT_EQ(nullptr, m_tree.NodeOf(hThrowing));
}
