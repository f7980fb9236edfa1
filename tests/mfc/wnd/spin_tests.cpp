// The up-down control on a real window: 16-bit packing of range and position,
// the 32-bit forms beyond it, the buddy's text, and a parent that refuses a
// change through UDN_DELTAPOS.
#include <gtest/gtest.h>

#include <afxcmn.h>

#include <vector>

namespace {

class CSpinParent : public CFrameWnd {
public:
    BOOL m_bRefuse = FALSE;
    std::vector<int> m_seen;  // iPos, iDelta of every notification

protected:
    void OnDeltaPos(NMHDR* pNMHDR, LRESULT* pResult)
    {
        NMUPDOWN* pUD = reinterpret_cast<NMUPDOWN*>(pNMHDR);
        m_seen.insert(m_seen.end(), {pUD->iPos, pUD->iDelta});
        *pResult = m_bRefuse;
    }
    DECLARE_MESSAGE_MAP()
};

BEGIN_MESSAGE_MAP(CSpinParent, CFrameWnd)
    ON_NOTIFY(UDN_DELTAPOS, 9, OnDeltaPos)
END_MESSAGE_MAP()

class SpinTest : public ::testing::Test {
protected:
    void SetUp() override
    {
        ASSERT_TRUE(m_pFrame->CreateEx(0, AfxRegisterWndClass(0), "Spin", WS_OVERLAPPEDWINDOW | WS_VISIBLE, 20, 20,
                                       300, 200, NULL, NULL));
        ASSERT_TRUE(m_edit.Create(WS_CHILD | WS_VISIBLE | WS_BORDER, CRect(10, 10, 110, 34), m_pFrame, 8));
        ASSERT_TRUE(m_spin.Create(WS_CHILD | WS_VISIBLE | UDS_ARROWKEYS | UDS_SETBUDDYINT | UDS_NOTHOUSANDS,
                                  CRect(120, 10, 140, 34), m_pFrame, 9));
    }
    void TearDown() override
    {
        if (::IsWindow(m_pFrame->m_hWnd)) m_pFrame->DestroyWindow();
    }
    CSpinParent* m_pFrame = new CSpinParent;  // deletes itself with its window
    CEdit m_edit;
    CSpinButtonCtrl m_spin;
};

}  // namespace

TEST_F(SpinTest, SixteenBitFormsPackTheirValuesAndThirtyTwoBitFormsDoNot)
{
    m_spin.SetRange(-5, 300);
    EXPECT_EQ(MAKELONG(300, (WORD)-5), (LONG)m_spin.GetRange());
    int lower = 0, upper = 0;
    m_spin.SetRange32(-100000, 70000);
    m_spin.GetRange32(lower, upper);
    EXPECT_EQ((std::vector<int>{-100000, 70000}), (std::vector<int>{lower, upper}));
    EXPECT_EQ(0, m_spin.SetPos32(65000));
    EXPECT_EQ(65000, m_spin.SetPos32(-99999));
    EXPECT_EQ(-99999, m_spin.GetPos32());
    // A position in 16 bits: the previous one comes back cut to 16 bits.
    EXPECT_EQ((short)(WORD)-99999, m_spin.SetPos(1234));
    EXPECT_EQ(1234, LOWORD(m_spin.GetPos()));
}

TEST_F(SpinTest, BuddyShowsThePositionAndReportsBadText)
{
    m_spin.SetBuddy(&m_edit);
    m_spin.SetRange(0, 1000);
    m_spin.SetPos(42);
    CString text;
    m_edit.GetWindowText(text);
    EXPECT_STREQ("42", (const char*)text);
    EXPECT_EQ(0, m_spin.SetBase(7));  // refused: only 10 and 16

    m_edit.SetWindowText("kein Wert");
    EXPECT_NE(0, HIWORD(m_spin.GetPos()));
    BOOL bError = FALSE;
    m_spin.GetPos32(&bError);
    EXPECT_TRUE(bError);
}

TEST_F(SpinTest, ParentSeesEveryStepAndMayRefuseIt)
{
    m_spin.SetRange32(0, 10);
    m_spin.SetPos32(10);
    m_spin.SendMessage(WM_KEYDOWN, VK_DOWN, 0);
    EXPECT_EQ(9, m_spin.GetPos32());
    m_spin.SendMessage(WM_KEYDOWN, VK_UP, 0);
    m_spin.SendMessage(WM_KEYDOWN, VK_UP, 0);  // at the upper limit: asked, but stays
    EXPECT_EQ(10, m_spin.GetPos32());

    m_pFrame->m_bRefuse = TRUE;
    m_spin.SendMessage(WM_KEYDOWN, VK_DOWN, 0);
    EXPECT_EQ(10, m_spin.GetPos32());
    EXPECT_EQ((std::vector<int>{10, -1, 9, 1, 10, 1, 10, -1}), m_pFrame->m_seen);
}
