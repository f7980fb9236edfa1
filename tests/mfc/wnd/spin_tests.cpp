// The up-down control on a real window: the 16-bit forms pack range and
// position into one word each; the 32-bit forms keep the whole values.
#include <gtest/gtest.h>

#include <afxcmn.h>

#include <vector>

TEST(SpinTest, SixteenBitFormsPackTheirValuesAndThirtyTwoBitFormsDoNot)
{
    CFrameWnd* pFrame = new CFrameWnd;  // deletes itself with its window
    ASSERT_TRUE(pFrame->CreateEx(0, AfxRegisterWndClass(0), "Spin", WS_OVERLAPPEDWINDOW, 20, 20, 300, 200, NULL,
                                 NULL));
    CSpinButtonCtrl spin;
    ASSERT_TRUE(spin.Create(WS_CHILD | WS_VISIBLE, CRect(120, 10, 140, 34), pFrame, 9));
    spin.SetRange(-5, 300);
    EXPECT_EQ(MAKELONG(300, (WORD)-5), (LONG)spin.GetRange());
    int lower = 0, upper = 0;
    spin.GetRange(lower, upper);
    EXPECT_EQ((std::vector<int>{-5, 300}), (std::vector<int>{lower, upper}));
    spin.SetRange32(-100000, 70000);
    spin.GetRange32(lower, upper);
    EXPECT_EQ((std::vector<int>{-100000, 70000}), (std::vector<int>{lower, upper}));
    EXPECT_EQ(0, spin.SetPos32(65000));
    EXPECT_EQ(65000, spin.SetPos32(-99999));
    EXPECT_EQ(-99999, spin.GetPos32());
    // A position in 16 bits: the previous one comes back cut to 16 bits.
    EXPECT_EQ((short)(WORD)-99999, spin.SetPos(1234));
    EXPECT_EQ(1234, LOWORD(spin.GetPos()));
    pFrame->DestroyWindow();
}
